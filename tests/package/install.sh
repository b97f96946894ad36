#!/usr/bin/env bash
# Installs the build into one folder and moves that, so that nothing in it can point to its first place.

set -euo pipefail

rm -rf "$PREFIX" "$PREFIX.first"
"$CMAKE" --install "$BUILD" --prefix "$PREFIX.first"
mv "$PREFIX.first" "$PREFIX"
