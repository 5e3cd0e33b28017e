#!/usr/bin/env bash
# results_test.sh PROGRAM INCLUDE_DIR: the program prints lines with names of their own; a second run, with other
# content in fresh memory, prints the same; where results differ, hashes do; and every exported function is called.
set -euo pipefail
program=$1
headers=$2
here=$(dirname "$0")
export LC_ALL=C

fail() {
    echo "$1"
    exit 1
}

# hash NAME: that of the line of just this name.
hash() {
    "$program" "$1" | sed -n "s|^$1 ||p" | grep -xE '[0-9a-f]{16}' || fail "no hash of $1"
}

for part in plain/convert/BGRA_4444_8u/ plain/streams/PALDV25/ plain/alpha/ plain/arrays/ plain/buffers/ plain/box-blur/ \
    plain/mask/BGR plain/composite/over/BGR plain/composite/mode/1 plain/matte/ plain/alpha-gain/ plain/accumulate/ plain/planar \
    plain/row-bridges/ plain/rotate/ plain/quad-warp/skew/q3/ plain/motion/BGRA_4444_8u/ plain/motion/fields/ once/formats/ once/colour-; do
    first=$(MALLOC_PERTURB_=85 "$program" "$part")
    second=$(MALLOC_PERTURB_=170 "$program" "$part")
    [ -z "$(cut -d' ' -f1 <<<"$first" | uniq -d)" ] || fail "lines of $part share a name"
    grep -vE '^[^ ]+ [0-9a-f]{16}$' <<<"$first" && fail "lines of $part have no hash"
    sort -c <<<"$first" || fail "lines of $part are in no order"
    difference=$(diff <(echo "$first") <(echo "$second")) || fail "two runs differ: $difference"
done

# The content is the same in all lines: only results tell them apart. (The second is one that bodies differ in.)
pair=convert/BGRA_4444_8u
[ "$(hash plain/$pair/ARGB_4444_8u/q4)" != "$(hash plain/$pair/VUYA_4444_8u/q4)" ] || fail "formats do not differ"
[ "$(hash plain/$pair/BGRA_4444_15u/q4)" != "$(hash SSE2/$pair/BGRA_4444_15u/q4)" ] || fail "rules do not differ"
[ "$(hash plain/$pair/UYVY_422_8u/q4)" = "$(hash SSE2/$pair/UYVY_422_8u/q4)" ] || fail "bodies differ"
[ "$(hash plain/convert/quality/1)" != "$(hash plain/convert/quality/2)" ] || fail "qualities do not differ"

"$program" no-such-name && fail "a name that no line has is accepted"
"$program" --help 2>/dev/null && fail "an option is accepted"

exported=$(cat "$headers"/PixelKiln/*.h | sed 's|//.*||' | tr '\n' ' ' | grep -oP 'PK_API[^;({]*\b\KPK_\w+(?=[<(])' | sort -u)
[ "$(wc -l <<<"$exported")" -gt 50 ] || fail "few exported functions: $exported"
for function in $exported; do
    grep -qw "$function" "$here"/*_results.cpp || fail "$function has no line"
done
