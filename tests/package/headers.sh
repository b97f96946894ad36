#!/usr/bin/env bash
# Every installed header compiles alone, those of libschema under both of their names.

set -euo pipefail

lib=$(dirname "$(find "$PREFIX" -name libschema.a)")
read -ra flags <<<"$CONSUMER_FLAGS $(PKG_CONFIG_PATH=$lib/pkgconfig "$PKG_CONFIG" --cflags libschema)"

count=0
for header in "$PREFIX"/include/libschema/*.h; do
  name=$(basename "$header")
  printf '#include <libschema/%s>\n#include "%s"\n' "$name" "$name" |
    "$CXX" "${flags[@]}" -fsyntax-only -x c++ -
  count=$((count + 1))
done
for header in "$PREFIX"/include/libschema-migration/*.h; do
  printf '#include <libschema-migration/%s>\n' "$(basename "$header")" |
    "$CXX" "${flags[@]}" -fsyntax-only -x c++ -
  count=$((count + 1))
done
[ "$count" -gt 20 ]
