// Withdrawing the definitions that a list names, and the OID set of V3.modifiedschema.

#include <gtest/gtest.h>

#include <string>

#include "Calls.h"
#include "Files.h"
#include "FixedClock.h"
#include "Installation.h"
#include "UnfreedDefinitions.h"

using namespace support;

namespace {

// Withdraws these OIDs, one a line.
int withdraw(Installation* installation, const std::string& list) {
  return (*installation)->modifySchema(installation->write("list", list));
}

}  // namespace

// ---- The set of V3.modifiedschema ----

TEST(DelOidFromModSch, ExactMatchOnly) {
  Installation installation{
      {"V3.modifiedschema", attributeType("1.1", "a") + attributeType("Word", "b")}};
  for (const char* oid : {"1.10", "1", "1.1 ", "word", ""}) {
    EXPECT_EQ(installation->delOidFromModSch(oid), 32) << oid;
  }
  EXPECT_EQ(takeFromModifiedSchema(installation.manager(), {"1.1", "Word"}), "1.1 Word");
}

TEST(DelOidFromModSch, AbsentOidIs32WithoutAMessage) {
  Installation installation{{"V3.user.at", attributeType("1.1", "a")}};
  int result = -1;
  EXPECT_EQ(messagesOf([&] { result = installation->delOidFromModSch("1.1"); }), "");
  EXPECT_EQ(result, 32);
  EXPECT_EQ(setsOf(installation.manager()), "V3.user.at: 1.1\n");
}

TEST(DelOidFromModSch, TakesTheOidOutOnce) {
  Installation installation{{"V3.modifiedschema", attributeType("1.1", "a")}};
  EXPECT_EQ(callsOf([&] { installation->delOidFromModSch("1.1"); }), "delOidFromModSch");
  EXPECT_EQ(callsOf([&] { installation->delOidFromModSch("1.1"); }), "delOidFromModSch=32");
  EXPECT_EQ(tablesOf(installation.manager()), "attributes: a=1.1(text)\n");
}

TEST(IsModFileEmpty, OnlyTheSetOfModifiedSchemaCounts) {
  Installation installation;
  EXPECT_TRUE(installation->isModFileEmpty());
  EXPECT_EQ(installation.read("V3.user.at", attributeType("1.1", "a")), 0);
  EXPECT_TRUE(installation->isModFileEmpty());
  EXPECT_EQ(installation.read("V3.modifiedschema", attributeType("1.1", "a")), 0);
  EXPECT_FALSE(installation->isModFileEmpty());
  EXPECT_EQ(installation->delOidFromModSch("1.1"), 0);
  EXPECT_TRUE(installation->isModFileEmpty());
  EXPECT_EQ(callsOf([&] { installation->isModFileEmpty(); }), "isModFileEmpty");
}

// ---- Withdrawing ----

TEST(ModifySchema, EachKindLeavesItsTable) {
  const UnfreedDefinitions unfreed;
  Installation installation{
      {"V3.modifiedschema", attributeType("1.1", "Aa") + attributeType("1.2", "b") +
                                objectClass("2.1", "Cc") + objectClass("2.2", "d") +
                                vendorExtension("3.1") + vendorExtension("3.2")}};
  EXPECT_EQ(withdraw(&installation, "1.1\n2.1\n3.1\n"), 0);
  EXPECT_EQ(tablesOf(installation.manager()),
            "attributes: b=1.2(text)\nclasses: d=2.2(text)\nextensions: 3.2(normal)\n");
  EXPECT_EQ(
      takeFromModifiedSchema(installation.manager(), {"1.1", "1.2", "2.1", "2.2", "3.1", "3.2"}),
      "1.2 2.2 3.2");
}

TEST(ModifySchema, WithdrawnDefinitionIsFoundByOidNotByName) {
  const UnfreedDefinitions unfreed;
  Installation installation{
      {"V3.modifiedschema",
       attributeType("1.1", "a") + objectClass("2.1", "c") + vendorExtension("3.1")}};
  EXPECT_EQ(withdraw(&installation, "1.1 2.1 3.1\n"), 0);
  EXPECT_EQ(attributeUnder(installation.manager(), "1.1"), "a=1.1(text)");
  EXPECT_EQ(attributeUnder(installation.manager(), "a"), "nothing");
  EXPECT_EQ(objectClassUnder(installation.manager(), "2.1"), "c=2.1(text)");
  EXPECT_EQ(objectClassUnder(installation.manager(), "c"), "nothing");
  EXPECT_EQ(extensionUnder(installation.manager(), "3.1"), "nothing");
  EXPECT_TRUE(installation->isModFileEmpty());
}

