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
major=${VERSION%%.*}
expect "packages" "libschema$major libschema-platform$major libschema-migration$major libschema-dev \
schema-migrate libschema-doc" "$(sed -n 's/^Package: //p' debian/control | tr '\n' ' ' | sed 's/ $//')"
for library in libschema libschema-platform libschema-migration; do
  expect "symbols of $library" "$library.so.$major $library$major #MINVER#" \
    "$(grep "^$library" "debian/$library$major.symbols")"
done
