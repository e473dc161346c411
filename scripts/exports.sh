#!/bin/sh
# Tells what a library has exported and does not any more, by the record of what it did when it was
# last packed: a line for each class (- for what is in none) with the names of its functions, and
# how many share a name. What is new is nobody's loss.
#
#   scripts/exports.sh LIBRARY RECORD            says what is lost; exits with 1 when anything is
#   scripts/exports.sh --record LIBRARY RECORD   writes the record anew
#
set -eu
export LC_ALL=C

# Without tables, thunks and what templates and inline functions leave, which compilers choose.
exported() {
    nm -DC --defined-only "$1" |
        sed -n '/ thunk to /d; s/\[abi:[^]]*\]//; s/ \[clone .*//; s/^[0-9a-f]* [TDBR] //p' |
        sort -u | sed 's/(.*//; s/ /_/g; /::/!s/^/-::/; s/\(.*\)::/\1: /' | sort | uniq -c |
        awk '{ $3 = $3 ($1 > 1 ? "*" $1 : "") }
             $2 != class { if (class) print line; class = line = $2 }
             { line = line " " $3 }
             END { print line }' | fold -s -w 98 | sed 's/ $//; /^[^ ]*: /!s/^/  /'
}
# one name a line, as often as it is exported
names() {
    awk '{ for (i = 1; i <= NF; ++i) {
               if ($i ~ /:$/) { class = $i; continue }
               times = match($i, /\*[0-9]+$/) ? substr($i, RSTART + 1) : 1
               sub(/\*[0-9]+$/, "", $i)
               for (n = 1; n <= times; ++n) print class ":" $i, n
           } }' | sort
}

case ${1:-} in
    --record) exported "$2" >"$3"; exit ;;
    -h | --help) sed -n '2,/^$/{/^$/d;/^[^#]/d;s/^# \{0,1\}//;p}' "$0"; exit ;;
esac
now=$(mktemp)
trap 'rm -f "$now"' EXIT
exported "$1" | names >"$now"
lost=$(names <"$2" | comm -23 - "$now" | sed 's/ [0-9]*$//')
[ -z "$lost" ] || {
    printf 'exported no more, or less often:\n%s\n' "$lost"
    printf 'Programs that use it will not run. If that is meant: a new SOVERSION, and --record.\n'
    exit 1
}
