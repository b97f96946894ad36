// Reading schema files that can be read.

#include <gtest/gtest.h>
#include <sys/stat.h>

#include <clocale>
#include <cstdlib>
#include <string>
#include <vector>

#include "Calls.h"
#include "Files.h"
#include "FixedClock.h"
#include "Installation.h"
#include "Rows.h"

using namespace support;

namespace {

struct ReadCase {
  const char* name;
  std::string text;   // of V3.user.at
  const char* state;  // of the manager, once it is read
};

class ReadFileCases : public testing::TestWithParam<ReadCase> {};

void PrintTo(const ReadCase& row, std::ostream* out) { *out << row.name << ":\n" << row.text; }

}  // namespace

TEST_P(ReadFileCases, ReadsToItsEnd) {
  Installation installation;
  EXPECT_EQ(installation.read("V3.user.at", GetParam().text), 0);
  EXPECT_EQ(stateOf(installation.manager()), GetParam().state);
}

const ReadCase kReadCases[] = {
    {"EmptyFile", "", ""},
    {"BlankFile", " \n\t\n \n", ""},
    {"CommentOnly", "# attributetypes=( 1.1 NAME 'a' DESC 'd' )\n", ""},
    {"CommentWithoutLineEnd", "# attributetypes=( 1.1 NAME 'a' DESC 'd' )", ""},
    {"SingleDefinitions",
     attributeType("1.1", "a") + objectClass("1.2", "c") + vendorExtension("1.3"),
     "attributes: a=1.1(text)\nclasses: c=1.2(text)\nextensions: 1.3(normal)\n"
     "V3.user.at: 1.1 1.2 1.3\n"},
    {"NoLineEndAfterTheLast", "attributetypes=( 1.1 NAME 'a' DESC 'd' )",
     "attributes: a=1.1(d)\nV3.user.at: 1.1\n"},
    {"AllOnOneLine",
     "attributetypes=( 1.1 NAME 'a' DESC 'd' )attributetypes=( 1.2 NAME 'b' DESC 'd' ) "
     "objectclasses=( 2.1 NAME 'c' DESC 'd' )\n",
     "attributes: a=1.1(d) b=1.2(d)\nclasses: c=2.1(d)\nV3.user.at: 1.1 1.2 2.1\n"},
    {"KeywordsInTheOtherSpelling",
     "attributeTypes=( 1.1 NAME 'a' DESC 'd' )\nobjectClasses=( 1.2 NAME 'c' DESC 'd' )\n"
     "ORVattributeTypes=( 1.3 EQUALITY )\n",
     "attributes: a=1.1(d)\nclasses: c=1.2(d)\nextensions: 1.3(normal)\n"
     "V3.user.at: 1.1 1.2 1.3\n"},
    {"AnyOtherSpellingIsSkipped", "ATTRIBUTETYPES=( 1.1 NAME 'a' DESC 'd' )\n", ""},
    {"BlankBeforeTheEqualSign", "attributetypes\n  =\n( 1.1 NAME 'a' DESC 'd' )\n",
     "attributes: a=1.1(d)\nV3.user.at: 1.1\n"},
    {"BlockOfAttributeTypes",
     "attributetypes {\n( 1.1 NAME 'a' DESC 'd' )\n( 1.2 NAME 'b' DESC 'e' )\n}\n",
     "attributes: a=1.1(d) b=1.2(e)\nV3.user.at: 1.1 1.2\n"},
    {"BlockOfObjectClasses",
     "objectclasses {\n( 1.1 NAME 'a' DESC 'd' )\n( 1.2 NAME 'b' DESC 'e' )\n}\n",
     "classes: a=1.1(d) b=1.2(e)\nV3.user.at: 1.1 1.2\n"},
    {"BlockOfVendorExtensions",
     "ORVAttributetypes {\n( 1.1 DBNAME ( 'a' 'b' ) ACCESS-CLASS x )\n( 1.2 LENGTH 5 )\n}\n",
     "extensions: 1.1(x) 1.2(normal)\nV3.user.at: 1.1 1.2\n"},
    {"BlockOnOneLine", "attributetypes{(1.1 NAME 'a' DESC 'd')(1.2 NAME 'b' DESC 'e')}",
     "attributes: a=1.1(d) b=1.2(e)\nV3.user.at: 1.1 1.2\n"},
    {"EmptyBlocks", "attributetypes { }\nobjectclasses { }\nORVAttributetypes { }\n", ""},
    {"DefinitionsAfterABlock",
     "attributetypes { ( 1.1 NAME 'a' DESC 'd' ) }\n" + attributeType("1.2", "b"),
     "attributes: a=1.1(d) b=1.2(text)\nV3.user.at: 1.1 1.2\n"},
    {"ObjectClassInABlockEndsAtTheNextParenthesis",
     "objectclasses {\n( 1.1 NAME 'a' DESC 'd' \n( 1.2 NAME 'b' DESC 'e' )\n}\n",
     "classes: a=1.1(d) b=1.2(e)\nV3.user.at: 1.1 1.2\n"},
    {"VendorExtensionInABlockEndsAtAParenthesisOnALaterLine",
     "ORVAttributetypes {\n( 1.1 DBNAME ( 'a' 'b' )\n( 1.2 DBNAME ( 'c' 'd' ) )\n}\n",
     "extensions: 1.1(normal) 1.2(normal)\nV3.user.at: 1.1 1.2\n"},
    {"TextBetweenDefinitionsIsSkipped",
     "junk 'quoted' 1.2.3 ) ( } { = NAME DESC\n" + attributeType("1.1", "a") +
         "more = { junk } ) 5{\n" + objectClass("1.2", "c") + "the end\n",
     "attributes: a=1.1(text)\nclasses: c=1.2(text)\nV3.user.at: 1.1 1.2\n"},
    {"CommentBetweenDefinitions",
     attributeType("1.1", "a") + "# objectclasses=( 1.2 NAME 'c' DESC 'd' )\n" +
         attributeType("1.3", "b"),
     "attributes: a=1.1(text) b=1.3(text)\nV3.user.at: 1.1 1.3\n"},
    {"CarriageReturns",
     "attributetypes=( 1.1 NAME 'a' DESC 'd' )\r\nobjectclasses=( 1.2 NAME 'c' "
     "DESC 'd' )\r\n",
     "attributes: a=1.1(d)\nclasses: c=1.2(d)\nV3.user.at: 1.1 1.2\n"},
    {"SingleWithoutOidGoesUnderTheEmptyOid",
     "attributetypes=( NAME 'a' DESC 'd' )\nobjectclasses=( NAME 'c' DESC 'd' )\n"
     "ORVAttributetypes=( DBNAME ( 'v' 'v' ) ACCESS-CLASS x )\n",
     "attributes: a=''(d)\nclasses: c=''(d)\nextensions: ''(x)\nV3.user.at: ''\n"},
    {"WithoutOidInABlockIsLeftOut",
     "attributetypes { ( NAME 'a' DESC 'd' ) ( 1.1 NAME 'b' DESC 'e' ) ( NAME 'c' DESC 'f' ) }\n"
     "objectclasses { ( NAME 'a' DESC 'd' ) ( 1.2 NAME 'b' DESC 'e' ) }\n"
     "ORVAttributetypes { ( DBNAME ( 'v' 'v' ) ACCESS-CLASS x ) ( 1.3 LENGTH 1 ) }\n",
     "attributes: b=1.1(e)\nclasses: b=1.2(e)\nextensions: 1.3(normal)\n"
     "V3.user.at: 1.1 1.2 1.3\n"},
    {"WithoutNameGoesUnderTheEmptyName",
     "attributetypes=( 1.1 DESC 'd' )\nobjectclasses=( 1.2 DESC 'e' )\n",
     "attributes: ''=1.1(d)\nclasses: ''=1.2(e)\nV3.user.at: 1.1 1.2\n"},
    {"OidThatIsAWord", "attributetypes=( a-OID NAME 'a' DESC 'd' )\n",
     "attributes: a=a-OID(d)\nV3.user.at: a-OID\n"},
    {"NumberWithALengthIsNoOid", "attributetypes=( 1.1 1.2{3} NAME 'a' DESC 'd' )\n",
     "attributes: a=1.1(d)\nV3.user.at: 1.1\n"},
    {"OneOidOfTwoKindsStandsOnceInTheSet",
     attributeType("1.1", "a") + objectClass("1.1", "c") + vendorExtension("1.1"),
     "attributes: a=1.1(text)\nclasses: c=1.1(text)\nextensions: 1.1(normal)\nV3.user.at: 1.1\n"},
};

