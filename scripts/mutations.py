# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
"""Finds what mutants.py changes in a source, on the syntax tree of libclang."""
import collections
import re

import clang.cindex as clang

COMPARISONS = {"==": ["!="], "!=": ["=="], "<": ["<=", ">="], ">": [">=", "<="], "<=": ["<", ">"],
               ">=": [">", "<"], "&&": ["||"], "||": ["&&"]}
K = clang.CursorKind
FUNCTIONS = {K.FUNCTION_DECL, K.CXX_METHOD, K.CONSTRUCTOR, K.DESTRUCTOR, K.FUNCTION_TEMPLATE,
             K.CONVERSION_FUNCTION}
NEVER = {K.STATIC_ASSERT, K.TYPE_REF, K.TEMPLATE_REF, K.PARM_DECL, K.ENUM_DECL, K.TYPE_ALIAS_DECL}


class Finder:
    """Finds the mutants of one source: edits of its text, as (start, end, text, how)."""

    def __init__(self, name, text, unit, path):
        self.name, self.text, self.path, self.mutants = name, text, str(path), []
        inside = [c for c in unit.cursor.get_children() if self.is_here(c)]
        self.macros = [self.span(c) for c in inside if c.kind == K.MACRO_INSTANTIATION]
        for cursor in inside:
            self.declarations(cursor)

    def is_here(self, cursor):
        return cursor.location.file and cursor.location.file.name == self.path

    def span(self, cursor):
        return cursor.extent.start.offset, cursor.extent.end.offset

    def source(self, cursor):
        start, end = self.span(cursor)
        return self.text[start:end]

    def add(self, kind, start, end, text, how="value", more=()):
        if end < start or any(a < end and start < b and not (start <= a and b <= end) for a, b in self.macros):
            return  # partly in a macro
        edits = [(start, end, text, how), *more]
        first, last = edits[0][0], edits[-1][1]
        left, right = self.text.rfind("\n", 0, first) + 1, (self.text + "\n").find("\n", last)
        changed, at = "", left
        for a, b, new, _ in edits:
            changed, at = changed + self.text[at:a] + new, b
        changed += self.text[at:right]
        self.mutants.append({
            "file": self.name, "line": self.text.count("\n", 0, first) + 1, "function": self.function,
            "kind": kind, "from": " ".join(self.text[left:right].split()), "to": " ".join(changed.split()),
            "edits": edits})

    def declarations(self, cursor):
        if cursor.kind in FUNCTIONS and cursor.is_definition():
            start, end = self.span(cursor)
            names, parent = [cursor.spelling], cursor.semantic_parent
            while parent is not None and parent.kind != K.TRANSLATION_UNIT:
                names, parent = [parent.spelling, *names], parent.semantic_parent
            self.function = "::".join(name for name in names if name)
            body = next((c for c in cursor.get_children() if c.kind == K.COMPOUND_STMT), None)
            if body and "constexpr" not in self.text[start:body.extent.start.offset].split("(")[0]:
                void = cursor.result_type.kind in (clang.TypeKind.VOID, clang.TypeKind.INVALID)
                self.body(body, "" if void else " {}")
                for child in cursor.get_children():
                    if child.kind not in NEVER and child != body:
                        self.expression(child)  # a constructor's member initializers
                        self.visit(child)
        else:
            for child in cursor.get_children():
                if self.is_here(child):
                    self.declarations(child)

    def body(self, body, value):
        at = body.extent.start.offset + 1
        whole = re.sub(r"\s*}$", "", self.text[at:body.extent.end.offset].strip())
        if whole not in ("", "return false;", "return {};", "return nullptr;"):
            self.add("early return", at, at, f" return{value};", "insert")
        self.visit(body)

    def visit(self, cursor):
        children = list(cursor.get_children())
        for index, child in enumerate(children):
            if child.kind in NEVER or not self.is_here(child):
                continue
            if child.kind == K.LAMBDA_EXPR:
                body = next((c for c in child.get_children() if c.kind == K.COMPOUND_STMT), None)
                values = [c for r in child.walk_preorder() if r.kind == K.RETURN_STMT for c in r.get_children()]
                if body:
                    self.body(body, f" {values[0].type.spelling}()" if values else "")
                continue
            if child.kind == K.CALL_EXPR and child.spelling == "reserve":
                continue  # changes only the speed
            if child.kind == K.DECL_STMT and re.match(r"(static )?constexpr|using\b", self.source(child)):
                continue
            if cursor.kind == K.CASE_STMT and index == 0:
                continue
            if self.is_statement(cursor, children, index):
                self.statement(child)
            else:
                self.expression(child)
            self.visit(child)
        condition = self.condition(cursor, children)
        if condition is not None:
            self.negate(condition)

    def is_statement(self, parent, children, index):
        last = index == len(children) - 1
        return (parent.kind == K.COMPOUND_STMT or parent.kind == K.IF_STMT and index > 0
                or parent.kind in (K.WHILE_STMT, K.FOR_STMT, K.CXX_FOR_RANGE_STMT, K.CASE_STMT,
                                   K.DEFAULT_STMT) and last or parent.kind == K.DO_STMT and index == 0)

    def bare(self, cursor):
        """Without parentheses and what the compiler adds."""
        children = list(cursor.get_children())
        while cursor.kind in (K.UNEXPOSED_EXPR, K.PAREN_EXPR) and len(children) == 1:
            cursor = children[0]
            children = list(cursor.get_children())
        return cursor

    def operator(self, cursor):
        """The operands of a binary operator, built in or overloaded, and where its sign is."""
        children = list(cursor.get_children())
        if (cursor.kind in (K.BINARY_OPERATOR, K.COMPOUND_ASSIGNMENT_OPERATOR) and len(children) == 2
                or cursor.kind == K.CALL_EXPR and len(children) == 3):
            start, end = children[0].extent.end.offset, children[-1].extent.start.offset
            sign = self.text[start:end].strip()
            if re.fullmatch(r"[-+*/%&|^<>=!]{1,3}", sign):
                start = self.text.index(sign, start)
                return children[0], children[-1], sign, start
        return None

    def statement(self, cursor):
        bare, (start, end) = self.bare(cursor), self.span(cursor)
        found = self.operator(bare)
        if (bare.kind in (K.CALL_EXPR, K.CXX_DELETE_EXPR, K.COMPOUND_ASSIGNMENT_OPERATOR)
                or found and found[2] == "=" or bare.kind == K.UNARY_OPERATOR):
            kind = "delete" if bare.kind == K.CXX_DELETE_EXPR else "dropped statement"
            self.add(kind, start, end, "", "statement")
        if bare.kind == K.CALL_EXPR and not found:
            self.swap(bare)
        if cursor.kind == K.DECL_STMT:
            for variable in cursor.get_children():
                call = re.search(r"[({]([\w.>-]+|\w+\(\))[)}]$", self.source(variable))
                if variable.kind == K.VAR_DECL and call and re.search("Lock|Guard|lock", variable.type.spelling):
                    first = self.span(variable)[0] + call.start(1)
                    self.add("lock", first, first + len(call[1]), f"velocor_private({call[1]})")

    def expression(self, cursor):
        if cursor.kind in (K.UNEXPOSED_EXPR, K.PAREN_EXPR) and self.bare(cursor) != cursor:
            return  # its one child is visited
        (start, end), text = self.span(cursor), self.source(cursor)
        found = self.operator(cursor)
        if found:
            left, right, sign, at = found
            for other in COMPARISONS.get(sign, []):
                kind = "boundary" if other[0] == sign[0] and sign[0] in "<>" else "comparison"
                self.add(kind, start, end, self.text[start:at] + other + self.text[at + len(sign):end])
            if sign in ("&&", "||"):
                self.negate(left)
                self.negate(right)
        elif cursor.kind == K.CALL_EXPR:
            if re.search("flush|sync", cursor.spelling, re.I):
                self.add("flush", start, end, "true")
            self.swap(cursor)
        elif cursor.kind == K.INTEGER_LITERAL and text[:1].isdigit():  # not in a macro
            number = re.fullmatch(r"(\d+)(\w*)", text)
            for step in (1, -1):
                self.add("constant", start, end,
                         f"{int(number[1]) + step}{number[2]}" if number and text[:2] != "0x" else f"({text} + {step})")
        elif cursor.kind == K.CHARACTER_LITERAL:
            self.add("constant", start, end, f"char({text} + 1)")
        elif cursor.kind == K.CXX_BOOL_LITERAL_EXPR and text in ("true", "false"):
            self.add("constant", start, end, "false" if text == "true" else "true")
        elif cursor.kind in (K.DECL_REF_EXPR, K.MEMBER_REF_EXPR):
            constant = cursor.referenced
            if (constant is not None and constant.kind == K.VAR_DECL and constant.type.is_const_qualified()
                    and constant.semantic_parent.kind not in FUNCTIONS
                    and constant.type.get_canonical().spelling.replace("const ", "") in (
                        "int", "unsigned int", "long", "unsigned long", "long long", "short")):
                self.add("constant", start, end, f"({text} + 1)")
                self.add("constant", start, end, f"({text} - 1)")

    def swap(self, call):
        if call.spelling in ("min", "max", "swap"):  # their order does not matter
            return
        arguments = [a for a in call.get_arguments() if a is not None and a.extent.end.offset > a.extent.start.offset]
        for a, b in zip(arguments, arguments[1:]):
            plain = [re.sub(r"^const (?=[^*]*$)|&", "", x.type.get_canonical().spelling) for x in (a, b)]
            (s, e), (t, f) = self.span(a), self.span(b)
            if plain[0] == plain[1] and self.text[s:e] != self.text[t:f] and e <= t:
                self.add("swapped arguments", s, e, self.text[t:f], "value",
                         [(t, f, self.text[s:e], "value")])

    def condition(self, cursor, children):
        if cursor.kind in (K.IF_STMT, K.WHILE_STMT) and children[0].kind not in (K.VAR_DECL, K.DECL_STMT):
            return children[0]
        if cursor.kind == K.DO_STMT:
            return children[1]
        if cursor.kind == K.CONDITIONAL_OPERATOR:
            return children[0]
        if cursor.kind == K.FOR_STMT:
            ends = [c for c in children[:-1] if self.text[c.extent.end.offset:].lstrip()[:1] == ";"]
            return ends[-1] if ends and ends[-1].kind.is_expression() else None
        bool_value = children and children[-1].type.kind == clang.TypeKind.BOOL
        if cursor.kind == K.RETURN_STMT and bool_value:
            return children[0]
        if cursor.kind == K.VAR_DECL and cursor.type.kind == clang.TypeKind.BOOL and bool_value:
            return children[-1] if children[-1].kind.is_expression() else None
        return None

    def negate(self, cursor):
        bare, (start, end) = self.bare(cursor), self.span(cursor)
        found = self.operator(bare)
        if found and found[2] in COMPARISONS or bare.kind == K.CXX_BOOL_LITERAL_EXPR:
            return
        text = self.text[start:end]
        self.add("negated condition", start, end, text[1:] if text[:1] == "!" else f"!({text})", "condition")


