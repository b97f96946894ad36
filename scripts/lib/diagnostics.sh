# The diagnostic files of the library, which have fixed names. Sourced after common.sh.
# shellcheck shell=bash

readonly diagnostic_files=(/tmp/attr.txt /tmp/orvattr.txt /tmp/objectclass.txt /tmp/lexan.txt
                           /tmp/table.txt)

# remove_diagnostics: takes them away, for the tests to begin and to end without any; those of another
# user would be in the way of the tests' own.
remove_diagnostics() {
  local file
  for file in "${diagnostic_files[@]}"; do
    rm -f -- "$file" 2>/dev/null ||
      fail "$file is in the way of the tests and cannot be removed: $(ls -ld -- "$file")"
  done
}