INSTANTIATE_TEST_SUITE_P(ReadFile, ReadFileCases, testing::ValuesIn(kReadCases),
                         nameOfRow<ReadCase>);

TEST(ReadFile, SingleDefinitionWithoutOidIsInserted) {
  Installation installation{{"V3.user.at", "attributetypes=( NAME 'a' DESC 'd' )\n"}};
  EXPECT_EQ(attributeUnder(installation.manager(), ""), "a=''(d)");
  EXPECT_EQ(writtenFor(installation.manager(), {""}),
            std::string(kHeaderLine) +
                "attributetypes=(  NAME ( 'a'  )  DESC 'd' USAGE userApplications  )\n");
}

// ---- File names ----

TEST(ReadFile, NineNamesSevenOfWhichHaveASet) {
  const struct {
    const char* file;
    const char* set;
    bool isModifiedSchema;
  } rows[] = {
      {"V3.user.oc", "V3.user.oc: 1.1 1.2 1.3\n", false},
      {"V3.user.at", "V3.user.at: 1.1 1.2 1.3\n", false},
      {"V3.orv.oc", "V3.orv.oc: 1.1 1.2 1.3\n", false},
      {"V3.orv.at", "V3.orv.at: 1.1 1.2 1.3\n", false},
      {"V3.system.oc", "V3.system.oc: 1.1 1.2 1.3\n", false},
      {"V3.system.at", "V3.system.at: 1.1 1.2 1.3\n", false},
      {"V3.modifiedschema", "", true},
      {"V3.config.at", "", false},
      {"V3.config.oc", "", false},
  };
  for (const auto& row : rows) {
    SCOPED_TRACE(row.file);
    Installation installation;
    EXPECT_EQ(installation.read(row.file, attributeType("1.1", "a") + objectClass("1.2", "c") +
                                              vendorExtension("1.3")),
              0);
    EXPECT_EQ(tablesOf(installation.manager()),
              "attributes: a=1.1(text)\nclasses: c=1.2(text)\nextensions: 1.3(normal)\n");
    EXPECT_EQ(setsOf(installation.manager()), row.set);
    EXPECT_EQ(installation->isModFileEmpty(), !row.isModifiedSchema);
    EXPECT_EQ(takeFromModifiedSchema(installation.manager(), {"1.1", "1.2", "1.3"}),
              row.isModifiedSchema ? "1.1 1.2 1.3" : "");
    EXPECT_EQ(attributeUnder(installation.manager(), "1.1"), "a=1.1(text)");
    EXPECT_EQ(objectClassUnder(installation.manager(), "1.2"), "c=1.2(text)");
  }
}

