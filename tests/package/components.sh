#!/usr/bin/env bash
# The components of the installation: together they are all of it, and each holds what its package does.

set -euo pipefail
. "$(dirname "$0")/expect.sh"

rm -rf "$WORK"
mkdir -p "$WORK"
cd "$WORK"

# files FOLDER: the files below it, without that which names the kind of the build.
files() {
  if [ -d "$1" ]; then
    (cd "$1" && find . ! -type d | LC_ALL=C sort)
  fi
}

for component in runtime development tool documentation; do
  "$CMAKE" --install "$BUILD" --prefix "$WORK/$component" --component "$component" >log
done
expect "files of all components" "$(files "$PREFIX")" \
  "$(for component in runtime development tool documentation; do files "$component"; done |
    LC_ALL=C sort)"

lib=$(cd development && dirname "$(find . -name libschema.a)")
expect "runtime" "$(for name in libschema-migration libschema-platform; do
  printf '%s\n' "$lib/$name.so.1" "$lib/$name.so.1.$VERSION"
done
printf '%s\n' "$lib/libschema.so.2" "$lib/libschema.so.$VERSION")" "$(files runtime)"
expect "tool but for manual pages and the collection" "./bin/schema-migrate
./share/bash-completion/completions/schema-migrate
./share/fish/vendor_completions.d/schema-migrate.fish
./share/zsh/site-functions/_schema-migrate" "$(files tool | grep -vE '^./share/(man|ansible)/')"
expect "manual pages of the tool" "" "$(files tool | grep '^./share/man/' | grep -vE '/man[15]/schema-migrate' || true)"
expect "manual pages for programs" "./share/man/man3/libschema-migration.3
./share/man/man3/libschema.3" "$(files development | grep '^./share/man/')"
sources=$(dirname "$0")/../../ansible
expect "collection" "$(files "$sources" | grep '^./ansible_collections/' | grep -v '/__pycache__/')" \
  "$(files tool/share/ansible/collections)"
expect "development outside of its folders" "$(for name in libschema-migration libschema-platform libschema
do
  printf '%s\n' "$lib/$name.a" "$lib/$name.so"
done)" "$(files development | grep -vE '^./include/|/cmake/|/pkgconfig/|^./share/man/')"
expect "documentation outside of its folder" "" \
  "$(files documentation | grep -vE '^./share/(doc|man)/' || true)"
