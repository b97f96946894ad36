// Collision check, and the reports of what is left.

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "Calls.h"
#include "Files.h"
#include "Installation.h"
#include "Rows.h"
#include "UnfreedDefinitions.h"

using namespace support;

namespace {

constexpr char kNoClasses[] = "No objectClasses definition collisions found.\n";
constexpr char kNoExtensions[] = "No ORVAttributeTypes definition collisions found.\n";
constexpr char kNoAttributes[] = "No attributeTypes definition collisions found.\n";
constexpr char kClasses[] = "The following objectClasses definition collisions found:\n";
constexpr char kExtensions[] = "The following ORVAttributeTypes definition collisions found:\n";
constexpr char kAttributes[] = "The following attributeTypes collisions found:\n";

std::string reportsOf(Installation* installation) {
  std::string reports = (*installation)->getOcTable();
  reports += (*installation)->getAttrTable();
  return reports + (*installation)->getORVAttrTable();
}

void check(Installation* installation, Installation* reference) {
  EXPECT_TRUE((*installation)->checkCollisions(reference->manager()));
}

// One definition against a reference: does it collide?
struct Rule {
  const char* name;
  std::string definition;
  std::string reference;
  bool isCollision;
};

class CollisionRule : public testing::TestWithParam<Rule> {};

void PrintTo(const Rule& row, std::ostream* out) {
  *out << row.name << ":\n" << row.definition << "against\n" << row.reference;
}

}  // namespace

TEST_P(CollisionRule, DecidesWhatIsKept) {
  const UnfreedDefinitions unfreed;
  const Rule& row = GetParam();
  Installation installation{{"V3.user.at", row.definition}};
  Installation reference{{"V3.user.at", row.reference}};
  const std::string whole = stateOf(installation.manager());
  const std::string sets = setsOf(installation.manager());
  const std::string ofReference = stateOf(reference.manager());
  check(&installation, &reference);
  EXPECT_EQ(stateOf(installation.manager()), row.isCollision ? whole : sets);
  EXPECT_EQ(stateOf(reference.manager()), ofReference);
}

// The OID tests look among first names in lower case: a definition hits that is *named* like the
// OID.
const Rule kRules[] = {
    {"ClassByNameOfAClass", objectClass("2.1", "Cc"), objectClass("9.9", "cC"), true},
    {"ClassByOidThatIsTheNameOfAClass", objectClass("2.1", "c"), objectClass("9.9", "2.1"), true},
    {"ClassByOidThatIsTheNameOfAnAttributeType", objectClass("2.1", "c"),
     attributeType("9.9", "2.1"), true},
    {"ClassByOidOfAVendorExtension", objectClass("2.1", "c"), vendorExtension("2.1"), true},
    {"ClassByOidOfAClassOfAnotherName", objectClass("2.1", "c"), objectClass("2.1", "d"), false},
    {"ClassByOidOfAnAttributeType", objectClass("2.1", "c"), attributeType("2.1", "c"), false},
    {"ClassByNameOfAnAttributeType", objectClass("2.1", "c"), attributeType("9.9", "c"), false},
    {"ClassByOidInAnotherCase", objectClass("Word", "c"), objectClass("9.9", "WORD"), false},
    {"ClassByOidWordInLowerCase", objectClass("word", "c"), objectClass("9.9", "WORD"), true},
    {"ClassBySecondName", "objectclasses=( 2.1 NAME ( 'c' 'd' ) STRUCTURAL )\n",
     objectClass("9.9", "d"), false},

    {"AttributeTypeByNameOfAnAttributeType", attributeType("1.1", "Aa"), attributeType("9.9", "aA"),
     true},
    {"AttributeTypeByOidThatIsTheNameOfAnAttributeType", attributeType("1.1", "a"),
     attributeType("9.9", "1.1"), true},
    {"AttributeTypeByOidThatIsTheNameOfAClass", attributeType("1.1", "a"),
     objectClass("9.9", "1.1"), true},
    {"AttributeTypeByOidOfAVendorExtension", attributeType("1.1", "a"), vendorExtension("1.1"),
     true},
    {"AttributeTypeByOidOfAnAttributeTypeOfAnotherName", attributeType("1.1", "a"),
     attributeType("1.1", "b"), false},
    {"AttributeTypeByOidOfAClass", attributeType("1.1", "a"), objectClass("1.1", "c"), false},
    {"AttributeTypeByNameOfAClass", attributeType("1.1", "a"), objectClass("9.9", "a"), false},
    {"AttributeTypeByOidInAnotherCase", attributeType("Word", "a"), attributeType("9.9", "WORD"),
     false},

    {"ExtensionByOidOfAVendorExtension", vendorExtension("1.1"), vendorExtension("1.1", "other"),
     true},
    {"ExtensionByOidThatIsTheNameOfAClass", vendorExtension("1.1"), objectClass("9.9", "1.1"),
     true},
    {"ExtensionByOidThatIsTheNameOfAnAttributeType", vendorExtension("1.1"),
     attributeType("9.9", "1.1"), true},
    {"ExtensionByOidOfAnAttributeType", vendorExtension("1.1"), attributeType("1.1", "a"), false},
    {"ExtensionByOidOfAClass", vendorExtension("1.1"), objectClass("1.1", "c"), false},
    {"ExtensionByDatabaseName", vendorExtension("1.1"),
     attributeType("9.9", "column") + objectClass("9.8", "column") + vendorExtension("9.7"), false},

    {"EqualDefinitionsCollideToo", attributeType("1.1", "a"), attributeType("1.1", "a"), true},
    {"EmptyReference", attributeType("1.1", "a"), "", false},
};

