// A second lexical analyser, written in the simplest way: one character at a time from a stream,
// whose position is asked for after each. Slow, and compared with the library's token for token.

#ifndef LIBSCHEMA_TESTS_REFERENCE_LEXER_H
#define LIBSCHEMA_TESTS_REFERENCE_LEXER_H

#include <fstream>
#include <string>
#include <vector>

class ReferenceLexer {
 public:
  explicit ReferenceLexer(const std::string& path);

  int lexan();
  void match(int expected);

  int currentToken() const { return m_current; }
  int valueIndex() const { return m_index; }
  int line() const { return m_line; }
  std::string text() const;

 private:
  struct Symbol {
    std::string text;
    int token;
  };

  bool readNext();
  int endBetweenTokens();
  int number();
  int word();
  int found(int index);
  int indexOf(const std::string& text) const;
  int store(const std::string& text, int token);

  std::ifstream m_in;
  std::streamoff m_position = 0;
  char m_c = '\0';
  int m_current = -1;
  int m_index = -1;
  int m_line = 1;
  std::vector<Symbol> m_symbols;  // the keywords and, once there was one, the scratch entry
};

#endif  // LIBSCHEMA_TESTS_REFERENCE_LEXER_H
