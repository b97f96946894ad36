// Comparison: what is left of one manager against a reference.

#include <gtest/gtest.h>

#include <string>

#include "Calls.h"
#include "Files.h"
#include "FixedClock.h"
#include "Installation.h"
#include "Rows.h"
#include "UnfreedDefinitions.h"

using namespace support;

namespace {

// Everything that a manager holds, as far as it can be seen from outside.
std::string everythingOf(SchemaManager* manager, const std::string& oid) {
  return stateOf(manager) + attributeUnder(manager, oid) + objectClassUnder(manager, oid) +
         extensionUnder(manager, oid) + standardOutputOf([&] { manager->dumpEOids(); });
}

struct Decision {
  const char* name;
  bool isInReference;
  bool isExcluded;
  bool isEqual;
  bool isKept;
};

const Decision kDecisions[] = {
    {"LackingInReference", false, false, false, true},
    {"LackingInReferenceAndExcluded", false, true, false, false},
    {"ExcludedAndEqual", true, true, true, false},
    {"ExcludedAndDifferent", true, true, false, false},
    {"Equal", true, false, true, false},
    {"Different", true, false, false, true},
};

class CompareDecision : public testing::TestWithParam<Decision> {};

void compare(Installation* installation, Installation* reference) {
  EXPECT_TRUE((*installation)->compSchemas(reference->manager()));
}

void PrintTo(const Decision& row, std::ostream* out) { *out << row.name; }

}  // namespace

// An attribute type or object class that goes takes its OID out of the file set.
TEST_P(CompareDecision, OfAttributeTypes) {
  const UnfreedDefinitions unfreed;
  const Decision& row = GetParam();
  Installation installation{{"V3.user.at", attributeType("1.1", "Aa", "mine")}};
  Installation reference;
  if (row.isInReference) {
    reference.read("V3.system.at", attributeType("1.1", "Aa", row.isEqual ? "mine" : "other"));
  }
  if (row.isExcluded) {
    installation.exclude({"1.1"});
  }
  const std::string before = everythingOf(reference.manager(), "1.1");
  EXPECT_TRUE(installation->compAttrTables(reference.manager()));
  EXPECT_EQ(stateOf(installation.manager()),
            row.isKept ? "attributes: aa=1.1(mine)\nV3.user.at: 1.1\n" : "");
  EXPECT_EQ(attributeUnder(installation.manager(), "1.1"), "aa=1.1(mine)");
  EXPECT_EQ(attributeUnder(installation.manager(), "aa"), row.isKept ? "aa=1.1(mine)" : "nothing");
  EXPECT_EQ(everythingOf(reference.manager(), "1.1"), before);
}

TEST_P(CompareDecision, OfObjectClasses) {
  const UnfreedDefinitions unfreed;
  const Decision& row = GetParam();
  Installation installation{{"V3.user.oc", objectClass("1.1", "Cc", "mine")}};
  Installation reference;
  if (row.isInReference) {
    reference.read("V3.system.oc", objectClass("1.1", "Cc", row.isEqual ? "mine" : "other"));
  }
  if (row.isExcluded) {
    installation.exclude({"1.1"});
  }
  const std::string before = everythingOf(reference.manager(), "1.1");
  EXPECT_TRUE(installation->compObjTables(reference.manager()));
  EXPECT_EQ(stateOf(installation.manager()),
            row.isKept ? "classes: cc=1.1(mine)\nV3.user.oc: 1.1\n" : "");
  EXPECT_EQ(objectClassUnder(installation.manager(), "1.1"), "cc=1.1(mine)");
  EXPECT_EQ(objectClassUnder(installation.manager(), "cc"),
            row.isKept ? "cc=1.1(mine)" : "nothing");
  EXPECT_EQ(everythingOf(reference.manager(), "1.1"), before);
}

// A vendor extension that goes leaves its OID in the file set.
TEST_P(CompareDecision, OfVendorExtensions) {
  const UnfreedDefinitions unfreed;
  const Decision& row = GetParam();
  Installation installation{{"V3.orv.at", vendorExtension("1.1", "mine")}};
  Installation reference;
  if (row.isInReference) {
    reference.read("V3.orv.at", vendorExtension("1.1", row.isEqual ? "mine" : "other"));
  }
  if (row.isExcluded) {
    installation.exclude({"1.1"});
  }
  const std::string before = everythingOf(reference.manager(), "1.1");
  EXPECT_TRUE(installation->compORVAttrTables(reference.manager()));
  EXPECT_EQ(stateOf(installation.manager()),
            row.isKept ? "extensions: 1.1(mine)\nV3.orv.at: 1.1\n" : "V3.orv.at: 1.1\n");
  EXPECT_EQ(everythingOf(reference.manager(), "1.1"), before);
}

