#!/bin/sh
# The ODBC benchmark beside the native bulk loaders, in one run: a delimited
# file of ROWS rows x 10 columns goes into SQLite and PostgreSQL through the
# library's ODBC output filter and is read back through its input filter
# (bench_odbc.exe under Wine), then the same file through `sqlite3 .import`
# and `psql \copy`. Needs the Windows build (default build/win).
#
#   bench/odbc/run.sh [ROWS] [build folder]        default 1000000 build/win
set -e
here=$(cd "$(dirname "$0")" && pwd)
repo=$(cd "$here/../.." && pwd)
rows=${1:-1000000}
build=$(cd "${2:-$repo/build/win}" && pwd)
work=$(mktemp -d /tmp/qo_bench_odbc.XXXXXX)
chmod 755 "$work"   # the server runs as postgres
trap '"$repo/tools/pg-test-server" stop "$work/pg" >/dev/null 2>&1 || true; rm -rf "$work"' EXIT

/usr/bin/python3 - "$work/bench.csv" "$rows" <<'PY'
import random, sys
path, rows = sys.argv[1], int(sys.argv[2])
random.seed(1)
letters = "abcdefghijklmnopqrstuvwxyz\xe4\xf6\xfc"
with open(path, "w", encoding="cp1252", newline="") as f:
    f.write(";".join("c%d" % c for c in range(10)) + "\r\n")
    for r in range(rows):
        fields = [str(r), '"Name; %d"' % (r % 9973)]
        fields += ["".join(random.choice(letters) for _ in range(random.randint(3, 8))) for _ in range(8)]
        f.write(";".join(fields) + "\r\n")
PY
mb=$(du -m "$work/bench.csv" | cut -f1)
echo "file: $rows rows x 10 columns, $mb MB"

# No statement log here: the tests read it, a benchmark would only measure it.
connect=$(QO_PG_LOG_STATEMENTS=none "$repo/tools/pg-test-server" start "$work/pg" | tail -n 1)
port=$(echo "$connect" | sed -n 's/.*Port=\([0-9]*\).*/\1/p')

echo "--- the library (under Wine)"
QO_PG_CONNECT="$connect" "$repo/tools/session" wine "$build/bin/bench_odbc.exe" \
  "Z:$work/bench.csv" "Z:$work" 2>&1 | grep -v '^wine: '

echo "--- native bulk loaders"
start=$(date +%s.%N)
sqlite3 "$work/import.db" ".mode csv" ".separator ;" ".import $work/bench.csv bench"
end=$(date +%s.%N)
echo "sqlite3 .import: $(awk "BEGIN { printf \"%.2f\", $end - $start }") s"

cols=$(seq 0 9 | sed 's/.*/c& varchar(60)/' | paste -sd, -)
psql -q -h 127.0.0.1 -p "$port" -U postgres -d qotest -c "drop table if exists bench_copy" \
  -c "create table bench_copy ($cols)"
start=$(date +%s.%N)
psql -q -h 127.0.0.1 -p "$port" -U postgres -d qotest \
  -c "\\copy bench_copy from '$work/bench.csv' with (format csv, delimiter ';', header true, encoding 'WIN1252')"
end=$(date +%s.%N)
awk "BEGIN { printf \"psql \\\\copy: %.2f s = %.0f rows/s\\n\", $end - $start, $rows / ($end - $start) }"
