// Whole runs: what is printed, what is written, and the definitions that a warning names.

#include <gtest/gtest.h>

#include <cstdio>
#include <cstdlib>
#include <filesystem>

#include "ToolRun.h"

namespace {

using Files = ToolFolder::Files;

// An installation with every file and every fate in it.
const Files kOld = {
    {"V3.system.at",
     "attributetypes=( 2.5.4.3 NAME ( 'cn' 'commonName' ) SUP name )\n"
     "attributetypes=( 2.5.4.4 NAME 'sn' SUP name )\n"
     "attributetypes=( 2.5.4.7 NAME 'l' DESC 'as shipped' )\n"
     "attributetypes=( 2.5.4.9 NAME 'street' DESC 'withdrawn' )\n"},
    {"V3.system.oc",
     "objectclasses=( 2.5.6.6 NAME 'person' SUP top STRUCTURAL MUST ( cn $ sn ) )\n"},
    {"V3.orv.at",
     "ORVAttributetypes=( 2.5.4.3 DBNAME ( 'cn' 'cn' ) ACCESS-CLASS normal LENGTH 256 )\n"
     "ORVAttributetypes=( 2.5.4.4 DBNAME ( 'sn' 'sn' ) LENGTH 128 EQUALITY )\n"},
    {"V3.user.at",
     "attributetypes {\n( 1.1.10 NAME 'siteCode' SYNTAX 1.3{4} SINGLE-VALUE )\n( 1.1.2 NAME 'siteName' OBSOLETE )\n}\n"
     "ORVAttributetypes=( 1.1.10 DBNAME ( 'siteCode' ) )\n"},
    {"V3.user.oc",
     "objectclasses=( 1.2.1 NAME 'sitePerson' SUP person AUXILIARY MAY ( siteCode ) )\n"
     "objectclasses=( 1.2.2 NAME 'siteOld' STRUCTURAL )\n"},
    {"V3.modifiedschema", "attributetypes=( 2.5.4.7 NAME 'l' DESC 'changed here' )\n"},
    {"V3.config.at", "attributetypes=( 1.3.1 NAME 'cfg' SINGLE-VALUE )\n"},
};

const Files kNew = {
    {"V3.system.at",
     "attributetypes=( 2.5.4.3 NAME ( 'CN' 'commonName' ) SUP name )\n"
     "attributetypes=( 2.5.4.4 NAME 'sn' SUP name )\n"
     "attributetypes=( 2.5.4.7 NAME 'l' DESC 'as shipped' )\n"},
    {"V3.system.oc",
     "objectclasses=( 2.5.6.6 NAME 'person' SUP top STRUCTURAL MUST ( sn $ cn ) )\n"
     "objectclasses=( 2.5.6.7 NAME 'newClass' ABSTRACT )\n"},
    {"V3.orv.at",
     "ORVAttributetypes=( 2.5.4.3 DBNAME ( 'cn' 'cn' ) ACCESS-CLASS normal LENGTH 256 )\n"
     "ORVAttributetypes=( 2.5.4.4 DBNAME ( 'sn' 'sn' ) LENGTH 64 EQUALITY )\n"},
    {"V3.config.at", "attributetypes=( 1.3.1 NAME 'cfg' SINGLE-VALUE )  # kept to the byte\n"},
    {"V3.config.oc", "objectclasses=( 1.3.2 NAME 'cfgClass' STRUCTURAL )"},
};

constexpr char kCn[] =
    "attributetypes=( 2.5.4.3 NAME ( 'CN' 'commonName'  ) SUP name USAGE userApplications  )\nORVAttributetypes=( 2.5.4.3 DBNAME ( 'cn' 'cn'  ) ACCESS-CLASS normal LENGTH 256 )\n";
constexpr char kSn[] =
    "attributetypes=( 2.5.4.4 NAME ( 'sn'  ) SUP name USAGE userApplications  )\nORVAttributetypes=( 2.5.4.4 DBNAME ( 'sn' 'sn'  ) ACCESS-CLASS normal LENGTH 128 EQUALITY )\n";

const Files kOut = {
    {"V3.system.at",
     kHeader + std::string(kCn) + kSn +
         "attributetypes=( 2.5.4.7 NAME ( 'l'  )  DESC 'changed here' USAGE userApplications  )\n"},
    {"V3.system.oc",
     kHeader +
         std::string(
             "objectclasses=( 2.5.6.6 NAME 'person' SUP ( top ) STRUCTURAL MUST ( sn $ cn ) )\nobjectclasses=( 2.5.6.7 NAME 'newClass' ABSTRACT )\n")},
    {"V3.orv.at", kHeader + std::string(kCn) + kSn},
    {"V3.orv.oc", ""},
    {"V3.user.at",
     kHeader +
         std::string(
             "attributetypes=( 1.1.10 NAME ( 'siteCode'  ) SYNTAX 1.3{4} SINGLE-VALUE USAGE userApplications  )\nORVAttributetypes=( 1.1.10 DBNAME ( 'siteCode'  ) ACCESS-CLASS normal )\nattributetypes=( 1.1.2 NAME ( 'siteName'  ) OBSOLETE USAGE userApplications  )\n")},
    {"V3.user.oc",
     kHeader +
         std::string(
             "objectclasses=( 1.2.1 NAME 'sitePerson' SUP ( person ) AUXILIARY MAY ( siteCode ) )\n")},
    {"V3.modifiedschema", ""},
    {"V3.config.at", kNew.at("V3.config.at")},
    {"V3.config.oc", kNew.at("V3.config.oc")},
};

constexpr char kPrinted[] = R"(No objectClasses definition collisions found.
The following attributeTypes collisions found:
OID --> 2.5.4.7
Name --> l

The following ORVAttributeTypes definition collisions found:
OID --> 2.5.4.4
Name --> sn, sn


File               read OLD  read NEW     kept    added  replaced   written
V3.system.at              4         3        3        0         2         5
V3.system.oc              1         2        2        0         0         2
V3.orv.at                 2         2        3        0         1         4
V3.orv.oc                 0         0        0        0         0         0
V3.user.at                3         0        0        3         0         3
V3.user.oc                2         0        0        1         0         1
V3.modifiedschema         1         0        0        0         0         0
V3.config.at              1         1        1        0         0         1
V3.config.oc              0         1        1        0         0         1
Total                    14         9       10        4         3        17
V3.config.at is NEW's, unchanged.
V3.config.oc is NEW's, unchanged.
Of OLD's 14 definitions:
  5 the same in NEW
  4 added to NEW's
  2 in the place of NEW's
  1 excluded
  1 withdrawn
  1 repeated, or superseded by V3.modifiedschema
Written and verified: @/out
)";

