#!/usr/bin/env bash
# What the packages say of themselves: they are built with all that ./scripts/package installs to build, and
# their libraries have the number of the SONAME.

set -euo pipefail
here=$(cd "$(dirname "$0")" && pwd)
. "$here/expect.sh"
cd "$here/../.."
. scripts/lib/packages.sh

fields=$(awk '/^[^ ]/ { field = $1 } field ~ /^Build-Depends/ { print $1, $2 }' debian/control)
for package in "${packages_to_build[@]}"; do
  [ "$package" = g++ ] || grep -qE "^$package(,| |$)" <<<"$fields" || expect "build dependency" "$package" "none"
done
expect "packages" "libschema2 libschema-platform1 libschema-migration1 libschema-dev schema-migrate \
libschema-doc" "$(sed -n 's/^Package: //p' debian/control | tr '\n' ' ' | sed 's/ $//')"
for library in 'libschema 2' 'libschema-platform 1' 'libschema-migration 1'; do
  read -r name number <<<"$library"
  expect "symbols of $name" "$name.so.$number $name$number #MINVER#" \
    "$(grep "^$name" "debian/$name$number.symbols")"
  expect "files of $name" "usr/lib/*/$name.so.*" "$(cat "debian/$name$number.install")"
done
