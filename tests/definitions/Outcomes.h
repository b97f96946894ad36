// What parse() did, as text, for the tables of the definition tests.

#ifndef LIBSCHEMA_TESTS_OUTCOMES_H
#define LIBSCHEMA_TESTS_OUTCOMES_H

#include <gtest/gtest.h>

#include <initializer_list>
#include <string>
#include <vector>

#include "Files.h"
#include "Tokens.h"

namespace definitions {

// One row of a parse table: the input from the token before "(" on, and outcomeOf() it.
struct ParseCase {
  const char* rule;
  std::string input;
  std::string outcome;
};

// The line that dump(std::ofstream&) writes, without its line end.
template <typename Definition>
std::string bareLineOf(Definition* definition) {
  std::string line = support::lineOf(definition);
  if (line.empty() || line.find('\n') != line.size() - 1) {
    return line + "<not one line>";
  }
  line.pop_back();
  return line;
}

// "RESULT LINE": what parse() returned and the line written of what it left in the definition.
template <typename Definition>
std::string outcomeOf(const std::string& text) {
  Definition definition;
  const int result = support::parseText(text, &definition);
  return std::to_string(result) + " " + bareLineOf(&definition);
}

// "RESULT on CODE line N then TOKENS": what parse() returned, the current token and the line number
// afterwards, and the tokens that are still to come.
template <typename Definition>
std::string standingAfter(const std::string& text) {
  support::LexedText input(text);
  input.lexer().lexan();
  Definition definition;
  const int result = definition.parse(&input.lexer()) ? 1 : 0;
  const std::string current = std::to_string(input.lexer().getCurrentToken());
  const std::string line = std::to_string(input.lexer().getLineNumber());
  return std::to_string(result) + " on " + current + " line " + line + " then " + input.rest();
}

template <typename Definition>
void expectOutcomes(std::initializer_list<ParseCase> cases) {
  for (const ParseCase& row : cases) {
    SCOPED_TRACE(std::string(row.rule) + ": " + row.input);
    EXPECT_EQ(outcomeOf<Definition>(row.input), row.outcome);
  }
}

template <typename Definition>
void expectStanding(std::initializer_list<ParseCase> cases) {
  for (const ParseCase& row : cases) {
    SCOPED_TRACE(std::string(row.rule) + ": " + row.input);
    EXPECT_EQ(standingAfter<Definition>(row.input), row.outcome);
  }
}

// The definition that `text` holds; parse() must return 1.
template <typename Definition>
Definition parsed(const std::string& text) {
  Definition definition;
  EXPECT_EQ(support::parseText(text, &definition), 1) << text;
  return definition;
}

// `text` with its only `from` replaced.
inline std::string replaced(std::string text, const std::string& from, const std::string& to) {
  const std::size_t at = text.find(from);
  EXPECT_NE(at, std::string::npos) << from;
  EXPECT_EQ(text.find(from, at + 1), std::string::npos) << from;
  return at == std::string::npos ? text : text.replace(at, from.size(), to);
}

// A token as a value after a clause keyword: its name in the tables, how it is written, its text.
struct ValueKind {
  const char* name;
  const char* written;
  const char* text;
};

// One of each kind. "filler" is a keyword without a meaning in the definition under test.
inline const std::vector<ValueKind>& valueKinds() {
  static const std::vector<ValueKind> kinds = {
      {"word", "some_word", "some_word"},
      {"quoted", "'a b,c'", "a b,c"},
      {"number", "3.4", "3.4"},
      {"length", "3.4 {5}", "3.4{5}"},
      {"bad-length", "3.4{ ", "3.4{"},
      {"objectclasses", "objectClasses", "objectclasses"},
      {"attributetypes", "'attributeTypes'", "attributetypes"},
      {"orvattributetypes", "ORVattributeTypes", "ORVAttributetypes"},
      {"filler", nullptr, nullptr},
      {"character", "$", ""},
  };
  return kinds;
}

// What a clause does with the kinds of token that may follow its keyword.
struct ClauseCase {
  const char* clause;
  std::string taken;        // the kinds whose text is taken, blank-separated
  std::string whenTaken;    // the outcome, with "@" for the text
  std::string whenDropped;  // the outcome when the token is dropped
};

// Puts each kind of token into `frame`, which has "#" for the clause and its value.
template <typename Definition>
void expectClauses(const std::string& frame, const char* filler,
                   std::initializer_list<ClauseCase> cases) {
  for (const ClauseCase& row : cases) {
    for (const ValueKind& kind : valueKinds()) {
      const std::string written = kind.written == nullptr ? filler : kind.written;
      const std::string text = kind.text == nullptr ? filler : kind.text;
      const bool isTaken =
          (" " + row.taken + " ").find(" " + std::string(kind.name) + " ") != std::string::npos;
      const std::string input = replaced(frame, "#", std::string(row.clause) + " " + written);
      SCOPED_TRACE(std::string(row.clause) + " with a " + kind.name + ": " + input);
      EXPECT_EQ(outcomeOf<Definition>(input),
                isTaken ? replaced(row.whenTaken, "@", text) : row.whenDropped);
    }
  }
}

}  // namespace definitions

#endif  // LIBSCHEMA_TESTS_OUTCOMES_H
