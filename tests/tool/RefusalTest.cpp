// Runs that are refused before anything is written, and what makes them go.

#include <gtest/gtest.h>

#include "ToolRun.h"

namespace {

using Files = ToolFolder::Files;

struct Row {
  const char* name;
  Files oldOne;
  Files newOne;
  const char* excluded;  // the OIDs without which the run is made
  const char* err;
};

void PrintTo(const Row& row, std::ostream* out) { *out << row.name; }

const Row kRows[] = {
    {"KnownOnlyFromModifiedSchemaOrConfig",
     {{"V3.modifiedschema",
       "objectclasses=( 1.1 NAME 'a' ABSTRACT )\nattributetypes=( 1.2 NAME 'b' OBSOLETE )\nORVAttributetypes=( 1.2 LENGTH 3 )\n"},
      {"V3.config.at", "attributetypes=( 1.3 NAME 'c' OBSOLETE )\n"},
      {"V3.config.oc", "objectclasses=( 1.4 NAME 'd' ABSTRACT )\n"}},
     {{"V3.user.at", ""}},
     "1.1 1.2 1.3 1.4\n",
     "@/old/V3.modifiedschema:2: error: attribute type b (1.2) cannot be migrated: NEW lacks it, and OLD knows it only from V3.modifiedschema, so that no file of the output would hold it; put its line into V3.user.at or V3.user.oc of OLD as well, or list 1.2 in a file for --exclude-oids to go without it\n"
     "@/old/V3.config.at:1: error: attribute type c (1.3) cannot be migrated: NEW lacks it, and OLD knows it only from V3.config.at, so that no file of the output would hold it; put its line into V3.user.at or V3.user.oc of OLD as well, or list 1.3 in a file for --exclude-oids to go without it\n"
     "@/old/V3.modifiedschema:3: error: vendor extension (1.2) cannot be migrated: NEW lacks it, and OLD knows it only from V3.modifiedschema, so that no file of the output would hold it; put its line into V3.user.at or V3.user.oc of OLD as well, or list 1.2 in a file for --exclude-oids to go without it\n"
     "@/old/V3.modifiedschema:1: error: object class a (1.1) cannot be migrated: NEW lacks it, and OLD knows it only from V3.modifiedschema, so that no file of the output would hold it; put its line into V3.user.at or V3.user.oc of OLD as well, or list 1.1 in a file for --exclude-oids to go without it\n"
     "@/old/V3.config.oc:1: error: object class d (1.4) cannot be migrated: NEW lacks it, and OLD knows it only from V3.config.oc, so that no file of the output would hold it; put its line into V3.user.at or V3.user.oc of OLD as well, or list 1.4 in a file for --exclude-oids to go without it\n"
     "schema-migrate: error: refused: 5 definitions cannot be migrated; nothing was written\n"},
    {"ExtensionWhoseOidLeavesWithItsAttributeType",
     {{"V3.user.at",
       "attributetypes=( 1.1 NAME 'a' OBSOLETE )\nORVAttributetypes=( 1.1 LENGTH 3 )\n"}},
     {{"V3.user.at", "attributetypes=( 1.1 NAME 'a' OBSOLETE )\n"}},
     "1.1\n",
     "@/old/V3.user.at:2: error: vendor extension (1.1) cannot be migrated: NEW lacks it but defines its attribute type as OLD does, and with that the OID leaves the only file of OLD that holds it; put its line into V3.orv.at of OLD as well, or list 1.1 in a file for --exclude-oids to go without it\n"
     "schema-migrate: error: refused: 1 definition cannot be migrated; nothing was written\n"},
    {"DefinitionWhoseOidLeavesWithAnother",
     {{"V3.user.at",
       "attributetypes=( 1.1 NAME 'a' OBSOLETE )\nattributetypes=( 1.1 NAME 'b' OBSOLETE )\n"}},
     {{"V3.user.at", "attributetypes=( 1.1 NAME 'a' OBSOLETE )\n"}},
     "1.1\n",
     "@/old/V3.user.at:2: error: attribute type b (1.1) cannot be migrated: NEW lacks it, and its OID leaves the files of OLD with another definition of the same OID, which NEW has; give it an OID of its own, or list 1.1 in a file for --exclude-oids to go without it\n"
     "schema-migrate: error: refused: 1 definition cannot be migrated; nothing was written\n"},
    {"NameUnderAnotherOid",
     {{"V3.user.oc", "objectclasses=( 1.2 NAME 'A' ABSTRACT )\n"}},
     {{"V3.user.oc", "objectclasses=( 1.1 NAME 'a' ABSTRACT )\n"}},
     "1.2\n",
     "@/old/V3.user.oc:1: error: object class A (1.2) cannot be migrated: NEW gives the first name to the OID 1.1 at @/new/V3.user.oc:1, and the merge would lose OLD's; give it NEW's OID or a first name of its own, or list 1.2 in a file for --exclude-oids to keep what NEW has\n"
     "schema-migrate: error: refused: 1 definition cannot be migrated; nothing was written\n"},
    {"OidUnderAnotherName",
     {{"V3.user.at", "attributetypes=( 1.1 NAME 'b' OBSOLETE )\n"}},
     {{"V3.user.at", "attributetypes=( 1.1 NAME 'a' OBSOLETE )\n"}},
     "1.1\n",
     "@/old/V3.user.at:1: error: attribute type b (1.1) cannot be migrated: NEW gives the OID to attribute type a (1.1) at @/new/V3.user.at:1, and the merge would lose OLD's; give it NEW's first name or an OID of its own, or list 1.1 in a file for --exclude-oids to keep what NEW has\n"
     "schema-migrate: error: refused: 1 definition cannot be migrated; nothing was written\n"},
    {"NameAndOidOfTwoOthers",
     {{"V3.user.at", "attributetypes=( 1.2 NAME 'foo' OBSOLETE )\n"}},
     {{"V3.user.at",
       "attributetypes=( 1.1 NAME 'foo' OBSOLETE )\nattributetypes=( 1.2 NAME 'bar' OBSOLETE )\n"}},
     "1.2\n",
     "@/old/V3.user.at:1: error: attribute type foo (1.2) cannot be migrated: NEW has the first name in attribute type foo (1.1) at @/new/V3.user.at:1 and the OID in attribute type bar (1.2) at @/new/V3.user.at:2, which the merge would remove; make name and OID agree with NEW's, or list 1.2 in a file for --exclude-oids to keep what NEW has\n"
     "schema-migrate: error: refused: 1 definition cannot be migrated; nothing was written\n"},
    {"ObjectClassThatHidesAnAttributeType",
     {{"V3.user.oc", "objectclasses=( 1.1 NAME 'a' ABSTRACT )\n"}},
     {{"V3.user.at",
       "attributetypes=( 1.1 NAME 'b' OBSOLETE )\nORVAttributetypes=( 1.1 LENGTH 3 )\n"}},
     "1.1\n",
     "@/new/V3.user.at:1: error: attribute type b (1.1) cannot be migrated: the merge would remove it: object class a (1.1) at @/old/V3.user.oc:1 has the same OID, and of the two only the object class is written; give one of them an OID of its own, or list 1.1 in a file for --exclude-oids to keep what NEW has\n"
     "@/new/V3.user.at:2: error: vendor extension (1.1) cannot be migrated: the merge would remove it: object class a (1.1) at @/old/V3.user.oc:1 has the same OID, and of the two only the object class is written; give one of them an OID of its own, or list 1.1 in a file for --exclude-oids to keep what NEW has\n"
     "schema-migrate: error: refused: 2 definitions cannot be migrated; nothing was written\n"},
    {"AttributeTypeHiddenByAnObjectClass",
     {{"V3.user.at", "attributetypes=( 1.1 NAME 'b' OBSOLETE )\n"}},
     {{"V3.user.oc", "objectclasses=( 1.1 NAME 'a' ABSTRACT )\n"}},
     "1.1\n",
     "@/old/V3.user.at:1: error: attribute type b (1.1) cannot be migrated: object class a (1.1) at @/new/V3.user.oc:1 has the same OID, and of the two only the object class is written; give one of them an OID of its own, or list 1.1 in a file for --exclude-oids to keep what NEW has\n"
     "schema-migrate: error: refused: 1 definition cannot be migrated; nothing was written\n"},
};

class Refusal : public testing::TestWithParam<Row> {};

TEST_P(Refusal, NamesEachDefinitionAndWritesNothing) {
  const Row& row = GetParam();
  const ToolFolder folder;
  folder.install("old", row.oldOne);
  folder.install("new", row.newOne);
  const ToolResult result = folder.migrate();
  EXPECT_EQ(4, result.exitCode);
  EXPECT_EQ("", result.out);
  EXPECT_EQ(row.err, result.err);
  EXPECT_EQ("new old", folder.names());
}

// The advice that every message ends in.
TEST_P(Refusal, IsLiftedByExcludingTheOids) {
  const Row& row = GetParam();
  const ToolFolder folder;
  folder.install("old", row.oldOne);
  folder.install("new", row.newOne);
  folder.write("list", row.excluded);
  const ToolResult result = folder.migrate({"--exclude-oids", "@/list"});
  EXPECT_EQ(0, result.exitCode);
  EXPECT_EQ("", result.err);
  EXPECT_EQ("list new old out", folder.names());
}

INSTANTIATE_TEST_SUITE_P(Rows, Refusal, testing::ValuesIn(kRows),
                         [](const auto& row) { return std::string(row.param.name); });

// The other advice: the definition's line in one of the files that the merge knows.
TEST(RefusalOfModifiedSchema, IsLiftedByTheLineInAnotherFile) {
  const ToolFolder folder;
  const std::string line = "attributetypes=( 1.2 NAME 'b' OBSOLETE )\n";
  folder.install("old", {{"V3.modifiedschema", line}, {"V3.user.at", line}});
  folder.install("new", {{"V3.user.at", ""}});
  EXPECT_EQ(0, folder.migrate().exitCode);
}

TEST(RefusalOfExtension, IsLiftedByTheLineInTheVendorsFile) {
  const ToolFolder folder;
  const std::string attribute = "attributetypes=( 1.1 NAME 'a' OBSOLETE )\n";
  const std::string extension = "ORVAttributetypes=( 1.1 LENGTH 3 )\n";
  folder.install("old", {{"V3.user.at", attribute + extension}, {"V3.orv.at", extension}});
  folder.install("new", {{"V3.user.at", attribute}});
  EXPECT_EQ(0, folder.migrate().exitCode);
  EXPECT_NE(std::string::npos, folder.contents("out")["V3.user.at"].find("LENGTH 3"));
}

// An OID list holds words: the OID "s badge" is none.
TEST(RefusalAdvice, NoAdviceToListWhatNoListCanHold) {
  ToolFolder folder;
  folder.install("old",
                 {{"V3.user.oc", "objectclasses=( 1.2 NAME 'a' ABSTRACT X-DESC 's badge' )\n"}});
  folder.install("new", {{"V3.user.oc", "objectclasses=( 1.1 NAME 'a' ABSTRACT )\n"}});
  const ToolResult result = folder.migrate();
  EXPECT_EQ(4, result.exitCode);
  EXPECT_NE(std::string::npos, result.err.find("give it NEW's OID or a first name of its own\n"))
      << result.err;
  EXPECT_EQ(std::string::npos, result.err.find("or list ")) << result.err;
}

}  // namespace
