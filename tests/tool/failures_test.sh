# Bad input and bad luck: the exit code, a sentence that helps, and nothing left behind.
. "$(dirname "$0")/expect.sh"

mkdir in out
photo=$media/coffee.png
frame=$((1280 * 300)) # V210 at 451x300
head -c 100000 "$photo" > in/truncated.png
head -c 20 "$photo" > in/header.png
head -c 5 "$photo" > in/signature.png
printf 'hello, this is no picture' > in/text.png
: > in/empty.png
mkdir in/folder.png
{ head -c 5000 "$photo"; printf 'damage'; tail -c +5007 "$photo"; } > in/damaged.png
"$program" convert --quiet "$media/chelsea.png" in/frame.raw --to V210_422_10u

for name in truncated header damaged; do
    expect 3 "ends too early or is damaged" convert in/$name.png out/x.png
done
for name in signature text; do
    expect 3 "is not a PNG file" convert in/$name.png out/x.png
done
expect 3 "the file is empty" convert in/empty.png out/x.png
expect 3 "Is a directory" convert in/folder.png out/x.png
expect 3 "No such file" convert in/missing.png out/x.png
expect 3 "No such file" convert "$photo" out/missing/x.png
expect 3 "Is a directory" convert "$photo" out --to BGRA_4444_8u
expect 3 "ends too early" compare "$photo" in/truncated.png
expect 3 "ends too early" sheet out/x.png "$photo" in/truncated.png
expect 3 "is not a PNG" pairs out/x.svg --image in/text.png
expect 3 "ends too early" demo in/truncated.png out

head -c 1000 in/frame.raw > in/short.raw
cat in/frame.raw in/short.raw > in/long.raw
"$program" convert --quiet "$media/chelsea.png" in/packed.raw --to V210_422_10u --packed
: > in/empty.raw
v210=(--from V210_422_10u --size 451x300)
expect 3 "has 1000 bytes, but a frame of V210_422_10u at 451x300 with padded rows takes $frame" \
    convert in/short.raw out/x.png "${v210[@]}"
expect 3 "takes $frame" convert in/long.raw out/x.raw "${v210[@]}" --to UYVY_422_8u
expect 3 "with --packed it would fit" convert in/packed.raw out/x.png "${v210[@]}"
expect 3 "without --packed it would fit" convert in/frame.raw out/x.png "${v210[@]}" --packed
expect 3 "has 0 bytes" convert in/empty.raw out/x.png "${v210[@]}"
expect 3 "No such file" convert in/missing.raw out/x.png "${v210[@]}"
expect 3 "'standard input' holds no frame" convert - out/x.raw "${v210[@]}" --to UYVY_422_8u < /dev/null
checks=$((checks + 1))
said=$(cat in/long.raw | "$program" convert - out/x.raw "${v210[@]}" --to UYVY_422_8u 2>&1)
[ $? -eq 3 ] && [[ $said == *"ends within a frame, 1000 bytes into $frame"* ]] || fail "a pipe that ends early: $said"

expect 2 "name it with --to" convert "$photo" out/x.raw
expect 2 "name it with --from" convert in/frame.raw out/x.png --size 451x300
expect 2 "give it with --size" convert in/frame.raw out/x.png --from V210_422_10u
for size in 451 451x 451x0 -1x300 451x300x2 axb 99999999999x1; do
    expect 2 "is no size" convert in/frame.raw out/x.png --from V210_422_10u --size=$size
done
expect 2 "leave --size away" convert "$photo" out/x.png --size 600x400
expect 2 "there is no pixel format 'UYVY'; did you mean UYVY_422_8u" convert "$photo" out/x.raw --to UYVY
expect 2 "png-depth" convert "$photo" out/x.png --png-depth 12
expect 2 "must end in .svg" pairs out/x.jpg
cat in/frame.raw in/frame.raw > in/two.raw
expect 2 "number the output" convert in/two.raw out/x.png "${v210[@]}"
expect 1 "there is no memory for a frame" convert in/frame.raw out/x.png --from V210_422_10u --size 1000000x1000000
expect 1 "cannot convert BGRA_4444_8u to NTSCDV25" convert "$photo" out/x.dv --to NTSCDV25
expect 1 "differ in size" compare "$photo" "$media/chelsea.png"
"$program" convert --quiet "$photo" in/yuv.png --to VUYA_4444_8u
expect 1 "above the limit of 0" compare "$photo" in/yuv.png --limit 0
expect 1 "above the limit of nan" compare "$photo" in/yuv.png --limit nan
expect 2 "more than one place for a number" convert "$photo" out/x-%d-%d.png
expect 2 "more than 20 digits" convert "$photo" out/x-%999999999d.png
is "nothing left behind" "$(names out)" ""

# Full disks: of the output, of standard output, and of an old file that must stay.
expect 3 "No space left" convert "$photo" /dev/full --to BGRA_4444_8u
"$program" formats > /dev/full 2> said
is "listing to a full disk" $? 3
is "its sentence" "$(grep -c 'standard output: No space left' said)" 1
cp "$media/chelsea.png" out/old.png
for command in "convert $photo out/old.png" "sheet out/old.png $photo $photo"; do
    (
        ulimit -f 16
        # shellcheck disable=SC2086
        "$program" $command > /dev/null 2> "$scratch/said"
    )
    is "file size limit, $command" $? 3
    is "its sentence" "$(grep -c "cannot write 'out/old.png': File too large" said)" 1
done
same "the old file stays" out/old.png "$media/chelsea.png"
is "and nothing beside it" "$(names out)" "old.png "

# A reader that goes away ends the program as a broken pipe, without a word.
"$program" convert "$photo" - --to BGRA_4444_32f 2> said | head -c 1 > first
is "broken pipe" "${PIPESTATUS[0]}" 141
is "no words" "$(cat said)" ""

# A signal in the middle of the work removes the unfinished file.
mkfifo feed
"$program" convert - out/old.png2 "${v210[@]}" --to UYVY_422_8u < feed &
worker=$!
exec 3> feed
cat in/frame.raw in/frame.raw >&3
for _ in $(seq 100); do
    [ "$(names out)" != "old.png " ] && break
    sleep 0.05
done
is "an unfinished file" "$(ls -A out | grep -c '^.pixelkiln\.')" 1
kill -TERM $worker
wait $worker
is "ended by the signal" $? 143
exec 3>&-
is "the unfinished file is gone" "$(names out)" "old.png "

# Read-only outputs. The superuser may write anywhere, so then another user tries.
as_user=()
[ "$(id -u)" -ne 0 ] || as_user=(setpriv --reuid=65534 --regid=65534 --clear-groups)
if "${as_user[@]}" test -x "$program" && "${as_user[@]}" test -r "$photo"; then
    mkdir closed open
    chmod 555 closed
    chmod 777 open
    cp "$photo" open/old.png
    chmod 444 open/old.png
    for output in closed/x.png open/old.png; do
        said=$("${as_user[@]}" "$program" convert "$media/chelsea.png" $output 2>&1)
        is "exit code for the read-only $output" $? 3
        is "its sentence" "$said" \
            "pixelkiln: cannot write '$output': Permission denied; check the permissions of the file and of its folder"
    done
    is "closed folder" "$(names closed)" ""
    is "open folder" "$(names open)$(cmp open/old.png "$photo" && echo equal)" "old.png equal"
    chmod 755 closed
else
    echo "read-only outputs not tried: another user cannot reach the program"
fi

finish
