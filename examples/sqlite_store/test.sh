#!/usr/bin/env bash
# test.sh PROGRAM: what the first run adds to the project, the second run lists.
set -euo pipefail
program=$1
folder=$(realpath "$(mktemp -d)")
trap 'rm -rf "$folder"' EXIT
mkdir "$folder/src"
touch "$folder/src/main.cpp"
expected=$(printf '%s\n' "$folder/src" "$folder/src/main.cpp")

[ "$("$program" "$folder" "$folder/src/main.cpp")" = "$expected" ] || { echo "the file was not added" >&2; exit 1; }
[ "$("$program" "$folder")" = "$expected" ] || { echo "the file was not listed again" >&2; exit 1; }

if "$program" "$folder" "$folder/missing" 2> "$folder/error"; then
    echo "a missing file was added" >&2
    exit 1
fi
grep -q missing "$folder/error" || { echo "the error does not name the file" >&2; exit 1; }
[ "$("$program" "$folder")" = "$expected" ] || { echo "the failed call has changed the project" >&2; exit 1; }
