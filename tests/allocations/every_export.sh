#!/usr/bin/env bash
# every_export.sh PROGRAM LIBRARY: the program calls exactly the functions that the library exports, overloads as one.
set -euo pipefail
export LC_ALL=C

called=$("$1" --names | sort -u)
exported=$(nm -DC --defined-only "$2" | sed 's/^[0-9a-f]* . //; s/^void //; s/(.*//' | grep -vE '^(vtable|typeinfo|typeinfo name) for ' | sort -u)
[ "$(wc -l <<<"$exported")" -gt 100 ] || { echo "few exported functions: $exported"; exit 1; }
if ! difference=$(diff <(echo "$called") <(echo "$exported")); then
    echo "with calls in tests/allocations (<) and exported (>):"
    echo "$difference"
    exit 1
fi
