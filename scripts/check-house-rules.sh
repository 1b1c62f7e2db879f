#!/usr/bin/env bash
# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
#
# Checks the rules of this source tree that no compiler checks. Prints every violation, fails on any.
set -euo pipefail
cd "$(dirname "${BASH_SOURCE[0]}")/.."

violations=0

# rule TEXT COMMAND...: the command prints the places that violate the rule.
rule() {
    local text=$1 places
    shift
    places=$("$@")
    [ -n "$places" ] || return 0
    printf 'house rules: %s:\n%s\n' "$text" "$places"
    violations=$((violations + 1))
}

# All files that are tracked or not ignored and match the patterns of git, whose * also matches /.
tracked() {
    local file
    git ls-files --cached --others --exclude-standard -- "$@" | sort -u |
        while IFS= read -r file; do
            [ ! -f "$file" ] || printf '%s\0' "$file"
        done
}

sources() {
    tracked '*.cpp' '*.h' '*.cmake' '*CMakeLists.txt' '*.sh' '*.in' run test bench package check .ci/run .clang-tidy
}

# Runs grep on the files named on standard input; no match is not a failure, but a bad pattern is.
# shellcheck disable=SC2016  # expanded by the shell that xargs starts
search() { xargs -0 -r bash -c 'grep "$@" || [ $? -eq 1 ]' grep "$@"; }

# REUSE-IgnoreStart
without_spdx() {
    local file
    while IFS= read -r -d '' file; do
        [ "$(head -n 5 "$file" | grep -cE \
            'SPDX-FileCopyrightText: The Velocor authors|SPDX-License-Identifier: MIT')" -eq 2 ] ||
            echo "$file"
    done < <(sources)
}
# REUSE-IgnoreEnd

without_pragma_once() { tracked '*.h' | search -LE '^#pragma once$'; }

stray_blanks() { sources | search -nHP '\t|[ \t]+$'; }

# Ada is the user in the samples. The names are split so that the check does not find itself.
machine_paths() {
    local start='(^|[^]A-Za-z0-9_.}$)/-])' name='[A-Za-z0-9_.]+'
    tracked | search -nHIP \
        "$start/((home|Users)/(?!ada/)$name/$name|(root|wo""rk|workspace)/$name)|/tmp/[a-z]*_jo""bs"
}

# Between "Q_SIGNALS:" and the next access specifier or the end of the class.
capital_signals() {
    local file
    while IFS= read -r -d '' file; do
        awk -v file="$file" '/^ *(Q_SIGNALS:|signals:)/ { inside = 1; next }
            /^ *(public|protected|private)( Q_SLOTS| slots)?:|^};/ { inside = 0 }
            inside && /^ *void [A-Z]/ { print file ":" FNR ":" $0 }' "$file"
    done < <(tracked 'app/*.h' 'common/*.h')
}

qt_keywords() {
    tracked 'app/*.cpp' 'app/*.h' 'common/*.cpp' 'common/*.h' |
        search -nHE '^\s*(signals|(public|protected|private) slots):|\bemit [A-Za-z]'
}

# QString const&, as in CONTRIBUTING.md.
const_before_the_type() {
    tracked 'app/*.cpp' 'app/*.h' 'common/*.cpp' 'common/*.h' |
        search -nHP '\bconst [\w:]+(<[^<>;]*>)? ?[&*]'
}

# The names are those that Qt 5.15's manual says came after 5.9, except common words; overloads and
# new classes' members of older names are not among them. keyToValue() asks whether there is such a
# name.
newer_than_qt_5_9() {
    tracked 'app/*.cpp' 'app/*.h' 'common/*.cpp' 'common/*.h' 'examples/*.cpp' 'examples/*.h' |
        search -nHwFf scripts/qt-after-5.9.txt | grep -vE '^[^:]+:[0-9]+: *//|keyToValue' || true
}

exceptions() {
    tracked 'app/*.cpp' 'app/*.h' 'common/*.cpp' 'common/*.h' | search -nHP '^(?!\s*//).*\bthrow\b'
}

private_headers_in_public_ones() {
    tracked ':(glob)app/*.h' 'common/*.h' ':!*_p.h' | search -nHE '^\s*#\s*include.*_p\.h"'
}

# The words are split so that the check does not find itself.
british_spelling() {
    local stems='behav''iour|organ''is|initial''is|serial''is|recogn''is|optim''is|normal''is|sanit''is'
    tracked ':!LICENSES/*' ':!translations/*' | search -nHIiE "\\b(un|de|re)?($stems)|\\b(lic""ence|cen""tre|neigh""bour|fav""our)"
}

# Except where CONTRIBUTING.md forbids it.
other_words_for_qt() {
    tracked ':!CONTRIBUTING.md' | search -nHIi 'tool''kit'
}

# The framework links Qt Widgets, so the compiler would let the rooms below the window use it.
# Colors and fonts are values of the store, and need no window.
widgets_below_the_window() {
    tracked 'app/logfile/*' 'app/history/*' 'app/report/*' 'app/terminal/*' 'app/settingsfile/*' 'app/runninglog/*' |
        search -nHP '^\s*#\s*include\s*<(Qt(Gui|Widgets)\b|Q\w*(Widget|Dialog|Color|Font|Icon|Image|Pixmap|Paint|Palette|Screen|Style|Menu|Label|Button|Layout|MessageBox|Window|Clipboard|GuiApplication)|QApplication)' |
        sed '/^app\/settingsfile\/.*<Q\(Color\|Font\)>/d'
}

