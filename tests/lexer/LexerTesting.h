// What the tests of the lexical analyser share.

#ifndef LIBSCHEMA_TESTS_LEXER_TESTING_H
#define LIBSCHEMA_TESTS_LEXER_TESTING_H

#include <unistd.h>
#include <csignal>
#include <string>

#include "SchemaLexan.h"

namespace lexertesting {

// The directory in which inputFile() writes; it lives as long as the program.
const std::string& inputDirectory();
constexpr char kInputName[] = "V3.user.at";

// Writes `text` to the one input file of the program and returns its path.
std::string inputFile(const std::string& text);

// An analyser over `text`, whose members a test can see and set.
class OpenLexer : public SchemaLexan {
 public:
  explicit OpenLexer(const std::string& text);
  OpenLexer(const std::string& directory, const std::string& name) : SchemaLexan(directory, name) {}

  CSymbolTable* table() { return m_symtable; }
  // Deletes the table, as if there had never been one.
  void dropTable() {
    delete m_symtable;
    m_symtable = nullptr;
  }
  void setCurrentToken(int token) { m_lookahead = token; }
  bool inputIsAtEnd() { return m_input.eof(); }

  // The text of the current token; "" when it has none.
  std::string text();
};

// Every token up to the end, blank-separated: code, or code:text for names and numbers. The closing
// 260 is included.
std::string tokensOf(const std::string& text);

// The same with "@" and the line number behind each token.
std::string linesOf(const std::string& text);

// The same with "#" and the value index and "=" and the current token behind each token, which are
// read after lexan() returned.
std::string stateOf(const std::string& text);

// Text with unprintable bytes shown as \xNN, for messages.
std::string printable(const std::string& text);

// Ends the program by a signal when the test lasts longer.
class Deadline {
 public:
  explicit Deadline(unsigned seconds) { ::alarm(seconds); }
  ~Deadline() { ::alarm(0); }
  Deadline(const Deadline&) = delete;
  Deadline& operator=(const Deadline&) = delete;
};

}  // namespace lexertesting

#endif  // LIBSCHEMA_TESTS_LEXER_TESTING_H
