#!/usr/bin/env bash
# exports.sh LIBRARY INCLUDE_DIR: the binary interface that the installed headers declare is the one in interface.txt,
# and the library's dynamic symbols are exactly its functions.
set -euo pipefail
library=$1
headers=$2
here=$(dirname "$0")
export LC_ALL=C

# same WHAT LEFT RIGHT
same() {
    if ! difference=$(diff <(echo "$2") <(echo "$3")); then
        echo "$1 differ:"
        echo "$difference"
        return 1
    fi
    echo "$(echo "$3" | wc -l) lines: $1 agree"
}

table=$("$here/interface.py" "$headers")
if ! same "interface.txt (<) and the headers (>)" "$(cat "$here/interface.txt")" "$table"; then
    echo "If programs that are compiled already can live with it:"
    echo "    tests/package/interface.py include > tests/package/interface.txt"
    exit 1
fi
# The functions are the first paragraph. C names leave the library without their parameters, and
# templates with the type that they return.
declared=$(sed -E '/^$/Q; s/ -> .*//; /^PK::|^[a-z ]* for |^void /!s/\(.*//' "$here/interface.txt" | sort -u)
exported=$(nm -DC --defined-only "$library" | sed 's/^[0-9a-f]* . //' | sort -u)
same "declared (<) and exported (>) names" "$declared" "$exported"
