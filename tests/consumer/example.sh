#!/usr/bin/env bash
# example.sh EXAMPLE WORK COMPILER PREFIX: copies an example, as people do, and runs the commands of its page, which build it
# against the library that is installed under a prefix, and run its tests.
set -euo pipefail
example=$1 work=$2
export CXX=$3 CMAKE_PREFIX_PATH=$4 CMAKE_GENERATOR=Ninja CMAKE_CXX_COMPILER_LAUNCHER=ccache CTEST_OUTPUT_ON_FAILURE=1
rm -rf "$work"
cp -r "$example" "$work"
rm -rf "$work/build" # of somebody who has built it there
cd "$work"
commands=$(sed -n '/^```console$/,/^```$/s/^\$ //p' README.md)
[ -n "$commands" ] || { echo "the page has no commands" >&2; exit 1; }
bash -euo pipefail -c "$commands" | tee output
grep -q "100% tests passed" output # and there are tests
