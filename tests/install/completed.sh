# What bash offers for lines of which the last word has begun, by the completions of a prefix.
#
#   completed.sh PREFIX
prefix=$1
PATH=$prefix/bin:$PATH
status=0

# offers <line> <words expected, in their order>
offers() {
    local line=$1 expected=$2 COMP_WORDS COMP_CWORD COMPREPLY=()
    read -ra COMP_WORDS <<<"$line"
    case $line in *' ') COMP_WORDS+=('') ;; esac
    COMP_CWORD=$((${#COMP_WORDS[@]} - 1))
    . "$prefix/share/bash-completion/completions/${COMP_WORDS[0]}"
    complete -p "${COMP_WORDS[0]}" >/dev/null || status=1
    _zem_complete "${COMP_WORDS[0]}" "${COMP_WORDS[COMP_CWORD]}" "${COMP_WORDS[COMP_CWORD - 1]}"
    [ "${COMPREPLY[*]}" = "$expected" ] && return
    echo "'$line' offers '${COMPREPLY[*]}', not '$expected'"
    status=1
}

offers 'cimom w' 'watch'
offers 'cimom --br' '--broker'
offers 'cimom --user ann g' 'gi gp gc'
offers 'cimom --format ' 'text json'
offers 'cimom watch --c' '--count'
offers 'cimom watch C' ''
offers 'appliance fault --sig' '--signal'
offers 'appliance show --format t' 'text'
offers 'qyplat -' '-r -m --filter -F --help --version'
offers 'qyplat -m x -r ' 'sys lpar prof'
offers 'domove -o ' 'v m s'
exit $status
