#!/usr/bin/env bash
# build_and_run.sh SOURCE BUILD COMPILER PREFIX static|shared PROGRAM...: builds a project that uses the library, runs
# programs of it, and checks that they use the libraries of the kind.
set -euo pipefail
source=$1 build=$2 compiler=$3 prefix=$4 kind=$5
shift 5
shared=OFF
[ "$kind" = static ] || shared=ON
rm -rf "$build"
cmake -S "$source" -B "$build" -G Ninja -DCMAKE_CXX_COMPILER="$compiler" -DCMAKE_PREFIX_PATH="$prefix" \
    -DCMAKE_CXX_COMPILER_LAUNCHER=ccache -DCMAKE_UNITY_BUILD=ON -DBUILD_SHARED_LIBS="$shared" >/dev/null
cmake --build "$build" --target "$@"
for program in "$@"; do "$build/$program"; done
"$(dirname "$0")/linked_kind.sh" "$build/$1" "$kind"