INSTANTIATE_TEST_SUITE_P(Rows, CompareDecision, testing::ValuesIn(kDecisions), nameOfRow<Decision>);

// ---- Whole schemas ----

namespace {

const SchemaText kAttributes = {"V3.user.at", attributeType("1.1", "a") +
                                                  attributeType("1.2", "b") +
                                                  vendorExtension("1.1") + vendorExtension("1.2")};
const SchemaText kClasses = {"V3.user.oc", objectClass("2.1", "c") + objectClass("2.2", "d")};
constexpr char kWholeState[] =
    "attributes: a=1.1(text) b=1.2(text)\n"
    "classes: c=2.1(text) d=2.2(text)\n"
    "extensions: 1.1(normal) 1.2(normal)\n"
    "V3.user.oc: 2.1 2.2\n"
    "V3.user.at: 1.1 1.2\n";

}  // namespace

TEST(CompSchemas, EmptyManagerStaysEmpty) {
  Installation installation;
  Installation reference{kAttributes, kClasses};
  compare(&installation, &reference);
  EXPECT_TRUE(installation->compAttrTables(reference.manager()));
  EXPECT_TRUE(installation->compORVAttrTables(reference.manager()));
  EXPECT_TRUE(installation->compObjTables(reference.manager()));
  EXPECT_EQ(stateOf(installation.manager()), "");
  EXPECT_EQ(stateOf(reference.manager()), kWholeState);
}

TEST(CompSchemas, EmptyReferenceLeavesAllThatIsNotExcluded) {
  const UnfreedDefinitions unfreed;
  Installation installation{kAttributes, kClasses};
  Installation reference;
  compare(&installation, &reference);
  EXPECT_EQ(stateOf(installation.manager()), kWholeState);
  installation.exclude({"1.1", "2.2"});
  compare(&installation, &reference);
  EXPECT_EQ(stateOf(installation.manager()),
            "attributes: b=1.2(text)\n"
            "classes: c=2.1(text)\n"
            "extensions: 1.2(normal)\n"
            "V3.user.oc: 2.1\n"
            "V3.user.at: 1.2\n");
}

TEST(CompSchemas, EqualReferenceLeavesNothing) {
  const UnfreedDefinitions unfreed;
  Installation installation{kAttributes, kClasses};
  Installation reference{kClasses, kAttributes};
  compare(&installation, &reference);
  EXPECT_EQ(stateOf(installation.manager()), "");
  EXPECT_EQ(stateOf(reference.manager()), kWholeState);
}

TEST(CompSchemas, ManagerAgainstItselfLeavesNothing) {
  const UnfreedDefinitions unfreed;
  Installation installation{kAttributes, kClasses};
  compare(&installation, &installation);
  EXPECT_EQ(stateOf(installation.manager()), "");
}

TEST(CompSchemas, EachPassPrunesItsOwnTable) {
  const UnfreedDefinitions unfreed;
  Installation installation{kAttributes, kClasses};
  Installation reference{kAttributes, kClasses};
  EXPECT_TRUE(installation->compORVAttrTables(reference.manager()));
  EXPECT_EQ(stateOf(installation.manager()),
            "attributes: a=1.1(text) b=1.2(text)\nclasses: c=2.1(text) d=2.2(text)\n"
            "V3.user.oc: 2.1 2.2\nV3.user.at: 1.1 1.2\n");
  EXPECT_TRUE(installation->compObjTables(reference.manager()));
  EXPECT_EQ(stateOf(installation.manager()),
            "attributes: a=1.1(text) b=1.2(text)\nV3.user.at: 1.1 1.2\n");
  EXPECT_TRUE(installation->compAttrTables(reference.manager()));
  EXPECT_EQ(stateOf(installation.manager()), "");
}

