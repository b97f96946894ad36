#include "ReferenceParsers.h"

#include <gtest/gtest.h>

#include <cstddef>
#include <fstream>
#include <random>
#include <string>
#include <vector>

#include "Attribute.h"
#include "Files.h"
#include "ORVAttribute.h"
#include "ObjectClass.h"
#include "SchemaLexan.h"

namespace {

using definitions::TokenTape;
using Words = std::vector<std::string>;

// What the sequences of one kind are made of.
struct Vocabulary {
  Words keywords;  // those that mean something to the kind
  Words complete;  // a whole definition
};

const Words kValues = {"a",
                       "b",
                       "B",
                       "'c d'",
                       "''",
                       "1.2",
                       "3.4",
                       "3.4{5}",
                       "3.4 {6}",
                       "3.4{",
                       "'3.4'",
                       "X-y",
                       "'a b",
                       "0",
                       "objectClasses",
                       "attributeTypes",
                       "ORVattributeTypes"};
const Words kMarks = {"(", ")", "(", ")",  ")",   "$",   "}",
                      "{", "=", ",", "\n", "\n(", ")\n", "# c )\n"};
const Words kAllKeywords = {"objectclasses",
                            "NAME",
                            "DESC",
                            "SUP",
                            "AUXILIARY",
                            "MUST",
                            "MAY",
                            "STRUCTURAL",
                            "attributetypes",
                            "EQUALITY",
                            "SYNTAX",
                            "SINGLE-VALUE",
                            "USAGE",
                            "NO-USER-MODIFICATION",
                            "ORVAttributetypes",
                            "ACCESS-CLASS",
                            "DBNAME",
                            "SUBSTR",
                            "REVERSE",
                            "ORDERING",
                            "COLLECTIVE",
                            "OBSOLETE",
                            "ABSTRACT",
                            "LENGTH",
                            "APPROX"};

const Vocabulary kAttributeWords = {
    {"NAME", "DESC", "SUP", "EQUALITY", "ORDERING", "SUBSTR", "SYNTAX", "USAGE", "SINGLE-VALUE",
     "OBSOLETE", "NO-USER-MODIFICATION"},
    {"=",
     "(",
     "1.2",
     "NAME",
     "(",
     "'a'",
     "'b'",
     ")",
     "DESC",
     "'d e'",
     "OBSOLETE",
     "SUP",
     "s",
     "EQUALITY",
     "e",
     "ORDERING",
     "o",
     "SUBSTR",
     "1.5",
     "SYNTAX",
     "1.6{7}",
     "SINGLE-VALUE",
     "NO-USER-MODIFICATION",
     "USAGE",
     "u",
     ")"}};

const Vocabulary kObjectClassWords = {
    {"NAME", "DESC", "SUP", "MUST", "MAY", "MUST", "MAY", "OBSOLETE", "STRUCTURAL", "AUXILIARY",
     "ABSTRACT"},
    {"=",   "(", "1.2", "NAME", "(", "'a'", "'b'",       ")",    "DESC", "'d e'", "OBSOLETE",
     "SUP", "(", "s",   "$",    "t", ")",   "AUXILIARY", "MUST", "(",    "m",     "$",
     "n",   ")", "MAY", "(",    "o", "$",   "p",         ")",    ")"}};

const Vocabulary kORVAttributeWords = {
    {"DBNAME", "DBNAME", "ACCESS-CLASS", "LENGTH", "EQUALITY", "ORDERING", "SUBSTR", "APPROX",
     "REVERSE"},
    {"=", "(", "1.2", "DBNAME", "(", "'a'", "'b'", ")", "ACCESS-CLASS", "critical", "LENGTH", "25",
     "EQUALITY", "ORDERING", "SUBSTR", "APPROX", "REVERSE", ")"}};

// Small token sequences, the same ones for the same seed.
class Sequences {
 public:
  Sequences(const Vocabulary& vocabulary, unsigned seed) : m_words(vocabulary), m_engine(seed) {}

  std::string next() {
    Words words = below(2) == 0 ? freeSequence() : changedDefinition();
    std::string text;
    for (const std::string& word : words) {
      text += (text.empty() ? "" : oneOf({" ", " ", " ", " ", "\n", "\t ", "", " "})) + word;
    }
    return text + oneOf({"\n", "\n", " ", ""});
  }

 private:
  std::size_t below(std::size_t bound) { return m_engine() % bound; }
  std::string oneOf(const Words& words) { return words[below(words.size())]; }

