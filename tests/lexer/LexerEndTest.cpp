// The end of the input: what is returned, what is lost, and the state that each way there leaves.

#include <gtest/gtest.h>

#include <ostream>
#include <string>

#include "LexerTesting.h"

namespace {

using lexertesting::OpenLexer;
using lexertesting::printable;
using lexertesting::stateOf;
using lexertesting::tokensOf;

// Each token is followed by "#" and its value index and "=" and the current token.
struct EndRow {
  const char* rule;
  std::string text;
  std::string states;
};

void PrintTo(const EndRow& row, std::ostream* out) { *out << printable(row.text); }

class End : public testing::TestWithParam<EndRow> {};

TEST_P(End, LeavesItsState) { EXPECT_EQ(stateOf(GetParam().text), GetParam().states); }

TEST_P(End, IsReturnedFromThenOnWithoutAnyChange) {
  OpenLexer lexer(GetParam().text);
  while (lexer.lexan() != 260) {
  }
  const int index = lexer.getTokenValIndex();
  const int current = lexer.getCurrentToken();
  const int line = lexer.getLineNumber();
  for (int i = 0; i < 3; ++i) {
    EXPECT_EQ(lexer.lexan(), 260);
    EXPECT_EQ(lexer.getTokenValIndex(), index);
    EXPECT_EQ(lexer.getCurrentToken(), current);
    EXPECT_EQ(lexer.getLineNumber(), line);
  }
}

TEST_P(End, IsStoredByMatch) {
  OpenLexer lexer(GetParam().text);
  do {
    lexer.match(lexer.getCurrentToken());
  } while (lexer.getCurrentToken() != 260);
  const int index = lexer.getTokenValIndex();
  const std::string expected = GetParam().states;
  const std::string last = "260#" + std::to_string(index) + "=";
  EXPECT_NE(expected.find(last), std::string::npos) << expected << " lacks " << last;
}

const EndRow kEnds[] = {
    // Between tokens: the value index goes, the current token stays.
    {"EmptyFile", "", "260#-1=-1"},
    {"OnlyBlanks", "   ", "260#-1=-1"},
    {"OnlyTabs", "\t\t", "260#-1=-1"},
    {"OnlyNewlines", "\n\n", "260#-1=-1"},
    {"OnlyAComment", "# c", "260#-1=-1"},
    {"OnlyAHash", "#", "260#-1=-1"},
    {"BehindABlank", "cn ", "259:cn#25=259 260#-1=259"},
    {"BehindABlankAndATab", "cn \t", "259:cn#25=259 260#-1=259"},
    {"BehindANewline", "cn\n", "259:cn#25=259 260#-1=259"},
    {"BehindABlankAndANewline", "NAME \n", "1003#1=1003 260#-1=1003"},
    {"BehindACommentWithoutALineEnd", "cn # c", "259:cn#25=259 260#-1=259"},
    {"BehindACommentWithALineEnd", "cn # c\n", "259:cn#25=259 260#-1=259"},
    {"BehindASingleCharacter", "cn )", "259:cn#25=259 41#-1=41 260#-1=41"},
    {"BehindAHighByte", "cn\x80", "259:cn#25=259 -128#-1=-128 260#-1=-128"},
    {"BehindANumberAndANewline", "1.2\n", "2024:1.2#25=2024 260#-1=2024"},
    {"BehindALengthAndABlank", "1{2} ", "2025:1{2}#25=2025 260#-1=2025"},
    {"BehindABadLengthAndABlank", "1{2 ", "2026:1{2#25=2026 260#-1=2026"},
    {"BehindAQuotedStringAndANewline", "'x'\n", "259:x#25=259 260#-1=259"},

    // In a number: it is lost, and both stay.
    {"NumberIsLost", "cn 1.2", "259:cn#25=259 260#25=259"},
    {"NumberIsLostBehindAKeyword", "NAME 1.2", "1003#1=1003 260#1=1003"},
    {"NumberIsLostBehindASingleCharacter", "( 1.2", "40#-1=40 260#-1=40"},
    {"NumberIsLostAtTheStart", "1.2", "260#-1=-1"},
    {"NumberIsLostWithItsBlanks", "cn 1.2   ", "259:cn#25=259 260#25=259"},
    {"NumberIsLostWithABrace", "cn 1.2{", "259:cn#25=259 260#25=259"},
    {"NumberIsLostWithABraceBehindABlank", "cn 1.2 {", "259:cn#25=259 260#25=259"},
    {"NumberIsLostWithAnOpenLength", "cn 1.2{32", "259:cn#25=259 260#25=259"},
    {"NumberIsLostWithItsLength", "cn 1.2{32}", "259:cn#25=259 260#25=259"},

    // In a word or quoted string: it is lost, and both stay.
    {"WordIsLost", "cn sn", "259:cn#25=259 260#25=259"},
    {"WordIsLostAtTheStart", "cn", "260#-1=-1"},
    {"HyphenIsLost", "cn -", "259:cn#25=259 260#25=259"},
    {"WordIsLostWithItsTab", "NAME cn\t", "1003#1=1003 260#1=1003"},
    {"KeywordIsLost", "( NAME", "40#-1=40 260#-1=40"},
    {"FoldedKeywordIsLost", "cn objectClasses", "259:cn#25=259 260#25=259"},
    {"TextOfTheScratchEntryIsLost", "cn cn", "259:cn#25=259 260#25=259"},
    {"QuotedStringIsLost", "cn 'x'", "259:cn#25=259 260#25=259"},
    {"QuotedKeywordIsLost", "cn 'NAME'", "259:cn#25=259 260#25=259"},
    {"EmptyQuotedStringIsLost", "cn ''", "259:cn#25=259 260#25=259"},
    {"UnclosedQuotedStringIsLost", "cn 'x y", "259:cn#25=259 260#25=259"},
    {"UnclosedQuotedStringIsLostWithItsLineEnd", "cn 'x y\n", "259:cn#25=259 260#25=259"},
    {"QuoteIsLost", "cn '", "259:cn#25=259 260#25=259"},
    {"QuotedStringIsLostWithAHighByte", "cn 'x\x80", "259:cn#25=259 260#25=259"},
};

INSTANTIATE_TEST_SUITE_P(All, End, testing::ValuesIn(kEnds),
                         [](const auto& row) { return std::string(row.param.rule); });

TEST(End, LostTextDoesNotReplaceTheScratchEntry) {
  OpenLexer lexer("cn sn");
  EXPECT_EQ(lexer.lexan(), 259);
  EXPECT_EQ(lexer.lexan(), 260);
  EXPECT_EQ(lexer.text(), "cn");
  EXPECT_EQ(lexer.table()->lookUpValue("sn"), -1);
}

TEST(End, EveryPrefixOfADefinitionLosesOnlyItsUnfinishedToken) {
  const std::string text = "attributetypes=( 2.5.4.3 NAME 'cn' SYNTAX 1.2 {64} )\n";
  const struct {
    std::size_t length;
    const char* tokens;
  } rows[] = {
      {13, "260"},
      {14, "260"},
      {15, "1010 61 260"},
      {16, "1010 61 40 260"},
      {17, "1010 61 40 260"},
      {24, "1010 61 40 260"},
      {25, "1010 61 40 260"},
      {26, "1010 61 40 2024:2.5.4.3 260"},
      {29, "1010 61 40 2024:2.5.4.3 260"},
      {30, "1010 61 40 2024:2.5.4.3 1003 260"},
      {34, "1010 61 40 2024:2.5.4.3 1003 260"},
      {35, "1010 61 40 2024:2.5.4.3 1003 259:cn 260"},
      {42, "1010 61 40 2024:2.5.4.3 1003 259:cn 1012 260"},
      {45, "1010 61 40 2024:2.5.4.3 1003 259:cn 1012 260"},
      {46, "1010 61 40 2024:2.5.4.3 1003 259:cn 1012 260"},
      {50, "1010 61 40 2024:2.5.4.3 1003 259:cn 1012 260"},
      {51, "1010 61 40 2024:2.5.4.3 1003 259:cn 1012 2025:1.2{64} 260"},
      {52, "1010 61 40 2024:2.5.4.3 1003 259:cn 1012 2025:1.2{64} 41 260"},
  };
  for (const auto& row : rows) {
    EXPECT_EQ(tokensOf(text.substr(0, row.length)), row.tokens) << row.length;
  }
}

}  // namespace
