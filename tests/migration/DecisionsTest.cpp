// Decisions: what a file says, and what it makes of a three-way comparison.

#include "Decisions.h"

#include <gtest/gtest.h>

#include <string>
#include <utility>
#include <vector>

#include "Installation.h"
#include "ThreeWay.h"

namespace {

using migration::Decision;
using migration::Installation;
using migration::Outcome;
using migration::ThreeWay;
using migration::ThreeWayRequest;
using migration::Verdict;

Installation installationOf(const std::string& name, const std::string& text) {
  migration::Failures failures;
  Installation installation =
      Installation::fromTexts(name, {{"V3.user.at", text}}, migration::ReadLimits(), &failures);
  EXPECT_TRUE(failures.empty());
  return installation;
}

std::string at(const std::string& rest) { return "attributetypes=( " + rest + " )\n"; }
std::string oc(const std::string& rest) { return "objectclasses=( " + rest + " )\n"; }
std::string orv(const std::string& rest) { return "ORVAttributetypes=( " + rest + " )\n"; }

std::string lineOf(const migration::Failure& failure) {
  return failure.file + ":" + std::to_string(failure.line) + ": " + failure.text + "\n";
}

// ---- Reading ----

std::string problemsOf(const std::string& toml) {
  const migration::Source source("d.toml", toml);
  std::vector<Decision> decisions;
  migration::Failures failures;
  readDecisions(source, &decisions, &failures);
  std::string text;
  for (const migration::Failure& failure : failures) {
    text += lineOf(failure);
  }
  return text;
}

TEST(DecisionsFile, EveryKeyIsRead) {
  const migration::Source source("d.toml",
                                 "# decided on Monday\n"
                                 "[[definition]]\n"
                                 "kind = \"object-class\"\n"
                                 "name = \"person\"\n"
                                 "fingerprint = \"sha256:00\"\n"
                                 "clauses = { SYNTAX = \"new\", may = \"union\" }\n"
                                 "rename = \"r\"\n"
                                 "renumber = \"1.2\"\n"
                                 "reason = \"why\"\n"
                                 "[[definition]]\n"
                                 "kind = \"vendor-extension\"\n"
                                 "oid = \"1.1\"\n"
                                 "take = \"drop\"\n");
  std::vector<Decision> decisions;
  migration::Failures failures;
  readDecisions(source, &decisions, &failures);
  ASSERT_TRUE(failures.empty()) << lineOf(failures.front());
  ASSERT_EQ(decisions.size(), 2U);
  EXPECT_EQ(decisions[0].file + ":" + std::to_string(decisions[0].line), "d.toml:2");
  EXPECT_EQ(decisions[0].kind, migration::Kind::kObjectClass);
  EXPECT_EQ(decisions[0].name + "/" + decisions[0].fingerprint + "/" + decisions[0].rename + "/" +
                decisions[0].renumber + "/" + decisions[0].reason,
            "person/sha256:00/r/1.2/why");
  EXPECT_EQ(decisions[0].clauses,
            (std::map<std::string, migration::Take>{{"SYNTAX", migration::Take::kNew},
                                                    {"MAY", migration::Take::kUnion}}));
  EXPECT_EQ(decisions[1].kind, migration::Kind::kVendorExtension);
  EXPECT_EQ(decisions[1].oid, "1.1");
  EXPECT_EQ(decisions[1].take, migration::Take::kDrop);
}

TEST(DecisionsFile, WhatIsMalformedIsToldWithItsLine) {
  const std::string entry = "[[definition]]\nkind = \"object-class\"\noid = \"1\"\n";
  const struct {
    const char* rule;
    std::string toml;
    std::string problems;
  } cases[] = {
      {"NoToml", "x = \n",
       "d.toml:1: is not TOML: Error while parsing value: encountered "
       "end-of-line"},
      {"OtherTable", "[decision]\n",
       "d.toml:1: \"decision\" does not belong here; a decisions file has a [[definition]] for each "
       "decision\n"},
      {"OtherKey", entry + "take = \"new\"\ntook = \"x\"\n",
       "d.toml:5: \"took\" is no key of a decision; the keys are kind, oid, name, fingerprint, "
       "take, text, clauses, rename, renumber and reason\n"},
      {"NoText", entry + "take = 5\n", "d.toml:4: \"take\" must be a text in quotes\n"},
      {"EmptyText", entry + "text = \"\"\n",
       "d.toml:4: \"text\" is empty; give it a value or leave it out\n"},
      {"OtherTake", entry + "take = \"mine\"\n",
       "d.toml:4: \"mine\" cannot be taken; write old, new, base, merged or drop\n"},
      {"OtherKind", "[[definition]]\nkind = \"class\"\noid = \"1\"\ntake = \"new\"\n",
       "d.toml:2: \"class\" is no kind; write attribute-type, object-class or vendor-extension\n"},
      {"NoName", "[[definition]]\nkind = \"object-class\"\ntake = \"new\"\n",
       "d.toml:1: a decision names its definition by \"kind\" and by either \"oid\" or \"name\"\n"},
      {"TwoNames", entry + "name = \"a\"\ntake = \"new\"\n",
       "d.toml:1: a decision names its definition by \"kind\" and by either \"oid\" or \"name\"\n"},
      {"TwoWays", entry + "take = \"new\"\ntext = \"( 1 )\"\n",
       "d.toml:1: \"take\", \"text\" and \"clauses\" exclude each other; keep one of them\n"},
      {"NoWay", entry,
       "d.toml:1: nothing is decided; give \"take\", \"text\", \"clauses\", \"rename\" or "
       "\"renumber\"\n"},
      {"NoClauses", entry + "clauses = \"all\"\n",
       "d.toml:4: \"clauses\" must be a table, as in { SYNTAX = \"new\", MAY = \"union\" }\n"},
      {"OtherClauseTake", entry + "clauses = { MAY = \"drop\" }\n",
       "d.toml:4: a clause is taken from \"old\", \"new\", \"base\" or \"union\"\n"},
  };
  for (const auto& row : cases) {
    SCOPED_TRACE(row.rule);
    const std::string problems = problemsOf(row.toml);
    if (std::string(row.rule) == "NoToml") {
      EXPECT_EQ(problems.substr(0, 23), "d.toml:1: is not TOML: ") << problems;
      continue;
    }
    EXPECT_EQ(problems, row.problems);
  }
}

// ---- Carrying out ----

struct Inputs {
  std::string base;
  std::string old;
  std::string latest;
};

const Inputs kConflict = {oc("2.1 NAME 'c' SUP p ABSTRACT MAY ( x )"),
                          oc("2.1 NAME 'c' SUP q ABSTRACT MAY ( x $ s )"),
                          oc("2.1 NAME 'c' SUP r ABSTRACT MAY ( x $ n )")};

// The definitions that are not the same, with what is wrong.
std::string decided(const Inputs& inputs, const std::string& toml, bool allowUnused = false,
                    migration::Prefer prefer = migration::Prefer::kNothing) {
  const Installation base = installationOf("BASE", inputs.base);
  const Installation old = installationOf("OLD", inputs.old);
  const Installation latest = installationOf("NEW", inputs.latest);
  ThreeWayRequest request;
  request.base = &base;
  request.old = &old;
  request.latest = &latest;
  request.allowUnused = allowUnused;
  request.prefer = prefer;
  const migration::Source source("d.toml", toml);
  migration::Failures malformed;
  readDecisions(source, &request.decisions, &malformed);
  EXPECT_TRUE(malformed.empty()) << lineOf(malformed.front());
  const ThreeWay result = compareThreeWay(request);
  std::string text;
  for (const Verdict& row : result.differences) {
    if (row.outcome != Outcome::kSame) {
      text += describe(row) + " -> " + std::string(wordOf(row.outcome)) +
              (row.decision.empty() ? "" : " by " + row.decision) +
              (row.isTakenOut ? ", taken out" : "") +
              (row.result ? " " + migration::textOf(*row.result) : "") + "\n";
    }
  }
  for (const migration::Failure& failure : result.failures) {
    text += lineOf(failure);
  }
  return text;
}

std::string about(const char* kind, const char* name, const std::string& rest) {
  return std::string("[[definition]]\nkind = \"") + kind + "\"\nname = \"" + name + "\"\n" + rest +
         "\n";
}

struct Case {
  const char* rule;
  Inputs inputs;
  std::string toml;
  std::string outcome;
};

void expectDecided(const std::vector<Case>& cases) {
  for (const Case& row : cases) {
    SCOPED_TRACE(row.rule);
    EXPECT_EQ(decided(row.inputs, row.toml), row.outcome);
  }
}

TEST(Decisions, WhatIsTaken) {
  const auto take = [](const char* whose) {
    return about("object-class", "C", std::string("take = \"") + whose + "\"");
  };
  expectDecided({
      {"Nothing", kConflict, "", "object class c (2.1) -> undecided\n"},
      {"Old", kConflict, take("old"),
       "object class c (2.1) -> old by d.toml:1 ( 2.1 NAME ( 'c' ) SUP ( q ) ABSTRACT MAY ( x $ s ) "
       ")\n"},
      {"New", kConflict, take("new"), "object class c (2.1) -> new by d.toml:1\n"},
      {"Base", kConflict, take("base"),
       "object class c (2.1) -> text by d.toml:1 ( 2.1 NAME ( 'c' ) SUP ( p ) ABSTRACT MAY ( x ) "
       ")\n"},
      {"MergedIsTheUnionOfLists", kConflict, take("merged"),
       "object class c (2.1) -> merged by d.toml:1 ( 2.1 NAME ( 'c' ) SUP ( r $ q ) ABSTRACT MAY ( "
       "x $ n $ s ) )\n"},
      {"Drop", kConflict, take("drop"), "object class c (2.1) -> dropped by d.toml:1, taken out\n"},
      {"Text", kConflict,
       about("object-class", "c", "text = \"( 2.1 NAME 'c' AUXILIARY MAY ( x ) )\""),
       "object class c (2.1) -> text by d.toml:1 ( 2.1 NAME ( 'c' ) AUXILIARY MAY ( x ) )\n"},
      {"Clauses", kConflict, about("object-class", "c", "clauses = { SUP = \"new\" }"),
       "object class c (2.1) -> merged by d.toml:1 ( 2.1 NAME ( 'c' ) SUP ( r ) ABSTRACT MAY ( x $ "
       "n $ s ) )\n"},
      {"OneOfTheMatchingRulesForAll",
       {at("1.1 NAME 'a' EQUALITY e SYNTAX 1.2"), at("1.1 NAME 'a' EQUALITY f SYNTAX 1.2"),
        at("1.1 NAME 'a' EQUALITY e SYNTAX 1.3")},
       about("attribute-type", "a", "clauses = { EQUALITY = \"new\" }"),
       "attribute type a (1.1) -> new by d.toml:1\n"},
      {"TheMatchingRulesByAnotherOfThem",
       {at("1.1 NAME 'a' EQUALITY e SYNTAX 1.2"), at("1.1 NAME 'a' EQUALITY f SYNTAX 1.2"),
        at("1.1 NAME 'a' EQUALITY e SYNTAX 1.3")},
       about("attribute-type", "a", "clauses = { ORDERING = \"old\" }"),
       "attribute type a (1.1) -> old by d.toml:1 ( 1.1 NAME ( 'a' ) EQUALITY f SYNTAX 1.2 USAGE "
       "userApplications )\n"},
      {"ClausesByUnion", kConflict, about("object-class", "c", "clauses = { SUP = \"union\" }"),
       "object class c (2.1) -> merged by d.toml:1 ( 2.1 NAME ( 'c' ) SUP ( r $ q ) ABSTRACT MAY ( "
       "x $ n $ s ) )\n"},
      {"AnyDefinition",
       {at("1.1 NAME 'a' USAGE u"), at("1.1 NAME 'a' USAGE u"), at("1.1 NAME 'a' USAGE v")},
       about("attribute-type", "a", "take = \"old\""),
       "attribute type a (1.1) -> old by d.toml:1 ( 1.1 NAME ( 'a' ) USAGE u )\n"},
      {"WhatTheReleaseRemoved",
       {at("1.1 NAME 'a' USAGE u"), at("1.1 NAME 'a' USAGE v"), ""},
       about("attribute-type", "a", "take = \"new\""),
       "attribute type a (1.1) -> dropped by d.toml:1\n"},
  });
}

TEST(Decisions, WhatCannotBeCarriedOut) {
  const std::string undecided = "object class c (2.1) -> undecided\n";
  const std::string cannot =
      "d.toml:1: the decision about object class c (2.1) cannot be carried "
      "out: ";
  const Inputs kinds = {oc("2.1 NAME 'c' ABSTRACT"), oc("2.1 NAME 'c' STRUCTURAL"),
                        oc("2.1 NAME 'c' AUXILIARY")};
  const Inputs superiors = {at("1.1 NAME 'a' SUP p"), at("1.1 NAME 'a' SUP q"),
                            at("1.1 NAME 'a' SUP r")};
  const std::string cannotForType =
      "d.toml:1: the decision about attribute type a (1.1) cannot be carried out: ";
  expectDecided({
      {"NoDefinition", kConflict, about("object-class", "d", "take = \"old\""),
       undecided + "d.toml:1: it matches no definition of BASE, OLD or NEW; remove it, or allow "
                   "entries that match nothing\n"},
      {"OtherKind", kConflict, about("attribute-type", "c", "take = \"old\""),
       undecided + "d.toml:1: it matches no definition of BASE, OLD or NEW; remove it, or allow "
                   "entries that match nothing\n"},
      {"Stale", kConflict, about("object-class", "c", "take = \"old\"\nfingerprint = \"sha256:1\""),
       undecided + "d.toml:1: the decision about object class c (2.1) is stale: the definition has "
                   "changed since it was made; look at it again, and make it anew\n"},
      {"Contradiction", kConflict,
       about("object-class", "c", "take = \"new\"") + about("object-class", "c", "take = \"old\""),
       "object class c (2.1) -> new by d.toml:1\n"
       "d.toml:5: the decision about object class c (2.1) contradicts the one at d.toml:1; keep one "
       "of them\n"},
      {"NoSuchClause", kConflict, about("object-class", "c", "clauses = { SYNTAX = \"new\" }"),
       undecided + cannot + "SYNTAX is no clause of an object class\n"},
      {"TwoOfTheMatchingRulesFromTwoSides",
       {at("1.1 NAME 'a' EQUALITY e SYNTAX 1.2"), at("1.1 NAME 'a' EQUALITY f SYNTAX 1.2"),
        at("1.1 NAME 'a' EQUALITY e SYNTAX 1.3")},
       about("attribute-type", "a", "clauses = { EQUALITY = \"old\", SYNTAX = \"new\" }"),
       "attribute type a (1.1) -> undecided\n" + cannotForType +
           "EQUALITY, ORDERING, SUBSTR and SYNTAX go together, and are to be taken from two "
           "sides\n"},
      {"NoUnionOfAKind", kinds, about("object-class", "c", "clauses = { KIND = \"union\" }"),
       undecided + cannot + "KIND is no list, and has no union\n"},
      {"NoUnionOfTheOneSuperiorOfAnAttributeType", superiors,
       about("attribute-type", "a", "clauses = { SUP = \"union\" }"),
       "attribute type a (1.1) -> undecided\n" + cannotForType +
           "SUP is no list, and has no union\n"},
      {"NoMergeOfTheOneSuperiorOfAnAttributeType", superiors,
       about("attribute-type", "a", "take = \"merged\""),
       "attribute type a (1.1) -> undecided\n" + cannotForType +
           "it cannot be merged: SUP was changed in two ways; decide it by \"clauses\"\n"},
      {"AClauseIsLeft", kConflict, about("object-class", "c", "clauses = { MAY = \"new\" }"),
       undecided + cannot + "it leaves undecided: SUP\n"},
      {"NotMergeable", kinds, about("object-class", "c", "take = \"merged\""),
       undecided + cannot +
           "it cannot be merged: KIND was changed in two ways; decide it by "
           "\"clauses\"\n"},
      {"NoDefinitionInTheText", kConflict, about("object-class", "c", "text = \"( 2.1 NAME\""),
       undecided + cannot +
           "its text: the definition that begins here is not closed, so that it "
           "gets lost, or what stands behind it is taken for a part of it; write "
           "its \")\" [D204]\n"},
      {"BaseOfAClauseWithoutBase",
       {"", kConflict.old, kConflict.latest},
       about("object-class", "c", "clauses = { SUP = \"base\" }"),
       undecided + cannot + "BASE does not have it\n"},
      {"TextOfTwo", kConflict,
       about("object-class", "c", "text = \"( 1 ABSTRACT ) objectclasses=( 2 ABSTRACT )\""),
       undecided + cannot +
           "its text is not one whole object class from \"(\" to \")\" that the "
           "server's reader takes\n"},
      {"NoBase",
       {"", kConflict.old, kConflict.latest},
       about("object-class", "c", "take = \"base\""),
       undecided + cannot + "BASE does not have it\n"},
  });
  EXPECT_EQ(decided(kConflict, about("object-class", "d", "take = \"old\""), true), undecided);
}

// What a careless decision must not do.
TEST(Decisions, NothingButWhatTheyNameIsChanged) {
  const Inputs type = {at("1.1 NAME 'a' USAGE u"), at("1.1 NAME 'a' USAGE site"),
                       at("1.1 NAME 'a' SINGLE-VALUE USAGE u")};
  expectDecided({
      {"MergedKeepsWhatOnlyOneSideChanged", type, about("attribute-type", "a", "take = 'merged'"),
       "attribute type a (1.1) -> merged by d.toml:1 ( 1.1 NAME ( 'a' ) SINGLE-VALUE USAGE site )\n"},
      {"BaseOfWhatBothRemoved",
       {at("1.1 NAME 'a' USAGE u"), "", ""},
       about("attribute-type", "a", "take = 'base'"),
       "attribute type a (1.1) -> text by d.toml:1 ( 1.1 NAME ( 'a' ) USAGE u )\n"},
      {"DropTakesTheExtensionAlong",
       {at("1.1 NAME 'a' USAGE u") + orv("1.1 DBNAME ( 'a' )"),
        at("1.1 NAME 'a' USAGE u") + orv("1.1 DBNAME ( 'a' )"),
        at("1.1 NAME 'a' USAGE u") + orv("1.1 DBNAME ( 'a' )")},
       about("attribute-type", "a", "take = 'drop'"),
       "attribute type a (1.1) -> dropped by d.toml:1, taken out\n"
       "vendor extension 1.1 -> dropped by d.toml:1, taken out\n"},
      {"WhatAPersonDropsIsNotKept",
       {"", at("9.1 NAME 'badge' USAGE u") + oc("9.2 NAME 'guard' ABSTRACT MAY ( badge )"), ""},
       about("attribute-type", "badge", "take = 'drop'"),
       "attribute type badge (9.1) -> dropped by d.toml:1, taken out\n"
       "object class guard (9.2) -> added ( 9.2 NAME ( 'guard' ) ABSTRACT MAY ( badge ) )\n"},
      {"RenumberLeavesNewsDefinition",
       {"", at("1.9 NAME 'mine' USAGE u"),
        at("1.9 NAME 'theirs' USAGE u") + orv("1.9 DBNAME ( 't' )")},
       about("attribute-type", "mine", "renumber = '1.60'"),
       "attribute type theirs (1.9) -> new\n"
       "vendor extension 1.9 -> new\n"
       "attribute type mine (1.9) -> added by d.toml:1 ( 1.60 NAME ( 'mine' ) USAGE u )\n"},
      {"TwoNamesAreSwapped",
       {"",
        at("9.1 NAME 'a' USAGE u") + at("9.2 NAME 'b' USAGE u") +
            oc("9.3 NAME 'g' ABSTRACT MUST ( a ) MAY ( b )"),
        ""},
       about("attribute-type", "a", "rename = 'b'") + about("attribute-type", "b", "rename = 'a'"),
       "attribute type a (9.1) -> added by d.toml:1 ( 9.1 NAME ( 'b' ) USAGE u )\n"
       "attribute type b (9.2) -> added by d.toml:5 ( 9.2 NAME ( 'a' ) USAGE u )\n"
       "object class g (9.3) -> added ( 9.3 NAME ( 'g' ) ABSTRACT MUST ( b ) MAY ( a ) )\n"},
      {"AnotherEntryMeansTheSitesOwn",
       {"", at("9.1 NAME 'badge' USAGE u"), at("1.5 NAME 'badge' USAGE v")},
       "[[definition]]\nkind='attribute-type'\noid='9.1'\nrename='siteBadge'\n"
       "[[definition]]\nkind='attribute-type'\noid='1.5'\ntake='new'\n",
       "attribute type badge (1.5) -> new by d.toml:5\n"
       "attribute type badge (9.1) -> added by d.toml:1 ( 9.1 NAME ( 'siteBadge' ) USAGE u )\n"},
      {"ADbNameThatNewHas",
       {"", at("9.1 NAME 'badge' USAGE u") + orv("9.1 DBNAME ( 'c' )"),
        at("1.5 NAME 'x' USAGE v") + orv("1.5 DBNAME ( 'c' )")},
       "[[definition]]\nkind='vendor-extension'\noid='9.1'\ntake='old'\n",
       "attribute type x (1.5) -> new\n"
       "attribute type badge (9.1) -> added ( 9.1 NAME ( 'badge' ) USAGE u )\n"
       "vendor extension 1.5 -> new\n"
       "vendor extension 9.1 -> added by d.toml:1 ( 9.1 DBNAME ( 'c' ) ACCESS-CLASS normal )\n"
       "d.toml:1: the decision about vendor extension 9.1 cannot be carried out: its DBNAME 'c' would "
       "also be that of vendor extension 1.5; rename or renumber it, or take NEW's\n"},
  });
  for (const char* const rubbish :
       {"( 1.1 NAME 'a' USAGE u ) garbage", "( 1.1 NAME 'a' X-ORIGIN 'me' )",
        "( 1.1 NAME 'a' USAGE u ) ( 1.2 NAME 'b' USAGE u )"}) {
    const std::string outcome =
        decided(type, about("attribute-type", "a", std::string("text = \"") + rubbish + "\""));
    EXPECT_NE(outcome.find("cannot be carried out: its text"), std::string::npos) << outcome;
  }
}

TEST(DecisionsFile, NamesAndOidsAreLookedAt) {
  const std::string entry = "[[definition]]\nkind = \"object-class\"\noid = \"1\"\n";
  EXPECT_EQ(
      problemsOf(entry + "rename = \"b c' ) X\"\n"),
      "d.toml:4: \"b c' ) X\" is no name; a name begins with a letter, and letters, digits and "
      "\"-\" follow\n");
  EXPECT_EQ(problemsOf(entry + "renumber = \"x\"\n"),
            "d.toml:4: \"x\" is no OID; write numbers with dots in between\n");
}

TEST(Decisions, AStaleFingerprintIsThatOfOtherTexts) {
  const Installation base = installationOf("BASE", kConflict.base);
  const Installation old = installationOf("OLD", "# moved\n\n" + kConflict.old);
  const Installation latest = installationOf("NEW", kConflict.latest);
  ThreeWayRequest request;
  request.base = &base;
  request.old = &old;
  request.latest = &latest;
  const ThreeWay result = compareThreeWay(request);
  const std::string fingerprint = fingerprintOf(result.differences.front());
  EXPECT_EQ(fingerprint.substr(0, 7), "sha256:");
  EXPECT_EQ(decided(kConflict, about("object-class", "c",
                                     "take = \"new\"\nfingerprint = \"" + fingerprint + "\"")),
            "object class c (2.1) -> new by d.toml:1\n");
}

// A file that serves many installations has an entry for each way in which they have a definition.
TEST(Decisions, OfTwoForOneDefinitionTheOneForItsTextsHolds) {
  const Installation base = installationOf("BASE", kConflict.base);
  const Installation old = installationOf("OLD", kConflict.old);
  const Installation latest = installationOf("NEW", kConflict.latest);
  ThreeWayRequest request;
  request.base = &base;
  request.old = &old;
  request.latest = &latest;
  const std::string fingerprint = fingerprintOf(compareThreeWay(request).differences.front());
  const std::string ours =
      about("object-class", "c", "take = \"new\"\nfingerprint = \"" + fingerprint + "\"");
  const std::string theirs =
      about("object-class", "c", "take = \"old\"\nfingerprint = \"sha256:1\"");
  EXPECT_EQ(decided(kConflict, theirs + ours, true), "object class c (2.1) -> new by d.toml:6\n");
  EXPECT_EQ(decided(kConflict, ours + theirs, true), "object class c (2.1) -> new by d.toml:1\n");
  EXPECT_EQ(decided(kConflict, theirs, true), "object class c (2.1) -> undecided\n");
  EXPECT_EQ(decided(kConflict, theirs + ours),
            "object class c (2.1) -> undecided\n"
            "d.toml:1: the decision about object class c (2.1) is stale: the definition has "
            "changed since it was made; look at it again, and make it anew\n"
            "d.toml:6: the decision about object class c (2.1) contradicts the one at d.toml:1; "
            "keep one of them\n");
}

TEST(Decisions, ThatAreForOtherTextsAreNoted) {
  const Installation old = installationOf("OLD", at("1.1 NAME 'a' USAGE u"));
  const Installation latest = installationOf("NEW", at("1.1 NAME 'a' USAGE v"));
  ThreeWayRequest request;
  request.old = &old;
  request.latest = &latest;
  request.allowUnused = true;
  const auto notesWith = [&](const std::string& toml) {
    const migration::Source source("d.toml", toml);
    migration::Failures malformed;
    request.decisions.clear();
    readDecisions(source, &request.decisions, &malformed);
    EXPECT_TRUE(malformed.empty());
    const ThreeWay result = compareThreeWay(request);
    std::string notes;
    for (const std::string& note : result.differences.front().notes) {
      notes += note + "\n";
    }
    return notes;
  };
  const std::string other =
      about("attribute-type", "a", "take = \"old\"\nfingerprint = \"sha256:1\"");
  EXPECT_EQ("a decision about it, made for other texts than these, is not used: d.toml:1\n",
            notesWith(other));
  EXPECT_EQ(
      "2 decisions about it, made for other texts than these, are not used; the first: d.toml:1\n",
      notesWith(other + other));
  EXPECT_EQ("", notesWith(other + about("attribute-type", "a", "take = \"old\"")));
}

const Inputs kTaken = {"",
                       at("9.1 NAME 'badge' USAGE u") + orv("9.1 DBNAME ( 'b' )") +
                           at("9.2 NAME 'sub' SUP badge USAGE u") +
                           oc("9.3 NAME 'guard' ABSTRACT MUST ( Badge ) MAY ( sub )"),
                       at("1.5 NAME ( 'x' 'badge' ) USAGE v")};

TEST(Decisions, RenameTakesEveryReferenceAlong) {
  EXPECT_EQ(
      decided(kTaken, about("attribute-type", "badge", "rename = 'siteBadge'")),
      "attribute type x (1.5) -> new\n"
      "attribute type badge (9.1) -> added by d.toml:1 ( 9.1 NAME ( 'siteBadge' ) USAGE u )\n"
      "attribute type sub (9.2) -> added ( 9.2 NAME ( 'sub' ) SUP siteBadge USAGE u )\n"
      "object class guard (9.3) -> added ( 9.3 NAME ( 'guard' ) ABSTRACT MUST ( siteBadge ) "
      "MAY ( sub ) )\n"
      "vendor extension 9.1 -> added by d.toml:1 ( 9.1 DBNAME ( 'b' ) ACCESS-CLASS normal )\n");
}

TEST(Decisions, RenumberTakesReferencesAndTheExtensionAlong) {
  const Inputs inputs = {"",
                         at("9.1 NAME 'badge' USAGE u") + orv("9.1 DBNAME ( 'b' )") +
                             at("9.2 NAME 'sub' SUP 9.1 USAGE u"),
                         ""};
  EXPECT_EQ(
      decided(inputs, about("attribute-type", "badge", "renumber = '9.9'")),
      "attribute type badge (9.1) -> added by d.toml:1 ( 9.9 NAME ( 'badge' ) USAGE u )\n"
      "attribute type sub (9.2) -> added ( 9.2 NAME ( 'sub' ) SUP 9.9 USAGE u )\n"
      "vendor extension 9.1 -> added by d.toml:1 ( 9.9 DBNAME ( 'b' ) ACCESS-CLASS normal )\n");
}

TEST(Decisions, ATakenNameThatIsNotGivenUpIsRefused) {
  EXPECT_EQ(decided(kTaken, about("attribute-type", "badge", "take = 'old'")),
            "attribute type x (1.5) -> new\n"
            "attribute type badge (9.1) -> added by d.toml:1 ( 9.1 NAME ( 'badge' ) USAGE u )\n"
            "attribute type sub (9.2) -> added ( 9.2 NAME ( 'sub' ) SUP badge USAGE u )\n"
            "object class guard (9.3) -> added ( 9.3 NAME ( 'guard' ) ABSTRACT MUST ( Badge ) "
            "MAY ( sub ) )\n"
            "vendor extension 9.1 -> added by d.toml:1 ( 9.1 DBNAME ( 'b' ) ACCESS-CLASS normal )\n"
            "d.toml:1: the decision about attribute type badge (9.1) cannot be carried out: its "
            "name 'badge' would also be that of attribute type x (1.5); rename or renumber it, or "
            "take NEW's\n");
}

TEST(Decisions, WhatSharesOnlyTheNameIsRenamedBesideNews) {
  const Inputs renumbered = {"", kTaken.old,
                             at("1.5 NAME 'badge' USAGE v") + orv("1.5 DBNAME ( 'n' )")};
  EXPECT_EQ(
      decided(renumbered, about("attribute-type", "badge", "rename = 'siteBadge'")),
      "attribute type badge (1.5) -> new\n"
      "attribute type sub (9.2) -> added ( 9.2 NAME ( 'sub' ) SUP siteBadge USAGE u )\n"
      "object class guard (9.3) -> added ( 9.3 NAME ( 'guard' ) ABSTRACT MUST ( siteBadge ) "
      "MAY ( sub ) )\n"
      "vendor extension 1.5 -> new\n"
      "attribute type badge (9.1) -> added by d.toml:1 ( 9.1 NAME ( 'siteBadge' ) USAGE u )\n"
      "vendor extension 9.1 -> added by d.toml:1 ( 9.1 DBNAME ( 'b' ) ACCESS-CLASS normal )\n");
}

TEST(Decisions, TheFingerprintOfWhatIsRenamedBesideNewsIsThatOfBoth) {
  const Inputs renumbered = {"", kTaken.old,
                             at("1.5 NAME 'badge' USAGE u") + at("1.6 NAME 'y' USAGE u")};
  const Installation old = installationOf("OLD", renumbered.old);
  const Installation latest = installationOf("NEW", renumbered.latest);
  ThreeWayRequest request;
  request.old = &old;
  request.latest = &latest;
  const ThreeWay plain = compareThreeWay(request);
  const std::string fingerprint = fingerprintOf(plain.differences.front());
  ASSERT_EQ(describe(plain.differences.front()), "attribute type badge (9.1)");
  const std::string outcome =
      decided(renumbered, about("attribute-type", "badge",
                                "rename = 'siteBadge'\nfingerprint = '" + fingerprint + "'"));
  EXPECT_EQ(outcome, decided(renumbered, about("attribute-type", "badge", "rename = 'siteBadge'")));
  EXPECT_EQ(outcome.find("d.toml:1: "), std::string::npos) << outcome;
}

TEST(Decisions, AFingerprintCoversTheExtensionThatGoesWithTheAttributeType) {
  const auto fingerprint = [](const Inputs& inputs) {
    const Installation base = installationOf("BASE", inputs.base);
    const Installation old = installationOf("OLD", inputs.old);
    const Installation latest = installationOf("NEW", inputs.latest);
    ThreeWayRequest request;
    request.base = &base;
    request.old = &old;
    request.latest = &latest;
    return fingerprintOf(compareThreeWay(request).differences.front());
  };
  const std::string type = at("9.1 NAME 'badge' USAGE u");
  const std::string first = orv("9.1 DBNAME ( 'b' )");
  const std::string other = orv("9.1 DBNAME ( 'c' )");
  EXPECT_NE(fingerprint({"", type + first, ""}), fingerprint({"", type + other, ""}));
  EXPECT_EQ(fingerprint({"", type + first, type + first}),
            fingerprint({"", type + other, type + first}));
}

// A decision made for what is split then is no less fresh.
TEST(Decisions, RenameBesideNewsTakesItsFingerprint) {
  const Inputs inputs = {"", at("9.1 NAME 'badge' USAGE u"), at("1.5 NAME 'badge' USAGE v")};
  const Installation base = installationOf("BASE", inputs.base);
  const Installation old = installationOf("OLD", inputs.old);
  const Installation latest = installationOf("NEW", inputs.latest);
  ThreeWayRequest request;
  request.base = &base;
  request.old = &old;
  request.latest = &latest;
  const std::string fingerprint = fingerprintOf(compareThreeWay(request).differences.front());
  EXPECT_EQ(decided(inputs, about("attribute-type", "badge",
                                  "rename = 'mine'\nfingerprint = '" + fingerprint + "'")),
            "attribute type badge (1.5) -> new\n"
            "attribute type badge (9.1) -> added by d.toml:1 ( 9.1 NAME ( 'mine' ) USAGE u )\n");
}

TEST(Decisions, WhatClausesDoNotNameIsDecidedByThePreference) {
  const Inputs inputs = {at("1.1 NAME 'a' SUP p SYNTAX 1.2 USAGE u"),
                         at("1.1 NAME 'a' SUP q SYNTAX 1.3 USAGE u"),
                         at("1.1 NAME 'a' SUP r SYNTAX 1.4 USAGE u")};
  const std::string toml = about("attribute-type", "a", "clauses = { SUP = 'new' }");
  EXPECT_EQ(decided(inputs, toml),
            "attribute type a (1.1) -> undecided\n"
            "d.toml:1: the decision about attribute type a (1.1) cannot be carried out: it leaves "
            "undecided: SYNTAX\n");
  EXPECT_EQ(decided(inputs, toml, false, migration::Prefer::kOld),
            "attribute type a (1.1) -> merged by d.toml:1 ( 1.1 NAME ( 'a' ) SUP r SYNTAX 1.3 "
            "USAGE u )\n");
}

TEST(Decisions, ARenameGivesUpTheAliasThatIsTaken) {
  const Inputs inputs = {"",
                         at("9.1 NAME ( 'mine' 'badge' 'other' ) USAGE u") +
                             oc("9.3 NAME 'guard' ABSTRACT MUST ( badge ) MAY ( other )"),
                         at("1.5 NAME 'badge' USAGE v")};
  EXPECT_EQ(decided(inputs, about("attribute-type", "mine", "rename = 'mine'")),
            "attribute type badge (1.5) -> new\n"
            "attribute type mine (9.1) -> added by d.toml:1 ( 9.1 NAME ( 'mine' 'other' ) USAGE u "
            ")\n"
            "object class guard (9.3) -> added ( 9.3 NAME ( 'guard' ) ABSTRACT MUST ( mine ) MAY ( "
            "other ) )\n");
}

// The extension that comes with what is renamed can still clash.
TEST(Decisions, ADbNameThatStaysTakenIsUndecided) {
  const Inputs inputs = {"", at("9.1 NAME 'badge' USAGE u") + orv("9.1 DBNAME ( 'b' )"),
                         at("1.5 NAME 'badge' USAGE v") + orv("1.5 DBNAME ( 'b' )")};
  const std::string rename = about("attribute-type", "badge", "rename = 'mine'");
  EXPECT_EQ(decided(inputs, rename),
            "attribute type badge (1.5) -> new\n"
            "vendor extension 1.5 -> new\n"
            "attribute type badge (9.1) -> added by d.toml:1 ( 9.1 NAME ( 'mine' ) USAGE u )\n"
            "vendor extension 9.1 -> undecided\n");
  EXPECT_EQ(decided(inputs, rename + "[[definition]]\nkind='vendor-extension'\noid='9.1'\n"
                                     "text=\"( 9.1 DBNAME ( 'mine' ) )\"\n"),
            "attribute type badge (1.5) -> new\n"
            "vendor extension 1.5 -> new\n"
            "attribute type badge (9.1) -> added by d.toml:1 ( 9.1 NAME ( 'mine' ) USAGE u )\n"
            "vendor extension 9.1 -> text by d.toml:5 ( 9.1 DBNAME ( 'mine' ) ACCESS-CLASS normal "
            ")\n");
}

TEST(Decisions, ATakenTypeDecidedByClausesLeavesItsExtensionToItself) {
  const std::string plain = at("1.1 NAME 'a' USAGE u") + orv("1.1 DBNAME ( 'a' ) LENGTH 8");
  const Inputs inputs = {
      plain, at("1.1 NAME ( 'a' 'badge' ) USAGE u") + orv("1.1 DBNAME ( 'a' ) LENGTH 8"),
      at("1.1 NAME 'a' USAGE u") + orv("1.1 DBNAME ( 'a' ) LENGTH 9") +
          at("1.5 NAME 'badge' USAGE v")};
  EXPECT_EQ(decided(inputs, about("attribute-type", "a", "text = \"( 1.1 NAME 'a' USAGE w )\"")),
            "attribute type a (1.1) -> text by d.toml:1 ( 1.1 NAME ( 'a' ) USAGE w )\n"
            "attribute type badge (1.5) -> new\n"
            "vendor extension 1.1 -> new\n");
}

TEST(Decisions, WhatIsKeptFollowsARename) {
  const std::string shipped = at("1.1 NAME 'k' SUP badge USAGE u");
  const Inputs inputs = {
      shipped, shipped + at("9.1 NAME 'badge' USAGE u") + oc("9.2 NAME 'guard' ABSTRACT MAY ( k )"),
      ""};
  EXPECT_EQ(decided(inputs, about("attribute-type", "badge", "rename = 'mine'")),
            "attribute type k (1.1) -> kept ( 1.1 NAME ( 'k' ) SUP mine USAGE u )\n"
            "attribute type badge (9.1) -> added by d.toml:1 ( 9.1 NAME ( 'mine' ) USAGE u )\n"
            "object class guard (9.2) -> added ( 9.2 NAME ( 'guard' ) ABSTRACT MAY ( k ) )\n");
}

TEST(Decisions, AnExtensionWithoutItsAttributeTypeIsRefused) {
  const Inputs inputs = {"", at("9.1 NAME 'badge' USAGE u") + orv("9.1 DBNAME ( 'b' )"), ""};
  EXPECT_EQ(
      decided(inputs, about("attribute-type", "badge", "take = 'drop'") +
                          "[[definition]]\nkind='vendor-extension'\noid='9.1'\n"
                          "take='old'\n"),
      "attribute type badge (9.1) -> dropped by d.toml:1, taken out\n"
      "vendor extension 9.1 -> added by d.toml:5 ( 9.1 DBNAME ( 'b' ) ACCESS-CLASS normal )\n"
      "d.toml:5: the decision about vendor extension 9.1 cannot be carried out: its attribute "
      "type is not in the result\n");
}

TEST(Decisions, OneDecisionCoversAnAttributeTypeAndItsExtension) {
  const Inputs removed = {at("1.1 NAME 'a' USAGE u") + orv("1.1 DBNAME ( 'a' )"),
                          at("1.1 NAME 'a' USAGE v") + orv("1.1 DBNAME ( 'a' )"), ""};
  EXPECT_EQ(decided(removed, ""),
            "attribute type a (1.1) -> undecided\nvendor extension 1.1 -> undecided\n");
  EXPECT_EQ(
      decided(removed, about("attribute-type", "a", "take = 'old'")),
      "attribute type a (1.1) -> added by d.toml:1 ( 1.1 NAME ( 'a' ) USAGE v )\n"
      "vendor extension 1.1 -> added by d.toml:1 ( 1.1 DBNAME ( 'a' ) ACCESS-CLASS normal )\n");
}

}  // namespace
