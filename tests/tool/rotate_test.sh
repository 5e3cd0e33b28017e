# pixelkiln rotate: quarter turns, clockwise as one sees the picture.
. "$(dirname "$0")/expect.sh"

mkdir in out
# Three pixels above each other, the bottom row first: 1, 2, 3 from the bottom.
printf '\1\1\1\377\2\2\2\377\3\3\3\377' > in/column.raw
column=(--from BGRA_4444_8u --size 1x3 --packed)
turned() { # DEGREES: the first byte of each pixel
    "$program" rotate in/column.raw - "${column[@]}" "--degrees=$1" | od -An -v -w4 -tx1 | cut -c 2-3 | xargs
}
is "clockwise, the bottom comes to the left" "$(turned 90)" "01 02 03"
is "a half" "$(turned 180)" "03 02 01"
is "three quarters" "$(turned 270)" "03 02 01"
is "counterclockwise" "$(turned -90)" "03 02 01"
is "a half the other way" "$(turned -180)" "03 02 01"
is "three quarters the other way" "$(turned -270)" "01 02 03"

expect 0 "451x300, BGRA_4444_8u to BGRA_4444_8u at 300x451" rotate "$media/chelsea.png" quarter.png --degrees 90
expect 0 "1 frame 300x451" rotate quarter.png back.png --degrees 270
identical "$media/chelsea.png" back.png
cat in/column.raw in/column.raw > in/two.raw
expect 0 "2 frames 1x3, BGRA_4444_8u to VUYA_4444_8u" rotate in/two.raw two.raw "${column[@]}" --degrees 90 --to VUYA_4444_8u
is "two frames" "$(stat -c %s two.raw)" 24

for degrees in 0 45 360 x; do
    expect 2 "--degrees" rotate in/column.raw out/x.png "${column[@]}" --degrees $degrees
done
expect 2 "--degrees" rotate in/column.raw out/x.png "${column[@]}"
expect 1 "cannot rotate a frame of BGRA_4444_32f at 451x300: the source format is not accepted" \
    rotate "$media/chelsea.png" out/x.png --from BGRA_4444_32f --degrees 90
expect 2 "number the output" rotate in/two.raw out/x.png "${column[@]}" --degrees 90
expect 2 "name it with --from" rotate in/column.raw out/x.png --degrees 90
expect 3 "No such file" rotate in/missing.png out/x.png --degrees 90
is "nothing left behind" "$(names out)" ""

finish
