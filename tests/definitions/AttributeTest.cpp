#include "Attribute.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstddef>
#include <memory>
#include <random>
#include <string>
#include <type_traits>
#include <utility>
#include <vector>

#include "Outcomes.h"
#include "SchemaTokens.h"
#include "TraceRecorder.h"

namespace {

using definitions::bareLineOf;
using definitions::parsed;
using definitions::replaced;

// Opens the members that a derived definition reads and sets.
class OpenAttribute : public Attribute {
 public:
  using Attribute::description;
  using Attribute::equality;
  using Attribute::isCollective;
  using Attribute::isObsolete;
  using Attribute::isUserModifiable;
  using Attribute::names;
  using Attribute::OID;
  using Attribute::ordering;
  using Attribute::singleValue;
  using Attribute::substr;
  using Attribute::superiors;
  using Attribute::syntax;
  using Attribute::usage;
};

const std::string kFull =
    "=( 2.5.4.3 NAME ( 'cn' 'commonName' ) DESC 'a Name' OBSOLETE SUP name "
    "EQUALITY caseIgnoreMatch ORDERING caseIgnoreOrderingMatch SUBSTR caseIgnoreSubstringsMatch "
    "SYNTAX 1.3.6.1{64} SINGLE-VALUE NO-USER-MODIFICATION USAGE directoryOperation )\n";

const char kFullLine[] =
    "attributetypes=( 2.5.4.3 NAME ( 'cn' 'commonName'  )  DESC 'a Name' OBSOLETE SUP name "
    "EQUALITY caseIgnoreMatch ORDERING caseIgnoreOrderingMatch SUBSTR caseIgnoreSubstringsMatch "
    "SYNTAX 1.3.6.1{64} SINGLE-VALUE NO-USER-MODIFICATION USAGE directoryOperation  )";

static_assert(std::is_base_of_v<ORVSchema, Attribute>);
static_assert(std::has_virtual_destructor_v<ORVSchema>);
static_assert(std::is_abstract_v<ORVSchema>);
static_assert(std::is_same_v<decltype(std::declval<Attribute>().parse(nullptr)), int>);

TEST(AttributeDump, WritesOneLine) {
  Attribute fresh;
  EXPECT_EQ(support::lineOf(&fresh), "attributetypes=(  NAME (  ) USAGE userApplications  )\n");

  Attribute full = parsed<Attribute>(kFull);
  EXPECT_EQ(support::lineOf(&full), std::string(kFullLine) + "\n");
}

TEST(AttributeDump, WritesEachPieceOnlyWhenThereIsSomething) {
  OpenAttribute attribute;
  attribute.OID = "1.1";
  attribute.usage = "";
  EXPECT_EQ(support::lineOf(&attribute), "attributetypes=( 1.1 NAME (  )  )\n");
  attribute.isCollective = true;
  attribute.isUserModifiable = false;
  EXPECT_EQ(support::lineOf(&attribute),
            "attributetypes=( 1.1 NAME (  ) COLLECTIVE NO-USER-MODIFICATION  )\n");
  attribute.singleValue = KEY_SINGLE_VALUE;
  attribute.superiors = {"a", "b", "a"};
  EXPECT_EQ(support::lineOf(&attribute),
            "attributetypes=( 1.1 NAME (  ) SUP a b a SINGLE-VALUE COLLECTIVE NO-USER-MODIFICATION "
            " )\n");
}

TEST(AttributeDump, WritesLongLists) {
  OpenAttribute attribute;
  std::string names;
  std::string superiors;
  for (int i = 0; i < 3000; ++i) {
    const std::string member = i % 3 == 0 ? "" : std::to_string(i);
    attribute.names.push_back(member);
    attribute.superiors.push_back(member);
    names += "'" + member + "' ";
    superiors += member + " ";
  }
  EXPECT_EQ(support::lineOf(&attribute), "attributetypes=(  NAME ( " + names + " ) SUP " +
                                             superiors + "USAGE userApplications  )\n");
}

TEST(AttributeDump, AddsToTheStreamAndFlushesIt) {
  const support::TemporaryDirectory directory;
  std::ofstream out(directory.file("lines"));
  Attribute attribute = parsed<Attribute>("=( 1.1 OBSOLETE )");
  out << "# two\n";
  attribute.dump(out);
  attribute.dump(out);
  EXPECT_EQ(support::readWholeFile(directory.file("lines")),
            "# two\n"
            "attributetypes=( 1.1 NAME (  ) OBSOLETE USAGE userApplications  )\n"
            "attributetypes=( 1.1 NAME (  ) OBSOLETE USAGE userApplications  )\n");
}

TEST(AttributeDump, AppendLineWritesAndTracesTheSame) {
  Attribute attribute = parsed<Attribute>(kFull);
  const support::TraceRecorder recorder(support::kAllEvents);
  std::string text = "before\n";
  attribute.appendLine(&text);
  EXPECT_EQ(text, "before\n" + std::string(kFullLine) + "\n");
  EXPECT_EQ(recorder.records(),
            (std::vector<std::string>{"entry 0x53010300 level 0x3200000",
                                      "exit 0x53010300 kind 33 bit 4096 code 0"}));
}

TEST(AttributeDump, PrintsToStandardOutput) {
  Attribute fresh;
  EXPECT_EQ(support::standardOutputOf([&] { fresh.dump(); }),
            "oid --> \nnames --> \ndescription --> \nequality --> \nsyntax --> \nordering --> \n"
            "substr --> \nsuperior --> \nusage --> userApplications\n");

  Attribute full = parsed<Attribute>(replaced(kFull, "SUP name", "SUP name SUP top"));
  EXPECT_EQ(support::standardOutputOf([&] { full.dump(); }),
            "oid --> 2.5.4.3\n"
            "names --> cn commonName \n"
            "description --> a Name\n"
            "equality --> caseIgnoreMatch\n"
            "syntax --> 1.3.6.1{64}\n"
            "ordering --> caseIgnoreOrderingMatch\n"
            "substr --> caseIgnoreSubstringsMatch\n"
            "superior --> name top \n"
            "usage --> directoryOperation\n");
}

TEST(AttributeDump, ReadsBackToTheSameBytes) {
  for (const std::string& text :
       {kFull, std::string("=( )"), std::string("=( 1.1 SUP a )"),
        std::string("=( 1.1 NAME ( 'a' 'b' 'objectClasses' ) DESC 'x (y) $ \"z\"' )"),
        std::string("=( word NAME '' USAGE dSAOperation SYNTAX 'a' )")}) {
    SCOPED_TRACE(text);
    Attribute first = parsed<Attribute>(text);
    const std::string line = support::lineOf(&first);
    Attribute second = parsed<Attribute>(line.substr(std::string("attributetypes").size()));
    EXPECT_EQ(support::lineOf(&second), line);
    EXPECT_EQ(second.attrsEqual(first), 1);
  }
}

TEST(AttributeMembers, Defaults) {
  const OpenAttribute fresh;
  EXPECT_EQ(fresh.OID, "");
  EXPECT_EQ(fresh.description, "");
  EXPECT_TRUE(fresh.names.empty());
  EXPECT_TRUE(fresh.superiors.empty());
  EXPECT_FALSE(fresh.isObsolete);
  EXPECT_EQ(fresh.equality, "");
  EXPECT_EQ(fresh.usage, "userApplications");
  EXPECT_EQ(fresh.syntax, "");
  EXPECT_EQ(fresh.ordering, "");
  EXPECT_EQ(fresh.substr, "");
  EXPECT_EQ(fresh.singleValue, 1);
  EXPECT_FALSE(fresh.isCollective);
  EXPECT_TRUE(fresh.isUserModifiable);
}

TEST(AttributeMembers, SingleValueKeepsTheTokenCode) {
  OpenAttribute attribute;
  support::parseText("=( 1.1 SINGLE-VALUE )", &attribute);
  EXPECT_EQ(attribute.singleValue, 1013);
}

TEST(AttributeMembers, GettersReturnCopies) {
  Attribute full = parsed<Attribute>(replaced(kFull, "SUP name", "SUP name SUP top"));
  EXPECT_EQ(full.getOid(), "2.5.4.3");
  EXPECT_EQ(full.getDescription(), "a Name");
  EXPECT_EQ(full.getSuperior(), (std::vector<std::string>{"name", "top"}));
  EXPECT_EQ(full.getNames(), (std::vector<std::string>{"cn", "commonName"}));
  EXPECT_EQ(full.getFirstName(), "cn");
  full.getNames().clear();
  full.getSuperior().clear();
  EXPECT_EQ(full.getNames().size(), 2u);
  EXPECT_EQ(full.getSuperior().size(), 2u);
}

TEST(AttributeMembers, FirstName) {
  Attribute named = parsed<Attribute>("=( 1.1 NAME ( 'commonName' 'CN' ) OBSOLETE )");
  EXPECT_EQ(named.getFirstName(), "commonName");
  EXPECT_EQ(named.getFirstNameLower(), "commonname");
  Attribute unnamed;
  EXPECT_EQ(unnamed.getFirstName(), "");
  EXPECT_EQ(unnamed.getFirstNameLower(), "");
}

TEST(AttributeMembers, ConvertLowersEachCharacter) {
  Attribute attribute;
  EXPECT_EQ(attribute.convert(""), "");
  EXPECT_EQ(attribute.convert("MiXed-09_Z ['@'"), "mixed-09_z ['@'");
  EXPECT_EQ(attribute.convert("\xC3\x84\xFF"), "\xC3\x84\xFF");
}

TEST(AttributeMembers, OidAndName) {
  EXPECT_EQ(Attribute().getOidAndName(), "OID --> \nName --> \n\n");
  EXPECT_EQ(parsed<Attribute>("=( 1.1 OBSOLETE )").getOidAndName(), "OID --> 1.1\nName --> \n\n");
  EXPECT_EQ(parsed<Attribute>("=( 1.1 NAME 'A' OBSOLETE )").getOidAndName(),
            "OID --> 1.1\nName --> A\n\n");
  EXPECT_EQ(parsed<Attribute>("=( 1.1 NAME ( 'A' 'b' 'C' ) OBSOLETE )").getOidAndName(),
            "OID --> 1.1\nName --> A, b, C\n\n");
}

TEST(AttributeMembers, CopiesAreWholeAndTheirOwn) {
  Attribute copy;
  std::string line;
  {
    Attribute full = parsed<Attribute>(kFull);
    Attribute constructed(full);
    copy = constructed;
    EXPECT_EQ(copy.attrsEqual(full), 1);
    full = Attribute();
    EXPECT_EQ(bareLineOf(&full), "attributetypes=(  NAME (  ) USAGE userApplications  )");
  }
  EXPECT_EQ(bareLineOf(&copy), kFullLine);
}

TEST(AttributeMembers, DeletedThroughTheBaseClass) {
  class Observed : public Attribute {
   public:
    explicit Observed(bool* isGone) : m_isGone(isGone) {}
    ~Observed() override { *m_isGone = true; }

   private:
    bool* m_isGone;
  };
  bool isGone = false;
  std::unique_ptr<ORVSchema> definition = std::make_unique<Observed>(&isGone);
  EXPECT_EQ(definition->getFirstNameLower(), "");
  definition.reset();
  EXPECT_TRUE(isGone);
}

// What attrsEqual gives from the left to the right and back.
std::string equalBothWays(Attribute left, Attribute right) {
  return std::to_string(left.attrsEqual(right)) + " " + std::to_string(right.attrsEqual(left));
}

struct EqualityCase {
  const char* rule;
  const char* from;  // in the full definition
  const char* to;
  const char* result;
};

TEST(AttributeEquality, EveryFieldCounts) {
  const EqualityCase kCases[] = {
      {"Same", " )\n", " )", "1 1"},
      {"Oid", "2.5.4.3", "2.5.4.4", "0 0"},
      {"DescriptionByCase", "'a Name'", "'a name'", "0 0"},
      {"Description", "DESC 'a Name' ", "DESC '' ", "0 0"},
      {"Equality", "caseIgnoreMatch", "caseExactMatch", "0 0"},
      {"EqualityByCase", "caseIgnoreMatch", "caseignorematch", "0 0"},
      {"Usage", "directoryOperation", "dSAOperation", "0 0"},
      {"UsageByCase", "directoryOperation", "DirectoryOperation", "0 0"},
      {"Syntax", "1.3.6.1{64}", "1.3.6.2{64}", "0 0"},
      {"SyntaxLength", "1.3.6.1{64}", "1.3.6.1{65}", "0 0"},
      {"SyntaxWithoutLength", "1.3.6.1{64}", "1.3.6.1", "0 0"},
      {"Ordering", "caseIgnoreOrderingMatch", "caseExactOrderingMatch", "0 0"},
      {"OrderingByCase", "caseIgnoreOrderingMatch", "CaseIgnoreOrderingMatch", "0 0"},
      {"Substr", "caseIgnoreSubstringsMatch", "caseExactSubstringsMatch", "0 0"},
      {"SubstrByCase", "caseIgnoreSubstringsMatch", "caseIgnoreSubStringsMatch", "0 0"},
      {"SingleValue", "SINGLE-VALUE ", "", "0 0"},
      {"Obsolete", "OBSOLETE ", "", "0 0"},
      {"UserModification", "NO-USER-MODIFICATION ", "", "0 0"},
      {"NameCount", "'cn' 'commonName'", "'cn'", "0 0"},
      {"OtherName", "'cn' 'commonName'", "'cn' 'surname'", "0 0"},
      {"NamesByCaseAndOrder", "'cn' 'commonName'", "'COMMONNAME' 'CN'", "1 1"},
      {"SuperiorCount", "SUP name", "SUP name SUP name", "0 0"},
      {"OtherSuperior", "SUP name", "SUP top", "0 0"},
      {"NoSuperior", "SUP name ", "", "0 0"},
      {"SuperiorByCase", "SUP name", "SUP Name", "1 1"},
  };
  for (const EqualityCase& row : kCases) {
    SCOPED_TRACE(row.rule);
    EXPECT_EQ(equalBothWays(parsed<Attribute>(kFull),
                            parsed<Attribute>(replaced(kFull, row.from, row.to))),
              row.result);
  }
  EXPECT_EQ(equalBothWays(Attribute(), Attribute()), "1 1");
}

TEST(AttributeEquality, CollectiveCounts) {
  const OpenAttribute plain;
  OpenAttribute collective;
  collective.isCollective = true;
  EXPECT_EQ(equalBothWays(plain, collective), "0 0");
  EXPECT_EQ(equalBothWays(collective, collective), "1 1");
}

TEST(AttributeEquality, WordOidsCompareByCase) {
  EXPECT_EQ(equalBothWays(parsed<Attribute>("=( cn-oid )"), parsed<Attribute>("=( CN-oid )")),
            "0 0");
}

struct ListCase {
  const char* rule;
  std::vector<std::string> left;
  std::vector<std::string> right;
  const char* result;
};

TEST(AttributeEquality, ListsAreComparedFromOneSideOnly) {
  const ListCase kCases[] = {
      {"Empty", {}, {}, "1 1"},
      {"EmptyAgainstOne", {}, {"a"}, "0 0"},
      {"Order", {"a", "b", "c"}, {"c", "a", "b"}, "1 1"},
      {"Case", {"a", "B"}, {"A", "b"}, "1 1"},
      {"RepeatAgainstTwo", {"a", "a"}, {"a", "b"}, "1 0"},
      {"RepeatByCaseAgainstTwo", {"a", "A"}, {"b", "A"}, "1 0"},
      {"OtherRepeats", {"a", "a", "b"}, {"a", "b", "b"}, "1 1"},
      {"Other", {"a", "b"}, {"a", "c"}, "0 0"},
      {"EmptyTextIsAMember", {"", "a"}, {"a", "b"}, "0 0"},
      {"Counts", {"a", "a"}, {"a"}, "0 0"},
      {"NoPartOfAName", {"a"}, {"ab"}, "0 0"},
  };
  for (const ListCase& row : kCases) {
    SCOPED_TRACE(row.rule);
    OpenAttribute left;
    OpenAttribute right;
    left.names = row.left;
    right.names = row.right;
    EXPECT_EQ(equalBothWays(left, right), row.result) << "names";
    left.names = right.names = {"n"};
    left.superiors = row.left;
    right.superiors = row.right;
    EXPECT_EQ(equalBothWays(left, right), row.result) << "superiors";
  }
}

// Lists of every length up to thirty, mostly equal ones, against the rule written down plainly.
TEST(AttributeEquality, ListsOfEveryLength) {
  std::mt19937 engine(20010203);
  int unequal = 0;
  for (std::size_t length = 0; length <= 30; ++length) {
    for (int turn = 0; turn < 20; ++turn) {
      OpenAttribute left;
      OpenAttribute right;
      for (std::size_t i = 0; i < length; ++i) {
        left.names.push_back((engine() % 2 == 0 ? "n" : "N") +
                             std::to_string(engine() % (length * 3)));
      }
      right.names = left.names;
      std::shuffle(right.names.begin(), right.names.end(), engine);
      for (std::string& name : right.names) {
        name[0] = engine() % 2 == 0 ? 'n' : 'N';
        if (engine() % (length * 2) == 0) {
          name = "n" + std::to_string(engine() % (length * 3));
        }
      }
      const auto isAmong = [&left](const std::string& name,
                                   const std::vector<std::string>& others) {
        return std::any_of(others.begin(), others.end(), [&](const std::string& other) {
          return left.convert(name) == left.convert(other);
        });
      };
      const auto areAmong = [&](const std::vector<std::string>& some,
                                const std::vector<std::string>& others) {
        return std::all_of(some.begin(), some.end(),
                           [&](const std::string& name) { return isAmong(name, others); });
      };
      const std::string expected = std::string(areAmong(left.names, right.names) ? "1" : "0") +
                                   (areAmong(right.names, left.names) ? " 1" : " 0");
      ASSERT_EQ(equalBothWays(left, right), expected) << bareLineOf(&left) << bareLineOf(&right);
      unequal += expected == "0 0" ? 1 : 0;
    }
  }
  EXPECT_GT(unequal, 50);
  EXPECT_LT(unequal, 500);
}

TEST(AttributeEquality, LongLists) {
  OpenAttribute left;
  OpenAttribute right;
  for (int i = 0; i < 4000; ++i) {
    left.names.push_back("Name" + std::to_string(i));
    right.names.push_back("nAME" + std::to_string(3999 - i));
  }
  left.superiors = right.names;
  right.superiors = left.names;
  EXPECT_EQ(equalBothWays(left, right), "1 1");
  left.names[0] = "name1";
  EXPECT_EQ(equalBothWays(left, right), "1 0");
  left.names[0] = "other";
  EXPECT_EQ(equalBothWays(left, right), "0 0");
  left.names[0] = "NAME0";
  left.superiors[3999] = "other";
  EXPECT_EQ(equalBothWays(left, right), "0 0");
}

TEST(AttributeTrace, ExitRecordsCarryTheResult) {
  Attribute attribute = parsed<Attribute>("=( 1.1 )");
  Attribute other;
  support::TraceRecorder recorder(support::kAllEvents);
  attribute.attrsEqual(attribute);
  attribute.attrsEqual(other);
  support::lineOf(&attribute);
  support::standardOutputOf([&] { attribute.dump(); });
  EXPECT_EQ(recorder.records(),
            (std::vector<std::string>{
                "entry 0x53010100 level 0x3200000", "exit 0x53010100 kind 33 bit 4096 code 1",
                "entry 0x53010100 level 0x3200000", "exit 0x53010100 kind 33 bit 4096 code 0",
                "entry 0x53010300 level 0x3200000", "exit 0x53010300 kind 33 bit 4096 code 0",
                "entry 0x53010400 level 0x3200000", "exit 0x53010400 kind 33 bit 4096 code 0"}));
  recorder.clear();
  attribute.getOidAndName();
  attribute.getOid();
  attribute.getFirstNameLower();
  attribute.convert("A");
  EXPECT_TRUE(recorder.records().empty());
}

}  // namespace
