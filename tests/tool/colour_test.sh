# pixelkiln colour: known pixels of every space, round trips, gamut and tone range, and what is refused.
. "$(dirname "$0")/expect.sh"

mkdir in out
# One pixel of raw floats from R, G and B; a row of fewer than eight pixels is computed to full precision.
pixel() { # FILE R G B
    perl -e 'print pack "f<4", @ARGV[2, 1, 0], 1' "$2" "$3" "$4" > "$1"
}
# colours FILE: R G B
colours() {
    od -An -v -tf4 "$1" | awk '{ print $3, $2, $1 }'
}
# values FORMULA...: each in double precision; p(x, y) is a power, pq(x) and hlg(x) encode x in cd/m2.
values() {
    perl -e 'sub p { $_[0] ** $_[1] }
        sub pq { my $y = p($_[0] / 10000, 0.1593017578125);
                 p((0.8359375 + 18.8515625 * $y) / (1 + 18.6875 * $y), 78.84375) }
        sub hlg { my $e = p($_[0] / 1000, 1 / 1.2);
                  $e > 1 / 12 ? 0.17883277 * log(12 * $e - 0.28466892) + 0.55991073 : sqrt(3 * $e) }
        print join " ", map eval, @ARGV' "$@"
}
# grey FORMULA: its value three times
grey() {
    values "$1" "$1" "$1"
}
# near WHAT GOT WANTED: three numbers each, no more than 2e-5 apart
near() {
    checks=$((checks + 1))
    echo "$2 $3" | awk '{ for (i = 1; i <= 3; ++i) { d = $i - $(i + 3); if (!(d * d < 4e-10)) bad = 1 } }
                        END { exit bad || NF != 6 }' || fail "$1: '$2', not '$3'"
}
# converted FROM TO R G B [OPTION...]: what becomes of a pixel
converted() {
    local from=$1 to=$2
    pixel in/pixel.raw "$3" "$4" "$5"
    shift 5
    "$program" colour in/pixel.raw out/pixel.raw --size 1x1 --packed --quiet --from "$from" --to "$to" "$@" || return
    colours out/pixel.raw
    rm out/pixel.raw
}

white="1 1 1"
for space in srgb rec709 rec2020 p3 p3-d65 p3-d60 p3-dci pq-normalised pq-p3-normalised gamma:0.45 gamma:1 \
    GAMMA:.5 Rec2020; do
    near "white in $space" "$(converted rec709 "$space" 1 1 1)" "$white"
    near "white from $space" "$(converted "$space" rec709 1 1 1)" "$white"
done
near "white in PQ" "$(converted rec709 pq 1 1 1)" "$(grey 'pq(100)')"
near "white in PQ with P3" "$(converted rec709 pq-p3 1 1 1)" "$(grey 'pq(100)')"
near "white in HLG" "$(converted rec709 hlg 1 1 1)" "$(grey 'hlg(100)')"
near "dark grey in HLG" "$(converted rec709 hlg .2 .2 .2)" "$(grey 'hlg(100 * p(.2, 2.4))')"
near "a highlight in PQ" "$(converted gamma:1 pq 40 40 40)" "$(grey 'pq(4000)')"
near "full PQ in the hub" "$(converted pq rec709 1 1 1)" "$(grey 'p(100, 1 / 2.4)')"
near "full HLG in the hub" "$(converted hlg rec709 1 1 1)" "$(grey 'p(10, 1 / 2.4)')"
near "linear light" "$(converted rec709 gamma:1 .25 .5 .75)" "$(values 'p(.25, 2.4)' 'p(.5, 2.4)' 'p(.75, 2.4)')"
near "sRGB in the hub" "$(converted srgb rec709 .02 .5 .8)" \
    "$(values 'p(.02 / 12.92, 1 / 2.4)' 'p(.555 / 1.055, 1)' 'p(.855 / 1.055, 1)')"
near "red in Rec. 2020" "$(converted rec709 rec2020 1 0 0)" \
    "$(values 'p(.627402, 1 / 2.4)' 'p(.0690955, 1 / 2.4)' 'p(.0163937, 1 / 2.4)')"
near "P3 red in the hub" "$(converted p3 gamma:1 1 0 0)" "1.22494 -0.0420569 -0.0196376"
is "alpha stays" "$(perl -e 'print pack "f<4", .1, .2, .3, .25' |
    "$program" colour - - --size 1x1 --packed --from srgb --to pq | od -An -tf4 | awk '{ print $4 }')" 0.25

# PNG files of both depths, and raw frames by way of pipes.
photo=$media/chelsea.png
expect 0 "451x300, BGRA_4444_32f to BGRA_4444_8u" colour "$photo" same8.png --from rec709 --to rec709
identical "$photo" same8.png
expect 0 "to BGRA_4444_32f" colour "$photo" hub.png --from srgb --to rec709 --png-depth 16
expect 0 "srgb to rec709: samples from " colour "$photo" hub.raw --from srgb --to rec709
expect 0 "" colour hub.png hub-again.png --from rec709 --to rec709 --png-depth 16
identical hub.png hub-again.png
for space in rec2020 p3-dci pq-p3 pq-normalised hlg gamma:0.45; do
    expect 0 "srgb to $space" colour "$photo" there.png --from srgb --to "$space" --png-depth 16
    expect 0 "$space to srgb" colour there.png back.png --from "$space" --to srgb --png-depth 16
    expect 0 "" compare "$photo" back.png --limit 1
