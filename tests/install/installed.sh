# Builds on an installed tree, by the CMake package and by pkg-config, and asks its providers.
#
#   installed.sh PREFIX LIBDIR CXX
set -eu
prefix=$1 libdir=$2 cxx=$3
consumer=$(cd "$(dirname "$0")" && pwd)/consumer
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
cd "$work"

for file in "$prefix"/bin/* "$libdir"/*.so; do
    paths=$(readelf -d "$file" | sed -n 's/.*R\(UN\)\?PATH.*\[\(.*\)\]/:\2:/p')
    case $paths in
        *::*) echo "$file searches the current folder: $paths"; exit 1 ;;
    esac
done

cmake -S "$consumer" -B package -DCMAKE_CXX_COMPILER="$cxx" -Dzemutilities_DIR="$libdir/cmake/zemutilities"
cmake --build package
package/consumer

export PKG_CONFIG_PATH="$libdir/pkgconfig"
"$cxx" -std=c++17 "$consumer/consumer.cpp" -o by-pkg-config \
    $(pkg-config --cflags --libs zemutilities) \
    $(pkg-config --libs-only-L zemutilities | sed 's/-L/-Wl,-rpath,/g')
./by-pkg-config

export PATH="$prefix/bin:$PATH" APPLIANCE_HOME="$work/appliance"
share=$prefix/share/zemutilities
appliance init
cimom --registration "$share/zemproviders.json" --schema "$share/mof/zem.mof" ein ORXC_CEC_CS |
    grep -c '"1111-AA.\*' | grep -x 4
