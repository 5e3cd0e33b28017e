#!/usr/bin/env bash
# first_uses.sh PROGRAM TIMES [NAME...]: each first use that the program lists, or those that are named, in so many fresh
# processes.
set -euo pipefail
program=$1
times=$2
shift 2
names=("$@")
[ ${#names[@]} -gt 0 ] || mapfile -t names < <("$program")
[ ${#names[@]} -gt 0 ] || { echo "$program lists nothing"; exit 1; }

for name in "${names[@]}"; do
    for ((i = 1; i <= times; i++)); do
        "$program" "$name" || { echo "$name went wrong in process $i of $times"; exit 1; }
    done
done
echo "${#names[@]} first uses, $times times each"
