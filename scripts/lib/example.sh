# The way of the example installation to its new release. Sourced, with the root of the project as current
# folder.
# shellcheck shell=bash

# shown COMMAND...: prints the command and runs it.
shown() {
  printf '\n$ %s\n' "$*"
  "$@"
}

# migrate_example TOOL FOLDER: plans, migrates and verifies in the folder, which it makes.
migrate_example() {
  local tool=$1 folder=$2
  local inputs=(--base examples/base --from examples/old --to examples/new
    --exclude-oids examples/excluded-oids.txt --withdraw examples/withdraw-oids.txt
    --decisions examples/decisions.toml)
  mkdir -p "$folder"
  shown "$tool" plan "${inputs[@]}" --save "$folder/plan.json"
  shown "$tool" migrate --plan "$folder/plan.json" --out "$folder/migrated" --record "$folder/ticket" \
    --html "$folder/migrated.html"
  shown "$tool" verify --plan "$folder/plan.json" "$folder/migrated"
  cat <<END

The migrated schema:         $folder/migrated
What came of it, to browse:  $folder/migrated.html
For the change ticket:       $folder/ticket
The plan that was verified:  $folder/plan.json
What the example shows:      examples/README.md
An upgrade step by step:     docs/guide.md
END
}
