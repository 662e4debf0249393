#!/usr/bin/env bash
# macro_names.sh SOURCE: checks that the public headers define no macro without our prefix, which could be another's.
set -euo pipefail
cd "$1"
mapfile -t headers < <(find include platform/include stores/include session/include adapters/*/include -name '*.hpp')
[ "${#headers[@]}" -gt 100 ] || { echo "only ${#headers[@]} headers found" >&2; exit 1; }
if grep -nE '^[[:space:]]*#[[:space:]]*define[[:space:]]' "${headers[@]}" | grep -vE 'define[[:space:]]+PROJECT_'; then
    echo "A macro of a public header begins with PROJECT_." >&2
    exit 1
fi
