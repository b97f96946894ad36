#include "ORVAttribute.h"

#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <type_traits>
#include <utility>
#include <vector>

#include "Outcomes.h"
#include "TraceRecorder.h"

namespace {

using definitions::bareLineOf;
using definitions::outcomeOf;
using definitions::parsed;
using definitions::replaced;

const std::string kFull =
    "=( 2.5.4.3 DBNAME ( 'cn' 'commonName' ) ACCESS-CLASS critical LENGTH 256 EQUALITY ORDERING "
    "SUBSTR APPROX REVERSE )\n";

const char kFullLine[] =
    "ORVAttributetypes=( 2.5.4.3 DBNAME ( 'cn' 'commonName'  ) ACCESS-CLASS critical LENGTH 256 "
    "EQUALITY ORDERING SUBSTR APPROX REVERSE )";

static_assert(std::is_base_of_v<Attribute, ORVAttribute>);
static_assert(std::is_same_v<decltype(std::declval<ORVAttribute>().parse(nullptr)), bool>);

TEST(ORVAttributeDump, WritesOneLine) {
  ORVAttribute fresh;
  EXPECT_EQ(support::lineOf(&fresh), "ORVAttributetypes=(  ACCESS-CLASS normal )\n");

  ORVAttribute full = parsed<ORVAttribute>(kFull);
  EXPECT_EQ(support::lineOf(&full), std::string(kFullLine) + "\n");
}

TEST(ORVAttributeDump, WritesLongLists) {
  std::string names;
  for (int i = 0; i < 3000; ++i) {
    names += "'" + (i % 3 == 1 ? std::string() : "m" + std::to_string(i)) + "' ";
  }
  ORVAttribute entry = parsed<ORVAttribute>("=( DBNAME ( " + names + ") )");
  EXPECT_EQ(support::lineOf(&entry),
            "ORVAttributetypes=(  DBNAME ( " + names + " ) ACCESS-CLASS normal )\n");
}

TEST(ORVAttributeDump, AddsToTheStreamAndFlushesIt) {
  const support::TemporaryDirectory directory;
  std::ofstream out(directory.file("lines"));
  ORVAttribute entry = parsed<ORVAttribute>("=( 1.1 APPROX )");
  out << "# two\n";
  entry.dump(out);
  static_cast<ORVSchema&>(entry).dump(out);
  EXPECT_EQ(support::readWholeFile(directory.file("lines")),
            "# two\nORVAttributetypes=( 1.1 ACCESS-CLASS normal APPROX )\n"
            "ORVAttributetypes=( 1.1 ACCESS-CLASS normal APPROX )\n");
}

TEST(ORVAttributeDump, AppendLineWritesAndTracesTheSame) {
  ORVAttribute entry = parsed<ORVAttribute>(kFull);
  const support::TraceRecorder recorder(support::kAllEvents);
  std::string text = "before\n";
  entry.appendLine(&text);
  EXPECT_EQ(text, "before\n" + std::string(kFullLine) + "\n");
  EXPECT_EQ(recorder.records(),
            (std::vector<std::string>{"entry 0x53020300 level 0x3200000",
                                      "exit 0x53020300 kind 33 bit 4096 code 0"}));
}

TEST(ORVAttributeDump, PrintsToStandardOutput) {
  ORVAttribute fresh;
  const char freshText[] =
      "oid --> \naccessClass --> normal\nlength --> 0\nequality --> NO\nordering --> NO\n"
      "substr --> NO\napprox --> NO\nreverse --> NO\nnames--> \n";
  EXPECT_EQ(support::standardOutputOf([&] { fresh.dump(); }), freshText);
  EXPECT_EQ(support::standardOutputOf([&] { static_cast<ORVSchema&>(fresh).dump(); }), freshText);

  ORVAttribute full = parsed<ORVAttribute>(kFull);
  EXPECT_EQ(support::standardOutputOf([&] { full.dump(); }),
            "oid --> 2.5.4.3\n"
            "accessClass --> critical\n"
            "length --> 256\n"
            "equality --> YES\n"
            "ordering --> YES\n"
            "substr --> YES\n"
            "approx --> YES\n"
            "reverse --> YES\n"
            "names--> cn commonName \n");
}

TEST(ORVAttributeDump, EachFlagHasItsLine) {
  const struct {
    const char* keyword;
    const char* lines;
  } kCases[] = {
      {"EQUALITY",
       "equality --> YES\nordering --> NO\nsubstr --> NO\napprox --> NO\nreverse --> NO\n"},
      {"ORDERING",
       "equality --> NO\nordering --> YES\nsubstr --> NO\napprox --> NO\nreverse --> NO\n"},
      {"SUBSTR",
       "equality --> NO\nordering --> NO\nsubstr --> YES\napprox --> NO\nreverse --> NO\n"},
      {"APPROX",
       "equality --> NO\nordering --> NO\nsubstr --> NO\napprox --> YES\nreverse --> NO\n"},
      {"REVERSE",
       "equality --> NO\nordering --> NO\nsubstr --> NO\napprox --> NO\nreverse --> YES\n"},
  };
  for (const auto& row : kCases) {
    SCOPED_TRACE(row.keyword);
    ORVAttribute entry = parsed<ORVAttribute>("=( 1.1 " + std::string(row.keyword) + " )");
    EXPECT_EQ(support::standardOutputOf([&] { entry.dump(); }),
              "oid --> 1.1\naccessClass --> normal\nlength --> 0\n" + std::string(row.lines) +
                  "names--> \n");
  }
}

TEST(ORVAttributeDump, ReadsBackToTheSameBytes) {
  for (const std::string& text : {kFull, std::string("=( )"), std::string("=( 1.1 LENGTH 0 )"),
                                  std::string("=( 1.1 DBNAME ( 'a' 'a' 'attributeTypes' 'b c' ) )"),
                                  std::string("=( word ACCESS-CLASS 5{6} LENGTH EQUALITY )")}) {
    SCOPED_TRACE(text);
    ORVAttribute first = parsed<ORVAttribute>(text);
    const std::string line = support::lineOf(&first);
    ORVAttribute second =
        parsed<ORVAttribute>(line.substr(std::string("ORVAttributetypes").size()));
    EXPECT_EQ(support::lineOf(&second), line);
    EXPECT_TRUE(second.orvAttrsEqual(first));
  }
}

// An empty access class writes no clause, and an entry without the clause is "normal".
TEST(ORVAttributeDump, EmptyAccessClassReadsBackAsNormal) {
  ORVAttribute first = parsed<ORVAttribute>("=( 1.1 ACCESS-CLASS '' )");
  EXPECT_EQ(bareLineOf(&first), "ORVAttributetypes=( 1.1 )");
  EXPECT_EQ(outcomeOf<ORVAttribute>("=( 1.1 )"), "1 ORVAttributetypes=( 1.1 ACCESS-CLASS normal )");
}

TEST(ORVAttributeMembers, OnlyTheOidIsInherited) {
  ORVAttribute full = parsed<ORVAttribute>(kFull);
  EXPECT_EQ(full.getOid(), "2.5.4.3");
  EXPECT_EQ(full.getDescription(), "");
  EXPECT_TRUE(full.getSuperior().empty());
  EXPECT_TRUE(full.getNames().empty());
  EXPECT_EQ(full.getFirstName(), "");
  EXPECT_EQ(full.getFirstNameLower(), "");
  const Attribute& asAttribute = full;
  Attribute attribute = asAttribute;
  EXPECT_EQ(bareLineOf(&attribute), "attributetypes=( 2.5.4.3 NAME (  ) USAGE userApplications  )");
}

TEST(ORVAttributeMembers, ConvertLowersEachCharacter) {
  ORVAttribute entry;
  EXPECT_EQ(entry.convert(""), "");
  EXPECT_EQ(entry.convert("MiXed-09_Z ['@'"), "mixed-09_z ['@'");
  EXPECT_EQ(entry.convert("\xC3\x84\xFF"), "\xC3\x84\xFF");
}

TEST(ORVAttributeMembers, OidAndNameListsTheDatabaseNames) {
  EXPECT_EQ(ORVAttribute().getOidAndName(), "OID --> \nName --> \n\n");
  EXPECT_EQ(parsed<ORVAttribute>("=( 1.1 )").getOidAndName(), "OID --> 1.1\nName --> \n\n");
  EXPECT_EQ(parsed<ORVAttribute>("=( 1.1 DBNAME 'A' REVERSE )").getOidAndName(),
            "OID --> 1.1\nName --> A\n\n");
  EXPECT_EQ(parsed<ORVAttribute>("=( 1.1 DBNAME ( 'A' 'b' 'A' ) )").getOidAndName(),
            "OID --> 1.1\nName --> A, b, A\n\n");
}

TEST(ORVAttributeMembers, CopiesAreWholeAndTheirOwn) {
  ORVAttribute copy;
  {
    ORVAttribute full = parsed<ORVAttribute>(kFull);
    ORVAttribute constructed(full);
    copy = constructed;
    EXPECT_TRUE(copy.orvAttrsEqual(full));
    EXPECT_EQ(&(full = ORVAttribute()), &full);
    EXPECT_EQ(bareLineOf(&full), "ORVAttributetypes=(  ACCESS-CLASS normal )");
  }
  EXPECT_EQ(bareLineOf(&copy), kFullLine);
}

TEST(ORVAttributeMembers, DeletedThroughTheBaseClass) {
  class Observed : public ORVAttribute {
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

// What orvAttrsEqual gives from the left to the right and back.
std::string equalBothWays(ORVAttribute left, ORVAttribute right) {
  return std::to_string(left.orvAttrsEqual(right) ? 1 : 0) + " " +
         std::to_string(right.orvAttrsEqual(left) ? 1 : 0);
}

struct EqualityCase {
  const char* rule;
  const char* from;  // in the full entry
  const char* to;
  const char* result;
};

TEST(ORVAttributeEquality, EveryFieldCounts) {
  const EqualityCase kCases[] = {
      {"Same", " )\n", " )", "1 1"},
      {"Oid", "2.5.4.3", "2.5.4.4", "0 0"},
      {"Access", "critical", "sensitive", "0 0"},
      {"AccessByCase", "critical", "Critical", "0 0"},
      {"Equality", "EQUALITY ", "", "0 0"},
      {"Ordering", "ORDERING ", "", "0 0"},
      {"Substr", "SUBSTR ", "", "0 0"},
      {"Approx", "APPROX ", "", "0 0"},
      {"Reverse", "REVERSE ", "", "0 0"},
      {"Length", "LENGTH 256", "LENGTH 255", "0 0"},
      {"LengthIsText", "LENGTH 256", "LENGTH 0256", "0 0"},
      {"NoLength", "LENGTH 256 ", "", "0 0"},
      {"NamesByCaseAndOrder", "'cn' 'commonName'", "'COMMONNAME' 'CN'", "1 1"},
      {"OtherName", "'cn' 'commonName'", "'cn' 'sn'", "0 0"},
      {"NameCount", "'cn' 'commonName'", "'cn' 'commonName' 'cn'", "0 0"},
  };
  for (const EqualityCase& row : kCases) {
    SCOPED_TRACE(row.rule);
    EXPECT_EQ(equalBothWays(parsed<ORVAttribute>(kFull),
                            parsed<ORVAttribute>(replaced(kFull, row.from, row.to))),
              row.result);
  }
  EXPECT_EQ(equalBothWays(ORVAttribute(), ORVAttribute()), "1 1");
  EXPECT_EQ(equalBothWays(parsed<ORVAttribute>("=( cn-oid )"), parsed<ORVAttribute>("=( CN-oid )")),
            "0 0");
  EXPECT_EQ(equalBothWays(parsed<ORVAttribute>("=( 1.1 )"),
                          parsed<ORVAttribute>("=( 1.1 LENGTH 0 ACCESS-CLASS normal )")),
            "1 1");
}

TEST(ORVAttributeEquality, InheritedFieldsTakeNoPart) {
  class Named : public ORVAttribute {
   public:
    Named() {
      names = {"a"};
      description = "d";
      superiors = {"s"};
      usage = "dSAOperation";
      syntax = "1.1";
      singleValue = 1013;
      isObsolete = true;
      isCollective = true;
      isUserModifiable = false;
    }
  };
  EXPECT_EQ(equalBothWays(ORVAttribute(), Named()), "1 1");
}

TEST(ORVAttributeEquality, NamesAreComparedFromOneSideOnly) {
  const struct {
    const char* rule;
    const char* left;
    const char* right;
    const char* result;
  } kCases[] = {
      {"Order", "a b c", "c a b", "1 1"},
      {"Case", "a B", "A b", "1 1"},
      {"RepeatAgainstTwo", "a a", "a b", "1 0"},
      {"RepeatByCaseAgainstTwo", "a A", "b A", "1 0"},
      {"OtherRepeats", "a a b", "a b b", "1 1"},
      {"Other", "a b", "a c", "0 0"},
      {"EmptyTextIsAMember", "'' a", "a b", "0 0"},
      {"EmptyAgainstOne", "", "a", "0 0"},
      {"Counts", "a a", "a", "0 0"},
      {"NoPartOfAName", "a", "ab", "0 0"},
  };
  for (const auto& row : kCases) {
    SCOPED_TRACE(row.rule);
    EXPECT_EQ(
        equalBothWays(parsed<ORVAttribute>("=( 1.1 DBNAME ( " + std::string(row.left) + " ) )"),
                      parsed<ORVAttribute>("=( 1.1 DBNAME ( " + std::string(row.right) + " ) )")),
        row.result);
  }
}

TEST(ORVAttributeEquality, LongLists) {
  std::string forwards;
  std::string backwards;
  for (int i = 0; i < 4000; ++i) {
    forwards += "name" + std::to_string(i) + " ";
    backwards += "nAME" + std::to_string(3999 - i) + " ";
  }
  const std::string head = "=( 1.1 DBNAME ( ";
  ORVAttribute right = parsed<ORVAttribute>(head + backwards + ") )");
  EXPECT_EQ(equalBothWays(parsed<ORVAttribute>(head + forwards + ") )"), right), "1 1");
  const std::string repeats = replaced(forwards, "name0 ", "name1 ");
  EXPECT_EQ(equalBothWays(parsed<ORVAttribute>(head + repeats + ") )"), right), "1 0");
  const std::string other = replaced(forwards, "name3999 ", "other ");
  EXPECT_EQ(equalBothWays(parsed<ORVAttribute>(head + other + ") )"), right), "0 0");
}

TEST(ORVAttributeTrace, ExitRecordsCarryNoResult) {
  ORVAttribute entry = parsed<ORVAttribute>("=( 1.1 )");
  ORVAttribute other;
  support::TraceRecorder recorder(support::kAllEvents);
  entry.orvAttrsEqual(entry);
  entry.orvAttrsEqual(other);
  support::lineOf(&entry);
  support::standardOutputOf([&] { entry.dump(); });
  EXPECT_EQ(recorder.records(),
            (std::vector<std::string>{
                "entry 0x53020200 level 0x3200000", "exit 0x53020200 kind 33 bit 4096 code 0",
                "entry 0x53020200 level 0x3200000", "exit 0x53020200 kind 33 bit 4096 code 0",
                "entry 0x53020300 level 0x3200000", "exit 0x53020300 kind 33 bit 4096 code 0",
                "entry 0x53020400 level 0x3200000", "exit 0x53020400 kind 33 bit 4096 code 0"}));
  recorder.clear();
  entry.getOidAndName();
  entry.convert("A");
  EXPECT_TRUE(recorder.records().empty());
}

}  // namespace
