# The commands that draw.
. "$(dirname "$0")/expect.sh"

expect 0 "2 pictures" sheet sheet.png "$media/coffee.png" "$media/chelsea.png"
expect 0 "identical" compare sheet.png sheet.png
expect 0 "5 pictures" sheet sheet.png "$media"/{coffee,chelsea,coffee,chelsea,coffee}.png --columns 5 --heading Five
expect 0 "size                1376x364" compare sheet.png sheet.png
expect 2 "--columns" sheet x.png "$media/coffee.png" --columns 0

expect 0 "demo/sheet.png shows all 12" demo "$media/chelsea.png" demo
is "pictures of the demonstration" "$(ls -A demo | wc -l)" 16
for picture in demo/[01]*.png; do
    expect 0 "size                451x300" compare "$media/chelsea.png" "$picture" --limit 255
done
identical "$media/chelsea.png" demo/08-BGRA_4444_15u.png
expect 0 "size                832x684" compare demo/colour.png demo/colour.png
expect 0 "size                928x544" compare demo/tone-range.png demo/tone-range.png

expect 0 "2209 pairs of 47 formats" pairs pairs.csv
is "lines of numbers" "$(wc -l < pairs.csv)" 2210
is "pairs without a way" "$(awk -F, '$3 == 0' pairs.csv | wc -l)" 0
is "a format by way of itself" "$(awk -F, 'NR > 1 && $1 == $2 && $5 != 0' pairs.csv | wc -l)" 0
is "8 bits by way of float" "$(grep '^BGRA_4444_8u,BGRA_4444_32f,' pairs.csv)" "BGRA_4444_8u,BGRA_4444_32f,1,1,0"
expect 0 "2209 pairs" pairs pairs.svg --quality 0
is "cells in the picture" "$(grep -o '>[1-8]</tspan>' pairs.svg | wc -l)" 2209
is "start and end" "$(head -c 4 pairs.svg)$(tail -c 7 pairs.svg)" "<svg</svg>"

finish
