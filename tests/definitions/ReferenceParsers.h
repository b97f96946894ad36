// A second parser for each kind of definition, written step by step and independent of the
// library's: it works on a list of recorded tokens and tells a parse that never completes.

#ifndef LIBSCHEMA_TESTS_REFERENCE_PARSERS_H
#define LIBSCHEMA_TESTS_REFERENCE_PARSERS_H

#include <cstddef>
#include <string>
#include <utility>
#include <vector>

#include "SchemaLexan.h"

namespace definitions {

struct RecordedToken {
  int code;
  std::string text;  // what the analyser gives as the text of the token, "" for none
  int line;          // the line number once the token is read
};

// Every token from `lexer`, or of `text`, the closing TOKEN_END included.
std::vector<RecordedToken> recordTokens(SchemaLexan* lexer);
std::vector<RecordedToken> recordTokens(const std::string& text);

// Plays recorded tokens with the analyser's rules for its current token.
class TokenTape {
 public:
  explicit TokenTape(std::vector<RecordedToken> tokens) : m_tokens(std::move(tokens)) {}

  // The end of the input is returned again and again; the current token stays what it was.
  int lexan();

  // Consumes the current token if it is `expected`; here the end of the input becomes current.
  void match(int expected);

  int current() const { return m_current; }
  const std::string& text() const { return m_tokens[m_read - 1].text; }
  int line() const { return m_tokens[m_read - 1].line; }

  // The tokens not read yet, as LexedText::rest() writes them.
  std::string rest() const;

 private:
  std::vector<RecordedToken> m_tokens;
  std::size_t m_read = 0;
  int m_current = -1;
};

// What parse() of the reference parsers returns beside 0 and 1.
constexpr int kEndless = -1;

class ReferenceAttribute {
 public:
  int parse(TokenTape* lexer);
  std::string line() const;

 private:
  bool readClause(TokenTape* lexer, int* token);
  bool readNames(TokenTape* lexer, int* token);

  std::vector<std::string> m_names;
  std::string m_oid;
  std::string m_description;
  std::vector<std::string> m_superiors;
  bool m_obsolete = false;
  std::string m_equality;
  std::string m_usage = "userApplications";
  std::string m_syntax;
  std::string m_ordering;
  std::string m_substr;
  bool m_singleValue = false;
  bool m_userModification = true;
};

class ReferenceObjectClass {
 public:
  int parse(TokenTape* lexer);
  std::string line() const;

 private:
  bool readClause(TokenTape* lexer, int* token);
  static int readList(TokenTape* lexer, std::vector<std::string>* list);

  std::vector<std::string> m_names;
  std::string m_oid;
  std::string m_description;
  std::vector<std::string> m_superiors;
  bool m_obsolete = false;
  std::string m_kind = "STRUCTURAL";
  std::vector<std::string> m_required;
  std::vector<std::string> m_optional;
};

class ReferenceORVAttribute {
 public:
  int parse(TokenTape* lexer);
  std::string line() const;

 private:
  bool readClause(TokenTape* lexer, int* token);
  bool readDatabaseNames(TokenTape* lexer, int* token);

  std::string m_oid;
  std::vector<std::string> m_databaseNames;
  std::string m_access = "normal";
  std::string m_length = "0";
  bool m_equality = false;
  bool m_ordering = false;
  bool m_substr = false;
  bool m_approx = false;
  bool m_reverse = false;
  bool m_ended = false;
};

}  // namespace definitions

#endif  // LIBSCHEMA_TESTS_REFERENCE_PARSERS_H
