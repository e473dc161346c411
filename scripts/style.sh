#!/usr/bin/env bash
# Checks layout (.clang-format) and lint (.clang-tidy) of every source; changes nothing.
#
#   scripts/style.sh            both
#   scripts/style.sh --format   layout alone
#
# Exits with 0 when nothing is to be mended.
. "$(dirname "$0")/common.sh"

case ${1:-} in
    '' | --format) ;;
    -h | --help) sed -n '2,/^\./{/^\./d;s/^# \{0,1\}//;p}' "$0"; exit 0 ;;
    *) die "unknown argument '$1'; see $0 --help" ;;
esac

install_missing $packages_build $packages_style
cd "$top"
say "layout"
git ls-files '*.h' '*.cpp' '*.c' | xargs clang-format-16 --dry-run --Werror

[ "${1:-}" = --format ] && exit 0
say "lint"
# A configuration of its own: clang-tidy cannot read the compiler's precompiled headers. Of the
# build it needs no more than the sources that are generated, and those that are compiled together:
# it so reads a system header once for many sources. What it says names the true source.
build_folder=$top/build/lint
build_targets=(cimom/mof/MofGrammar.cpp cimom/mof/MofLexer.cpp)
build release -DZEM_BUILD_TESTS=OFF -DZEM_BUILD_BENCH=OFF \
    -DCMAKE_DISABLE_PRECOMPILE_HEADERS=ON -DCMAKE_UNITY_BUILD=ON -DCMAKE_UNITY_BUILD_BATCH_SIZE=0
together=$(sed -n 's|^ *"file": "\(.*/Unity/[^"]*\)".*|\1|p' "$build_folder/compile_commands.json")
within=$(sed -n 's/^#include "\(.*\)"$/\1/p' $together)
alone=$(git ls-files 'utilities/*.cpp' 'cmpi/*.cpp' 'appliance/*.cpp' 'cimom/*.cpp' \
    'providers/*.cpp' | sed "s|^|$top/|" | grep -vxF "$within")

# One file at a time, and as many at once as there are processors; it shows what is said of those
# that fail. Tests are held to the warnings of both compilers, which the sanitized builds take for
# errors.
printf '%s\n' $together $alone |
    xargs -P "$jobs" -I {} sh -c 'said=$(clang-tidy --quiet --warnings-as-errors="*" -p "$1" "$2" 2>&1) ||
        { printf "%s\n" "$said"; exit 1; }' lint "$build_folder" {}
