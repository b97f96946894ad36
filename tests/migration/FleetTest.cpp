// Plans of many installations, added up: how each stands to a definition, what is one question, and
// what becomes of a document that is no plan.

#include "Fleet.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "Decisions.h"
#include "FleetTemplate.h"

namespace migration {
namespace {

const std::string kDigest(64, 'a');
const std::string kOther(64, 'b');

std::string clause(const std::string& name, const std::string& base, const std::string& old,
                   const std::string& latest) {
  const auto value = [](const std::string& text) {
    return text.empty() ? std::string("null") : "\"" + text + "\"";
  };
  return R"({"clause": ")" + name + R"(", "base": )" + value(base) + R"(, "old": )" + value(old) +
         R"(, "new": )" + value(latest) + "}";
}

// A definition 1.NUMBER as it stands in a plan; `sides` are those that have it, as "bon".
struct Row {
  std::string number;
  std::string change = "same";
  std::string outcome = "same";
  std::string sides = "bon";
  std::string clauses{};
  std::string fingerprint = "f";
  std::string question = "null";
  std::string description = "d";  // a clause that is alike wherever it is
};

std::string textOf(const Row& row) {
  const auto place = [&](const char* side, char letter) {
    return std::string("\"") + side + "\": " +
           (row.sides.find(letter) == std::string::npos ? "null" : R"({"file": "/f", "line": 1})");
  };
  return R"({"kind": "attribute-type", "oid": "1.)" + row.number + R"(", "name": "n)" + row.number +
         R"(", "class": ")" + row.change + R"(", "outcome": ")" + row.outcome +
         R"(", "reason": "why", "notes": ["n"], "question": )" + row.question +
         R"(, "fingerprint": ")" + row.fingerprint + R"(", "clauses": [)" + row.clauses +
         R"(], "otherClauses": [{"clause": "DESC", "value": ")" + row.description +
         R"("}], "places": {)" + place("base", 'b') + ", " + place("old", 'o') + ", " +
         place("new", 'n') + "}}";
}

struct Plan {
  std::vector<Row> rows;
  bool isReady = true;
  bool hasBase = true;
  std::string latestDigest = kDigest;
  std::string refusals{};
};

// With a line for each thing that can be wrong.
std::string textOf(const Plan& plan) {
  std::string rows;
  for (const Row& row : plan.rows) {
    rows += (rows.empty() ? "" : ",\n") + textOf(row);
  }
  return "{\n\"version\": 1,\n\"program\": {\"name\": \"schema-migrate\", \"version\": \"7\"},\n"
         "\"command\": \"plan\",\n\"ready\": " +
         std::string(plan.isReady ? "true" : "false") +
         ",\n\"options\": {\"base\": " + (plan.hasBase ? "\"/base\"" : "null") +
         ",\n\"to\": \"/new\"},\n" +
         "\"inputs\": [{\"role\": \"old\", \"path\": \"/o/V3.user.at\", \"sha256\": \"" + kOther +
         "\"},\n{\"role\": \"new\", \"path\": \"/new/V3.user.at\", \"sha256\": \"" +
         plan.latestDigest + "\"}],\n\"outputs\": [],\n\"definitions\": [\n" + rows +
         "],\n\"refusals\": [" + plan.refusals + "],\n\"failures\": []\n}\n";
}

Fleet fleetOf(const std::vector<Plan>& plans, const FleetQuery& query = {}) {
  FleetReader reader(query);
  char name = 'A';
  for (const Plan& plan : plans) {
    Failures failures;
    const Source source(std::string(1, name) + ".json", textOf(plan));
    EXPECT_TRUE(reader.add(std::string(1, name++), source, &failures));
    EXPECT_TRUE(failures.empty()) << failures.front().text;
  }
  return reader.take();
}

std::string namesOf(const Fleet& fleet, const std::vector<std::size_t>& installations) {
  std::string names;
  for (const std::size_t at : installations) {
    names += fleet.installations[at].name;
  }
  return names;
}