// Only the name table loses the entry; a file set that lists the OID still writes it.
TEST(ModifySchema, WithdrawnAttributeIsStillWritten) {
  const UnfreedDefinitions unfreed;
  Installation installation{{"V3.user.at", attributeType("1.1", "a") + vendorExtension("1.1")},
                            {"V3.modifiedschema", attributeType("1.1", "a")}};
  const std::string before = writtenFile(installation.manager(), "V3.user.at");
  EXPECT_EQ(withdraw(&installation, "1.1\n"), 0);
  EXPECT_EQ(stateOf(installation.manager()), "extensions: 1.1(normal)\nV3.user.at: 1.1\n");
  EXPECT_EQ(writtenFile(installation.manager(), "V3.user.at"), before);
  EXPECT_EQ(
      before,
      std::string(kHeaderLine) +
          "attributetypes=( 1.1 NAME ( 'a'  )  DESC 'text' USAGE userApplications  )\n"
          "ORVAttributetypes=( 1.1 DBNAME ( 'column' 'column'  ) ACCESS-CLASS normal LENGTH 9 EQUALITY )\n");
  EXPECT_EQ(writtenFile(installation.manager(), "V3.modifiedschema"), "");
}

TEST(ModifySchema, WithdrawnObjectClassIsStillWritten) {
  const UnfreedDefinitions unfreed;
  Installation installation{{"V3.user.oc", objectClass("2.1", "c")},
                            {"V3.modifiedschema", objectClass("2.1", "c")}};
  EXPECT_EQ(withdraw(&installation, "2.1\n"), 0);
  EXPECT_EQ(stateOf(installation.manager()), "V3.user.oc: 2.1\n");
  EXPECT_EQ(writtenFile(installation.manager(), "V3.user.oc"),
            std::string(kHeaderLine) + "objectclasses=( 2.1 NAME 'c'  DESC 'text' STRUCTURAL )\n");
}

TEST(ModifySchema, WithdrawnVendorExtensionIsNoLongerWritten) {
  const UnfreedDefinitions unfreed;
  Installation installation{{"V3.orv.at", vendorExtension("1.1") + vendorExtension("1.2")}};
  EXPECT_EQ(withdraw(&installation, "1.1\n"), 0);
  EXPECT_EQ(installation.read("V3.user.at", attributeType("1.1", "a")), 0);
  EXPECT_EQ(writtenFile(installation.manager(), "V3.orv.at"),
            std::string(kHeaderLine) +
                "attributetypes=( 1.1 NAME ( 'a'  )  DESC 'text' USAGE userApplications  )\n");
}

// One OID, one definition: the object class, else the attribute type, else the vendor extension.
TEST(ModifySchema, OneOidWithdrawsOneKind) {
  const UnfreedDefinitions unfreed;
  Installation all{{"V3.modifiedschema",
                    attributeType("1.1", "a") + objectClass("1.1", "c") + vendorExtension("1.1")}};
  EXPECT_EQ(withdraw(&all, "1.1\n"), 0);
  EXPECT_EQ(tablesOf(all.manager()), "attributes: a=1.1(text)\nextensions: 1.1(normal)\n");
  // The index by OID still holds the class, so the next time it is the class again.
  EXPECT_EQ(withdraw(&all, "1.1\n"), 0);
  EXPECT_EQ(tablesOf(all.manager()), "attributes: a=1.1(text)\nextensions: 1.1(normal)\n");

  Installation attribute{{"V3.modifiedschema", attributeType("1.1", "a") + vendorExtension("1.1")}};
  EXPECT_EQ(withdraw(&attribute, "1.1\n"), 0);
  EXPECT_EQ(tablesOf(attribute.manager()), "extensions: 1.1(normal)\n");
}

TEST(ModifySchema, DefinitionsOfAnyFileAreWithdrawn) {
  const UnfreedDefinitions unfreed;
  Installation installation{{"V3.system.at", attributeType("1.1", "a")},
                            {"V3.config.oc", objectClass("2.1", "c")}};
  EXPECT_EQ(withdraw(&installation, "1.1\n2.1\n"), 0);
  EXPECT_EQ(stateOf(installation.manager()), "V3.system.at: 1.1\n");
}

