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

constexpr char kSummary[] = R"(
File               read OLD  read NEW     kept    added  replaced   merged   written
V3.system.at              4         3        3        0         2        0         5
V3.system.oc              1         2        2        0         0        0         2
V3.orv.at                 2         2        3        0         1        0         4
V3.orv.oc                 0         0        0        0         0        0         0
V3.user.at                3         0        0        3         0        0         3
V3.user.oc                2         0        0        1         0        0         1
V3.modifiedschema         1         0        0        0         0        0         0
V3.config.at              1         1        1        0         0        0         1
V3.config.oc              0         1        1        0         0        0         1
Total                    14         9       10        4         3        0        17
Written and verified: @/out
)";

// What is excluded and withdrawn in the whole run.
const std::vector<std::string> kLists = {"--exclude-oids", "@/exclude", "--withdraw",
                                         "@/withdraw",     "--prefer",  "old"};

// What is printed at the end.
std::string summaryIn(const std::string& out) {
  const std::size_t begin = out.find("\nFile ");
  return begin == std::string::npos ? out : out.substr(begin);
}

void installWhole(const ToolFolder& folder) {
  folder.install("old", kOld);
  folder.install("new", kNew);
  folder.write("exclude", "# site\n1.2.2\n");
  folder.write("withdraw", "2.5.4.9 # street\n");
}

TEST(Migration, WholeRun) {
  const ToolFolder folder;
  installWhole(folder);
  const ToolResult result = folder.migrate(kLists);
  EXPECT_EQ(0, result.exitCode);
  EXPECT_EQ("", result.err);
  EXPECT_EQ(kSummary, summaryIn(result.out));
  EXPECT_EQ(kOut, folder.contents("out"));
  EXPECT_EQ(kOld, folder.contents("old"));
  EXPECT_EQ(kNew, folder.contents("new"));
  EXPECT_EQ("exclude new old out withdraw", folder.names());
}

