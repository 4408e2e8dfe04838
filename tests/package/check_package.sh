#!/usr/bin/env bash
# check_package.sh SOURCE BUILD COMPILER FLAGS
set -euo pipefail
source=$1 build=$2 compiler=$3 flags=$4
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT

cmake --install "$build" --prefix "$work/installed" >/dev/null
"$work/installed/bin/fileio" --version >/dev/null

# README's snippet: what stands between its ```cpp fences, directives apart from statements.
snippet=$(sed -n '/^```cpp$/,/^```$/{/^```/!p}' "$source/README.md")
{
    grep -E '^(#include|using )' <<<"$snippet"
    echo 'int main() {'
    grep -vE '^(#include|using )' <<<"$snippet"
    echo 'long bytes = 0; out.getPosition(bytes); return bytes == 8 ? 0 : 1; }'
} >"$work/main.cc"
cat >"$work/CMakeLists.txt" <<'CMAKE'
cmake_minimum_required(VERSION 3.25)
project(consumer LANGUAGES CXX)
find_package(fileio REQUIRED)
add_executable(consumer main.cc)
target_link_libraries(consumer PRIVATE fileio::fileio)
CMAKE
cmake -S "$work" -B "$work/build" -G Ninja -DCMAKE_PREFIX_PATH="$work/installed" \
    -DCMAKE_CXX_COMPILER="$compiler" -DCMAKE_CXX_FLAGS="$flags" >/dev/null
cmake --build "$work/build" >/dev/null
"$work/build/consumer"
