// show: definitions, listings and trees.

#include <gtest/gtest.h>

#include "ToolRun.h"

namespace {

constexpr char kTypes[] =
    "attributetypes=( 2.5.4.0 NAME 'objectClass' SYNTAX 1.3.6.1.4.1.1466.115.121.1.38 )\n"
    "attributetypes=( 2.5.4.41 NAME 'name' EQUALITY caseIgnoreMatch SUBSTR caseIgnoreSubstringsMatch SYNTAX 1.3.6.1.4.1.1466.115.121.1.15{64} )\n"
    "attributetypes=( 2.5.4.3 NAME ( 'cn' 'commonName' ) DESC 'names' SUP name )\n"
    "attributetypes=( 2.5.4.4 NAME 'sn' SUP 2.5.4.41 SYNTAX 1.3.6.1.4.1.1466.115.121.1.44 SINGLE-VALUE )\n";
constexpr char kClasses[] =
    "objectclasses=( 2.5.6.0 NAME 'top' ABSTRACT MUST ( objectClass ) )\n"
    "objectclasses=( 2.5.6.6 NAME 'person' SUP top STRUCTURAL MUST ( sn $ cn ) MAY ( name ) )\n"
    "objectclasses=( 1.2.1 NAME 'sitePerson' SUP PERSON STRUCTURAL MUST ( name ) )\n"
    "objectclasses=( 1.2.2 NAME 'lost' SUP nobody STRUCTURAL )\n"
    "objectclasses=( 1.2.3 NAME 'both' SUP ( person $ sitePerson ) STRUCTURAL )\n"
    "objectclasses=( 1.2.4 NAME 'under' SUP both STRUCTURAL )\n";
constexpr char kExtensions[] =
    "ORVAttributetypes=( 2.5.4.3 DBNAME ( 'cn' 'cn' ) ACCESS-CLASS normal LENGTH 128 EQUALITY )\n";

class Show : public testing::Test {
 protected:
  Show() {
    m_folder.install("dir",
                     {{"V3.system.at", kTypes},
                      {"V3.system.oc", kClasses},
                      {"V3.orv.at", kExtensions},
                      {"V3.user.at", "attributetypes=( 2.5.4.3 NAME 'CN' DESC 'again' )\n"}});
  }
  ToolFolder m_folder;
};

struct Row {
  const char* name;
  std::vector<std::string> arguments;
  const char* out;
};

void PrintTo(const Row& row, std::ostream* out) { *out << row.name; }

constexpr char kCn[] =
    "@/dir/V3.system.at:3: attribute type cn (2.5.4.3)\n"
    "( 2.5.4.3\n"
    "  NAME ( 'cn' 'commonName' )\n"
    "  DESC 'names'\n"
    "  SUP name\n"
    "  USAGE userApplications\n"
    ")\n"
    "\n"
    "@/dir/V3.orv.at:1: vendor extension 2.5.4.3\n"
    "( 2.5.4.3\n"
    "  DBNAME ( 'cn' 'cn' )\n"
    "  ACCESS-CLASS normal\n"
    "  LENGTH 128\n"
    "  EQUALITY\n"
    ")\n";

const Row kRows[] = {
    {"ByAlias", {"commonname"}, kCn},
    {"ByOidOfATypeItsExtensionToo",
     {"2.5.4.4"},
     "@/dir/V3.system.at:4: attribute type sn (2.5.4.4)\n"
     "( 2.5.4.4\n"
     "  NAME 'sn'\n"
     "  SUP 2.5.4.41\n"
     "  SYNTAX 1.3.6.1.4.1.1466.115.121.1.44\n"
     "  SINGLE-VALUE\n"
     "  USAGE userApplications\n"
     ")\n"},
    {"SeveralOfOneNameAndWhichOneCounts",
     {"cn", "--kind", "attribute-type"},
     "@/dir/V3.system.at:3: attribute type cn (2.5.4.3)\n"
     "( 2.5.4.3\n"
     "  NAME ( 'cn' 'commonName' )\n"
     "  DESC 'names'\n"
     "  SUP name\n"
     "  USAGE userApplications\n"
     ")\n"
     "\n"
     "@/dir/V3.user.at:1: attribute type CN (2.5.4.3)\n"
     "( 2.5.4.3\n"
     "  NAME 'CN'\n"
     "  DESC 'again'\n"
     "  USAGE userApplications\n"
     ")\n"
     "  not in use; the server uses @/dir/V3.system.at:3\n"},
    {"OfOneFile",
     {"cn", "--file", "V3.user.at"},
     "@/dir/V3.user.at:1: attribute type CN (2.5.4.3)\n"
     "( 2.5.4.3\n"
     "  NAME 'CN'\n"
     "  DESC 'again'\n"
     "  USAGE userApplications\n"
     ")\n"
     "  not in use; the server uses @/dir/V3.system.at:3\n"},
    {"InheritedByAType",
     {"sn", "--inherited"},
     "@/dir/V3.system.at:4: attribute type sn (2.5.4.4)\n"
     "( 2.5.4.4\n"
     "  NAME 'sn'\n"
     "  SUP 2.5.4.41\n"
     "  SYNTAX 1.3.6.1.4.1.1466.115.121.1.44\n"
     "  SINGLE-VALUE\n"
     "  USAGE userApplications\n"
     ")\n"
     "  inherits:\n"
     "    EQUALITY caseIgnoreMatch          from attribute type name (2.5.4.41), @/dir/V3.system.at:2\n"
     "    SUBSTR caseIgnoreSubstringsMatch  from attribute type name (2.5.4.41), @/dir/V3.system.at:2\n"},
    {"InheritedByAClassAndWhoRefersToIt",
     {"sitePERSON", "--inherited", "--refs"},
     "@/dir/V3.system.oc:3: object class sitePerson (1.2.1)\n"
     "( 1.2.1\n"
     "  NAME 'sitePerson'\n"
     "  SUP PERSON\n"
     "  STRUCTURAL\n"
     "  MUST name\n"
     ")\n"
     "  inherits:\n"
     "    MUST sn           from object class person (2.5.6.6), @/dir/V3.system.oc:2\n"
     "    MUST cn           from object class person (2.5.6.6), @/dir/V3.system.oc:2\n"
     "    MUST objectClass  from object class top (2.5.6.0), @/dir/V3.system.oc:1\n"
     "  is referred to by:\n"
     "    SUP sitePerson  of object class both (1.2.3), @/dir/V3.system.oc:5\n"},
    {"NothingInheritedNobodyRefers",
     {"under", "--refs", "--inherited", "--file", "V3.system.oc"},
     "@/dir/V3.system.oc:6: object class under (1.2.4)\n"
     "( 1.2.4\n"
     "  NAME 'under'\n"
     "  SUP both\n"
     "  STRUCTURAL\n"
     ")\n"
     "  inherits:\n"
     "    MUST sn           from object class person (2.5.6.6), @/dir/V3.system.oc:2\n"
     "    MUST cn           from object class person (2.5.6.6), @/dir/V3.system.oc:2\n"
     "    MUST name         from object class sitePerson (1.2.1), @/dir/V3.system.oc:3\n"
     "    MUST objectClass  from object class top (2.5.6.0), @/dir/V3.system.oc:1\n"
     "  is referred to by:\n"
     "    nothing\n"},
    {"AsWritten",
     {"top", "--as", "written"},
     "@/dir/V3.system.oc:1: object class top (2.5.6.0)\n"
     "( 2.5.6.0\n"
     "  NAME 'top'\n"
     "  ABSTRACT\n"
     "  MUST ( objectClass )\n"
     ")\n"},
    {"ListingOfAKind",
     {"--kind", "vendor-extension"},
     "@/dir/V3.orv.at:1: vendor extension 2.5.4.3\n"},
    {"ListingOfAFile",
     {"--file", "V3.user.at"},
     "@/dir/V3.user.at:1: attribute type CN (2.5.4.3)\n"},
    {"ListingByPatternOfAnyName",
     {"--match", "COMMON*"},
     "@/dir/V3.system.at:3: attribute type cn (2.5.4.3)\n"},
    {"ListingByPatternOfTheOid",
     {"--match", "2.5.6.*"},
     "@/dir/V3.system.oc:1: object class top (2.5.6.0)\n"
     "@/dir/V3.system.oc:2: object class person (2.5.6.6)\n"},
    {"ListingOfNothing", {"--match", "zebra"}, ""},
    {"Tree",
     {"--tree"},
     "lost (its superior nobody is not defined)\n"
     "top\n"
     "  person\n"
     "    both\n"
     "      under\n"
     "    sitePerson\n"
     "      both (see above)\n"},
    {"TreeOfAttributeTypes",
     {"--tree", "--kind", "attribute-type"},
     "name\n"
     "  cn\n"
     "  sn\n"
     "objectClass\n"},
    {"TreeFromAName", {"siteperson", "--tree"}, "sitePerson\n  both\n    under\n"},
    {"TreeAsAGraph",
     {"--tree", "--format", "dot"},
     "digraph schema {\n"
     "  rankdir=BT;\n"
     "  node [shape=box];\n"
     "  \"lost\";\n"
     "  \"nobody\" [style=dashed];\n"
     "  \"lost\" -> \"nobody\" [style=dashed];\n"
     "  \"top\";\n"
     "  \"person\";\n"
     "  \"person\" -> \"top\";\n"
     "  \"both\";\n"
     "  \"both\" -> \"person\";\n"
     "  \"both\" -> \"sitePerson\";\n"
     "  \"under\";\n"
     "  \"under\" -> \"both\";\n"
     "  \"sitePerson\";\n"
     "  \"sitePerson\" -> \"person\";\n"
     "}\n"},
};

class ShowRows : public Show, public testing::WithParamInterface<Row> {};

TEST_P(ShowRows, Prints) {
  std::vector<std::string> arguments = GetParam().arguments;
  arguments.insert(arguments.begin(), {"show", "@/dir"});
  const ToolResult result = m_folder.run(arguments);
  EXPECT_EQ(0, result.exitCode);
  EXPECT_EQ("", result.err);
  EXPECT_EQ(GetParam().out, result.out);
}

INSTANTIATE_TEST_SUITE_P(Rows, ShowRows, testing::ValuesIn(kRows),
                         [](const auto& row) { return std::string(row.param.name); });

TEST_F(Show, ADefinitionThatIsWrittenAndNotKept) {
  m_folder.install(
      "odd", {{"V3.user.at", "attributetypes=( 1.2.3 NAME 'a' OBSOLETE X-ORIGIN 'RFC4519' )\n"}});
  EXPECT_EQ(
      "@/odd/V3.user.at:1: attribute type a (1.2.3)\n"
      "( 1.2.3\n  NAME 'a'\n  OBSOLETE\n  X-ORIGIN 'RFC4519'\n)\n",
      m_folder.run({"show", "@/odd", "1.2.3", "--as", "written"}).out);
  EXPECT_EQ(
      "@/odd/V3.user.at:1: attribute type a (RFC4519)\n"
      "( RFC4519\n  NAME 'a'\n  OBSOLETE\n  USAGE userApplications\n)\n",
      m_folder.run({"show", "@/odd", "a"}).out);
}

TEST_F(Show, AnUnknownNameNamesTheNearest) {
  const ToolResult result = m_folder.run({"show", "@/dir", "preson", "top", "zebra"});
  EXPECT_EQ(1, result.exitCode);
  EXPECT_EQ(0U, result.out.find("@/dir/V3.system.oc:1: object class top (2.5.6.0)\n"));
  EXPECT_EQ(
      0U, result.err.find("schema-migrate: error: nothing here is called preson; near it: person"))
      << result.err;
  EXPECT_NE(std::string::npos,
            result.err.find("\nschema-migrate: error: nothing here is called zebra\n"))
      << result.err;
}

TEST_F(Show, WhatIsWrittenAndNotKeptIsNamedByItsPlace) {
  m_folder.install("odd", {{"V3.user.oc",
                            "objectclasses=( 1.2.1 NAME 'a' ABSTRACT MUST cn )\n"
                            "objectclasses=( 1.2.2 NAME 'b' ABSTRACT )\n"}});
  const ToolResult result = m_folder.run({"show", "@/odd", "a"});
  EXPECT_EQ(1, result.exitCode);
  EXPECT_EQ("", result.out);
  EXPECT_EQ(
      "@/odd/V3.user.oc:1: error: object class a (1.2.1) is written here, and the library does not keep it; --as written shows it, and schema-migrate check tells why\n",
      result.err);
}

TEST_F(Show, WhatCannotBeRead) {
  const ToolResult result = m_folder.run({"show", "@/none"});
  EXPECT_EQ(3, result.exitCode);
  EXPECT_EQ("", result.out);
  EXPECT_EQ("@/none: error: the directory cannot be read: No such file or directory\n", result.err);
}

TEST_F(Show, LoopsOfSuperiorsEnd) {
  m_folder.install("loop", {{"V3.user.oc",
                             "objectclasses=( 1.2.1 NAME 'a' SUP b STRUCTURAL MAY ( cn ) )\n"
                             "objectclasses=( 1.2.2 NAME 'b' SUP a STRUCTURAL MAY ( sn ) )\n"}});
  const ToolResult result = m_folder.run({"show", "@/loop", "a", "--inherited"});
  EXPECT_EQ(0, result.exitCode);
  EXPECT_NE(std::string::npos, result.out.find("    MAY sn  from object class b (1.2.2), "))
      << result.out;
  const std::string tree = m_folder.run({"show", "@/loop", "--tree"}).out;
  EXPECT_NE(std::string::npos, tree.find('a')) << tree;
  EXPECT_NE(std::string::npos, tree.find('b')) << tree;
}

TEST_F(Show, HostileTextIsShownPrintable) {
  m_folder.install("bad", {{"V3.user.at", "attributetypes=( 1.2.3 NAME 'a' DESC 'x\x1b[31m' )\n"}});
  const ToolResult result = m_folder.run({"show", "@/bad", "--as", "written", "a"});
  EXPECT_NE(std::string::npos, result.out.find("DESC 'x\\x1B[31m'")) << result.out;
}

struct UsageRow {
  const char* name;
  std::vector<std::string> arguments;
  const char* err;
};

void PrintTo(const UsageRow& row, std::ostream* out) { *out << row.name; }

const UsageRow kUsageRows[] = {
    {"NoDirectory", {}, "DIR is required"},
    {"UnknownKind",
     {"@/dir", "--kind", "rule"},
     "--kind: must be attribute-type, object-class or vendor-extension"},
    {"UnknownReading", {"@/dir", "--as", "meant"}, "--as: must be written or kept"},
    {"InheritedWithoutAName", {"@/dir", "--inherited"}, "--inherited requires NAME"},
    {"GraphOfNoTree", {"@/dir", "--format", "dot"}, "--format requires --tree"},
    {"PatternAndName", {"@/dir", "cn", "--match", "c*"}, "NAME excludes --match"},
};

class ShowUsage : public Show, public testing::WithParamInterface<UsageRow> {};

TEST_P(ShowUsage, IsRefused) {
  std::vector<std::string> arguments = GetParam().arguments;
  arguments.insert(arguments.begin(), "show");
  const ToolResult result = m_folder.run(arguments);
  EXPECT_EQ(2, result.exitCode);
  EXPECT_EQ("", result.out);
  EXPECT_EQ(std::string("schema-migrate: error: ") + GetParam().err +
                "; schema-migrate show --help tells how it is used\n",
            result.err);
}

INSTANTIATE_TEST_SUITE_P(Rows, ShowUsage, testing::ValuesIn(kUsageRows),
                         [](const auto& row) { return std::string(row.param.name); });

}  // namespace