// What is excluded and withdrawn in the whole run.
const std::vector<std::string> kLists = {"--exclude-oids", "@/more",     "--exclude-oids",
                                         "@/exclude",      "--withdraw", "@/withdraw"};

void installWhole(const ToolFolder& folder) {
  folder.install("old", kOld);
  folder.install("new", kNew);
  folder.write("exclude", "# site\n1.2.2\n");
  folder.write("more", "9.9.9 8.8\n");
  folder.write("withdraw", "2.5.4.9 # street\n");
}

TEST(Migration, WholeRun) {
  const ToolFolder folder;
  installWhole(folder);
  const ToolResult result = folder.migrate(kLists);
  EXPECT_EQ(0, result.exitCode);
  EXPECT_EQ("", result.err);
  EXPECT_EQ(kPrinted, result.out);
  EXPECT_EQ(kOut, folder.contents("out"));
  EXPECT_EQ(kOld, folder.contents("old"));
  EXPECT_EQ(kNew, folder.contents("new"));
  EXPECT_EQ("exclude more new old out withdraw", folder.names());
}

TEST(Migration, OfItsOwnResultChangesNothing) {
  const ToolFolder folder;
  installWhole(folder);
  ASSERT_EQ(0, folder.migrate(kLists).exitCode);
  const ToolResult result =
      folder.run({"migrate", "--from", "@/out", "--to", "@/new", "--out", "@/again"});
  EXPECT_EQ(0, result.exitCode);
  EXPECT_EQ("", result.err);
  EXPECT_EQ(folder.contents("out"), folder.contents("again"));
}

