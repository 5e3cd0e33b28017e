# pixelkiln scale and explain --scale: every route by some pixels, formats, fields, and what is refused.
. "$(dirname "$0")/expect.sh"

mkdir in out
# bytes NUMBER...: as a file has them
bytes() {
    for number; do printf "\\x$(printf %x "$number")"; done
}
# decimal FILE
decimal() {
    od -An -v -tu1 "$1" | xargs
}

# Four rows of two pairs of UYVY: 1 to 8, 11 to 18, 21 to 28, 31 to 38.
bytes {1..8} {11..18} {21..28} {31..38} > in/pairs.raw
pairs=(in/pairs.raw --from UYVY_422_8u --size 4x4 --packed)
expect 0 "1 frame 4x4, UYVY_422_8u to VUYP_4444_8u at 2x2" scale "${pairs[@]}" half.raw --to VUYP_4444_8u \
    --to-size 2x2 --quality 2
is "half size drops" "$(decimal half.raw)" "33 31 32 255 37 35 36 255 13 11 12 255 17 15 16 255"
expect 0 "" scale "${pairs[@]}" half.raw --to VUYP_4444_8u --to-size 2x2 --quality 2 --src-field 1
is "of the first field" "$(decimal half.raw)" "23 21 22 255 27 25 26 255 3 1 2 255 7 5 6 255"
expect 0 "" scale "${pairs[@]}" filtered.raw --to VUYP_4444_8u --to-size 2x2 --quality 4
is "from quality 3 on it filters" "$(cmp -s half.raw filtered.raw && echo equal)" ""

for field in 1 2; do
    expect 0 "UYVY_422_8u to UYVY_422_8u at 4x2" scale "${pairs[@]}" field.raw --to-size 4x2 --src-field $field \
        --quality 2
    is "field $field" "$(decimal field.raw)" "$(bytes {1..8} {11..18} {21..28} {31..38} > t.raw
        od -An -v -w8 -tu1 t.raw | awk "NR % 2 == $field % 2" | xargs)"
done
expect 0 "" scale "${pairs[@]}" same.raw --to-size 4x4
same "the same size" in/pairs.raw same.raw
expect 0 "" convert "${pairs[@]}" converted.raw --to BGRA_4444_32f --quality 3
expect 0 "" scale "${pairs[@]}" same.raw --to-size 4x4 --to BGRA_4444_32f --quality 3
same "the same size converted" converted.raw same.raw

# One field of an interlaced output: its rows alone are drawn.
bytes 9 9 9 255 9 9 9 255 > in/grey.raw
expect 0 "1x4" scale in/grey.raw field.raw --from BGRA_4444_8u --size 1x2 --packed --to-size 1x4 --dst-field 1 \
    --render-field 1 --quality 2
is "rows 0 and 2, from the bottom" "$(decimal field.raw)" "0 0 0 0 9 9 9 255 0 0 0 0 9 9 9 255"

expect 0 "451x300, BGRA_4444_8u to BGRA_4444_8u at 225x150" scale "$media/chelsea.png" small.png --to-size 225x150
expect 0 "225x150" convert small.png small.raw --to BGRA_4444_8u
expect 0 "BGRA_4444_32f at 900x600" scale "$media/chelsea.png" large.png --to-size 900x600 --png-depth 16
expect 0 "to UYVY_422_8u at 100x100" scale "$media/chelsea.png" x.raw --to UYVY_422_8u --to-size 100x100

expect 2 "--to-size" scale "$media/chelsea.png" out/x.png
for size in 0x1 -1x2 10 x 3x4x5; do
    expect 2 "is no size" scale "$media/chelsea.png" out/x.png "--to-size=$size"
done
expect 2 "--to" scale "$media/chelsea.png" out/x.raw --to-size 3x3
expect 2 "tell --dst-field" scale "$media/chelsea.png" out/x.png --to-size 3x3 --render-field 1
expect 2 "--src-field" scale "$media/chelsea.png" out/x.png --to-size 3x3 --src-field 3
expect 1 "cannot scale" scale "$media/chelsea.png" out/x.raw --to NTSCDV50 --to-size 720x486
expect 3 "No such file" scale in/missing.png out/x.png --to-size 3x3
is "nothing left behind" "$(names out)" ""

# steps WANTED ARGUMENT...: routes and steps, without the columns between them
steps() {
    local wanted=$1
    shift
    is "explain $*" "$("$program" explain --scale "$@" | tail -n +3 | sed 's/  */ /g; s/ $//' | tr '\n' ';')" "$wanted"
}
expect 0 "720x486 UYVY_422_8u, field 1, to 360x243 BGRA_4444_8u, field 0, at quality 2" explain UYVY_422_8u \
    BGRA_4444_8u --scale --src-size 720x486 --src-field 1 --dst-size 360x243 --quality 2
expect 0 "HalveRowUYVY8u from row 484 up" explain UYVY_422_8u BGRA_4444_8u --scale --src-size 720x486 --src-field 1 \
    --dst-size 360x243 --quality 2
expect 0 "HalveRowV210 from row 485 up" explain V210_422_10u BGRA_4444_8u --scale --src-size 720x486 \
    --dst-size 360x243 --quality 2
steps "conversion PK_Convert 64x48 BGRA_4444_8u, field 0;" UYVY_422_8u BGRA_4444_8u --src-size 64x48 --dst-size 64x48
steps "one field rows 1, 3, ... in memory 64x24 UYVY_422_8u, field 0;conversion PK_Convert 64x24 BGRA_4444_8u, field 0;" \
    UYVY_422_8u BGRA_4444_8u --src-size 64x48 --src-field 2 --dst-size 64x24 --quality 1
steps "motion PK_Convert 64x48 BGRP_4444_32f_Linear, field 0;motion PK_Motion, scale 0.5 x 0.5 32x24 UYVY_422_8u, field 0;" \
    BGRA_4444_8u UYVY_422_8u --src-size 64x48 --dst-size 32x24
steps "motion rows 0, 2, ... in memory 64x24 BGRA_4444_8u, field 0;motion PK_Motion, scale 1 x 1 64x24 BGRA_4444_8u, field 0;motion PK_Convert 64x24 NTSCDV50, field 0;" \
    BGRA_4444_8u NTSCDV50 --src-size 64x48 --src-field 2 --dst-size 64x24 --quality 4
steps "field of planes copy every second line 64x24 YUV_420_MPEG2_FRAME, field 1;" YUV_420_MPEG2_FRAME \
    YUV_420_MPEG2_FRAME --src-size 64x48 --src-field 1 --dst-size 64x24 --dst-field 1 --quality 2
steps "straight decoding decode 720x240 YUYV_422_8u, field 0;" NTSCDV50 YUYV_422_8u --src-size 720x480 --src-field 1 \
    --dst-size 720x240
steps "decoding decode 360x240 VUYA_4444_8u, field 0;motion PK_Motion, scale 0.833333 x 0.833333 300x200 BGRA_4444_8u, field 0;" \
    NTSCDV50 BGRA_4444_8u --src-size 720x480 --src-field 2 --dst-size 300x200 --quality 4
expect 2 "wants both sizes" explain UYVY_422_8u BGRA_4444_8u --scale --src-size 64x48
expect 2 "is no size" explain UYVY_422_8u BGRA_4444_8u --scale --src-size 64x48 --dst-size 64
expect 2 "sizes are for --scale" explain UYVY_422_8u BGRA_4444_8u --dst-size 64x48

finish
