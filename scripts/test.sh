#!/usr/bin/env bash
# Installs what is missing, builds, and runs all tests under CTest.
#
#   scripts/test.sh                     release build, every test
#   scripts/test.sh --preset asan       the same under address and undefined-behaviour sanitizers
#   scripts/test.sh --preset tsan       under the thread sanitizer
#   scripts/test.sh --program NAME      builds and runs that test program alone; repeatable
#   scripts/test.sh --only REGEX        only tests whose name matches
#
# Exits with 0 when every test passed.
. "$(dirname "$0")/common.sh"

preset=release
only=
programs=()
while [ $# -gt 0 ]; do
    case $1 in
        --preset) preset=${2:?--preset needs release, debug, asan or tsan}; shift 2 ;;
        --only) only=${2:?--only needs a regular expression}; shift 2 ;;
        --program) programs+=("${2:?--program needs the name of a test program}"); shift 2 ;;
        -h | --help) sed -n '2,/^\./{/^\./d;s/^# \{0,1\}//;p}' "$0"; exit 0 ;;
        *) die "unknown argument '$1'; see $0 --help" ;;
    esac
done

install_missing $packages_build $packages_test
[ "$preset" != asan ] || install_missing $packages_sanitize

build_targets=("${programs[@]}")
build "$preset" -DZEM_BUILD_TESTS=ON -DZEM_BUILD_BENCH=OFF

say "testing ($preset)"
export ASAN_OPTIONS=${ASAN_OPTIONS:-detect_leaks=1:strict_string_checks=1:detect_stack_use_after_return=1}
export UBSAN_OPTIONS=${UBSAN_OPTIONS:-print_stacktrace=1:halt_on_error=1}
export TSAN_OPTIONS=${TSAN_OPTIONS:-halt_on_error=1:second_deadlock_stack=1}
labels=$(IFS='|'; printf '%s' "${programs[*]}")
ctest --test-dir "$top/build/$preset" --output-on-failure -j "$jobs" \
    ${labels:+-L "^($labels)\$"} ${only:+-R "$only"}
