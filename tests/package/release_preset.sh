#!/usr/bin/env bash
# The release preset, as README gives it: what is installed, and no test. The same with the tests.

set -euo pipefail
here=$(cd "$(dirname "$0")" && pwd)
. "$here/expect.sh"

# targets [OPTION...]: how many of these targets the preset configures.
targets() {
  rm -rf "$WORK"
  "$CMAKE" -S "$here/../.." --preset release -B "$WORK" -DCMAKE_CXX_COMPILER="$CXX" "$@" >/dev/null
  "$CMAKE" --build "$WORK" --target help | grep -cE '^(schema|schema_static|schema-migrate|lexer_test): '
}

expect "targets of the preset" 3 "$(targets)"
expect "targets with tests" 4 "$(targets -DBUILD_TESTING=ON)"