INSTANTIATE_TEST_SUITE_P(Rows, CollisionRule, testing::ValuesIn(kRules), nameOfRow<Rule>);

// ---- Whole schemas ----

namespace {

const SchemaText kAttributeFile = {
    "V3.user.at", attributeType("1.2", "Beta") +
                      "attributetypes=( 1.1 NAME ( 'Gamma' 'g' 'third' ) DESC 'text' )\n" +
                      attributeType("1.3", "alpha") +
                      "ORVAttributetypes=( 1.6 DBNAME ( 'six' 'SIX' ) )\n"
                      "ORVAttributetypes=( 1.10 DBNAME ( 'ten' 'TEN' ) )\n"};
const SchemaText kClassFile = {
    "V3.user.oc",
    objectClass("2.1", "zeta") + "objectclasses=( 2.2 NAME ( 'Eta' 'e' ) STRUCTURAL )\n"};

}  // namespace

TEST(CheckCollisions, EmptyManager) {
  Installation installation;
  Installation reference{kAttributeFile, kClassFile};
  const std::string before = stateOf(reference.manager());
  EXPECT_TRUE(installation->checkObjClasses(reference.manager()));
  EXPECT_TRUE(installation->checkAttrs(reference.manager()));
  EXPECT_TRUE(installation->checkORVAttrs(reference.manager()));
  check(&installation, &reference);
  EXPECT_EQ(reportsOf(&installation), std::string(kNoClasses) + kNoAttributes + kNoExtensions);
  EXPECT_EQ(stateOf(reference.manager()), before);
  EXPECT_EQ(attributeUnder(reference.manager(), "1.2"), "beta=1.2(text)");
}

TEST(CheckCollisions, EmptyReferenceLeavesNothing) {
  const UnfreedDefinitions unfreed;
  Installation installation{kAttributeFile, kClassFile};
  Installation reference;
  check(&installation, &reference);
  EXPECT_EQ(tablesOf(installation.manager()), "");
  EXPECT_EQ(reportsOf(&installation), std::string(kNoClasses) + kNoAttributes + kNoExtensions);
  EXPECT_EQ(stateOf(reference.manager()), "");
}

TEST(CheckCollisions, EqualReferenceKeepsEverything) {
  Installation installation{kAttributeFile, kClassFile};
  Installation reference{kAttributeFile, kClassFile};
  const std::string before = stateOf(installation.manager());
  check(&installation, &reference);
  EXPECT_EQ(stateOf(installation.manager()), before);
}

