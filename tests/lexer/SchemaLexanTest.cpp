// The analyser's operations other than the reading of tokens.

#include "SchemaLexan.h"

#include <gtest/gtest.h>

#include <cstring>
#include <filesystem>
#include <fstream>
#include <memory>
#include <string>
#include <type_traits>
#include <vector>

#include "Files.h"
#include "LexerTesting.h"

namespace {

using lexertesting::inputDirectory;
using lexertesting::inputFile;
using lexertesting::kInputName;
using lexertesting::OpenLexer;
using support::readWholeFile;
using support::TemporaryDirectory;

// ---- The interface ----

TEST(ClexAnalyzer, IsAnAbstractBaseToWhichTheAnalyserAddsNoData) {
  EXPECT_TRUE(std::is_abstract<Clex_analyzer>::value);
  EXPECT_TRUE(std::has_virtual_destructor<Clex_analyzer>::value);
  EXPECT_TRUE((std::is_convertible<SchemaLexan*, Clex_analyzer*>::value));
  EXPECT_FALSE(std::is_abstract<SchemaLexan>::value);
  EXPECT_EQ(sizeof(SchemaLexan), sizeof(Clex_analyzer));
}

// The place of a virtual function in its table: the first word of the pointer holds its offset.
template <typename Function>
std::size_t slotOf(Function function) {
  std::size_t word = 0;
  std::memcpy(&word, &function, sizeof word);
  return word / sizeof(void*);
}

TEST(ClexAnalyzer, DeclaresItsVirtualOperationsInTheOrderOfTheirSlots) {
  using Base = Clex_analyzer;
  const std::vector<std::size_t> slots = {slotOf(&Base::getLineNumber),
                                          slotOf(&Base::getFileName),
                                          slotOf(&Base::getWorkingDir),
                                          slotOf(&Base::isString),
                                          slotOf(&Base::isCharacter),
                                          slotOf(&Base::getCurrentToken),
                                          slotOf(&Base::getTokenValIndex),
                                          slotOf(&Base::getStringValue),
                                          slotOf(&Base::getCharValue),
                                          slotOf(&Base::lookUp),
                                          slotOf(&Base::lexan),
                                          slotOf(&Base::match),
                                          slotOf(&Base::insertString),
                                          slotOf(&Base::insertCharacter),
                                          slotOf(&Base::clear),
                                          slotOf(&Base::dumpTable),
                                          slotOf(&Base::dump),
                                          slotOf(&Base::skip)};
  for (std::size_t i = 0; i < slots.size(); ++i) {
    EXPECT_EQ(slots[i], i);
  }
}

// An analyser that shows where its members lie.
class MemberOrder : public SchemaLexan {
 public:
  MemberOrder() : SchemaLexan(inputDirectory(), kInputName) {}
  std::vector<const void*> addresses() const {
    return {&m_symtable,  &m_filename, &m_tokenvalindex, &m_input,
            &m_lookahead, &m_line_num, &m_scratch_index, &m_working_dir};
  }
};

TEST(ClexAnalyzer, DeclaresItsMembersInOrder) {
  inputFile("");
  const MemberOrder lexer;
  const std::vector<const void*> addresses = lexer.addresses();
  for (std::size_t i = 1; i < addresses.size(); ++i) {
    EXPECT_LT(addresses[i - 1], addresses[i]) << i;
  }
}

// ---- Construction ----

TEST(SchemaLexan, StartsBeforeTheFirstToken) {
  OpenLexer lexer("NAME 'cn'\n");
  EXPECT_TRUE(lexer.fileIsOpen());
  EXPECT_EQ(lexer.getCurrentToken(), -1);
  EXPECT_EQ(lexer.getTokenValIndex(), -1);
  EXPECT_EQ(lexer.getLineNumber(), 1);
  EXPECT_EQ(lexer.getFileName(), "V3.user.at");
  EXPECT_EQ(lexer.getWorkingDir(), inputDirectory());
  ASSERT_NE(lexer.table(), nullptr);
  EXPECT_EQ(lexer.table()->getTableSize(), 25);
}

TEST(SchemaLexan, TakesTheDirectoryFirstAndTheNameSecond) {
  TemporaryDirectory directory;
  std::filesystem::create_directory(directory.file("sub"));
  directory.write("sub/V3.user.oc", "MAY ");
  OpenLexer plain(directory.file("sub"), "V3.user.oc");
  OpenLexer slash(directory.file("sub/"), "V3.user.oc");
  OpenLexer nested(directory.path(), "sub/V3.user.oc");
  EXPECT_EQ(plain.lexan(), 1008);
  EXPECT_EQ(slash.lexan(), 1008);
  EXPECT_EQ(nested.lexan(), 1008);
  EXPECT_EQ(slash.getWorkingDir(), directory.file("sub/"));
  EXPECT_EQ(nested.getWorkingDir(), directory.path());
  EXPECT_EQ(nested.getFileName(), "sub/V3.user.oc");
}

// What the analyser is over something that cannot be read.
void expectNothingToRead(OpenLexer* lexer, const std::string& name) {
  EXPECT_FALSE(lexer->fileIsOpen()) << name;
  EXPECT_EQ(lexer->getLineNumber(), 1) << name;
  EXPECT_EQ(lexer->getFileName(), name);
  EXPECT_EQ(lexer->lexan(), 260) << name;
  EXPECT_EQ(lexer->lexan(), 260) << name;
  EXPECT_EQ(lexer->getCurrentToken(), -1) << name;
  EXPECT_EQ(lexer->getTokenValIndex(), -1) << name;
  EXPECT_EQ(lexer->getLineNumber(), 1) << name;
  EXPECT_FALSE(lexer->fileIsOpen()) << name;
}

TEST(SchemaLexan, MissingFileIsNotOpenAndEndsAtOnce) {
  TemporaryDirectory directory;
  OpenLexer lexer(directory.path(), "V3.user.at");
  expectNothingToRead(&lexer, "V3.user.at");
}

TEST(SchemaLexan, MissingDirectoryIsNotOpenAndEndsAtOnce) {
  TemporaryDirectory directory;
  OpenLexer lexer(directory.file("missing"), "V3.user.at");
  expectNothingToRead(&lexer, "V3.user.at");
}

TEST(SchemaLexan, DirectoryInPlaceOfAFileIsNotOpenAndEndsAtOnce) {
  const lexertesting::Deadline deadline(20);
  TemporaryDirectory directory;
  std::filesystem::create_directory(directory.file("V3.user.at"));
  OpenLexer lexer(directory.path(), "V3.user.at");
  expectNothingToRead(&lexer, "V3.user.at");
}

TEST(SchemaLexan, EmptyFileIsOpenUntilItsEndIsMet) {
  OpenLexer lexer("");
  EXPECT_TRUE(lexer.fileIsOpen());
  EXPECT_EQ(lexer.lexan(), 260);
  EXPECT_FALSE(lexer.fileIsOpen());
}

TEST(SchemaLexan, FileIsOpenUntilAReadMeetsItsEnd) {
  OpenLexer lexer("cn (");
  EXPECT_EQ(lexer.lexan(), 259);
  EXPECT_TRUE(lexer.fileIsOpen());
  EXPECT_EQ(lexer.lexan(), 40);
  EXPECT_TRUE(lexer.fileIsOpen());
  EXPECT_EQ(lexer.lexan(), 260);
  EXPECT_FALSE(lexer.fileIsOpen());
  EXPECT_TRUE(lexer.inputIsAtEnd());
}

TEST(SchemaLexan, IsDestroyedThroughItsInterface) {
  inputFile("NAME ");
  std::unique_ptr<Clex_analyzer> lexer =
      std::make_unique<SchemaLexan>(inputDirectory(), kInputName);
  EXPECT_EQ(lexer->lexan(), 1003);
  lexer.reset();
}

// ---- The current token and its text ----

TEST(SchemaLexan, KeywordHasItsOwnIndexAndText) {
  OpenLexer lexer("REVERSE ORDERING ");
  EXPECT_EQ(lexer.lexan(), 1026);
  EXPECT_EQ(lexer.getTokenValIndex(), 18);
  EXPECT_EQ(lexer.text(), "REVERSE");
  EXPECT_EQ(lexer.lexan(), 1020);
  EXPECT_EQ(lexer.getTokenValIndex(), 19);
  EXPECT_EQ(lexer.text(), "ORDERING");
  EXPECT_EQ(lexer.table()->getTableSize(), 25);
}

TEST(SchemaLexan, NameAndNumberStandInTheScratchEntry) {
  OpenLexer lexer("cn 2.5.4.3 {32} $ ");
  EXPECT_EQ(lexer.lexan(), 259);
  EXPECT_EQ(lexer.getTokenValIndex(), 25);
  EXPECT_EQ(lexer.text(), "cn");
  EXPECT_EQ(lexer.table()->getTokenValue(25), 259);
  EXPECT_EQ(lexer.lexan(), 2025);
  EXPECT_EQ(lexer.getTokenValIndex(), 25);
  EXPECT_EQ(lexer.text(), "2.5.4.3{32}");
  EXPECT_EQ(lexer.table()->getTokenValue(25), 2025);
  EXPECT_EQ(lexer.lexan(), 36);
  EXPECT_EQ(lexer.getTokenValIndex(), -1);
  EXPECT_EQ(lexer.getCurrentToken(), 36);
  EXPECT_EQ(lexer.table()->getTableSize(), 26);
}

TEST(SchemaLexan, TableHoldsOneScratchEntryAfterAnyNumberOfTokens) {
  std::string text;
  for (int i = 0; i < 5000; ++i) {
    text += "word" + std::to_string(i) + " 1." + std::to_string(i) + " ";
  }
  OpenLexer lexer(text);
  while (lexer.lexan() != 260) {
    ASSERT_EQ(lexer.table()->getTableSize(), 26);
  }
}

TEST(SchemaLexan, ValueOfTheOtherKindOrOfNoEntryIsNotCopied) {
  OpenLexer lexer("");
  const int character = lexer.insertCharacter('x', 120);
  std::string text = "untouched";
  char value = '?';
  EXPECT_FALSE(lexer.getStringValue(character, text));
  EXPECT_FALSE(lexer.getStringValue(-1, text));
  EXPECT_FALSE(lexer.getStringValue(4711, text));
  EXPECT_EQ(text, "untouched");
  EXPECT_FALSE(lexer.getCharValue(1, value));
  EXPECT_FALSE(lexer.getCharValue(-1, value));
  EXPECT_FALSE(lexer.getCharValue(4711, value));
  EXPECT_EQ(value, '?');
  EXPECT_TRUE(lexer.getCharValue(character, value));
  EXPECT_EQ(value, 'x');
  EXPECT_TRUE(lexer.getStringValue(1, text));
  EXPECT_EQ(text, "NAME");
  EXPECT_TRUE(lexer.isString(1));
  EXPECT_FALSE(lexer.isCharacter(1));
  EXPECT_TRUE(lexer.isCharacter(character));
  EXPECT_FALSE(lexer.isString(character));
  EXPECT_FALSE(lexer.isString(-1));
  EXPECT_FALSE(lexer.isCharacter(-1));
}

// ---- Maintenance of the symbol table ----

TEST(SchemaLexan, InsertedEntriesCarryTheirCode) {
  OpenLexer lexer("");
  const int text = lexer.insertString("extra", 777);
  const int character = lexer.insertCharacter('x', 778);
  EXPECT_EQ(text, 25);
  EXPECT_EQ(character, 26);
  EXPECT_EQ(lexer.table()->getTokenValue(text), 777);
  EXPECT_EQ(lexer.table()->getTokenValue(character), 778);
  EXPECT_EQ(lexer.table()->getTableSize(), 27);
}

TEST(SchemaLexan, WordOfAnInsertedEntryHasItsCode) {
  OpenLexer lexer("one extra two 'extra' 1.2 extra ");
  EXPECT_EQ(lexer.lexan(), 259);
  const int index = lexer.insertString("extra", 777);
  const int expected[] = {777, 259, 777, 2024, 777, 260};
  for (const int token : expected) {
    EXPECT_EQ(lexer.lexan(), token);
    EXPECT_EQ(lexer.getTokenValIndex() == index, token == 777);
  }
}

TEST(SchemaLexan, NumberOfAnInsertedEntryHasItsCode) {
  OpenLexer lexer("one 1.2 1.3 1.2 {3} ");
  EXPECT_EQ(lexer.lexan(), 259);
  lexer.insertString("1.2", 777);
  EXPECT_EQ(lexer.lexan(), 777);
  EXPECT_EQ(lexer.lexan(), 2024);
  EXPECT_EQ(lexer.lexan(), 2025);
}

// The index that the first new text removes is the table's size after the keywords, whatever has
// been inserted there in between.
TEST(SchemaLexan, FirstNewTextRemovesTheEntryBehindTheKeywords) {
  OpenLexer lexer("extra one extra ");
  EXPECT_EQ(lexer.insertString("extra", 777), 25);
  EXPECT_EQ(lexer.lexan(), 777);
  EXPECT_EQ(lexer.lexan(), 259);
  EXPECT_EQ(lexer.text(), "one");
  EXPECT_EQ(lexer.lexan(), 259);
  EXPECT_EQ(lexer.text(), "extra");
  EXPECT_EQ(lexer.table()->getTableSize(), 26);
}

TEST(SchemaLexan, LookUpIsTheTables) {
  OpenLexer lexer("");
  for (const int first : {1002, 1003, 1026, 259, -1}) {
    for (const int second : {0, 1, 2, 24, 25, -1}) {
      EXPECT_EQ(lexer.lookUp(first, second), lexer.table()->lookUp(first, second));
    }
  }
}

TEST(SchemaLexan, ClearTakesTheTablesResultAsValueIndex) {
  OpenLexer lexer("cn sn ");
  EXPECT_EQ(lexer.lexan(), 259);
  EXPECT_EQ(lexer.getTokenValIndex(), 25);
  const int expected = lexer.table()->clear(25);
  EXPECT_EQ(lexer.clear(), expected);
  EXPECT_EQ(lexer.getTokenValIndex(), expected);
  EXPECT_EQ(lexer.getCurrentToken(), 259);
  EXPECT_EQ(lexer.lexan(), 259);
  EXPECT_EQ(lexer.text(), "sn");
}

TEST(SchemaLexan, DumpTableWritesTheTablesDump) {
  TemporaryDirectory directory;
  OpenLexer lexer("cn ");
  lexer.lexan();
  lexer.dumpTable(directory.file("by lexer"));
  lexer.table()->tableDump(directory.file("by table"));
  const std::string text = readWholeFile(directory.file("by lexer"));
  EXPECT_EQ(text, readWholeFile(directory.file("by table")));
  EXPECT_NE(text.find("cn"), std::string::npos);
}

// ---- match ----

TEST(Match, ConsumesTheExpectedToken) {
  OpenLexer lexer("( NAME 'cn' ) ");
  EXPECT_EQ(lexer.lexan(), 40);
  lexer.match(40);
  EXPECT_EQ(lexer.getCurrentToken(), 1003);
  lexer.match(1003);
  EXPECT_EQ(lexer.getCurrentToken(), 259);
  EXPECT_EQ(lexer.text(), "cn");
}

TEST(Match, LeavesAnotherTokenInPlace) {
  OpenLexer lexer("DESC 'x' ");
  EXPECT_EQ(lexer.lexan(), 1004);
  lexer.match(1003);
  EXPECT_EQ(lexer.getCurrentToken(), 1004);
  EXPECT_EQ(lexer.getTokenValIndex(), 2);
  EXPECT_EQ(lexer.lexan(), 259);
  EXPECT_EQ(lexer.text(), "x");
}

TEST(Match, BeforeTheFirstTokenExpectsMinusOne) {
  OpenLexer lexer("NAME DESC ");
  lexer.match(1003);
  EXPECT_EQ(lexer.getCurrentToken(), -1);
  lexer.match(-1);
  EXPECT_EQ(lexer.getCurrentToken(), 1003);
}

TEST(Match, StoresTheEndCodeWhereLexanDoesNot) {
  OpenLexer lexer("( ");
  EXPECT_EQ(lexer.lexan(), 40);
  EXPECT_EQ(lexer.lexan(), 260);
  EXPECT_EQ(lexer.getCurrentToken(), 40);
  lexer.match(40);
  EXPECT_EQ(lexer.getCurrentToken(), 260);
  lexer.match(40);
  EXPECT_EQ(lexer.getCurrentToken(), 260);
  lexer.match(260);
  EXPECT_EQ(lexer.getCurrentToken(), 260);
}

TEST(Match, WithoutSymbolTableLeavesTheTokenInPlace) {
  OpenLexer lexer("( NAME ");
  EXPECT_EQ(lexer.lexan(), 40);
  lexer.dropTable();
  lexer.match(40);
  EXPECT_EQ(lexer.getCurrentToken(), 40);
}

// Answers with codes of its own.
class ScriptedLexer : public OpenLexer {
 public:
  explicit ScriptedLexer(std::vector<int> tokens) : OpenLexer(""), m_tokens(std::move(tokens)) {}
  int lexan() override {
    ++m_calls;
    const int token = m_tokens.front();
    m_tokens.erase(m_tokens.begin());
    return token;
  }
  int calls() const { return m_calls; }