// The environment's locale, a trace or the time zone must not be seen in the result.
TEST(Migration, IsTheSameInEveryEnvironment) {
  const ToolFolder folder;
  installWhole(folder);
  const std::string before = folder.snapshot();
  const std::pair<const char*, const char*> kSettings[] = {
      {"LC_ALL", "C"},
      {"LC_ALL", "C.UTF-8"},
      {"LC_ALL", "tr_TR.ISO-8859-9"},
      {"LC_ALL", "not-a-place"},
      {"LC_CTYPE", "tr_TR"},
      {"TZ", "Pacific/Auckland"},
      {"LANG", "xx_YY.UTF-8"},
      {"LIBSCHEMA_TRACE", "0xffffffff"},
  };
  for (const auto& setting : kSettings) {
    SCOPED_TRACE(std::string(setting.first) + "=" + setting.second);
    const ToolResult result =
        folder.migrate(kLists, [&] { ::setenv(setting.first, setting.second, 1); });
    EXPECT_EQ(0, result.exitCode);
    EXPECT_EQ(kPrinted, result.out);
    EXPECT_EQ(kOut, folder.contents("out"));
    std::filesystem::remove_all(folder.file("out"));
    EXPECT_EQ(before, folder.snapshot());
  }
}

// Linked into a host with a trace facility of its own, all of whose bits are on.
TEST(Migration, IsTheSameInAHostThatTracesEverything) {
  ToolFolder folder;
  folder.useProgram(TRACING_SCHEMA_MIGRATE);
  installWhole(folder);
  const ToolResult result =
      folder.migrate(kLists, [&] { ::setenv("HOST_RECORDS", folder.file("records").c_str(), 1); });
  EXPECT_EQ(0, result.exitCode);
  EXPECT_EQ("", result.err);
  EXPECT_EQ(kPrinted, result.out);
  EXPECT_EQ(kOut, folder.contents("out"));
  int entries = 0;
  int exits = 0;
  int messages = 0;
  const std::string records = support::readWholeFile(folder.file("records"));
  ASSERT_EQ(3, std::sscanf(records.c_str(), "entries %d exits %d messages %d", &entries, &exits,
                           &messages))
      << records;
  EXPECT_GT(entries, 100);
  EXPECT_EQ(entries, exits);
  EXPECT_GT(messages, 10);
}

// ---- Warnings ----

// A run that succeeds with warnings, or none.
struct Row {
  const char* name;
  Files oldOne;
  Files newOne;
  std::vector<std::string> more;
  const char* err;
  const char* balance;  // the end of what is printed
};

void PrintTo(const Row& row, std::ostream* out) { *out << row.name; }

