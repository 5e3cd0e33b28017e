#!/usr/bin/env bash
# exports.sh LIBRARY INCLUDE_DIR: the library's dynamic symbols are exactly the functions that the installed
# headers mark PK_API, and the names of namespace PK in cxx_exports.txt.
set -euo pipefail
library=$1
headers=$2
export LC_ALL=C

# same WHAT DECLARED EXPORTED
same() {
    [ -n "$2" ] || { echo "no $1 is declared"; exit 1; }
    if ! difference=$(diff <(echo "$2") <(echo "$3")); then
        echo "declared (<) and exported (>) $1 differ:"
        echo "$difference"
        exit 1
    fi
    echo "$(echo "$3" | wc -l) $1, as declared"
}

exported=$(nm -DC --defined-only "$library" | sed 's/^[0-9a-f]* . //' | sort -u)
declared=$(cat "$headers"/PixelKiln/*.h | sed 's|//.*||' | tr '\n' ' ' | grep -oP 'PK_API[^;({]*\b\KPK_\w+(?=\()' | sort)
same functions "$declared" "$(grep -v 'PK::' <<<"$exported")"
same "names of namespace PK" "$(cat "$(dirname "$0")/cxx_exports.txt")" "$(grep 'PK::' <<<"$exported")"
