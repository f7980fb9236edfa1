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
  unixodbc unixodbc-dev libsqliteodbc sqlite3 odbc-postgresql postgresql"
missing=
for p in $PACKAGES; do
  dpkg-query -W -f='${Status}' "$p" 2>/dev/null | grep -q "install ok installed" || missing="$missing $p"
done
if [ -n "$missing" ]; then
  $SUDO apt-get update
  DEBIAN_FRONTEND=noninteractive $SUDO apt-get install -y $missing
fi
