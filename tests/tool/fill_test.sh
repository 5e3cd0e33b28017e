# pixelkiln fill: each colour, kinds of formats, and what is refused.
. "$(dirname "$0")/expect.sh"

mkdir out
filled() { # FORMAT COLOUR [SIZE]: the bytes
    "$program" fill - --size "${3:-2x1}" --to "$1" --colour "$2" --packed | hex
}
is "opaque black" "$(filled BGRA_4444_8u black)" "00 00 00 ff 00 00 00 ff"
is "opaque white" "$(filled UYVY_422_8u white)" "80 eb 80 eb"
is "clear white" "$(filled BGRA_4444_8u clear-white)" "ff ff ff 00 ff ff ff 00"
is "clear white, premultiplied" "$(filled BGRP_4444_8u clear-white)" "00 00 00 00 00 00 00 00"
is "a colour" "$(filled ARGB_4444_8u 10,20,30,40)" "28 0a 14 1e 28 0a 14 1e"
is "black in 15 bits" "$(filled BGRA_4444_15u black 1x1)" "00 00 00 00 00 00 00 80"
is "a group of V210" "$(filled V210_422_10u black 6x1)" "00 02 01 20 40 00 08 04 00 02 01 20 40 00 08 04"
is "a colour in V210, though the library names an error" "$(filled V210_422_10u 0,0,0,255 6x1)" \
    "$(filled V210_422_10u black 6x1)"

expect 0 "out/orange.png: 1 frame 3x2, BGRA_4444_8u" fill out/orange.png --size 3x2 --colour 255,128,0,255
is "a picture" "$("$program" convert out/orange.png - --to BGRA_4444_8u --packed | hex | cut -c 1-11)" "00 80 ff ff"
rm out/orange.png
is "no words with --quiet" "$("$program" fill out/quiet.png --size 3x2 --colour black --quiet 2>&1)" ""
rm out/quiet.png

expect 1 "cannot fill a frame of UYVY_422_8u at 2x2: the destination format is not accepted" \
    fill out/x.raw --size 2x2 --to UYVY_422_8u --colour clear-black
expect 1 "this combination is not offered" fill out/x.raw --size 2x2 --to RGB_444_10u --colour black
expect 1 "cannot fill a frame of RGB_444_10u" fill out/x.raw --size 2x2 --to RGB_444_10u --colour 1,2,3,4
expect 2 "name it with --to" fill out/x.raw --size 2x2 --colour black
expect 2 "--size" fill out/x.png --colour black
expect 2 "is no size" fill out/x.png --size 0x2 --colour black
expect 2 "--colour" fill out/x.png --size 2x2
for colour in green 1,2,3 1,2,3,4,5 1,2,3,x 1,,2,3 nan,0,0,0 ''; do
    expect 2 "takes 4 numbers" fill out/x.png --size 2x2 --colour "$colour"
done
for colour in 1,2,3,256 -1,2,3,4 1,2,3,4.5; do
    expect 2 "must be whole, from 0 to 255" fill out/x.png --size 2x2 "--colour=$colour"
done
expect 1 "there is no memory for a frame" fill out/x.png --size 1000000x1000000 --colour black
expect 3 "No such file" fill out/missing/x.png --size 2x2 --colour black
is "nothing left behind" "$(names out)" ""

finish
