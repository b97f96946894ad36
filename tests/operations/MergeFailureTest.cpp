// Merges that fail, and the search for the set that an added OID joins.

#include <gtest/gtest.h>

#include <set>
#include <string>

#include "Calls.h"
#include "Files.h"
#include "Installation.h"
#include "UnfreedDefinitions.h"

using namespace support;

namespace {

// After a merge that failed the two managers share definitions, so that neither is destroyed.
void keepForGood(Installation* installation, Installation* source) {
  installation->keepForGood();
  source->keepForGood();
}

struct FailingKind {
  const char* name;
  std::string definition;
  const char* messages;
  const char* calls;
};

const FailingKind kFailingKinds[] = {
    {"AttributeType", attributeType("5.1", "x"),
     "findOidInSet: Unable to find OID, 5.1, in set.\nmergeAttrs: findOidInSet returned NULL\n",
     "mergeSchemas{mergeAttrs{findOidInSet}}"},
    {"VendorExtension", vendorExtension("5.1"),
     "findOidInSet: Unable to find OID, 5.1, in set.\nmergeORVAttrs: findOidInSet returned NULL\n",
     "mergeSchemas{mergeAttrs=1 mergeORVAttrs{findOidInSet}}"},
    {"ObjectClass", objectClass("5.1", "x"),
     "findOidInSet: Unable to find OID, 5.1, in set.\nmergeObjClasses: findOidInSet returned NULL\n",
     "mergeSchemas{mergeAttrs=1 mergeORVAttrs mergeObjClasses{findOidInSet}}"},
};

}  // namespace

// A definition known only from V3.modifiedschema or a config file cannot be added.
TEST(MergeSchemas, AdditionWithoutASetOfTheSourceFails) {
  for (const FailingKind& kind : kFailingKinds) {
    for (const char* file : {"V3.modifiedschema", "V3.config.at", "V3.config.oc"}) {
      SCOPED_TRACE(std::string(kind.name) + " of " + file);
      Installation installation;
      Installation source{{file, kind.definition}};
      source.exclude({"5.1"});
      bool result = true;
      EXPECT_EQ(messagesOf([&] { result = installation->mergeSchemas(source.manager()); }),
                kind.messages);
      EXPECT_FALSE(result);
      EXPECT_EQ(callsOf([&] { installation->mergeSchemas(source.manager()); }), kind.calls);
      EXPECT_EQ(stateOf(installation.manager()), "");
      keepForGood(&installation, &source);
    }
  }
}

TEST(MergeSchemas, FailurePrintsNothing) {
  Installation installation;
  Installation source{{"V3.config.at", attributeType("5.1", "x")}};
  EXPECT_EQ(standardOutputOf([&] { installation->mergeSchemas(source.manager()); }), "");
  keepForGood(&installation, &source);
}

// The pass ends in the middle of its walk: what came before is in both managers, and the later
// passes do not run.
TEST(MergeSchemas, FailureLeavesTheInterruptedPassInBothManagers) {
  const UnfreedDefinitions unfreed;  // what was replaced before the failure
  const std::string vendor = vendorExtension("1.1") + vendorExtension("1.3");
  Installation installation{{"V3.system.at", attributeType("1.1", "a", "mine")}};
  Installation source{
      {"V3.user.at", attributeType("1.1", "a", "theirs") + attributeType("1.2", "b") +
                         attributeType("1.4", "d") + vendor},
      {"V3.config.at", attributeType("1.3", "c")},
      {"V3.user.oc", objectClass("2.1", "e")}};
  // The vendor extension's OID would find the set of the source; the attribute type must not.
  EXPECT_EQ(source->delOidFromFileSet("1.3"), 0);
  const std::string whole = stateOf(source.manager());
  EXPECT_FALSE(installation->mergeSchemas(source.manager()));
  EXPECT_EQ(stateOf(installation.manager()),
            "attributes: a=1.1(theirs) b=1.2(text)\nV3.user.at: 1.2\nV3.system.at: 1.1\n");
  EXPECT_EQ(attributeUnder(installation.manager(), "1.1"), "a=1.1(theirs)");
  EXPECT_EQ(stateOf(source.manager()), whole);
  EXPECT_EQ(attributeUnder(source.manager(), "1.1"), "a=1.1(theirs)");
  EXPECT_EQ(attributeUnder(source.manager(), "1.2"), "b=1.2(text)");
  keepForGood(&installation, &source);
}

