# pixelkiln deinterlace: both methods, both fields, and what is refused.
. "$(dirname "$0")/expect.sh"

mkdir in out
# Four rows of one pixel, from the bottom row of the picture up: 40, 30, 20, 10.
for code in 050 036 024 012; do printf "\\$code\\$code\\$code\\377"; done > in/rows.raw
raw=(--from BGRP_4444_8u --size 1x4 --packed)
greys() { od -An -v -w4 -tu1 "$1" | awk '{ print $1 }' | tac | xargs; }
is "the rows from the top" "$(greys in/rows.raw)" "10 20 30 40"
expect 0 "1x4" deinterlace in/rows.raw even.raw "${raw[@]}"
is "rows 0 and 2 kept" "$(greys even.raw)" "10 20 30 30"
expect 0 "" deinterlace in/rows.raw odd.raw "${raw[@]}" --field 1
is "rows 1 and 3 kept" "$(greys odd.raw)" "20 20 30 40"
expect 0 "" deinterlace in/rows.raw other.raw "${raw[@]}" --field 2
same "field 2 along edges" even.raw other.raw
expect 0 "" deinterlace in/rows.raw means.raw "${raw[@]}" --field 2 --quality 3
same "field 2 by means" odd.raw means.raw
expect 0 "" deinterlace in/rows.raw means.raw "${raw[@]}" --quality 3
same "field 0 by means" even.raw means.raw

expect 0 "" deinterlace "$media/chelsea.png" edges.png
expect 0 "" deinterlace "$media/chelsea.png" means.png --quality 3
is "the methods differ" "$("$program" compare edges.png means.png | grep -c identical)" 0
expect 0 "" deinterlace edges.png again.png
identical edges.png again.png
expect 0 "451x300" deinterlace "$media/chelsea.png" v210.raw --from V210_422_10u
is "in the format of --from" "$(stat -c %s v210.raw)" $((1280 * 300))

for field in -1 3 x; do
    expect 2 "--field" deinterlace in/rows.raw out/x.raw "${raw[@]}" "--field=$field"
done
expect 2 "--quality" deinterlace in/rows.raw out/x.raw "${raw[@]}" --quality 6
expect 1 "cannot deinterlace a frame of RGB_444_10u" deinterlace "$media/chelsea.png" out/x.png --from RGB_444_10u
expect 3 "No such file" deinterlace in/missing.png out/x.png
is "nothing left behind" "$(names out)" ""

finish
