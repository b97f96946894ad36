// Reading schema files that cannot be parsed: messages, diagnostic files, what stays.

#include <gtest/gtest.h>

#include <algorithm>
#include <string>
#include <vector>

#include "Calls.h"
#include "Files.h"
#include "Installation.h"
#include "Rows.h"

using namespace support;

namespace {

struct Failure {
  const char* name;
  const char* text;      // of V3.user.at
  const char* messages;  // after "Parsing file"
  const char* attr;      // the whole of /tmp/attr.txt, and so on
  const char* orvattr;
  const char* objectclass;
  int tokenValueIndex;  // in /tmp/lexan.txt
  int line;
  int lookahead;
  const char* state;  // of the manager: what was read before the failure
};

class ReadFailure : public testing::TestWithParam<Failure> {};

constexpr char kFirstMessage[] = "readFile: There was an error parsing the file, V3.user.at.\n";

// /tmp/lexan.txt without the lines of the symbol table, which are indented by one TAB more.
std::string analyserDump(const std::string& file) {
  std::string dump;
  for (const std::string& line : splitLines(file)) {
    dump += line.compare(0, 6, "\t\t\t\t\t\t") == 0 ? "" : line + "\n";
  }
  return dump;
}

// The lines of the symbol table in /tmp/lexan.txt, unindented.
std::string symbolTableDump(const std::string& file) {
  std::string dump;
  for (const std::string& line : splitLines(file)) {
    dump += line.compare(0, 6, "\t\t\t\t\t\t") == 0 ? line.substr(6) + "\n" : "";
  }
  return dump;
}

std::string expectedAnalyserDump(const Failure& row) {
  const std::string margin(5, '\t');
  return margin + "SchemaLexan\n" +                                                    //
         margin + "{ \n" +                                                             //
         margin + "  m_filename \"V3.user.at\"\n" +                                    //
         margin + "  m_tokenvalindex " + std::to_string(row.tokenValueIndex) + "\n" +  //
         margin + "  m_line_num " + std::to_string(row.line) + "\n" +                  //
         margin + "  m_lookahead " + std::to_string(row.lookahead) + "\n" +            //
         margin + "  m_symtable \n" +                                                  //
         margin + "}\n";
}

void PrintTo(const Failure& row, std::ostream* out) { *out << row.name << ":\n" << row.text; }

}  // namespace

TEST_P(ReadFailure, IsToldAndDiagnosed) {
  const Failure& row = GetParam();
  Installation installation;
  int result = -1;
  EXPECT_EQ(messagesOf([&] { result = installation.read("V3.user.at", row.text); }),
            "readFile: Parsing file: V3.user.at in directory: " + installation.path() + " \n" +
                kFirstMessage + row.messages);
  EXPECT_EQ(result, 1);
  EXPECT_EQ(readWholeFile("/tmp/attr.txt"), row.attr);
  EXPECT_EQ(readWholeFile("/tmp/orvattr.txt"), row.orvattr);
  EXPECT_EQ(readWholeFile("/tmp/objectclass.txt"), row.objectclass);
  const std::string lexan = readWholeFile("/tmp/lexan.txt");
  EXPECT_EQ(analyserDump(lexan), expectedAnalyserDump(row));
  EXPECT_EQ(symbolTableDump(lexan), readWholeFile("/tmp/table.txt"));
  EXPECT_EQ(stateOf(installation.manager()), row.state);
}

// The diagnostic files do not depend on the trace.
TEST_P(ReadFailure, IsDiagnosedWithoutTracing) {
  const Failure& row = GetParam();
  Installation installation;
  EXPECT_EQ(installation.read("V3.user.at", row.text), 1);
  EXPECT_EQ(readWholeFile("/tmp/attr.txt"), row.attr);
  EXPECT_EQ(readWholeFile("/tmp/orvattr.txt"), row.orvattr);
  EXPECT_EQ(readWholeFile("/tmp/objectclass.txt"), row.objectclass);
  EXPECT_EQ(analyserDump(readWholeFile("/tmp/lexan.txt")), expectedAnalyserDump(row));
}

