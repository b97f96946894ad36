#!/usr/bin/env bash
# What is installed is hardened, as hardening-check sees it: every line that is no "yes" is listed here with
# its reason.

set -euo pipefail
. "$(dirname "$0")/expect.sh"

lib=$(dirname "$(find "$PREFIX" -name libschema.a)")

# marked FILE: how many objects of it are marked for indirect jumps and shadow stacks.
marked() {
  { readelf -nW "$1" 2>/dev/null || true; } | grep -c 'x86 feature: IBT, SHSTK' || true
}

# missing FILE [LINE...]: what hardening-check misses in it, but for the lines that begin like those given.
missing() {
  local report line
  report=$(hardening-check "$1" || true)
  grep -q 'Immediate binding: yes' <<<"$report" || printf 'no immediate binding: %s\n' "$report"
  for line in "${@:2}"; do
    report=$(grep -v "^ $line" <<<"$report" || true)
  done
  grep ': no' <<<"$report" || true
}

ignored=()
case $(uname -m) in
  x86_64 | i?86)
    for archive in "$lib"/*.a; do
      expect "marked objects of $archive" "$(ar t "$archive" | wc -l)" "$(marked "$archive")"
    done
    # A program or library is marked when all of it is, and the C library adds objects of its own.
    [ "$(marked "$("$CXX" -print-file-name=crti.o)")" -gt 0 ] || ignored+=("Control flow integrity:")
    ;;
  *) ignored+=("Control flow integrity:") ;;
esac
# clang makes a checked call of none of the functions that the tool takes from the C library.
unchecked="Fortify Source functions: no, only unprotected"
of_tool=("${ignored[@]}")
! "$CXX" --version | grep -q clang || of_tool+=("$unchecked")
expect "what the tool misses" "" "$(missing "$PREFIX/bin/schema-migrate" "${of_tool[@]}")"
ignored+=("Position Independent Executable: no, regular shared library")
for library in libschema-platform.so libschema-migration.so; do
  expect "what $library misses" "" "$(missing "$lib/$library" "${ignored[@]}")"
done
# Nor does any compiler of those that libschema does.
expect "what libschema.so misses" "" "$(missing "$lib/libschema.so" "${ignored[@]}" "$unchecked")"
