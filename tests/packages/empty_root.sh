#!/usr/bin/env bash
# empty_root.sh PACKAGES CONSUMER ROOT: installs the packages into an empty Debian, runs the tool as an ordinary user, and
# builds programs that use the library. Prints each command with its duration.
set -euo pipefail
packages=$1 consumer=$2 root=$3
skip() { echo "skipped: $*"; exit 77; }
[ "$(id -u)" = 0 ] || skip "an empty root needs the rights of root"
command -v debootstrap > /dev/null || skip "debootstrap is not installed"

TIMEFORMAT='    (%R s)'
quietly() { "$@" > "$root.log" 2>&1 || { tail -n 40 "$root.log" >&2; exit 1; }; }
in_root() { env -i PATH=/usr/sbin:/usr/bin:/sbin:/bin DEBIAN_FRONTEND=noninteractive chroot "$root" "$@"; }
as_root() { # as_root COMMAND...
    printf '# %s\n' "$*"
    time quietly in_root "$@"
}
as_user() { # as_user COMMAND-LINE: as a user without rights
    printf '$ %s\n' "$*"
    time in_root su - newcomer -c "$*"
}
fail() { echo "$*" >&2; exit 1; }

# Debian's own archives, as this machine reaches them.
codename=$(sed -n 's/^VERSION_CODENAME=//p' /etc/os-release)
mapfile -t archives < <(apt-get indextargets --format '$(ORIGIN) $(REPO_URI) $(RELEASE) $(COMPONENT)' \
    'Created-By: Packages' | awk '$1 == "Debian" {print "deb", $2, $3, $4}')
[ "${#archives[@]}" -gt 0 ] || fail "apt has no list of Debian's packages: run apt-get update"
mirror=$(awk -v codename="$codename" '$3 == codename {print $2; exit}' < <(printf '%s\n' "${archives[@]}"))

rm -rf "$root"
mkdir -p "$root"
echo "# debootstrap"
time quietly debootstrap --variant=minbase "$codename" "$root" "$mirror"
printf '%s\n' "${archives[@]}" > "$root/etc/apt/sources.list"
apt-config dump | { grep -E '^Acquire::(https?|Check|Retries)' || true; } > "$root/etc/apt/apt.conf.d/90machine"
echo force-unsafe-io > "$root/etc/dpkg/dpkg.cfg.d/fast" # the root is deleted at the end
cp /etc/resolv.conf /etc/hosts "$root/etc/"
printf '#!/bin/sh\nexit 101\n' > "$root/usr/sbin/policy-rc.d" # starts no service
chmod +x "$root/usr/sbin/policy-rc.d"
as_root useradd --create-home --shell /bin/bash newcomer

# From the packages to a running program.
cp "$packages"/*.deb "$root/tmp/"
begin=$EPOCHREALTIME
as_root apt-get update
as_root sh -c 'apt-get install --yes --no-install-recommends /tmp/projectctl_*.deb'
as_user projectctl --version
as_user 'mkdir -p sources/.git/objects sources/.git/refs && echo "ref: refs/heads/main" > sources/.git/HEAD'
as_user 'cd sources && touch main.cpp && projectctl init && projectctl add main.cpp && projectctl check'
awk -v begin="$begin" -v end="$EPOCHREALTIME" 'BEGIN {printf "=== from the packages to a project: %.1f s\n", end - begin}'
[ "$(as_user 'cd sources && projectctl list' | grep -c '^main.cpp$')" = 1 ] || fail "the project does not list its file"
# libgit2 was found: the file is staged
grep -q main.cpp "$root/home/newcomer/sources/.git/index" || fail "the file is not staged"
as_user 'source /usr/share/bash-completion/completions/projectctl && complete -p projectctl'
as_user 'zcat /usr/share/man/man1/projectctl.1.gz | grep -q "^.Nm projectctl"'

# The Python module alone, without the tool's libraries.
as_root sh -c 'apt-get install --yes --no-install-recommends /tmp/python3-project-management_*.deb'
as_user 'python3 -c "import project_management as pm; print(list(pm.open(\"sources\").files))"' | grep -q main.cpp ||
    fail "the Python module does not list the file"
[ -d "$root/usr/lib/python3/dist-packages/project_management/__pycache__" ] || fail "the Python module is not compiled"
as_user 'mkdir -p engine/src/io && touch engine/src/main.cpp engine/src/io/pump.cpp engine/src/io/pump.hpp'
cp "$(dirname "$0")/example.py" "$root/home/newcomer/"
[ "$(as_user 'python3 example.py' | tail -n 1)" = name_changed ] || fail "the example in Python does not run"

# The library, for programs.
as_root sh -c 'apt-get install --yes --no-install-recommends /tmp/*.deb g++ cmake make pkg-config'
cp -r "$consumer" "$root/home/newcomer/consumer"
as_user 'cmake -S consumer/find_package -B by_cmake > by_cmake.log && cmake --build by_cmake -j2 >> by_cmake.log' ||
    fail "$(cat "$root/home/newcomer/by_cmake.log")"
as_user 'by_cmake/consumer && by_cmake/application'
as_user 'g++ consumer/application.cpp $(pkg-config --cflags --libs project-management) -o by_pkg_config && ./by_pkg_config'
# The library for shared projects is found by its name: the error is that of the server's client library.
mkdir -p "$root/home/newcomer/shared/.projectdata"
echo '{"format":"project-store","version":1,"kind":"postgresql","service":"nowhere","project":"3f0d6f0e-8c2b-4f52-9d0e-5a3f9b7c1d2e"}' \
    > "$root/home/newcomer/shared/.projectdata/store.json"
answer=$(as_user 'cd shared && projectctl list 2>&1' || true)
echo "$answer"
grep -q 'definition of service "nowhere" not found' <<< "$answer" ||
    fail "the library for shared projects was not found"

# Removing the packages leaves nothing of theirs.
as_root sh -c 'apt-get purge --yes projectctl "libproject-*" python3-project-management'
left=$(find "$root/usr" -name '*project_management*' -o -name 'projectctl*' -o -name 'libproject_*')
[ -z "$left" ] || fail "left after removal: $left"
rm -rf "$root"