TEST(MergeSchemas, FailureOfALaterPassLeavesTheEarlierOnesDone) {
  Installation installation;
  Installation source{{"V3.user.at", attributeType("1.1", "a") + vendorExtension("1.1")},
                      {"V3.user.oc", objectClass("2.1", "c")},
                      {"V3.config.oc", objectClass("2.2", "d")}};
  EXPECT_FALSE(installation->mergeSchemas(source.manager()));
  EXPECT_EQ(stateOf(installation.manager()),
            "attributes: a=1.1(text)\nclasses: c=2.1(text)\nextensions: 1.1(normal)\n"
            "V3.user.oc: 2.1\nV3.user.at: 1.1\n");
  EXPECT_EQ(tablesOf(source.manager()), "classes: c=2.1(text) d=2.2(text)\n");
  keepForGood(&installation, &source);
}

TEST(MergeSchemas, FailureOfVendorExtensions) {
  Installation installation;
  Installation source{{"V3.user.at", attributeType("1.1", "a")},
                      {"V3.orv.at", vendorExtension("1.1") + vendorExtension("1.3")},
                      {"V3.config.at", vendorExtension("1.2")},
                      {"V3.user.oc", objectClass("2.1", "c")}};
  EXPECT_FALSE(installation->mergeORVAttrs(source.manager()));
  EXPECT_EQ(stateOf(installation.manager()), "extensions: 1.1(normal)\nV3.user.at: 1.1\n");
  EXPECT_EQ(tablesOf(source.manager()),
            "attributes: a=1.1(text)\nclasses: c=2.1(text)\n"
            "extensions: 1.1(normal) 1.2(normal) 1.3(normal)\n");
  keepForGood(&installation, &source);
}

// ---- findOidInSet ----

TEST(FindOidInSet, IsTheSetOfThisManagerForTheSameFile) {
  for (const char* file :
       {"V3.user.oc", "V3.user.at", "V3.orv.oc", "V3.orv.at", "V3.system.oc", "V3.system.at"}) {
    SCOPED_TRACE(file);
    Installation installation;
    Installation source{{file, attributeType("1.1", "a")}};
    std::set<std::string>* oids = installation->findOidInSet(source.manager(), "1.1");
    ASSERT_NE(oids, nullptr);
    oids->insert("7.7");
    EXPECT_EQ(setsOf(installation.manager()), std::string(file) + ": 7.7\n");
    EXPECT_EQ(setsOf(source.manager()), std::string(file) + ": 1.1\n");
  }
}

TEST(FindOidInSet, AbsentOidIsNullWithAMessage) {
  Installation installation{{"V3.user.at", attributeType("1.1", "a")}};
  Installation source{{"V3.modifiedschema", attributeType("1.1", "a")},
                      {"V3.user.at", attributeType("Word", "b") + attributeType("1.10", "c")}};
  source.exclude({"1.1"});
  for (const char* oid : {"1.1", "1", "word", "1.10 ", ""}) {
    std::set<std::string>* oids = nullptr;
    EXPECT_EQ(messagesOf([&] { oids = installation->findOidInSet(source.manager(), oid); }),
              "findOidInSet: Unable to find OID, " + std::string(oid) + ", in set.\n");
    EXPECT_EQ(oids, nullptr) << oid;
  }
}

TEST(FindOidInSet, LeavesOneRecordWithoutACode) {
  Installation installation;
  Installation source{{"V3.user.at", attributeType("1.1", "a")}};
  EXPECT_EQ(callsOf([&] {
              installation->findOidInSet(source.manager(), "1.1");
              installation->findOidInSet(source.manager(), "1.2");
            }),
            "findOidInSet findOidInSet");
}
