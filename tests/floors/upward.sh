#!/usr/bin/env bash
# upward.sh SOURCE WORK: floors.sh tells an include that points upward, on every floor.

set -euo pipefail
here=$(cd "$(dirname "$0")" && pwd)
rm -rf "$2"
mkdir -p "$2"
failed=0

# expect_complaint FILE INCLUDE: a copy of the sources with this include in this file.
expect_complaint() {
  rm -rf "$2/src"
  cp -r "$1/src" "$2/src"
  echo "$4" >>"$2/src/$3"
  local printed
  if printed=$("$here/floors.sh" "$2"); then
    echo "nothing is told of $4 in $3"
    failed=1
  elif [ "$(wc -l <<<"$printed")" != 1 ] || [ "${printed%%:*}" != "src/$3" ]; then
    printf 'of %s in %s is told:\n%s\n' "$4" "$3" "$printed"
    failed=1
  fi
}

migration=libraries/libmigration
expect_complaint "$1" "$2" platform/parse/Clex_analyzer.h '#include "SchemaLexan.h"'
expect_complaint "$1" "$2" libraries/libschema/SchemaLexan.cpp '#include "ORVSchema.h"'
expect_complaint "$1" "$2" libraries/libschema/Attribute.cpp '#include "SchemaManager.h"'
expect_complaint "$1" "$2" libraries/libschema/SchemaManager.cpp '#include <libschema-migration/Source.h>'
expect_complaint "$1" "$2" $migration/text/Source.cpp '#include "Installation.h"'
expect_complaint "$1" "$2" $migration/model/Installation.cpp '#include "Rule.h"'
expect_complaint "$1" "$2" $migration/rules/Rule.h '#include "SchemaManager.h"'
expect_complaint "$1" "$2" tools/schema-migrate/main.cpp '#include "Attribute.h"'
expect_complaint "$1" "$2" tools/schema-migrate/main.cpp '#include <libschema-migration/Nowhere.h>'
exit "$failed"
