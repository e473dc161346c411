#!/usr/bin/env bash
# Installs what is missing, builds, and makes Debian packages, which lintian then judges.
#
#   scripts/package.sh
#
# Prints where they lie, in build/package. Exits with 0 when lintian finds nothing to be mended.
. "$(dirname "$0")/common.sh"

case ${1:-} in
    '') ;;
    -h | --help) sed -n '2,/^\./{/^\./d;s/^# \{0,1\}//;p}' "$0"; exit 0 ;;
    *) die "unknown argument '$1'; see $0 --help" ;;
esac

install_missing $packages_build $packages_package
build_folder=$top/build/package
build release -DCMAKE_INSTALL_PREFIX=/usr -DZEM_BUILD_TESTS=OFF -DZEM_BUILD_BENCH=OFF

say "packing"
cd "$build_folder"
rm -f -- *.deb
said=$(cpack 2>&1) || {
    printf '%s\n' "$said" >&2
    die "packing failed"
}
say "judging (lintian)"
lintian --fail-on error,warning *.deb >&2
ls -1 "$build_folder"/*.deb