TEST(Migration, OfItsOwnResultChangesNothing) {
  const ToolFolder folder;
  installWhole(folder);
  ASSERT_EQ(0, folder.migrate(kLists).exitCode);
  const ToolResult result = folder.run({"migrate", "--from", "@/out", "--to", "@/new", "--out",
                                        "@/again", "--layout", "library", "--prefer", "old"});
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
    EXPECT_EQ(kSummary, summaryIn(result.out));
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
  EXPECT_EQ(kSummary, summaryIn(result.out));
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

// A run that succeeds in NEW's layout, with warnings or none, or is refused.
struct Row {
  const char* name;
  Files oldOne;
  Files newOne;
  int exitCode;
  const char* err;
};

void PrintTo(const Row& row, std::ostream* out) { *out << row.name; }

const Row kRows[] = {
    {"NothingAtAll", {{"V3.user.at", ""}}, {{"V3.user.at", ""}}, 0, ""},
    {"EqualRepetitionIsNoLoss",
     {{"V3.system.at", "attributetypes=( 1.1 NAME ( 'a' 'b' ) OBSOLETE )\n"},
      {"V3.user.at", "attributetypes=( 1.1 NAME ( 'A' 'B' ) OBSOLETE )\n"}},
     {{"V3.system.at", "attributetypes=( 1.2 NAME 'c' OBSOLETE )\n"},
      {"V3.user.at", "attributetypes=( 1.2 NAME 'c' OBSOLETE )\n"}},
     0,
     ""},
    {"SameNameInOld",
     {{"V3.system.at", "attributetypes=( 1.1 NAME 'a' OBSOLETE )\n"},
      {"V3.user.at", "attributetypes=( 1.2 NAME 'A' OBSOLETE )\n"}},
     {{"V3.user.at", ""}},
     0,
     "@/old/V3.user.at:1:16: warning: has the same first name as attribute type a (1.1) of V3.system.at:1 and is different; only the first that is read counts, attribute type a (1.1) of V3.system.at:1, and this one is lost; delete one of them, or give one another first name [T301]\n"},
    {"ExtensionWithoutItsAttributeType",
     {{"V3.orv.at", "ORVAttributetypes=( 1.1 LENGTH 3 )\n"}},
     {{"V3.orv.at", "# none\nORVAttributetypes=( 1.2 LENGTH 3 )\n"}},
     0,
     "@/old/V3.orv.at:1:19: warning: no attribute type has the OID 1.1, so that this vendor extension is never written; define the attribute type, or delete the extension [T304]\n"
     "@/new/V3.orv.at:2:19: warning: no attribute type has the OID 1.2, so that this vendor extension is never written; define the attribute type, or delete the extension [T304]\n"},
    {"TwoExtensionsOfOneAttributeType",
     {{"V3.orv.at",
       "attributetypes=( 1.1 NAME 'a' OBSOLETE )\nORVAttributetypes=( 1.1 LENGTH 3 )\nORVAttributetypes=( 1.1 LENGTH 4 )\n"}},
     {{"V3.user.at", ""}},
     0,
     "@/old/V3.orv.at:3:19: warning: has the same OID as vendor extension 1.1 of V3.orv.at:2 and is different; only the first that is read counts, vendor extension 1.1 of V3.orv.at:2, and this one is lost; delete one of them, or give one another OID [T301]\n"},
    {"NoOid",
     {{"V3.user.at", "attributetypes {\n( NAME 'a' OBSOLETE )\n}\n"}},
     {{"V3.user.at", "attributetypes=( NAME 'b' OBSOLETE )\n"}},
     4,
     "@/old/V3.user.at:2:1: error: this definition has no OID, by which everything finds it; write a numeric OID behind its \"(\" [D205]\n"
     "@/new/V3.user.at:1:16: error: this definition has no OID, by which everything finds it; write a numeric OID behind its \"(\" [D205]\n"
     "schema-migrate: error: refused: nothing was written; what can be mended without changing what is said, --repair mends in private copies; a .schema-migrate.toml in the directory accepts what is meant so\n"},
    {"ChangeToAConfigDefinition",
     {{"V3.config.oc", "objectclasses=( 1.1 NAME 'a' STRUCTURAL )\n"}},
     {{"V3.config.oc", "objectclasses=( 1.1 NAME 'a' ABSTRACT )\n"}},
     4,
     "schema-migrate: error: undecided: object class a (1.1): NEW has it only in V3.config.oc, which is carried over as it is, and OLD's differs\n"
     "schema-migrate: error: refused: nothing was written; plan --template makes a file in which what is undecided can be decided\n"},
    {"FileOfAnotherName",
     {{"V3.user.at", ""}, {"V3.user.at~", "x"}, {"README", "x"}},
     {{"V3.user.at", ""}, {"V3.other", "x"}},
     0,
     "@/old/V3.user.at~: warning: is not read, since no schema file has this name; rename it if it belongs to the schema, or move it to another directory [I702]\n"
     "@/new/V3.other: warning: is not read, since no schema file has this name; rename it if it belongs to the schema, or move it to another directory [I702]\n"},
    {"WordThatReplacesAnOid",
     {{"V3.user.at", "attributetypes=( 1.1 NAME 'a' OBSOLETE X-ORIGIN 'here' )\n"}},
     {{"V3.user.at", ""}},
     4,
     "@/old/V3.user.at:1:40: error: \"X-ORIGIN\" is no clause that the reader knows here, and it or its value takes the place of the OID; take it away, or make a comment of it [D201]\n"
     "schema-migrate: error: refused: nothing was written; what can be mended without changing what is said, --repair mends in private copies; a .schema-migrate.toml in the directory accepts what is meant so\n"},
    {"SameOidOfTwoKindsInNew",
     {{"V3.user.oc", ""}},
     {{"V3.user.oc",
       "attributetypes=( 1.1 NAME 'a' OBSOLETE )\nobjectclasses=( 1.1 NAME 'b' ABSTRACT )\n"}},
     0,
     "@/new/V3.user.oc:1:16: warning: has the OID of object class b (1.1) of V3.user.oc:2; the library writes the object class in its place, so that the attribute type is lost; give one of them an OID of its own [T303]\n"},
};

class Warnings : public testing::TestWithParam<Row> {};

TEST_P(Warnings, NameEachDefinitionThatGetsLost) {
  const Row& row = GetParam();
  const ToolFolder folder;
  folder.install("old", row.oldOne);
  folder.install("new", row.newOne);
  const ToolResult result =
      folder.run({"migrate", "--from", "@/old", "--to", "@/new", "--out", "@/out"});
  EXPECT_EQ(row.exitCode, result.exitCode);
  EXPECT_EQ(row.err, result.err);
  EXPECT_EQ(row.exitCode == 0, std::filesystem::exists(folder.file("out")));
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
