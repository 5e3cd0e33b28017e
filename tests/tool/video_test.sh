# Planar 4:2:0 in and out: Y4M streams, and raw frames as FFmpeg names them.
. "$(dirname "$0")/expect.sh"

mkdir in out
# bytes NUMBER...
bytes() {
    local number
    for number in "$@"; do printf "\\x$(printf %x "$number")"; done
}
# stream HEAD FRAME...: of bytes in decimal
stream() {
    printf 'YUV4MPEG2 %s\n' "$1"
    shift
    local frame
    for frame in "$@"; do
        printf 'FRAME\n'
        bytes $frame
    done
}
decimal() { od -An -v -tu1 | xargs; }
head_of() { head -1 "$1"; }
# planes FILE: the bytes behind the heads of a stream of one frame
planes() { tail -n +2 "$1" | tail -c +7 | decimal; }

luma="11 12 13 14 21 22 23 24 31 32 33 34 41 42 43 44"
stream "W4 H4 F30000:1001 Ip A16:15 C420jpeg" "$luma 1 2 3 4 5 6 7 8" > in/four.y4m

# Nothing is computed between containers of one format.
expect 0 "in/four.y4m -> four.yuv: 1 frame 4x4, YUV_420_MPEG4_FRAME to YUV_420_MPEG4_FRAME" \
    convert in/four.y4m four.yuv --to yuv420p
is "Y, U and V" "$(decimal < four.yuv)" "$luma 1 2 3 4 5 6 7 8"
expect 0 "" convert in/four.y4m four.nv12 --to nv12
is "U before V in pairs" "$(decimal < four.nv12)" "$luma 1 5 2 6 3 7 4 8"
expect 0 "YUV_420_MPEG4_FRAME to" convert four.nv12 back.yuv --from nv12:center --to yuv420p --size 4x4
same "from pairs" four.yuv back.yuv
expect 0 "" convert in/four.y4m own.raw --to YUV_420_MPEG4_FRAME
is "the library's rows" "$(stat -c %s own.raw)" $((128 * 32 + 2 * 128 * 16))
is "its second chroma row" "$(tail -c +$((128 * 32 + 129)) own.raw | head -c 3 | decimal)" "3 4 0"
expect 0 "" convert own.raw back.yuv --from YUV_420_MPEG4_FRAME --to yuv420p --size 4x4
same "from the library's rows" four.yuv back.yuv

expect 0 "" convert in/four.y4m copy.y4m
is "rate and aspect go on" "$(head_of copy.y4m)" \
    "YUV4MPEG2 W4 H4 F30000:1001 Ip A16:15 C420jpeg XCOLORRANGE=LIMITED"
is "and the planes" "$(planes copy.y4m)" "$luma 1 2 3 4 5 6 7 8"
expect 0 "" convert four.yuv made.y4m --from yuv420p:center:fields --size 4x4
is "a stream of raw fields" "$(head_of made.y4m)" "YUV4MPEG2 W4 H4 F25:1 It A1:1 C420jpeg XCOLORRANGE=LIMITED"
is "its planes" "$(planes made.y4m)" "$luma 1 2 3 4 5 6 7 8"

# What a stream tells. tells HEAD FORMAT COPIED_WORDS
tells() {
    stream "W4 H4 F25:1 $1" "$luma 1 2 3 4 5 6 7 8" > in/head.y4m
    expect 0 "4x4, $2 to $2" convert in/head.y4m copy.y4m
    is "head of $1" "$(head_of copy.y4m)" "YUV4MPEG2 W4 H4 F25:1 $3"
}
tells "" YUV_420_MPEG4_FRAME "Ip A1:1 C420jpeg XCOLORRANGE=LIMITED"
tells "C420" YUV_420_MPEG4_FRAME "Ip A1:1 C420jpeg XCOLORRANGE=LIMITED"
tells "C420mpeg2 XYSCSS=420MPEG2" YUV_420_MPEG2_FRAME "Ip A1:1 C420mpeg2 XCOLORRANGE=LIMITED"
tells "It C420mpeg2" YUV_420_MPEG2_FIELD "It A1:1 C420mpeg2 XCOLORRANGE=LIMITED"
tells "Ib A0:0 C420jpeg" YUV_420_MPEG4_FIELD "Ib A0:0 C420jpeg XCOLORRANGE=LIMITED"
tells "I? C420mpeg2 XCOLORRANGE=LIMITED" YUV_420_MPEG2_FRAME "Ip A1:1 C420mpeg2 XCOLORRANGE=LIMITED"
tells "XCOLORRANGE=FULL C420jpeg" YUV_420_MPEG4_FRAME_FullRange "Ip A1:1 C420jpeg XCOLORRANGE=FULL"
tells "C420mpeg2 It XCOLORRANGE=FULL" YUV_420_MPEG2_FIELD_FullRange "It A1:1 C420mpeg2 XCOLORRANGE=FULL"

