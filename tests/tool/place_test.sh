# pixelkiln place: every word with what it does to some pixels, flights, and what is refused.
. "$(dirname "$0")/expect.sh"

mkdir in out
expect 0 "" fill in/white.png --size 2x2 --colour white
expect 0 "" fill in/blue.png --size 6x4 --colour 0,0,255,255
# From the top 4 5 6 and 1 2 3.
printf '\1\1\1\377\2\2\2\377\3\3\3\377\4\4\4\377\5\5\5\377\6\6\6\377' > in/six.raw
expect 0 "" convert in/six.raw in/six.png --from BGRA_4444_8u --size 3x2 --packed
# reds FILE WIDTH: of each row from the top; a half is 127 or 128 by the processor's estimate of a reciprocal
reds() {
    "$program" convert "$1" - --to BGRA_4444_8u --packed | od -An -v -w$((4 * $2)) -tx1 | tac |
        awk '{ row = ""; for (i = 3; i <= NF; i += 4) row = row $i; print row }' | sed s/7f/80/g | xargs| xargs
}
# placed WIDTH ARGUMENT...: the reds of the result
placed() {
    local width=$1
    shift
    "$program" place "$@" --quiet > said && reds "${*: -1}" "$width"
}
# over NAME WANTED ARGUMENT...: white over 6x4 pixels of blue
over() {
    local name=$1 wanted=$2
    shift 2
    "$program" place in/white.png in/blue.png x.png --quiet "$@"
    is "$name" "$(reds x.png 6)" "$wanted"
}

for quality in 0 1 2 3 4 5; do
    expect 0 "same.png: 1 frame 3x2, BGRA_4444_8u" place in/six.png same.png --quality $quality
    identical in/six.png same.png
done
none=000000000000
over "in the middle" "$none 0000ffff0000 0000ffff0000 $none"
over "y goes down" "0000ffff0000 0000ffff0000 $none $none" --position 0.5,0.25
over "to the right" "$none 000000ffff00 000000ffff00 $none" --position 0.6666667,0.5
over "the anchor of SRC" "$none $none 000000ffff00 000000ffff00" --anchor 0,0
over "partly outside" "ff0000000000 $none $none $none" --position 0,0 --anchor 0.5,0.5
over "outside" "$none $none $none $none" --position -3,0.5
over "scaled" "$none 00ffffffff00 00ffffffff00 $none" --scale 2,1 --quality 2
over "scaled to nothing" "$none $none $none $none" --scale 0,1
over "half of it" "$none 000080800000 000080800000 $none" --opacity 0.5
over "nothing of it" "$none $none $none $none" --opacity 0
over "hard edges" "$none ffffff000000 ffffff000000 $none" --position 0.25,0.5 --quality 2
over "soft edges" "$none 80ff80000000 80ff80000000 $none" --position 0.25,0.5 --quality 2 --soft-edges
over "the edges of the highest quality" "$none 80ff80000000 80ff80000000 $none" --position 0.25,0.5
over "a mode" "$none $none $none $none" --mode Multiply
over "another" "$none 0000ffff0000 0000ffff0000 $none" --mode Screen

expect 0 "2x3" place in/six.png turned.png --size 2x3 --rotate 90 --quality 2
is "turned clockwise" "$(reds turned.png 2)" "0104 0205 0306"
expect 0 "" place in/six.png turned.png --rotate 180
is "turned by a half" "$(reds turned.png 3)" "030201 060504"
expect 0 "" rotate in/six.png quarter.png --degrees 270
expect 0 "" place in/six.png turned.png --size 2x3 --rotate=-90 --quality 2
identical quarter.png turned.png