// "n1: has 2, 1 unchanged, 1 way, 0 undecided; A changed old" a line each.
std::string toldBy(const Fleet& fleet) {
  std::string text;
  for (const FleetDefinition& one : fleet.definitions) {
    text += one.name + " " + one.oid + ": has " + std::to_string(one.has) + ", " +
            std::to_string(one.unchanged) + " unchanged, " + std::to_string(one.ways) + " ways, " +
            std::to_string(one.undecided) + " undecided";
    for (const FleetGroup& group : one.groups) {
      text += "; " + namesOf(fleet, group.installations) + " " +
              std::string(wordOf(group.standing)) + " " + group.outcome;
    }
    text += "\n";
  }
  return text;
}

// ---- How an installation stands ----

const std::string kSyntax = clause("SYNTAX", "1", "2", "1");

struct Standing1 {
  const char* name;
  bool hasBase;
  Row row;
  std::string told;
};

void PrintTo(const Standing1& row, std::ostream* out) { *out << row.name; }

const Standing1 kStandings[] = {
    {"Same", true, {"1"}, ""},
    {"ChangedBySite",
     true,
     {"1", "changed-by-site", "old", "bon", kSyntax},
     "n1 1.1: has 1, 0 unchanged, 1 ways, 0 undecided; A changed old\n"},
    {"ChangedByRelease",
     true,
     {"1", "changed-by-release", "new", "bon", clause("SYNTAX", "1", "1", "2")},
     ""},
    {"ChangedAlike",
     true,
     {"1", "same", "same", "bon", clause("SYNTAX", "1", "2", "2")},
     "n1 1.1: has 1, 0 unchanged, 1 ways, 0 undecided; A changed same\n"},
    {"InConflict",
     true,
     {"1", "changed-by-both-in-conflict", "undecided", "bon", clause("SYNTAX", "1", "2", "3")},
     "n1 1.1: has 1, 0 unchanged, 1 ways, 1 undecided; A changed undecided\n"},
    {"AddedBySite",
     true,
     {"1", "added-by-site", "added", "o"},
     "n1 1.1: has 1, 0 unchanged, 1 ways, 0 undecided; A added added\n"},
    {"AddedByRelease", true, {"1", "added-by-release", "new", "n"}, ""},
    {"AddedAlike",
     true,
     {"1", "same", "same", "on"},
     "n1 1.1: has 1, 0 unchanged, 1 ways, 0 undecided; A added same\n"},
    {"RemovedBySite",
     true,
     {"1", "removed-by-site", "new", "bn"},
     "n1 1.1: has 0, 0 unchanged, 0 ways, 0 undecided; A removed new\n"},
    {"RemovedAlike",
     true,
     {"1", "same", "gone", "b"},
     "n1 1.1: has 0, 0 unchanged, 0 ways, 0 undecided; A removed gone\n"},
    {"RemovedByRelease", true, {"1", "removed-by-release", "dropped", "bo"}, ""},
    {"RemovedByReleaseAndChanged",
     true,
     {"1", "removed-by-release", "undecided", "bo", clause("SYNTAX", "1", "2", "")},
     "n1 1.1: has 1, 0 unchanged, 1 ways, 1 undecided; A changed undecided\n"},
    {"TakenAndUnchanged",
     true,
     {"1", "taken", "undecided", "bo"},
     "n1 1.1: has 1, 1 unchanged, 0 ways, 1 undecided; A unchanged undecided\n"},
    {"RenumberedByTheSiteIsBases",
     true,
     {"1", "changed-by-site", "old", "bon", clause("OID", "1.9", "1.1", "1.9")},
     "n1 1.9: has 1, 0 unchanged, 1 ways, 0 undecided; A changed old\n"},
    {"RenamedByTheSiteIsBases",
     true,
     {"1", "changed-by-site", "old", "bon", clause("NAME", "'x'", "'n1'", "'x'")},
     "x 1.1: has 1, 0 unchanged, 1 ways, 0 undecided; A changed old\n"},
    {"WithoutBaseSame", false, {"1", "same", "same", "on"}, ""},
    {"WithoutBaseOtherwise",
     false,
     {"1", "unknown", "undecided", "on", clause("SYNTAX", "", "2", "1")},
     "n1 1.1: has 1, 0 unchanged, 1 ways, 1 undecided; A unknown undecided\n"},
    {"WithoutBaseOnlyOld",
     false,
     {"1", "unknown", "added", "o"},
     "n1 1.1: has 1, 0 unchanged, 1 ways, 0 undecided; A unknown added\n"},
    {"WithoutBaseOnlyNew", false, {"1", "unknown", "new", "n"}, ""},
};

