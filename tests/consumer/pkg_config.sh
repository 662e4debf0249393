#!/usr/bin/env bash
# pkg_config.sh SOURCE PROGRAM COMPILER PREFIX static|shared: builds a program against the library that is installed under
# a prefix, with the flags of pkg-config, and runs it.
set -euo pipefail
source=$1 program=$2 compiler=$3 prefix=$4 kind=$5
PKG_CONFIG_PATH=$(dirname "$(find "$prefix" -name project-management.pc)")
export PKG_CONFIG_PATH
ask=(pkg-config)
[ "$kind" = shared ] || ask+=(--static)
read -ra flags < <("${ask[@]}" --cflags --libs project-management)
"$compiler" "$source" "${flags[@]}" "-Wl,-rpath,$(pkg-config --variable=libdir project-management)" -o "$program"
"$program"
"$(dirname "$0")/linked_kind.sh" "$program" "$kind"