TEST(CheckCollisions, EachPassPrunesItsOwnTable) {
  const UnfreedDefinitions unfreed;
  Installation installation{{"V3.user.at", attributeType("1.1", "a") + vendorExtension("1.1")},
                            {"V3.user.oc", objectClass("2.1", "c")}};
  Installation reference;
  EXPECT_TRUE(installation->checkAttrs(reference.manager()));
  EXPECT_EQ(tablesOf(installation.manager()), "classes: c=2.1(text)\nextensions: 1.1(normal)\n");
  EXPECT_TRUE(installation->checkORVAttrs(reference.manager()));
  EXPECT_EQ(tablesOf(installation.manager()), "classes: c=2.1(text)\n");
  EXPECT_TRUE(installation->checkObjClasses(reference.manager()));
  EXPECT_EQ(tablesOf(installation.manager()), "");
}

// Only the tables are pruned: by OID, and in the files to be written, all is as before.
TEST(CheckCollisions, WhatDoesNotCollideIsStillFoundByOidAndWritten) {
  const UnfreedDefinitions unfreed;
  Installation installation{{"V3.user.at", attributeType("1.1", "a")},
                            {"V3.user.oc", objectClass("2.1", "c")},
                            {"V3.orv.at", vendorExtension("3.1")}};
  const std::string attributes = writtenFile(installation.manager(), "V3.user.at");
  const std::string classes = writtenFile(installation.manager(), "V3.user.oc");
  Installation reference;
  check(&installation, &reference);
  EXPECT_EQ(stateOf(installation.manager()), "V3.user.oc: 2.1\nV3.user.at: 1.1\nV3.orv.at: 3.1\n");
  EXPECT_EQ(attributeUnder(installation.manager(), "1.1"), "a=1.1(text)");
  EXPECT_EQ(attributeUnder(installation.manager(), "a"), "nothing");
  EXPECT_EQ(objectClassUnder(installation.manager(), "2.1"), "c=2.1(text)");
  EXPECT_EQ(objectClassUnder(installation.manager(), "c"), "nothing");
  EXPECT_EQ(extensionUnder(installation.manager(), "3.1"), "nothing");
  EXPECT_EQ(writtenFile(installation.manager(), "V3.user.at"), attributes);
  EXPECT_EQ(writtenFile(installation.manager(), "V3.user.oc"), classes);
}

TEST(CheckCollisions, ExclusionHasNoPartInIt) {
  Installation installation{{"V3.user.at", attributeType("1.1", "a") + vendorExtension("1.1")},
                            {"V3.user.oc", objectClass("2.1", "c")}};
  Installation reference{{"V3.user.at", attributeType("1.1", "a") + vendorExtension("1.1")},
                         {"V3.user.oc", objectClass("2.1", "c")}};
  installation.exclude({"1.1", "2.1"});
  reference.exclude({"1.1", "2.1"});
  const std::string before = stateOf(installation.manager());
  check(&installation, &reference);
  EXPECT_EQ(stateOf(installation.manager()), before);
}

// The reference's name tables are asked for the OID, so only a definition named like it is found;
// the same OID under another name is no collision.
TEST(CheckCollisions, OidIsLookedUpAmongNames) {
  const UnfreedDefinitions unfreed;
  Installation installation{{"V3.user.at", attributeType("1.1", "a") + attributeType("1.2", "b") +
                                               vendorExtension("1.1") + vendorExtension("1.2")},
                            {"V3.user.oc", objectClass("1.1", "c") + objectClass("1.2", "d")}};
  Installation reference{
      {"V3.user.at", attributeType("1.1", "other") + attributeType("9.1", "1.2")},
      {"V3.user.oc", objectClass("1.1", "another")}};
  check(&installation, &reference);
  EXPECT_EQ(tablesOf(installation.manager()),
            "attributes: b=1.2(text)\nclasses: d=1.2(text)\nextensions: 1.2(normal)\n");
}

// ---- The index by OID of the reference ----

// The one change to the reference: its attribute types with the OID of a colliding one are found by
// name only.
TEST(CheckAttrs, CollidingOidsLeaveTheOidIndexOfTheReference) {
  Installation installation{{"V3.user.at", attributeType("1.1", "a")}};
  Installation reference{
      {"V3.user.at", attributeType("1.1", "a", "theirs") + attributeType("1.2", "b", "theirs")}};
  const std::string before = stateOf(reference.manager());
  EXPECT_TRUE(installation->checkAttrs(reference.manager()));
  EXPECT_EQ(attributeUnder(reference.manager(), "1.1"), "nothing");
  EXPECT_EQ(attributeUnder(reference.manager(), "a"), "a=1.1(theirs)");
  EXPECT_EQ(attributeUnder(reference.manager(), "1.2"), "b=1.2(theirs)");
  EXPECT_EQ(stateOf(reference.manager()), before);
  EXPECT_EQ(attributeUnder(installation.manager(), "1.1"), "a=1.1(text)");
  // Writing finds definitions by OID.
  EXPECT_EQ(writtenFor(reference.manager(), {"1.1"}), writtenFor(reference.manager(), {"9.9"}));
}

