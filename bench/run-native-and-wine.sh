#!/bin/sh
# The portable benchmarks (bench_textvar, bench_dbase, bench_write, bench_xlsx)
# built natively and for Windows with the same compiler (GCC 12: g++ natively,
# the mingw-w64 g++ for Windows), the same build type and so the same
# optimisation flags, without sanitizers; then each run natively and under
# Wine on the same files, one after the other, and every figure line of the
# native run printed above the matching line of the Wine run.
#
#   bench/run-native-and-wine.sh [ROWS] [BENCHMARK ...]
#
# ROWS: rows (records) of every benchmark; without it each takes its own
# default (1,000,000; bench_xlsx 100,000). BENCHMARK: one or more of the four
# (default all). Settings from the environment:
#   QO_BENCH_BUILD_TYPE   Release (default: -O3 -DNDEBUG) or RelWithDebInfo (-O2 -g -DNDEBUG, what
#                         tools/test.sh builds), the same for both builds
#   QO_BENCH_NATIVE_DIR   native build folder (default build/bench-native)
#   QO_BENCH_WIN_DIR      Windows build folder (default build/bench-win)
#   QO_BENCH_NATIVE_CXX   native C++ compiler (default g++; clang++ with QO_BENCH_NATIVE_CC=clang)
#   WINEPREFIX            the Wine prefix (as for tools/session)
set -e
here=$(cd "$(dirname "$0")" && pwd)
repo=$(cd "$here/.." && pwd)

rows=
case "${1:-}" in
  '' | bench_*) ;;
  *[!0-9]* | 0*)
    echo "'$1' is neither a row count (a whole number from 1 on) nor a benchmark (bench_...)" >&2
    exit 2 ;;
  *) rows=$1; shift ;;
esac
benches=${*:-bench_textvar bench_dbase bench_write bench_xlsx}
for b in $benches; do
  case "$b" in
    bench_textvar | bench_dbase | bench_write | bench_xlsx) ;;
    *) echo "unknown benchmark '$b' (bench_textvar, bench_dbase, bench_write, bench_xlsx)" >&2; exit 2 ;;
  esac
done

type=${QO_BENCH_BUILD_TYPE:-Release}
native=${QO_BENCH_NATIVE_DIR:-$repo/build/bench-native}
win=${QO_BENCH_WIN_DIR:-$repo/build/bench-win}
cxx=${QO_BENCH_NATIVE_CXX:-g++}
cc=${QO_BENCH_NATIVE_CC:-gcc}
jobs=$(nproc)

work=$(mktemp -d "${TMPDIR:-/tmp}/qo-bench-nw.XXXXXX")
trap 'rm -rf "$work"' EXIT
quiet() { "$@" >"$work/build.log" 2>&1 || { cat "$work/build.log" >&2; exit 1; }; }

cd "$repo"
quiet cmake -S . -B "$native" -DCMAKE_BUILD_TYPE="$type" -DQO_SANITIZE=OFF \
  -DCMAKE_CXX_COMPILER="$cxx" -DCMAKE_C_COMPILER="$cc"
quiet cmake -S . -B "$win" -DCMAKE_TOOLCHAIN_FILE=cmake/mingw-w64-x86_64.cmake -DCMAKE_BUILD_TYPE="$type"
# shellcheck disable=SC2086
quiet cmake --build "$native" -j "$jobs" --target $benches
# shellcheck disable=SC2086
quiet cmake --build "$win" -j "$jobs" --target $benches

# What each build compiles the library and the benchmarks with.
flags() { # build folder
  compiler=$(sed -n 's/^set(CMAKE_CXX_COMPILER "\(.*\)")$/\1/p' "$1"/CMakeFiles/*/CMakeCXXCompiler.cmake | head -n 1)
  version=$(sed -n 's/^set(CMAKE_CXX_COMPILER_VERSION "\(.*\)")$/\1/p' "$1"/CMakeFiles/*/CMakeCXXCompiler.cmake | head -n 1)
  echo "$(basename "$compiler") $version: $(sed -n 's/^CXX_FLAGS = //p' "$1/qotools/CMakeFiles/qotools.dir/flags.make")"
}
echo "build type $type"
echo "  native: $(flags "$native")"
echo "  wine:   $(flags "$win")"

# Every benchmark gets the same files on both sides: a folder natively is
# Z:<folder> under Wine. The native run makes the input files that both read.
arguments() { # benchmark folder-as-the-program-sees-it
  case "$1" in
    bench_textvar) echo "${rows:-1000000} $2/textvar.csv" ;;
    bench_dbase | bench_write) echo "${rows:-1000000} $2" ;;
    bench_xlsx) echo "$2/workbook.xlsx ${rows:-100000}" ;;
  esac
}

for b in $benches; do
  # shellcheck disable=SC2046
  "$native/bench/$b" $(arguments "$b" "$work") >"$work/$b.native" 2>&1 ||
    echo "(native $b failed: $?)" >>"$work/$b.native"
  arguments "$b" "Z:$work" >"$work/$b.args"
done
# One Wine session for every Windows run; they come after the native runs, so
# the two never share the processors. Wine's own messages on stderr are shown
# only when a run fails.
# shellcheck disable=SC2016,SC2086
"$repo/tools/session" sh -c '
  winrun=$1 work=$2 win=$3
  shift 3
  for b in "$@"; do
    "$winrun" "$win/bin/$b.exe" $(cat "$work/$b.args") >"$work/$b.wine" 2>"$work/$b.wine-err" ||
      { echo "(wine $b failed: $?)"; cat "$work/$b.wine-err"; } >>"$work/$b.wine"
  done' sh "$repo/tools/winrun" "$work" "$win" $benches

# The lines are paired by their text without the numbers and without paths
# (and, for "label: ...", by the label alone); a line the other side does not
# print stands alone.
for b in $benches; do
  echo
  echo "=== $b ${rows:+($rows rows)}"
  tr -d '\r' <"$work/$b.wine" >"$work/$b.wine.txt"
  awk '
    function key(line,   k) {
      k = line
      gsub(/[^ ]*[\/\\][^ :]*/, "", k)
      if (match(k, /^[^:]*[^:0-9 ][^:]*: /)) k = substr(k, 1, RLENGTH)
      gsub(/[-+]?[0-9][0-9.,]*/, "", k)
      gsub(/[ \t]+/, " ", k)
      return k
    }
    FNR == NR { wine[++n] = $0; wkey[n] = key($0); next }
    {
      k = key($0); found = 0
      for (j = next_w; j <= n; ++j) if (!used[j] && wkey[j] == k) { found = j; break }
      if (found) {
        for (j = next_w; j < found; ++j) if (!used[j]) { printf "  wine    %s\n", wine[j]; used[j] = 1 }
        next_w = found + 1
      }
      printf "  native  %s\n", $0
      if (found) { printf "  wine    %s\n", wine[found]; used[found] = 1 }
    }
    BEGIN { next_w = 1 }
    END { for (j = 1; j <= n; ++j) if (!used[j]) printf "  wine    %s\n", wine[j] }
  ' "$work/$b.wine.txt" "$work/$b.native"
done