TEST(ReadFile, AnyOtherNameIs89WhenTheFileExistsAnd1WhenNot) {
  for (const char* file : {"V3.Config.at", "V3.USER.AT", "v3.user.at", "V3.user.at ", "V3.user",
                           "V3.user.at.bak", "V3.config", "schema"}) {
    SCOPED_TRACE(file);
    Installation installation;
    int result = -1;
    EXPECT_EQ(messagesOf([&] { result = installation->readFile(file); }),
              "readFile: Could not open file to be parsed\n");
    EXPECT_EQ(result, 1);
    EXPECT_EQ(messagesOf([&] { result = installation.read(file, attributeType("1.1", "a")); }),
              "readFile: Unexpected file name given, " + std::string(file) + "\n");
    EXPECT_EQ(result, 89);
    EXPECT_EQ(stateOf(installation.manager()), "");
  }
}

TEST(ReadFile, NameOfAFileElsewhereIsNoneOfTheNine) {
  Installation installation;
  installation.write("V3.user.at", attributeType("1.1", "a"));
  EXPECT_EQ(installation->readFile("./V3.user.at"), 89);
}

TEST(ReadFile, MissingFileIs1) {
  Installation installation;
  int result = -1;
  EXPECT_EQ(messagesOf([&] { result = installation->readFile("V3.user.at"); }),
            "readFile: Could not open file to be parsed\n");
  EXPECT_EQ(result, 1);
}

