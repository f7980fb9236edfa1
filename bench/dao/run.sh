#!/bin/sh
# Appends N rows (default 1,000,000) through the DAO engine under Wine and
# imports the same rows with the sqlite3 shell, printing both times.
#   bench/dao/run.sh [rows] [build folder]
set -e
here=$(cd "$(dirname "$0")" && pwd)
repo=$(cd "$here/../.." && pwd)
rows=${1:-1000000}
build=${2:-$repo/build/win}
work=$(mktemp -d "${TMPDIR:-/tmp}/qo-bench-dao.XXXXXX")
trap 'rm -rf "$work"' EXIT
"$repo/tools/winrun" "$build/bin/bench_dao.exe" "Z:$work/dao.db" "$rows" "Z:$work/rows.csv" | tr -d '\r'
rm -f "$work/dao.db"
start=$(date +%s.%N)
sqlite3 "$work/import.db" <<SQL
create table T (F0 INTEGER, F1 VARCHAR(40), F2 VARCHAR(40), F3 VARCHAR(40), F4 VARCHAR(40),
  F5 VARCHAR(40), F6 VARCHAR(40), F7 VARCHAR(40), F8 VARCHAR(40), F9 DOUBLE);
.mode csv
.import $work/rows.csv T
SQL
end=$(date +%s.%N)
echo "sqlite3_import rows=$(sqlite3 "$work/import.db" 'select count(*) from T') seconds=$(echo "$end - $start" | bc)"
