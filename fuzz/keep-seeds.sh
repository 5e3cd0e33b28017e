#!/usr/bin/env bash
# Makes fuzz/seeds anew: of the seeds and of the inputs in FOLDER, few that reach all branches that they reach together.
#
#   fuzz/keep-seeds.sh PIXELKILN_FUZZ FOLDER      PIXELKILN_FUZZ is built with libFuzzer
set -euo pipefail
target=$(realpath "$1")
inputs=$(realpath "$2")
cd "$(dirname "${BASH_SOURCE[0]}")"

declare -A families
while read -r letter name; do
    families[$letter]=$name
done < <(grep -rhoP "const Family s\w+\('\K\w', \"[^\"]+" --include='*_fuzz.cpp' . | sed "s/', \"/ /")
mapfile -t letters < <(printf '%s\n' "${!families[@]}" | LC_ALL=C sort)

chosen=$(mktemp -d)
trap 'rm -rf "$chosen"' EXIT
"$target" -set_cover_merge=1 -use_counters=0 "$chosen" seeds "$inputs"

rm -rf seeds && mkdir seeds
for input in "$chosen"/*; do
    # The first byte chooses the family: its letter, or any other byte as Family::OfFirstByte says. Here it is the letter.
    byte=$(od -An -N1 -tu1 "$input")
    letter=$(printf "\\x$(printf %x "${byte:-0}")" | tr -cd 'A-Za-z')
    [ -n "${letter:+${families[$letter]:-}}" ] || letter=${letters[${byte:-0} % ${#letters[@]}]}
    { printf %s "$letter" && tail -c +2 "$input"; } >"seeds/${families[$letter]}-$(basename "$input" | head -c 8)"
done
