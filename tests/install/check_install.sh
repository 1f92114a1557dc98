#!/usr/bin/env bash
# Installs the build into a temporary prefix and builds a client against it,
# once with find_package(Zelta) and once with pkg-config; each client must
# count the partitions of a file.
set -euo pipefail
build=$1 source=$2 file=$3 expected=$4
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
cmake --install "$build" --prefix "$work/prefix" >/dev/null
cmake -S "$source" -B "$work/cmake" -G Ninja -DCMAKE_PREFIX_PATH="$work/prefix" >/dev/null
cmake --build "$work/cmake" >/dev/null
test "$(LD_LIBRARY_PATH="$work/prefix/lib" "$work/cmake/consumer" "$file")" = "$expected"
flags=$(PKG_CONFIG_PATH="$work/prefix/lib/pkgconfig" pkg-config --cflags --libs zelta)
c++ -std=c++17 "$source/consumer.cpp" $flags -o "$work/pkg-consumer"
test "$(LD_LIBRARY_PATH="$work/prefix/lib" "$work/pkg-consumer" "$file")" = "$expected"
echo "installed library found by find_package and pkg-config"
