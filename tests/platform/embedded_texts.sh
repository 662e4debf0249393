#!/usr/bin/env bash
# embedded_texts.sh BUILD: in a build with Ninja, an object depends on each catalog of texts, which it contains. A changed
# text is therefore in the next program that is built.
set -euo pipefail
cd "$1"
[ -f build.ninja ] || { echo "skipped: the build does not use Ninja"; exit 77; }
count=0
for bundles in $(find . -path ./tests/consumer -prune -o -name bundles.txt -print); do
    package=$(basename "$(dirname "$bundles")")
    catalog=$(dirname "${bundles#./}")/$package.dat
    ninja -t query "$catalog" | sed '1,/outputs:/d' | grep -q '\.o$' || { echo "no object depends on $catalog"; exit 1; }
    count=$((count + 1))
done
[ "$count" -gt 0 ] || { echo "there are no catalogs"; exit 1; }
