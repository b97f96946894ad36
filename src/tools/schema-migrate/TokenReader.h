// The tokens of a schema file exactly as the library's lexical analyser returns them, with the
// place where each begins. The library tells the line only, and not of every newline: hence a
// tokeniser of its own here. It holds a buffer, and the texts of the last two words.

#ifndef SCHEMA_MIGRATE_TOKEN_READER_H
#define SCHEMA_MIGRATE_TOKEN_READER_H

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "InputFile.h"
#include "Messages.h"

class TokenReader {
 public:
  // Over a file, which must stay open, or over a text, which must stay in place.
  explicit TokenReader(InputFile* file);
  explicit TokenReader(std::string_view text);

  // Reads the next token and returns its code, as SchemaLexan does: at the end of the input
  // TOKEN_END, in place of a word or number behind which no character stands too.
  int lexan();

  // Makes the next token the current one, the end included, if the current one is `expected`.
  void match(int expected);

  // The current token. The end that lexan() met does not become the current token.
  int currentToken() const { return m_current; }

  // Where the token last read begins.
  const Position& position() const { return m_position; }

  // The first quoted string since the last call that something else than a quote ended: where it
  // begins, and what ended it. Returns false when there is none.
  bool takeBrokenString(Position* begin, std::string* end);

  // The line as the library counts it. A newline that ends a quoted string does not count.
  std::uint64_t countedLine() const { return m_countedLine; }

  // The text of the last word, quoted string or number; for other tokens it means nothing.
  const std::string& text() const { return m_textIsStored ? m_stored : m_text; }

  // The length of the longest of these texts so far.
  std::size_t longestText() const { return m_longestText; }

 private:
  bool refill();
  bool read(char* c);
  void putBack();
  bool skipToToken(char* c);
  int readToken(char c);
  int readNumber(char c);
  int readWord(char c);
  int readQuoted(char c);
  void noteBrokenString(const std::string& end);
  int lookUp(int token);

  InputFile* m_file = nullptr;
  std::vector<char> m_buffer;
  const char* m_next = nullptr;
  const char* m_limit = nullptr;
  bool m_isAtEnd = false;

  // Place of the next character, as offsets.
  std::uint64_t m_offset = 0;
  std::uint64_t m_lineStart = 0;
  std::uint64_t m_line = 1;
  std::uint64_t m_previousLineStart = 0;

  Position m_position;
  Position m_brokenString;
  std::string m_brokenBy;  // empty when there is none
  std::uint64_t m_countedLine = 1;
  int m_current = -1;

  std::string m_text;
  std::string m_stored;  // the text that the library's symbol table holds besides the keywords
  std::size_t m_longestText = 0;
  int m_storedToken = 0;
  bool m_hasStored = false;
  bool m_textIsStored = false;
};

#endif  // SCHEMA_MIGRATE_TOKEN_READER_H
