// Reading, writing and reading again: what comes back, and each case of what does not.

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "Files.h"
#include "GeneratedDirectory.h"
#include "ManagerGroup.h"
#include "Pairs.h"
#include "RoundTrip.h"

namespace {

using properties::allReadBack;
using properties::differenceAfterRoundTrip;
using properties::ManagerGroup;

struct RoundTripCase {
  const char* rule;
  std::string text;
};

std::string attribute(const std::string& clauses) { return "attributetypes=( " + clauses + " )\n"; }

std::string objectClass(const std::string& clauses) {
  return "objectclasses=( " + clauses + " )\n";
}

std::string extension(const std::string& clauses) {
  return "attributetypes=( 1.2 NAME 'a' DESC 'd' )\nORVAttributetypes=( " + clauses + " )\n";
}

const RoundTripCase kComingBack[] = {
    {"nothing", ""},
    {"everything, attribute type",
     attribute("1.2 NAME ( 'a' 'b c' ) DESC 'x, (y)' OBSOLETE SUP name EQUALITY caseIgnoreMatch "
               "ORDERING 2.5.13.3 SUBSTR -x SYNTAX 1.3{64} SINGLE-VALUE NO-USER-MODIFICATION USAGE "
               "dSAOperation")},
    {"everything, object class",
     objectClass("1.2 NAME ( 'a' 'a' ) DESC 'x' OBSOLETE SUP ( top $ b ) AUXILIARY MUST ( cn $ "
                 "objectClasses ) MAY ( attributeTypes )")},
    {"everything, vendor extension",
     extension("1.2 DBNAME ( 'a' ORVattributeTypes ) ACCESS-CLASS critical LENGTH 64 EQUALITY "
               "ORDERING SUBSTR APPROX REVERSE")},
    {"no OID", attribute("NAME 'a' DESC 'd'") + objectClass("NAME 'a' DESC 'd'")},
    {"no names", attribute("1.2 DESC '1.3'") + objectClass("1.3 MAY ( cn )")},
    {"an empty name", attribute("1.2 NAME ( '' 'a' ) DESC 'd'")},
    {"a word for an OID", attribute("site-oid NAME 'site-oid' DESC 'd'")},
    {"a name with a TAB", attribute("1.2 NAME ( 'a\tb' c\td ) DESC '\t'")},
    {"a later name that is the OID", attribute("1.2 NAME ( 'a' '1.2' ) DESC '1.2'")},
    {"a keyword for an access class", extension("1.2 ACCESS-CLASS EQUALITY LENGTH DBNAME")},
    {"numbers for access class and length", extension("1.2 ACCESS-CLASS 1{2} LENGTH 3{")},
    {"a length of 0", extension("1.2 LENGTH 0")},
    {"one OID for two kinds",
     attribute("1.2 NAME 'a' DESC 'd'") + objectClass("1.2 NAME 'a' MAY ( cn )")},
    {"one name under two OIDs",
     attribute("1.3 NAME 'a' DESC 'd'") + attribute("1.2 NAME 'A' DESC 'e'")},
    {"a vendor extension alone, which is not written",
     "ORVAttributetypes=( 1.9 DBNAME ( 'a' ) ACCESS-CLASS '' )\n"},
};

const RoundTripCase kNotComingBack[] = {
    {"an OID of two words", attribute("'1.2 b' NAME 'a' DESC 'd'")},
    {"an OID that begins like no word", attribute("'_b' NAME 'a' DESC 'd'")},
    {"an OID with a length", attribute("'1.2{3}' NAME 'a' DESC 'd'")},
    {"two superiors", attribute("1.2 NAME 'a' SUP b SUP c")},
    {"a superior of two words", attribute("1.2 NAME 'a' SUP 'b EQUALITY c'")},
    {"an empty superior", attribute("1.2 NAME 'a' SUP '' SYNTAX 1.3")},
    {"a matching rule of two words", attribute("1.2 NAME 'a' ORDERING 'b c'")},
    {"a matching rule with a length", attribute("1.2 NAME 'a' EQUALITY '1.3{4}'")},
    {"a syntax of two words", attribute("1.2 NAME 'a' SYNTAX '1.3 b'")},
    {"a syntax without its length", attribute("1.2 NAME 'a' SYNTAX '1.3{'")},
    {"an empty usage", attribute("1.2 NAME 'a' DESC 'd' USAGE ''")},
    {"a number for a usage", attribute("1.2 NAME 'a' DESC 'd' USAGE '1.3'")},
    {"a first name that is the OID", attribute("NAME '1.2' DESC 'd' 1.2")},
    {"a first name that is the OID, behind a keyword",
     attribute("NAME ( objectClasses '1.2' ) DESC 'd' 1.2")},
    {"a description that is the OID, without names", attribute("DESC '1.2' SYNTAX 1.3 1.2")},
    {"an OID of two words, object class", objectClass("'1.2 b' NAME 'a' MAY ( cn )")},
    {"a first name that is the OID, object class", objectClass("NAME '1.2' DESC 'd' 1.2")},
    {"a superior of two words, object class", objectClass("1.2 NAME 'a' SUP 'b c'")},
    {"an empty superior, object class", objectClass("1.2 NAME 'a' SUP ''")},
    {"a number for a superior", objectClass("1.2 NAME 'a' SUP '1.3'")},
    {"a number for a member", objectClass("1.2 NAME 'a' MUST ( cn '1.3' )")},
    {"a member of two words", objectClass("1.2 NAME 'a' MAY ( 'cn )' )")},
    {"an empty access class", extension("1.2 ACCESS-CLASS '' LENGTH 9")},
    {"an access class of two words", extension("1.2 ACCESS-CLASS 'a b'")},
    {"an empty length", extension("1.2 LENGTH )")},
    {"a first database name that is the OID", extension("DBNAME ( '1.2' ) 1.2")},
};

TEST(RoundTrip, OfWhatReadsBackKeepsTablesSetAndBytes) {
  const support::TemporaryDirectory folder;
  for (const RoundTripCase& row : kComingBack) {
    SCOPED_TRACE(row.rule);
    folder.write("V3.user.at", row.text);
    ManagerGroup group(folder.path());
    const auto [manager, status] = group.readIn(folder.path(), "V3.user.at");
    EXPECT_EQ(status, 0);
    EXPECT_TRUE(allReadBack(*manager, "V3.user.at"));
    EXPECT_EQ(differenceAfterRoundTrip(manager, "V3.user.at", &group), "");
  }
}

TEST(RoundTrip, OfWhatDoesNotReadBackChangesSomething) {
  const support::TemporaryDirectory folder;
  for (const RoundTripCase& row : kNotComingBack) {
    SCOPED_TRACE(row.rule);
    folder.write("V3.user.at", row.text);
    ManagerGroup group(folder.path());
    const auto [manager, status] = group.readIn(folder.path(), "V3.user.at");
    EXPECT_EQ(status, 0);
    EXPECT_FALSE(allReadBack(*manager, "V3.user.at"));
    EXPECT_NE(differenceAfterRoundTrip(manager, "V3.user.at", &group), "");
  }
}

TEST(RoundTrip, OfEveryFileOfGeneratedDirectories) {
  std::size_t filled = 0;
  properties::forAnyPairs([&](const properties::Pair& pair) {
    for (const auto& [name, text] : properties::filesOf(pair.first)) {
      if (name != "V3.config.at" && name != "V3.config.oc") {
        ManagerGroup group(pair.folder);
        SchemaManager* const manager = group.read({{name, text}});
        ASSERT_TRUE(allReadBack(*manager, name)) << text;
        ASSERT_EQ(differenceAfterRoundTrip(manager, name, &group), "") << text;
        ++filled;
      }
    }
  });
  EXPECT_GT(filled, properties::kPairs);
}

}  // namespace
