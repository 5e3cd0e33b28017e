# pixelkiln blur: both directions and each alone, room to spread, edges, light, and what is refused.
. "$(dirname "$0")/expect.sh"

mkdir in out
# A white dot at sigma 1: c0 = 0.396485 in the middle, and beside it c2 = c1 - d1 c0 = 0.244289 of 255.
printf '\377\377\377\377' > in/dot.raw
dot=(--from BGRP_4444_8u --size 1x1 --packed)
expect 0 "1x1" blur in/dot.raw alone.raw "${dot[@]}" --sigma 1,0
is "the middle" "$(hex < alone.raw)" "65 65 65 65"
expect 0 "3x1" blur in/dot.raw row.raw "${dot[@]}" --sigma 1,0 --grow 1
is "rows grow to the sides" "$(hex < row.raw)" "3e 3e 3e 3e 65 65 65 65 3e 3e 3e 3e"
expect 0 "1x3" blur in/dot.raw column.raw "${dot[@]}" --sigma 0,1 --grow 1
same "columns grow up and down" row.raw column.raw
expect 0 "3x3" blur in/dot.raw both.raw "${dot[@]}" --sigma 1 --grow 1
is "both" "$(od -An -v -w12 -tu1 both.raw | awk '{ print $1, $5, $9 }' | xargs)" "15 25 15 25 40 25 15 25 15"
expect 0 "" blur in/dot.raw pair.raw "${dot[@]}" --sigma 1,1 --grow 1
same "X,Y" both.raw pair.raw
expect 0 "1x1" blur in/dot.raw same.raw "${dot[@]}" --sigma 0 --grow 5
same "no blur" in/dot.raw same.raw

# Half of the edge for each pass: the sums of one pixel are whole.
expect 0 "" blur in/dot.raw repeated.raw "${dot[@]}" --sigma 7 --repeat-edge
same "a repeated edge" in/dot.raw repeated.raw
expect 0 "451x300" blur "$media/chelsea.png" codes.png --sigma 5 --repeat-edge
expect 0 "" blur "$media/chelsea.png" light.png --sigma 5 --repeat-edge --linear
is "light is not codes" "$("$program" compare codes.png light.png | grep -c identical)" 0
expect 0 "" blur "$media/chelsea.png" wide.png --sigma 5 --grow 10
expect 0 "471x320" convert wide.png wide.raw --to BGRA_4444_8u
expect 0 "" blur "$media/chelsea.png" out/v.raw --sigma 2 --from VUYA_4444_32f_709
rm out/v.raw

for sigma in -1 1,-2 x 1,2,3 nan inf ""; do
    expect 2 "sigma" blur in/dot.raw out/x.raw "${dot[@]}" "--sigma=$sigma"
done
expect 2 "--sigma" blur in/dot.raw out/x.raw "${dot[@]}"
expect 2 "--grow" blur in/dot.raw out/x.raw "${dot[@]}" --sigma 1 --grow=-1
expect 1 "cannot blur a frame of UYVY_422_8u" blur "$media/chelsea.png" out/x.png --sigma 1 --from UYVY_422_8u
expect 1 "cannot blur a frame of RGB_444_10u" blur "$media/chelsea.png" out/x.png --sigma 1 --from RGB_444_10u
expect 3 "No such file" blur in/missing.png out/x.png --sigma 1
is "nothing left behind" "$(names out)" ""

finish
