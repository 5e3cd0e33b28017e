#!/usr/bin/env bash
# kernel_objects.sh BUILD_DIR: three checks on the compiled kernels.
#
# An inline function that a kernel source compiled for a higher instruction set is a weak symbol, and the
# linker may keep that copy for everybody. So every weak symbol of a kernel object must lie in the namespace of
# its target. Optimisation hides such functions, so the check compiles without it.
#
# And no AVX instruction may stand in any object but those of the AVX, AVX2 and AVX-512 bodies, and nothing of
# AVX-512 in those of the AVX and AVX2 bodies.
set -euo pipefail
build=$1
root=$(cd "$(dirname "$0")/../.." && pwd)
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
status=0

weak_symbols() { # TARGET VECTOR_HEADER SOURCES FLAG...
    local target=$1 header=$2 sources=$3 source
    shift 3
    for source in $sources; do
        g++ -std=c++20 -O0 "$@" -ffp-contract=off -fvisibility=hidden -I"$root/Src" -I"$root/include" \
            -DPK_TARGET="$target" -DPK_TARGET_HEADER="\"primitives/simd/$header.h\"" -c "$source" -o "$work/kernel.o"
        if nm -C "$work/kernel.o" | grep -E '^[0-9a-f]+ [WVu] ' | grep -v "PK::$target::"; then
            echo "the weak symbols above, of $(basename "$source") for $target, are not in its namespace"
            status=1
        fi
    done
}
colour=$(ls "$root"/Src/colour/*.kernels.cpp)
rows=$(ls "$root"/Src/*/*.kernels.cpp | grep -v /Src/colour/)
weak_symbols ssse3 vector128 "$rows" -mssse3
weak_symbols sse41 vector128 "$rows $colour" -msse4.1
weak_symbols avx avx "$colour" -mavx
weak_symbols avx2 avx2 "$rows" -mavx2
weak_symbols avx2fma avx2 "$colour" -mavx2 -mfma
weak_symbols avx512 avx512 "$rows" -mavx512f -mavx512bw -mavx512vl -mavx512dq

checked=0
search() { # NAME PATTERN, and the names of objects on standard input
    local name=$1 pattern=$2 object
    while IFS= read -r object; do
        checked=$((checked + 1))
        if objdump -d --no-show-raw-insn "$object" | grep -m1 -P "$pattern"; then
            echo "the $name instruction above is in $object"
            status=1
        fi
    done
}
avx512='\tv[a-z0-9]+\s.*(%zmm|%[xy]mm(1[6-9]|[23][0-9]))|%k[0-7]'
search AVX "\tv[a-z0-9]+\s.*%[xy]mm|\tvzeroupper|$avx512" < <(find "$build/Src" "$build/host" -name '*.o' \
    -not -path '*_kernels_avx*.dir/*')
[ "$checked" -gt 0 ] || { echo "no objects found in $build"; exit 1; }
others=$checked
search AVX-512 "$avx512" < <(find "$build/Src" -name '*.o' -path '*_kernels_avx*.dir/*' -not -path '*_kernels_avx512.dir/*')
[ "$checked" -gt "$others" ] || { echo "no objects of the AVX2 bodies found in $build"; exit 1; }
[ "$status" -eq 0 ] && echo "kernel objects are clean ($checked objects searched for AVX)"
exit "$status"
