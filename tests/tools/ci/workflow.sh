#!/usr/bin/env bash
# Runs the steps of the guide's workflow, as they are printed there, in clones of a project.
#   workflow.sh GUIDE PROJECTCTL
set -euo pipefail
guide=$1 projectctl=$2
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
export HOME="$work" GIT_CONFIG_NOSYSTEM=1 PATH="$(dirname "$projectctl"):$PATH"
git config --global user.name Tester
git config --global user.email tester@localhost
git config --global init.defaultBranch main
fail() { echo "$1"; exit 1; }

# The commands of the workflow, one per line. The package pre-commit installs this reader of YAML.
/usr/bin/python3 - "$guide" > "$work/steps" <<'END'
import re, sys, yaml
block = re.search(r"```yaml\n(name:.*?)```", open(sys.argv[1], encoding="utf-8").read(), re.S)[1]
for job in yaml.safe_load(block)["jobs"].values():
    for step in job["steps"]:
        if "run" in step:
            print(step["run"])
END
[ "$(wc -l < "$work/steps")" = 2 ] || fail "the workflow does not have two steps: $(cat "$work/steps")"

# step NUMBER: runs a step of the workflow in the clone, and writes its exit code.
step() {
    local code=0
    (cd "$work/clone" && bash -e -c "$(sed -n "$1p" "$work/steps")") > "$work/output" 2>&1 || code=$?
    echo "$code"
}
# runs CHECK STATUS SITUATION: clones the project, and compares the exit codes of the steps.
runs() {
    rm -rf "$work/clone"
    git clone -q "$work/project" "$work/clone"
    [ "$(step 2)" = "$2" ] || fail "$3: the second step: $(cat "$work/output")"
    [ "$(step 1)" = "$1" ] || fail "$3: the first step: $(cat "$work/output")"
}
commit() { git add --all && git commit -qm "$1"; }

mkdir -p "$work/project/src"
cd "$work/project"
git init -q
projectctl init
echo '*.o' > .gitignore
echo 1 > src/pump.c
projectctl add src/pump.c .gitignore
commit "A clean project"
runs 0 0 "a clean project"
[ ! -s "$work/output" ] || fail "a clean project has annotations: $(cat "$work/output")"

echo 1 > unlisted.c
commit "A file that is not listed"
runs 0 3 "a file that is not listed"
projectctl add unlisted.c
projectctl category create Status
projectctl label create Status Open
projectctl label put Status Open src/pump.c
commit "Listed"
runs 0 0 "a listed file"

git rm -q --cached src/pump.c
rm src/pump.c
commit "A file that is gone"
runs 0 3 "a file that is gone"
git revert --no-edit HEAD > /dev/null

sed -i '/"Label"/s/"UUID":"[0-9a-f-]*"/"UUID":"another"/' .projectdata/project.jsonl
commit "A category that does not exist"
runs 3 3 "a damaged definition"
head -1 "$work/output" | grep -Eq '^::error file=\.projectdata/project\.jsonl,line=[0-9]+,title=category-missing::' ||
    fail "the fault is not the first annotation: $(cat "$work/output")"
