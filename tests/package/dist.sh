#!/usr/bin/env bash
# The source tarball: made once more of what it holds, without git, under another umask, at other dates of the
# files, it is the same byte for byte; and it holds the sources as they are here.

set -euo pipefail
here=$(cd "$(dirname "$0")" && pwd)
. "$here/expect.sh"
root=$(cd "$here/../.." && pwd)

rm -rf "$WORK"
mkdir -p "$WORK"
cd "$WORK"
tarball=libschema-$VERSION.tar.xz

expect "name of the tarball" "$WORK/first/$tarball" "$("$root/scripts/dist" "$WORK/first")"
(umask 077 && tar -xf "first/$tarball")
find "libschema-$VERSION" -exec touch -d '2001-02-03 04:05' {} +
(umask 027 && TZ=Pacific/Kiritimati "libschema-$VERSION/scripts/dist" "$WORK/second" >/dev/null)
expect "bytes of the second tarball" "$(sha256sum <"first/$tarball")" "$(sha256sum <"second/$tarball")"

differences=$(diff -rq "$root" "libschema-$VERSION" 2>&1 |
  grep -v "^Only in $root" | grep -v 'debian: changelog$' || true)
expect "differences of the sources" "" "$differences"
for file in VERSION CMakeLists.txt debian/rules scripts/package src/libraries/libschema/SchemaManager.h; do
  [ -f "libschema-$VERSION/$file" ] || expect "file of the tarball" "$file" "none"
done
expect "users and modes" "0/0 -rw-r--r--
0/0 -rwxr-xr-x
0/0 drwxr-xr-x" "$(tar --numeric-owner -tvf "first/$tarball" | awk '{ print $2, $1 }' | sort -u)"
expect "top of debian/changelog" "libschema ($VERSION)" \
  "$(head -n 1 "libschema-$VERSION/debian/changelog" | cut -d ' ' -f 1,2)"
