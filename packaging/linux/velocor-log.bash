# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
#
# Completion of velocor-log for bash.

_velocor_log() {
    local current=$2 previous=$3 data=${XDG_DATA_HOME:-$HOME/.local/share}/Tork name
    COMPREPLY=()
    case $previous in
    --format)
        mapfile -t COMPREPLY < <(compgen -W 'text markdown csv json' -- "$current")
        return
        ;;
    --severity)
        mapfile -t COMPREPLY < <(compgen -W 'trace notification warning error fatal none
            notification+ warning+ error+' -- "$current")
        return
        ;;
    --since | --until | --match | --exclude | --context) return ;;
    esac
    if [[ ${COMP_WORDS[1]} == report && $COMP_CWORD -gt 1 ]]; then
        mapfile -t COMPREPLY < <(compgen -W '--without --hide --help' -- "$current")
        [[ $current == -* ]] || mapfile -t COMPREPLY < <(compgen -f -- "$current")
        return
    fi
    if [[ $current == -* ]]; then
        mapfile -t COMPREPLY < <(compgen -W '--merge --since --until --severity --match --exclude
            --context --follow --runs --patterns --program --format --help --version' -- "$current")
        return
    fi
    mapfile -t COMPREPLY < <(compgen -f -- "$current")
    [[ $COMP_CWORD -gt 1 || report != "$current"* ]] || COMPREPLY+=(report)
    for name in "$data"/*/logs; do
        name=${name%/logs}
        name=${name##*/}
        [[ $name == '*' || $name != "$current"* ]] || COMPREPLY+=("$name")
    done
}
complete -o filenames -F _velocor_log velocor-log