class Standings : public testing::TestWithParam<Standing1> {};
INSTANTIATE_TEST_SUITE_P(Fleet, Standings, testing::ValuesIn(kStandings),
                         [](const auto& row) { return row.param.name; });

TEST_P(Standings, OfOneInstallation) {
  Plan plan{{GetParam().row}};
  plan.hasBase = GetParam().hasBase;
  const Fleet fleet = fleetOf({plan});
  EXPECT_EQ(GetParam().told, toldBy(fleet));
  EXPECT_EQ(1U, fleet.releases.at(0).definitions);
  EXPECT_EQ(GetParam().told.empty() ? 1U : 0U, fleet.releases.at(0).unchangedDefinitions);
}

// ---- Several installations ----

Row changed(const std::string& number, const std::string& value) {
  return {number, "changed-by-site", "old", "bon", clause("SYNTAX", "1", value, "1")};
}

TEST(Fleet, WhatIsHadAlikeIsOneWay) {
  EXPECT_EQ(
      "n1 1.1: has 5, 1 unchanged, 2 ways, 0 undecided; BCE changed old; D changed old\n"
      "n2 1.2: has 4, 4 unchanged, 0 ways, 0 undecided; A removed new\n"
      "n3 1.3: has 2, 0 unchanged, 2 ways, 0 undecided; A added added; B added added\n",
      toldBy(fleetOf({{{{"1"},
                        {"2", "removed-by-site", "new", "bn"},
                        {"3", "added-by-site", "added", "o", "", "f", "null", "mine"}}},
                      {{changed("1", "2"),
                        {"2"},
                        {"3", "added-by-site", "added", "o", "", "f", "null", "ours"}}},
                      {{changed("1", "2"), {"2"}}},
                      {{changed("1", "3"), {"2"}}},
                      {{changed("1", "2"), {"2"}}}})));
}

// The same text of OLD is one way, whichever of its clauses the plans tell as different.
TEST(Fleet, AWayIsWhatOldSays) {
  Row told = {"1", "changed-by-both-in-conflict", "undecided", "on",
              clause("OID", "", "1.1", "1.2") + "," + clause("SUP", "", "", "x")};
  Row plain = {"1", "added-by-site", "added", "o", clause("OID", "", "1.1", "")};
  EXPECT_EQ("n1 1.1: has 2, 0 unchanged, 1 ways, 1 undecided; A added undecided; B added added\n",
            toldBy(fleetOf({{{told}, false}, {{plain}}})));
}

TEST(Fleet, WhatNobodyChangedIsCountedOnly) {
  const std::vector<Plan> plans = {{{{"1"}, {"2"}, changed("3", "2")}}, {{{"1"}, {"2"}, {"3"}}}};
  const Fleet fleet = fleetOf(plans);
  EXPECT_EQ("n3 1.3: has 2, 1 unchanged, 1 ways, 0 undecided; A changed old\n", toldBy(fleet));
  EXPECT_EQ(3U, fleet.releases.at(0).definitions);
  EXPECT_EQ(2U, fleet.releases.at(0).unchangedDefinitions);
  FleetQuery all;
  all.isWithUnchanged = true;
  EXPECT_EQ(
      "n1 1.1: has 2, 2 unchanged, 0 ways, 0 undecided\n"
      "n2 1.2: has 2, 2 unchanged, 0 ways, 0 undecided\n"
      "n3 1.3: has 2, 1 unchanged, 1 ways, 0 undecided; A changed old\n",
      toldBy(fleetOf(plans, all)));
  for (const char* const name : {"N2", "1.2"}) {
    FleetQuery one;
    one.definition = name;
    EXPECT_EQ("n2 1.2: has 2, 2 unchanged, 0 ways, 0 undecided\n", toldBy(fleetOf(plans, one)));
  }
}

