#!/usr/bin/env bash
# run.sh BUILD_DIR [CMAKE_ARGUMENT...]: builds a project that includes PixelKiln as a folder and brings its own host, in
# Debug, and runs its programs.
set -euo pipefail
build=$1
here=$(cd "$(dirname "$0")" && pwd)
shift

cmake -S "$here" -B "$build" -G Ninja -DCMAKE_BUILD_TYPE=Debug "$@"
cmake --build "$build"
"$build/embedder"
"$build/shared_embedder"
