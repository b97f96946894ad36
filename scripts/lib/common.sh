# What the commands of this project share. Sourced, with the root of the project as current folder.
# shellcheck shell=bash

# fail TEXT...: the text to standard error, and the end.
fail() {
  printf '%s\n' "$*" >&2
  exit 1
}

# step TITLE COMMAND...: runs the command with its output kept back; when it fails, shows the end of
# the output and gives up.
step() {
  local title=$1 log status=0
  shift
  printf '%s\n' "$title"
  log=$(mktemp)
  "$@" >"$log" 2>&1 </dev/null || status=$?
  if [ "$status" -ne 0 ]; then
    tail -n 200 "$log" >&2
    rm -f "$log"
    fail "failed with status $status: $*"
  fi
  rm -f "$log"
}

# build_preset PRESET FOLDER [CMAKE OPTION...]: configures and builds everything in FOLDER.
build_preset() {
  local preset=$1 folder=$2
  shift 2
  step "Configuring $folder" cmake --preset "$preset" -B "$folder" "$@"
  step "Building $folder" cmake --build "$folder" -j "$(nproc)"
}