TEST(ModifySchema, NameIsNoOid) {
  Installation installation{{"V3.modifiedschema", attributeType("1.1", "a")}};
  EXPECT_EQ(withdraw(&installation, "a\n1.10\n1\n"), 0);
  EXPECT_EQ(tablesOf(installation.manager()), "attributes: a=1.1(text)\n");
  EXPECT_FALSE(installation->isModFileEmpty());
}

TEST(ModifySchema, UnknownOidsAreIgnoredSilently) {
  Installation installation{{"V3.modifiedschema", attributeType("1.1", "a")}};
  EXPECT_EQ(messagesOf([&] { EXPECT_EQ(withdraw(&installation, "9.9\n"), 0); }), "");
  EXPECT_EQ(tablesOf(installation.manager()), "attributes: a=1.1(text)\n");
}

TEST(ModifySchema, ListMayBeEmpty) {
  Installation installation{{"V3.modifiedschema", attributeType("1.1", "a")}};
  EXPECT_EQ(callsOf([&] { EXPECT_EQ(withdraw(&installation, ""), 0); }), "modifySchema");
  EXPECT_FALSE(installation->isModFileEmpty());
}

// The list's OID is looked up as the public operations do: among the names first. The name of the
// definition so found is erased.
TEST(ModifySchema, DefinitionNamedLikeTheOidIsWithdrawnInstead) {
  const UnfreedDefinitions unfreed;
  Installation installation{
      {"V3.modifiedschema", attributeType("1.1", "a") + attributeType("9.1", "1.1") +
                                objectClass("2.1", "c") + objectClass("9.2", "2.1")}};
  EXPECT_EQ(withdraw(&installation, "1.1\n2.1\n"), 0);
  EXPECT_EQ(tablesOf(installation.manager()), "attributes: a=1.1(text)\nclasses: c=2.1(text)\n");
  EXPECT_EQ(takeFromModifiedSchema(installation.manager(), {"1.1", "2.1", "9.1", "9.2"}),
            "9.1 9.2");
}

// The name is erased whatever definition stands under it: here another one than the OID's.
TEST(ModifySchema, SecondDefinitionOfANameTakesTheFirstWithIt) {
  const UnfreedDefinitions unfreed;
  Installation installation{
      {"V3.modifiedschema", attributeType("1.1", "a", "first") + attributeType("1.2", "a")}};
  EXPECT_EQ(withdraw(&installation, "1.2\n"), 0);
  EXPECT_EQ(tablesOf(installation.manager()), "");
  EXPECT_EQ(takeFromModifiedSchema(installation.manager(), {"1.1", "1.2"}), "1.1");
  EXPECT_EQ(attributeUnder(installation.manager(), "1.1"), "a=1.1(first)");
}

// ---- Trace ----

TEST(ModifySchema, CallsOfEachKind) {
  const UnfreedDefinitions unfreed;
  Installation installation{
      {"V3.modifiedschema",
       attributeType("1.1", "a") + objectClass("2.1", "c") + vendorExtension("3.1")}};
  EXPECT_EQ(callsOf([&] { withdraw(&installation, "3.1\n2.1\n1.1\n9.9\n"); }),
            "modifySchema{getAttr delOidFromModSch getObjClass delOidFromModSch "
            "delOidFromModSch}");
  EXPECT_EQ(callsOf([&] { installation->modifySchema("/no such"); }), "modifySchema=1");
}

TEST(ModifySchema, OidListedTwiceIsWithdrawnOnce) {
  const UnfreedDefinitions unfreed;
  Installation installation{{"V3.modifiedschema", attributeType("1.1", "a")}};
  EXPECT_EQ(callsOf([&] { withdraw(&installation, "1.1 1.1\n1.1\n"); }),
            "modifySchema{getAttr delOidFromModSch}");
}

// 1.2.10 goes before 1.2.6: only the first of the two is in the set of V3.modifiedschema. What
// delOidFromModSch returns changes nothing.
TEST(ModifySchema, OidsAreWithdrawnInByteOrder) {
  const UnfreedDefinitions unfreed;
  Installation installation{{"V3.user.at", attributeType("1.2.6", "six")},
                            {"V3.modifiedschema", attributeType("1.2.10", "ten")}};
  EXPECT_EQ(callsOf([&] { EXPECT_EQ(withdraw(&installation, "1.2.6\n1.2.10\n"), 0); }),
            "modifySchema{getAttr delOidFromModSch getAttr delOidFromModSch=32}");
  EXPECT_EQ(stateOf(installation.manager()), "V3.user.at: 1.2.6\n");
}
