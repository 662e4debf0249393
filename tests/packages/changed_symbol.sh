#!/usr/bin/env bash
# changed_symbol.sh SOURCE COMPILER BUILD: the comparison of symbols reports a function that was removed, and one that was
# added, and accepts the same library again.
set -euo pipefail
source=$1 compiler=$2 build=$3
rm -rf "$build"
mkdir -p "$build/lists"
export PROJECT_SYMBOL_LISTS=$build/lists
library() { # library FUNCTION...: a library that exports these functions
    printf 'namespace project { void %s() {} }\n' "$@" |
        "$compiler" -shared -fPIC -x c++ - -o "$build/libproject_sample.so.0.1.0" -Wl,-soname,libproject_sample.so.0.1
}
library open close
"$source/scripts/symbols" --update "$build"
"$source/scripts/symbols" --compare "$build"
for functions in "open" "open close read"; do
    # shellcheck disable=SC2086 # several names
    library $functions
    if "$source/scripts/symbols" --compare "$build" > "$build/log" 2>&1; then
        echo "a library with the functions '$functions' instead of 'open close' was accepted" >&2
        exit 1
    fi
    grep -q "run scripts/symbols --update" "$build/log" || { cat "$build/log" >&2; exit 1; }
done
