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