TEST(Fleet, WithoutBaseWhoLacksItIsNamed) {
  const auto plan = [](Row row) {
    Plan without{{std::move(row)}};
    without.hasBase = false;
    return without;
  };
  EXPECT_EQ("n1 1.1: has 2, 1 unchanged, 1 ways, 0 undecided; B unknown old; C absent new\n",
            toldBy(fleetOf({plan({"1", "same", "same", "on"}),
                            plan({"1", "unknown", "old", "on", clause("SYNTAX", "", "2", "1")}),
                            plan({"1", "unknown", "new", "n"})})));
}

TEST(Fleet, ADefinitionThatAPlanHasTwiceCountsTwice) {
  EXPECT_EQ(
      "n1 1.1: has 2, 1 unchanged, 1 ways, 0 undecided; B changed old\n"
      "n1 1.1: has 1, 0 unchanged, 1 ways, 0 undecided; B changed old\n",
      toldBy(fleetOf({{{{"1"}}}, {{changed("1", "2"), changed("1", "3")}}})));
}

TEST(Fleet, PlansOfOtherReleasesAreToldApart) {
  Plan other{{changed("1", "2")}};
  other.latestDigest = kOther;
  const Fleet fleet = fleetOf({{{changed("1", "2")}}, other, {{{"1"}}}});
  ASSERT_EQ(2U, fleet.releases.size());
  EXPECT_EQ(2U, fleet.releases[0].installations);
  EXPECT_EQ(1U, fleet.releases[1].installations);
  EXPECT_EQ(std::vector<std::string>{"NEW V3.user.at"}, fleet.releases[1].differing);
  EXPECT_EQ(1U, fleet.installations[1].release);
  EXPECT_EQ(
      "n1 1.1: has 2, 1 unchanged, 1 ways, 0 undecided; A changed old\n"
      "n1 1.1: has 1, 0 unchanged, 1 ways, 0 undecided; B changed old\n",
      toldBy(fleet));
}

// ---- Questions ----

std::string question(const std::string& takes) {
  return R"({"by": "oid", "take": [)" + takes +
         R"(], "clauses": [{"clause": "SYNTAX", "take": ["old", "new"]}], "move": false})";
}

Row open(const std::string& number, const std::string& old,
         const std::string& takes = R"("old", "new", "base")") {
  return {number,         "changed-by-both-in-conflict",   "undecided",
          "bon",          clause("SYNTAX", "1", old, "3"), "sha256:" + number + old,
          question(takes)};
}

std::string questionsOf(const Fleet& fleet) {
  std::string text;
  for (const FleetQuestion& one : fleet.questions) {
    text += one.name + " " + one.fingerprint + " at " + namesOf(fleet, one.installations) + ", " +
            std::to_string(one.readyThen) + " ready:";
    for (const std::string& take : one.takes) {
      text += " " + take;
    }
    text += "\n";
  }
  return text;
}

// Which ones settle most, and how many are ready then: worked out by hand.
TEST(Fleet, WhatSettlesMostComesFirst) {
  const Fleet fleet = fleetOf({{{open("1", "2"), open("2", "2")}, false},
                               {{open("2", "2")}, false},
                               {{open("1", "5"), open("2", "2")}, false},
                               {{{"1"}, {"2"}}},
                               {{open("2", "2")}, false, true, kDigest, "{}"}});
  EXPECT_EQ(
      "n2 sha256:22 at ABCE, 2 ready: old new base\n"
      "n1 sha256:12 at A, 3 ready: old new base\n"
      "n1 sha256:15 at C, 4 ready: old new base\n",
      questionsOf(fleet));
  EXPECT_EQ(1U, fleet.readyCount);
  EXPECT_EQ(1U, fleet.refusedCount);
  EXPECT_EQ(6U, fleet.questionCount);
}

TEST(Fleet, OnlyWhatCanBeTakenEverywhereIsOffered) {
  EXPECT_EQ("n1 sha256:12 at AB, 2 ready: new base\n",
            questionsOf(fleetOf(
                {{{open("1", "2")}, false}, {{open("1", "2", R"("new", "base")")}, false}})));
}

