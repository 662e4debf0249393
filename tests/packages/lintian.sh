#!/usr/bin/env bash
# lintian.sh FOLDER: Debian's policy, checked on the packages in a folder. Warnings are shown, errors fail.
set -euo pipefail
command -v lintian > /dev/null || { echo "skipped: lintian is not installed"; exit 77; }
lintian --fail-on error --allow-root "$1"/*.deb