const Row kRows[] = {
    {"NothingAtAll",
     {{"V3.user.at", ""}},
     {{"V3.user.at", ""}},
     {},
     "",
     "Of OLD's 0 definitions:\n"},
    {"EqualRepetitionIsNoLoss",
     {{"V3.system.at", "attributetypes=( 1.1 NAME ( 'a' 'b' ) OBSOLETE )\n"},
      {"V3.user.at", "attributetypes=( 1.1 NAME ( 'A' 'B' ) OBSOLETE )\n"}},
     {{"V3.system.at", "attributetypes=( 1.2 NAME 'c' OBSOLETE )\n"},
      {"V3.user.at", "attributetypes=( 1.2 NAME 'c' OBSOLETE )\n"}},
     {},
     "",
     "Of OLD's 2 definitions:\n  1 added to NEW's\n  1 repeated, or superseded by V3.modifiedschema\n"},
    {"SameNameInOld",
     {{"V3.system.at", "attributetypes=( 1.1 NAME 'a' OBSOLETE )\n"},
      {"V3.user.at", "attributetypes=( 1.2 NAME 'A' OBSOLETE )\n"}},
     {{"V3.user.at", ""}},
     {},
     "@/old/V3.user.at:1: warning: attribute type A (1.2) gets lost: attribute type a (1.1) at @/old/V3.system.at:1 has the same first name and is read first; remove one of the two, or give it a name of its own\n",
     "Of OLD's 2 definitions:\n  1 added to NEW's\n  1 lost; see the warnings\n"},
    {"SameNameInNewIsWrittenAllTheSame",
     {{"V3.user.oc", ""}},
     {{"V3.user.oc",
       "objectclasses=( 1.1 NAME 'a' ABSTRACT )\nobjectclasses=( 1.2 NAME 'a' ABSTRACT )\n"}},
     {},
     "",
     "Of OLD's 0 definitions:\n"},
    {"SameOidInOld",
     {{"V3.user.oc",
       "objectclasses=( 1.1 NAME 'a' ABSTRACT )\n\nobjectclasses=( 1.1 NAME 'b' ABSTRACT )\n"}},
     {{"V3.user.oc", ""}},
     {},
     "@/old/V3.user.oc:3: warning: object class b (1.1) gets lost: object class a (1.1) at @/old/V3.user.oc:1 has the same OID, and only one of the two is written; give one of them an OID of its own\n",
     "Of OLD's 2 definitions:\n  1 added to NEW's\n  1 lost; see the warnings\n"},
    {"SameOidInNew",
     {{"V3.user.oc", ""}},
     {{"V3.user.oc",
       "objectclasses=( 1.1 NAME 'a' ABSTRACT )\nobjectclasses=( 1.1 NAME 'b' ABSTRACT )\n"}},
     {},
     "@/new/V3.user.oc:2: warning: object class b (1.1) gets lost: object class a (1.1) at @/new/V3.user.oc:1 has the same OID and is read first; remove one of the two, or give it an OID of its own\n",
     "Of OLD's 0 definitions:\n"},
    {"SameOidOfTwoKindsInNew",
     {{"V3.user.oc", ""}},
     {{"V3.user.oc",
       "attributetypes=( 1.1 NAME 'a' OBSOLETE )\nobjectclasses=( 1.1 NAME 'b' ABSTRACT )\n"}},
     {},
     "@/new/V3.user.oc:1: warning: attribute type a (1.1) gets lost: object class b (1.1) at @/new/V3.user.oc:2 has the same OID, and of the two only the object class is written; give one of them an OID of its own\n",
     "Of OLD's 0 definitions:\n"},
    {"ExtensionWithoutItsAttributeType",
     {{"V3.orv.at", "ORVAttributetypes=( 1.1 LENGTH 3 )\n"}},
     {{"V3.orv.at", "# none\nORVAttributetypes=( 1.2 LENGTH 3 )\n"}},
     {},
     "@/old/V3.orv.at:1: warning: vendor extension (1.1) gets lost: no attribute type has its OID, and a vendor extension is written with its attribute type only; define the attribute type, or remove the extension\n"
     "@/new/V3.orv.at:2: warning: vendor extension (1.2) gets lost: no attribute type has its OID, and a vendor extension is written with its attribute type only; define the attribute type, or remove the extension\n",
     "Of OLD's 1 definition:\n  1 lost; see the warnings\n"},
    {"TwoExtensionsOfOneAttributeType",
     {{"V3.orv.at",
       "attributetypes=( 1.1 NAME 'a' OBSOLETE )\nORVAttributetypes=( 1.1 LENGTH 3 )\nORVAttributetypes=( 1.1 LENGTH 4 )\n"}},
     {{"V3.user.at", ""}},
     {},
     "@/old/V3.orv.at:3: warning: vendor extension (1.1) gets lost: the one at @/old/V3.orv.at:2 has the same OID and is read first; remove one of the two\n",
     "Of OLD's 3 definitions:\n  2 added to NEW's\n  1 lost; see the warnings\n"},
    {"NoOidInABlock",
     {{"V3.user.at", "attributetypes {\n( NAME 'a' OBSOLETE )\n}\n"}},
     {{"V3.user.at", "attributetypes {\n( NAME 'b' OBSOLETE )\n}\n"}},
     {},
     "@/old/V3.user.at:2: warning: attribute type a (no OID) gets lost: it has no OID, and in a block such a definition is passed over; give it its OID\n"
     "@/new/V3.user.at:2: warning: attribute type b (no OID) gets lost: it has no OID, and in a block such a definition is passed over; give it its OID\n",
     "Of OLD's 1 definition:\n  1 lost; see the warnings\n"},
    {"SingleDefinitionWithoutOidIsCarriedOver",
     {{"V3.user.at", "attributetypes=( NAME 'a' OBSOLETE )\n"}},
     {{"V3.user.at", ""}},
     {},
     "",
     "Of OLD's 1 definition:\n  1 added to NEW's\n"},
    {"ChangeToAConfigDefinition",
     {{"V3.config.oc", "objectclasses=( 1.1 NAME 'a' STRUCTURAL )\n"}},
     {{"V3.config.oc", "objectclasses=( 1.1 NAME 'a' ABSTRACT )\n"}},
     {},
     "@/old/V3.config.oc:1: warning: object class a (1.1) gets lost: NEW has it in a V3.config.* file only, and those are copied from NEW unchanged; if the change is still wanted, make it in the output by hand\n",
     "Of OLD's 1 definition:\n  1 lost; see the warnings\n"},
    {"ExtensionOfAWithdrawnAttributeType",
     {{"V3.user.at",
       "attributetypes=( 1.1 NAME 'a' OBSOLETE )\nORVAttributetypes=( 1.1 LENGTH 3 )\n"}},
     {{"V3.user.at", ""}},
     {"--withdraw", "@/list"},
     "",
     "Of OLD's 2 definitions:\n  2 withdrawn\n"},
    {"FileOfAnotherName",
     {{"V3.user.at", ""}, {"V3.user.at~", "x"}, {"README", "x"}},
     {{"V3.user.at", ""}, {"V3.other", "x"}},
     {},
     "@/old/V3.user.at~: warning: not read, since no schema file has this name; rename it if it belongs to the schema\n"
     "@/new/V3.other: warning: not read, since no schema file has this name; rename it if it belongs to the schema\n",
     "Of OLD's 0 definitions:\n"},
    {"WordThatReplacesAnOid",
     {{"V3.user.at", "attributetypes=( 1.1 NAME 'a' OBSOLETE X-ORIGIN 'here' )\n"}},
     {{"V3.user.at", ""}},
     {},
     "@/old/V3.user.at:1:40: warning: \"X-ORIGIN\" takes the place of the OID of the attribute type that begins in line 1: it stands where a clause begins and is no keyword that is known there; remove it\n",
     "Of OLD's 1 definition:\n  1 added to NEW's\n"},
};

