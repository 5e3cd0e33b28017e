#!/usr/bin/env bash
# exports.sh LIBRARY INCLUDE_DIR: the library's dynamic symbols are exactly the functions that the installed
# headers mark PK_API.
set -euo pipefail
library=$1
headers=$2

exported=$(nm -D --defined-only "$library" | awk '{print $3}' | sort)
declared=$(cat "$headers"/PixelKiln/*.h | sed 's|//.*||' | tr '\n' ' ' | grep -oP 'PK_API[^;(]*\b\KPK_\w+(?=\()' | sort)
[ -n "$declared" ] || { echo "no declaration found in $headers"; exit 1; }
if ! difference=$(diff <(echo "$declared") <(echo "$exported")); then
    echo "declared (<) and exported (>) names differ:"
    echo "$difference"
    exit 1
fi
echo "$(echo "$exported" | wc -l) names, as declared"
