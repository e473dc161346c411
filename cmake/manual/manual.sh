# Makes the manual page of a program from what it prints with --help, for it and for each of its
# verbs, and from a file with further sections.
#
#   manual.sh PROGRAM SECTIONS PAGE
set -eu
folder=$(dirname "$1") program=$(basename "$1") sections=$2 page=$3
PATH=$(cd "$folder" && pwd):$PATH
# The same page whoever makes it, wherever and whenever.
export PATH LC_ALL=C SOURCE_DATE_EPOCH
released=$(sed -n 's/^ -- .*>  //p' "$(dirname "$0")/../debian/changelog" | head -n 1)
SOURCE_DATE_EPOCH=$(date -u -d "$released" +%s)
unset APPLIANCE_HOME CIMOM_REGISTRATION CIMOM_SCHEMA VM_CIMPROVIDER_TRACE_PATH

mkdir -p "$(dirname "$page")"
trap 'rm -f "$page.more"' EXIT
summary=$("$program" --help | sed -n "/^Usage:/d; s/^$program //; s/\.\$//; p; q" )
verbs=$("$program" --help | sed -n '/^Subcommands:/,/^$/s/^  \([a-z]\{1,\}\) .*/\1/p')
{
    [ -z "$verbs" ] || echo '[verbs]'
    for verb in $verbs; do
        "$program" "$verb" --help | awk '
            function roff(text) { gsub(/\\/, "\\e", text); gsub(/-/, "\\-", text); return text }
            /^Usage: / { print ".SS \"" roff(substr($0, 8)) "\"\n" roff(summary); used = 1; next }
            !used { summary = summary (summary ? " " : "") $0; next }
            !/^ / { told = /^(Options|Positionals):/; next }
            !told || /^  -h,--help/ { next }
            /^  [^ ]/ { at = match(substr($0, 3), /   *[^ ]/)
                        print ".TP\n\\fB" roff(at ? substr($0, 3, at - 1) : substr($0, 3)) "\\fR"
                        $0 = at ? substr($0, at + RLENGTH + 1) : "" }
            { sub(/^ */, "") }
            NF { print roff($0) }'
    done
    cat "$sections"
} >"$page.more"
help2man --no-info --name "$summary" --include "$page.more" --output "$page" "$program"
