#!/usr/bin/env bash
# migration.sh find_package|pkg_config shared|static: builds the programs of README.md against the
# installed libschema-migration, and compares what they print.

set -euo pipefail
here=$(cd "$(dirname "$0")" && pwd)
. "$here/expect.sh"

way=$1
linkage=$2
lib=$(dirname "$(find "$PREFIX" -name libschema.a)")
read -ra flags <<<"$CONSUMER_FLAGS"
programs=(definitions lookup dangling differences memory)

build_by_find_package() {
  local target=libschema::migration
  [ "$linkage" = shared ] || target=libschema::migration_static
  "$CMAKE" -S "$here/migration" -B build -DCMAKE_PREFIX_PATH="$PREFIX" -DMIGRATION_TARGET="$target" \
    -DCMAKE_CXX_COMPILER="$CXX" -DCMAKE_CXX_FLAGS="$CONSUMER_FLAGS"
  "$CMAKE" --build build
}

build_by_pkg_config() {
  local program package=() library
  mkdir build
  export PKG_CONFIG_PATH=$lib/pkgconfig
  if [ "$linkage" = shared ]; then
    read -ra package <<<"$("$PKG_CONFIG" --cflags --libs libschema-migration)"
  else
    read -ra package <<<"$("$PKG_CONFIG" --static --cflags --libs libschema-migration)"
    # The run-time libraries of the sanitizers stay out of an archive.
    library=-static
    [ -z "${SANITIZED:-}" ] || library="-Wl,-Bstatic"
    package=("$library" "${package[@]}")
    [ -z "${SANITIZED:-}" ] || package+=("-Wl,-Bdynamic")
  fi
  for program in "${programs[@]}"; do
    "$CXX" "${flags[@]}" "$here/migration/$program.cpp" -o "build/$program" "${package[@]}"
  done
}

rm -rf "$WORK"
mkdir -p "$WORK"
cd "$WORK"
"build_by_$way"
[ "$linkage" = static ] || export LD_LIBRARY_PATH=$lib
needed=$(objdump -p build/definitions | awk '$1 == "NEEDED" && $2 ~ /migration/ { print $2 }')
expect "library that a program loads" \
  "$([ "$linkage" = static ] || echo "libschema-migration.so.1")" "$needed"

mkdir old new
cat >old/V3.user.at <<'END'
# The site's own.
attributetypes=( 1.1 NAME ( 'badge' 'badgeNumber' ) DESC 'on the badge' EQUALITY caseIgnoreMatch
                 SYNTAX 1.5{8} SINGLE-VALUE )
END
cat >old/V3.user.oc <<'END'
objectclasses {
  ( 1.9 NAME 'visitor' AUXILIARY MUST ( BADGE $ name ) )
}
END
cat >old/V3.orv.at <<'END'
ORVAttributetypes=( 1.1 DBNAME ( 'badge' 'badge' ) ACCESS-CLASS critical LENGTH 8 EQUALITY )
END
cat >new/V3.user.at <<'END'
attributetypes=( 1.1 NAME 'badge' DESC 'on the badge' )
attributetypes=( 1.2 NAME 'name' DESC 'name' )
END
before=$(cat old/* new/* | cksum)

expect "definitions" "V3.orv.at:1: vendor extension 1.1
  OID 1.1
  DBNAME badge badge
  ACCESS-CLASS critical
  LENGTH 8
  EQUALITY
V3.user.at:2: attribute type badge (1.1)
  OID 1.1
  NAME badge badgeNumber
  DESC on the badge
  EQUALITY caseIgnoreMatch
  SYNTAX 1.5{8}
  SINGLE-VALUE
  USAGE userApplications
V3.user.oc:2: object class visitor (1.9)
  OID 1.9
  NAME visitor
  AUXILIARY
  MUST BADGE name" "$(build/definitions old)"
expect "definitions of a missing directory" \
  "3 missing: the directory cannot be read: No such file or directory" \
  "$(status=0 && printed=$(build/definitions missing 2>&1) || status=$? && echo "$status $printed")"
expect "found" "attribute type badge (1.1) in line 2
MUST of object class visitor (1.9)" "$(build/lookup old BadgeNumber)"
expect "not found" "1 not found: badge?" \
  "$(status=0 && printed=$(build/lookup old bagde) || status=$? && echo "$status $printed")"
expect "dangling references" "V3.user.oc:2:49: MUST of object class visitor (1.9) names name" \
  "$(build/dangling old)"
expect "differences" "< vendor extension 1.1
! attribute type badge (1.1) in line 2 and line 1
< object class visitor (1.9)
> attribute type name (1.2)" "$(build/differences old new)"
expect "memory" "upload/V3.user.at:1:39: R401
upload/V3.user.oc: with this file the inputs have more than 200 bytes in all" "$(build/memory)"
expect "the directories afterwards" "$before" "$(cat old/* new/* | cksum)"
