# pixelkiln stamp: where the strokes stand, counting, and what is refused.
. "$(dirname "$0")/expect.sh"

mkdir in out
expect 0 "" fill in/black.raw --size 64x32 --to BGRA_4444_8u --colour black
raw=(--from BGRA_4444_8u --size 64x32)
# The height leaves cells of (32 - 4) / 2 = 14 pixels, and strokes of 10. A one has the two on the right: column
# 4 + 10, rows 4 to 23.
picture() { "$program" convert "$1" - --to BGRA_4444_8u "${@:2}" | od -An -v -w256 -tx1 | tr -d ' ' | tac; }
expect 0 "64x32" stamp in/black.raw one.raw "${raw[@]}" --number 1 --digit 0.25 --at 0,0
picture one.raw "${raw[@]}" > lines
is "red pixels" "$(grep -o 0000ffff lines | wc -l)" 20
is "their rows" "$(grep -n 0000ffff lines | cut -d : -f 1 | xargs)" "$(seq -s ' ' 5 24)"
is "their column" "$(grep 0000ffff lines | awk '{ print (index($0, "0000ffff") - 1) / 8 }' | sort -u)" 14

# Numbers go up from frame to frame; hexadecimal digits.
cat in/black.raw in/black.raw > in/two.raw
expect 0 "2 frames" stamp in/two.raw two.raw "${raw[@]}" --number 9 --digit 0.1 --at 0.1,0.1
expect 0 "" stamp in/black.raw ten.raw "${raw[@]}" --number 10 --digit 0.1 --at 0.1,0.1
is "the second frame" "$(tail -c 8192 two.raw | cmp - ten.raw && echo equal)" equal
expect 0 "" stamp in/black.raw a.raw "${raw[@]}" --number 10 --hex --digit 0.1 --at 0.1,0.1
is "hexadecimal is another" "$(cmp -s a.raw ten.raw || echo differs)" differs
expect 0 "451x300" stamp "$media/chelsea.png" chelsea.png --number=-7
is "drawn into a picture" "$("$program" compare "$media/chelsea.png" chelsea.png | grep -c identical)" 0
expect 0 "to UYVY_422_8u" stamp "$media/chelsea.png" chelsea.raw --number 7 --from UYVY_422_8u

for at in 0 0,0,0 a,b; do
    expect 2 "takes 2 numbers" stamp in/black.raw out/x.png "${raw[@]}" --number 1 "--at=$at"
done
expect 1 "cannot stamp a frame of BGRA_4444_8u at 64x32" stamp in/black.raw out/x.png "${raw[@]}" --number 1 --at 0,1.5
expect 2 "--digit" stamp in/black.raw out/x.png "${raw[@]}" --number 1 --digit 1.5
expect 2 "--number" stamp in/black.raw out/x.png "${raw[@]}"
expect 2 "--number" stamp in/black.raw out/x.png "${raw[@]}" --number 99999999999
expect 1 "cannot stamp a frame of BGRA_4444_15u" stamp "$media/chelsea.png" out/x.png --number 1 --from BGRA_4444_15u
is "nothing left behind" "$(names out)" ""

finish