done
"$program" colour - - --size 451x300 --from rec709 --to srgb < hub.raw > piped.raw
expect 0 "" convert piped.raw piped.png --from BGRA_4444_32f --size 451x300
identical "$photo" piped.png
cat hub.raw hub.raw > two.raw
expect 0 "2 frames 451x300" colour two.raw two-%d.png --from rec709 --to srgb --size 451x300
same "a numbered file" two-1.png piped.png
is "no words with --quiet" "$("$program" colour "$photo" quiet.png --from srgb --to pq --quiet 2>&1)" ""
rm quiet.png
expect 0 "" fill in/green.png --size 2x2 --colour 0,255,0,255
expect 0 "the PNG clips 100 % of them to 0 or 1" colour in/green.png out/x.png --from rec2020 --to rec709
is "nothing clipped" "$("$program" colour in/green.png out/x.png --from rec709 --to rec2020 | grep -c clips)" 0
rm out/x.png

# Green of Rec. 2020 is pulled towards its luminance until red is 0: s = Y / (Y - R) in linear light.
clip='$y = .2126 * -.587657 + .7152 * 1.1329 - .0722 * .100597; $s = $y / ($y + .587657);'
near "clipped green" "$(converted rec2020 rec709 0 1 0 --gamut-clip | awk '{ print ($1 < 1e-3) ? 0 : $1, $2, $3 }')" \
    "0 $(values "$clip p((1.1329 - \$y) * \$s + \$y, 1 / 2.4)" "$clip p((-.100597 - \$y) * \$s + \$y, 1 / 2.4)")"
is "the hub in between clips nothing" \
    "$(converted rec2020 rec2020 0 1 0 --gamut-clip | awk '{ printf "%.1f %.1f %.1f", $1, $2, $3 }')" "0.0 1.0 0.0"
near "clipped white of P3" "$(converted rec709 p3 1 1 1 --gamut-clip)" "$white"
expect 1 "nothing clips the gamut from srgb to pq" colour "$photo" out/x.png --from srgb --to pq --gamut-clip
expect 1 "nothing clips the gamut from hlg to rec709" colour "$photo" out/x.png --from hlg --to rec709 --gamut-clip

# With a slope of 1 the curve is (sqrt(1 + 99.99 e Y) - 1) / 99, whatever the knee.
bent() { # E Y: the luminance after it
    echo "(sqrt(1 + 99.99 * $1 * $2) - 1) / 99"
}
for space in rec709:2.4 rec2020:2.4 p3:2.6; do
    name=${space%:*} power=${space#*:}
    near "tone range of $name" "$(converted "$name" "$name" .5 .5 .5 --exposure 4 --slope 1 --knee .6)" \
        "$(grey "p($(bent 4 "p(.5, $power)"), 1 / $power)")"
done
near "tone range of sRGB" "$(converted srgb srgb .5 .5 .5 --exposure 4 --slope 1 --knee 0)" \
    "$(grey "1.055 * p($(bent 4 'p(.555 / 1.055, 2.4)'), 1 / 2.4) - .055")"
near "a highlight" "$(converted rec709 gamma:1 3 3 3 --exposure 10 --slope 2 --knee .7)" "$white"
expect 0 "" fill in/grey.png --size 2x2 --colour 128,128,128,255
for space in gamma:0.45 pq pq-normalised hlg; do
    expect 1 "tone-range compression does nothing in $space" \
        colour in/grey.png out/x.png --from "$space" --to srgb --exposure 1 --slope 1 --knee 0
done
tone=(colour in/grey.png out/x.png --from rec709 --to srgb)
expect 2 "belong together" "${tone[@]}" --exposure 1
expect 2 "belong together" "${tone[@]}" --slope 1 --knee .5
for wrong in 0 -1 nan inf; do
    expect 2 "--exposure must be a number above 0" "${tone[@]}" "--exposure=$wrong" --slope 1 --knee .5
    expect 2 "--slope must be a number above 0" "${tone[@]}" --exposure 1 "--slope=$wrong" --knee .5
done
for wrong in 1 -0.1 nan; do
    expect 2 "--knee must be from 0 to below 1" "${tone[@]}" --exposure 1 --slope 1 "--knee=$wrong"
done
expect 2 "--knee" "${tone[@]}" --exposure 1 --slope 1 --knee much

expect 2 "'rec601' is no colour space; there are srgb, rec709," colour "$photo" out/x.png --from rec601 --to srgb
expect 2 "'' is no colour space" colour "$photo" out/x.png --from srgb --to ''
for gamma in gamma: gamma:0 gamma:-1 gamma:nan gamma:inf gamma:1x gamma:x; do
    expect 2 "needs an exponent above 0" colour "$photo" out/x.png --from "$gamma" --to srgb
done
expect 2 "'gamma' is no colour space" colour "$photo" out/x.png --from gamma --to srgb
expect 2 "--to" colour "$photo" out/x.png --from srgb
expect 2 "--from" colour "$photo" out/x.png --to srgb
expect 2 "give it with --size" colour hub.raw out/x.png --from rec709 --to srgb
expect 2 "leave --size away" colour "$photo" out/x.png --from srgb --to pq --size 451x300
expect 3 "check --size and the format" colour hub.raw out/x.png --from rec709 --to srgb --size 480x300
expect 3 "No such file" colour in/missing.png out/x.png --from srgb --to pq
is "nothing left behind" "$(names out)" ""

finish
