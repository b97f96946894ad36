# Makes the comments of a header such that Doxygen takes them. In these headers a comment holds for all
# declarations up to the next comment or empty line; one behind a declaration is about that alone; and the
# one at the top is about the file and the class of its name. Lines keep their numbers.

function escaped(text) {
  gsub(/\\/, "\\\\", text)
  gsub(/@/, "\\@", text)
  gsub(/</, "\\<", text)
  gsub(/#/, "\\#", text)
  return text
}

function indentation(line) {
  match(line, /^ */)
  return RLENGTH
}

# The comment that a declaration without one of its own gets.
function shared(line) {
  if (group != "" && indentation(line) == depth) return group
  if (line ~ "^(class|struct) " name "( |$)" && top != "") return top
  if (line ~ /^ *[A-Za-z:]+\(const [A-Za-z]+&\)( = default)?;$/) return "Copies the other one."
  if (line ~ /operator=\(const [A-Za-z]+&\)( = default)?;$/) return "Becomes a copy of the other one."
  if (line ~ /^ *[A-Za-z:]+\([A-Za-z]+&&\)( noexcept)?( = default)?;$/)
    return "Takes what the other one has, which can only be destroyed or assigned to then."
  if (line ~ /operator=\([A-Za-z]+&&\)( noexcept)?( = default)?;$/)
    return "Takes what the other one has, which can only be destroyed or assigned to then."
  if (line ~ /^ +[A-Za-z][A-Za-z0-9_:<>,&* ]* [a-zA-Z_0-9]+( = .*|\{.*\})?;$/ && line !~ /^ +(using|return|struct|class|enum) /) return said(line)
  return ""
}

# The words of a member's name.
function said(line,  word) {
  sub(/( = .*|\{.*\})?;$/, "", line)
  sub(/.* /, "", line)
  sub(/^m_/, "", line)
  word = line
  line = ""
  while (match(word, /[A-Z][a-z]/)) {
    line = line substr(word, 1, RSTART - 1) " " tolower(substr(word, RSTART, 1))
    word = substr(word, RSTART + 1)
  }
  return toupper(substr(line word, 1, 1)) substr(line word, 2) "."
}

FNR == 1 {
  name = FILENAME
  sub(/.*\//, "", name)
  sub(/\.h$/, "", name)
  inTop = 1
  starts = 1
}

inTop && /^$/ { print "/// @file"; inTop = 0; next }
inTop { text = $0; sub(/^\/\/ ?/, "", text); top = top " " escaped(text); print "/// " escaped(text); next }

/^ *\/\/ ----/ { print; group = ""; next }

# The second line of a comment behind a declaration.
wasBehind && /^ {9,}\/\/ / {
  text = $0
  sub(/^ *\/\/ ?/, "", text)
  print "  ///< " escaped(text)
  next
}

/^ *\/\/( |$)/ {
  wasBehind = 0
  text = $0
  sub(/^ *\/\/ ?/, "", text)
  if (!inComment) group = ""
  group = group " " escaped(text)
  depth = indentation($0)
  inComment = 1
  print substr($0, 1, depth) "/// " escaped(text)
  next
}

/^ *$/ { group = ""; starts = 1; print; next }

{
  code = $0
  behind = ""
  if (match(code, /  \/\/ /)) {
    behind = "  ///< " escaped(substr(code, RSTART + 5))
    code = substr(code, 1, RSTART - 1)
    sub(/ +$/, "", code)
  }
  before = ""
  if (!inComment && starts && code ~ /[A-Za-z]/ && code !~ /^ *(public|private|protected|friend|#|namespace|\})/) {
    before = shared(code)
    if (before != "") before = "/** " before " */ "
  }
  inComment = 0
  wasBehind = behind != ""
  starts = code ~ /[;{}]$|:$/
  if (code ~ /^ *(class|struct|enum|namespace) .*[{]$/) group = ""
  print before code behind
}
