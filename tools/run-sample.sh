#!/bin/sh
# Builds the Windows binaries and runs the sample program qoconvert in batch
# mode on the shipped sample project: a customer list in Windows-1252 is
# converted to DOS code page 850. Prints the program's log and both files.
set -e
here=$(cd "$(dirname "$0")" && pwd)
repo=$(dirname "$here")
cd "$repo"

cmake -S . -B "${QO_BUILD:-build/win}" -DCMAKE_TOOLCHAIN_FILE=cmake/mingw-w64-x86_64.cmake >/dev/null
cmake --build "${QO_BUILD:-build/win}" -j "$(nproc)" --target qoconvert

project=build/sample-project
rm -rf "$project"
mkdir -p "$project"
iconv -f UTF-8 -t CP1252 examples/qoconvert/sample/kunden.txt.utf8 > "$project/kunden.txt"
printf '[Eingabe]\r\nDatei=kunden.txt\r\nZeichensatz=0\r\n[Ausgabe]\r\nDatei=kunden-dos.txt\r\nZeichensatz=1\r\n' \
  > "$project/qoconvert.ini"

# The program runs in the project folder, so the files are named relative to it.
"$here/session" sh -c "cd '$project' && wine '$repo/${QO_BUILD:-build/win}/bin/qoconvert.exe' /batch ." && rc=0 || rc=$?

# The same records into a table of an SQLite database file (no server needed),
# read back with the sqlite3 shell.
if [ $rc -eq 0 ]; then
  db_project=build/sample-project-db
  rm -rf "$db_project"
  mkdir -p "$db_project"
  cp "$project/kunden.txt" "$db_project/"
  printf '[Eingabe]\r\nDatei=kunden.txt\r\nZeichensatz=0\r\n[Ausgabe]\r\nODBC=Driver=SQLite3;Database=kunden.db\r\nTabelle=Kunden\r\n' \
    > "$db_project/qoconvert.ini"
  "$here/session" sh -c "cd '$db_project' && wine '$repo/${QO_BUILD:-build/win}/bin/qoconvert.exe' /batch ." && rc=0 || rc=$?
  echo "--- into SQLite: $db_project/kunden.db, table Kunden, read by the sqlite3 shell:"
  sqlite3 -header -separator ' | ' "$db_project/kunden.db" 'select * from Kunden' || rc=1
fi

# The large sample (generated, not in git): 120,000 records with four
# defective ones, which a batch run skips and names in the log (exit code 3).
if [ $rc -eq 0 ]; then
  big=build/sample-project-gross
  rm -rf "$big"
  /usr/bin/python3 examples/qoconvert/sample/make-big-sample.py "$big"
  "$here/session" sh -c "cd '$big' && wine '$repo/${QO_BUILD:-build/win}/bin/qoconvert.exe' /batch ." && big_rc=0 || big_rc=$?
  echo "--- large sample: $big, exit code $big_rc (3: converted, defective records left out); its log:"
  iconv -f CP1252 -t UTF-8 "$big/qoconvert.log"
  [ $big_rc -eq 3 ] || rc=1
fi

echo "--- qoconvert.log"
iconv -f CP1252 -t UTF-8 "$project/qoconvert.log"
if [ -f "$project/kunden-dos.txt" ]; then
  echo "--- kunden-dos.txt (code page 850), read back as UTF-8:"
  iconv -f CP850 -t UTF-8 "$project/kunden-dos.txt"
fi
exit $rc
