#!/usr/bin/env bash
# pkg_config.sh SOURCE PROGRAM COMPILER PREFIX: builds a program against the library that is installed under a
# prefix, with what pkg-config says, and runs it.
set -euo pipefail
source=$1 program=$2 compiler=$3 prefix=$4
PKG_CONFIG_PATH=$(dirname "$(find "$prefix" -name project-management.pc)")
export PKG_CONFIG_PATH
read -ra flags < <(pkg-config --cflags --libs project-management)
"$compiler" "$source" "${flags[@]}" "-Wl,-rpath,$(pkg-config --variable=libdir project-management)" -o "$program"
"$program"
