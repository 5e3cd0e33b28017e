#!/usr/bin/env bash
# run.sh BUILD_DIR: installs the build into a scratch prefix and builds the consumer against it, by CMake package
# and by pkg-config.
set -euo pipefail
build=$1
here=$(cd "$(dirname "$0")" && pwd)
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT

cmake --install "$build" --prefix "$work/prefix" >"$work/install.log" || { cat "$work/install.log"; exit 1; }

cmake -S "$here" -B "$work/cmake" -DCMAKE_PREFIX_PATH="$work/prefix" >"$work/configure.log" ||
    { cat "$work/configure.log"; exit 1; }
cmake --build "$work/cmake" >"$work/build.log" || { cat "$work/build.log"; exit 1; }
"$work/cmake/consumer"

pkgconfig=$(find "$work/prefix" -name pixelkiln.pc -printf '%h')
flags=$(PKG_CONFIG_PATH=$pkgconfig pkg-config --cflags --libs pixelkiln)
# shellcheck disable=SC2086 -- flags are words
g++ -std=c++20 "$here/consumer.cpp" $flags -o "$work/consumer"
LD_LIBRARY_PATH=$(dirname "$pkgconfig") "$work/consumer"