TEST(CheckAttrs, OidOfOneThatDoesNotCollideStaysInTheIndexOfTheReference) {
  const UnfreedDefinitions unfreed;
  Installation installation{{"V3.user.at", attributeType("1.1", "a")}};
  Installation reference{{"V3.user.at", attributeType("1.1", "b", "theirs")}};
  EXPECT_TRUE(installation->checkAttrs(reference.manager()));
  EXPECT_EQ(tablesOf(installation.manager()), "");
  EXPECT_EQ(attributeUnder(reference.manager(), "1.1"), "b=1.1(theirs)");
}

// The OID is the one of this manager's definition, whichever definition of the reference has it.
TEST(CheckAttrs, CollisionByNameErasesTheOidOfAnotherDefinition) {
  Installation installation{{"V3.user.at", attributeType("1.2", "a")}};
  Installation reference{
      {"V3.user.at", attributeType("1.1", "a", "theirs") + attributeType("1.2", "b", "theirs")}};
  EXPECT_TRUE(installation->checkAttrs(reference.manager()));
  EXPECT_EQ(tablesOf(installation.manager()), "attributes: a=1.2(text)\n");
  EXPECT_EQ(attributeUnder(reference.manager(), "1.1"), "a=1.1(theirs)");
  EXPECT_EQ(attributeUnder(reference.manager(), "1.2"), "nothing");
  EXPECT_EQ(attributeUnder(reference.manager(), "b"), "b=1.2(theirs)");
}

TEST(CheckAttrs, CollisionWithAVendorExtensionErasesTheOidToo) {
  Installation installation{{"V3.user.at", attributeType("1.1", "a")}};
  Installation reference{
      {"V3.orv.at", attributeType("1.1", "other", "theirs") + vendorExtension("1.1")}};
  EXPECT_TRUE(installation->checkAttrs(reference.manager()));
  EXPECT_EQ(tablesOf(installation.manager()), "attributes: a=1.1(text)\n");
  EXPECT_EQ(attributeUnder(reference.manager(), "1.1"), "nothing");
  EXPECT_EQ(attributeUnder(reference.manager(), "other"), "other=1.1(theirs)");
  EXPECT_EQ(extensionUnder(reference.manager(), "1.1"), "1.1(normal)");
}

TEST(CheckCollisions, IndexOfObjectClassesOfTheReferenceStays) {
  Installation installation{{"V3.user.oc", objectClass("2.1", "c")},
                            {"V3.orv.at", vendorExtension("1.1")}};
  Installation reference{{"V3.user.oc", objectClass("2.1", "c", "theirs")},
                         {"V3.orv.at", vendorExtension("1.1") + attributeType("1.1", "a")}};
  check(&installation, &reference);
  EXPECT_EQ(tablesOf(installation.manager()), "classes: c=2.1(text)\nextensions: 1.1(normal)\n");
  EXPECT_EQ(objectClassUnder(reference.manager(), "2.1"), "c=2.1(theirs)");
  EXPECT_EQ(attributeUnder(reference.manager(), "1.1"), "a=1.1(text)");
}

// ---- Reports ----

TEST(CollisionReport, OfAnEmptyManager) {
  Installation installation;
  EXPECT_EQ(installation->getOcTable(), kNoClasses);
  EXPECT_EQ(installation->getORVAttrTable(), kNoExtensions);
  EXPECT_EQ(installation->getAttrTable(), kNoAttributes);
}

TEST(CollisionReport, OfObjectClassesInOrderOfLowerCaseNames) {
  Installation installation{kClassFile};
  EXPECT_EQ(installation->getOcTable(), std::string(kClasses) +
                                            "OID --> 2.2\nName --> Eta, e\n\n"
                                            "OID --> 2.1\nName --> zeta\n\n");
  EXPECT_EQ(installation->getAttrTable(), kNoAttributes);
  EXPECT_EQ(installation->getORVAttrTable(), kNoExtensions);
}