# The matrix, which no stream tells. matrix SIZE FORMAT ARGUMENT...
matrix() {
    local size=$1 format=$2
    shift 2
    head -c $((${size%x*} * ${size#*x} * 3 / 2)) /dev/zero > in/zero.yuv
    expect 0 "$size, $format to" convert in/zero.yuv out.y4m --from yuv420p --size "$size" "$@"
    expect 0 "$size, $format to" convert out.y4m copy.y4m "$@"
}
matrix 1278x2 YUV_420_MPEG2_FRAME
matrix 1280x2 YUV_420_MPEG2_FRAME_709
matrix 2x576 YUV_420_MPEG2_FRAME
matrix 2x578 YUV_420_MPEG2_FRAME_709
matrix 2x2 YUV_420_MPEG2_FRAME_709 --matrix 709
matrix 1280x2 YUV_420_MPEG2_FRAME --matrix 601
expect 0 "YUV_420_MPEG4_FIELD_FullRange_709 to YUV_420_MPEG4_FIELD_FullRange_709" convert four.yuv x.yuv \
    --from yuvj420p:fields:center --to yuvj420p --matrix 709 --size 4x4
same "full range" four.yuv x.yuv

# Of odd sizes the last column and row of chroma are left out, and repeated: in fields, that of the same field.
luma="11 12 13 21 22 23 31 32 33"
stream "W3 H3 C420jpeg" "$luma 1 2 3 4 5 6 7 8" > in/odd.y4m
expect 0 "3x3" convert in/odd.y4m odd.raw --to YUV_420_MPEG4_FRAME --packed
is "one sample is left" "$(decimal < odd.raw)" "$luma 1 5"
expect 0 "" convert in/odd.y4m odd.y4m
is "it is repeated" "$(planes odd.y4m)" "$luma 1 1 1 1 5 5 5 5"
expect 0 "" convert in/odd.y4m odd.nv12 --to nv12
is "in pairs" "$(decimal < odd.nv12)" "$luma 1 5 1 5 1 5 1 5"
expect 0 "" convert odd.nv12 odd2.y4m --from nv12:center --size 3x3
same "from pairs" <(planes odd.y4m) <(planes odd2.y4m)
stream "W2 H5 It C420jpeg" "0 0 0 0 0 0 0 0 0 0 1 2 3 4 5 6" > in/fields.y4m
expect 0 "" convert in/fields.y4m x.y4m
is "in fields" "$(planes x.y4m)" "0 0 0 0 0 0 0 0 0 0 1 2 1 4 5 4"
stream "W1 H2 C420jpeg" "7 8 9 10" > in/thin.y4m
expect 0 "" convert in/thin.y4m x.y4m
is "no chroma at all is grey" "$(planes x.y4m)" "7 8 128 128"

# Several frames, and pipes.
stream "W2 H2 C420mpeg2" "1 2 3 4 5 6" "7 8 9 10 11 12" > in/two.y4m
sed -i 's/^FRAME$/FRAME Ip/' in/two.y4m
expect 0 "2 frames 2x2" convert in/two.y4m two.yuv --to yuv420p
is "two frames" "$(decimal < two.yuv)" "1 2 3 4 5 6 7 8 9 10 11 12"
"$program" convert - - --from y4m --to nv12 < in/two.y4m > piped.nv12
is "from a pipe" "$(decimal < piped.nv12)" "1 2 3 4 5 6 7 8 9 10 11 12"
"$program" convert - - --from nv12 --to y4m --size 2x2 < piped.nv12 > piped.y4m
is "to a pipe" "$(grep -ac FRAME piped.y4m) $(head_of piped.y4m)" \
    "2 YUV4MPEG2 W2 H2 F25:1 Ip A1:1 C420mpeg2 XCOLORRANGE=LIMITED"

# Chroma of all pixels, as the library decodes it: U of a stream, in rows from the top.
# decoded HEAD FRAME
decoded() {
    stream "$1" "$2" > in/chroma.y4m
    "$program" convert in/chroma.y4m chroma.raw --to VUYX_4444_8u --packed --quiet
    od -An -v -w$((4 * $(sed -n '1s/.* W\([0-9]*\).*/\1/p' in/chroma.y4m))) -tu1 chroma.raw | tac |
        awk '{ row = $2; for (i = 6; i <= NF; i += 4) row = row " " $i; print row }' | paste -sd /
}
luma="100 100 100 100 100 100 100 100 100 100 100 100 100 100 100 100" v="128 128 128 128"
is "frames, chroma on the left" "$(decoded "W4 H4 C420mpeg2" "$luma 80 120 160 200 $v")" \
    "80 100 120 120/100 120 140 140/140 160 180 180/160 180 200 200"
is "frames, centred chroma" "$(decoded "W4 H4 C420jpeg" "$luma 80 120 160 200 $v")" \
    "80 90 110 120/100 110 130 140/140 150 170 180/160 170 190 200"
is "fields of one row of chroma" "$(decoded "W4 H4 C420mpeg2 It" "$luma 80 120 160 200 $v")" \
    "80 100 120 120/160 180 200 200/80 100 120 120/160 180 200 200"
# Between 80 and 160 for rows 0, 2, 4, 6, between 40 and 240 for rows 1, 3, 5, 7.
is "fields" "$(decoded "W2 H8 C420mpeg2 Ib" "$luma 80 40 160 240 $v")" \
    "80 80/40 40/110 110/65 65/150 150/165 165/160 160/240 240"
stream "W2 H2 C420mpeg2" "235 16 16 235 128 128" > in/chequers.y4m
is "to RGB" "$("$program" convert in/chequers.y4m - --to BGRX_4444_8u --packed | hex)" \
    "00 00 00 ff ff ff ff ff ff ff ff ff 00 00 00 ff"

# And as it encodes it, from two rows of four pixels, the lower one first.
bytes 128 50 1 255 128 60 2 255 128 70 3 255 128 80 4 255 128 10 5 255 128 20 6 255 128 30 7 255 128 40 8 255 > in/rows.raw
expect 0 "VUYX_4444_8u to YUV_420_MPEG2_FRAME" convert in/rows.raw x.yuv --from VUYX_4444_8u --to yuv420p --size 4x2 \
    --packed
is "a mean by 1-2-1 over two rows" "$(decimal < x.yuv)" "5 6 7 8 1 2 3 4 32 50 128 128"
bytes 128 40 4 255 128 40 4 255 128 30 3 255 128 30 3 255 128 20 2 255 128 20 2 255 128 10 1 255 128 10 1 255 > in/rows.raw
expect 0 "" convert in/rows.raw x.yuv --from VUYX_4444_8u --to yuv420p --size 2x4 --packed
is "of frames" "$(decimal < x.yuv)" "1 1 2 2 3 3 4 4 15 35 128 128"
expect 0 "" convert in/rows.raw x.yuv --from VUYX_4444_8u --to yuv420p:fields --size 2x4 --packed
is "of fields" "$(decimal < x.yuv)" "1 1 2 2 3 3 4 4 20 30 128 128"

# 4:2:2 and 4:4:4, which have formats of interleaved samples.
stream "W3 H2 F50:1 Ib A59:54 C422" "11 12 13 21 22 23 1 2 3 4 5 6 7 8" > in/422.y4m
expect 0 "3x2, UYVY_422_8u to UYVY_422_8u" convert in/422.y4m x.raw --to UYVY_422_8u --packed
is "samples of 4:2:2" "$(decimal < x.raw)" "1 11 5 12 2 13 6 0 3 21 7 22 4 23 8 0"
expect 0 "3x2, UYVY_422_8u to UYVY_422_8u" convert in/422.y4m x.y4m
is "its head goes on" "$(head_of x.y4m)" "YUV4MPEG2 W3 H2 F50:1 Ib A59:54 C422 XCOLORRANGE=LIMITED"
is "and its planes" "$(planes x.y4m)" "11 12 13 21 22 23 1 2 3 4 5 6 7 8"
stream "W2 H2 C444" "11 12 21 22 1 2 3 4 5 6 7 8" > in/444.y4m
expect 0 "2x2, VUYX_4444_8u to VUYX_4444_8u" convert in/444.y4m x.y4m
is "planes of 4:4:4" "$(head_of x.y4m) $(planes x.y4m)" \
    "YUV4MPEG2 W2 H2 F25:1 Ip A1:1 C444 XCOLORRANGE=LIMITED 11 12 21 22 1 2 3 4 5 6 7 8"
stream "W2 H2 C444" "235 16 16 235 128 128 128 128 128 128 128 128" > in/chequers.y4m
is "4:4:4 to RGB" "$("$program" convert in/chequers.y4m - --to BGRX_4444_8u --packed | hex)" \
    "00 00 00 ff ff ff ff ff ff ff ff ff 00 00 00 ff"
# Players take streams of many rows for Rec. 709, whatever the samples are.
expect 0 "UYVY_422_8u_709 to UYVY_422_8u_709" convert in/422.y4m x.y4m --matrix 709
is "of the other matrix" "$(head_of x.y4m | grep -o ' C4..')" " C444"

# What works on pixels gets pixels, and the output is planes again.
expect 0 "4x4, YUV_420_MPEG4_FRAME to YUV_420_MPEG4_FRAME" rotate in/four.y4m turned.y4m --degrees 180
is "a stream turned" "$(planes turned.y4m | cut -d ' ' -f 1-16)" "44 43 42 41 34 33 32 31 24 23 22 21 14 13 12 11"
expect 0 "" rotate four.yuv turned.yuv --from yuv420p:center --size 4x4 --degrees 180
is "raw planes turned" "$(head -c 16 turned.yuv | decimal)" "44 43 42 41 34 33 32 31 24 23 22 21 14 13 12 11"
expect 0 "" fill white.yuv --size 2x2 --to yuv420p --colour white
is "white planes" "$(decimal < white.yuv)" "235 235 235 235 128 128"
expect 0 "" fill white.y4m --size 2x2 --colour white
is "a stream of 4:4:4" "$(head_of white.y4m) $(planes white.y4m)" \
    "YUV4MPEG2 W2 H2 F25:1 Ip A1:1 C444 XCOLORRANGE=LIMITED 235 235 235 235 128 128 128 128 128 128 128 128"

# refused TEXT HEAD
refused() {
    stream "$2" "1 2 3 4 5 6" > in/bad.y4m
    expect 3 "the stream 'in/bad.y4m' $1" convert in/bad.y4m out/x.yuv --to yuv420p
}
refused "has the chroma of DV in PAL (C420paldv)" "W2 H2 C420paldv"
refused "is of mixed frames (Im)" "W2 H2 Im"
refused "has the colour space C440;" "W2 H2 C440"
refused "is C422 of the full range" "W2 H2 C422 XCOLORRANGE=FULL"
refused "is C444 of the full range" "W2 H2 XCOLORRANGE=FULL C444"
refused "ends within a frame, 6 bytes into 8" "W2 H2 C422"
refused "ends within a frame, 6 bytes into 12" "W2 H2 C444"
refused "has the colour space C444alpha;" "W2 H2 C444alpha"
refused "has the colour space C420p10;" "W2 H2 C420p10"
refused "has the colour space Cmono;" "W2 H2 Cmono"
refused "tells no size" "W2"
refused "tells no size" "W2 H0"
refused "tells no size" "W-2 H2"
refused "tells '2x' for a size" "W2x H2"
refused "tells '' for a size" "W H2"
refused "ends within a frame, 6 bytes into 12" "W4 H2"
for head in "" "W2 H2" "YUV4MPEG" "YUV4MPEG2 W2 H2"; do
    printf '%s' "$head" > in/bad.y4m
    expect 3 "'in/bad.y4m' is no Y4M stream" convert in/bad.y4m out/x.yuv --to yuv420p
done
printf 'YUV4MPEG2 W2 H2\n' > in/bad.y4m
expect 3 "holds no frame" convert in/bad.y4m out/x.yuv --to yuv420p
printf 'YUV4MPEG2 W2 H2\nFRAME\n123456frame\n' > in/bad.y4m
expect 3 "has no frame where one should begin" convert in/bad.y4m out/x.yuv --to yuv420p
head -c 100000 /dev/zero > in/bad.y4m
expect 3 "is no Y4M stream" convert in/bad.y4m out/x.yuv --to yuv420p
expect 3 "No such file" convert in/missing.y4m out/x.yuv --to yuv420p
expect 2 "a Y4M stream tells its own size" convert in/two.y4m out/x.yuv --to yuv420p --size 2x2
expect 2 "name it with --to" convert in/two.y4m out/x.yuv
expect 2 "give it with --size" convert two.yuv out/x.nv12 --from yuv420p --to nv12
for word in : :top :709 :fields: :left:x ::left; do
    expect 2 "may stand :left or :center" convert in/two.y4m out/x.yuv --to "nv12$word"
done
expect 2 "there is no pixel format 'nv21'" convert in/two.y4m out/x.yuv --to nv21
for matrix in 2020 bt709 601x; do
    expect 2 "is no matrix of video" convert in/two.y4m out/x.yuv --to yuv420p --matrix $matrix
done
expect 3 "with planes without padding takes 24" convert two.yuv out/x.nv12 --from yuv420p --to nv12 --size 4x4
expect 3 "with interleaved chroma takes 18" convert two.yuv out/x.nv12 --from nv12 --to nv12 --size 2x6
expect 3 "No space left" convert in/two.y4m /dev/full --to y4m
is "nothing left behind" "$(names out)" ""

finish
