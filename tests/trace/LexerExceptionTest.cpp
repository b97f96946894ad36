// An exception that comes from the analyser and passes through traced functions: each leaves its
// exit record, with the code 0.

#include <gtest/gtest.h>

#include <stdexcept>
#include <string>
#include <vector>

#include "Attribute.h"
#include "Files.h"
#include "ORVAttribute.h"
#include "ObjectClass.h"
#include "SchemaLexan.h"
#include "TraceRecorder.h"
#include "TraceTree.h"

namespace {

using support::TraceRecorder;

// Throws instead of reading the token behind the first `count`.
class ThrowingLexer : public SchemaLexan {
 public:
  ThrowingLexer(const support::TemporaryDirectory& directory, const std::string& text, int count)
      : SchemaLexan((directory.write("input", text), directory.path()), "input"), m_count(count) {}

  int lexan() override {
    if (m_count-- == 0) {
      throw std::runtime_error("no token");
    }
    return SchemaLexan::lexan();
  }

 private:
  int m_count;
};

// The records of parsing `text`, the analyser throwing instead of its last token.
template <typename Definition>
std::string treeOfParse(const std::string& text, int count, std::uint64_t events = 0x33000) {
  support::TemporaryDirectory directory;
  ThrowingLexer lexer(directory, text, count);
  lexer.lexan();
  Definition definition;
  TraceRecorder recorder(events);
  EXPECT_THROW(definition.parse(&lexer), std::runtime_error);
  return tracetree::treeOf(recorder.records());
}

TEST(AnalyserThrows, InMatch) {
  support::TemporaryDirectory directory;
  ThrowingLexer lexer(directory, "", 0);
  TraceRecorder recorder(0x33000);
  EXPECT_THROW(lexer.match(-1), std::runtime_error);
  EXPECT_EQ(tracetree::treeOf(recorder.records()), "\nmatch -> 0\n");
  EXPECT_EQ(lexer.getCurrentToken(), -1);
}

TEST(AnalyserThrows, InMatchOfParse) {
  EXPECT_EQ(treeOfParse<Attribute>("= ( 1 )\n", 1), R"(
Attribute::parse
  match -> 0
Attribute::parse -> 0
)");
  EXPECT_EQ(treeOfParse<ORVAttribute>("= ( 1 )\n", 1), R"(
ORVAttribute::parse
  match -> 0
ORVAttribute::parse -> 0
)");
  EXPECT_EQ(treeOfParse<ObjectClass>("= ( 1 )\n", 1), R"(
ObjectClass::parse
  match -> 0
ObjectClass::parse -> 0
)");
}

constexpr char kOpened[] =
    "  match\n"
    "    lexan -> 40\n"
    "  match -> 0\n"
    "  match\n"
    "    lexan -> 2024\n"
    "  match -> 0\n"
    "  lexan -> 41\n";

// Here the status was known already: the definition was complete but for the token behind it.
TEST(AnalyserThrows, BehindTheClosingParenthesis) {
  EXPECT_EQ(treeOfParse<Attribute>("= ( 1 ) ", 4),
            std::string("\nAttribute::parse\n") + kOpened + "Attribute::parse -> 0\n");
  EXPECT_EQ(treeOfParse<ORVAttribute>("= ( 1 ) ", 4),
            std::string("\nORVAttribute::parse\n") + kOpened + "ORVAttribute::parse -> 0\n");
  EXPECT_EQ(treeOfParse<ObjectClass>("= ( 1 ) ", 4),
            std::string("\nObjectClass::parse\n") + kOpened + "ObjectClass::parse -> 0\n");
}

TEST(AnalyserThrows, ExitRecordsDependOnTheirBitsAsEver) {
  const auto exits = [](std::uint64_t events) {
    support::TemporaryDirectory directory;
    ThrowingLexer lexer(directory, "= ( 1 )\n", 1);
    lexer.lexan();
    Attribute definition;
    TraceRecorder recorder(events);
    EXPECT_THROW(definition.parse(&lexer), std::runtime_error);
    return recorder.records();
  };
  const std::vector<std::string> both = {"exit 0x53040300 kind 33 bit 4096 code 0",
                                         "exit 0x53010200 kind 33 bit 4096 code 0"};
  EXPECT_EQ(exits(0x2000), both);
  EXPECT_EQ(exits(0x30000), std::vector<std::string>());
  EXPECT_EQ(exits(0), std::vector<std::string>());
  EXPECT_EQ(exits(support::kDebugEvents), std::vector<std::string>());
}

TEST(AnalyserThrows, WhatWasReadStaysInTheDefinition) {
  support::TemporaryDirectory directory;
  ThrowingLexer lexer(directory, "= ( 1.2 DESC 'd' SYNTAX 1.3 )\n", 6);
  lexer.lexan();
  Attribute definition;
  EXPECT_THROW(definition.parse(&lexer), std::runtime_error);
  EXPECT_EQ(definition.getOid(), "1.2");
  EXPECT_EQ(definition.getDescription(), "d");
}

}  // namespace
