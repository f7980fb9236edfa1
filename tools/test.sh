#!/bin/sh
# Builds both configurations once and runs every test suite once:
# the native base library with sanitizers, then the Windows build under Wine
# (one Xvfb and one Wine prefix for the whole run).
set -e
here=$(cd "$(dirname "$0")" && pwd)
repo=$(dirname "$here")
cd "$repo"
jobs=$(nproc)

cmake -S . -B build/native -DCMAKE_BUILD_TYPE=RelWithDebInfo -DCMAKE_CXX_COMPILER=clang++ -DCMAKE_C_COMPILER=clang >/dev/null
cmake --build build/native -j "$jobs"
(cd build/native && ctest --output-on-failure -j "$jobs")

cmake -S . -B build/win -DCMAKE_TOOLCHAIN_FILE=cmake/mingw-w64-x86_64.cmake >/dev/null
cmake --build build/win -j "$jobs"
"$here/session" sh -c 'cd build/win && ctest --output-on-failure --timeout 300'
