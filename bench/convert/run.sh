#!/bin/sh
# The sample program's whole conversion beside two peers, on the same file: a
# delimited file of ROWS records x 10 fields in Windows-1252 (the large
# sample's generator, without defective records) becomes a delimited file in
# code page 850
#   - through the conversion module under Wine (bench_convert.exe: delimited
#     input filter, output source, delimited output filter), with the peak
#     working set of the Wine process, and through the whole sample program
#     (qoconvert.exe /batch, timed from its start to its end, three runs),
#   - through iconv -f CP1252 -t CP850 (bytes only, no fields),
#   - through Python's csv module (reads and writes the fields).
# Then the same at a quarter of the rows: the module's memory must not grow
# with the file. Needs the Windows build (default build/win).
#
#   bench/convert/run.sh [ROWS] [build folder]      default 1000000 build/win
set -e
here=$(cd "$(dirname "$0")" && pwd)
repo=$(cd "$here/../.." && pwd)
rows=${1:-1000000}
build=$(cd "${2:-$repo/build/win}" && pwd)
# What this benchmark runs, brought up to date in that build.
cmake --build "$build" --target bench_convert qoconvert >/dev/null
work=$(mktemp -d /tmp/qo_bench_convert.XXXXXX)
trap 'rm -rf "$work"' EXIT

for n in "$rows" $((rows / 4)); do
  project="$work/p$n"
  /usr/bin/python3 "$repo/examples/qoconvert/sample/make-big-sample.py" "$project" "$n" --clean
  input="$project/kunden-gross.txt"
  mb=$(stat -c %s "$input" | awk '{ printf "%.1f", $1 / 1e6 }')
  echo "--- $n rows x 10 fields, $mb MB"
  # shellcheck disable=SC2016
  "$repo/tools/session" sh -c '
    winrun=$1 build=$2 project=$3 mb=$4
    "$winrun" "$build/bin/bench_convert.exe" "$build/bin/qoconvert_run.dll" "Z:$project" 2>&1 | grep -v "^wine: "
    # The whole program, counted from its start until it has ended (Wine
    # itself already running, as for any program after the first): the
    # module and its output flushed to disk before the replace, loading the
    # libraries, the log.
    for run in 1 2 3; do
      start=$(date +%s.%N)
      "$winrun" "$build/bin/qoconvert.exe" /batch "Z:$project" >/dev/null 2>&1 || echo "(qoconvert failed: $?)"
      end=$(date +%s.%N)
      awk "BEGIN { printf \"qoconvert.exe /batch (Wine, whole process) run %d: %.2f s = %.1f MB/s\\n\", $run, $end - $start, $mb / ($end - $start) }"
    done' sh "$repo/tools/winrun" "$build" "$project" "$mb"

  start=$(date +%s.%N)
  iconv -f CP1252 -t CP850 "$input" > "$work/iconv.txt"
  end=$(date +%s.%N)
  awk "BEGIN { printf \"iconv -f CP1252 -t CP850: %.2f s = %.1f MB/s\\n\", $end - $start, $mb / ($end - $start) }"

  /usr/bin/python3 - "$input" "$work/python.txt" "$mb" <<'PY'
import csv, sys, time
source, target, mb = sys.argv[1], sys.argv[2], float(sys.argv[3])
start = time.perf_counter()
with open(source, encoding="cp1252", newline="") as i, open(target, "w", encoding="cp850", newline="") as o:
    writer = csv.writer(o, delimiter=";", quotechar='"', lineterminator="\r\n")
    for row in csv.reader(i, delimiter=";", quotechar='"'):
        writer.writerow(row)
seconds = time.perf_counter() - start
print("Python csv reader/writer: %.2f s = %.1f MB/s" % (seconds, mb / seconds))
PY
  # The three outputs hold the same records.
  if ! cmp -s "$project/kunden-gross-dos.txt" "$work/python.txt"; then
    echo "note: the module's output differs from Python's csv output" >&2
  fi
  rm -rf "$project" "$work/iconv.txt" "$work/python.txt"
done
