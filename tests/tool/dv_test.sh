# Raw files of DV: what they tell, decoded, encoded and merged.
. "$(dirname "$0")/expect.sh"

mkdir in out
# copy NAME FILE: a frame of media/dv/ that can be changed
copy() {
    cat "$media/dv/$1.dif" > "$2"
}
# patch FILE PLACE BYTE...: bytes in hexadecimal from a place on
patch() {
    local file=$1 place=$2
    shift 2
    printf "$(printf '\\x%s' "$@")" | dd of="$file" bs=1 seek="$place" conv=notrunc status=none
}
bytes_of() { stat -c %s "$1"; }

# What each format tells. told NAME TEXT CHROMA SHAPE
told() {
    expect 0 "$1.dif: 1 frame of $2" dv info "$media/dv/$1.dif"
    expect 0 "chroma      $3" dv info "$media/dv/$1.dif"
    expect 0 "shape       $4" dv info "$media/dv/$1.dif"
    expect 0 "errors      none" dv info "$media/dv/$1.dif"
}
told dv25_525_411_astronaut "NTSCDV25, 720x480, 30000/1001 frames a second" 4:1:1 4:3
told dv25_625_420_coffee "PALDV25, 720x576, 25 frames a second" 4:2:0 4:3
told dv25_625_411_chelsea "PALDV25, 720x576, 25 frames a second" 4:1:1 4:3
told dv50_525_coffee "NTSCDV50, 720x480, 30000/1001 frames a second" 4:2:2 4:3
told dv50_625_astronaut "PALDV50, 720x576, 25 frames a second" 4:2:2 4:3
told dv100_720p60_chelsea "NTSC_DV100_720p, 960x720, 60000/1001 frames a second" 4:2:2 16:9
told dv100_720p60_chelsea_second "NTSC_DV100_720p, 960x720, 60000/1001 frames a second" 4:2:2 16:9
told dv100_720p50_astronaut "PAL_DV100_720p, 960x720, 50 frames a second" 4:2:2 16:9
told dv100_1080i60_coffee "NTSC_DV100_1080i, 1280x1080, 30000/1001 frames a second" 4:2:2 16:9
told dv100_1080i50_astronaut "PAL_DV100_1080i, 1440x1080, 25 frames a second" 4:2:2 16:9
is "the whole report" "$("$program" dv info "$media/dv/dv25_525_411_astronaut.dif" | tail -n +2)" \
    "  chroma      4:1:1
  shape       4:3
  time code   none
  recorded    none
  audio       none
  packs       VAUX 60 61; subcode none; audio none
  errors      none"

# Packs of all kinds: time code 01:02:03;04 in the first SSYB, recording date and time, audio source; shapes by majority.
copy dv25_525_411_astronaut in/packs.dv
patch in/packs.dv $((80 + 3 + 3)) 13 44 83 82 c1
patch in/packs.dv $((240 + 80 + 3 + 5 * 2)) 62 ff c4 07 03
patch in/packs.dv $((240 + 80 + 3 + 5 * 3)) 63 ff 56 34 12
patch in/packs.dv $((6 * 80 + 3)) 50 40 00 c0 80
cat in/packs.dv > in/two.dv
copy dv25_525_411_astronaut in/plain.dv
cat in/plain.dv >> in/two.dv
patch in/two.dv $((120000 + 80 + 3 + 3)) 13 05 03 02 01
expect 0 "2 frames of NTSCDV25" dv info in/two.dv
expect 0 "time code   01:02:03;04 to 01:02:03:05" dv info in/two.dv
expect 0 "recorded    2003-07-04 12:34:56 to none" dv info in/two.dv
expect 0 "audio       48 kHz, 16 bit, then others" dv info in/two.dv
expect 0 "packs       VAUX 60 61 62 63; subcode 13; audio 50" dv info in/two.dv
is "a row for each frame" "$("$program" dv info in/two.dv --csv)" \
    "Frame,\"Time code\",Recorded,Shape,Chroma,Audio,Errors
0,01:02:03;04,\"2003-07-04 12:34:56\",4:3,4:1:1,\"48 kHz, 16 bit\",0
1,01:02:03:05,none,4:3,4:1:1,none,0"
expect 0 "0  01:02:03;04  2003-07-04 12:34:56  4:3    4:1:1   48 kHz, 16 bit       0" dv info in/two.dv --frames
expect 0 "2 frames" dv info - < in/two.dv
copy dv25_525_411_astronaut in/bad.dv
patch in/bad.dv $((80 + 3 + 3)) 13 0f 03 02 01
expect 0 "time code   none" dv info in/bad.dv

