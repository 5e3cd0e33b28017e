# pixelkiln curves: both kinds of picture, places where curves must pass, and what is refused.
. "$(dirname "$0")/expect.sh"

mkdir out
expect 0 "curves.svg: transfer functions and tone curves" curves curves.svg
is "start and end" "$(head -c 5 curves.svg) $(tail -n 1 curves.svg)" "<?xml </svg>"
# A curve is a line of many points: seven spaces twice, and twice four tone curves beside no compression.
grep -o ' d="M [^"]*"' curves.svg | awk 'gsub(/ L /, " ") > 100' > lines
is "curves" "$(wc -l < lines)" 24
# ends X Y: how many curves end there, in whole pixels
ends() {
    awk -v x="$1" -v y="$2" 'function near(a, b) { return a >= b - .5 && a < b + .5 }
        { gsub(/[" ]*$/, ""); if (near($(NF - 1), x) && near($NF, y)) ++n }
        END { print n + 0 }' lines
}
# Linear 1 is encoded as 1 by the four power laws, and by PQ where it is normalised. The fields are 362 high.
is "standard range to 1" "$(ends 556 "$(awk 'BEGIN { print 76 + 362 * (1 - 1 / 1.4) }')")" 5
is "PQ at 100 cd/m2" "$(ends 556 "$(awk 'BEGIN { print 76 + 362 * (1 - 0.50807786 / 1.4) }')")" 1
is "PQ at 10000 cd/m2" "$(ends 1126 257)" 1
is "tone curves that reach white" "$(ends 556 "$(awk 'BEGIN { print 566 + 362 * (1 - 1 / 1.2) }')")" 4

expect 0 "" curves curves.png
expect 0 "size                1160x1000" compare curves.png curves.png
expect 0 "" curves again.svg
same "the same again" curves.svg again.svg

expect 2 "must end in .svg or .png" curves out/curves.pdf
expect 2 "must end in .svg or .png" curves -
expect 2 "OUT is required" curves
expect 3 "No such file" curves out/missing/curves.svg
is "nothing left behind" "$(names out)" ""

finish
