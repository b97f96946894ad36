// Tokens over the end of the stream's internal buffer, wherever it lies.

#include <gtest/gtest.h>

#include <string>

#include "LexerTesting.h"

namespace {

using lexertesting::linesOf;
using lexertesting::OpenLexer;
using lexertesting::tokensOf;
using namespace std::string_literals;

const std::string& mixedText() {
  static const std::string text =
      "attributetypes=( 2.5.4.3 NAME ( 'cn' 'commonName' ) DESC 'a b, c: \"d\"'\n"
      "  SUP name  # a comment, with ' in it\n"
      "\tSYNTAX 1.3.6.1.4.1.1466.115.121.1.15   {32768} SINGLE-VALUE\tx )\n\n\n"
      "objectClasses={ ( 1.2{3 MUST ( objectClasses $ attributeTypes ) 'q\x80r' MAY\r\n"
      "-y '' 2.5.4.3 '2.5.4.3' } ORVattributeTypes=\xff~ 12 {34}5 {6) _z -\n"s;
  return text;
}

constexpr char kMixedTokens[] =
    "1010@L0 61@L0 40@L0 2024:2.5.4.3@L0 1003@L0 40@L0 259:cn@L0 259:commonName@L0 41@L0 1004@L0 "
    "259:a b, c: \"d\"@L0 1005@L1 259:name@L1 1012@L2 "
    "2025:1.3.6.1.4.1.1466.115.121.1.15{32768}@L2 259:SINGLE-VALUE\tx@L2 41@L2 1002@L5 61@L5 123@L5 "
    "40@L5 2026:1.2{3@L5 1007@L5 40@L5 1002@L5 36@L5 1010@L5 41@L5 259:q@L5 259:r@L5 "
    "259: MAY@L5 ";

// The tokens behind the carriage return that ends a quoted string: its "\n" is still to come.
constexpr char kRestTokens[] =
    "259:-y@L6 259:@L6 2024:2.5.4.3@L6 2024:2.5.4.3@L6 125@L6 1016@L6 61@L6 -1@L6 126@L6 "
    "2025:12{34}@L6 2026:5{6@L6 41@L6 95@L6 259:z@L6 259:-@L6 260@L7";

std::string mixedTokens(int firstLine) {
  std::string expected = std::string(kMixedTokens) + kRestTokens;
  for (std::size_t at = expected.find("@L"); at != std::string::npos;
       at = expected.find("@L", at)) {
    expected.replace(at, 3, "@" + std::to_string(firstLine + expected[at + 2] - '0'));
  }
  return expected;
}

TEST(Boundary, MixedTextIsReadAsWritten) { EXPECT_EQ(linesOf(mixedText()), mixedTokens(1)); }

TEST(Boundary, BlanksBeforeATextChangeNothing) {
  const std::string expected = mixedTokens(1);
  const std::size_t length = mixedText().size();
  for (const std::size_t boundary : {1024U, 4096U, 8191U, 8192U, 16382U, 16384U, 32768U, 65536U}) {
    for (std::size_t cut = 0; cut <= length + 2; ++cut) {
      const std::size_t padding = boundary - (length + 1 - cut);
      ASSERT_EQ(linesOf(std::string(padding, ' ') + mixedText()), expected) << padding << " blanks";
    }
  }
}

// How much lies in the buffer of the stream at a time: all of it but the byte that the stream
// keeps. And of a stream with a buffer of the usual size.
constexpr std::size_t kBuffers[] = {(1 << 15) - 1, 8191};

TEST(Boundary, NewlinesBeforeATextOnlyMoveItsLines) {
  for (const std::size_t buffer : kBuffers) {
    for (std::size_t padding = buffer - mixedText().size(); padding <= buffer + 2; padding += 7) {
      ASSERT_EQ(linesOf(std::string(padding, '\n') + mixedText()),
                mixedTokens(1 + static_cast<int>(padding)))
          << padding;
    }
  }
}

TEST(Boundary, CommentBeforeATextOnlyMovesItsLines) {
  for (const std::size_t buffer : kBuffers) {
    for (std::size_t padding = buffer - mixedText().size(); padding <= buffer + 2; ++padding) {
      ASSERT_EQ(linesOf("#" + std::string(padding, '\'') + "\n" + mixedText()), mixedTokens(2))
          << padding;
    }
  }
}

// Lengths around the sizes that a buffer may have.
const std::size_t kSizes[] = {1022,  1023,  1024,  4094,  4095,  4096,  4097,  8189,
                              8190,  8191,  8192,  8193,  8194,  12288, 16381, 16382,
                              16383, 16384, 16385, 24573, 24576, 32764, 32765, 32766,
                              32767, 32768, 65532, 65535, 65536, 65537, 100000};

TEST(Boundary, LongQuotedStringIsWhole) {
  for (const std::size_t size : kSizes) {
    std::string text(size, 'q');
    for (std::size_t i = 0; i < size; i += 13) {
      text[i] = " ,.$#"[i % 5];
    }
    ASSERT_EQ(tokensOf("'" + text + "' NAME "), "259:" + text + " 1003 260") << size;
    ASSERT_EQ(tokensOf("'" + text + "'\n"), "259:" + text + " 260") << size;
    ASSERT_EQ(tokensOf("'" + text + "'"), "260") << size;
    ASSERT_EQ(tokensOf("'" + text), "260") << size;
  }
}

TEST(Boundary, LongWordIsWhole) {
  for (const std::size_t size : kSizes) {
    const std::string text(size, 'w');
    ASSERT_EQ(tokensOf(text + "(" + text + "\n"), "259:" + text + " 40 259:" + text + " 260")
        << size;
    ASSERT_EQ(tokensOf(text), "260") << size;
  }
}

TEST(Boundary, LongNumberAndLengthAreWhole) {
  for (const std::size_t size : kSizes) {
    const std::string digits(size, '8');
    ASSERT_EQ(tokensOf(digits + " {" + digits + "}\n"), "2025:" + digits + "{" + digits + "} 260");
    ASSERT_EQ(tokensOf(digits + "{" + digits + ")\n"), "2026:" + digits + "{" + digits + " 41 260");
    ASSERT_EQ(tokensOf(digits + "\n"), "2024:" + digits + " 260") << size;
    ASSERT_EQ(tokensOf(digits), "260") << size;
  }
}

TEST(Boundary, BlanksBetweenANumberAndItsLengthAreDropped) {
  for (const std::size_t size : kSizes) {
    const std::string blanks(size, ' ');
    ASSERT_EQ(tokensOf("1.2" + blanks + "{3}\n"), "2025:1.2{3} 260") << size;
    ASSERT_EQ(tokensOf("1.2" + blanks + "x\n"), "2024:1.2 259:x 260") << size;
    ASSERT_EQ(tokensOf("1.2" + blanks), "260") << size;
  }
}

TEST(Boundary, RunsBetweenTokensAreSkipped) {
  for (const std::size_t size : kSizes) {
    const std::string lines = std::to_string(size + 1);
    ASSERT_EQ(linesOf("(" + std::string(size, ' ') + ")"), "40@1 41@1 260@1") << size;
    ASSERT_EQ(linesOf("(" + std::string(size, '\t') + ")"), "40@1 41@1 260@1") << size;
    ASSERT_EQ(linesOf("(" + std::string(size, '\n') + ")"), "40@1 41@" + lines + " 260@" + lines);
    ASSERT_EQ(linesOf("(#" + std::string(size, '#') + "\n)"), "40@1 41@2 260@2") << size;
  }
}

// The file ends exactly where a buffer does.
TEST(Boundary, FileOfExactlyABuffersSizeKeepsItsEndRules) {
  for (const std::size_t size : kSizes) {
    const std::string fill(size - 8, ' ');
    ASSERT_EQ(tokensOf(fill + "DESC 'x'"), "1004 260") << size;
    ASSERT_EQ(tokensOf(fill + " DESC x\n"), "1004 259:x 260") << size;
    ASSERT_EQ(tokensOf(fill + "  DESC x"), "1004 260") << size;
    ASSERT_EQ(tokensOf(fill + "  DESC 7"), "1004 260") << size;
    ASSERT_EQ(tokensOf(fill + "DESC 7\n "), "1004 2024:7 260") << size;
    ASSERT_EQ(tokensOf(fill + "  DESC )"), "1004 41 260") << size;
    ASSERT_EQ(tokensOf(fill + "DESC  # "), "1004 260") << size;
  }
}

// A text that crosses the end of the buffer takes the place that any other would.
TEST(Boundary, IndexOfATextDoesNotDependOnThePlace) {
  const std::string before = "first second";
  for (const std::size_t padding : {std::size_t{1}, kBuffers[0] - before.size() - 2}) {
    OpenLexer lexer(before + std::string(padding, ' ') + "third\n");
    lexer.lexan();
    EXPECT_EQ(lexer.insertString("inserted", 5), 26);
    lexer.lexan();
    EXPECT_EQ(lexer.getTokenValIndex(), 27);
    lexer.table()->removeValue(26);
    lexer.lexan();
    EXPECT_EQ(lexer.text(), "third");
    EXPECT_EQ(lexer.getTokenValIndex(), 25) << padding;
  }
}

TEST(Boundary, LinesOverManyBuffersAreCounted) {
  std::string text;
  for (int i = 0; i < 20000; ++i) {
    text += "cn" + std::to_string(i % 7) + (i % 3 == 0 ? " # c\n" : "\n");
  }
  OpenLexer lexer(text);
  for (int line = 1; line <= 20000; ++line) {
    ASSERT_EQ(lexer.lexan(), 259);
    ASSERT_EQ(lexer.getLineNumber(), line);
  }
  EXPECT_EQ(lexer.lexan(), 260);
  EXPECT_EQ(lexer.getLineNumber(), 20001);
}

}  // namespace
