#!/usr/bin/env bash
# A repository whose commits pre-commit checks with the hooks of this one, as the guide says: a commit with a file that
# the project does not list fails, and a clean one passes. Nothing is loaded from the network.
#   pre_commit.sh ROOT PROJECTCTL
set -euo pipefail
root=$1 projectctl=$2
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
export PRE_COMMIT_HOME="$work/cache" HOME="$work" GIT_CONFIG_NOSYSTEM=1 PATH="$(dirname "$projectctl"):$PATH"
git config --global user.name Tester
git config --global user.email tester@localhost
git config --global init.defaultBranch main

mkdir "$work/hooks" "$work/project"
cp "$root/.pre-commit-hooks.yaml" "$work/hooks"
cd "$work/hooks"
git init -q
git add .
git commit -qm "Hooks"
revision=$(git rev-parse HEAD)

cd "$work/project"
git init -q
projectctl init
sed -n '/^```yaml$/,/^```$/{/^repos:/,/^```$/p}' "$root/docs/guide/continuous-integration.md" | sed '$d' |
    sed "s|REPOSITORY|$work/hooks|; s|REVISION|$revision|" > .pre-commit-config.yaml
grep -q "rev: $revision" .pre-commit-config.yaml
echo listed > listed
projectctl add listed .pre-commit-config.yaml
git add .
pre-commit install
git commit -m "A clean commit" || { echo "a clean commit failed"; exit 1; }

echo unlisted > unlisted
git add unlisted
if git commit -m "A file that is not listed" > "$work/output" 2>&1; then
    echo "a commit with a file that is not in the project passed"
    exit 1
fi
grep -q "new  unlisted" "$work/output" || { cat "$work/output"; exit 1; }

projectctl add unlisted
git commit -m "The same file, listed" || { echo "a clean commit failed"; exit 1; }
[ "$(git rev-list --count HEAD)" = 2 ]