TEST(CollisionReport, OfAttributeTypesInOrderOfLowerCaseNames) {
  Installation installation{kAttributeFile};
  EXPECT_EQ(installation->getAttrTable(), std::string(kAttributes) +
                                              "OID --> 1.3\nName --> alpha\n\n"
                                              "OID --> 1.2\nName --> Beta\n\n"
                                              "OID --> 1.1\nName --> Gamma, g, third\n\n");
  EXPECT_EQ(installation->getOcTable(), kNoClasses);
}

// 1.10 goes before 1.6; the names are those of the database.
TEST(CollisionReport, OfVendorExtensionsInByteOrderOfOids) {
  Installation installation{kAttributeFile};
  EXPECT_EQ(installation->getORVAttrTable(), std::string(kExtensions) +
                                                 "OID --> 1.10\nName --> ten, TEN\n\n"
                                                 "OID --> 1.6\nName --> six, SIX\n\n");
}

TEST(CollisionReport, OfDefinitionsWithoutNames) {
  Installation installation{{"V3.user.at",
                             "attributetypes=( 1.1 DESC 'd' )\n"
                             "objectclasses=( 1.2 DESC 'd' )\n"
                             "ORVAttributetypes=( 1.3 LENGTH 1 )\n"}};
  EXPECT_EQ(reportsOf(&installation), std::string(kClasses) + "OID --> 1.2\nName --> \n\n" +
                                          kAttributes + "OID --> 1.1\nName --> \n\n" + kExtensions +
                                          "OID --> 1.3\nName --> \n\n");
}

TEST(CollisionReport, ListsWhatTheCheckLeft) {
  const UnfreedDefinitions unfreed;
  Installation installation{kAttributeFile, kClassFile};
  Installation reference{
      {"V3.system.at",
       attributeType("9.1", "beta") + attributeType("9.2", "ALPHA") + vendorExtension("1.10")},
      {"V3.system.oc", objectClass("9.3", "ZETA")}};
  check(&installation, &reference);
  EXPECT_EQ(reportsOf(&installation), std::string(kClasses) + "OID --> 2.1\nName --> zeta\n\n" +
                                          kAttributes + "OID --> 1.3\nName --> alpha\n\n" +
                                          "OID --> 1.2\nName --> Beta\n\n" + kExtensions +
                                          "OID --> 1.10\nName --> ten, TEN\n\n");
}

TEST(CollisionReport, PrintsNothingAndChangesNothing) {
  Installation installation{kAttributeFile, kClassFile};
  const std::string before = stateOf(installation.manager());
  EXPECT_EQ(standardOutputOf([&] { reportsOf(&installation); }), "");
  EXPECT_EQ(stateOf(installation.manager()), before);
}

// ---- Trace ----

TEST(CheckCollisions, ObjectClassesComeFirst) {
  Installation installation;
  Installation reference;
  EXPECT_EQ(callsOf([&] { check(&installation, &reference); }),
            "checkCollisions{checkObjClasses checkAttrs checkORVAttrs}");
}

TEST(CheckCollisions, CallsForEachDefinition) {
  const UnfreedDefinitions unfreed;
  Installation installation{kAttributeFile, kClassFile};
  Installation reference{{"V3.user.at", attributeType("1.2", "beta")}};
  EXPECT_EQ(callsOf([&] { check(&installation, &reference); }),
            "checkCollisions{checkObjClasses{getObjClass getObjClass} "
            "checkAttrs{getAttr getAttr getAttr} checkORVAttrs{getORVAttr getORVAttr}}");
}

TEST(CollisionReport, LeavesOneRecordEach) {
  Installation installation{kAttributeFile, kClassFile};
  EXPECT_EQ(callsOf([&] { reportsOf(&installation); }), "getOcTable getAttrTable getORVAttrTable");
}

TEST(CheckCollisions, NoMessageOfItsOwn) {
  const UnfreedDefinitions unfreed;
  Installation installation{kAttributeFile, kClassFile};
  Installation reference{{"V3.user.at", attributeType("1.2", "beta")}};
  EXPECT_EQ(messagesOf([&] {
              check(&installation, &reference);
              reportsOf(&installation);
            }),
            "");
}
