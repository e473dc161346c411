# Completion in bash, for each program by whose name this file is called: verbs, options, and the
# values of those that --help lists them for. All is read from --help, so nothing stands here twice.

# _zem_help <program> [<verb>]: without the state of an appliance, in which a failure of the
# program's next call may be planned.
_zem_help() { env -u APPLIANCE_HOME "$@" --help 2>/dev/null; }

# Of lines on standard input, the options; or with an option, the values that it may have.
_zem_options() {
    awk -v of="$1" '/^  -/ {
        sub(/^  /, ""); sub(/   *[^ ].*/, ""); sub(/  $/, "")
        split($0, part, " "); n = split(part[1], names, ",")
        for (i = 1; i <= n; ++i)
            if (of == "") { if (!told[names[i]]++) print names[i] }
            else if (names[i] == of) {
                count = split(substr($0, length(part[1]) + 2), values, /[|{},]/)
                for (j = 1; j <= count; ++j)
                    if (values[j] ~ /^[a-z][a-z0-9_]*$/ && !told[values[j]]++) print values[j]
            } }'
}

_zem_complete() {
    local program=$1 word=$2 before=$3 help verbs verb i words=
    help=$(_zem_help "$program")
    verbs=$(sed -n '/^Subcommands:/,/^$/s/^  \([a-z][a-z]*\) .*/\1/p' <<<"$help")
    for ((i = 1; i < COMP_CWORD && ${#verbs}; ++i)); do
        if grep -qxFe "${COMP_WORDS[i]}" <<<"$verbs"; then
            verb=${COMP_WORDS[i]}
            help+=$'\n'$(_zem_help "$program" "$verb")
            break
        fi
    done
    case $before in
        -*) words=$(_zem_options "$before" <<<"$help") ;;
    esac
    case $word in
        -*) words=$(_zem_options '' <<<"$help") ;;
        *) [ -n "$words$verb" ] || words=$verbs ;;
    esac
    mapfile -t COMPREPLY < <(compgen -W "$words" -- "$word")
}

complete -o default -F _zem_complete "${BASH_SOURCE[0]##*/}"
