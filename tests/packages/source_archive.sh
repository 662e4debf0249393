#!/usr/bin/env bash
# source_archive.sh SOURCE BUILD: the archive has the same bytes in other circumstances, and contains a tree that builds.
set -euo pipefail
source=$1 build=$2
rm -rf "$build"
mkdir -p "$build"
"$source/scripts/dist" "$build/one"
sleep 1.1 # the time of day must not be in it
cd /
umask 077
TZ=Pacific/Auckland LC_ALL=C GIT_CONFIG_COUNT=1 GIT_CONFIG_KEY_0=tar.umask GIT_CONFIG_VALUE_0=user \
    "$source/scripts/dist" "$build/two"
umask 022
archive=$(basename "$build"/one/*.tar.gz)
cmp "$build/one/$archive" "$build/two/$archive"

tar -xzf "$build/one/$archive" -C "$build"
cmake -S "$build/${archive%.tar.gz}" -B "$build/out" -G Ninja -DPROJECT_MANAGEMENT_TESTS=OFF \
    -DPROJECT_MANAGEMENT_BENCHMARKS=OFF > "$build/log" 2>&1 || { cat "$build/log" >&2; exit 1; }
