// What is kept of a definition: where it begins and ends, its fields, what differs from what is
// written.

#include <gtest/gtest.h>
#include <libschema-migration/Fields.h>

#include <string>

#include "Differences.h"
#include "RulesTesting.h"

namespace {

using migration::Difference;
using migration::Field;
using migration::KeptDefinition;
using migration::SchemaFile;

std::string keptIn(const std::string& text) {
  const SchemaFile file = rules_testing::fileOf("V3.user.at", text);
  std::string printed;
  for (const KeptDefinition& definition : file.kept->definitions()) {
    const std::size_t length = definition.end - definition.offset;
    printed += std::string(file.source->bytes().substr(definition.offset, length)) + "\n";
    for (const Field& field : fieldsOf(definition)) {
      printed += " " + std::string(keywordOf(field.clause));
      for (const std::string& value : field.values) {
        printed += " [" + value + "]";
      }
    }
    printed += "\n";
  }
  return printed;
}

TEST(KeptFields, OfAnAttributeType) {
  EXPECT_EQ(
      "( 1.2 NAME ( 'a' 'b' ) USAGE directoryOperation SINGLE-VALUE SYNTAX 1.3{7} EQUALITY e )\n"
      " OID [1.2] NAME [a] [b] EQUALITY [e] SYNTAX [1.3{7}] SINGLE-VALUE USAGE "
      "[directoryOperation]\n",
      keptIn("attributetypes=( 1.2 NAME ( 'a' 'b' ) USAGE directoryOperation SINGLE-VALUE SYNTAX "
             "1.3{7} EQUALITY e )\n"));
}

TEST(KeptFields, OfAnObjectClass) {
  EXPECT_EQ(
      "( 1.2 MAY ( c ) MUST ( b $ a ) SUP top AUXILIARY OBSOLETE DESC 'd' )\n"
      " OID [1.2] DESC [d] OBSOLETE SUP [top] AUXILIARY MUST [b] [a] MAY [c]\n",
      keptIn(
          "objectclasses=( 1.2 MAY ( c ) MUST ( b $ a ) SUP top AUXILIARY OBSOLETE DESC 'd' )\n"));
}

TEST(KeptFields, OfAVendorExtension) {
  EXPECT_EQ(
      "( 1.2 REVERSE LENGTH 5 DBNAME ( 'x' 'y' ) ACCESS-CLASS sensitive )\n"
      " OID [1.2] DBNAME [x] [y] ACCESS-CLASS [sensitive] LENGTH [5] REVERSE\n",
      keptIn(
          "ORVAttributetypes=( 1.2 REVERSE LENGTH 5 DBNAME ( 'x' 'y' ) ACCESS-CLASS sensitive )\n"));
}

// A definition has its defaults whether it names them or not; a length of 0 is none.
TEST(KeptFields, HaveTheDefaults) {
  EXPECT_EQ("( 1.2 DESC 'd' )\n OID [1.2] DESC [d] USAGE [userApplications]\n",
            keptIn("attributetypes=( 1.2 DESC 'd' )\n"));
  EXPECT_EQ("( 1.2 DESC 'd' )\n OID [1.2] DESC [d] STRUCTURAL\n",
            keptIn("objectclasses=( 1.2 DESC 'd' )\n"));
  EXPECT_EQ("( 1.2 LENGTH 0 )\n OID [1.2] ACCESS-CLASS [normal]\n",
            keptIn("ORVAttributetypes=( 1.2 LENGTH 0 )\n"));
}

TEST(KeptPlaces, BeginAtTheParenthesisBehindAnyBlankAndComment) {
  EXPECT_EQ(
      "( 1.2 DESC 'd' )\n OID [1.2] DESC [d] USAGE [userApplications]\n"
      "( 1.3 DESC 'd' )\n OID [1.3] DESC [d] USAGE [userApplications]\n",
      keptIn("attributetypes=\t \t( 1.2 DESC 'd' )\n"
             "attributetypes = # (\n\t( 1.3 DESC 'd' )\n"));
}

TEST(KeptFile, FailsWhereTheTokenStands) {
  const SchemaFile file = rules_testing::fileOf("V3.user.at", "attributetypes\n\t# x\n\tfoo\n");
  EXPECT_EQ(migration::ReadingEnd::kFails, file.kept->ending());
  EXPECT_EQ("foo\n", file.source->bytes().substr(file.kept->endOffset()));
}

std::string differencesIn(const std::string& text) {
  const SchemaFile file = rules_testing::fileOf("V3.user.at", text);
  const migration::Differences differences(*file.written, *file.kept);
  std::string printed;
  for (const Difference& each : differences.all()) {
    printed += each.sort == Difference::kField  ? std::string(keywordOf(each.clause)) + " "
               : each.sort == Difference::kLost ? "lost "
               : each.sort == Difference::kMade ? "made "
                                                : "ends ";
    printed += "at " + std::to_string(each.offset) + ": " + each.reads + ", " + each.kept + "\n";
  }
  return printed;
}

// What stands nowhere as this clause and is kept as it differs as well.
TEST(Differences, ValueThatIsWrittenNowhere) {
  EXPECT_EQ("", differencesIn("attributetypes=( 1.2 DESC 'd' )\n"));
  EXPECT_EQ(" at 32: \"X-ORIGIN 'here'\", nothing\nOID at 15: nothing, \"here\"\n",
            differencesIn("attributetypes=( NAME 'a' SUP b X-ORIGIN 'here' )\n"));
}

TEST(Slice, IsEmptyWithoutElements) {
  const migration::Slice<int> none;
  EXPECT_EQ(0U, none.size());
  EXPECT_TRUE(none.empty());
  EXPECT_EQ(none.begin(), none.end());
}

}  // namespace
