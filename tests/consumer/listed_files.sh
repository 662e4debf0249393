#!/usr/bin/env bash
# A build that compiles the files that a project lists: every change of the definition gives exactly the right set, and a
# further build does nothing.
#   listed_files.sh PREFIX PROJECTCTL BUILD
set -euo pipefail
prefix=$1 projectctl=$2 build=$3
rm -rf "$build"
mkdir -p "$build/project/src"
cd "$build/project"
fail() { echo "$1" >&2; exit 1; }

cat > CMakeLists.txt <<'END'
cmake_minimum_required(VERSION 3.22)
project(listed LANGUAGES CXX)
find_package(project_management REQUIRED)
project_management_files(files LABEL Build PATHS src)
set(results)
file(WRITE "${CMAKE_CURRENT_BINARY_DIR}/names" "")
foreach(file IN LISTS files)
  file(APPEND "${CMAKE_CURRENT_BINARY_DIR}/names" "${file}\n")
  if(file MATCHES ";") # add_custom_command splits it
    continue()
  endif()
  file(RELATIVE_PATH name "${CMAKE_CURRENT_SOURCE_DIR}/src" "${file}")
  string(MAKE_C_IDENTIFIER "${name}" target)
  add_custom_command(OUTPUT "${target}.out" DEPENDS "${file}" VERBATIM
    COMMAND "${CMAKE_COMMAND}" -E copy "${file}" "${target}.out"
    COMMAND "${CMAKE_COMMAND}" -E echo "compiled ${target}")
  list(APPEND results "${target}.out")
endforeach()
add_custom_target(everything ALL DEPENDS ${results})
END
configure() { cmake -S . -B "$build/out" -G Ninja -DCMAKE_PREFIX_PATH="$prefix" "$@"; }

"$projectctl" init --no-source-control
"$projectctl" category create Build
"$projectctl" label create Build Yes
for name in one 'two words' 'semi;colon' other; do echo "$name" > "src/$name.cpp"; done
"$projectctl" add --recursive src
"$projectctl" label put Build Yes src/one.cpp 'src/two words.cpp'

# compiled: builds, and writes the names of the files that were compiled, sorted.
compiled() { cmake --build "$build/out" | sed -n 's/.*compiled \(.*\)/\1/p' | LC_ALL=C sort | paste -sd' '; }
expect() { local found; found=$(compiled); [ "$found" = "$1" ] || fail "$2: compiled '$found' instead of '$1'"; }
expect_nothing() {
    local said
    said=$(cmake --build "$build/out")
    grep -q "no work to do" <<< "$said" || fail "a further build did something: $said"
}

configure > "$build/log" || fail "$(cat "$build/log")"
expect "one_cpp two_words_cpp" "the first build"
expect_nothing

echo three > src/three.cpp
expect_nothing                        # a new file that is not in the project
"$projectctl" add src/three.cpp
expect "" "a file that has no label"
"$projectctl" label put Build Yes src/three.cpp
expect "three_cpp" "a file with the label"
expect_nothing
"$projectctl" label put Build Yes 'src/semi;colon.cpp'
expect "" "a name with a semicolon"
grep -qxF "$PWD/src/semi;colon.cpp" "$build/out/names" || fail "a name with a semicolon is not one item of the list"
expect_nothing
"$projectctl" remove src/one.cpp
touch src/one.cpp
expect "" "a file that was removed"
expect_nothing
touch 'src/two words.cpp'
expect "two_words_cpp" "a file that has changed"
expect_nothing

# Without the tool there is one error, which says what to do.
cat > "$build/missing.cmake" <<END
include("$prefix/lib/cmake/project_management/ProjectManagementFiles.cmake" OPTIONAL RESULT_VARIABLE found)
if(NOT found)
  file(GLOB module "$prefix/lib*/*/cmake/project_management/ProjectManagementFiles.cmake")
  include("\${module}")
endif()
set(project_management_PROGRAMS /nowhere)
project_management_files(files)
END
if PATH=/usr/bin:/bin cmake -P "$build/missing.cmake" > "$build/log" 2>&1; then
    fail "a missing tool was not noticed"
fi
[ "$(grep -c "CMake Error" "$build/log")" = 1 ] || fail "$(cat "$build/log")"
grep -q "needs projectctl, which was not found" "$build/log" || fail "$(cat "$build/log")"
