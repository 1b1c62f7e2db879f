// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/RequiredLiterals.h"

#include <QRegularExpression>
#include <QtTest>

using namespace Velocor;

class tst_RequiredLiterals : public QObject
{
    Q_OBJECT

private slots:
    void literals_data();
    void literals();
};

void tst_RequiredLiterals::literals_data()
{
    QTest::addColumn<QString>("expression");
    QTest::addColumn<QStringList>("literals");
    const auto row = [](char const* name, char const* expression, QStringList const& literals) {
        QTest::newRow(name) << QString::fromUtf8(expression) << literals;
    };
    const auto none = [&](char const* name, char const* expression) {
        row(name, expression, QStringList());
    };

    none("nothing", "");
    row("text", "disk full", {"disk full"});
    row("not only ASCII", "größe", {QString::fromUtf8("größe")});
    row("brackets that close nothing", "a]b}c", {"a]b}c"});

    row("a dot", "ab.cd", {"ab", "cd"});
    row("anchors", "^ab$", {"ab"});
    none("alternatives", "ab|cd");
    none("alternatives, one empty", "|ab");

    row("optional", "ab?c", {"a", "c"});
    row("optional, at the start", "a?b", {"b"});
    row("optional, lazy", "ab??c", {"a", "c"});
    row("optional, possessive", "ab?+c", {"a", "c"});
    row("any number", "ab*c", {"a", "c"});
    row("at least one", "ab+c", {"ab", "c"});
    row("at least one, lazy", "ab+?c", {"ab", "c"});
    row("a pair of surrogates, optional", "a😀?b", {"a", "b"});
    row("a pair of surrogates at the start, optional", "😀?b", {"b"});
    row("none at all", "a{0}b", {"b"});
    row("none, but not at the start", "ca{0}b", {"c", "b"});
    row("none, in two digits", "a{00}b", {"b"});
    row("from none on", "a{0,}b", {"b"});
    row("up to two", "a{0,2}b", {"b"});
    row("twice", "ca{2}b", {"ca", "b"});
    row("ten times", "ca{10}b", {"ca", "b"});
    row("two or more", "ca{2,}b", {"ca", "b"});
    none("what newer versions take for a quantifier", "ca{,3}b");
    none("what newer versions take for a quantifier, with a blank", "ca{ 1}b");
    none("a brace before digits that is none", "ca{1");
    none("a brace before digits and more", "ca{1a}b");
    none("a brace before a comma that is none", "ca{1,a}b");
    row("a brace", "a{\"b\":", {"a{\"b\":"});
    row("a brace, optional", "a{?b", {"a", "b"});
    row("a brace at the end", "a{", {"a{"});

    row("a group", "ab(cd)ef", {"ab", "ef"});
    row("an optional group", "ab(cd)?ef", {"ab", "ef"});
    row("alternatives in a group", "ab(c|d)ef", {"ab", "ef"});
    row("groups in groups", "ab(c(d|e)f)ef", {"ab", "ef"});
    row("a group without a number", "ab(?:cd)*ef", {"ab", "ef"});
    row("a group with a name", "ab(?<n_1>cd)ef", {"ab", "ef"});
    row("a group with a short name", "ab(?<n>cd)ef", {"ab", "ef"});
    none("a group with a name that is not ASCII", "ab(?<é>cd)ef");
    none("a group with a name that is not all ASCII", "ab(?<né>cd)ef");
    row("an empty group without a number", "ab(?:)ef", {"ab", "ef"});
    row("an empty group with a name", "ab(?<n>)ef", {"ab", "ef"});
    none("a group with a name in another style", "ab(?P<n>cd)ef");
    none("a group with a name in a third style", "ab(?'n'cd)ef");
    row("an atomic group", "ab(?>cd)ef", {"ab", "ef"});
    row("a group with numbers by branch", "ab(?|cd|e)ef", {"ab", "ef"});
    row("text ahead", "ab(?=cd)ef", {"ab", "ef"});
    row("no text ahead", "ab(?!cd)ef", {"ab", "ef"});
    row("text before", "ab(?<=cd)ef", {"ab", "ef"});
    row("no text before", "ab(?<!cd)ef", {"ab", "ef"});
    row("a bracket in a group, escaped", "ab(\\))ef", {"ab", "ef"});
    row("a bracket in a group, in a class", "ab([)])ef", {"ab", "ef"});
    row("a bracket in a group, quoted", "ab(\\Q)\\E)ef", {"ab", "ef"});
    none("recursion", "ab(?1)(ef)");
    none("a condition", "(a)?(?(1)b|c)d");
    none("a comment", "ab(?#cd)ef");
    none("a comment before a quantifier", "ab(?#cd)?ef");
    none("a comment with an opening bracket", "ab(?#()ef");
    none("an option", "(?i)ab");
    none("an option, later", "ab(?x)c d # e");
    none("an option in a group", "ab((?x)#)\n)cd");
    none("an option of a group", "ab(?i:cd)ef");
    none("a verb", "(*UCP)ab");
    none("a verb that ends the match", "(*ACCEPT)ab");

    row("a class", "ab[cd]ef", {"ab", "ef"});
    row("a negated class", "ab[^cd]ef", {"ab", "ef"});
    row("a class of a pipe", "ab[|]ef", {"ab", "ef"});
    row("a class of a closing bracket", "ab[]]ef", {"ab", "ef"});
    row("a negated class of a closing bracket", "ab[^]]ef", {"ab", "ef"});
    row("a class of an escaped bracket", "ab[\\]]ef", {"ab", "ef"});
    row("a class of an opening bracket", "ab[[]ef", {"ab", "ef"});
    row("a class of a backslash", "ab[\\\\]ef", {"ab", "ef"});
    row("a class of a character by its number", "ab[\\x5d]ef", {"ab", "ef"});
    row("a class of a colon", "ab[c:]ef", {"ab", "ef"});
    none("a class of a character and a named class", "ab[c[:alpha:]]ef");
    none("a class of a named class", "ab[[:alpha:]]ef");
    none("a class of a control character", "ab[\\c]]ef]gh");
    none("a class with quotes", "ab[\\Q]\\E]ef");
    none("a class with the end of quotes", "ab[\\E]ef]gh");

    row("an escaped pipe", "ab\\|cd", {"ab|cd"});
    row("an escaped dot", "a\\.b", {"a.b"});
    row("an escaped backslash", "a\\\\b", {"a\\b"});
    row("an escaped character, optional", "a\\.?b", {"a", "b"});
    row("an escaped blank", "a\\ b", {"a b"});
    row("an escaped tilde", "a\\~b", {"a~b"});
    none("an escaped character that is not printed", "a\\\x7F"
                                                     "b");
    none("an escaped character, not ASCII", "a\\éb");
    row("classes by a letter", "ab\\dcd\\Wef", {"ab", "cd", "ef"});
    row("a class by a letter, optional", "ab\\d?cd", {"ab", "cd"});
    row("a place by a letter", "\\bab\\Kcd\\z", {"ab", "cd"});
    row("a tabulator", "ab\\tcd", {"ab", "cd"});
    none("a character by its number", "ab\\x41cd");
    none("a character by its long number", "ab\\x{41}cd");
    none("a character by its octal number", "ab\\o{101}cd");
    none("a character by its name", "ab\\N{U+41}cd");
    row("no line end", "ab\\Ncd", {"ab", "cd"});
    none("a control character", "ab\\cAcd");
    none("a property", "ab\\p{L}cd");
    none("a back reference", "(a)b\\1c");
    none("a back reference by name", "(?<n>a)b\\k<n>c");
    row("quoted text", "ab\\Q(|\\Ecd", {"ab(|cd"});
    row("quoted text, optional", "ab\\Qcd\\E?ef", {"abc", "ef"});
    row("quoted to the end", "ab\\Q(|", {"ab(|"});
    row("no quoted text, optional", "ab\\Q\\E?ef", {"a", "ef"});
    row("the end of no quotes, optional", "ab\\E?ef", {"a", "ef"});
}

void tst_RequiredLiterals::literals()
{
    QFETCH(QString, expression);
    QVERIFY(QRegularExpression(expression).isValid());
    QTEST(RequiredLiterals(expression), "literals");
}

QTEST_GUILESS_MAIN(tst_RequiredLiterals)
#include "tst_RequiredLiterals.moc"
