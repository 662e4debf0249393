#!/usr/bin/env bash
# example.sh EXAMPLE BUILD COMPILER PREFIX: builds an example as a project of its own, against the library that is
# installed under a prefix, and runs its tests.
set -euo pipefail
example=$1 build=$2 compiler=$3 prefix=$4
rm -rf "$build"
cmake -S "$example" -B "$build" -G Ninja -DCMAKE_CXX_COMPILER="$compiler" -DCMAKE_PREFIX_PATH="$prefix" \
    -DCMAKE_CXX_COMPILER_LAUNCHER=ccache -DCMAKE_UNITY_BUILD=ON > /dev/null
cmake --build "$build"
ctest --test-dir "$build" --output-on-failure --no-tests=error
