#!/usr/bin/env bash
# A library of two classes is released, and changed afterwards in one way after the other: what breaks a
# linked program is refused, by name, but under another SONAME.

set -euo pipefail
root=$(cd "$(dirname "$0")/../.." && pwd)
. "$root/tests/package/expect.sh"

rm -rf "$WORK"
mkdir -p "$WORK/include"
cd "$WORK"

cat >include/Table.h <<'END'
#include <string>
#include <vector>
struct Entry {
  int line;
  std::string text;
};
class Table {
 public:
  virtual ~Table();
  virtual std::string name();
  virtual int size() const;
  std::vector<std::string> all();
  Entry entry(int number);

 private:
  int m_size = 0;
};
END
cat >Table.cpp <<'END'
#include "Table.h"
Table::~Table() = default;
std::string Table::name() { return ""; }
int Table::size() const { return m_size; }
std::vector<std::string> Table::all() { return {}; }
Entry Table::entry(int number) { return {number, ""}; }
END

# build FOLDER SONAME: libtable.so of the header and the source in the folder.
build() {
  "$CXX" -std=c++17 -O1 -g -shared -fPIC -I"$1/include" "$1/Table.cpp" -o "$1/libtable.so" \
    "-Wl,-soname,$2"
}

# change NAME SED-EXPRESSION [SED-EXPRESSION OF THE SOURCE]: a changed copy.
change() {
  rm -rf "$1"
  mkdir "$1"
  cp -r include Table.cpp "$1"
  sed -i "$2" "$1/include/Table.h"
  sed -i "${3:-}" "$1/Table.cpp"
  ! cmp -s include/Table.h "$1/include/Table.h" || expect "changed header of $1" "another" "the same"
}

# compared NAME: what scripts/abi says of the changed library, and its status.
compared() {
  local status=0
  "$root/scripts/abi" compare "$PWD/released.xz" "$PWD/$1/libtable.so" >"$1.log" 2>&1 ||
    status=$?
  printf '%s\n' "$status"
}

# refuses NAME TEXT: the change is refused, and the text says by what.
refuses() {
  build "$1" libtable.so.1
  expect "status for $1: $(cat "$1.log" 2>/dev/null)" 1 "$(compared "$1")"
  grep -qF -- "$2" "$1.log" || expect "report on $1" "$2" "$(cat "$1.log")"
  build "$1" libtable.so.2
  expect "status for $1 under another SONAME" 0 "$(compared "$1")"
  expect "report on $1 under another SONAME" \
    "libtable.so: libtable.so.2 since the last release, which had libtable.so.1" "$(cat "$1.log")"
}

allows() {
  build "$1" libtable.so.1
  expect "status for $1: $(cat "$1.log" 2>/dev/null)" 0 "$(compared "$1")"
  expect "report on $1" "libtable.so: as in the last release, or more" "$(cat "$1.log")"
}

mkdir same
cp -r include Table.cpp same
build same libtable.so.1
"$root/scripts/abi" dump-one "$PWD/same/libtable.so" "$PWD/include" | xz >released.xz
allows same

change function_added 's/ private:/  int added();\n private:/' '$a int Table::added() { return 1; }'
allows function_added
change class_added '$a class Other {\n public:\n  int one();\n};' '$a int Other::one() { return 1; }'
allows class_added

change function_gone '/all()/d' '/all()/d'
refuses function_gone 'Table::all()'
change const_gone 's/size() const/size()/' 's/size() const/size()/'
refuses const_gone 'Table::size() const'
change parameter_changed 's/int number/long number/' 's/entry(int number) { return {number/entry(long) { return {1/'
refuses parameter_changed 'Table::entry(int)'
change virtual_added 's/  virtual std::string name/  virtual int early();\n&/' '$a int Table::early() { return 1; }'
refuses virtual_added 'vtable'
change member_added 's/  int line;/&\n  int column;/' 's/{number, ""}/{number, 1, ""}/'
refuses member_added 'Entry'
change result_changed 's/std::vector<std::string> all/std::string all/' 's/std::vector<std::string> Table::all/std::string Table::all/'
refuses result_changed 'Table::all()'