TEST(CompSchemas, FilesOfTheReferenceDoNotMatter) {
  const UnfreedDefinitions unfreed;
  Installation installation{{"V3.user.at", attributeType("1.1", "a")}};
  Installation reference{{"V3.config.oc", attributeType("1.1", "a")}};
  compare(&installation, &reference);
  EXPECT_EQ(stateOf(installation.manager()), "");
}

// ---- Rules ----

TEST(CompSchemas, ExclusionsOfTheReferenceDoNotMatter) {
  Installation installation{{"V3.user.at", attributeType("1.1", "a")},
                            {"V3.user.oc", objectClass("2.1", "c", "mine")},
                            {"V3.orv.at", vendorExtension("3.1")}};
  Installation reference{{"V3.user.oc", objectClass("2.1", "c", "other")}};
  reference.exclude({"1.1", "2.1", "3.1"});
  const std::string before = stateOf(installation.manager());
  compare(&installation, &reference);
  EXPECT_EQ(stateOf(installation.manager()), before);
}

TEST(CompSchemas, ExcludedOidIsTheOneOfThisManager) {
  const UnfreedDefinitions unfreed;
  Installation installation{{"V3.user.at", attributeType("1.1", "a", "mine")}};
  Installation reference{{"V3.user.at", attributeType("1.2", "a", "other")}};
  installation.exclude({"1.2"});
  compare(&installation, &reference);
  EXPECT_EQ(stateOf(installation.manager()), "attributes: a=1.1(mine)\nV3.user.at: 1.1\n");
  installation.exclude({"1.1"});
  compare(&installation, &reference);
  EXPECT_EQ(stateOf(installation.manager()), "");
}

// Attribute types and object classes are matched by first name, in any letter case.
TEST(CompSchemas, ChangedOidUnderTheSameNameIsADifference) {
  Installation installation{{"V3.user.at", attributeType("1.1", "Aa")},
                            {"V3.user.oc", objectClass("2.1", "Cc")}};
  Installation reference{{"V3.user.at", attributeType("1.9", "aA")},
                         {"V3.user.oc", objectClass("2.9", "cC")}};
  compare(&installation, &reference);
  EXPECT_EQ(stateOf(installation.manager()),
            "attributes: aa=1.1(text)\nclasses: cc=2.1(text)\n"
            "V3.user.oc: 2.1\nV3.user.at: 1.1\n");
}

TEST(CompSchemas, NamesInAnotherLetterCaseAreEqual) {
  const UnfreedDefinitions unfreed;
  Installation installation{{"V3.user.at", attributeType("1.1", "Aa")},
                            {"V3.user.oc", objectClass("2.1", "Cc")}};
  Installation reference{{"V3.user.at", attributeType("1.1", "aA")},
                         {"V3.user.oc", objectClass("2.1", "cC")}};
  compare(&installation, &reference);
  EXPECT_EQ(stateOf(installation.manager()), "");
}

TEST(CompSchemas, SameOidUnderAnotherNameIsNoMatch) {
  Installation installation{{"V3.user.at", attributeType("1.1", "a")},
                            {"V3.user.oc", objectClass("2.1", "c")}};
  Installation reference{{"V3.user.at", attributeType("1.1", "b")},
                         {"V3.user.oc", objectClass("2.1", "d")}};
  compare(&installation, &reference);
  EXPECT_EQ(stateOf(installation.manager()),
            "attributes: a=1.1(text)\nclasses: c=2.1(text)\n"
            "V3.user.oc: 2.1\nV3.user.at: 1.1\n");
}

TEST(CompSchemas, KindsAreNotMatchedWithEachOther) {
  Installation installation{{"V3.user.at", attributeType("1.1", "a")}};
  Installation reference{{"V3.user.oc", objectClass("1.1", "a")},
                         {"V3.orv.at", vendorExtension("1.1")}};
  compare(&installation, &reference);
  EXPECT_EQ(stateOf(installation.manager()), "attributes: a=1.1(text)\nV3.user.at: 1.1\n");
}

TEST(CompSchemas, SecondNameIsNoMatch) {
  Installation installation{
      {"V3.user.at", "attributetypes=( 1.1 NAME ( 'a' 'b' ) DESC 'text' )\n"}};
  Installation reference{{"V3.user.at", "attributetypes=( 1.1 NAME ( 'b' 'a' ) DESC 'text' )\n"}};
  compare(&installation, &reference);
  EXPECT_EQ(stateOf(installation.manager()), "attributes: a=1.1(text)\nV3.user.at: 1.1\n");
}

