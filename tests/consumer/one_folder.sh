#!/usr/bin/env bash
# one_folder.sh INCLUDE_FOLDER: checks that an installation adds one folder to the system's headers, with the headers in it.
set -euo pipefail
found=$(ls "$1")
[ "$found" = project_management ] || { echo "installed in $1: $found" >&2; exit 1; }
for header in project/session.hpp project/management.hpp fl/i18n/Utf8.hpp cmlink/CMAdapter.hpp; do
    [ -f "$1/project_management/$header" ] || { echo "not installed: $header" >&2; exit 1; }
done