  std::string anyWord() {
    switch (below(10)) {
      case 0:
        return oneOf(kAllKeywords);
      case 1:
      case 2:
      case 3:
        return oneOf(m_words.keywords);
      case 4:
      case 5:
      case 6:
        return oneOf(kMarks);
      default:
        return oneOf(kValues);
    }
  }

  Words freeSequence() {
    Words words = below(5) == 0 ? Words{anyWord()} : Words{oneOf({"=", "=", "{"}), "("};
    for (std::size_t count = below(14); count > 0; --count) {
      words.push_back(anyWord());
    }
    return words;
  }

  Words changedDefinition() {
    Words words = m_words.complete;
    if (below(2) == 0) {
      words.insert(words.end(), words.begin(), words.end());
    }
    for (std::size_t count = below(4); count > 0; --count) {
      const std::size_t at = below(words.size());
      switch (below(3)) {
        case 0:
          words.erase(words.begin() + static_cast<std::ptrdiff_t>(at));
          break;
        case 1:
          words.insert(words.begin() + static_cast<std::ptrdiff_t>(at), anyWord());
          break;
        default:
          words[at] = anyWord();
      }
    }
    return words;
  }

  const Vocabulary& m_words;
  std::mt19937 m_engine;
};

// "RESULT on CODE line N: LINE": one definition, read and written.
std::string described(int result, int current, int lineNumber, const std::string& line) {
  return std::to_string(result) + " on " + std::to_string(current) + " line " +
         std::to_string(lineNumber) + ": " + line;
}

// Up to three definitions in a row, as in a block, and the tokens left over. Stops before the first
// one that never completes; `count` is the number of definitions that did.
template <typename Reference>
std::string readByReference(SchemaLexan* lexer, int* count) {
  TokenTape tape(definitions::recordTokens(lexer));
  tape.lexan();
  std::string outcome;
  for (*count = 0; *count < 3; ++*count) {
    Reference definition;
    const int result = definition.parse(&tape);
    if (result == definitions::kEndless) {
      return outcome;
    }
    outcome += described(result, tape.current(), tape.line(), definition.line());
  }
  return outcome + tape.rest();
}

template <typename Definition>
std::string readByLibrary(SchemaLexan* lexer, int count) {
  lexer->lexan();
  std::string outcome;
  for (int i = 0; i < count; ++i) {
    Definition definition;
    const int result = definition.parse(lexer) ? 1 : 0;
    std::string line;
    definition.appendLine(&line);
    outcome += described(result, lexer->getCurrentToken(), lexer->getLineNumber(), line);
  }
  return count == 3 ? outcome + TokenTape(definitions::recordTokens(lexer)).rest() : outcome;
}

// Compares the two parsers over `sequences` texts. Enough of them must complete, with either
// result.
template <typename Definition, typename Reference>
void compare(const Vocabulary& vocabulary, int sequences) {
  Sequences source(vocabulary, 20010203);
  const support::TemporaryDirectory directory;
  int completed = 0;
  int succeeded = 0;
  for (int i = 0; i < sequences; ++i) {
    const std::string text = source.next();
    std::ofstream(directory.file("V3.user.at")) << text;
    SchemaLexan recorded(directory.path(), "V3.user.at");
    int count = 0;
    const std::string expected = readByReference<Reference>(&recorded, &count);
    if (count == 0) {
      continue;
    }
    SchemaLexan lexer(directory.path(), "V3.user.at");
    ASSERT_EQ(readByLibrary<Definition>(&lexer, count), expected) << text;
    completed += 1;
    succeeded += expected[0] == '1' ? 1 : 0;
  }
  EXPECT_GT(completed, sequences / 2);
  EXPECT_GT(succeeded, completed / 8);
  EXPECT_GT(completed - succeeded, completed / 8);
}

constexpr int kSequences = 4000;

TEST(ReferenceParsers, AttributeTypesAgree) {
  compare<Attribute, definitions::ReferenceAttribute>(kAttributeWords, kSequences);
}

TEST(ReferenceParsers, ObjectClassesAgree) {
  compare<ObjectClass, definitions::ReferenceObjectClass>(kObjectClassWords, kSequences);
}

TEST(ReferenceParsers, VendorExtensionsAgree) {
  compare<ORVAttribute, definitions::ReferenceORVAttribute>(kORVAttributeWords, kSequences);
}

}  // namespace
