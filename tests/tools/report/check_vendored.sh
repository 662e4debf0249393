#!/usr/bin/env bash
# Compares the vendored library with the checksum in the page of the decision.
#   check_vendored.sh ROOT
set -euo pipefail
page=$1/docs/decisions/0004-vendored-d3-hierarchy.md
file=$1/tools/projectctl/report/page/vendor/d3-hierarchy.min.js
sum=$(sed -n 's/.*SHA-256 \([0-9a-f]\{64\}\).*/\1/p' "$page")
echo "$sum  $file" | sha256sum --check --strict
