#!/usr/bin/env bash
# Tests the page of a report in Debian's Chromium.
#   run.sh FOLDER            copies the tests to the folder, and installs the driver there, from the npm registry
#   run.sh FOLDER TEST...    runs tests of the folder; PROJECTCTL names the tool
set -euo pipefail
here=$(cd "$(dirname "$0")" && pwd)
folder=$1
shift
if [ "$#" -eq 0 ]; then
    mkdir -p "$folder"
    cp "$here"/*.json "$here"/*.mjs "$folder"
    cd "$folder"
    if ! cmp -s package-lock.json node_modules/.installed; then
        PUPPETEER_SKIP_DOWNLOAD=1 npm ci --no-audit --no-fund --loglevel=error
        cp package-lock.json node_modules/.installed
    fi
else
    cd "$folder"
    exec node --test "$@"
fi