 private:
  std::vector<int> m_tokens;
  int m_calls = 0;
};

TEST(Match, ReadsThroughTheInterface) {
  ScriptedLexer lexer({4711, 260, 12});
  lexer.setCurrentToken(40);
  lexer.match(41);
  EXPECT_EQ(lexer.calls(), 0);
  lexer.match(40);
  EXPECT_EQ(lexer.getCurrentToken(), 4711);
  lexer.match(4711);
  EXPECT_EQ(lexer.getCurrentToken(), 260);
  lexer.match(260);
  EXPECT_EQ(lexer.getCurrentToken(), 12);
  EXPECT_EQ(lexer.calls(), 3);
}

// ---- dump and skip ----

template <typename Action>
std::string written(Action action) {
  TemporaryDirectory directory;
  std::ofstream out(directory.file("out"));
  action(out);
  out.close();
  return readWholeFile(directory.file("out"));
}

TEST(Skip, WritesTabs) {
  OpenLexer lexer("");
  const struct {
    int count;
    const char* text;
  } rows[] = {{0, ""}, {1, "\t"}, {5, "\t\t\t\t\t"}, {-1, ""}, {-2147483647 - 1, ""}};
  for (const auto& row : rows) {
    EXPECT_EQ(written([&](std::ofstream& out) { lexer.skip(row.count, out); }), row.text)
        << row.count;
  }
}

TEST(Dump, ShowsTheStateAndTheTable) {
  OpenLexer lexer("\n( cn ");
  lexer.lexan();
  lexer.lexan();
  const std::string table = written([&](std::ofstream& out) { lexer.table()->dump(3, out); });
  EXPECT_EQ(written([&](std::ofstream& out) { lexer.dump(2, out); }),
            "\t\tSchemaLexan\n"
            "\t\t{ \n"
            "\t\t  m_filename \"V3.user.at\"\n"
            "\t\t  m_tokenvalindex 25\n"
            "\t\t  m_line_num 2\n"
            "\t\t  m_lookahead 259\n"
            "\t\t  m_symtable \n" +
                table + "\t\t}\n");
}

TEST(Dump, OfAFreshAnalyserHasNoToken) {
  OpenLexer lexer("");
  const std::string table = written([&](std::ofstream& out) { lexer.table()->dump(1, out); });
  EXPECT_EQ(written([&](std::ofstream& out) { lexer.dump(0, out); }),
            "SchemaLexan\n"
            "{ \n"
            "  m_filename \"V3.user.at\"\n"
            "  m_tokenvalindex -1\n"
            "  m_line_num 1\n"
            "  m_lookahead -1\n"
            "  m_symtable \n" +
                table + "}\n");
}

TEST(Dump, WithoutSymbolTableIsEmptyThere) {
  OpenLexer lexer("");
  lexer.dropTable();
  EXPECT_EQ(written([&](std::ofstream& out) { lexer.dump(1, out); }),
            "\tSchemaLexan\n"
            "\t{ \n"
            "\t  m_filename \"V3.user.at\"\n"
            "\t  m_tokenvalindex -1\n"
            "\t  m_line_num 1\n"
            "\t  m_lookahead -1\n"
            "\t  m_symtable EMPTY\n"
            "\t}\n");
}

// Indents by a mark of its own.
class MarkingLexer : public OpenLexer {
 public:
  MarkingLexer() : OpenLexer("") {}
  void skip(int count, std::ofstream& out) override { out << "<" << count << ">"; }
};

TEST(Dump, IndentsThroughTheInterface) {
  MarkingLexer lexer;
  lexer.dropTable();
  EXPECT_EQ(written([&](std::ofstream& out) { lexer.dump(7, out); }),
            "<7>SchemaLexan\n"
            "<7>{ \n"
            "<7>  m_filename \"V3.user.at\"\n"
            "<7>  m_tokenvalindex -1\n"
            "<7>  m_line_num 1\n"
            "<7>  m_lookahead -1\n"
            "<7>  m_symtable EMPTY\n"
            "<7>}\n");
}

}  // namespace
