// Every debug record, with the identifier of its function and its levels.

#include <gtest/gtest.h>

#include <clocale>
#include <cstdint>
#include <cstdlib>
#include <functional>
#include <ostream>
#include <string>
#include <vector>

#include "Files.h"
#include "SchemaManager.h"
#include "TraceRecorder.h"

namespace {

using support::TemporaryDirectory;
using support::TraceRecorder;

// The debug records of `action`, joined; those of the analyser's locale, which belong to no
// function, left out.
std::string debugRecordsOf(const std::function<void()>& action, std::uint64_t events) {
  TraceRecorder recorder(events);
  action();
  std::string all;
  for (const std::string& record : recorder.records()) {
    if (record.rfind("debug 0x", 0) == 0) {
      all += record;
    }
  }
  return all;
}

std::string head(const char* identifier) {
  return std::string("debug ") + identifier + " level 0x3400000 0xc8010000: ";
}

constexpr char kReadFile[] = "0x53051000";

// ---- readFile ----

struct ReadRow {
  const char* rule;
  const char* fileName;
  const char* text;  // null: there is no such file
  int result;
  std::vector<std::string> messages;  // without "readFile: "; $ stands for the directory
};

void PrintTo(const ReadRow& row, std::ostream* out) { *out << row.rule; }

class ReadFileRecords : public testing::TestWithParam<ReadRow> {};

TEST_P(ReadFileRecords, AreMadeInOrder) {
  const ReadRow& row = GetParam();
  TemporaryDirectory directory;
  if (row.text != nullptr) {
    directory.write(row.fileName, row.text);
  }
  std::string expected;
  for (std::string message : row.messages) {
    const auto place = message.find('$');
    if (place != std::string::npos) {
      message.replace(place, 1, directory.path());
    }
    expected += head(kReadFile) + "readFile: " + message;
  }
  SchemaManager manager(directory.path());
  int result = -1;
  EXPECT_EQ(debugRecordsOf([&] { result = manager.readFile(row.fileName); }, support::kDebugEvents),
            expected);
  EXPECT_EQ(result, row.result);
}

const char kParsing[] = "Parsing file: V3.user.at in directory: $ \n";
const char kParseError[] = "There was an error parsing the file, V3.user.at.\n";

const ReadRow kReadRows[] = {
    {"Success",
     "V3.user.at",
     "attributetypes=( 1.1 NAME 'a' DESC 'd' )\n",
     0,
     {kParsing, "Successfully parsed the file, V3.user.at.\n"}},
    {"ConfigFile",
     "V3.config.oc",
     "",
     0,
     {"Parsing file: V3.config.oc in directory: $ \n",
      "Successfully parsed the file, V3.config.oc.\n"}},
    {"MissingFile", "V3.user.at", nullptr, 1, {"Could not open file to be parsed\n"}},
    {"MissingFileWithAnUnknownName",
     "V3.Config.at",
     nullptr,
     1,
     {"Could not open file to be parsed\n"}},
    {"UnknownName", "V3.Config.at", "", 89, {"Unexpected file name given, V3.Config.at\n"}},
    {"SingleAttributeType",
     "V3.user.at",
     "attributetypes=( 1.1 NAME 'First' DESC 'd'\n",
     1,
     {kParsing, kParseError, "(1).Error occured while parsing the attribute: first\n"}},
    {"AttributeTypeInABlock",
     "V3.user.at",
     "attributetypes{( 1.1 NAME 'First' DESC 'd'\n",
     1,
     {kParsing, kParseError, "(2).Error occured while parsing the attribute: first\n"}},
    {"AttributeTypeWithoutAName",
     "V3.user.at",
     "attributetypes=( 1.1 DESC 'd'\n",
     1,
     {kParsing, kParseError, "(1).Error occured while parsing the attribute: \n"}},
    {"NoOpeningOfAttributeTypes",
     "V3.user.at",
     "attributetypes( 1.1 )\n",
     1,
     {kParsing, kParseError, "(3).ATTR: Error occured as } was not found\n"}},
    {"SingleExtension",
     "V3.user.at",
     "ORVAttributetypes=( 1.1 DBNAME ( 'A' 'b' ) LENGTH 5\n",
     1,
     {kParsing, kParseError,
      "(1).Error occured while parsing the orv attribute: OID --> 1.1\nName --> A, b\n\n\n"}},
    {"ExtensionInABlock",
     "V3.user.at",
     "ORVAttributetypes{( 1.1 LENGTH 5\n",
     1,
     {kParsing, kParseError,
      "(2).Error occured while parsing the orv attribute: OID --> 1.1\nName --> \n\n\n"}},
    {"NoOpeningOfExtensions",
     "V3.user.at",
     "ORVAttributetypes NAME\n",
     1,
     {kParsing, kParseError, "(3).ORVATTR: Error occured as } was not found\n"}},
    {"SingleObjectClass",
     "V3.user.at",
     "objectclasses=( 2.1 NAME 'Thing' MAY x\n",
     1,
     {kParsing, kParseError, "(1).Error occured while parsing the objectclass: Thing\n"}},
    {"ObjectClassInABlock",
     "V3.user.at",
     "objectclasses{( 2.1 NAME 'Thing' MAY x\n",
     1,
     {kParsing, kParseError, "(2).Error occured while parsing the objectclass: Thing\n"}},
    {"ObjectClassWithoutAName",
     "V3.user.at",
     "objectclasses=( 2.1 MAY x\n",
     1,
     {kParsing, kParseError, "(1).Error occured while parsing the objectclass: \n"}},
    {"KeywordAsTheLastWordIsLost",
     "V3.user.at",
     "objectclasses",
     0,
     {kParsing, "Successfully parsed the file, V3.user.at.\n"}},
    {"EndBehindObjectClasses",
     "V3.user.at",
     "objectclasses\n",
     1,
     {kParsing, kParseError, "(3).OBJECTCLASS: Error occured as } was not found\n"}},
};

INSTANTIATE_TEST_SUITE_P(All, ReadFileRecords, testing::ValuesIn(kReadRows),
                         [](const auto& row) { return std::string(row.param.rule); });

// ---- The other operations ----

TEST(DebugRecords, FilesThatCannotBeOpened) {
  TemporaryDirectory directory;
  SchemaManager manager(directory.path());
  const std::string missing = directory.file("none/list");
  EXPECT_EQ(
      debugRecordsOf([&] { EXPECT_EQ(manager.readExcludedOids(missing), 1); },
                     support::kDebugEvents),
      head("0x53051300") + "readExcludedOids: Unable to open file for reading, " + missing + ".\n");
  EXPECT_EQ(
      debugRecordsOf([&] { EXPECT_EQ(manager.modifySchema(missing), 1); }, support::kDebugEvents),
      head("0x53051d00") + "modifySchema: Unable to open file, " + missing + ", for reading.\n");
  EXPECT_EQ(
      debugRecordsOf([&] { EXPECT_EQ(manager.writeSetToFile({"1"}, missing), 1); },
                     support::kDebugEvents),
      head("0x53051200") + "writeSetToFile: Unable to open file for writing, " + missing + ".\n");
  EXPECT_EQ(
      debugRecordsOf([&] { EXPECT_EQ(manager.writeFile(directory.file("none"), "V3.user.at"), 1); },
                     support::kDebugEvents),
      head("0x53051200") + "writeSetToFile: Unable to open file for writing, " +
          directory.file("none/V3.user.at") + ".\n");
}

TEST(DebugRecords, NamesAndOidsThatAreNotKnown) {
  TemporaryDirectory directory;
  SchemaManager manager(directory.path());
  SchemaManager source(directory.path());
  EXPECT_EQ(
      debugRecordsOf([&] { EXPECT_EQ(manager.writeFile(directory.path(), "V3.config.oc"), 89); },
                     support::kDebugEvents),
      head("0x53051100") + "writeFile: Unexpected file name given, V3.config.oc\n");
  EXPECT_EQ(debugRecordsOf([&] { EXPECT_EQ(manager.delOidFromFileSet("1.2.3"), 32); },
                           support::kDebugEvents),
            head("0x53051400") + "delOidFromFileSet: Unable to delete OID from set, 1.2.3.\n");
  EXPECT_EQ(debugRecordsOf([&] { EXPECT_EQ(manager.findOidInSet(&source, "1.2.3"), nullptr); },
                           support::kDebugEvents),
            head("0x53051900") + "findOidInSet: Unable to find OID, 1.2.3, in set.\n");
  EXPECT_EQ(debugRecordsOf([&] { EXPECT_EQ(manager.delOidFromModSch("1.2.3"), 32); },
                           support::kDebugEvents),
            "");
}

struct MergeRow {
  const char* definition;
  const char* identifier;
  const char* message;
};

TEST(DebugRecords, MergesOfDefinitionsInNoFileSet) {
  const MergeRow rows[] = {
      {"attributetypes=( 1.1 NAME 'a' DESC 'd' )\n", "0x53051600",
       "mergeAttrs: findOidInSet returned NULL\n"},
      {"ORVAttributetypes=( 1.1 LENGTH 5 )\n", "0x53051700",
       "mergeORVAttrs: findOidInSet returned NULL\n"},
      {"objectclasses=( 1.1 NAME 'o' STRUCTURAL )\n", "0x53051800",
       "mergeObjClasses: findOidInSet returned NULL\n"},
  };
  for (const MergeRow& row : rows) {
    TemporaryDirectory directory;
    directory.write("V3.modifiedschema", row.definition);
    SchemaManager source(directory.path());
    SchemaManager target(directory.path());
    ASSERT_EQ(source.readFile("V3.modifiedschema"), 0);
    EXPECT_EQ(
        debugRecordsOf([&] { EXPECT_FALSE(target.mergeSchemas(&source)); }, support::kDebugEvents),
        head("0x53051900") + "findOidInSet: Unable to find OID, 1.1, in set.\n" +
            head(row.identifier) + row.message);
  }
}

class TablelessLexer : public SchemaLexan {
 public:
  explicit TablelessLexer(const std::string& directory) : SchemaLexan(directory, "input") {
    delete m_symtable;
    m_symtable = nullptr;
  }
};

TEST(DebugRecords, MatchWithoutASymbolTable) {
  TemporaryDirectory directory;
  TablelessLexer lexer(directory.path());
  EXPECT_EQ(debugRecordsOf([&] { lexer.match(-1); }, support::kDebugEvents),
            head("0x53040300") + "match: No pointer to symbol table");
}

// The arguments go through a printf-style format, and never are one.
TEST(DebugRecords, ArgumentsAreNoFormats) {
  TemporaryDirectory directory;
  SchemaManager manager(directory.path());
  EXPECT_EQ(debugRecordsOf([&] { manager.delOidFromFileSet("%s%n%d"); }, support::kDebugEvents),
            head("0x53051400") + "delOidFromFileSet: Unable to delete OID from set, %s%n%d.\n");
}

TEST(DebugRecords, OnlyTheirOwnBitSwitchesThem) {
  TemporaryDirectory directory;
  SchemaManager manager(directory.path());
  const auto action = [&] {
    manager.readFile("V3.user.at");
    manager.delOidFromFileSet("1");
  };
  EXPECT_EQ(debugRecordsOf(action, 0), "");
  EXPECT_EQ(debugRecordsOf(action, ~support::kDebugEvents), "");
  const std::string expected = head(kReadFile) + "readFile: Could not open file to be parsed\n" +
                               head("0x53051400") +
                               "delOidFromFileSet: Unable to delete OID from set, 1.\n";
  EXPECT_EQ(debugRecordsOf(action, support::kDebugEvents), expected);
  EXPECT_EQ(debugRecordsOf(action, ~std::uint64_t{0}), expected);
}

TEST(DebugRecords, NoOtherRecordsComeWithThem) {
  TemporaryDirectory directory;
  directory.write("V3.user.at", "attributetypes=( 1.1 NAME 'a' DESC 'd' )\n");
  SchemaManager manager(directory.path());
  TraceRecorder recorder(support::kDebugEvents);
  manager.readFile("V3.user.at");
  manager.writeFile(directory.path(), "V3.user.at");
  for (const std::string& record : recorder.records()) {
    EXPECT_EQ(record.rfind("debug ", 0), 0U) << record;
  }
}

// The locale's records stand around the file's: the analyser goes before the outcome is recorded on
// success, and after it on failure.
TEST(DebugRecords, OfAnAnalyserStandAroundThoseOfItsFile) {
  ::setenv("LC_ALL", "C", 1);
  std::setlocale(LC_ALL, "C");
  TemporaryDirectory directory;
  directory.write("V3.user.at", "");
  SchemaManager manager(directory.path());
  const std::vector<std::string> before = {
      "SchemaLexan: current locale settings on the system is: C\n",
      "SchemaLexan: changing locale settings to \"C\" \n",
      "SchemaLexan: locale settings on the system after changing is: C \n"};
  const std::vector<std::string> after = {
      "~SchemaLexan: resetting locale before returning to system default settings. \n",
      "lexan: locale settings after resetting is: C"};

  TraceRecorder recorder(support::kDebugEvents);
  EXPECT_EQ(manager.readFile("V3.user.at"), 0);
  std::vector<std::string> expected = before;
  expected.push_back("readFile: Parsing file: V3.user.at in directory: " + directory.path() +
                     " \n");
  expected.insert(expected.end(), after.begin(), after.end());
  expected.push_back("readFile: Successfully parsed the file, V3.user.at.\n");
  EXPECT_EQ(recorder.messages(), expected);

  recorder.clear();
  EXPECT_EQ(manager.readFile("V3.user.oc"), 1);
  expected = before;
  expected.push_back("readFile: Could not open file to be parsed\n");
  expected.insert(expected.end(), after.begin(), after.end());
  EXPECT_EQ(recorder.messages(), expected);
  ::unsetenv("LC_ALL");
}

}  // namespace