# What is wrong. wrong TEXT PLACE BYTE...: with these bytes in a good frame
wrong() {
    local text=$1
    shift
    copy dv25_625_420_coffee in/bad.dv
    patch in/bad.dv "$@"
    expect 0 "frame 0: $text" dv info in/bad.dv
    expect 0 "errors      1" dv info in/bad.dv
}
video=$((2 * 12000 + 7 * 80)) # the first video block of the third sequence
wrong "1 x wrong section in an ID, first in channel 0, sequence 2, block 7" $video 76
wrong "1 x wrong sequence or channel in an ID, first in channel 0, sequence 2, block 7" $((video + 1)) 37
wrong "1 x wrong sequence or channel in an ID, first in channel 0, sequence 2, block 7" $((video + 1)) 2f
wrong "1 x wrong number in an ID, first in channel 0, sequence 2, block 7" $((video + 2)) 01
wrong "1 x macroblock marked as an error (STA 15), first in channel 0, sequence 2, block 7" $((video + 3)) f0
wrong "1 x application IDs that disagree (APT 1, AP1 to AP3 0, 0, 0), first in channel 0, sequence 0, block 0" 4 f9
wrong "1 x application IDs that mean no DV (APT 0, AP1 to AP3 0, 1, 0), first in channel 0, sequence 0, block 0" \
    6 79
wrong "1 x header of the other count of lines, first in channel 0, sequence 3, block 0" $((3 * 12000 + 3)) 3f
copy dv25_625_420_coffee in/bad.dv
patch in/bad.dv $((video + 3)) e0
patch in/bad.dv $((video + 83)) e0
expect 0 "2 x macroblock marked as an error (STA 14), first in channel 0, sequence 2, block 7" dv info in/bad.dv
{ cat "$media/dv/dv25_625_420_coffee.dif"; head -c 144000 "$media/dv/dv50_625_astronaut.dif"; } > in/bad.dv
expect 0 "frame 1: 1 x another format told, PALDV50, 720x576, 25 frames a second, first in the first sequence" \
    dv info in/bad.dv
{ cat "$media/dv/dv25_625_420_coffee.dif"; head -c 1000 /dev/zero; } > in/bad.dv
expect 0 "the file ends within frame 1, 1000 bytes into 144000" dv info in/bad.dv
# Of many errors the first are shown.
for _ in $(seq 15); do cat in/two.dv; done > in/many.dv
expect 0 "errors      37" dv info in/many.dv --from PALDV50
expect 0 "and 17 more" dv info in/many.dv --from PALDV50
expect 0 "chroma      4:2:2
" dv info in/many.dv --from PALDV50
expect 0 "29 frames of NTSCDV25" dv info <(head -c $((29 * 120000)) in/many.dv)

# size_of NAME: of the picture, as 720x480
size_of() {
    "$program" dv info "$media/dv/$1.dif" | head -1 | sed 's/.*, \([0-9]*x[0-9]*\),.*/\1/'
}
# format_of NAME
format_of() {
    "$program" dv info "$media/dv/$1.dif" | head -1 | sed 's/.* of \([A-Za-z0-9_]*\),.*/\1/'
}

