#!/usr/bin/env bash
# build_and_run.sh SOURCE BUILD COMPILER PREFIX PROGRAM...: builds a project that uses the library, runs programs of
# it. The options are those of the preset 'dev', so that ccache knows what is compiled again.
set -euo pipefail
source=$1 build=$2 compiler=$3 prefix=$4
shift 4
rm -rf "$build"
cmake -S "$source" -B "$build" -G Ninja -DCMAKE_CXX_COMPILER="$compiler" -DCMAKE_PREFIX_PATH="$prefix" \
    -DCMAKE_CXX_COMPILER_LAUNCHER=ccache -DCMAKE_BUILD_TYPE=Debug -DCMAKE_CXX_FLAGS=-Og >/dev/null
cmake --build "$build" --target "$@"
for program in "$@"; do "$build/$program"; done
