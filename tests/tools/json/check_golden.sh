#!/usr/bin/env bash
# Fails if a golden JSON document was ever changed or deleted. A change of a format needs a new version, and with it a new file.
#   check_golden.sh ROOT
set -euo pipefail
cd "$1"
folder=tests/tools/json/golden
if ! git rev-parse --git-dir >/dev/null 2>&1; then
    echo "not in a git repository: the history of $folder is unknown"
    exit 77
fi
since=(--no-renames --diff-filter=MDT --name-only)
changed=$(git log "${since[@]}" --format= -- "$folder"; git diff "${since[@]}" HEAD -- "$folder")
if [ -n "$changed" ]; then
    echo "these documents have changed; give their formats a new version in JsonFormat.hpp, and restore them:"
    echo "$changed" | sort -u
    exit 1
fi
echo "no golden document has changed"
