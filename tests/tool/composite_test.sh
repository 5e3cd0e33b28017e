# pixelkiln composite and blendsheet: modes, opacity, linear light, and what is refused.
. "$(dirname "$0")/expect.sh"

mkdir in out
expect 0 "" fill in/white.png --size 4x4 --colour 255,255,255,255
expect 0 "" fill in/black.png --size 4x4 --colour 0,0,0,255
expect 0 "" fill in/grey.png --size 4x4 --colour 128,128,128,255
expect 0 "" fill in/clear.png --size 4x4 --colour 200,100,50,0
expect 0 "out/x.png: Normal at 1, 4x4" composite in/white.png in/black.png out/x.png
identical in/white.png out/x.png
# By the processor's estimate of a reciprocal, half of white is 127 or 128.
expect 0 "Normal at 0.5" composite in/white.png in/black.png out/x.png --opacity 0.5
expect 0 "" compare in/grey.png out/x.png --limit 1
expect 0 "" composite in/clear.png in/grey.png out/x.png
identical in/grey.png out/x.png
expect 0 "" composite in/white.png in/grey.png out/x.png --mode Multiply
identical in/grey.png out/x.png
expect 0 "" composite in/white.png in/grey.png out/x.png --mode Screen
identical in/white.png out/x.png
expect 0 "" composite in/grey.png in/grey.png out/x.png --mode Difference
identical in/black.png out/x.png

# Half of white in linear light is 0.5 ^ (1 / 2.4) encoded: 191.
expect 0 "" fill in/linear.png --size 4x4 --colour 191,191,191,255
expect 0 "" composite in/white.png in/black.png out/x.png --opacity 0.5 --linear
identical in/linear.png out/x.png

expect 0 "27 modes" blendsheet "$media/chelsea.png" "$media/coffee.png" out/sheet.png

expect 2 "there is no blend mode 'multiply'; the modes are Color, ColorBurn" \
    composite in/white.png in/black.png out/y.png --mode multiply
expect 2 "--linear is for the mode Normal" composite in/white.png in/black.png out/y.png --mode Screen --linear
for opacity in -1 1.5 x nan NaN; do
    expect 2 "--opacity" composite in/white.png in/black.png out/y.png "--opacity=$opacity"
done
expect 0 "" fill in/wide.png --size 5x4 --colour 0,0,0,255
expect 1 "the pictures differ in size: the top one has 5x4, the back one 4x4" \
    composite in/wide.png in/black.png out/y.png
expect 2 "OUT" composite in/white.png in/black.png
is "nothing is left of what failed" "$(names out)" "sheet.png x.png "
finish