TEST(ReadFile, DirectoryInPlaceOfTheFileIs1) {
  for (const char* file : {"V3.user.at", "V3.unknown"}) {
    SCOPED_TRACE(file);
    Installation installation;
    ASSERT_EQ(::mkdir((installation.path() + "/" + file).c_str(), 0755), 0);
    int result = -1;
    EXPECT_EQ(messagesOf([&] { result = installation->readFile(file); }),
              "readFile: Could not open file to be parsed\n");
    EXPECT_EQ(result, 1);
  }
}

// ---- Several files, and one file again ----

TEST(ReadFile, FileAgainAddsNothing) {
  const std::string text =
      attributeType("1.1", "a") + objectClass("1.2", "c") + vendorExtension("1.3");
  Installation installation{{"V3.user.at", text}};
  const std::string state = stateOf(installation.manager());
  EXPECT_EQ(installation->readFile("V3.user.at"), 0);
  EXPECT_EQ(stateOf(installation.manager()), state);
}

TEST(ReadFile, FirstFileWinsAndBothSetsHoldTheOid) {
  Installation installation{
      {"V3.system.at", attributeType("1.1", "a", "system") + vendorExtension("1.1", "system")},
      {"V3.user.at", attributeType("1.1", "a", "user") + vendorExtension("1.1", "user")}};
  EXPECT_EQ(stateOf(installation.manager()),
            "attributes: a=1.1(system)\nextensions: 1.1(system)\n"
            "V3.user.at: 1.1\nV3.system.at: 1.1\n");
}

TEST(ReadFile, ChangedFileOnlyAdds) {
  Installation installation{{"V3.user.at", attributeType("1.1", "a", "before")}};
  EXPECT_EQ(installation.read("V3.user.at",
                              attributeType("1.1", "a", "after") + attributeType("1.2", "b")),
            0);
  EXPECT_EQ(stateOf(installation.manager()),
            "attributes: a=1.1(before) b=1.2(text)\nV3.user.at: 1.1 1.2\n");
}

TEST(ReadFile, ExcludedDefinitionsAreReadLikeAllOthers) {
  Installation installation;
  installation.exclude({"1.1"});
  EXPECT_EQ(installation.read("V3.user.at", attributeType("1.1", "a")), 0);
  EXPECT_EQ(stateOf(installation.manager()), "attributes: a=1.1(text)\nV3.user.at: 1.1\n");
}

// ---- Trace and locale ----

namespace {

// The environment's locale for as long as the object lives; the process itself is in "C".
class LocaleOfEnvironment {
 public:
  explicit LocaleOfEnvironment(const char* name) {
    const char* before = std::getenv("LC_ALL");
    m_wasSet = before != nullptr;
    m_before = m_wasSet ? before : "";
    ::setenv("LC_ALL", name, 1);
    std::setlocale(LC_ALL, "C");
  }
  ~LocaleOfEnvironment() {
    if (m_wasSet) {
      ::setenv("LC_ALL", m_before.c_str(), 1);
    } else {
      ::unsetenv("LC_ALL");
    }
    std::setlocale(LC_ALL, "C");
  }
  LocaleOfEnvironment(const LocaleOfEnvironment&) = delete;
  LocaleOfEnvironment& operator=(const LocaleOfEnvironment&) = delete;

