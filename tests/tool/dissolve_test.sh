# pixelkiln dissolve: both ends, means, formats, and what is refused.
. "$(dirname "$0")/expect.sh"

mkdir in out
photo=$media/chelsea.png
expect 0 "" fill in/dark.png --size 8x6 --colour 10,20,30,255
expect 0 "" fill in/bright.png --size 8x6 --colour 110,220,131,255
expect 0 "" fill in/clear.png --size 8x6 --colour 0,0,0,0
first_pixel() { "$program" convert "$1" - --to BGRA_4444_8u --packed | head -c 4 | hex; }
expect 0 "8x6" dissolve in/dark.png in/bright.png half.png --ratio 0.5
is "the mean, 80.5 to even" "$(first_pixel half.png)" "50 78 3c ff"
expect 0 "" dissolve in/dark.png in/bright.png tenth.png --ratio 0.1
is "a tenth of the way" "$(first_pixel tenth.png)" "28 28 14 ff"
expect 0 "" dissolve in/dark.png in/clear.png fading.png --ratio 0.25
is "fading out keeps its colour" "$(first_pixel fading.png)" "1e 14 0a bf"
expect 0 "" dissolve in/dark.png in/bright.png first.png --ratio 0
identical first.png in/dark.png
expect 0 "" dissolve in/dark.png in/bright.png second.png --ratio 1
identical second.png in/bright.png
expect 0 "451x300" dissolve "$photo" "$photo" same.png --ratio 0.31
identical same.png "$photo"

# Two raw frames, one after the other, meet the same picture.
expect 0 "" convert in/dark.png in/dark.raw --to UYVY_422_8u --packed
cat in/dark.raw in/dark.raw > in/two.raw
raw=(--from UYVY_422_8u --size 8x6 --packed --ratio 0.5)
expect 0 "2 frames 8x6" dissolve in/two.raw in/bright.png two.raw "${raw[@]}"
is "both frames" "$(stat -c %s two.raw)" 192
is "alike" "$(head -c 96 two.raw | cmp - <(tail -c 96 two.raw) && echo alike)" alike

for ratio in -0.1 1.1 x; do
    expect 2 "--ratio" dissolve in/dark.png in/bright.png out/x.png "--ratio=$ratio"
done
expect 2 "--ratio" dissolve in/dark.png in/bright.png out/x.png
expect 2 "'nan' is not a number" dissolve in/dark.png in/bright.png out/x.png --ratio nan
expect 2 "OUT" dissolve in/dark.png in/bright.png --ratio 0.5
expect 1 "one has 8x6 and the other has 451x300" dissolve in/dark.png "$photo" out/x.png --ratio 0.5
expect 3 "No such file" dissolve in/dark.png in/missing.png out/x.png --ratio 0.5
is "nothing left behind" "$(names out)" ""

finish
