#!/usr/bin/env bash
# guards.sh LIBRARY: no static object in a function is made at its first use. Its guard, caught by a fork while another
# thread makes the object, would keep the child waiting for ever.
set -euo pipefail
names=$(nm -C --defined-only "$1")
grep -q 'PK_Initialize' <<<"$names" || { echo "$1 has no table of symbols"; exit 1; }
if grep 'guard variable for' <<<"$names"; then
    echo "the objects above want to be a PK::FirstUse (Src/primitives/FirstUse.h), or made when the library is loaded"
    exit 1
fi
echo "no object is made behind a guard"