# Decoded as by 'convert', and to a stream that tells rate, fields and shape. decoded NAME HEAD
decoded() {
    local format size
    format=$(format_of "$1")
    size=$(size_of "$1")
    local raster=UYVY_422_8u
    case $format in *DV100*) raster=UYVY_422_8u_709 ;; esac
    expect 0 "1 frame of $format, $size" dv decode "$media/dv/$1.dif" x.raw --to $raster --packed
    expect 0 "" convert "$media/dv/$1.dif" y.raw --from "$format" --size "$size" --to $raster --packed
    same "decoded $1" x.raw y.raw
    expect 0 "to $raster" dv decode "$media/dv/$1.dif" "$1.y4m"
    is "head of $1" "$(head -1 "$1.y4m")" "YUV4MPEG2 $2 C422 XCOLORRANGE=LIMITED"
    expect 0 "" convert "$1.y4m" y.raw --to $raster --packed
    same "stream of $1" x.raw y.raw
}
decoded dv25_525_411_astronaut "W720 H480 F30000:1001 Ib A8:9"
decoded dv25_625_420_coffee "W720 H576 F25:1 Ib A16:15"
decoded dv25_625_411_chelsea "W720 H576 F25:1 Ib A16:15"
decoded dv50_525_coffee "W720 H480 F30000:1001 Ib A8:9"
decoded dv50_625_astronaut "W720 H576 F25:1 Ib A16:15"
decoded dv100_720p60_chelsea "W960 H720 F60000:1001 Ip A4:3"
decoded dv100_720p50_astronaut "W960 H720 F50:1 Ip A4:3"
decoded dv100_1080i60_coffee "W1280 H1080 F30000:1001 It A3:2"
decoded dv100_1080i50_astronaut "W1440 H1080 F25:1 It A4:3"
copy dv25_525_411_astronaut in/wide.dv
for sequence in $(seq 0 9); do
    patch in/wide.dv $((12000 * sequence + (sequence % 2 == 0 ? 455 : 250))) ca
done
expect 0 "shape       16:9" dv info in/wide.dv
expect 0 "" dv decode in/wide.dv x.y4m
is "wide pixels" "$(head -1 x.y4m | grep -o ' A[^ ]*')" " A32:27"

# Other formats on the way out.
expect 0 "to YUV_420_MPEG2_FIELD" dv decode in/plain.dv x.y4m --to yuv420p
is "planes of fields" "$(head -1 x.y4m)" "YUV4MPEG2 W720 H480 F30000:1001 Ib A8:9 C420mpeg2 XCOLORRANGE=LIMITED"
expect 0 "to YUV_420_MPEG2_FRAME_709" dv decode "$media/dv/dv100_720p60_chelsea.dif" x.yuv --to yuv420p
is "planes of frames" "$(bytes_of x.yuv)" $((960 * 720 * 3 / 2))
expect 0 "to BGRA_4444_8u" dv decode in/two.dv frame-%02d.png
expect 0 "to BGRA_4444_32f" dv decode in/two.dv frame-16-%02d.png --png-depth 16
expect 0 "" convert frame-00.png x.raw --to BGRA_4444_8u
expect 0 "" dv decode in/plain.dv y.raw --to BGRA_4444_8u
same "a PNG" x.raw y.raw
"$program" dv decode - - --to y4m < in/two.dv > piped.y4m
is "through pipes" "$(grep -ac FRAME piped.y4m)" 2
is "and quiet" "$("$program" dv decode in/two.dv x.y4m --quiet)" ""
expect 2 "name it with --to" dv decode in/two.dv out/x.raw
expect 2 "number the output" dv decode in/two.dv out/x.png
expect 3 "ends within a frame, 1000 bytes into 120000" dv decode <(cat in/two.dv; head -c 1000 in/two.dv) out/x.y4m
cat in/plain.dv > in/bad.dv
patch in/bad.dv 4 ff
expect 1 "cannot decode NTSCDV25 to a frame of UYVY_422_8u at 720x480: this DV format is not covered" \
    dv decode in/bad.dv out/x.y4m

# Several frames keep their order, whatever the threads.
cat in/plain.dv in/wide.dv in/bad.dv > in/several.dv
for name in stress_dv25_525_411 dv25_525_411_astronaut; do cat "$media/dv/$name.dif"; done > in/several.dv
for _ in 1 2; do cat in/several.dv in/several.dv in/two.dv; done > in/ten.dv
for threads in 1 2 3 16; do
    expect 0 "12 frames of NTSCDV25" dv decode in/ten.dv $threads.y4m --threads $threads
    same "decoded by $threads threads" 1.y4m $threads.y4m
    expect 0 "12 frames of NTSCDV25" dv encode 1.y4m $threads.dv --to NTSCDV25 --threads $threads
    same "encoded by $threads threads" 1.dv $threads.dv
    expect 0 "12 frames of NTSCDV25" dv merge 1.dv in/ten.dv merged$threads.dv --threads $threads
    same "merged by $threads threads" merged1.dv merged$threads.dv