# The compiler sees only one of them at a time, and the linker takes either one's functions for both.
types_of_one_name() {
    tracked 'app/*.h' | search -hoP '^(class|struct) \K\w+(?=[^;]*$)' | sort | uniq -d
}

# Statements, also of several lines, that set a tool tip without calling PlainToolTip().
bare_tool_tips() {
    local rest='((?!PlainToolTip\()[^;{}])*'
    tracked 'app/*.cpp' 'app/*.h' | search -HPzo \
        "\bset(Tab)?ToolTip\($rest(?=;)|(?<=[;{}])$rest,\s*Qt::ToolTipRole\)|ToolTipRole:$rest(?=;)|WhatsThis\(" |
        tr -s '\0\n' '\n'
}

# PlainText.cpp makes them plain; UserMessages leaves the format to its callers.
guessing_widgets() {
    local boxes='(critical|warning|information|question|about)'
    tracked 'app/*.cpp' 'app/*.h' ':!app/UserMessages.cpp' ':(exclude,glob)app/**/PlainText.*' | search -nHP \
        "new QLabel\b|\bQLabel\s+\w+\s*[;({]|QMessageBox::$boxes\(|new QMessageBox\b|\bQMessageBox\s+\w+\s*[;({]|QMessageBox\(|addRow\(\s*(tr\(|QString|\")|QErrorMessage|QProgressDialog|QInputDialog|QTextBrowser|QToolTip::"
}

# Headers that are installed, of more than 20 lines, in which fewer than 60 % of the lines that are not
# blank or an #include are comments.
undocumented_headers() {
    local file
    tracked ':(glob)app/*.h' 'common/*.h' ':!*_p.h' |
        while IFS= read -r -d '' file; do
            awk -v file="$file" 'NF && !/^#include/ { lines++ } /^ *\/\// { comments++ }
                END { if (NR > 20 && comments < 0.6 * lines)
                    printf "%s: %d of %d lines\n", file, comments, lines }' "$file"
        done
}

# CMakeLists.txt has the version; only the lists of releases name it again.
unlisted_release() {
    local version
    version=$(sed -n 's/^ *VERSION \([0-9.]*\)$/\1/p' CMakeLists.txt | head -n 1)
    grep -qF "<release version=\"$version\"" packaging/linux/org.tork.velocor.metainfo.xml ||
        echo "packaging/linux/org.tork.velocor.metainfo.xml: no release $version"
    grep -qF "## [$version]" CHANGELOG.md || echo "CHANGELOG.md: no release $version"
}

# docs/deliberate-oddities.md names rows as `tst_Class::function(row)`, or without the row. A name may
# continue on the next line.
rows_without_test() {
    local name class function row source
    tr '\n' ' ' <docs/deliberate-oddities.md | tr -s ' ' | grep -oP 'tst_\w+::[^\x60]*' |
        while IFS= read -r name; do
            class=${name%%::*}
            function=${name#*::}
            function=${function%%(*}
            row=
            [[ $name != *'('* ]] || row=${name#*(} row=${row%)}
            source=$(git ls-files --cached --others --exclude-standard -- "*/$class.cpp")
            if [ ! -f "$source" ] || ! grep -q "^void $class::$function()" "$source"; then
                echo "$name"
            elif [ -n "$row" ] &&
                ! sed -n "/^void $class::${function}_data()/,/^}/p" "$source" |
                    grep -F "\"$row\"" >/dev/null; then # with -q, sed would fail with SIGPIPE
                echo "$name"
            fi
        done
}

[ "$(sources | tr -dc '\0' | wc -c)" -gt 0 ] # git may refuse to list another user's files

rule "no SPDX lines at the top" without_spdx
rule "a header without #pragma once" without_pragma_once
rule "a tab or trailing blanks" stray_blanks
rule "a machine-specific path" machine_paths
rule "does not match docs/architecture.md" scripts/check-rooms.py
rule "a signal that starts with a capital letter" capital_signals
rule "a Qt keyword instead of Q_SIGNALS, Q_SLOTS or Q_EMIT" qt_keywords
rule "const before the type of a reference or pointer" const_before_the_type
rule "not in Qt 5.9" newer_than_qt_5_9
rule "an exception" exceptions
rule "an installed header that includes a private one" private_headers_in_public_ones
rule "British spelling" british_spelling
rule "another word for Qt" other_words_for_qt
rule "widgets used below the window" widgets_below_the_window
rule "a name of two types" types_of_one_name
rule "a tool tip that does not come from PlainToolTip()" bare_tool_tips
rule "a widget that guesses its text format; see app/window/widgets/PlainText.h" guessing_widgets
rule "an installed header with less than 60 % comment lines" undocumented_headers
rule "a version that is not among the releases" unlisted_release
rule "an oddity whose test row does not exist" rows_without_test

[ "$violations" -eq 0 ] || exit 1
echo "house rules: $(sources | tr -dc '\0' | wc -c) files follow them"
