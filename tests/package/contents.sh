#!/usr/bin/env bash
# What an installation consists of.

set -euo pipefail
. "$(dirname "$0")/expect.sh"

major=${VERSION%%.*}
lib=$(dirname "$(find "$PREFIX" -name libschema.a)")
libraries=$(cd "$lib" && ls -d libschema*)
headers=$(cd "$PREFIX/include/libschema" && ls)
soname=$(objdump -p "$lib/libschema.so" | awk '$1 == "SONAME" { print $2 }')

expect "headers" "Attribute.h
CSymbolTable.h
Clex_analyzer.h
ORVAttribute.h
ORVSchema.h
ObjectClass.h
SchemaLexan.h
SchemaManager.h
SchemaSymbolTable.h
SchemaTokens.h
ldtr.h
timestamp.h" "$headers"
expect "libraries" "libschema.a
libschema.so
libschema.so.$major
libschema.so.$VERSION" "$libraries"
expect "SONAME" "libschema.so.$major" "$soname"
expect "version by pkg-config" "$VERSION" \
  "$(PKG_CONFIG_PATH=$lib/pkgconfig "$PKG_CONFIG" --modversion libschema)"
expect "tool" "schema-migrate $VERSION" "$("$PREFIX/bin/schema-migrate" --version)"
[ -s "$PREFIX/share/man/man1/schema-migrate.1" ] || expect "man page" "schema-migrate.1" "none"

# The installation refers neither to the build nor to the place where it was first.
if grep -rlE "$BUILD/|$PREFIX.first" "$lib/cmake" "$lib/pkgconfig" "$PREFIX/include"; then
  expect "references to other folders" "none" "those above"
fi
