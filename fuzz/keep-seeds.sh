#!/usr/bin/env bash
# Makes fuzz/seeds anew: of the seeds and of the inputs in FOLDER, few that reach all that they reach together.
#
#   fuzz/keep-seeds.sh PIXELKILN_FUZZ FOLDER      PIXELKILN_FUZZ is built with libFuzzer
set -euo pipefail
target=$(realpath "$1")
inputs=$(realpath "$2")
cd "$(dirname "${BASH_SOURCE[0]}")"

chosen=$(mktemp -d)
trap 'rm -rf "$chosen"' EXIT
"$target" -set_cover_merge=1 "$chosen" seeds "$inputs"

rm -rf seeds && mkdir seeds
for input in "$chosen"/*; do
    # An input begins with the letter of its family, and is named after it.
    letter=$(head -c 1 "$input" | tr -cd 'A-Za-z')
    family=$([ -z "$letter" ] || grep -rhoP "Family s\w+\('$letter', \"\K[^\"]+" --include='*_fuzz.cpp' .)
    cp "$input" "seeds/${family:-any}-$(basename "$input" | head -c 8)"
done