# Half a pixel beside the border of black and white lies their mean: of codes, or of light, 0.5 ^ (1 / 2.4).
printf '\0\0\0\377%.0s' 1 2 3 4 5 6 > in/step.raw
printf '\377\377\377\377%.0s' 1 2 3 4 5 6 >> in/step.raw
expect 0 "" convert in/step.raw in/step.png --from BGRA_4444_8u --size 12x1 --packed
for pair in 2:80 4:80 5:bf; do
    expect 0 "" place in/step.png x.png --position 0.4583333,0.5 --quality ${pair%:*}
    is "a mean at quality $pair" "$(reds x.png 12 | cut -c 11-12)" ${pair#*:}
done
# Stripes of a pixel, at a quarter of their width: 3 and 4 blur them first.
for i in 1 2 3 4 5 6 7 8; do printf '\0\0\0\377\377\377\377\377'; done > in/stripes.raw
expect 0 "" convert in/stripes.raw in/stripes.png --from BGRA_4444_8u --size 16x1 --packed
expect 0 "" place in/stripes.png x.png --size 4x1 --scale 0.25,1 --position 0.56,0.5 --quality 2
is "not blurred, 0.54 of the way" "$(reds x.png 4)" "8a8a8a8a"
expect 0 "" place in/stripes.png x.png --size 4x1 --scale 0.25,1 --position 0.56,0.5 --quality 4
is "blurred to grey" "$(reds x.png 4 | cut -c 3-6)" 8080
expect 0 "" place in/stripes.png soft.png --quality 3 --softness 1
expect 0 "" blur in/stripes.png blurred.png --sigma 0.5 --repeat-edge
is "a softness of 1 is a sigma of 0.5" "$(reds soft.png 16 | cut -c 3-28)" "$(reds blurred.png 16 | cut -c 3-28)"
is "which blurs" "$(reds soft.png 16 | cut -c 5-8)" 3cc3
# Fields of rows 10, 20, 30, 40: the earlier one of each order, with means between its lines.
printf '\50\50\50\377\36\36\36\377\24\24\24\377\12\12\12\377' > in/rows.raw
expect 0 "" convert in/rows.raw in/rows.png --from BGRA_4444_8u --size 1x4 --packed
for pair in "0:0a 14 1e 28" "1:0a 14 1e 1e" "2:14 14 1e 28"; do
    expect 0 "" place in/rows.png x.png --quality 2 --src-field ${pair%%:*}
    is "source of field $pair" "$(reds x.png 1)" "${pair#*:}"
done
expect 0 "" place in/rows.png x.png --quality 2 --src-field 2 --dst-field 2
identical in/rows.png x.png

# The middle of a back, or black around it.
is "black beside it" "$(placed 5 in/white.png in/six.png --size 5x4 --opacity 0 x.png)" \
    "0000000000 0004050600 0001020300 0000000000"
is "cut" "$(placed 1 in/white.png in/six.png --size 1x2 --opacity 0 x.png)" "05 02"
is "an odd pixel goes to the right and below" "$(placed 4 in/white.png in/six.png --size 4x3 --opacity 0 x.png)" \
    "04050600 01020300 00000000"
is "and is cut there" "$(placed 2 in/white.png in/six.png --size 2x1 --opacity 0 x.png)" "0405"
is "no back" "$(placed 4 in/white.png --size 4x2 x.png)" "00ffff00 00ffff00"
expect 0 "x.png: 1 frame 3x2, BGRA_4444_32f" place in/six.png x.png --png-depth 16
expect 0 "size                3x2" compare in/six.png x.png --limit 0.001
is "no words with --quiet" "$("$program" place in/six.png x.png --quiet 2>&1)" ""

# Flights. White is 235 of luma, black is 16.
expect 0 "" fill in/column.png --size 2x4 --colour white
expect 0 "" fill in/black.png --size 8x4 --colour black
head="YUV4MPEG2 W8 H4 F25:1 Ip A1:1 C444 XCOLORRANGE=LIMITED"
flight=(place in/column.png in/black.png flight.y4m --position 0.125,0.5 --to position=0.875,0.5 --quality 2)
# luma FRAME: the rows of a frame, of head, luma and two planes of chroma
luma() { tail -c +$((${#head} + 2 + 102 * $1 + 6)) flight.y4m | head -c 32 | od -An -v -w8 -tx1 | tr -d ' ' | xargs; }
expect 0 "flight.y4m: 4 frames 8x4" "${flight[@]}" --frames 4
is "head" "$(head -1 flight.y4m)" "$head"
is "length" "$(stat -c %s flight.y4m)" $((${#head} + 1 + 4 * 102))
is "frames" "$(grep -ao FRAME flight.y4m | wc -l)" 4
bar() { for _ in 1 2 3 4; do printf '%s ' "$1"; done | sed 's/ $//'; }
is "first" "$(luma 0)" "$(bar ebeb101010101010)"
is "second" "$(luma 1)" "$(bar 1010ebeb10101010)"
is "last" "$(luma 3)" "$(bar 101010101010ebeb)"
is "chroma" "$(tail -c 64 flight.y4m | tr -d '\200' | wc -c)" 0

expect 0 "stills-%02d.png: 4 frames 8x4" "${flight[@]:0:3}" stills-%02d.png "${flight[@]:4}" --frames 4 --png-depth 16
is "numbered files" "$(echo stills-*)" "stills-00.png stills-01.png stills-02.png stills-03.png"
is "the third of them" "$(reds stills-02.png 8)" "$(bar 00000000ffff0000)"
is "their depth" "$(od -An -j24 -N1 -tu1 stills-02.png | xargs)" 16

# Each field at its time: four fields in two frames.
for field in 1 2; do
    expect 0 "2 frames" "${flight[@]}" --frames 2 --dst-field $field --rate 50
    is "head of field $field" "$(head -1 flight.y4m | cut -d ' ' -f 4,5)" "F50:1 I$([ $field = 1 ] && echo t || echo b)"
    first=ebeb101010101010 second=1010ebeb10101010
    [ $field = 1 ] || { first=1010ebeb10101010 second=ebeb101010101010; }
    is "frame of field $field" "$(luma 0)" "$first $second $first $second"
done

# Begins and ends as the stills do, and everything moves.
start=(--position 0.3,0.6 --anchor 0.2,0.4 --scale 0.5,0.25 --rotate 20 --opacity 0.9 --softness 0.2)
end=(--position 0.7,0.1 --anchor 1,0 --scale 1,2 --rotate=-70 --opacity 0.4 --softness 1)
photos=("$media/coffee.png" "$media/chelsea.png")
common=(--size 101x75 --quality 4 --soft-edges --mode Screen)
expect 0 "3 frames 101x75" place "${photos[@]}" photo.y4m "${common[@]}" "${start[@]}" --frames 3 \
    --to position=0.7,0.1 anchor=1,0 scale=1,2 rotate=-70 opacity=0.4 softness=1
still() { # OPTION...: its luma, from the bottom as the format has it
    "$program" place "${photos[@]}" still.png "${common[@]}" "$@" --quiet
    "$program" convert still.png - --to VUYX_4444_8u --packed | od -An -v -w404 -tx1 | tac |
        awk '{ for (i = 3; i <= NF; i += 4) print $i }' | md5sum
}
bytes=$((6 + 3 * 101 * 75))
luma_of() { tail -c $((bytes * $1)) photo.y4m | tail -c +7 | head -c $((101 * 75)) | od -An -v -w1 -tx1 | tr -d ' ' | md5sum; }
is "the start" "$(luma_of 3)" "$(still "${start[@]}")"
is "the end" "$(luma_of 1)" "$(still "${end[@]}")"
is "half of the way" "$(luma_of 2)" "$(still --position 0.5,0.35 --anchor 0.6,0.2 --scale 0.75,1.125 --rotate=-25 \
    --opacity 0.65 --softness 0.6)"
if command -v ffprobe > found; then
    is "read by others" "$(ffprobe -v error -count_frames -of csv=p=0 -select_streams v photo.y4m \
        -show_entries stream=width,height,pix_fmt,nb_read_frames)" "101,75,yuv444p,3"
fi
"$program" place "${photos[@]}" - "${common[@]}" "${start[@]}" --frames 1 > piped.y4m 2> said
is "to a pipe, without a word" "$(cat said)$(stat -c %s piped.y4m)" $((bytes + $(head -1 piped.y4m | wc -c)))

# Players take Rec. 601 for small pictures and Rec. 709 for large ones.
for size in 1278x2 1280x2 2x576 2x577; do
    expect 0 "" fill in/red.png --size $size --colour 255,0,0,255
    expect 0 "" place in/red.png red.y4m --frames 1
    is "red of $size" "$(tail -n +2 red.y4m | tail -c +7 | hex | cut -c 1-2)" "$([[ $size =~ 1278|576 ]] && echo 51 || echo 3f)"
done
is "chroma of red in Rec. 601, V last" "$("$program" place in/red.png - --size 1x1 --frames 1 | tail -c 3 | hex)" "51 5a f0"
expect 0 "" fill in/glass.png --size 2x2 --colour 255,255,255,128
expect 0 "" place in/white.png in/glass.png glass.y4m --opacity 0 --frames 1
is "glass is seen over black" "$(tail -c 12 glass.y4m | hex)" "7e 7e 7e 7e 80 80 80 80 80 80 80 80"

refuse() { # TEXT ARGUMENT...
    local text=$1
    shift
    expect 2 "$text" place in/white.png in/blue.png "$@"
}
for name in position anchor scale; do
    for value in 1 1,2,3 x,1 nan,1 inf,0 1e300,0 0,-2e6; do
        refuse "is not a" out/x.png "--$name=$value"
        refuse "is not a" out/x.y4m --frames 2 --to "$name=$value"
    done
done
for name in rotate opacity softness; do
    for value in x 1,2 nan inf -inf 1e9; do
        refuse "is not a" out/x.png "--$name=$value" --quality 4
        refuse "is not a" out/x.y4m --frames 2 --to "$name=$value" --quality 4
    done
done
for word in scale=-1,1 opacity=1.1 opacity=-0.1 softness=1.01 softness=-1; do
    refuse "its numbers go from 0 to" out/x.png "--$word" --quality 4
    refuse "its numbers go from 0 to" out/x.y4m --frames 2 --to $word --quality 4
done
refuse "--to knows position" out/x.y4m --frames 2 --to quality=3
refuse "--to wants NAME=VALUE" out/x.y4m --frames 2 --to rotate
refuse "--to is for a flight" out/x.png --to rotate=3
refuse "a flight is a Y4M stream, or numbered files" out/x.png --frames 3
refuse "tell --frames" out/x.y4m
refuse "tell --frames" -
for frames in 0 -1 x 1000000; do refuse "--frames" out/x.y4m --frames=$frames; done
for rate in 0 -1 x nan; do refuse "--rate" out/x.y4m --frames 2 --rate=$rate; done
for field in 3 -1 x; do
    refuse "--src-field" out/x.png --src-field=$field
    refuse "--dst-field" out/x.png --dst-field=$field
done
for quality in 6 -1 nan; do refuse "--quality" out/x.png --quality=$quality; done
for size in 0x2 2 4,4 4.5x2 -1x3 nanx3; do refuse "is no size" out/x.png --size=$size; done
for quality in 2 5; do
    refuse "a softness is for --quality 3 or 4" out/x.png --softness 0.5 --quality $quality
    refuse "a softness is for --quality 3 or 4" out/x.y4m --frames 2 --to softness=0.5 --quality $quality
done
refuse "a softness is for --quality 3 or 4" out/x.y4m --frames 2 --softness 0.5 --to softness=0 --quality 2
refuse "--soft-edges is for a quality up to 4" out/x.png --soft-edges
refuse "there is no blend mode 'screen'" out/x.png --mode screen
refuse "place takes SRC" in/white.png out/x.png
expect 2 "place takes SRC" place in/white.png
expect 2 "FILES" place
expect 3 "No such file" place in/missing.png in/blue.png out/x.png
expect 3 "No such file" place in/white.png in/missing.png out/x.y4m --frames 2
expect 3 "No such file" place in/white.png in/blue.png out/missing/x.y4m --frames 2
expect 3 "No space left" place in/white.png in/blue.png /dev/full --frames 2
expect 1 "there is no memory for a frame" place in/white.png out/x.png --size 1000000x1000000
is "nothing left behind" "$(names out)" ""

finish
