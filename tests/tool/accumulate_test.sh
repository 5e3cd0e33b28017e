# pixelkiln accumulate: means and sums, in light and in code, and what is refused.
. "$(dirname "$0")/expect.sh"

mkdir in out
expect 0 "" fill in/black.png --size 3x2 --colour black
expect 0 "" fill in/white.png --size 3x2 --colour white
expect 0 "" fill in/red.png --size 3x2 --colour 255,0,0,255
pixel() { "$program" convert "$1" - --to BGRA_4444_8u --packed | hex | cut -c 1-11; }

expect 0 "out/mean.png: 1 frame 3x2, BGRA_4444_8u" accumulate in/black.png in/white.png out/mean.png
is "half of the light of white" "$(pixel out/mean.png)" "bf bf bf ff" # 255 x 0.5^0.41666666 = 191.03
premultiplied=(--quality 4 --to BGRX_4444_8u) # not divided by alpha on the way
expect 0 "" accumulate in/black.png in/white.png out/mean.png "${premultiplied[@]}"
is "half of the code of white" "$(pixel out/mean.png)" "80 80 80 ff" # 127.5
expect 0 "" accumulate in/black.png in/white.png in/red.png out/mean.png -q 4 --weights 0.4,0.2,0.4
is "by weight" "$(pixel out/mean.png)" "33 33 99 ff" # 0.2 x 255 = 51, 0.6 x 255 = 153
expect 0 "" accumulate in/black.png in/white.png out/mean.png -q 4 --weights 3,2
is "divided by alpha" "$(pixel out/mean.png)" "66 66 66 ff" # 2 / 5 x 255 = 102
expect 0 "" accumulate in/black.png in/white.png out/mean.png "${premultiplied[@]}" --weights 3,2
is "beyond white" "$(pixel out/mean.png)" "ff ff ff ff"
expect 0 "" accumulate in/red.png in/white.png out/mean.png -q 4 --weights 1,-1
identical out/mean.png in/red.png
expect 0 "" accumulate "$media/chelsea.png" "$media/chelsea.png" "$media/chelsea.png" out/mean.png -q 4
identical out/mean.png "$media/chelsea.png"
expect 0 "" accumulate in/red.png out/mean.png -q 4
identical out/mean.png in/red.png
rm out/mean.png

is "a raw frame" "$("$program" accumulate in/red.png in/white.png - -q 4 --to BGRP_4444_32f --packed --weights 1,1 |
    hex | cut -c 1-47)" "00 00 80 3f 00 00 80 3f 00 00 00 40 00 00 00 40"
is "no words with --quiet" "$("$program" accumulate in/red.png out/quiet.png --quiet 2>&1)" ""
rm out/quiet.png

for weights in 1 1,2,3 1,x nan,1 1,inf 1,,2; do
    expect 2 "is not a weight for each picture: that takes 2 numbers" \
        accumulate in/red.png in/white.png out/x.png "--weights=$weights"
done
expect 2 "name the pictures" accumulate out/x.png
expect 2 "FILE" accumulate
expect 2 "name it with --to" accumulate in/red.png out/x.raw
expect 2 "--quality" accumulate in/red.png out/x.png --quality 6
expect 1 "differ in size: 'in/red.png' has 3x2" accumulate in/red.png "$media/chelsea.png" out/x.png
expect 1 "cannot add up pictures to a frame of NTSCDV50" accumulate in/red.png out/x.dv --to NTSCDV50
expect 3 "No such file" accumulate in/red.png in/missing.png out/x.png
expect 3 "No such file" accumulate in/red.png out/missing/x.png
is "nothing left behind" "$(names out)" ""

finish
