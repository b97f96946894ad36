#!/usr/bin/env bash
# What an installation consists of.

set -euo pipefail
. "$(dirname "$0")/expect.sh"

lib=$(dirname "$(find "$PREFIX" -name libschema.a)")
libraries=$(cd "$lib" && ls -d libschema*)
headers=$(cd "$PREFIX/include/libschema" && ls)

# entries KIND LIBRARY: the values of this kind in the dynamic section, but for the system's libraries.
entries() {
  objdump -p "$lib/$2" | awk -v kind="$1" '$1 == kind && (kind != "NEEDED" || /schema/) { print $2 }'
}

# defined LIBRARY: the symbols that the shared library gives, demangled, but for those of templates.
defined() {
  nm -DC --defined-only "$lib/$1" | cut -d ' ' -f 3- | grep -v '^std::'
}

libraries_of_pkg_config() {
  PKG_CONFIG_PATH=$lib/pkgconfig "$PKG_CONFIG" "$@" --libs-only-l libschema | sed 's/ *$//'
}

expect "headers" "Attribute.h
CSymbolTable.h
Clex_analyzer.h
ORVAttribute.h
ORVSchema.h
ObjectClass.h
PlacedLexan.h
SchemaLexan.h
SchemaManager.h
SchemaSymbolTable.h
SchemaTokens.h
ldtr.h
timestamp.h" "$headers"
expect "libraries" "libschema-migration.a
libschema-migration.so
libschema-migration.so.1
libschema-migration.so.1.$VERSION
libschema-platform.a
libschema-platform.so
libschema-platform.so.1
libschema-platform.so.1.$VERSION
libschema.a
libschema.so
libschema.so.2
libschema.so.$VERSION" "$libraries"
expect "SONAME" "libschema.so.2" "$(entries SONAME libschema.so)"
expect "SONAME of the platform" "libschema-platform.so.1" "$(entries SONAME libschema-platform.so)"
expect "libraries behind libschema" "libschema-platform.so.1" "$(entries NEEDED libschema.so)"
expect "SONAME of libschema-migration" "libschema-migration.so.1" \
  "$(entries SONAME libschema-migration.so)"
expect "libraries behind libschema-migration" "libschema.so.2" \
  "$(entries NEEDED libschema-migration.so)"
expect "where libschema-migration looks for them" "\$ORIGIN" \
  "$(entries RUNPATH libschema-migration.so)"
expect "symbols of libschema-migration but its own" "" \
  "$(defined libschema-migration.so | grep -v 'migration::' | sort)"
expect "libraries behind the platform" "" "$(entries NEEDED libschema-platform.so)"
expect "where libschema looks for the platform" "\$ORIGIN" "$(entries RUNPATH libschema.so)"
expect "symbols of the platform" "getCurrentTimeStamp[abi:cxx11](int)
ldtr_exit_errcode(unsigned long, unsigned long, unsigned long, long, void const*)
ldtr_formater_global::debug(unsigned long, char const*, ...)
ldtr_formater_local::debug(unsigned long, char const*, ...)
ldtr_fun
ldtr_write(unsigned long, unsigned long, void const*)
libschema_trace_events
trcEvents" "$(defined libschema-platform.so | sort)"
expect "symbols of libschema that a server has, too" "" \
  "$(defined libschema.so | grep -E '^(ldtr_|trcEvents|getCurrentTimeStamp|CSymbolTable|Clex_analyzer)')"
expect "what a program is linked with" "-lschema" "$(libraries_of_pkg_config)"
expect "what a static program is linked with" "-lschema -lschema-platform" \
  "$(libraries_of_pkg_config --static)"
for package in libschema libschema-migration; do
  expect "version of $package by pkg-config" "$VERSION" \
    "$(PKG_CONFIG_PATH=$lib/pkgconfig "$PKG_CONFIG" --modversion "$package")"
done
expect "tool" "schema-migrate $VERSION" "$("$PREFIX/bin/schema-migrate" --version)"
for shell in bash:share/bash-completion/completions/schema-migrate zsh:share/zsh/site-functions/_schema-migrate \
  fish:share/fish/vendor_completions.d/schema-migrate.fish; do
  expect "completion for ${shell%%:*}" "$("$PREFIX/bin/schema-migrate" completion "${shell%%:*}")" \
    "$(cat "$PREFIX/${shell#*:}")"
done
for page in "$(dirname "$0")"/../../docs/man/*.scd; do
  page=$(basename "$page" .scd)
  [ -s "$PREFIX/share/man/man${page##*.}/$page" ] || expect "man page" "$page" "none"
done

# The installation refers neither to the build nor to the place where it was first.
if grep -rlE "$BUILD/|$PREFIX.first" "$lib/cmake" "$lib/pkgconfig" "$PREFIX/include"; then
  expect "references to other folders" "none" "those above"
fi
