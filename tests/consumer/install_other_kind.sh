#!/usr/bin/env bash
# install_other_kind.sh SOURCE BUILD PREFIX static|shared OPTION...: builds the libraries as static or as shared ones, and
# installs them.
set -euo pipefail
source=$1 build=$2 prefix=$3 kind=$4
shift 4
shared=OFF
[ "$kind" = static ] || shared=ON
cmake -S "$source" -B "$build" -G Ninja --log-level=WARNING "$@" -DBUILD_SHARED_LIBS="$shared" \
    -DPROJECT_MANAGEMENT_{TOOLS,PYTHON,TESTS,BENCHMARKS}=OFF
cmake --build "$build"
rm -rf "$prefix"
cmake --install "$build" --prefix "$prefix"
