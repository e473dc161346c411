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
git ls-files '*.h' '*.cpp' | xargs clang-format --dry-run --Werror

[ "${1:-}" = --format ] && exit 0
say "lint"
build release -DZEM_BUILD_BENCH=OFF
git ls-files 'utilities/*.cpp' 'cmpi/*.cpp' 'appliance/*.cpp' 'cimom/*.cpp' 'providers/*.cpp' |
    xargs -n 4 -P "$jobs" clang-tidy --quiet --warnings-as-errors='*' -p build/release 2>/dev/null
