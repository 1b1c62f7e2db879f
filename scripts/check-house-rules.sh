#!/usr/bin/env bash
# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
#
# The rules of this source tree that no compiler checks. Prints each breach, fails on any.
set -euo pipefail
cd "$(dirname "${BASH_SOURCE[0]}")/.."

breaches=0

# rule TEXT COMMAND...: what the command prints are the places where the rule is broken.
rule() {
    local text=$1 places
    shift
    places=$("$@")
    [ -n "$places" ] || return 0
    printf 'house rules: %s:\n%s\n' "$text" "$places"
    breaches=$((breaches + 1))
}

# Every file that is tracked or would be, as git matches the patterns; a pattern's * takes in folders.
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

# grep over the files named on standard input; finding nothing is no failure.
search() { xargs -0 -r grep "$@" || [ $? -eq 123 ]; }

without_spdx() {
    local file
    while IFS= read -r -d '' file; do
        [ "$(head -n 5 "$file" | grep -cE \
            'SPDX-FileCopyrightText: The Velocor authors|SPDX-License-Identifier: MIT')" -eq 2 ] ||
            echo "$file"
    done < <(sources)
}

without_pragma_once() { tracked '*.h' | search -LE '^#pragma once$'; }

stray_blanks() { sources | search -nHP '\t|[ \t]+$'; }

# Ada is the user of the samples. The names are broken up so as not to find themselves.
machine_paths() {
    local start='(^|[^]A-Za-z0-9_.}$)/-])' name='[A-Za-z0-9_.]+'
    tracked | search -nHIP \
        "$start/((home|Users)/(?!ada/)$name/$name|(root|wo""rk|workspace)/$name)|/tmp/[a-z]*_jo""bs"
}

# Of the includes of a folder's own files that name a folder of this tree, those of any folder but
# this one and the given ones; of a relative path it cannot be told. The entry point is above all.
includes_beyond() {
    local allowed
    allowed=$(printf '|%s' "$@")
    tracked ":(glob)$1/*.cpp" ":(glob)$1/*.h" | grep -zvxF app/main.cpp |
        search -nHP "^\s*#\s*include\s*[<\"](?!(${allowed#|})/[^/]+[>\"])(\.\.?/|(app|common)/)"
}

# What a folder's files may include of this tree besides each other: the arrows between the rooms.
may_include() {
    local folder=$1
    shift
    rule "$folder may include ${*:-nothing else}, no more" includes_beyond "$folder" "$@"
}

rooms() {
    may_include common/config common/log common/xml
    may_include common/log common/config
    may_include common/xml common/log
    may_include app common/config common/log common/xml
    may_include app/logfile
    may_include app/settingsfile common/config
    may_include app/runninglog common/config common/log
    may_include app/window/widgets app/logfile
    may_include app/window/log app/logfile app/runninglog app/window/widgets
    may_include app/window/settings app/settingsfile app/window/widgets common/config
    may_include app/window app app/logfile app/runninglog app/settingsfile \
        app/window/log app/window/settings app/window/widgets common/config common/log
}

# A folder that the rooms do not name would have no rule.
folders_without_rule() {
    local folder
    while IFS= read -r folder; do
        declare -f rooms | grep -qE "may_include $folder( |;|\$)" || echo "$folder"
    done < <(git ls-files --cached --others --exclude-standard 'app/*.h' 'common/*.h' |
        sed 's,/[^/]*$,,' | sort -u)
}

# The rooms below the window could include the headers of widgets through the framework.
widgets_below_the_window() {
    tracked 'app/logfile/*' 'app/settingsfile/*' 'app/runninglog/*' |
        search -nHP '^\s*#\s*include\s*<(Qt(Gui|Widgets)\b|Q\w*(Widget|Dialog|Color|Font|Icon|Image|Pixmap|Paint|Palette|Screen|Style|Menu|Label|Button|Layout|MessageBox|Window|Clipboard|GuiApplication)|QApplication)'
}

# Statements that match a pattern and hold no call of PlainToolTip(); they may go over several lines.
bare_tool_tips() {
    local rest='((?!PlainToolTip\()[^;{}])*'
    tracked 'app/*.cpp' 'app/*.h' | search -HPzo \
        "\bset(Tab)?ToolTip\($rest(?=;)|(?<=[;{}])$rest,\s*Qt::ToolTipRole\)|ToolTipRole:$rest(?=;)|WhatsThis\(" |
        tr -s '\0\n' '\n'
}

# PlainText.cpp is where they are made plain; UserMessages shows boxes as its callers want them.
guessing_widgets() {
    local boxes='(critical|warning|information|question|about)'
    tracked 'app/*.cpp' 'app/*.h' ':!app/UserMessages.cpp' ':(exclude,glob)app/**/PlainText.*' | search -nHP \
        "new QLabel\b|\bQLabel\s+\w+\s*[;({]|QMessageBox::$boxes\(|new QMessageBox\b|\bQMessageBox\s+\w+\s*[;({]|QMessageBox\(|addRow\(\s*(tr\(|QString|\")|QErrorMessage|QProgressDialog|QInputDialog|QTextBrowser|QToolTip::"
}

rule "no SPDX lines at the top" without_spdx
rule "a header without #pragma once" without_pragma_once
rule "a tab, or blanks at a line's end" stray_blanks
rule "a path of one machine" machine_paths
rooms
rule "a folder that no rule says what it may include" folders_without_rule
rule "a widget below the window" widgets_below_the_window
rule "a tool tip that does not come from PlainToolTip()" bare_tool_tips
rule "a widget that guesses whether its text is rich; see app/window/PlainText.h" guessing_widgets

[ "$breaches" -eq 0 ] || exit 1
echo "house rules: $(sources | tr -dc '\0' | wc -c) files keep them"
