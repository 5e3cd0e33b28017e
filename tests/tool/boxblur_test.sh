# pixelkiln boxblur: both directions and each alone, bright borders, and what is refused.
. "$(dirname "$0")/expect.sh"

mkdir in out
expect 0 "" fill in/grey.png --size 16x12 --colour 100,150,200,255
expect 0 "" boxblur in/grey.png grey.png --radius 2 --renormalise
identical in/grey.png grey.png
expect 0 "" boxblur in/grey.png faded.png --radius 2
is "borders fade without it" "$("$program" compare in/grey.png faded.png | grep -c identical)" 0
expect 0 "" boxblur "$media/chelsea.png" zero.png --radius 0
identical "$media/chelsea.png" zero.png

# White above black: a blur along rows changes nothing, one along columns does.
head -c 512 /dev/zero | tr '\0' '\377' > in/half.raw
head -c 512 /dev/zero >> in/half.raw
half=(--from BGRA_4444_8u --size 16x16 --packed --radius 1 --renormalise)
expect 0 "16x16" boxblur in/half.raw rows.raw "${half[@]}" --rows
same "rows" in/half.raw rows.raw
expect 0 "" boxblur in/half.raw columns.raw "${half[@]}" --columns
# A radius of 1 has a window of three pixels: (255 + 255 + 0) / 3 and (255 + 0 + 0) / 3.
column() { od -An -v -w64 -tu1 "$1" | awk '{ print $1 }' | xargs; }
is "columns" "$(column columns.raw)" "255 255 255 255 255 255 255 170 85 0 0 0 0 0 0 0"
expect 0 "" boxblur in/half.raw both.raw "${half[@]}"
same "both, by default" columns.raw both.raw
expect 0 "" boxblur in/half.raw asked.raw "${half[@]}" --rows --columns
same "both, asked for" both.raw asked.raw
expect 0 "" boxblur columns.raw again.raw "${half[@]}"
expect 0 "" boxblur in/half.raw passes.raw "${half[@]}" --passes 2
same "two passes" again.raw passes.raw

for radius in -1 x 1e9; do
    expect 2 "--radius" boxblur in/grey.png out/x.png "--radius=$radius"
done
expect 2 "--radius" boxblur in/grey.png out/x.png
expect 2 "'nan' is not a number" boxblur in/grey.png out/x.png --radius nan
for passes in 0 -1 101; do
    expect 2 "--passes" boxblur in/grey.png out/x.png --radius 1 "--passes=$passes"
done
expect 1 "cannot blur a frame of BGRA_4444_32f: only 8-bit formats" \
    boxblur in/grey.png out/x.png --radius 1 --from BGRA_4444_32f
expect 1 "cannot blur a frame of RGB_444_10u" boxblur in/grey.png out/x.png --radius 1 --from RGB_444_10u
expect 1 "cannot blur a frame of UYVY_422_8u" boxblur in/grey.png out/x.png --radius 1 --from UYVY_422_8u
expect 0 "" fill in/small.png --size 3x9 --colour black
expect 1 "no side may be shorter than 4 pixels" boxblur in/small.png out/x.png --radius 1
expect 3 "No such file" boxblur in/missing.png out/x.png --radius 1
is "nothing left behind" "$(names out)" ""

finish
