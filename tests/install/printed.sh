# Does what a page prints, in the order of the page: writes the files that it names, runs its
# commands, holds their output to the answer that follows them, and compiles its other C++. So for
# the examples of two headers. No link of an installed page may be dead.
#
#   printed.sh PAGE PREFIX LIBDIR CXX
set -eu
page=$1 PREFIX=$2 libdir=$3 CXX=$4
export PREFIX CXX PKG_CONFIG_PATH="$libdir/pkgconfig"
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
cd "$work"

# A block becomes NNN.KIND; the name of its file, which ends the line before it, stands in NNN.name.
awk '/^```/ && !within { within = 1; n = sprintf("%03d", ++count); block = n "." (substr($0, 4) ? substr($0, 4) : "text")
         printf "" > block
         if (match(last, /`[^`]+`:$/)) print substr(last, RSTART + 1, RLENGTH - 3) > (n ".name")
         next }
     /^```/ { within = 0; last = ""; next }
     within { print > block }
     NF { last = $0 }' "$page"

echo '#include <cstdio>' >others.cpp
printf '#include <%s.h>\n' AssociationProvider BaseZemInstanceProvider DNXApiCaller \
    BaseZemMultiNtoNAssociationProvider DataTypeConvertUtils JMPIProviderInterfaceStub \
    MultiNtoNAssociationProvider NtoNAssociationProvider ProviderFactories >>others.cpp
for block in [0-9]*.cpp [0-9]*.sh [0-9]*.text; do echo "$block"; done | grep -v '\*' | sort >blocks
mkdir home && cd home
while read -r block; do
    block=$work/$block
    name=${block%.*}.name
    if [ -f "$name" ]; then
        cp "$block" "$(cat "$name")"
        continue
    fi
    case $block in
        *.sh) . "$block" >"$work/said" ;;
        *.text)
            [ -f "$work/said" ] || continue
            diff "$work/said" "$block"
            rm "$work/said"
            ;;
        *.cpp) grep -q '^ *\.\.\.$' "$block" || cat "$block" >>"$work/others.cpp" ;;
    esac
done <"$work/blocks"

# example <header>: the indented lines of its opening comment
example() { sed -n '/^#/q;s|^///     ||p' "$PREFIX/include/zemutilities/$1"; }
{
    echo 'void read(const char* user) {'
    example DNXApiCaller.h
    echo '}'
    example BaseZemInstanceProvider.h
} >>"$work/others.cpp"
"$CXX" -std=c++17 -fsyntax-only -Wall -Wextra -Woverloaded-virtual -Werror \
    $(pkg-config --cflags zemutilities) "$work/others.cpp"

cd "$PREFIX"/share/doc/zemutilities
for page in README.md docs/*.md; do
    sed -n 's/.*](\([^):#]*\)[)#].*/\1/p' "$page" | while read -r link; do
        [ -e "$(dirname "$page")/$link" ] || { echo "$page: nothing at $link"; exit 1; }
    done
done
