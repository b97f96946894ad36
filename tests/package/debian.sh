#!/usr/bin/env bash
# What the packages say of themselves: they are built with all that ./scripts/package installs to build, their
# libraries have the number of the SONAME, and they hold the components of the installation: each of them goes
# into a package, and of the runtime component each file into one.

set -euo pipefail
here=$(cd "$(dirname "$0")" && pwd)
. "$here/expect.sh"
cd "$here/../.."
. scripts/lib/packages.sh

fields=$(awk '/^[^ ]/ { field = $1 } field ~ /^Build-Depends/ { print $1, $2 }' debian/control)
for package in "${packages_to_build[@]}"; do
  [ "$package" = g++ ] || grep -qE "^$package(,| |$)" <<<"$fields" || expect "build dependency" "$package" "none"
done
expect "packages" "libschema2 libschema-platform1 libschema-migration1 libschema-dev schema-migrate \
libschema-doc" "$(sed -n 's/^Package: //p' debian/control | tr '\n' ' ' | sed 's/ $//')"
for library in 'libschema 2' 'libschema-platform 1' 'libschema-migration 1'; do
  read -r name number <<<"$library"
  expect "symbols of $name" "$name.so.$number $name$number #MINVER#" \
    "$(grep "^$name" "debian/$name$number.symbols")"
  expect "files of $name" "usr/lib/*/$name.so.*" "$(cat "debian/$name$number.install")"
done

components=$(grep -rhoE 'COMPONENT [a-z]+' CMakeLists.txt cmake docs/man/CMakeLists.txt src --include=CMakeLists.txt \
  --include='*.cmake' | cut -d ' ' -f 2 | sort -u)
expect "components that packages are made of" "$components" \
  "$(grep -oE 'call install_component,[a-z]+' debian/rules | cut -d , -f 2 | sort -u)"
while IFS=, read -r component folder; do
  [ "$folder" = tmp ] || grep -q "^Package: $folder\$" debian/control || expect "package of $component" "$folder" "none"
done < <(sed -nE 's/.*call install_component,([a-z]+,[a-z-]+)\).*/\1/p' debian/rules)

rm -rf "$WORK"
"$CMAKE" --install "$BUILD" --prefix "$WORK/usr" --component runtime >/dev/null
while read -r file; do
  owners=0
  for list in debian/*.install; do
    while read -r pattern; do
      # The folder of the libraries has the name of the machine's kind in a package.
      [[ usr/lib/any/${file##*/} != $pattern ]] || owners=$((owners + 1))
    done <"$list"
  done
  expect "packages that hold $file" 1 "$owners"
done < <(find "$WORK/usr" ! -type d)
