#!/usr/bin/env bash
# One version: the file VERSION says it, and what is changed in it stands on top of CHANGELOG.md, under the
# version itself or, before it is out, under "Unreleased". The package's changelog is made of both.

set -euo pipefail
here=$(cd "$(dirname "$0")" && pwd)
. "$here/expect.sh"
root=$here/../..

expect "version of CMake" "$(cat "$root/VERSION")" "$VERSION"
expect "form of the version" "$VERSION" "$(grep -xE '[0-9]+\.[0-9]+\.[0-9]+' "$root/VERSION")"
first=$(sed -n 's/^## //p' "$root/CHANGELOG.md" | head -n 1)
second=$(sed -n "s/^## \([0-9][0-9.]*\).*/\1/p" "$root/CHANGELOG.md" | head -n 1)
case $first in
  Unreleased)
    [ "$second" != "$VERSION" ] || expect "top of CHANGELOG.md" "$VERSION" "$first"
    expect "order of $second and $VERSION" "$second" \
      "$(printf '%s\n' "$second" "$VERSION" | sort -V | head -n 1)"
    ;;
  *) expect "top of CHANGELOG.md" "$VERSION" "${first%% *}" ;;
esac

made=$(SOURCE_DATE_EPOCH=86400 "$root/scripts/lib/debian_changelog" "$root/CHANGELOG.md" "$VERSION")
expect "versions of the package's changelog" "$VERSION
$(sed -n 's/^## \([0-9][0-9.]*\).*/\1/p' "$root/CHANGELOG.md" | grep -vxF "$VERSION")" \
  "$(sed -n 's/^libschema (\(.*\)) .*/\1/p' <<<"$made")"
items=$(grep -c '^- ' "$root/CHANGELOG.md")
expect "items of the package's changelog" "$items" "$(grep -c '^  \* ' <<<"$made")"
expect "long lines" "" "$(awk 'length > 80 && !/^ -- /' <<<"$made")"
