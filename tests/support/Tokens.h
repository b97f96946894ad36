// Tokens as text, for the tests of the lexical analyser and of the definitions.

#ifndef LIBSCHEMA_TESTS_TOKENS_H
#define LIBSCHEMA_TESTS_TOKENS_H

#include <memory>
#include <string>

#include "Files.h"
#include "SchemaLexan.h"

namespace support {

// An analyser over a schema file with the given bytes. The file has no name any more, so that a
// process that ends without destructors leaves nothing behind.
class LexedText {
 public:
  explicit LexedText(const std::string& text);

  SchemaLexan& lexer() { return *m_lexer; }

  // Reads to the end and returns the tokens, blank-separated: code, or code:text for the tokens
  // that have a text of their own (259, 2024, 2025, 2026). The closing 260 is included.
  std::string rest();

 private:
  std::unique_ptr<SchemaLexan> m_lexer;
};

// The text of the analyser's current token; "" when it has none.
std::string currentText(SchemaLexan* lexer);

// Reads one definition from `text`, which starts at the token before "(" (usually "="), the way the
// file reader calls parse(). Returns what parse() returned.
template <typename Definition>
int parseText(const std::string& text, Definition* definition) {
  LexedText input(text);
  // The reader has read the token after the keyword; match() is the way to make it current.
  input.lexer().lexan();
  return definition->parse(&input.lexer()) ? 1 : 0;
}

// The line that dump(std::ofstream&) writes.
template <typename Definition>
std::string lineOf(Definition* definition) {
  TemporaryDirectory directory;
  const std::string path = directory.file("line");
  std::ofstream out(path);
  definition->dump(out);
  out.close();
  return readWholeFile(path);
}

}  // namespace support

#endif  // LIBSCHEMA_TESTS_TOKENS_H
