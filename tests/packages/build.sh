#!/usr/bin/env bash
# build.sh CPACK BUILD: builds the packages, and checks that each installed file has its place in the right one.
set -euo pipefail
cpack=$1 build=$2
cd "$build"
rm -rf packages
"$cpack" --config CPackConfig.cmake

# expect PACKAGE PATTERN: a file of the package matches the pattern.
expect() {
    local files
    files=$(dpkg-deb --contents packages/"$1"_*.deb | awk '{print $6}')
    grep -qE "^\./usr/$2\$" <<< "$files" || { echo "$1 has no file usr/$2" >&2; exit 1; }
}
soversion=$(sed -n 's/^set(CPACK_PACKAGE_VERSION "\([0-9]*\.[0-9]*\).*/\1/p' CPackConfig.cmake)
for library in platform metadata management stores git session; do
    expect "libproject-management$soversion" "lib/[^/]*/libproject_$library\.so\.$soversion"
    expect libproject-management-dev "lib/[^/]*/libproject_$library\.so"
done
expect "libproject-postgresql$soversion" "lib/[^/]*/libproject_postgresql\.so\.$soversion"
expect libproject-management-dev 'include/project_management/project/session\.hpp'
expect libproject-management-dev 'lib/[^/]*/cmake/project_management/ProjectManagementFiles\.cmake'
expect libproject-management-dev 'lib/[^/]*/pkgconfig/project-management\.pc'
expect projectctl 'bin/projectctl'
expect projectctl 'share/man/man1/projectctl\.1\.gz'
expect projectctl 'share/man/de/man1/projectctl\.1\.gz'
expect projectctl 'share/bash-completion/completions/projectctl'
expect projectctl 'share/zsh/vendor-completions/_projectctl'
expect projectctl 'share/fish/vendor_completions\.d/projectctl\.fish'
expect python3-project-management 'lib/python3/dist-packages/project_management/__init__\.py'
expect python3-project-management 'lib/python3/dist-packages/project_management/_core\.cpython-311-[a-z0-9_-]*\.so'
expect python3-project-management 'lib/python3/dist-packages/project_management/py\.typed'
depends=$(dpkg-deb --field packages/python3-project-management_*.deb Depends)
[[ $depends =~ "python3 (>= 3.11~), python3 (<< 3.12)" ]] ||
    { echo "python3-project-management does not depend on the Python that it is built for: $depends" >&2; exit 1; }
expect projectctl 'share/project-management/json/[a-z0-9-]*\.schema\.json'
