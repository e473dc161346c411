# Shared by the scripts: where the tree is, what the machine must have, how it is built.
# Sourced, not run.

set -euo pipefail
top=$(cd "$(dirname "${BASH_SOURCE[0]}")/.." && pwd)
jobs=$(nproc)

say() { printf '== %s\n' "$*" >&2; }
die() { printf 'error: %s\n' "$*" >&2; exit 1; }

# what each group of work needs, by Debian package
packages_build="g++ cmake ninja-build ccache pkg-config flex bison openjdk-17-jdk-headless
  libsqlite3-dev nlohmann-json3-dev libcli11-dev libmicrohttpd-dev libxml2-dev
  libcurl4-openssl-dev"
packages_test="libgtest-dev sblim-wbemcli openssl dpkg-dev file"
packages_bench="libbenchmark-dev libcsv-dev python3"
packages_sanitize="clang libclang-rt-14-dev lld"
packages_style="clang-format-16 clang-tidy"
packages_package="dpkg-dev file help2man lintian"

# install_missing <package>...: installs through apt what dpkg does not know yet.
install_missing() {
    local missing=() package
    for package in "$@"; do
        dpkg-query -W -f='${Status}' "$package" 2>/dev/null | grep -q 'ok installed' ||
            missing+=("$package")
    done
    [ ${#missing[@]} -eq 0 ] && return 0
    command -v apt-get >/dev/null || die "no apt-get here; install by hand: ${missing[*]}"
    local as_root=()
    if [ "$(id -u)" -ne 0 ]; then
        command -v sudo >/dev/null ||
            die "not root and no sudo; as root run: apt-get install ${missing[*]}"
        as_root=(sudo)
    fi
    say "installing: ${missing[*]}"
    "${as_root[@]}" apt-get update -qq >&2
    "${as_root[@]}" env DEBIAN_FRONTEND=noninteractive \
        apt-get install -y -qq --no-install-recommends "${missing[@]}" >&2
}

# build <preset> [<cmake option>...]: configures and builds into build_folder, or build/<preset>
# where that is not set; only the targets in build_targets where that names any.
build_targets=()
build_folder=
build() {
    local preset=$1 folder=${build_folder:-$top/build/$1} said
    shift
    say "building ($preset)"
    said=$(cmake -S "$top" -B "$folder" --preset "$preset" "$@" 2>&1) || {
        printf '%s\n' "$said" >&2
        die "configuring failed"
    }
    cmake --build "$folder" -j "$jobs" \
        ${build_targets[@]+--target "${build_targets[@]}"} >&2
}
