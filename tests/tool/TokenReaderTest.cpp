// The tokeniser of schema-migrate returns what the library's lexical analyser does, and tells where
// each token begins.

#include <gtest/gtest.h>

#include <string>

#include "Files.h"
#include "InputFile.h"
#include "RandomInput.h"
#include "SchemaLexan.h"
#include "TokenReader.h"
#include "Tokens.h"

namespace {

bool hasText(int token) {
  return token == TOKEN_NAME || (token >= TOKEN_NUMBER && token <= TOKEN_NUMBER_BAD_LENGTH);
}

// All tokens of either lexer: code, current token, counted line, and the text if it has one.
template <typename Lexer, typename Line, typename Current, typename Text>
std::string describe(Lexer* lexer, Line line, Current current, Text text) {
  std::string tokens;
  int token = 0;
  do {
    token = lexer->lexan();
    tokens += std::to_string(token) + "/" + std::to_string(current()) + "/" +
              std::to_string(line()) + (hasText(token) ? ":" + text() : "") + "\n";
  } while (token != TOKEN_END);
  return tokens;
}

std::string tokensOfLibrary(const support::TemporaryDirectory& directory) {
  SchemaLexan lexer(directory.path(), "text");
  return describe(
      &lexer, [&] { return lexer.getLineNumber(); }, [&] { return lexer.getCurrentToken(); },
      [&] { return support::currentText(&lexer); });
}

std::string tokensOf(TokenReader reader) {
  return describe(
      &reader, [&] { return reader.countedLine(); }, [&] { return reader.currentToken(); },
      [&] { return reader.text(); });
}

// "token@line:column" for each token.
std::string placesIn(const std::string& text) {
  TokenReader reader(text);
  std::string places;
  int token = 0;
  do {
    token = reader.lexan();
    places += (places.empty() ? "" : " ") + std::to_string(token) + "@" +
              std::to_string(reader.position().line) + ":" +
              std::to_string(reader.position().column);
  } while (token != TOKEN_END);
  return places;
}

TEST(TokenReader, ReturnsTheTokensOfTheLibrary) {
  RandomInput random(1);
  const support::TemporaryDirectory directory;
  for (int round = 0; round < 2000; ++round) {
    const std::string text = round % 2 == 0 ? random.pieces() : random.damagedDefinitions();
    SCOPED_TRACE("round " + std::to_string(round) + ":\n" + text);
    const std::string path = directory.write("text", text);
    const std::string expected = tokensOfLibrary(directory);
    InputFile file(path);
    ASSERT_EQ(expected, tokensOf(TokenReader(&file)));
    ASSERT_EQ(expected, tokensOf(TokenReader(text)));
  }
}

TEST(TokenReader, PutsBackAcrossTheEdgeOfItsBuffer) {
  const support::TemporaryDirectory directory;
  for (std::size_t blanks = 65500; blanks < 65560; ++blanks) {
    const std::string text = std::string(blanks, ' ') + "name'quoted text'\n1.2.3 {45}( x\n";
    const std::string path = directory.write("text", text);
    InputFile file(path);
    ASSERT_EQ(tokensOfLibrary(directory), tokensOf(TokenReader(&file))) << blanks;
  }
}

TEST(TokenReader, TellsWhereTokensBegin) {
  struct Row {
    const char* text;
    const char* places;
  };
  const Row kRows[] = {
      {"", "260@1:1"},
      {"cn", "260@1:3"},
      {"cn ", "259@1:1 260@1:4"},
      {"\n  cn\n(", "259@2:3 40@3:1 260@3:2"},
      {"\tcn# x\n)", "259@1:2 41@2:1 260@2:2"},
      {"a'b c'd\n", "259@1:1 259@1:2 259@1:7 260@2:1"},
      // The newline that ends the string is lost to the library's count, not to this one.
      {"'a\nb )\n", "259@1:1 259@2:1 41@2:3 260@3:1"},
      {"1.2  {3} x\r\ny )", "2025@1:1 259@1:10 13@1:11 259@2:1 41@2:3 260@2:4"},
  };
  for (const Row& row : kRows) {
    EXPECT_EQ(row.places, placesIn(row.text)) << row.text;
  }
}

}  // namespace