TEST(Fleet, WhatAnAttributeTypeSettlesIsNoQuestion) {
  Row covered = open("2", "2");
  covered.question = "null";
  const Fleet fleet = fleetOf({{{open("1", "2"), covered}, false}});
  EXPECT_EQ("n1 sha256:12 at A, 1 ready: old new base\n", questionsOf(fleet));
  EXPECT_EQ(2U, fleet.installations[0].undecided);
  EXPECT_EQ(1U, fleet.installations[0].questions);
}

// Also where definitions that are not asked for are undecided.
TEST(Fleet, ReadyIsWhatHasNoOtherQuestion) {
  FleetQuery query;
  query.definition = "n1";
  EXPECT_EQ("n1 sha256:12 at AB, 1 ready: old new base\n",
            questionsOf(fleetOf(
                {{{open("1", "2"), open("2", "2")}, false}, {{open("1", "2")}, false}}, query)));
}

TEST(FleetTemplate, HasAnEntryForEachQuestion) {
  const Fleet fleet =
      fleetOf({{{open("1", "2"), open("2", "2")}, false}, {{open("2", "2")}, false}});
  std::string text = decisionsTemplate(fleet);
  const std::string first = text.substr(text.find("[[definition]]"));
  EXPECT_EQ(
      "[[definition]]\n"
      "# attribute type n2 (1.2): why\n"
      "# At 2 of 2 installations: A, B\n"
      "# SYNTAX\n"
      "#   BASE  1\n"
      "#   OLD   2\n"
      "#   NEW   3\n"
      "# and alike wherever it is: DESC d\n"
      "kind = \"attribute-type\"\n"
      "oid = \"1.2\"\n"
      "fingerprint = \"sha256:22\"\n"
      "# take: \"old\" or \"new\" or \"base\"\n"
      "# or, clause by clause (old, new, base, of lists union):\n"
      "# clauses = { SYNTAX = \"\" }\n"
      "reason = \"\"\n",
      first.substr(0, first.find("\n\n[[") + 1));
  // Nothing is decided in it, and once something is, it can be read.
  std::vector<Decision> decisions;
  Failures failures;
  readDecisions(Source("t", text), &decisions, &failures);
  EXPECT_EQ(2U, failures.size());
  for (std::size_t at = 0; (at = text.find("# take", at)) != std::string::npos; at += 20) {
    text.insert(at, "take = \"old\"\n");
  }
  failures.clear();
  const Source filled("t", text);
  readDecisions(filled, &decisions, &failures);
  EXPECT_TRUE(failures.empty());
  EXPECT_EQ(2U, decisions.size());
}

// ---- Documents that are no plans ----

struct Malformed {
  const char* name;
  const char* from;
  const char* to;
  std::uint64_t line;
  const char* text;
};

void PrintTo(const Malformed& row, std::ostream* out) { *out << row.name; }

