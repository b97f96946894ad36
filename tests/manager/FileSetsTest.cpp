// Excluded OIDs, and taking an OID out of the file sets.

#include <gtest/gtest.h>

#include <string>

#include "Calls.h"
#include "Files.h"
#include "Installation.h"

using namespace support;

TEST(IsExcluded, ExactMatchOnly) {
  Installation installation;
  installation.exclude({"2.5.4.3", "Word", "1.2"});
  const std::pair<const char*, bool> rows[] = {
      {"2.5.4.3", true},   {"2.5.4.30", false}, {"2.5.4", false},  {"2.5.4.3 ", false},
      {" 2.5.4.3", false}, {"Word", true},      {"word", false},   {"WORD", false},
      {"1.2", true},       {"", false},         {"2.5.4.*", false}};
  for (const auto& [oid, isExcluded] : rows) {
    EXPECT_EQ(installation->isExcluded(oid), isExcluded) << "'" << oid << "'";
  }
}

TEST(IsExcluded, NothingInANewManager) {
  Installation installation;
  EXPECT_FALSE(installation->isExcluded("1.1"));
  EXPECT_FALSE(installation->isExcluded(""));
}

TEST(IsExcluded, LeavesOneRecordWithoutACode) {
  Installation installation;
  installation.exclude({"1.1"});
  EXPECT_EQ(callsOf([&] {
              installation->isExcluded("1.1");
              installation->isExcluded("1.2");
            }),
            "isExcluded isExcluded");
}

// The order of the files is fixed; each call takes the OID out of one set.
TEST(DelOidFromFileSet, FirstSetThatHoldsTheOidLosesIt) {
  const std::string at = attributeType("1.1", "a");
  const std::string oc = objectClass("1.1", "c");
  Installation installation{{"V3.system.at", at}, {"V3.system.oc", oc}, {"V3.orv.at", at},
                            {"V3.orv.oc", oc},    {"V3.user.at", at},   {"V3.user.oc", oc}};
  const char* const left[] = {
      "V3.user.oc: 1.1\nV3.user.at: 1.1\nV3.orv.oc: 1.1\nV3.orv.at: 1.1\nV3.system.oc: 1.1\nV3.system.at: 1.1\n",
      "V3.user.at: 1.1\nV3.orv.oc: 1.1\nV3.orv.at: 1.1\nV3.system.oc: 1.1\nV3.system.at: 1.1\n",
      "V3.orv.oc: 1.1\nV3.orv.at: 1.1\nV3.system.oc: 1.1\nV3.system.at: 1.1\n",
      "V3.orv.at: 1.1\nV3.system.oc: 1.1\nV3.system.at: 1.1\n",
      "V3.system.oc: 1.1\nV3.system.at: 1.1\n",
      "V3.system.at: 1.1\n",
      "",
  };
  for (int i = 0; i < 6; ++i) {
    EXPECT_EQ(setsOf(installation.manager()), left[i]);
    EXPECT_EQ(installation->delOidFromFileSet("1.1"), 0) << i;
  }
  EXPECT_EQ(setsOf(installation.manager()), left[6]);
  EXPECT_EQ(installation->delOidFromFileSet("1.1"), 32);
}

TEST(DelOidFromFileSet, UserClassesGoBeforeSystemClasses) {
  Installation installation{{"V3.system.oc", objectClass("1.1", "c") + objectClass("1.2", "d")},
                            {"V3.user.oc", objectClass("1.1", "c") + objectClass("1.3", "e")}};
  EXPECT_EQ(installation->delOidFromFileSet("1.1"), 0);
  EXPECT_EQ(setsOf(installation.manager()), "V3.user.oc: 1.3\nV3.system.oc: 1.1 1.2\n");
}

TEST(DelOidFromFileSet, ExactMatchOnly) {
  Installation installation{{"V3.user.at", attributeType("1.1", "a") + attributeType("Word", "b")}};
  for (const char* oid : {"1.10", "1", "1.1 ", "word", ""}) {
    EXPECT_EQ(installation->delOidFromFileSet(oid), 32) << oid;
  }
  EXPECT_EQ(setsOf(installation.manager()), "V3.user.at: 1.1 Word\n");
}

TEST(DelOidFromFileSet, AbsentOidIs32WithAMessage) {
  Installation installation;
  int result = -1;
  EXPECT_EQ(messagesOf([&] { result = installation->delOidFromFileSet("1.1"); }),
            "delOidFromFileSet: Unable to delete OID from set, 1.1.\n");
  EXPECT_EQ(result, 32);
}

TEST(DelOidFromFileSet, ModifiedSchemaAndExcludedOidsHaveNoPartInIt) {
  Installation installation{{"V3.modifiedschema", attributeType("1.1", "a")}};
  installation.exclude({"1.1"});
  EXPECT_EQ(installation->delOidFromFileSet("1.1"), 32);
  EXPECT_TRUE(installation->isExcluded("1.1"));
  EXPECT_EQ(installation->delOidFromModSch("1.1"), 0);
}

TEST(DelOidFromFileSet, TablesAreNotTouched) {
  Installation installation{{"V3.user.at", attributeType("1.1", "a") + attributeType("1.2", "b")}};
  EXPECT_EQ(installation->delOidFromFileSet("1.1"), 0);
  EXPECT_EQ(stateOf(installation.manager()),
            "attributes: a=1.1(text) b=1.2(text)\nV3.user.at: 1.2\n");
  EXPECT_EQ(attributeUnder(installation.manager(), "1.1"), "a=1.1(text)");
  EXPECT_EQ(writtenFile(installation.manager(), "V3.user.at").find("1.1 NAME"), std::string::npos);
}

TEST(DelOidFromFileSet, CallsAndExitCodes) {
  Installation installation{{"V3.user.at", attributeType("1.1", "a")}};
  EXPECT_EQ(callsOf([&] { installation->delOidFromFileSet("1.1"); }), "delOidFromFileSet");
  EXPECT_EQ(callsOf([&] { installation->delOidFromFileSet("1.1"); }), "delOidFromFileSet=32");
}
