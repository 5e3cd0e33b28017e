# What the program says of itself: every command under its heading, with a page of its own.
. "$(dirname "$0")/expect.sh"

help=$("$program" --help)
listed=$(echo "$help" | sed -n '/^Listings:/,/^Exit codes:/p')
is "headings" "$(echo "$listed" | sed -n 's/^\([A-Z].*\):$/\1/p' | paste -sd ,)" \
    "Listings,Frames,Operations on frames,Pictures,Exit codes"
is "by name under each" "$(echo "$listed" | awk '/^[A-Z]/ { last = "" } /^  [a-z]/ { if ($1 <= last) print $1; last = $1 }')" ""
commands=$(echo "$listed" | awk '/^  [a-z]/ { print $1 }')
is "some under each" "$(echo "$commands" | grep -cxE 'formats|convert|rotate|sheet')" 4
for command in $commands; do
    expect 0 "pixelkiln $command [OPTIONS]" "$command" --help
    is "$command is described" "$("$program" "$command" --help | head -1)" \
        "$(echo "$listed" | awk -v name="$command" '$1 == name { sub(/^  [a-z0-9]+ +/, ""); print }')"
    expect 2 "Run with --help" "$command" --nosuch
done

# Commands of a family are listed on its page.
family=$("$program" dv --help | sed -n '/^Commands:/,/^$/p' | awk '/^  [a-z]/ { print $1 }')
is "the family of DV" "$(echo $family)" "decode draw encode info merge"
for command in $family; do
    expect 0 "pixelkiln dv $command [OPTIONS]" dv "$command" --help
    is "dv $command is described" "$("$program" dv "$command" --help | head -1)" \
        "$("$program" dv --help | awk -v name="$command" '$1 == name { sub(/^  [a-z]+ +/, ""); print }')"
    expect 2 "Run with --help" dv "$command" --nosuch
done
expect 2 "A subcommand is required" dv nosuch
expect 2 "info" info dv

expect 0 "Exit codes" --help
expect 0 "pixelkiln 0." --version
expect 0 "Examples:" convert --help
expect 0 "[0 - 255]" warp --help
expect 0 "{90,180,270,-90,-180,-270}" rotate --help
is "defaults are shown" "$("$program" stamp --help | grep -o '=0.02,0.02')" "=0.02,0.02"
expect 2 "Listings:"
expect 2 "nosuch" nosuch

finish