// The index of a text that is no keyword is 25, the one after the keywords.
const Failure kFailures[] = {
    {"SingleAttributeType", "attributetypes=( 1.2 NAME 'CamelName' DESC 'd' \n",
     "readFile: (1).Error occured while parsing the attribute: camelname\n",
     "attributetypes=( 1.2 NAME ( 'CamelName'  )  DESC 'd' USAGE userApplications  )\n", "", "", -1,
     2, 259, ""},
    {"AttributeTypeInABlock",
     "attributetypes {\n( 1.1 NAME 'Good' DESC 'g' )\n( 1.2 NAME 'CamelName' DESC 'd' \n",
     "readFile: (2).Error occured while parsing the attribute: camelname\n",
     "attributetypes=( 1.2 NAME ( 'CamelName'  )  DESC 'd' USAGE userApplications  )\n", "", "", -1,
     4, 259, "attributes: good=1.1(g)\nV3.user.at: 1.1\n"},
    {"NeitherFormOfAttributeTypes", "attributetypes ( 1.2 NAME 'a' DESC 'd' )\n",
     "readFile: (3).ATTR: Error occured as } was not found\n", "", "", "", -1, 1, 40, ""},
    {"SingleVendorExtension", "ORVAttributetypes=( 1.2 DBNAME ( 'a' 'B' ) ACCESS-CLASS normal \n",
     "readFile: (1).Error occured while parsing the orv attribute: OID --> 1.2\nName --> a, B\n\n\n",
     "", "ORVAttributetypes=( 1.2 DBNAME ( 'a' 'B'  ) ACCESS-CLASS normal )\n", "", -1, 2, 259, ""},
    {"VendorExtensionInABlock",
     "ORVAttributetypes {\n( 1.1 DBNAME ( 'g' 'g' ) ACCESS-CLASS good )\n"
     "( 1.2 DBNAME ( 'a' 'B' ) ACCESS-CLASS normal \n",
     "readFile: (2).Error occured while parsing the orv attribute: OID --> 1.2\nName --> a, B\n\n\n",
     "", "ORVAttributetypes=( 1.2 DBNAME ( 'a' 'B'  ) ACCESS-CLASS normal )\n", "", -1, 4, 259,
     "extensions: 1.1(good)\nV3.user.at: 1.1\n"},
    {"NeitherFormOfVendorExtensions", "\n\nORVAttributetypes 1.2\n",
     "readFile: (3).ORVATTR: Error occured as } was not found\n", "", "", "", 25, 3, 2024, ""},
    {"SingleObjectClass", "objectclasses=( 1.2 NAME 'CamelClass' STRUCTURAL \n",
     "readFile: (1).Error occured while parsing the objectclass: CamelClass\n", "", "",
     "objectclasses=( 1.2 NAME 'CamelClass' STRUCTURAL )\n", -1, 2, 1009, ""},
    {"ObjectClassInABlock",
     "objectclasses {\n( 1.1 NAME 'Good' DESC 'g' )\n( 1.2 NAME 'CamelClass' AUXILIARY 1.3{ ) }\n",
     "readFile: (2).Error occured while parsing the objectclass: CamelClass\n", "", "",
     "objectclasses=( 1.2 NAME 'CamelClass' AUXILIARY )\n", 25, 3, 2026,
     "classes: good=1.1(g)\nV3.user.at: 1.1\n"},
    {"NeitherFormOfObjectClasses", "objectclasses NAME\n",
     "readFile: (3).OBJECTCLASS: Error occured as } was not found\n", "", "", "", 1, 1, 1003, ""},

    {"KeywordIsTheLastWord", "attributetypes\n",
     "readFile: (3).ATTR: Error occured as } was not found\n", "", "", "", -1, 2, 1010, ""},
    {"BlockOfAttributeTypesWithoutItsEnd", "attributetypes { ( 1.1 NAME 'Good' DESC 'g' )\n",
     "readFile: (2).Error occured while parsing the attribute: \n",
     "attributetypes=(  NAME (  ) USAGE userApplications  )\n", "", "", -1, 2, 260,
     "attributes: good=1.1(g)\nV3.user.at: 1.1\n"},
    {"BlockOfObjectClassesWithoutItsEnd", "objectclasses { ( 1.1 NAME 'Good' DESC 'g' )\n",
     "readFile: (2).Error occured while parsing the objectclass: \n", "", "",
     "objectclasses=(  NAME STRUCTURAL )\n", -1, 2, 260, "classes: good=1.1(g)\nV3.user.at: 1.1\n"},
    {"BlockOfVendorExtensionsWithoutItsEnd", "ORVAttributetypes { ( 1.1 LENGTH 5 )\n",
     "readFile: (2).Error occured while parsing the orv attribute: OID --> \nName --> \n\n\n", "",
     "ORVAttributetypes=(  ACCESS-CLASS normal )\n", "", -1, 2, 260,
     "extensions: 1.1(normal)\nV3.user.at: 1.1\n"},
    {"DefinitionEndsAtTheNextKeyword",
     "objectclasses=( 1.1 NAME 'Good' DESC 'g' )\n"
     "attributetypes=( 1.2 NAME 'Bad' DESC 'b'\n"
     "attributetypes=( 1.3 NAME 'never' DESC 'n' )\n",
     "readFile: (1).Error occured while parsing the attribute: bad\n",
     "attributetypes=( 1.2 NAME ( 'Bad'  )  DESC 'b' USAGE userApplications  )\n", "", "", 8, 3,
     1010, "classes: good=1.1(g)\nV3.user.at: 1.1\n"},
    {"ListWithoutParenthesesTakesTheClosingOne",
     "objectclasses=( 1.1 NAME 'Bare' DESC 'd' MUST cn )\n",
     "readFile: (1).Error occured while parsing the objectclass: Bare\n", "", "",
     "objectclasses=( 1.1 NAME 'Bare'  DESC 'd' STRUCTURAL MUST ( cn ) )\n", -1, 2, 260, ""},
    {"DefinitionsBeforeTheFailureStay",
     "attributetypes=( 1.1 NAME 'a' DESC 'd' )\n"
     "ORVAttributetypes=( 1.1 LENGTH 5 )\n"
     "objectclasses=( 2.1 NAME 'c' DESC 'd' )\n"
     "objectclasses {\n( 2.2 NAME 'e' DESC 'd' )\n( 2.3 NAME 'Bad' DESC 'd' \n",
     "readFile: (2).Error occured while parsing the objectclass: Bad\n", "", "",
     "objectclasses=( 2.3 NAME 'Bad'  DESC 'd' STRUCTURAL )\n", -1, 7, 259,
     "attributes: a=1.1(d)\nclasses: c=2.1(d) e=2.2(d)\nextensions: 1.1(normal)\n"
     "V3.user.at: 1.1 2.1 2.2\n"},
};

