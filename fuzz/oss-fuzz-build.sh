#!/usr/bin/env bash
# Builds the fuzz target as OSS-Fuzz asks for it: with $CC, $CXX, $CFLAGS, $CXXFLAGS and $LIB_FUZZING_ENGINE, in $WORK, and
# with its seeds and options beside it in $OUT. Needs cmake, ninja-build and libboost-dev.
set -euo pipefail
cd "$(dirname "${BASH_SOURCE[0]}")/.."

# Debug adds -g alone: how far to optimise is up to $CXXFLAGS.
cmake -S . -B "$WORK/pixelkiln" -G Ninja -DCMAKE_BUILD_TYPE=Debug -DPIXELKILN_BUILD_FUZZ=ON \
    -DLIB_FUZZING_ENGINE="$LIB_FUZZING_ENGINE" -DPIXELKILN_BUILD_TOOLS=OFF -DPIXELKILN_BUILD_TESTS=OFF \
    -DPIXELKILN_BUILD_EXAMPLES=OFF
cmake --build "$WORK/pixelkiln" --target pixelkiln_fuzz
cp "$WORK/pixelkiln/fuzz/pixelkiln_fuzz" fuzz/pixelkiln_fuzz.options "$OUT"
(cd fuzz/seeds && cmake -E tar cf "$OUT/pixelkiln_fuzz_seed_corpus.zip" --format=zip .)
