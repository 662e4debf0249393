#!/usr/bin/env bash
# browser.sh FOLDER SITE: checks the site in the browser whose driver is installed in a folder.
set -euo pipefail
cp "$(dirname "$0")/site.test.mjs" "$1"
cd "$1"
SITE=$2 exec node --test site.test.mjs
