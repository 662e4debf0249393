#!/usr/bin/env bash
# security_tests.sh SOURCE: each test suite that SECURITY.md names exists.
set -euo pipefail
cd "$1"
mapfile -t suites < <(sed -n '/^## What was tried/,/^## How to report/p' SECURITY.md | grep '^|' | grep -o '`[A-Z][A-Za-z]*`' | tr -d '`')
[ "${#suites[@]}" -gt 10 ] || { echo "SECURITY.md names only ${#suites[@]} suites" >&2; exit 1; }
for suite in "${suites[@]}"; do
    grep -rqE "TEST(_F|_P)?\($suite," tests fuzz || { echo "SECURITY.md names $suite, which is not a test suite" >&2; exit 1; }
done
