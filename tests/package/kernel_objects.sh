#!/usr/bin/env bash
# kernel_objects.sh BUILD_DIR DEBUG_BUILD_DIR: checks on the compiled kernels of an optimised build, and of one without
# optimisation, which shows inline functions that optimisation hides.
#
# An inline function that a kernel source compiled for a higher instruction set is a weak symbol, and the linker may keep
# that copy for everybody. So every weak symbol of a kernel object must lie in the namespace of its target. And within a
# target the linker keeps one copy of a name: two sources must not define different functions by the same one.
#
# No AVX instruction may stand in any object but those of the AVX, AVX2 and AVX-512 bodies, and nothing of AVX-512 in
# those of the AVX and AVX2 bodies.
set -euo pipefail
build=$1
debug=$2
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
status=0
complain() {
    echo "$*"
    status=1
}

folders=$(find "$debug/Src" -type d -name '*_kernels_*.dir' | sort)
[ -n "$folders" ] || complain "no kernel objects found in $debug"
for folder in $folders; do
    target=${folder##*_kernels_}
    target=${target%.dir}
    find "$folder" -name '*.o' -print0 | xargs -0 nm -lC --defined-only | grep -E '^[0-9a-f]+ [WVu] ' |
        cut -d' ' -f3- | sed -E 's/\t.*:([0-9]+)$/\tline \1/' | sort -u >"$work/weak"
    if grep -v "PK::$target::" "$work/weak"; then
        complain "the weak symbols above are not in the namespace of $target"
    fi
    # The line of a definition tells functions of one name apart; the file is not told reliably.
    grep -P '\tline' "$work/weak" | cut -f1 | uniq -d >"$work/merged"
    if [ -s "$work/merged" ]; then
        cat "$work/merged"
        complain "the names above stand for more than one function of $target"
    fi
done

checked=0
search() { # NAME PATTERN, and the names of objects on standard input
    local name=$1 pattern=$2 object
    while IFS= read -r object; do
        checked=$((checked + 1))
        if objdump -d --no-show-raw-insn "$object" | grep -m1 -P "$pattern"; then
            complain "the $name instruction above is in $object"
        fi
    done
}
avx512='\tv[a-z0-9]+\s.*(%zmm|%[xy]mm(1[6-9]|[23][0-9]))|%k[0-7]'
avx="\tv[a-z0-9]+\s.*%[xy]mm|\tvzeroupper|$avx512"
search AVX "$avx" < <(find "$build/Src" "$build/host" -name '*.o' -not -path '*_kernels_avx*.dir/*')
search AVX "$avx" < <(find "$debug/Src" -name '*.o' -path '*_kernels_*.dir/*' -not -path '*_kernels_avx*.dir/*')
[ "$checked" -gt 0 ] || complain "no objects found in $build"
others=$checked
search AVX-512 "$avx512" < <(find "$build/Src" -name '*.o' -path '*_kernels_avx*.dir/*' -not -path '*_kernels_avx512.dir/*')
[ "$checked" -gt "$others" ] || complain "no objects of the AVX2 bodies found in $build"
[ "$status" -eq 0 ] && echo "kernel objects are clean ($checked objects searched for AVX)"
exit "$status"