def instrument(text, mutants):
    """The text with all mutants in it, and the parts of it that belong to each, innermost last."""
    groups = collections.defaultdict(list)
    for mutant in mutants:
        for start, end, new, how in mutant["edits"]:
            groups[start, end].append((mutant["id"], new, how))
    order = sorted(groups, key=lambda span: (span[0], -span[1]))
    out, length, regions = [], 0, []

    def emit(piece):
        nonlocal length
        out.append(piece)
        length += len(piece)

    def write(start, end, inner):
        """Writes text[start:end], with the groups `inner`, which are inside it, replaced."""
        while inner:
            (first, last), rest = inner[0], inner[1:]
            emit(text[start:first])
            nested = [span for span in rest if span[1] <= last and span[0] < last]
            entries, begin = groups[first, last], length
            statement = any(how == "statement" for _, _, how in entries)
            if first != last:
                emit("(")
            for number, new, how in entries:
                begin_one = length
                if how == "insert":
                    emit(f" if (velocor_mutant({number})) {{{new} }}")
                elif statement:
                    emit(f"velocor_mutant({number}) ? (void)({new or 0}) : ")
                else:
                    emit(f"velocor_mutant({number}) ? ({new}) : ")
                regions.append((begin_one, length, [number]))
            if first != last:
                boolean = any(how == "condition" for _, _, how in entries)
                emit("(void)(" if statement else "!!(" if boolean else "(")
                write(first, last, nested)
                emit("))")
            regions.append((begin, length, [number for number, _, _ in entries]))
            start, inner = last, rest[len(nested):]
        emit(text[start:end])

    write(0, len(text), order)
    return "".join(out), regions


