# Reads lines "FILE:#include …" of all sources, after one line "FILE" for each header, and prints every
# include that points to a higher floor, or to a header of another library by its bare name.
#
#   0 src/platform
#   1 libschema's trace points      2 its lexical analyser    3 its definitions    4 its manager
#   5 libmigration/text             6 output    7 model       8 rules              9 plan
#  10 tools: installed headers only

function floor_of(path) {
  if (path ~ /^src\/platform\//) return 0
  if (path ~ /^src\/libraries\/libschema\//) {
    if (path ~ /\/(TracePoints|DiagnosticFile|StandardOutput)\./) return 1
    if (path ~ /\/(SchemaLexan|PlacedLexan|SchemaSymbolTable|SchemaTokens|TokenScanner|ByteClasses|Keywords|LexerTable|StreamInput)\./) return 2
    if (path ~ /\/(ORVSchema|Attribute|ObjectClass|ORVAttribute|ClauseShapes|CaseFolding)\./) return 3
    return 4
  }
  if (path ~ /^src\/libraries\/libmigration\/text\//) return 5
  if (path ~ /^src\/libraries\/libmigration\/output\//) return 6
  if (path ~ /^src\/libraries\/libmigration\/model\//) return 7
  if (path ~ /^src\/libraries\/libmigration\/rules\//) return 8
  if (path ~ /^src\/libraries\/libmigration\/plan\//) return 9
  return 10
}

function library_of(path,   parts) {
  split(path, parts, "/")
  return parts[2] == "libraries" ? parts[3] : parts[2]
}

# What a file of `library` means by the bare name: a header of its own library, of libschema's, of the
# platform.
function bare(library, name) {
  if ((library, name) in headers) return headers[library, name]
  if (("libschema", name) in headers) return headers["libschema", name]
  return headers["platform", name]
}

function complain(text) {
  print file ": " text
  wrong = 1
}

!/#[ \t]*include/ {
  name = $0
  sub(/.*\//, "", name)
  headers[library_of($0), name] = $0
  next
}

{
  file = substr($0, 1, index($0, ":") - 1)
  library = library_of(file)
  if (!match($0, /[<"][^>"]*/)) next
  isBare = substr($0, RSTART, 1) == "\""
  name = substr($0, RSTART + 1, RLENGTH - 1)
  if (isBare) {
    header = bare(library, name)
  } else if (name ~ /^libschema\//) {
    header = bare("libschema", substr(name, 11))
  } else if (name ~ /^libschema-migration\//) {
    header = headers["libmigration", substr(name, 21)]
  } else {
    next
  }
  if (header == "") {
    complain("includes " name ", which is nowhere")
  } else if (floor_of(header) > floor_of(file)) {
    complain("includes " header ", which is above it")
  } else if (isBare && library_of(header) != library && (library == "tools" || library == "libmigration")) {
    complain("includes " header ", which is of another library, by its bare name")
  }
}

END { exit wrong }
