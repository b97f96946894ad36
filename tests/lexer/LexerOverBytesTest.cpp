// The analyser over bytes in memory: as over a file, but without files and without the locale.

#include <gtest/gtest.h>

#include <clocale>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <memory>
#include <string>
#include <string_view>
#include <thread>
#include <utility>
#include <vector>

#include "Attribute.h"
#include "Files.h"
#include "LexerTesting.h"
#include "TraceRecorder.h"

namespace {

using lexertesting::inputDirectory;
using lexertesting::inputFile;
using lexertesting::kInputName;

// Every token with its text, value index, line and whether the input is open.
std::string statesOf(SchemaLexan* lexer) {
  std::string all;
  int token = 0;
  do {
    token = lexer->lexan();
    std::string text;
    lexer->getStringValue(lexer->getTokenValIndex(), text);
    all += std::to_string(token) + ":" + text + "#" + std::to_string(lexer->getTokenValIndex()) +
           "@" + std::to_string(lexer->getLineNumber()) + (lexer->fileIsOpen() ? " " : "! ");
  } while (token != TOKEN_END);
  return all;
}

TEST(LexerOverBytes, StartsBeforeTheFirstToken) {
  SchemaLexan lexer("NAME ", 5, "the directory", "the name");
  EXPECT_TRUE(lexer.fileIsOpen());
  EXPECT_EQ(lexer.getCurrentToken(), -1);
  EXPECT_EQ(lexer.getTokenValIndex(), -1);
  EXPECT_EQ(lexer.getLineNumber(), 1);
  EXPECT_EQ(lexer.getWorkingDir(), "the directory");
  EXPECT_EQ(lexer.getFileName(), "the name");
}

TEST(LexerOverBytes, WithoutBytesIsOpenUntilItsEndIsMet) {
  SchemaLexan lexer(nullptr, 0, "", "");
  EXPECT_TRUE(lexer.fileIsOpen());
  EXPECT_EQ(lexer.lexan(), TOKEN_END);
  EXPECT_FALSE(lexer.fileIsOpen());
}

TEST(LexerOverBytes, ReadsNothingBehindTheLastByte) {
  const std::string bytes = "NAME cn sn";
  EXPECT_EQ(statesOf(std::make_unique<SchemaLexan>(bytes.data(), 5, "", "").get()),
            "1003:NAME#1@1 260:#-1@1! ");
  EXPECT_EQ(statesOf(std::make_unique<SchemaLexan>(bytes.data(), 7, "", "").get()),
            "1003:NAME#1@1 260:NAME#1@1! ");
}

// The bytes stay as they are: they may lie in memory that cannot be written to.
TEST(LexerOverBytes, WritesNothing) {
  static constexpr char kBytes[] = "NAME 'cn' 1.2 {3} objectClasses # c\n x";
  SchemaLexan lexer(kBytes, sizeof kBytes - 1, "", "");
  EXPECT_EQ(statesOf(&lexer),
            "1003:NAME#1@1 259:cn#25@1 2025:1.2{3}#25@1 1002:objectclasses#0@1 "
            "260:objectclasses#0@2! ");
}

TEST(LexerOverBytes, OperationsAreThoseOverAFile) {
  const std::string text = "\n( NAME cn extra x ";
  const support::TemporaryDirectory directory;
  const auto dumped = [&](SchemaLexan* lexer) {
    {
      std::ofstream out(directory.file("dump"));
      lexer->dump(2, out);
    }
    lexer->dumpTable(directory.file("table"));
    return support::readWholeFile(directory.file("dump")) +
           support::readWholeFile(directory.file("table"));
  };
  inputFile(text);
  SchemaLexan file(inputDirectory(), kInputName);
  SchemaLexan bytes(text.data(), text.size(), inputDirectory(), kInputName);
  for (SchemaLexan* const lexer : {&file, &bytes}) {
    lexer->match(-1);
    lexer->match('(');
    lexer->match(KEY_NAME);
    EXPECT_EQ(lexer->getTokenValIndex(), 25);
  }
  EXPECT_EQ(dumped(&bytes), dumped(&file));
  for (SchemaLexan* const lexer : {&file, &bytes}) {
    EXPECT_EQ(lexer->insertString("extra", 777), 26);
    EXPECT_EQ(lexer->insertCharacter('x', 120), 27);
    EXPECT_EQ(lexer->lookUp(777, 0), 26);
    EXPECT_TRUE(lexer->isString(26));
    EXPECT_TRUE(lexer->isCharacter(27));
    EXPECT_EQ(lexer->lexan(), 777);
    EXPECT_EQ(lexer->lexan(), TOKEN_NAME);
  }
  EXPECT_EQ(dumped(&bytes), dumped(&file));
}

TEST(LexerOverBytes, DefinitionsParseThemselvesFromIt) {
  const std::string_view bytes =
      "attributetypes=( 2.5.4.3 NAME ( 'cn' 'commonName' ) DESC 'a name' SYNTAX 1.2{64} )\n";
  SchemaLexan lexer(bytes.data(), bytes.size(), "", "");
  EXPECT_EQ(lexer.lexan(), KEY_ATTRIBUTETYPES);
  lexer.lexan();
  Attribute definition;
  EXPECT_EQ(definition.parse(&lexer), 1);
  std::string line;
  definition.appendLine(&line);
  EXPECT_EQ(line,
            "attributetypes=( 2.5.4.3 NAME ( 'cn' 'commonName'  )  DESC 'a name' SYNTAX 1.2{64} "
            "USAGE userApplications  )\n");
}

// Reads the bytes by itself, too.
class Derived : public SchemaLexan {
 public:
  explicit Derived(std::string_view bytes) : SchemaLexan(bytes.data(), bytes.size(), "", "") {}
  std::ifstream& input() { return m_input; }
};

TEST(LexerOverBytes, MayBeDerivedFrom) {
  Derived lexer("NAME cn left out\nDESC d ");
  lexer.lexan();
  lexer.lexan();
  std::string rest;
  std::getline(lexer.input(), rest);
  EXPECT_EQ(rest, " left out");
  std::string text;
  lexer.getStringValue(lexer.getTokenValIndex(), text);
  EXPECT_EQ(text, "cn");
  EXPECT_EQ(lexer.input().peek(), 'D');
  EXPECT_FALSE(lexer.input().putback('x'));
  lexer.input().clear();
  EXPECT_EQ(statesOf(&lexer), "1004:DESC#2@1 259:d#25@1 260:#-1@1! ");
}

// ---- The locale ----

TEST(LexerOverBytes, LeavesTheLocaleAloneAndWritesNoRecordOfIt) {
  ASSERT_NE(std::setlocale(LC_ALL, "C.UTF-8"), nullptr);
  ::setenv("LC_ALL", "C", 1);
  support::TraceRecorder recorder(support::kDebugEvents);
  {
    const std::string_view bytes = "caf\xc3\xa9 'd\xe9' ";
    SchemaLexan lexer(bytes.data(), bytes.size(), "", "");
    EXPECT_EQ(statesOf(&lexer), "259:caf#25@1 -61:#-1@1 -87:#-1@1 259:d#25@1 260:d#25@1! ");
    EXPECT_STREQ(std::setlocale(LC_ALL, nullptr), "C.UTF-8");
  }
  EXPECT_STREQ(std::setlocale(LC_ALL, nullptr), "C.UTF-8");
  EXPECT_TRUE(recorder.records().empty());
  std::setlocale(LC_ALL, "C");
  ::unsetenv("LC_ALL");
}

// ---- Threads ----

TEST(LexerOverBytes, EachThreadReadsItsOwn) {
  constexpr int kThreads = 8;
  std::vector<std::string> texts;
  std::vector<std::string> expected;
  for (int i = 0; i < kThreads; ++i) {
    std::string text;
    for (int line = 0; line < 400; ++line) {
      text += "attributetypes=( 1.2." + std::to_string(i * 1000 + line) + " NAME 'name" +
              std::to_string(line % (i + 2)) + "' SYNTAX 1.3 {" + std::to_string(line) + "} )\n";
    }
    SchemaLexan lexer(text.data(), text.size(), "", "");
    expected.push_back(statesOf(&lexer));
    texts.push_back(std::move(text));
  }
  std::vector<std::string> actual(kThreads);
  std::vector<std::thread> threads;
  for (std::size_t i = 0; i < kThreads; ++i) {
    threads.emplace_back([&texts, &actual, i] {
      for (int round = 0; round < 5; ++round) {
        SchemaLexan lexer(texts[i].data(), texts[i].size(), "", "");
        actual[i] = statesOf(&lexer);
      }
    });
  }
  for (std::thread& thread : threads) {
    thread.join();
  }
  EXPECT_EQ(actual, expected);
}

// ---- The golden files ----

TEST(LexerOverBytes, ReadsTheGoldenFilesAsFromFiles) {
  int files = 0;
  for (const auto& entry : std::filesystem::recursive_directory_iterator(GOLDEN_DIRECTORY)) {
    if (!entry.is_regular_file()) {
      continue;
    }
    const std::string text = support::readWholeFile(entry.path().string());
    SchemaLexan file(entry.path().parent_path().string(), entry.path().filename().string());
    SchemaLexan bytes(text.data(), text.size(), "", "");
    EXPECT_EQ(statesOf(&bytes), statesOf(&file)) << entry.path();
    ++files;
  }
  EXPECT_GT(files, 50);
}

}  // namespace
