#!/bin/bash
# Uses the installed tool's completions and manual pages, from the folders in which shells and man look for them.
#   installed_tool.sh PREFIX
set -eu
share=$1/share

for page in man1/projectctl.1 man1/projectctl-label.1 de/man1/projectctl.1 de/man1/projectctl-label.1; do
    zgrep -q '^\.Nm projectctl' "$share/man/$page.gz"
done
mandoc -T ascii "$share/man/man1/projectctl-label.1.gz" | grep -q "label put"

export PATH=$1/bin:$PATH
folder=$(mktemp -d)
trap 'rm -rf "$folder"' EXIT
cd "$folder"
projectctl init --no-source-control
projectctl category create 'My Category'

# bash loads the completion of a command on its first use, by the name of the file
source "$share/bash-completion/completions/projectctl"
complete -p projectctl | grep -q -- '-F _projectctl'
COMP_LINE='projectctl label put ' COMP_POINT=21
_projectctl projectctl '' put
[ "${COMPREPLY[*]}" = 'My\ Category' ]

[ "$(head -n 1 "$share/zsh/vendor-completions/_projectctl")" = '#compdef projectctl' ]

XDG_DATA_DIRS=$share fish --no-config -c 'source $argv[1]; complete --do-complete "projectctl label put "' \
    "$share/fish/vendor_completions.d/projectctl.fish" | grep -q '^My Category'
