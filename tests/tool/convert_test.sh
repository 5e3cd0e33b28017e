# Pictures and raw frames that are what they should be.
. "$(dirname "$0")/expect.sh"

# Every kind of PNG, into BGRA with the bottom row first.
as_bgra() {
    "$program" convert "$pictures/$1" - --to BGRA_4444_8u --packed | hex
}
is "palette with alpha" "$(as_bgra palette.png)" "ff 00 00 ff 00 00 ff ff 00 00 ff ff 00 ff 00 80"
is "interlaced, one bit grey" "$(as_bgra gray1-interlaced.png)" \
    "00 00 00 ff ff ff ff ff ff ff ff ff ff ff ff ff 00 00 00 ff ff ff ff ff"
is "16 bits, grey and alpha" "$("$program" convert "$pictures/gray16-alpha.png" - --to BGRA_4444_32f --packed |
    od -An -v -tf4 | xargs)" "1.5259022e-05 1.5259022e-05 1.5259022e-05 0.2500038 0.5000076 0.5000076 0.5000076 1"

# PNG to PNG, plain and with 16 bits, loses nothing.
expect 0 "512x512, BGRA_4444_8u to BGRA_4444_8u" convert "$media/astronaut.png" same.png
identical "$media/astronaut.png" same.png
expect 0 "to BGRA_4444_32f" convert "$media/coffee.png" deep.png --png-depth 16
expect 0 "size                600x400" compare "$media/coffee.png" deep.png --limit 0.001
expect 0 "" convert "$pictures/gray16-alpha.png" gray16.png --png-depth 16
identical "$pictures/gray16-alpha.png" gray16.png
expect 0 "" convert "$pictures/palette.png" palette.png
identical "$pictures/palette.png" palette.png

# Rows of 451 pixels of V210: 76 groups of 16 bytes, padded to a multiple of 128.
expect 0 "451x300" convert "$media/chelsea.png" padded.raw --to V210_422_10u
is "padded V210" "$(stat -c %s padded.raw)" $((1280 * 300))
expect 0 "451x300" convert "$media/chelsea.png" packed.raw --to V210_422_10u --packed
is "packed V210" "$(stat -c %s packed.raw)" $((1216 * 300))
is "padding of the first row" "$(head -c 1280 padded.raw | tail -c 64 | tr -d '\0' | wc -c)" 0
expect 0 "V210_422_10u to BGRA_4444_8u" convert padded.raw padded.png --from V210_422_10u --size 451x300
expect 0 "" convert packed.raw packed.png --from 0x851 --size 451x300 --packed
same "both packings" padded.png packed.png
expect 0 "" convert "$media/chelsea.png" through.png --to V210_422_10u
same "through a format in one go" through.png packed.png

# A white bottom row under a black top row, from a format that begins at the bottom to one that begins at the
# top: 16 is black and 235 is white.
printf '\377\377\377\377\377\377\377\377\0\0\0\377\0\0\0\377' > upright.raw
is "origin" "$("$program" convert upright.raw - --from BGRA_4444_8u --to UYVY_422_8u --size 2x2 --packed | hex)" \
    "80 10 80 10 80 eb 80 eb"

# Several frames in one file, from a pipe, and into numbered PNG files.
cat padded.raw padded.raw padded.raw > three.raw
expect 0 "3 frames 451x300" convert three.raw three.uyvy --from V210_422_10u --to UYVY_422_8u --size 451x300
is "three frames" "$(stat -c %s three.uyvy)" $((3 * 912 * 300))
"$program" convert - - --from V210_422_10u --to UYVY_422_8u --size 451x300 < <(cat three.raw) > piped.uyvy
same "through pipes" three.uyvy piped.uyvy
mkdir numbered
expect 0 "3 frames" convert three.raw numbered/f-%03d.png --from V210_422_10u --size 451x300
is "numbered files" "$(names numbered)" "f-000.png f-001.png f-002.png "
same "a numbered file" numbered/f-002.png padded.png
is "no words with --quiet" "$("$program" convert --quiet "$media/coffee.png" quiet.png 2>&1)" ""

# An output that is a link is written where the link leads, with the permissions that the file has.
cp same.png target.png
chmod 640 target.png
ln -s target.png link.png
expect 0 "" convert "$media/coffee.png" link.png
is "the link stays" "$(readlink link.png)" target.png
expect 0 "identical" compare target.png "$media/coffee.png"
is "permissions stay" "$(stat -c %a target.png)" 640

finish