INSTANTIATE_TEST_SUITE_P(Rows, ReadFailure, testing::ValuesIn(kFailures), nameOfRow<Failure>);

TEST(ReadFailureDiagnostics, SymbolTableIsDumpedWithAllKeywords) {
  Installation installation;
  EXPECT_EQ(installation.read("V3.user.at", "attributetypes 1.2.3.4.5 \n"), 1);
  const std::string table = readWholeFile("/tmp/table.txt");
  for (const char* text : {"objectclasses",
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
                           "APPROX",
                           "1.2.3.4.5"}) {
    EXPECT_NE(table.find(text), std::string::npos) << text << " is not in\n" << table;
  }
}

TEST(ReadFailureDiagnostics, CallsLeaveTheirRecords) {
  Installation installation;
  EXPECT_EQ(callsOf([&] { installation.read("V3.user.at", "attributetypes=( 1.1\n"); }),
            "readFile{Attribute.parse Attribute.dump}=1");
  EXPECT_EQ(callsOf([&] { installation.read("V3.user.at", "objectclasses=( 1.1\n"); }),
            "readFile{ObjectClass.parse ObjectClass.dump}=1");
  EXPECT_EQ(callsOf([&] { installation.read("V3.user.at", "ORVAttributetypes=( 1.1\n"); }),
            "readFile{ORVAttribute.parse ORVAttribute.dump}=1");
  EXPECT_EQ(callsOf([&] { installation.read("V3.user.at", "attributetypes ( 1.1\n"); }),
            "readFile=1");
}