const Malformed kMalformed[] = {
    {"NoJson", "{\n\"version\"", "plan\n\"version\"", 1, "the JSON text is wrong or ends here"},
    {"ALineInTheMiddle", "\"to\": \"/new\"", "\"to\": /new", 7,
     "the JSON text is wrong or ends here"},
    {"TextBehindTheEnd", "\"failures\": []\n}", "\"failures\": []\n}\n}", 16,
     "the JSON text is wrong or ends here"},
    {"ANewerFormat", "\"version\": 1,", "\"version\": 2,", 2,
     "/version is 2, and this program reads version 1; it was written by another version of the "
     "program"},
    {"NoVersion", "\"version\": 1,\n", "", 14, "it has no member version"},
    {"AnotherProgram", "schema-migrate", "another", 3, "/program/name is another program"},
    {"ADocumentOfDiff", "\"plan\"", "\"diff\"", 4,
     "/command is diff, whose document need not be the whole plan"},
    {"AnotherCommand", "\"plan\"", "\"check\"", 4, "/command is no command that makes a plan"},
    {"NoFlag", "true", "1", 5, "/ready is neither true nor false"},
    {"NoPath", "\"/new\"", "[]", 7, "/options/to is no text"},
    {"NoInputs", "\"inputs\": [", "\"inputs\": {\"a\": [", 8, "/inputs is no array"},
    {"ADigestThatIsNone", "\"sha256\": \"b", "\"sha256\": 5, \"a\": \"b", 8,
     "/inputs/0/sha256 is no text"},
    {"ADefinitionThatIsNone", "\"definitions\": [\n", "\"definitions\": [\n7,", 12,
     "/definitions/0 is no object"},
    {"AKindThatIsNone", "attribute-type", "thing", 12, "/definitions/0/kind is no kind"},
    {"NoClass", "\"class\"", "\"klass\"", 12, "/definitions/0 has no member class"},
    {"ANumberForAText", "\"why\"", "3", 12, "/definitions/0/reason is no text"},
    {"NoClauses", "\"clauses\": []", "\"clauses\": {}", 12, "/definitions/0/clauses is no array"},
    {"AClauseThatIsNone", "\"clauses\": []", "\"clauses\": [1]", 12,
     "/definitions/0/clauses/0 is no object"},
    {"AValueThatIsNone", "\"value\": \"d\"", "\"value\": []", 12,
     "/definitions/0/otherClauses/0/value is no text"},
    {"APlaceThatIsNone", "\"new\": {\"file\"", "\"new\": 4, \"x\": {\"file\"", 12,
     "/definitions/0/places/new is no object"},
    {"AQuestionThatIsNone", "\"question\": null", "\"question\": true", 12,
     "/definitions/0/question is no object"},
};

class NoPlan : public testing::TestWithParam<Malformed> {};
INSTANTIATE_TEST_SUITE_P(Fleet, NoPlan, testing::ValuesIn(kMalformed),
                         [](const auto& row) { return row.param.name; });

TEST_P(NoPlan, IsToldAndCountsForNothing) {
  const std::string whole = textOf(Plan{{{"1"}}});
  std::string text = whole;
  const std::size_t at = text.find(GetParam().from);
  ASSERT_NE(std::string::npos, at);
  text.replace(at, std::string(GetParam().from).size(), GetParam().to);
  FleetReader reader({});
  Failures failures;
  EXPECT_TRUE(reader.add("good", Source("good.json", whole), &failures));
  EXPECT_FALSE(reader.add("bad", Source("bad.json", text), &failures));
  ASSERT_EQ(1U, failures.size());
  EXPECT_EQ("bad.json", failures[0].file);
  EXPECT_EQ(std::string("is no saved plan: ") + GetParam().text, failures[0].text);
  EXPECT_EQ(GetParam().line, failures[0].line);
  const Fleet fleet = reader.take();
  EXPECT_EQ(1U, fleet.installations.size());
  EXPECT_EQ(1U, fleet.releases.size());
}

// Every beginning of a document ends in a failure, not in anything else.
TEST(Fleet, APlanThatWasCutOffIsTold) {
  const std::string text = textOf(Plan{{open("1", "2"), {"2"}}});
  FleetReader reader({});
  for (std::size_t size = 0; size + 2 < text.size(); ++size) {
    Failures failures;
    EXPECT_FALSE(reader.add("cut", Source("cut.json", text.substr(0, size)), &failures)) << size;
    EXPECT_EQ(1U, failures.size());
  }
  EXPECT_TRUE(reader.take().installations.empty());
}

// A program may have sorted the members.
TEST(Fleet, TheOrderOfMembersMeansNothing) {
  std::string text = textOf(Plan{{changed("1", "2"), {"2", "same", "same", "on"}}});
  const std::size_t begin = text.find("\"definitions\"");
  const std::size_t end = text.find("\"refusals\"");
  const std::string definitions = text.substr(begin, end - begin);
  text.erase(begin, end - begin);
  text.insert(2, definitions);
  FleetReader reader({});
  Failures failures;
  ASSERT_TRUE(reader.add("A", Source("a.json", text), &failures)) << failures[0].text;
  EXPECT_EQ(
      "n1 1.1: has 1, 0 unchanged, 1 ways, 0 undecided; A changed old\n"
      "n2 1.2: has 1, 0 unchanged, 1 ways, 0 undecided; A added same\n",
      toldBy(reader.take()));
}

}  // namespace
}  // namespace migration
