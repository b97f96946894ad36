#include "ObjectClass.h"

#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <type_traits>
#include <utility>
#include <vector>

#include "Attribute.h"
#include "Outcomes.h"
#include "TraceRecorder.h"

namespace {

using definitions::bareLineOf;
using definitions::parsed;
using definitions::replaced;

const std::string kFull =
    "=( 2.5.6.6 NAME ( 'person' 'Human' ) DESC 'a Person' OBSOLETE SUP ( top $ other ) AUXILIARY "
    "MUST ( cn $ sn ) MAY ( seeAlso $ telephoneNumber $ userPassword ) )\n";

const char kFullLine[] =
    "objectclasses=( 2.5.6.6 NAME ( 'person' 'Human'  )  DESC 'a Person' OBSOLETE "
    "SUP ( top $ other ) AUXILIARY MUST ( cn $ sn ) MAY ( seeAlso $ telephoneNumber $ userPassword ) "
    ")";

static_assert(std::is_base_of_v<ORVSchema, ObjectClass>);
static_assert(!std::is_base_of_v<Attribute, ObjectClass>);
static_assert(std::is_same_v<decltype(std::declval<ObjectClass>().parse(nullptr)), bool>);

TEST(ObjectClassDump, WritesOneLine) {
  ObjectClass fresh;
  EXPECT_EQ(support::lineOf(&fresh), "objectclasses=(  NAME STRUCTURAL )\n");

  ObjectClass full = parsed<ObjectClass>(kFull);
  EXPECT_EQ(support::lineOf(&full), std::string(kFullLine) + "\n");
}

TEST(ObjectClassDump, WritesLongLists) {
  std::string read;
  std::string quoted;
  std::string joined;
  for (int i = 0; i < 3000; ++i) {
    const std::string member = i % 3 == 1 ? "" : "m" + std::to_string(i);
    read += "'" + member + "' $ ";
    quoted += "'" + member + "' ";
    joined += (i == 0 ? "" : " $ ") + member;
  }
  ObjectClass objectClass = parsed<ObjectClass>("=( NAME ( " + read + ") SUP ( " + read +
                                                ") MUST ( " + read + ") MAY ( " + read + ") )");
  EXPECT_EQ(support::lineOf(&objectClass), "objectclasses=(  NAME ( " + quoted + " ) SUP ( " +
                                               joined + " ) STRUCTURAL MUST ( " + joined +
                                               " ) MAY ( " + joined + " ) )\n");
}

TEST(ObjectClassDump, AddsToTheStreamAndFlushesIt) {
  const support::TemporaryDirectory directory;
  std::ofstream out(directory.file("lines"));
  ObjectClass objectClass = parsed<ObjectClass>("=( 1.1 ABSTRACT )");
  out << "# two\n";
  objectClass.dump(out);
  objectClass.dump(out);
  EXPECT_EQ(support::readWholeFile(directory.file("lines")),
            "# two\nobjectclasses=( 1.1 NAME ABSTRACT )\nobjectclasses=( 1.1 NAME ABSTRACT )\n");
}

TEST(ObjectClassDump, AppendLineWritesAndTracesTheSame) {
  ObjectClass objectClass = parsed<ObjectClass>(kFull);
  const support::TraceRecorder recorder(support::kAllEvents);
  std::string text = "before\n";
  objectClass.appendLine(&text);
  EXPECT_EQ(text, "before\n" + std::string(kFullLine) + "\n");
  EXPECT_EQ(recorder.records(),
            (std::vector<std::string>{"entry 0x53030300 level 0x3200000",
                                      "exit 0x53030300 kind 33 bit 4096 code 0"}));
}

TEST(ObjectClassDump, PrintsToStandardOutput) {
  ObjectClass fresh;
  EXPECT_EQ(support::standardOutputOf([&] { fresh.dump(); }),
            "\n\noid --> \nnames --> \ndescription --> \nsuperior --> \n"
            "structural type --> STRUCTURAL\nObsolete --> NO\nrequired Attrs --> \n"
            "optional Attrs --> \n\n\n");

  ObjectClass full = parsed<ObjectClass>(kFull);
  EXPECT_EQ(support::standardOutputOf([&] { full.dump(); }),
            "\n\noid --> 2.5.6.6\n"
            "names --> person Human \n"
            "description --> a Person\n"
            "superior --> top other \n"
            "structural type --> AUXILIARY\n"
            "Obsolete --> YES\n"
            "required Attrs --> cn sn \n"
            "optional Attrs --> seeAlso telephoneNumber userPassword \n"
            "\n\n");

  ObjectClass abstract = parsed<ObjectClass>("=( 1.1 ABSTRACT )");
  EXPECT_EQ(support::standardOutputOf([&] { abstract.dump(); }),
            "\n\noid --> 1.1\nnames --> \ndescription --> \nsuperior --> \n"
            "structural type --> ABSTRACT\nObsolete --> NO\nrequired Attrs --> \n"
            "optional Attrs --> \n\n\n");
}

TEST(ObjectClassDump, ReadsBackToTheSameBytes) {
  for (const std::string& text :
       {kFull, std::string("=( )"), std::string("=( 1.1 AUXILIARY )"),
        std::string("=( 1.1 ABSTRACT OBSOLETE )"), std::string("=( 1.1 SUP a )"),
        std::string("=( 1.1 NAME 'a' STRUCTURAL MUST b )"),
        std::string("=( 1.1 DESC 'x (y) $ \"z\"' )"),
        std::string("=( word NAME ( 'a' 'a' ) SUP ( objectClasses ) MAY ( attributeTypes ) )")}) {
    SCOPED_TRACE(text);
    ObjectClass first;
    support::parseText(text, &first);
    const std::string line = support::lineOf(&first);
    ObjectClass second = parsed<ObjectClass>(line.substr(std::string("objectclasses").size()));
    EXPECT_EQ(support::lineOf(&second), line);
    EXPECT_TRUE(second.objsEqual(first));
  }
}

TEST(ObjectClassMembers, GettersReturnCopies) {
  ObjectClass full = parsed<ObjectClass>(kFull);
  EXPECT_EQ(full.getOid(), "2.5.6.6");
  EXPECT_EQ(full.getDescription(), "a Person");
  EXPECT_EQ(full.getSuperior(), (std::vector<std::string>{"top", "other"}));
  EXPECT_EQ(full.getNames(), (std::vector<std::string>{"person", "Human"}));
  EXPECT_EQ(full.getReqAttrs(), (std::vector<std::string>{"cn", "sn"}));
  EXPECT_EQ(full.getOptAttrs(),
            (std::vector<std::string>{"seeAlso", "telephoneNumber", "userPassword"}));
  full.getReqAttrs().clear();
  full.getOptAttrs().clear();
  EXPECT_EQ(bareLineOf(&full), kFullLine);
}

TEST(ObjectClassMembers, Defaults) {
  ObjectClass fresh;
  EXPECT_EQ(fresh.getOid(), "");
  EXPECT_EQ(fresh.getDescription(), "");
  EXPECT_TRUE(fresh.getSuperior().empty());
  EXPECT_TRUE(fresh.getNames().empty());
  EXPECT_TRUE(fresh.getReqAttrs().empty());
  EXPECT_TRUE(fresh.getOptAttrs().empty());
}

TEST(ObjectClassMembers, FirstName) {
  ObjectClass named = parsed<ObjectClass>("=( 1.1 NAME ( 'inetOrgPerson' 'B' ) OBSOLETE )");
  EXPECT_EQ(named.getFirstName(), "inetOrgPerson");
  EXPECT_EQ(named.getFirstNameLower(), "inetorgperson");
  ObjectClass unnamed;
  EXPECT_EQ(unnamed.getFirstName(), "");
  EXPECT_EQ(unnamed.getFirstNameLower(), "");
}

TEST(ObjectClassMembers, ConvertLowersEachCharacter) {
  ObjectClass objectClass;
  EXPECT_EQ(objectClass.convert(""), "");
  EXPECT_EQ(objectClass.convert("MiXed-09_Z ['@'"), "mixed-09_z ['@'");
  EXPECT_EQ(objectClass.convert("\xC3\x84\xFF"), "\xC3\x84\xFF");
}

TEST(ObjectClassMembers, OidAndName) {
  EXPECT_EQ(ObjectClass().getOidAndName(), "OID --> \nName --> \n\n");
  EXPECT_EQ(parsed<ObjectClass>("=( 1.1 OBSOLETE )").getOidAndName(), "OID --> 1.1\nName --> \n\n");
  EXPECT_EQ(parsed<ObjectClass>("=( 1.1 NAME 'A' OBSOLETE )").getOidAndName(),
            "OID --> 1.1\nName --> A\n\n");
  EXPECT_EQ(parsed<ObjectClass>("=( 1.1 NAME ( 'A' 'b' 'C' ) OBSOLETE )").getOidAndName(),
            "OID --> 1.1\nName --> A, b, C\n\n");
}

TEST(ObjectClassMembers, CopiesAreWholeAndTheirOwn) {
  ObjectClass copy;
  {
    ObjectClass full = parsed<ObjectClass>(kFull);
    ObjectClass constructed(full);
    copy = constructed;
    EXPECT_TRUE(copy.objsEqual(full));
    full = ObjectClass();
    EXPECT_EQ(bareLineOf(&full), "objectclasses=(  NAME STRUCTURAL )");
  }
  EXPECT_EQ(bareLineOf(&copy), kFullLine);
}

TEST(ObjectClassMembers, DeletedThroughTheBaseClass) {
  class Observed : public ObjectClass {
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

// What objsEqual gives from the left to the right and back.
std::string equalBothWays(ObjectClass left, ObjectClass right) {
  return std::to_string(left.objsEqual(right) ? 1 : 0) + " " +
         std::to_string(right.objsEqual(left) ? 1 : 0);
}

struct EqualityCase {
  const char* rule;
  const char* from;  // in the full definition
  const char* to;
  const char* result;
};

TEST(ObjectClassEquality, EveryFieldCounts) {
  const EqualityCase kCases[] = {
      {"Same", " )\n", " )", "1 1"},
      {"Oid", "2.5.6.6", "2.5.6.7", "0 0"},
      {"Description", "DESC 'a Person'", "DESC 'a human'", "0 0"},
      {"DescriptionByCase", "DESC 'a Person'", "DESC 'a person'", "0 0"},
      {"Obsolete", "OBSOLETE ", "", "0 0"},
      {"Structural", "AUXILIARY", "STRUCTURAL", "0 0"},
      {"Abstract", "AUXILIARY", "ABSTRACT", "0 0"},
      {"NoKind", "AUXILIARY ", "", "0 0"},
      {"NamesByCaseAndOrder", "'person' 'Human'", "'HUMAN' 'PERSON'", "1 1"},
      {"OtherName", "'person' 'Human'", "'person' 'other'", "0 0"},
      {"NameCount", "'person' 'Human'", "'person' 'Human' 'Human'", "0 0"},
      {"SuperiorsByCaseAndOrder", "top $ other", "OTHER $ TOP", "1 1"},
      {"OtherSuperior", "top $ other", "top $ another", "0 0"},
      {"SuperiorCount", "top $ other", "top", "0 0"},
      {"MustByCaseAndOrder", "cn $ sn", "SN $ CN", "1 1"},
      {"OtherMust", "cn $ sn", "cn $ uid", "0 0"},
      {"MustCount", "cn $ sn", "cn $ sn $ sn", "0 0"},
      {"MayByCaseAndOrder", "seeAlso $ telephoneNumber", "TelephoneNumber $ seealso", "1 1"},
      {"OtherMay", "seeAlso", "uid", "0 0"},
      {"MayCount", "seeAlso $ ", "", "0 0"},
      {"MustIsNotMay", "MUST ( cn $ sn ) MAY ( seeAlso $ telephoneNumber $ userPassword )",
       "MAY ( cn $ sn ) MUST ( seeAlso $ telephoneNumber $ userPassword )", "0 0"},
  };
  for (const EqualityCase& row : kCases) {
    SCOPED_TRACE(row.rule);
    EXPECT_EQ(equalBothWays(parsed<ObjectClass>(kFull),
                            parsed<ObjectClass>(replaced(kFull, row.from, row.to))),
              row.result);
  }
  EXPECT_EQ(equalBothWays(ObjectClass(), ObjectClass()), "1 1");
}

TEST(ObjectClassEquality, OidsThatDifferInCaseDiffer) {
  EXPECT_EQ(
      equalBothWays(parsed<ObjectClass>("=( person-oid )"), parsed<ObjectClass>("=( PERSON-oid )")),
      "0 0");
}

struct ListCase {
  const char* rule;
  const char* left;
  const char* right;
  const char* result;
};

TEST(ObjectClassEquality, ListsAreComparedFromOneSideOnly) {
  const ListCase kCases[] = {
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
  for (const ListCase& row : kCases) {
    for (const std::string clause : {"NAME", "SUP", "MUST", "MAY"}) {
      SCOPED_TRACE(clause + " " + row.rule);
      const std::string head = "=( 1.1 " + clause + " ( ";
      EXPECT_EQ(equalBothWays(parsed<ObjectClass>(head + row.left + " ) OBSOLETE )"),
                              parsed<ObjectClass>(head + row.right + " ) OBSOLETE )")),
                row.result);
    }
  }
}

// "prefix0 prefix1 ...", forwards or backwards.
std::string longList(const std::string& prefix, bool isForwards) {
  std::string list;
  for (int i = 0; i < 4000; ++i) {
    list += prefix + std::to_string(isForwards ? i : 3999 - i) + " ";
  }
  return list;
}

TEST(ObjectClassEquality, LongLists) {
  for (const std::string clause : {"NAME", "SUP", "MUST", "MAY"}) {
    SCOPED_TRACE(clause);
    const std::string head = "=( 1.1 " + clause + " ( ";
    const std::string tail = ") OBSOLETE )";
    const std::string members = longList("name", true);
    ObjectClass left = parsed<ObjectClass>(head + members + tail);
    ObjectClass right = parsed<ObjectClass>(head + longList("nAME", false) + tail);
    EXPECT_EQ(equalBothWays(left, right), "1 1");
    const std::string repeats = replaced(members, "name0 ", "name1 ");
    EXPECT_EQ(equalBothWays(parsed<ObjectClass>(head + repeats + tail), right), "1 0");
    const std::string other = replaced(members, "name3999 ", "other ");
    EXPECT_EQ(equalBothWays(parsed<ObjectClass>(head + other + tail), right), "0 0");
  }
}

TEST(ObjectClassTrace, ExitRecordsCarryNoResult) {
  ObjectClass objectClass = parsed<ObjectClass>("=( 1.1 )");
  ObjectClass other;
  support::TraceRecorder recorder(support::kAllEvents);
  objectClass.objsEqual(objectClass);
  objectClass.objsEqual(other);
  support::lineOf(&objectClass);
  support::standardOutputOf([&] { objectClass.dump(); });
  EXPECT_EQ(recorder.records(),
            (std::vector<std::string>{
                "entry 0x53030100 level 0x3200000", "exit 0x53030100 kind 33 bit 4096 code 0",
                "entry 0x53030100 level 0x3200000", "exit 0x53030100 kind 33 bit 4096 code 0",
                "entry 0x53030300 level 0x3200000", "exit 0x53030300 kind 33 bit 4096 code 0",
                "entry 0x53030400 level 0x3200000", "exit 0x53030400 kind 33 bit 4096 code 0"}));
  recorder.clear();
  objectClass.getOidAndName();
  objectClass.getReqAttrs();
  objectClass.getFirstNameLower();
  objectClass.convert("A");
  EXPECT_TRUE(recorder.records().empty());
}

}  // namespace