// The messages, the definition, then the analyser and its table: in this order, once each.
TEST(ReadFailureDiagnostics, OrderOfRecords) {
  Installation installation;
  installation.write("V3.user.at", "attributetypes=( 1.1\n");
  const TraceRecorder trace(kAllEvents);
  EXPECT_EQ(installation->readFile("V3.user.at"), 1);
  std::vector<std::string> records = trace.records();
  const std::vector<std::string> expected = {
      "exit 0x53010200 kind 33 bit 4096 code 0",
      "debug 0x53051000 level 0x3400000 0xc8010000: readFile: There was an error parsing the file, V3.user.at.\n",
      "debug 0x53051000 level 0x3400000 0xc8010000: readFile: (1).Error occured while parsing the attribute: \n",
      "entry 0x53010300 level 0x3200000",
      "exit 0x53010300 kind 33 bit 4096 code 0",
      "entry 0x53040700 level 0x3200000",
      "exit 0x53040700 kind 33 bit 4096 code 0",
      "entry 0x53040600 level 0x3200000",
      "exit 0x53040600 kind 33 bit 4096 code 0",
  };
  const auto start = std::find(records.begin(), records.end(), expected.front());
  ASSERT_GE(records.end() - start, static_cast<std::ptrdiff_t>(expected.size()));
  EXPECT_EQ(std::vector<std::string>(start, start + static_cast<std::ptrdiff_t>(expected.size())),
            expected);
  EXPECT_EQ(records.back(), "exit 0x53051000 kind 33 bit 4096 code 1");
}

TEST(ReadFailureDiagnostics, SuccessEmptiesTheFourFilesAndLeavesTheTable) {
  Installation installation;
  for (const char* bad :
       {"attributetypes=( 1.1\n", "ORVAttributetypes=( 1.1\n", "objectclasses=( 1.1\n"}) {
    EXPECT_EQ(installation.read("V3.user.at", bad), 1);
  }
  const std::string table = readWholeFile("/tmp/table.txt");
  EXPECT_NE(table, "");
  EXPECT_NE(readWholeFile("/tmp/objectclass.txt"), "");
  EXPECT_NE(readWholeFile("/tmp/lexan.txt"), "");
  EXPECT_EQ(installation.read("V3.user.at", attributeType("1.1", "a")), 0);
  for (const char* file :
       {"/tmp/attr.txt", "/tmp/orvattr.txt", "/tmp/objectclass.txt", "/tmp/lexan.txt"}) {
    EXPECT_EQ(readWholeFile(file), "") << file;
  }
  EXPECT_EQ(readWholeFile("/tmp/table.txt"), table);
}

// A call that returns before it parses leaves the diagnostics of the call before.
TEST(ReadFailureDiagnostics, AreNotTouchedByACallThatDoesNotParse) {
  Installation installation;
  EXPECT_EQ(installation.read("V3.user.at", "objectclasses=( 1.1\n"), 1);
  const std::string definition = readWholeFile("/tmp/objectclass.txt");
  const std::string lexan = readWholeFile("/tmp/lexan.txt");
  EXPECT_EQ(installation->readFile("V3.missing"), 1);
  EXPECT_EQ(installation.read("V3.unknown", ""), 89);
  EXPECT_EQ(readWholeFile("/tmp/objectclass.txt"), definition);
  EXPECT_EQ(definition, "objectclasses=( 1.1 NAME STRUCTURAL )\n");
  EXPECT_EQ(readWholeFile("/tmp/lexan.txt"), lexan);
  EXPECT_NE(lexan, "");
}

TEST(ReadFailureDiagnostics, ManagerReadsOnAfterAFailure) {
  Installation installation;
  EXPECT_EQ(installation.read("V3.user.at", attributeType("1.1", "a") + "attributetypes=( 1.2\n"),
            1);
  EXPECT_EQ(installation.read("V3.user.oc", objectClass("2.1", "c")), 0);
  EXPECT_EQ(installation.read("V3.user.at", attributeType("1.2", "b")), 0);
  EXPECT_EQ(stateOf(installation.manager()),
            "attributes: a=1.1(text) b=1.2(text)\nclasses: c=2.1(text)\n"
            "V3.user.oc: 2.1\nV3.user.at: 1.1 1.2\n");
}