// The members of this manager's lists are looked for in the reference's, not the other way round.
TEST(CompSchemas, EqualityIsAskedFromThisSide) {
  const UnfreedDefinitions unfreed;
  const SchemaText repeated = {"V3.user.oc",
                               "objectclasses=( 2.1 NAME 'c' STRUCTURAL MUST ( x $ x ) )\n"};
  const SchemaText distinct = {"V3.user.oc",
                               "objectclasses=( 2.1 NAME 'c' STRUCTURAL MUST ( x $ y ) )\n"};
  Installation first{repeated};
  Installation second{distinct};
  compare(&second, &first);
  EXPECT_EQ(stateOf(second.manager()), "classes: c=2.1()\nV3.user.oc: 2.1\n");
  compare(&first, &second);
  EXPECT_EQ(stateOf(first.manager()), "");
}

// ---- The file sets ----

TEST(CompSchemas, OidLeavesTheFirstSetThatHoldsItOnly) {
  const UnfreedDefinitions unfreed;
  Installation installation{{"V3.system.at", attributeType("1.1", "a")},
                            {"V3.orv.at", attributeType("1.1", "a")},
                            {"V3.modifiedschema", attributeType("1.1", "a")}};
  Installation reference{{"V3.system.at", attributeType("1.1", "a")}};
  compare(&installation, &reference);
  EXPECT_EQ(stateOf(installation.manager()), "V3.system.at: 1.1\n");
  EXPECT_EQ(takeFromModifiedSchema(installation.manager(), {"1.1"}), "1.1");
}

// Each of them takes the OID out of the first set that still holds it, traced or not.
TEST(CompSchemas, DefinitionsOfOneOidLeaveAsManySets) {
  const UnfreedDefinitions unfreed;
  const auto pruned = [](bool isTraced) {
    Installation installation{
        {"V3.system.at", attributeType("1.1", "a") + attributeType("1.0", "c")},
        {"V3.orv.at", attributeType("1.1", "a")},
        {"V3.user.at", attributeType("1.1", "b") + attributeType("1.2", "d")}};
    Installation reference{{"V3.system.at", attributeType("1.1", "a") + attributeType("1.1", "b") +
                                                attributeType("1.2", "d")}};
    if (isTraced) {
      callsOf([&] { compare(&installation, &reference); });
    } else {
      compare(&installation, &reference);
    }
    return stateOf(installation.manager());
  };
  EXPECT_EQ(pruned(false), "attributes: c=1.0(text)\nV3.system.at: 1.0 1.1\n");
  EXPECT_EQ(pruned(true), pruned(false));
}

TEST(CompSchemas, DefinitionOfAConfigFileHasNoSetToLeave) {
  const UnfreedDefinitions unfreed;
  Installation installation{{"V3.config.at", attributeType("1.1", "a")},
                            {"V3.config.oc", objectClass("2.1", "c")}};
  Installation reference{{"V3.config.at", attributeType("1.1", "a")},
                         {"V3.config.oc", objectClass("2.1", "c")}};
  EXPECT_EQ(messagesOf([&] { compare(&installation, &reference); }),
            "delOidFromFileSet: Unable to delete OID from set, 1.1.\n"
            "delOidFromFileSet: Unable to delete OID from set, 2.1.\n");
  EXPECT_EQ(stateOf(installation.manager()), "");
}

TEST(CompSchemas, VendorExtensionAndAttributeTypeShareTheOidOfTheSet) {
  const UnfreedDefinitions unfreed;
  const std::string attribute = attributeType("1.1", "a");
  // Only the extension goes: the set keeps the OID, for the attribute type.
  Installation changed{
      {"V3.orv.at", attributeType("1.1", "a", "changed") + vendorExtension("1.1")}};
  Installation reference{{"V3.orv.at", attribute + vendorExtension("1.1")}};
  compare(&changed, &reference);
  EXPECT_EQ(stateOf(changed.manager()), "attributes: a=1.1(changed)\nV3.orv.at: 1.1\n");
  // Only the attribute type goes: the OID goes with it, and the extension is no longer written.
  Installation extended{{"V3.orv.at", attribute + vendorExtension("1.1", "changed")}};
  compare(&extended, &reference);
  EXPECT_EQ(stateOf(extended.manager()), "extensions: 1.1(changed)\n");
  EXPECT_EQ(writtenFile(extended.manager(), "V3.orv.at"), "");
}

