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

install_missing $packages_build $packages_test $packages_style
cd "$top"
say "layout"
git ls-files '*.h' '*.cpp' '*.c' | xargs clang-format-16 --dry-run --Werror

[ "${1:-}" = --format ] && exit 0
say "lint"
# A configuration of its own: clang-tidy cannot read the compiler's precompiled headers. Of the
# build it needs no more than the sources that are generated.
build_folder=$top/build/lint
build_targets=(cimom/mof/MofGrammar.cpp cimom/mof/MofLexer.cpp)
build release -DZEM_BUILD_TESTS=ON -DZEM_BUILD_BENCH=OFF \
    -DCMAKE_DISABLE_PRECOMPILE_HEADERS=ON

# lint <clang-tidy option>...: checks the files named on standard input, one at a time and as many
# at once as there are processors, and shows what it says of those that fail.
lint() {
    xargs -P "$jobs" -I {} bash -c 'file=$1; shift
        said=$(clang-tidy --quiet --warnings-as-errors="*" "$@" "$file" 2>&1) ||
            { printf "%s\n" "$said"; exit 1; }' lint {} -p "$build_folder" "$@"
}
git ls-files 'utilities/*.cpp' 'cmpi/*.cpp' 'appliance/*.cpp' 'cimom/*.cpp' 'providers/*.cpp' | lint
# Tests are held to what makes a test lie, not to how it is written.
git ls-files 'tests/*.cpp' ':!tests/install' | lint --header-filter='tests/.*' --checks="-*,$(printf '%s,' \
    bugprone-{assert-side-effect,dangling-handle,infinite-loop,sizeof-expression,unused-raii} \
    bugprone-{use-after-move,suspicious-semicolon} modernize-use-override)"
