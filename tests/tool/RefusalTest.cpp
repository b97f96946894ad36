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

constexpr char kUndecided[] =
    "schema-migrate: error: refused: nothing was written; plan --template makes a file in which what is undecided can be decided\n";

const Row kRows[] = {
    {"NameUnderAnotherOid",
     {{"V3.user.oc", "objectclasses=( 1.2 NAME 'A' ABSTRACT )\n"}},
     {{"V3.user.oc", "objectclasses=( 1.1 NAME 'a' ABSTRACT )\n"}},
     "1.2\n",
     "schema-migrate: error: undecided: object class A (1.2): OLD and NEW differ, and without BASE nobody can tell who changed: OID\n"},
    {"OidUnderAnotherName",
     {{"V3.user.at", "attributetypes=( 1.1 NAME 'b' OBSOLETE )\n"}},
     {{"V3.user.at", "attributetypes=( 1.1 NAME 'a' OBSOLETE )\n"}},
     "1.1\n",
     "schema-migrate: error: undecided: attribute type b (1.1): OLD and NEW differ, and without BASE nobody can tell who changed: NAME\n"},
    {"NameAndOidOfTwoOthers",
     {{"V3.user.at", "attributetypes=( 1.2 NAME 'foo' OBSOLETE )\n"}},
     {{"V3.user.at",
       "attributetypes=( 1.1 NAME 'foo' OBSOLETE )\nattributetypes=( 1.2 NAME 'bar' OBSOLETE )\n"}},
     "1.2\n",
     "schema-migrate: error: undecided: attribute type foo (1.2): its name 'foo' belongs to NEW's attribute type foo (1.1)\n"},
    {"ObjectClassThatHidesAnAttributeType",
     {{"V3.user.oc", "objectclasses=( 1.1 NAME 'a' ABSTRACT )\n"}},
     {{"V3.user.at",
       "attributetypes=( 1.1 NAME 'b' OBSOLETE )\nORVAttributetypes=( 1.1 LENGTH 3 )\n"}},
     "1.1\n",
     "schema-migrate: error: undecided: object class a (1.1): its OID 1.1 belongs to NEW's attribute type b (1.1)\n"},
    {"AttributeTypeHiddenByAnObjectClass",
     {{"V3.user.at", "attributetypes=( 1.1 NAME 'b' OBSOLETE )\n"}},
     {{"V3.user.oc", "objectclasses=( 1.1 NAME 'a' ABSTRACT )\n"}},
     "1.1\n",
     "schema-migrate: error: undecided: attribute type b (1.1): its OID 1.1 belongs to NEW's object class a (1.1)\n"},
    {"ConfigDefinitionThatDiffers",
     {{"V3.config.at", "attributetypes=( 1.1 NAME 'a' SINGLE-VALUE )\n"}},
     {{"V3.config.at", "attributetypes=( 1.1 NAME 'a' OBSOLETE )\n"}},
     "1.1\n",
     "schema-migrate: error: undecided: attribute type a (1.1): NEW has it only in V3.config.at, which is carried over as it is, and OLD's differs\n"},
};

class Refusal : public testing::TestWithParam<Row> {};

TEST_P(Refusal, NamesEachDefinitionAndWritesNothing) {
  const Row& row = GetParam();
  const ToolFolder folder;
  folder.install("old", row.oldOne);
  folder.install("new", row.newOne);
  const ToolResult result = folder.migrate();
  EXPECT_EQ(4, result.exitCode);
  EXPECT_EQ(std::string(row.err) + kUndecided, result.err);
  EXPECT_EQ("new old", folder.names());
}

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

// What OLD knows from V3.modifiedschema or a config file alone goes to the user's files by its
// kind.
TEST(Carried, FromModifiedSchemaAndConfigFiles) {
  const std::string types = "attributetypes=( 1.2 NAME 'b' OBSOLETE )\n";
  const std::string extension = "ORVAttributetypes=( 1.2 LENGTH 3 )\n";
  const ToolFolder folder;
  folder.install("old", {{"V3.modifiedschema",
                          "objectclasses=( 1.1 NAME 'a' ABSTRACT )\n" + types + extension},
                         {"V3.config.at", "attributetypes=( 1.3 NAME 'c' OBSOLETE )\n"},
                         {"V3.config.oc", "objectclasses=( 1.4 NAME 'd' ABSTRACT )\n"}});
  folder.install("new", {{"V3.user.at", ""}});
  EXPECT_EQ(0,
            folder.run({"migrate", "--from", "@/old", "--to", "@/new", "--out", "@/out"}).exitCode);
  const std::string heading = "# Carried over from the installation before the migration:\n";
  EXPECT_EQ((Files{{"V3.user.at",
                    heading + types + extension + "attributetypes=( 1.3 NAME 'c' OBSOLETE )\n"},
                   {"V3.user.oc", heading + "objectclasses=( 1.1 NAME 'a' ABSTRACT )\n"
                                            "objectclasses=( 1.4 NAME 'd' ABSTRACT )\n"}}),
            folder.contents("out"));
}

// The extension comes although NEW defines its attribute type as OLD does.
TEST(Carried, ExtensionWhoseAttributeTypeNewHas) {
  const ToolFolder folder;
  const std::string attribute = "attributetypes=( 1.1 NAME 'a' OBSOLETE )\n";
  const std::string extension = "ORVAttributetypes=( 1.1 LENGTH 3 )\n";
  folder.install("old", {{"V3.user.at", attribute + extension}});
  folder.install("new", {{"V3.user.at", attribute}});
  EXPECT_EQ(0, folder.migrate().exitCode);
  EXPECT_NE(std::string::npos, folder.contents("out")["V3.user.at"].find("LENGTH 3"));
}

}  // namespace
