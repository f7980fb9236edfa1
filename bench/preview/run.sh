#!/bin/sh
# The delimited text page's preview on files of 1,000,000 and 10,000,000 rows
# under Wine: opening until the first complete paint, a jump to the preview's
# last row until it is painted, and AbsoluteRow to the file's own last row,
# with the file size and the process's memory.
#   bench/preview/run.sh [build folder] [rows ...]
# The files are generated into <build folder>/bench-preview (not in git) and
# kept for the next run.
set -e
here=$(cd "$(dirname "$0")" && pwd)
repo=$(cd "$here/../.." && pwd)
build=$(cd "${1:-$repo/build/win}" && pwd)
[ $# -gt 0 ] && shift
# The benchmark brought up to date in that build.
cmake --build "$build" --target bench_preview >/dev/null
data="$build/bench-preview"
mkdir -p "$data"
exec "$repo/tools/session" "$repo/tools/winrun" "$build/bin/bench_preview.exe" "Z:$data" "$@"
