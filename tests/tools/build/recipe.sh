#!/usr/bin/env bash
# Builds a project with a recipe of the guide, exactly as it is printed there: after each change of the definition, the
# build compiles and links exactly the right files, and a further one does nothing.
#   recipe.sh GUIDE cmake|meson|make PROJECTCTL WORK [PREFIX]      PREFIX is that of the installed package, for CMake
set -euo pipefail
guide=$1 kind=$2 projectctl=$3 work=$4 prefix=${5:-}
fail() { echo "$kind: $1" >&2; cat "$work/log" >&2; exit 1; }

rm -rf "$work"
mkdir -p "$work/bin" "$work/project/src"
export COMPILED="$work/compiled" PATH="$work/bin:$(dirname "$projectctl"):$PATH" CXX="$work/bin/compiler"
# A compiler that notes the sources that it compiles.
cat > "$CXX" <<'END'
#!/bin/sh
case " $* " in
*" -c "*) for argument; do case $argument in *src/*.cpp) basename "$argument" .cpp >> "$COMPILED" ;; esac; done ;;
esac
exec c++ "$@"
END
chmod +x "$CXX"

cd "$work/project"
recipe() { sed -n "/^\`\`\`$kind\$/,/^\`\`\`\$/p" "$guide" | sed '1d;$d'; }
case $kind in
cmake)
    recipe > CMakeLists.txt
    configure() { cmake -S . -B build -G Ninja -DCMAKE_PREFIX_PATH="$prefix"; }
    build() { cmake --build build; }
    ;;
meson)
    recipe > meson.build
    configure() { meson setup build; }
    build() { ninja -C build; }
    ;;
make)
    recipe > Makefile
    configure() { :; }
    build() { make; }
    ;;
esac

source_file() { echo "#include <cstdio>
static int const said = std::puts(\"$1\");$2" > "src/$1.cpp"; }
source_file main 'int main() {}'
for name in one 'two words' three; do source_file "$name" ''; done
projectctl init --no-source-control
projectctl category create Build
projectctl label create Build Yes
projectctl label create Build No
projectctl add src/main.cpp src/one.cpp 'src/two words.cpp'
projectctl label put Build Yes src/main.cpp 'src/two words.cpp'
projectctl label put Build No src/one.cpp
configure > "$work/log" 2>&1 || fail "the configuration failed"

sorted() { LC_ALL=C sort | paste -sd,; }
# built COMPILED LINKED STEP: a build compiles these files, and the program consists of those; a further build does nothing.
built() {
    : > "$COMPILED"
    build > "$work/log" 2>&1 || fail "$3: the build failed"
    local compiled linked
    compiled=$(sorted < "$COMPILED")
    linked=$(build/app | sorted)
    [ "$compiled" = "$1" ] || fail "$3: compiled '$compiled' instead of '$1'"
    [ "$linked" = "$2" ] || fail "$3: linked '$linked' instead of '$2'"
    : > "$COMPILED"
    touch "$work/before"
    build > "$work/log" 2>&1 || fail "$3: a further build failed"
    [ ! -s "$COMPILED" ] && [ -z "$(find build -name app -newer "$work/before")" ] || fail "$3: a further build worked"
    grep -Eq "no work to do|Nothing to be done" "$work/log" || fail "$3: a further build did something"
}

built "main,two words" "main,two words" "the first build"
built "" "main,two words" "a new file that is not in the project"
projectctl add src/three.cpp
built "" "main,two words" "a file without a label"
projectctl label put Build Yes src/three.cpp
built "three" "main,three,two words" "a file with the label"
echo "// changed" >> "src/two words.cpp"
built "two words" "main,three,two words" "a changed file"
projectctl remove src/three.cpp
built "" "main,two words" "a removed file"
projectctl label take Build Yes 'src/two words.cpp'
built "" "main" "a file that has lost its label"
projectctl description "A change of the definition that changes no file"
built "" "main" "another change of the definition"
