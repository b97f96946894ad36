#!/usr/bin/env bash
# plain.sh build|suite|callers: the project in the folder BUILD over the platform of plain/, by
# LIBSCHEMA_PLATFORM.
#   build    builds the platform, the library and the library's tests; folders that lack something are
#            refused as a platform
#   suite    runs the library's tests
#   callers  installs what a caller gets, and builds and runs its callers against that
# What of the tests is left to the platform, and so left out, is named in tests/CMakeLists.txt.

set -euo pipefail
here=$(cd "$(dirname "$0")" && pwd)
project=$here/../..
mkdir -p "$BUILD"
BUILD=$(cd "$BUILD" && pwd)
export CMAKE=${CMAKE:-cmake} CXX=${CXX:-c++}

# The library's tests, by their folders.
readonly groups=(definitions interface golden lexer manager operations peer platform properties trace)

# refuses FOLDER TEXT: as a platform the folder is refused with this text. CMake breaks its lines.
refuses() {
  local said
  if said=$("$CMAKE" -S "$project" -B "$BUILD/refused" -DLIBSCHEMA_PLATFORM="$1" 2>&1) ||
    ! tr -s '\n' ' ' <<<"$said" | tr -s ' ' | grep -qF "$2"; then
    printf 'Not refused with "%s":\n%s\n' "$2" "$said" >&2
    exit 1
  fi
}

build_platform() {
  rm -rf "$BUILD/platform" "$BUILD/refused" "$BUILD/half"
  "$CMAKE" -S "$here/plain" -B "$BUILD/platform-build" -G Ninja -DCMAKE_CXX_COMPILER="$CXX"
  "$CMAKE" --build "$BUILD/platform-build"
  "$CMAKE" --install "$BUILD/platform-build" --prefix "$BUILD/platform"
}

check_refusals() {
  mkdir -p "$BUILD/half"
  refuses "$BUILD/half" "no ldtr.h in $BUILD/half"
  cp -r "$BUILD/platform/include" "$BUILD/half"
  refuses "$BUILD/half" "no library in $BUILD/half"
  rm -r "$BUILD/half" "$BUILD/refused"
}

# Without debug information, which would take as long again.
build_tests() {
  "$CMAKE" -S "$project" --preset dev -B "$BUILD/project" -DLIBSCHEMA_PLATFORM="$BUILD/platform" \
    -DBUILD_TESTING=ON -DCMAKE_CXX_FLAGS_DEBUG=-O1 -DCMAKE_CXX_COMPILER="$CXX"
  local targets=("${groups[@]/#/tests/}")
  "$CMAKE" --build "$BUILD/project" -j "$(nproc)" --target "${targets[@]/%//all}"
}

# The programs of a folder begin with its name.
run_tests() {
  ctest --test-dir "$BUILD/project" --output-on-failure --no-tests=error --stop-on-failure \
    -j "$(nproc)" -R "^($(IFS='|' && printf '%s' "${groups[*]}"))[a-z_]*\\."
}

install_package() {
  "$CMAKE" --build "$BUILD/project" -j "$(nproc)" --target \
    src/libraries/libschema/all src/libraries/libmigration/all src/tools/schema-migrate/all docs/man/all
  rm -rf "$BUILD/installed"
  "$CMAKE" --install "$BUILD/project" --prefix "$BUILD/installed"
  # The server's own take the place of these.
  local stand_ins
  stand_ins=$(find "$BUILD/installed" -name '*schema-platform*' -o -name ldtr.h -o -name timestamp.h \
    -o -name CSymbolTable.h -o -name Clex_analyzer.h)
  if [ -n "$stand_ins" ]; then
    printf 'Installed over a server'"'"'s own platform:\n%s\n' "$stand_ins" >&2
    exit 1
  fi
}

# check_callers find_package|pkg_config shared|static
check_callers() {
  PREFIX=$BUILD/installed WORK=$BUILD/callers PLATFORM=$BUILD/platform "$here/../package/consumer.sh" "$@"
}

case $1 in
  build)
    build_platform
    check_refusals
    build_tests
    ;;
  suite)
    run_tests
    ;;
  callers)
    install_package
    "$BUILD/installed/bin/schema-migrate" --version
    check_callers find_package shared
    check_callers find_package static
    check_callers pkg_config shared
    ;;
  *)
    printf 'plain.sh: %s?\n' "$1" >&2
    exit 2
    ;;
esac