 private:
  bool m_wasSet = false;
  std::string m_before;
};

}  // namespace

TEST(ReadFile, RecordsOfAnEmptyFile) {
  Installation installation;
  installation.write("V3.user.at", "");
  const LocaleOfEnvironment environment("C");
  const TraceRecorder trace(kAllEvents);
  EXPECT_EQ(installation->readFile("V3.user.at"), 0);
  const std::vector<std::string> expected = {
      "entry 0x53051000 level 0x3200000",
      "debug global level 0x3400000 0xc8010000: SchemaLexan: current locale settings on the system is: C\n",
      "debug global level 0x3400000 0xc8010000: SchemaLexan: changing locale settings to \"C\" \n",
      "debug global level 0x3400000 0xc8010000: SchemaLexan: locale settings on the system after changing is: C \n",
      "entry 0x53040b00 level 0x3200000",
      "exit 0x53040b00 kind 33 bit 4096 code 0",
      "debug 0x53051000 level 0x3400000 0xc8010000: readFile: Parsing file: V3.user.at in directory: " +
          installation.path() + " \n",
      "entry 0x53040200 level 0x3200000",
      "exit 0x53040200 kind 33 bit 4096 code 260",
      "entry 0x53040200 level 0x3200000",
      "exit 0x53040200 kind 33 bit 4096 code 260",
      "debug global level 0x3400000 0xc8010000: ~SchemaLexan: resetting locale before returning to system default settings. \n",
      "debug global level 0x3400000 0xc8010000: lexan: locale settings after resetting is: C",
      "debug 0x53051000 level 0x3400000 0xc8010000: readFile: Successfully parsed the file, V3.user.at.\n",
      "exit 0x53051000 kind 33 bit 4096 code 0",
  };
  EXPECT_EQ(trace.records(), expected);
}

TEST(ReadFile, CallsAndExitCodes) {
  Installation installation;
  EXPECT_EQ(callsOf([&] { installation->readFile("V3.user.at"); }), "readFile=1");
  EXPECT_EQ(callsOf([&] { installation.read("other", ""); }), "readFile=89");
  EXPECT_EQ(callsOf([&] {
              installation.read("V3.user.at", attributeType("1.1", "a") + objectClass("1.2", "c") +
                                                  vendorExtension("1.3"));
            }),
            "readFile{Attribute.parse=1 ObjectClass.parse ORVAttribute.parse}");
  EXPECT_EQ(callsOf([&] { installation.read("V3.user.oc", "attributetypes=( 1.2\n"); }),
            "readFile{Attribute.parse Attribute.dump}=1");
}

// The locale in force before the call is not the one that comes back: it is the environment's.
TEST(ReadFile, LeavesTheLocaleOfTheEnvironmentWhateverTheResult) {
  const struct {
    const char* name;
    const char* file;
    const char* text;  // null: there is no such file
    int result;
  } rows[] = {
      {"Success", "V3.user.at", "attributetypes=( 1.1 NAME 'a' DESC 'd' )\n", 0},
      {"FailureInADefinition", "V3.user.at", "attributetypes=( 1.1 NAME 'a' DESC 'd' \n", 1},
      {"FailureAfterTheKeyword", "V3.user.at", "attributetypes 1.1\n", 1},
      {"MissingFile", "V3.user.oc", nullptr, 1},
      {"UnknownName", "other", "", 89},
  };
  const LocaleOfEnvironment environment("C.UTF-8");
  for (const auto& row : rows) {
    SCOPED_TRACE(row.name);
    Installation installation;
    if (row.text != nullptr) {
      installation.write(row.file, row.text);
    }
    std::setlocale(LC_ALL, "C");
    EXPECT_EQ(installation->readFile(row.file), row.result);
    EXPECT_STREQ(std::setlocale(LC_ALL, nullptr), "C.UTF-8");
  }
}
