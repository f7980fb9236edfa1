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

# A PostgreSQL server on loopback for the database tests, for this run only.
# Wine hands the environment to the Windows test programs.
pgdir=$(mktemp -d "${TMPDIR:-/tmp}/qo-pg.XXXXXX")
stop_pg() { "$here/pg-test-server" stop "$pgdir" >/dev/null 2>&1 || true; }
trap stop_pg EXIT
trap 'stop_pg; exit 1' INT TERM
QO_PG_CONNECT=$("$here/pg-test-server" start "$pgdir")
QO_PG_LOG="$pgdir/log/statements.log"
export QO_PG_CONNECT QO_PG_LOG

"$here/session" sh -c 'cd build/win && ctest --output-on-failure --timeout 300'
