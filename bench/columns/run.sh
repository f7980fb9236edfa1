#!/bin/sh
# The column-by-column output pages over sources of 1,000 and 10,000 columns
# under Wine: taking the source's columns and handing them to the filter.
#   bench/columns/run.sh [build folder] [columns ...]
set -e
here=$(cd "$(dirname "$0")" && pwd)
repo=$(cd "$here/../.." && pwd)
build=$(cd "${1:-$repo/build/win}" && pwd)
[ $# -gt 0 ] && shift
exec "$repo/tools/session" "$repo/tools/winrun" "$build/bin/bench_columns.exe" "$@"
