// The records of writing, comparing, merging, checking, withdrawing and printing, in the order of
// the steps: which traced functions an operation goes through, and when.

#include "RecordOrder.h"
#include "UnfreedDefinitions.h"

namespace {

using tracetree::Installation;
using tracetree::treeOf;

// ---- Writing ----

TEST(RecordOrder, WriteADefinitionOfEachKind) {
  Installation installation(
      "objectclasses=( 1 NAME 'o' STRUCTURAL )\n"
      "attributetypes=( 2 NAME 'a' DESC 'd' )\n"
      "ORVAttributetypes=( 2 LENGTH 5 )\n"
      "attributetypes=( 3 NAME 'b' DESC 'd' )\n"
      "ORVAttributetypes=( 4 LENGTH 5 )\n");
  EXPECT_EQ(treeOf([&] {
              EXPECT_EQ(installation.manager.writeFile(installation.directory.path(), "V3.user.at"),
                        0);
            }),
            R"(
writeFile
  writeSetToFile
    ObjectClass::dump(out) -> 0
    Attribute::dump(out) -> 0
    getORVAttr -> 0
    ORVAttribute::dump(out) -> 0
    Attribute::dump(out) -> 0
  writeSetToFile -> 0
writeFile -> 0
)");
}

TEST(RecordOrder, WriteAnEmptySetAndAnUnknownName) {
  Installation installation;
  const std::string& directory = installation.directory.path();
  EXPECT_EQ(treeOf([&] { installation.manager.writeFile(directory, "V3.system.oc"); }), R"(
writeFile
  writeSetToFile -> 0
writeFile -> 0
)");
  EXPECT_EQ(treeOf([&] { installation.manager.writeFile(directory + "/none", "V3.system.oc"); }),
            R"(
writeFile
  writeSetToFile -> 1
writeFile -> 1
)");
  EXPECT_EQ(treeOf([&] { installation.manager.writeFile(directory, "V3.config.oc"); }), R"(
writeFile -> 89
)");
}

// ---- Comparison ----

// One definition for each case: lacking in the reference, and excluded or not; present there, and
// excluded, equal or different.
constexpr char kMineOfEachKind[] =
    "attributetypes=( 1.1 NAME 'a' DESC 'd' )\n"
    "attributetypes=( 1.2 NAME 'b' DESC 'd' )\n"
    "attributetypes=( 1.3 NAME 'c' DESC 'd' )\n"
    "attributetypes=( 1.4 NAME 'd' DESC 'd' )\n"
    "attributetypes=( 1.5 NAME 'e' DESC 'mine' )\n"
    "ORVAttributetypes=( 2.1 LENGTH 1 )\n"
    "ORVAttributetypes=( 2.2 LENGTH 1 )\n"
    "ORVAttributetypes=( 2.3 LENGTH 1 )\n"
    "ORVAttributetypes=( 2.4 LENGTH 1 )\n"
    "ORVAttributetypes=( 2.5 LENGTH 1 )\n"
    "objectclasses=( 3.1 NAME 'a' AUXILIARY )\n"
    "objectclasses=( 3.2 NAME 'b' AUXILIARY )\n"
    "objectclasses=( 3.3 NAME 'c' AUXILIARY )\n"
    "objectclasses=( 3.4 NAME 'd' AUXILIARY )\n"
    "objectclasses=( 3.5 NAME 'e' AUXILIARY )\n";

constexpr char kReferenceOfEachKind[] =
    "attributetypes=( 1.3 NAME 'c' DESC 'd' )\n"
    "attributetypes=( 1.4 NAME 'd' DESC 'd' )\n"
    "attributetypes=( 1.5 NAME 'e' DESC 'theirs' )\n"
    "ORVAttributetypes=( 2.3 LENGTH 1 )\n"
    "ORVAttributetypes=( 2.4 LENGTH 1 )\n"
    "ORVAttributetypes=( 2.5 LENGTH 2 )\n"
    "objectclasses=( 3.3 NAME 'c' AUXILIARY )\n"
    "objectclasses=( 3.4 NAME 'd' AUXILIARY )\n"
    "objectclasses=( 3.5 NAME 'e' ABSTRACT )\n";

constexpr char kExcluded[] = "1.2 1.3 2.2 2.3 3.2 3.3 \n";

TEST(RecordOrder, CompareEveryCaseOfEveryKind) {
  const support::UnfreedDefinitions erased;
  Installation mine(kMineOfEachKind);
  Installation reference(kReferenceOfEachKind);
  ASSERT_EQ(mine.manager.readExcludedOids(mine.directory.write("list", kExcluded)), 0);
  EXPECT_EQ(treeOf([&] { EXPECT_TRUE(mine.manager.compSchemas(&reference.manager)); }), R"(
compSchemas
  compAttrTables
    getAttr -> 0
    isExcluded -> 0
    getAttr -> 0
    isExcluded -> 0
    delOidFromFileSet -> 0
    getAttr -> 0
    getAttr -> 0
    isExcluded -> 0
    delOidFromFileSet -> 0
    getAttr -> 0
    getAttr -> 0
    isExcluded -> 0
    Attribute::attrsEqual -> 1
    delOidFromFileSet -> 0
    getAttr -> 0
    getAttr -> 0
    isExcluded -> 0
    Attribute::attrsEqual -> 0
  compAttrTables -> 0
  compORVAttrTables
    getORVAttr -> 0
    isExcluded -> 0
    getORVAttr -> 0
    isExcluded -> 0
    getORVAttr -> 0
    getORVAttr -> 0
    isExcluded -> 0
    getORVAttr -> 0
    getORVAttr -> 0
    isExcluded -> 0
    ORVAttribute::orvAttrsEqual -> 0
    getORVAttr -> 0
    getORVAttr -> 0
    isExcluded -> 0
    ORVAttribute::orvAttrsEqual -> 0
  compORVAttrTables -> 0
  compObjTables
    getObjClass -> 0
    isExcluded -> 0
    getObjClass -> 0
    isExcluded -> 0
    delOidFromFileSet -> 0
    getObjClass -> 0
    getObjClass -> 0
    isExcluded -> 0
    delOidFromFileSet -> 0
    getObjClass -> 0
    getObjClass -> 0
    isExcluded -> 0
    ObjectClass::objsEqual -> 0
    delOidFromFileSet -> 0
    getObjClass -> 0
    getObjClass -> 0
    isExcluded -> 0
    ObjectClass::objsEqual -> 0
  compObjTables -> 0
compSchemas -> 0
)");
}

// The definitions of a config file are compared like all others, and found in no file set.
TEST(RecordOrder, CompareADefinitionInNoFileSet) {
  const support::UnfreedDefinitions erased;
  Installation mine;
  Installation reference;
  mine.read("V3.config.at", "attributetypes=( 1.1 NAME 'A' DESC 'd' )\n");
  reference.read("V3.config.at", "attributetypes=( 1.1 NAME 'a' DESC 'd' )\n");
  EXPECT_EQ(treeOf([&] { EXPECT_TRUE(mine.manager.compAttrTables(&reference.manager)); }), R"(
compAttrTables
  getAttr -> 0
  getAttr -> 0
  isExcluded -> 0
  Attribute::attrsEqual -> 1
  delOidFromFileSet -> 32
compAttrTables -> 0
)");
}

// ---- Merge ----

TEST(RecordOrder, MergeReplacementsAndAdditionsOfEveryKind) {
  const support::UnfreedDefinitions replaced;
  Installation mine(
      "attributetypes=( 1.1 NAME 'a' DESC 'd' )\n"
      "ORVAttributetypes=( 2.1 LENGTH 1 )\n"
      "objectclasses=( 3.1 NAME 'a' AUXILIARY )\n");
  Installation source(
      "attributetypes=( 1.1 NAME 'a' DESC 'other' )\n"
      "attributetypes=( 1.2 NAME 'b' DESC 'd' )\n"
      "ORVAttributetypes=( 2.1 LENGTH 2 )\n"
      "ORVAttributetypes=( 2.2 LENGTH 1 )\n"
      "objectclasses=( 3.1 NAME 'a' ABSTRACT )\n"
      "objectclasses=( 3.2 NAME 'b' AUXILIARY )\n");
  EXPECT_EQ(treeOf([&] { EXPECT_TRUE(mine.manager.mergeSchemas(&source.manager)); }), R"(
mergeSchemas
  mergeAttrs
    getAttr -> 0
    findOidInSet -> 0
  mergeAttrs -> 1
  mergeORVAttrs
    findOidInSet -> 0
  mergeORVAttrs -> 0
  mergeObjClasses
    getObjClass -> 0
    findOidInSet -> 0
  mergeObjClasses -> 0
mergeSchemas -> 0
)");
}

// A failing pass ends the chain. Its definition was the first, so that the target holds nothing of
// it.
TEST(RecordOrder, MergeStopsAtAPassThatFails) {
  Installation mine;
  Installation source;
  source.read("V3.config.at", "ORVAttributetypes=( 2.1 LENGTH 1 )\n");
  source.read("V3.user.oc", "objectclasses=( 3.1 NAME 'a' ABSTRACT )\n");
  EXPECT_EQ(treeOf([&] { EXPECT_FALSE(mine.manager.mergeSchemas(&source.manager)); },
                   support::kAllEvents),
            R"(
mergeSchemas
  mergeAttrs -> 1
  mergeORVAttrs
    findOidInSet
      debug: findOidInSet: Unable to find OID, 2.1, in set.
    findOidInSet -> 0
    debug: mergeORVAttrs: findOidInSet returned NULL
  mergeORVAttrs -> 0
mergeSchemas -> 0
)");
}

// ---- Collision check ----

TEST(RecordOrder, CheckTakesObjectClassesFirst) {
  const support::UnfreedDefinitions erased;
  Installation mine(
      "attributetypes=( 1.1 NAME 'a' DESC 'd' )\n"
      "attributetypes=( 1.2 NAME 'b' DESC 'd' )\n"
      "ORVAttributetypes=( 2.1 LENGTH 1 )\n"
      "ORVAttributetypes=( 2.2 LENGTH 1 )\n"
      "ORVAttributetypes=( 2.3 LENGTH 1 )\n"
      "objectclasses=( 3.1 NAME 'a' AUXILIARY )\n");
  Installation reference(
      "attributetypes=( 1.1 NAME 'a' DESC 'd' )\n"
      "ORVAttributetypes=( 2.1 LENGTH 1 )\n"
      "objectclasses=( 3.1 NAME 'a' AUXILIARY )\n");
  EXPECT_EQ(treeOf([&] { EXPECT_TRUE(mine.manager.checkCollisions(&reference.manager)); }), R"(
checkCollisions
  checkObjClasses
    getObjClass -> 0
  checkObjClasses -> 0
  checkAttrs
    getAttr -> 0
    getAttr -> 0
  checkAttrs -> 0
  checkORVAttrs
    getORVAttr -> 0
    getORVAttr -> 0
    getORVAttr -> 0
  checkORVAttrs -> 0
checkCollisions -> 0
)");
  EXPECT_EQ(treeOf([&] {
              mine.manager.getOcTable();
              mine.manager.getAttrTable();
              mine.manager.getORVAttrTable();
            }),
            R"(
getOcTable -> 0
getAttrTable -> 0
getORVAttrTable -> 0
)");
}

// ---- Withdrawal and printing ----

// Each OID is withdrawn once, in the order of the texts; an unknown one leaves no record.
TEST(RecordOrder, ModifySchema) {
  const support::UnfreedDefinitions erased;
  Installation installation;
  installation.read("V3.modifiedschema",
                    "attributetypes=( 1.2 NAME 'a' DESC 'd' )\n"
                    "ORVAttributetypes=( 1.2 LENGTH 1 )\n"
                    "ORVAttributetypes=( 1.3 LENGTH 1 )\n"
                    "objectclasses=( 1.1 NAME 'a' AUXILIARY )\n");
  installation.read("V3.user.oc", "objectclasses=( 1.10 NAME 'b' AUXILIARY )\n");
  const std::string list =
      installation.directory.write("list", "1.3 1.2 9.9 1.2\n1.1 # 1.4\n1.10\n");
  EXPECT_EQ(treeOf([&] { EXPECT_EQ(installation.manager.modifySchema(list), 0); }), R"(
modifySchema
  getObjClass -> 0
  delOidFromModSch -> 0
  getObjClass -> 0
  delOidFromModSch -> 32
  getAttr -> 0
  delOidFromModSch -> 0
  delOidFromModSch -> 0
modifySchema -> 0
)");
}

TEST(RecordOrder, PrintTheTables) {
  Installation installation(
      "attributetypes=( 1.1 NAME 'a' DESC 'd' )\n"
      "attributetypes=( 1.2 NAME 'b' DESC 'd' )\n"
      "ORVAttributetypes=( 2.1 LENGTH 1 )\n"
      "objectclasses=( 3.1 NAME 'a' AUXILIARY )\n");
  std::string tree;
  support::standardOutputOf([&] {
    tree = treeOf([&] {
      installation.manager.dumpAttrTable();
      installation.manager.dumpORVAttrTable();
      installation.manager.dumpOcTable();
      installation.manager.dumpUserAt();
    });
  });
  EXPECT_EQ(tree, R"(
dumpAttrTable
  Attribute::dump() -> 0
  Attribute::dump() -> 0
dumpAttrTable -> 0
dumpORVAttrTable
  ORVAttribute::dump() -> 0
dumpORVAttrTable -> 0
dumpOcTable
  ObjectClass::dump() -> 0
dumpOcTable -> 0
dumpUserAt -> 0
)");
}

}  // namespace
