# Sourced by the checks of this folder.
# shellcheck shell=bash

export LC_ALL=C

# expect WHAT EXPECTED ACTUAL: ends the check when the two texts differ.
expect() {
  if [ "$2" != "$3" ]; then
    printf '%s, expected:\n%s\n%s, actual:\n%s\n' "$1" "$2" "$1" "$3" >&2
    exit 1
  fi
}