def compilable(name, first, text, path, arguments, unit_path):
    """The mutants of a source and the text with all of them; those that do not compile are left out."""
    index = clang.Index.create()
    options = clang.TranslationUnit.PARSE_DETAILED_PROCESSING_RECORD | 4  # keeps the headers parsed
    unit = index.parse(unit_path, arguments, [(path, text)], options)
    errors = [d for d in unit.diagnostics if d.severity >= clang.Diagnostic.Error]
    if errors:
        raise RuntimeError(f"{name}: {errors[0]}")
    mutants = Finder(name, text, unit, path).mutants
    for number, mutant in enumerate(mutants, first):
        mutant["id"] = number
    while True:
        changed, regions = instrument(text, mutants)
        unit.reparse([(path, changed)], options)
        errors = [d for d in unit.diagnostics if d.severity >= clang.Diagnostic.Error]
        if not errors:
            return mutants, changed
        bad = set()
        # Errors in a template are noted where this source uses it.
        places = [[p.location.offset for p in [error, *error.children]
                   if p.location.file and p.location.file.name == path] for error in errors]
        for own in places:
            around = next(filter(None, ([r for r in regions if r[0] <= at < r[1]] for at in own)), None)
            if around:
                bad.update(min(around, key=lambda r: r[1] - r[0])[2])
        if not bad:  # it only causes the error, as the size of an array does
            at = next(filter(None, places))[0]
            bad.update(min(regions, key=lambda r: min(abs(r[0] - at), abs(r[1] - at)))[2])
        mutants = [m for m in mutants if m["id"] not in bad]