class Warnings : public testing::TestWithParam<Row> {};

TEST_P(Warnings, NameEachDefinitionThatGetsLost) {
  const Row& row = GetParam();
  const ToolFolder folder;
  folder.install("old", row.oldOne);
  folder.install("new", row.newOne);
  folder.write("list", "1.1\n");
  const ToolResult result = folder.migrate(row.more);
  EXPECT_EQ(0, result.exitCode);
  EXPECT_EQ(row.err, result.err);
  const std::size_t balance = result.out.find("Of OLD's");
  ASSERT_NE(std::string::npos, balance) << result.out;
  EXPECT_EQ(row.balance + std::string("Written and verified: @/out\n"), result.out.substr(balance));
}

INSTANTIATE_TEST_SUITE_P(Rows, Warnings, testing::ValuesIn(kRows),
                         [](const auto& row) { return std::string(row.param.name); });

// What an administrator changed on the server goes before what it was changed from.
TEST(Migration, ModifiedSchemaSupersedesTheOtherFiles) {
  const ToolFolder folder;
  folder.install("old", {{"V3.modifiedschema", "attributetypes=( 1.1 NAME 'a' DESC 'new' )\n"},
                         {"V3.user.at", "attributetypes=( 1.1 NAME 'a' DESC 'old' )\n"}});
  folder.install("new", {{"V3.user.at", ""}});
  EXPECT_EQ(0, folder.migrate().exitCode);
  EXPECT_EQ(
      kHeader +
          std::string("attributetypes=( 1.1 NAME ( 'a'  )  DESC 'new' USAGE userApplications  )\n"),
      folder.contents("out")["V3.user.at"]);
}

}  // namespace
