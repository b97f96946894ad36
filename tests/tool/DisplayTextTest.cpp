// Texts as a terminal shows them.

#include "DisplayText.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace {

TEST(DisplayText, WidthIsThatOfWhatIsSeen) {
  const std::vector<std::pair<std::string, std::size_t>> rows = {
      {"", 0},
      {"abc", 3},
      {"M\xc3\xbcller", 6},
      {"Mu\xcc\x88ller", 6},            // a letter and its accent
      {"\xe6\xbc\xa2\xe5\xad\x97", 4},  // two characters of two columns
      {"\x1b[1;31mred\x1b[0m", 3},
      {"\xff", 1},
  };
  for (const auto& [text, width] : rows) {
    EXPECT_EQ(displayWidth(text), width) << text;
  }
}

TEST(DisplayText, WhatATerminalCouldTakeForACommandIsEscaped) {
  struct Row {
    const char* name;
    std::string text;
    std::string ascii;
    std::string utf8;
  };
  const Row kRows[] = {
      {"Ascii", "a ~", "a ~", "a ~"},
      {"Backslash", "\\x41", "\\x41", "\\x41"},
      {"Escape", "\x1b[2J", "\\x1B[2J", "\\x1B[2J"},
      {"Nul", std::string("\0", 1), "\\x00", "\\x00"},
      {"Delete", "\x7f", "\\x7F", "\\x7F"},
      {"Tab", "\t", "\\x09", "\\x09"},
      {"Letter", "\xc3\xbc", "\\xC3\\xBC", "\xc3\xbc"},
      {"WideLetter", "\xe6\xbc\xa2", "\\xE6\\xBC\\xA2", "\xe6\xbc\xa2"},
      {"ControlOfEightBits", "\xc2\x9b", "\\xC2\\x9B", "\\xC2\\x9B"},
      {"RightToLeftOverride", "\xe2\x80\xae", "\\xE2\\x80\\xAE", "\\xE2\\x80\\xAE"},
      {"ZeroWidthSpace", "\xe2\x80\x8b", "\\xE2\\x80\\x8B", "\\xE2\\x80\\x8B"},
      {"SoftHyphen", "\xc2\xad", "\\xC2\\xAD", "\\xC2\\xAD"},
      {"NoUtf8", "\xc3(", "\\xC3(", "\\xC3("},
  };
  for (const Row& row : kRows) {
    SCOPED_TRACE(row.name);
    EXPECT_EQ(asShown(row.text, false), row.ascii);
    EXPECT_EQ(asShown(row.text, true), row.utf8);
  }
  EXPECT_EQ(asShown("abcdef", false, 3), "abc...");
  EXPECT_EQ(asShown("abc", false, 3), "abc");
}

TEST(DisplayText, WordsAreWrapped) {
  EXPECT_EQ(wrapped("  o  ", "take the one of OLD", 16), "  o  take the\n     one of OLD\n");
  EXPECT_EQ(wrapped("", "M\xc3\xbcller M\xc3\xbcller", 13), "M\xc3\xbcller M\xc3\xbcller\n");
  EXPECT_EQ(wrapped("", "averylongwordindeed b", 8), "averylongwordindeed\nb\n");
  EXPECT_EQ(wrapped("x ", "", 8), "x \n");
}

TEST(DisplayText, OnlyLinesThatAreTooWideAreBroken) {
  EXPECT_EQ(fitted("short\n\n  a b\n", 10), "short\n\n  a b\n");
  EXPECT_EQ(fitted("alpha beta gamma\n", 12), "alpha beta\n    gamma\n");
  EXPECT_EQ(fitted("  old     one two three\n", 18), "  old     one two\n          three\n");
  EXPECT_EQ(fitted("alpha beta gamma", 12), "alpha beta\n    gamma");
  EXPECT_EQ(fitted("\x1b[1mone\x1b[0m two\n", 7), "\x1b[1mone\x1b[0m two\n");
  EXPECT_EQ(fitted("one two\n", std::string::npos), "one two\n");
}

TEST(DisplayText, PaddingCountsColumns) {
  EXPECT_EQ(padded("\xc3\xbc", 3) + "|", "\xc3\xbc  |");
  EXPECT_EQ(padded("abcd", 3), "abcd");
}

}  // namespace
