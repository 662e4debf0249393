#!/usr/bin/env bash
# A golden document that has changed is found, also after it is committed, or deleted and written again. A new one is not.
#   check_golden_test.sh CHECK
set -euo pipefail
check=$1
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
export HOME="$work" GIT_CONFIG_NOSYSTEM=1
git config --global user.name Tester
git config --global user.email tester@localhost
fail() { echo "$1"; exit 1; }
passes() { "$check" "$work/root" > "$work/output"; }
document="$work/root/tests/tools/json/golden/projectctl-list-1.json"

# with: a repository with one golden document, changed by this command
with() {
    rm -rf "$work/root"
    mkdir -p "$(dirname "$document")"
    git -C "$work/root" init -q
    echo 1 > "$document"
    commit
    "$@"
}
commit() { git -C "$work/root" add --all && git -C "$work/root" commit -qm "Documents"; }
change() { echo 2 > "$document"; }
commit_change() { change && commit; }
write_again() { rm "$document" && commit && change && commit; }
add_version() { echo 2 > "${document/list-1/list-2}" && commit; }

with add_version
passes || fail "a document of a new version was not accepted: $(cat "$work/output")"
for what in change commit_change write_again; do
    with "$what"
    if passes; then fail "not found: $what"; fi
    grep -q "projectctl-list-1.json" "$work/output" || fail "$what: the document is not named: $(cat "$work/output")"
done