TEST(CompSchemas, PrunedAttributeTypeIsNoLongerWrittenToItsFile) {
  const UnfreedDefinitions unfreed;
  Installation installation{
      {"V3.user.at", attributeType("1.2.10", "ten") + attributeType("1.2.6", "six")}};
  Installation reference{{"V3.user.at", attributeType("1.2.10", "ten")}};
  compare(&installation, &reference);
  EXPECT_EQ(writtenFile(installation.manager(), "V3.user.at"),
            std::string(kHeaderLine) +
                "attributetypes=( 1.2.6 NAME ( 'six'  )  DESC 'text' USAGE userApplications  )\n");
}

// ---- Trace ----

TEST(CompSchemas, PassesAttributeTypesThenVendorExtensionsThenObjectClasses) {
  Installation installation;
  Installation reference;
  EXPECT_EQ(callsOf([&] { compare(&installation, &reference); }),
            "compSchemas{compAttrTables compORVAttrTables compObjTables}");
}

TEST(CompSchemas, CallsForEachRowOfTheDecision) {
  const UnfreedDefinitions unfreed;
  // In key order: lacking, lacking and excluded, excluded, equal, different.
  Installation installation{
      {"V3.user.at", attributeType("1.1", "a") + attributeType("1.2", "b") +
                         attributeType("1.3", "c") + attributeType("1.4", "d") +
                         attributeType("1.5", "e")},
      {"V3.user.oc", objectClass("1.1", "a") + objectClass("1.2", "b") + objectClass("1.3", "c") +
                         objectClass("1.4", "d") + objectClass("1.5", "e")},
      {"V3.orv.at", vendorExtension("1.1") + vendorExtension("1.2") + vendorExtension("1.3") +
                        vendorExtension("1.4") + vendorExtension("1.5")}};
  Installation reference{{"V3.user.at", attributeType("1.3", "c") + attributeType("1.4", "d") +
                                            attributeType("1.5", "e", "other")},
                         {"V3.user.oc", objectClass("1.3", "c") + objectClass("1.4", "d") +
                                            objectClass("1.5", "e", "other")},
                         {"V3.orv.at", vendorExtension("1.3") + vendorExtension("1.4") +
                                           vendorExtension("1.5", "other")}};
  installation.exclude({"1.2", "1.3"});
  EXPECT_EQ(callsOf([&] { installation->compAttrTables(reference.manager()); }),
            "compAttrTables{"
            "getAttr isExcluded "
            "getAttr isExcluded delOidFromFileSet "
            "getAttr getAttr isExcluded delOidFromFileSet "
            "getAttr getAttr isExcluded Attribute.attrsEqual=1 delOidFromFileSet "
            "getAttr getAttr isExcluded Attribute.attrsEqual}");
  EXPECT_EQ(callsOf([&] { installation->compORVAttrTables(reference.manager()); }),
            "compORVAttrTables{"
            "getORVAttr isExcluded "
            "getORVAttr isExcluded "
            "getORVAttr getORVAttr isExcluded "
            "getORVAttr getORVAttr isExcluded ORVAttribute.orvAttrsEqual "
            "getORVAttr getORVAttr isExcluded ORVAttribute.orvAttrsEqual}");
  EXPECT_EQ(callsOf([&] { installation->compObjTables(reference.manager()); }),
            "compObjTables{"
            "getObjClass isExcluded "
            "getObjClass isExcluded delOidFromFileSet "
            "getObjClass getObjClass isExcluded delOidFromFileSet "
            "getObjClass getObjClass isExcluded ObjectClass.objsEqual delOidFromFileSet "
            "getObjClass getObjClass isExcluded ObjectClass.objsEqual}");
}

TEST(CompSchemas, NoMessageOfItsOwn) {
  const UnfreedDefinitions unfreed;
  Installation installation{kAttributes, kClasses};
  Installation reference{kAttributes, kClasses};
  EXPECT_EQ(messagesOf([&] { compare(&installation, &reference); }), "");
}