done
# A failure of one frame ends the work, and leaves nothing.
cat in/ten.dv in/bad.dv in/ten.dv > in/fails.dv
for threads in 1 4; do
    expect 1 "this DV format is not covered" dv decode in/fails.dv out/x.y4m --threads $threads
    expect 1 "cannot merge frames of NTSCDV25: this DV format is not covered" \
        dv merge in/fails.dv in/fails.dv out/x.dv --threads $threads
done

# Encoded. round NAME FORMAT: a decoded frame encoded and decoded again is as it was, but for a few codes.
round() {
    expect 0 "1 frame of $2" dv encode "$1.y4m" x.dv --to "$2"
    is "bytes of $1" "$(bytes_of x.dv)" "$(bytes_of "$media/dv/$1.dif")"
    expect 0 "errors      none" dv info x.dv
    expect 0 "1 frame of $2" dv info x.dv
    expect 0 "" dv decode x.dv x.png
    expect 0 "" dv decode "$media/dv/$1.dif" y.png
    local psnr
    psnr=$("$program" compare x.png y.png | awk '$1 == "PSNR" { print $2 }')
    echo "$1 encoded again: $psnr dB"
    is "$1 encoded again, $psnr dB" "$(echo "$psnr" | awk '{ print ($1 >= 40) }')" 1
}
round dv25_525_411_astronaut NTSCDV25
round dv25_625_420_coffee PALDV25
round dv50_525_coffee NTSCDV50
round dv50_625_astronaut PALDV50
round dv100_720p60_chelsea NTSC_DV100_720p
round dv100_720p50_astronaut PAL_DV100_720p
round dv100_1080i60_coffee NTSC_DV100_1080i
round dv100_1080i50_astronaut PAL_DV100_1080i
expect 0 "" dv encode dv25_625_420_coffee.y4m x.dv --to PALDV25 --dvcpro
expect 0 "chroma      4:1:1" dv info x.dv
is "AP of 4:1:1" "$(head -c 8 x.dv | tail -c 4 | hex)" "f9 79 79 79"
expect 0 "" convert dv25_525_411_astronaut.y4m x.dv --to NTSCDV25
expect 0 "" dv encode dv25_525_411_astronaut.y4m y.dv --to ntscdv25
same "as by 'convert'" x.dv y.dv
expect 0 "" convert dv25_525_411_astronaut.y4m x.dv --to NTSCDV25 --quality 1
expect 0 "" dv encode dv25_525_411_astronaut.y4m y.dv --to NTSCDV25 --quality 1
same "as by 'convert', quickly" x.dv y.dv
# Of 720 lines every second frame is the second of a pair.
expect 0 "" convert dv100_720p60_chelsea.y4m x.raw --to UYVY_422_8u_709 --packed
cat x.raw x.raw x.raw > three.raw
expect 0 "3 frames of NTSC_DV100_720p" dv encode three.raw pairs.dv --to NTSC_DV100_720p --size 960x720 \
    --from UYVY_422_8u_709 --packed
is "channels of pairs" "$(for i in 0 1 2; do tail -c +$((240000 * i + 2)) pairs.dv | head -c 1 | hex; done)" "070307"
expect 0 "errors      none" dv info pairs.dv
expect 0 "" dv decode pairs.dv pair-%d.png
identical pair-0.png pair-2.png
identical pair-0.png pair-1.png
expect 0 "1 frame of NTSCDV25, 720x480, 30000/1001 frames a second, from BGRA_4444_8u" \
    dv encode frame-00.png x.dv --to NTSCDV25
"$program" dv encode - - --from y4m --to NTSCDV25 < 1.y4m > piped.dv
same "through pipes" 1.dv piped.dv
expect 1 "the frames are 720x480 and those of PALDV25 720x576; 'pixelkiln scale' takes them there" \
    dv encode 1.y4m out/x.dv --to PALDV25
expect 2 "--to is required" dv encode 1.y4m out/x.dv
expect 2 "BGRA_4444_8u is no format of DV" dv encode 1.y4m out/x.dv --to BGRA_4444_8u
expect 2 "there is no pixel format 'dvcpro'" dv encode 1.y4m out/x.dv --to dvcpro
expect 2 "--dvcpro is for PALDV25 alone" dv encode 1.y4m out/x.dv --to PALDV50 --dvcpro
for name in x.png x.y4m; do
    expect 2 "would be no raw file of DV" dv encode 1.y4m out/$name --to NTSCDV25
