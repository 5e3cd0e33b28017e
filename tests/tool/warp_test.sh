# pixelkiln warp: copies, half pictures, a background, a soft rim, and what is refused.
. "$(dirname "$0")/expect.sh"

mkdir in out
photo=$media/chelsea.png
expect 0 "451x300" warp "$photo" same.png --quad 0,0,451,0,451,300,0,300
identical "$photo" same.png
expect 0 "" warp "$photo" turned.png --quad 451,300,0,300,0,0,451,0 --quality 3
expect 0 "" rotate "$photo" rotated.png --degrees 180
identical turned.png rotated.png

# A white picture into the upper left corner of a black one: 4 of 8 columns, 2 of 6 rows.
expect 0 "" fill in/white.png --size 8x6 --colour white
expect 0 "" fill in/blue.png --size 10x4 --colour 0,0,255,255
lines() { "$program" convert "$1" - --to BGRA_4444_8u --packed | od -An -v -w"$2" -tx1 | tr -d ' ' | tac; }
expect 0 "" warp in/white.png corner.png --quad 0,0,4,0,4,2,0,2
white=ffffffffffffffffffffffffffffffff
black=000000ff000000ff000000ff000000ff
is "rows from the top" "$(lines corner.png 32 | xargs)" \
    "$white$black $white$black $black$black $black$black $black$black $black$black"
# Half of white over blue: 128 of 255.
expect 0 "8x6" warp in/white.png half.png --quad 0,0,10,0,10,4,0,4 --onto in/blue.png --opacity 128
is "onto another size" "$(lines half.png 40 | cut -c 1-8 | xargs)" "ff8080ff ff8080ff ff8080ff ff8080ff"
expect 0 "" warp in/white.png none.png --quad 0,0,10,0,10,4,0,4 --onto in/blue.png --opacity 0
identical none.png in/blue.png
expect 0 "" warp in/white.png outside.png --quad=-30,0,-20,0,-20,4,-30,4 --onto in/blue.png
identical outside.png in/blue.png

# A soft rim is dark at the corner and bright inside.
expect 0 "" fill in/large.png --size 64x64 --colour white
expect 0 "" warp in/large.png soft.png --quad 0,0,64,0,64,64,0,64 --feather 16
middle=$(lines soft.png 256 | sed -n 32p)
is "in the middle" "$(echo "$middle" | cut -c 257-264)" ffffffff
first=$((16#$(echo "$middle" | cut -c 1-2)))
fifth=$((16#$(echo "$middle" | cut -c 33-34)))
is "rising" "$([ $first -lt 16 ] && [ $fifth -gt 80 ] && [ $fifth -lt 125 ] && echo rising)" rising

for quad in 0,0,1,0,1,1,0 0,0,1,0,1,1,0,1,5 0,0,1,0,1,1,0,x nan,0,1,0,1,1,0,1 inf,0,1,0,1,1,0,1; do
    expect 2 "takes 8 numbers" warp "$photo" out/x.png "--quad=$quad"
done
quad=(--quad 0,0,1e300,0,5,5,-1e300,9)
expect 0 "" warp "$photo" huge.png "${quad[@]}" --feather 3
expect 2 "--quad" warp "$photo" out/x.png
expect 2 "--feather" warp "$photo" out/x.png "${quad[@]}" --feather=-1
expect 2 "--opacity" warp "$photo" out/x.png "${quad[@]}" --opacity 256
expect 2 "--quality" warp "$photo" out/x.png "${quad[@]}" --quality 6
expect 1 "only BGRA_4444_8u and VUYA_4444_8u are composited" warp "$photo" out/x.png "${quad[@]}" --from ARGB_4444_8u
expect 3 "No such file" warp "$photo" out/x.png "${quad[@]}" --onto in/missing.png
is "nothing left behind" "$(names out)" ""

finish
