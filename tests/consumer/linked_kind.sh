#!/usr/bin/env bash
# linked_kind.sh PROGRAM static|shared: checks whether a program loads shared libraries of ours.
set -euo pipefail
program=$1 kind=$2
found=static
! readelf --dynamic "$program" | grep -q 'NEEDED.*libproject_' || found=shared
[ "$found" = "$kind" ] || { echo "$program uses $found libraries instead of $kind ones" >&2; exit 1; }
