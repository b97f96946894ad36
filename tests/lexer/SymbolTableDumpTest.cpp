// The dump of the symbol table, and what the file that it is written to may be.

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include <filesystem>
#include <fstream>
#include <string>
#include <vector>

#include "Files.h"
#include "LexerTesting.h"
#include "SchemaSymbolTable.h"

namespace {

using support::readWholeFile;
using support::TemporaryDirectory;

std::string dumpOf(CSymbolTable* table, int indent) {
  TemporaryDirectory directory;
  std::ofstream out(directory.file("dump"));
  table->dump(indent, out);
  out.close();
  return readWholeFile(directory.file("dump"));
}

TEST(SymbolTableDump, HasAHeadingAndOneLineForEachEntryInOrder) {
  SchemaSymbolTable table;
  table.insertValue(std::string("surname"), 259, false);
  const std::vector<std::string> lines = support::splitLines(dumpOf(&table, 0));
  ASSERT_EQ(lines.size(), 27U);
  for (int index = 0; index < 26; ++index) {
    std::string text;
    table.getValue(index, text);
    const std::string& line = lines[static_cast<std::size_t>(index) + 1];
    EXPECT_NE(line.find(text), std::string::npos) << line;
    EXPECT_NE(line.find(std::to_string(table.getTokenValue(index))), std::string::npos) << line;
  }
}

TEST(SymbolTableDump, LineShowsIndexCodeValueAndWhetherItIsAKeyword) {
  CSymbolTable table;
  table.insertValue(std::string("NAME"), 1003, true);
  table.insertValue(std::string("a 'b'"), 259, false);
  table.insertValue('(', 40, true);
  table.insertValue('x', -56, false);
  table.insertValue(std::string(), 0, false);
  table.removeValue(2);
  EXPECT_EQ(dumpOf(&table, 1),
            "\tCSymbolTable, 4 entries\n"
            "\t0 1003 \"NAME\" keyword\n"
            "\t1 259 \"a 'b'\"\n"
            "\t3 -56 'x'\n"
            "\t4 0 \"\"\n");
  table.insertValue(')', 41, true);
  EXPECT_EQ(support::splitLines(dumpOf(&table, 0)).back(), "5 41 ')' keyword");
}

TEST(SymbolTableDump, EveryLineIsIndentedByTheLevel) {
  SchemaSymbolTable table;
  const std::vector<std::string> plain = support::splitLines(dumpOf(&table, 0));
  const std::vector<std::string> indented = support::splitLines(dumpOf(&table, 3));
  ASSERT_EQ(plain.size(), indented.size());
  for (std::size_t i = 0; i < plain.size(); ++i) {
    EXPECT_EQ(indented[i], "\t\t\t" + plain[i]);
  }
  EXPECT_EQ(dumpOf(&table, -2), dumpOf(&table, 0));
}

TEST(SymbolTableDump, LeavesOutRemovedEntries) {
  SchemaSymbolTable table;
  table.removeValue(3);
  const std::string dump = dumpOf(&table, 0);
  EXPECT_EQ(support::splitLines(dump).size(), 25U);
  EXPECT_EQ(dump.find("\"SUP\""), std::string::npos);
}

TEST(TableDump, WritesEveryEntryToANewFile) {
  TemporaryDirectory directory;
  SchemaSymbolTable table;
  table.tableDump(directory.file("table.txt"));
  EXPECT_EQ(readWholeFile(directory.file("table.txt")), dumpOf(&table, 0));
}

TEST(TableDump, ReplacesTheContentOfAnOldFile) {
  TemporaryDirectory directory;
  SchemaSymbolTable table;
  const std::string path = directory.write("table.txt", std::string(100000, 'x'));
  table.tableDump(path);
  EXPECT_EQ(readWholeFile(path), dumpOf(&table, 0));
}

TEST(TableDump, DoesNotFollowASymbolicLink) {
  TemporaryDirectory directory;
  SchemaSymbolTable table;
  const std::string victim = directory.write("victim", "precious\n");
  std::filesystem::create_symlink(victim, directory.file("table.txt"));
  std::filesystem::create_symlink(directory.file("not there"), directory.file("dangling"));
  table.tableDump(directory.file("table.txt"));
  table.tableDump(directory.file("dangling"));
  EXPECT_EQ(readWholeFile(victim), "precious\n");
  EXPECT_TRUE(std::filesystem::is_symlink(directory.file("table.txt")));
  EXPECT_FALSE(std::filesystem::exists(directory.file("not there")));
}

TEST(TableDump, DoesNotTruncateAFileWithASecondName) {
  TemporaryDirectory directory;
  SchemaSymbolTable table;
  const std::string victim = directory.write("victim", "precious\n");
  std::filesystem::create_hard_link(victim, directory.file("table.txt"));
  table.tableDump(directory.file("table.txt"));
  EXPECT_EQ(readWholeFile(victim), "precious\n");
}

TEST(TableDump, DoesNotBlockOnAFifoWithoutReader) {
  const lexertesting::Deadline deadline(20);
  TemporaryDirectory directory;
  SchemaSymbolTable table;
  ASSERT_EQ(::mkfifo(directory.file("table.txt").c_str(), 0600), 0);
  table.tableDump(directory.file("table.txt"));
  EXPECT_TRUE(std::filesystem::is_fifo(directory.file("table.txt")));
}

TEST(TableDump, WritesNothingToAFifoWithReader) {
  const lexertesting::Deadline deadline(20);
  TemporaryDirectory directory;
  SchemaSymbolTable table;
  const std::string path = directory.file("table.txt");
  ASSERT_EQ(::mkfifo(path.c_str(), 0600), 0);
  const int reader = ::open(path.c_str(), O_RDONLY | O_NONBLOCK | O_CLOEXEC);
  ASSERT_GE(reader, 0);
  table.tableDump(path);
  char byte = 0;
  EXPECT_EQ(::read(reader, &byte, 1), 0);
  ::close(reader);
}

TEST(TableDump, LeavesADirectoryADeviceAndAMissingFolderAlone) {
  const lexertesting::Deadline deadline(20);
  TemporaryDirectory directory;
  SchemaSymbolTable table;
  std::filesystem::create_directory(directory.file("folder"));
  table.tableDump(directory.file("folder"));
  table.tableDump("/dev/null");
  table.tableDump("/dev/full");
  table.tableDump(directory.file("missing/table.txt"));
  table.tableDump("");
  EXPECT_TRUE(std::filesystem::is_empty(directory.file("folder")));
  EXPECT_TRUE(std::filesystem::is_character_file("/dev/null"));
  EXPECT_FALSE(std::filesystem::exists(directory.file("missing")));
}

}  // namespace