done
expect 2 "name it with --from" dv encode three.raw out/x.dv --to NTSC_DV100_720p
expect 2 "give it with --size" dv encode three.raw out/x.dv --to NTSC_DV100_720p --from UYVY_422_8u
expect 3 "No such file" dv encode in/missing.y4m out/x.dv --to NTSCDV25
expect 3 "No space left" dv encode 1.y4m /dev/full --to NTSCDV25

# Merged: rows 0, 2, 4 ... of the second, and of DV100 of the first.
grey() { # NAME COLOUR FORMAT SIZE
    expect 0 "" fill "$1.png" --size "$4" --colour "$2"
    expect 0 "" dv encode "$1.png" "$1.dv" --to "$3"
}
# Y of the first pixel of the first four rows
rows_of() {
    expect 0 "" dv decode "$1" x.raw --to UYVY_422_8u --packed
    local y
    for y in 0 1 2 3; do tail -c +$((2 * ${2%x*} * y + 2)) x.raw | head -c 1 | od -An -tu1; done | xargs
}
grey black black NTSCDV25 720x480
grey white white NTSCDV25 720x480
expect 0 "black.dv and white.dv -> x.dv: 1 frame of NTSCDV25" dv merge black.dv white.dv x.dv
is "DV25" "$(rows_of x.dv 720x480)" "235 16 235 16"
grey black black PAL_DV100_1080i 1440x1080
grey white white PAL_DV100_1080i 1440x1080
expect 0 "1 frame of PAL_DV100_1080i" dv merge black.dv white.dv x.dv
is "DV100" "$(rows_of x.dv 1440x1080)" "16 235 16 235"
expect 0 "" dv merge in/wide.dv in/plain.dv x.dv
expect 0 "shape       16:9" dv info x.dv
expect 0 "" dv merge in/plain.dv in/wide.dv x.dv
expect 0 "shape       4:3" dv info x.dv
"$program" dv merge - in/plain.dv - < in/wide.dv > piped.dv
expect 0 "shape       16:9" dv info piped.dv
expect 1 "'in/plain.dv' is NTSCDV25 and 'black.dv' is PAL_DV100_1080i; both must be of one format" \
    dv merge in/plain.dv black.dv out/x.dv
expect 3 "'in/plain.dv' has fewer frames than 'in/two.dv'; both must have as many" dv merge in/two.dv in/plain.dv out/x.dv
expect 3 "'in/plain.dv' has fewer frames than 'in/two.dv'" dv merge in/plain.dv in/two.dv out/x.dv

# Drawings.
expect 0 "" dv draw drawings
is "drawings" "$(names drawings)" "dv-passes.png dv-placement.png dv-sequence.png "
expect 3 "cannot make the folder 'in/two.dv'" dv draw in/two.dv
expect 2 "OUTDIR is required" dv draw

# refused CODE TEXT ARGUMENT...: of all commands that read DV
refused() {
    local code=$1 text=$2
    shift 2
    expect "$code" "$text" dv info "$@"
    expect "$code" "$text" dv decode "$@" out/x.y4m
    expect "$code" "$text" dv merge "$@" "$1" out/x.dv
}
: > in/empty.dv
head -c 12000 /dev/zero > in/zero.dv
head -c 11999 in/plain.dv > in/short.dv
refused 3 "No such file" in/missing.dv
refused 3 "'in/empty.dv' holds no frame" in/empty.dv
refused 3 "'in/zero.dv' does not begin with a frame of DV that tells its format" in/zero.dv
refused 3 "name the format with --from" in/short.dv
expect 3 "does not begin with a frame of DV" dv info "$media/coffee.png"
expect 2 "UYVY_422_8u is no format of DV; those are NTSCDV25, PALDV25, NTSCDV50, PALDV50, NTSC_DV100_720p, PAL_DV100_720p, NTSC_DV100_1080i, PAL_DV100_1080i" \
    dv info in/two.dv --from UYVY_422_8u
expect 2 "there is no pixel format 'DV25'" dv info in/two.dv --from DV25
expect 2 "A subcommand is required" dv
expect 2 "IN is required" dv info
for threads in 0 257 x; do expect 2 "--threads" dv decode in/two.dv out/x.y4m --threads $threads; done
is "nothing left behind" "$(names out)" ""

finish
