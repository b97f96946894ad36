#!/usr/bin/env bash
# floors.sh SOURCE: prints every include of SOURCE/src that points upward; exit 1 when there is one.

set -euo pipefail
here=$(cd "$(dirname "$0")" && pwd)
cd "$1"
{
  find src -name '*.h'
  grep -rHE '^[[:space:]]*#[[:space:]]*include' src --include=*.h --include=*.cpp
} | awk -f "$here/floors.awk"
