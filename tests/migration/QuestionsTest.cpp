// What a plan asks a person, what may be chosen, and the entries that tell the choice.

#include "Questions.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "Files.h"
#include "Utf8.h"

namespace {

using migration::Decision;
using migration::MigrationPlan;
using migration::Question;
using migration::Questionnaire;
using migration::Take;

std::string at(const std::string& rest) { return "attributetypes=( " + rest + " )\n"; }
std::string oc(const std::string& rest) { return "objectclasses=( " + rest + " )\n"; }
std::string orv(const std::string& rest) { return "ORVAttributetypes=( " + rest + " )\n"; }

// A plan of three installations; those in which `base` is empty have none.
class Planned {
 public:
  Planned(const std::string& base, const std::string& old, const std::string& latest,
          const std::string& file = "V3.user.at") {
    migration::PlanRequest request;
    request.old = installed("old", old, "V3.user.at");
    request.latest = installed("new", latest, file);
    request.base = base.empty() ? "" : installed("base", base, "V3.user.at");
    request.acceptBase = true;
    m_plan = makePlan(request);
    EXPECT_TRUE(m_plan->failures.empty()) << m_plan->failures.front().text;
  }

  MigrationPlan& plan() { return *m_plan; }

 private:
  std::string installed(const std::string& name, const std::string& text,
                        const std::string& file) const {
    std::filesystem::create_directory(m_folder.file(name));
    m_folder.write(name + "/" + file, text);
    return m_folder.file(name);
  }

  support::TemporaryDirectory m_folder;
  std::unique_ptr<MigrationPlan> m_plan;
};

std::string wordsOf(const std::vector<Take>& takes) {
  std::string text;
  for (const Take take : takes) {
    text += (text.empty() ? "" : " ") + std::string(wordOf(take));
  }
  return text;
}

// "object class c (2.1): old new drop; SUP: old new union; may move": a line for each question.
std::string asked(const MigrationPlan& plan) {
  const Questionnaire questionnaire(plan);
  std::string text;
  for (const migration::Verdict* const open : questionnaire.open()) {
    const Question question = questionnaire.about(*open);
    std::vector<Take> takes;
    for (const migration::Choice& choice : question.choices) {
      takes.push_back(choice.take);
    }
    text += describe(*open) + ": " + wordsOf(takes);
    for (const migration::ClauseChoices& clause : question.clauses) {
      text += "; " + std::string(nameOf(clause.change->aspect)) + ": " + wordsOf(clause.takes);
    }
    text += question.mayMove ? "; may move" : "";
    text += question.mayBeWritten ? "; may be written\n" : "\n";
  }
  return text;
}

struct Case {
  const char* rule;
  std::string base;
  std::string old;
  std::string latest;
  std::string asked;
  std::string file = "V3.user.at";  // of NEW
};

TEST(Questions, OnlyWhatWouldBeCarriedOutIsOffered) {
  const std::string removed = at("1.1 NAME 'a' USAGE userApplications");
  const std::vector<Case> cases = {
      {"NothingIsUndecided", "", removed, removed, ""},
      {"AClauseInConflict", oc("2.1 NAME 'c' ABSTRACT"), oc("2.1 NAME 'c' AUXILIARY"),
       oc("2.1 NAME 'c' STRUCTURAL"),
       "object class c (2.1): old new base drop; KIND: old new base; may be written\n"},
      {"WithoutABaseNothingIsBases", "", oc("2.1 NAME 'c' AUXILIARY"),
       oc("2.1 NAME 'c' STRUCTURAL"),
       "object class c (2.1): old new drop; KIND: old new; may be written\n"},
      {"ListsAloneCanBeMerged", "", oc("2.1 NAME 'c' ABSTRACT MAY ( x )"),
       oc("2.1 NAME 'c' ABSTRACT MAY ( y )"),
       "object class c (2.1): old new merged drop; MAY: old new union; may be written\n"},
      {"AListThatHasTheOtherHasNoUnionOfItsOwn", "", oc("2.1 NAME 'c' ABSTRACT MAY ( x $ y )"),
       oc("2.1 NAME 'c' ABSTRACT MAY ( x )"),
       "object class c (2.1): old new merged drop; MAY: old new; may be written\n"},
      {"WhatTheReleaseRemovedIsNotThereToMerge", at("1.1 NAME 'a' USAGE userApplications"),
       at("1.1 NAME 'a' SINGLE-VALUE USAGE userApplications"), "",
       "attribute type a (1.1): old new base; may be written\n"},
      {"WhatIsTakenMayMoveAndNotStay", "", at("9.1 NAME 'badge' USAGE userApplications"),
       at("1.5 NAME ( 'x' 'badge' ) USAGE userApplications"),
       "attribute type badge (9.1): new; may move; may be written\n"},
      {"OneOfTwoOidsMayMove", "", at("9.1 NAME 'badge' USAGE userApplications"),
       at("1.5 NAME 'badge' USAGE userApplications"),
       "attribute type badge (9.1): old new drop; OID: old new; may move; may be written\n"},
      {"AConfigFileIsNews", "", at("1.1 NAME 'a' SINGLE-VALUE USAGE userApplications"), removed,
       "attribute type a (1.1): new\n", "V3.config.at"},
      {"AnExtensionGoesWithItsAttributeType",
       at("1.1 NAME 'a' USAGE userApplications") + orv("1.1 DBNAME ( 'a' 'a' )"),
       at("1.1 NAME 'a' SINGLE-VALUE USAGE userApplications") + orv("1.1 DBNAME ( 'a' 'a' )"), "",
       "attribute type a (1.1): old new base; may be written\n"},
      {"AnExtensionOfItsOwn", "",
       at("1.1 NAME 'a' USAGE userApplications") + orv("1.1 DBNAME ( 'a' 'a' ) LENGTH 7"),
       at("1.1 NAME 'a' USAGE userApplications") + orv("1.1 DBNAME ( 'a' 'a' ) LENGTH 9"),
       "vendor extension 1.1: old new drop; LENGTH: old new; may be written\n"},
  };
  for (const Case& row : cases) {
    SCOPED_TRACE(row.rule);
    Planned planned(row.base, row.old, row.latest, row.file);
    EXPECT_EQ(asked(planned.plan()), row.asked);
  }
}

// What is offered settles its question, each choice by itself, when it is written to a file.
TEST(Questions, EveryChoiceDecidesItsQuestion) {
  Planned planned(
      oc("2.1 NAME 'c' ABSTRACT MAY ( z )"),
      oc("2.1 NAME 'c' AUXILIARY MAY ( x )") + at("9.1 NAME 'badge' USAGE userApplications"),
      oc("2.1 NAME 'c' STRUCTURAL MAY ( y )") +
          at("1.5 NAME ( 'x' 'badge' ) USAGE userApplications"));
  ASSERT_EQ(asked(planned.plan()),
            "attribute type badge (9.1): new; may move; may be written\n"
            "object class c (2.1): old new base drop; KIND: old new base; MAY: old new base union; "
            "may be written\n");
  std::vector<std::string> entries;
  const auto note = [&](const Questionnaire& questionnaire, const migration::Verdict& open,
                        const std::function<void(Decision*)>& decide) {
    Decision decision = questionnaire.decisionAbout(open);
    decide(&decision);
    entries.push_back(decisionEntry(decision, describe(open)));
  };
  {
    const Questionnaire questionnaire(planned.plan());
    for (const migration::Verdict* const open : questionnaire.open()) {
      const Question question = questionnaire.about(*open);
      for (const migration::Choice& choice : question.choices) {
        note(questionnaire, *open, [&](Decision* decision) { decision->take = choice.take; });
      }
    }
    const migration::Verdict& badge = *questionnaire.open().front();
    note(questionnaire, badge, [](Decision* decision) { decision->rename = "siteBadge"; });
    const migration::Verdict& shape = *questionnaire.open().back();
    for (const migration::ClauseChoices& clause : questionnaire.about(shape).clauses) {
      for (const Take take : clause.takes) {
        note(questionnaire, shape, [&](Decision* decision) {
          decision->clauses = {{"KIND", Take::kNew}, {"MAY", Take::kOld}};
          decision->clauses[std::string(nameOf(clause.change->aspect))] = take;
        });
      }
    }
  }
  EXPECT_EQ(entries.size(), 13U);
  for (const std::string& entry : entries) {
    SCOPED_TRACE(entry);
    const migration::Source source("f.toml", entry);
    std::vector<Decision> decisions;
    migration::Failures failures;
    readDecisions(source, &decisions, &failures);
    ASSERT_TRUE(failures.empty()) << failures.front().text;
    decideAnew(decisions, &planned.plan());
    EXPECT_TRUE(planned.plan().threeWay.failures.empty());
    EXPECT_EQ(planned.plan().undecidedCount, 1U);
  }
}

TEST(Questions, AnOidThatTwoHaveIsNoNameForOne) {
  Planned planned(
      "",
      at("1.1 NAME 'a' SINGLE-VALUE USAGE userApplications") +
          at("1.1 NAME 'b' SINGLE-VALUE USAGE userApplications"),
      at("1.1 NAME 'a' USAGE userApplications") + at("1.2 NAME 'b' USAGE userApplications"));
  const Questionnaire questionnaire(planned.plan());
  std::string called;
  for (const migration::Verdict* const open : questionnaire.open()) {
    const Decision decision = questionnaire.decisionAbout(*open);
    called += decision.name + decision.oid + " ";
  }
  EXPECT_EQ(called, "a b ");
}

TEST(Questions, WhoRefersToIt) {
  Planned planned("",
                  at("1.1 NAME 'a' SINGLE-VALUE USAGE userApplications") +
                      oc("2.1 NAME 'c' ABSTRACT MAY ( a )"),
                  at("1.1 NAME 'a' USAGE userApplications") +
                      oc("2.1 NAME 'c' ABSTRACT MAY ( a )") +
                      oc("2.2 NAME 'd' ABSTRACT MUST ( A )"));
  const Questionnaire questionnaire(planned.plan());
  ASSERT_EQ(questionnaire.open().size(), 1U);
  EXPECT_EQ(referrersInOld(*questionnaire.open().front(), planned.plan()).size(), 1U);
  EXPECT_EQ(referrersInNew(*questionnaire.open().front(), planned.plan()).size(), 2U);
}

TEST(Questions, AnEntryHoldsWhateverIsInATextAndNothingEndsItsComment) {
  Decision decision;
  decision.kind = migration::Kind::kObjectClass;
  decision.oid = "2.1";
  decision.fingerprint = "sha256:00";
  decision.take = Take::kOld;
  decision.reason = "\"so\" \\ he said\n\x1b[31mM\xc3\xbcller\x7f";
  const std::string entry = decisionEntry(decision, "object class c\n[x]\x1b \xff M\xc3\xbcller");
  EXPECT_EQ(entry,
            "\n[[definition]]\n"
            "# object class c?[x]? ? M\xc3\xbcller\n"
            "kind = \"object-class\"\n"
            "oid = \"2.1\"\n"
            "fingerprint = \"sha256:00\"\n"
            "take = \"old\"\n"
            "reason = \"\\\"so\\\" \\\\ he said\\u000A\\u001B[31mM\xc3\xbcller\\u007F\"\n");
  const migration::Source source("f.toml", entry);
  std::vector<Decision> decisions;
  migration::Failures failures;
  readDecisions(source, &decisions, &failures);
  ASSERT_TRUE(failures.empty()) << failures.front().text;
  EXPECT_EQ(decisions.front().reason, decision.reason);
}

struct Utf8Row {
  const char* name;
  std::string text;
  std::size_t length;
  char32_t code;
};

TEST(Utf8, ACharacterAtTheFront) {
  const std::vector<Utf8Row> rows = {
      {"Ascii", "ab", 1, 'a'},
      {"Nul", std::string("\0", 1), 1, 0},
      {"TwoBytes", "\xc3\xbcx", 2, 0xFC},
      {"ThreeBytes", "\xe2\x82\xac", 3, 0x20AC},
      {"FourBytes", "\xf0\x9f\x98\x80", 4, 0x1F600},
      {"TheLastOne", "\xf4\x8f\xbf\xbf", 4, 0x10FFFF},
      {"BehindTheLastOne", "\xf4\x90\x80\x80", 0, 0},
      {"CutOff", "\xe2\x82", 0, 0},
      {"ContinuedByAnother", "\xe2\x82z", 0, 0},
      {"Continuation", "\x80", 0, 0},
      {"OverlongOfTwo", "\xc0\xaf", 0, 0},
      {"OverlongOfThree", "\xe0\x9f\xbf", 0, 0},
      {"OverlongOfFour", "\xf0\x8f\xbf\xbf", 0, 0},
      {"Surrogate", "\xed\xa0\x80", 0, 0},
      {"NoByteOfAny", "\xff", 0, 0},
  };
  for (const Utf8Row& row : rows) {
    SCOPED_TRACE(row.name);
    const migration::Utf8Character character = migration::firstCharacter(row.text);
    EXPECT_EQ(character.length, row.length);
    EXPECT_EQ(character.code, row.code);
    EXPECT_EQ(migration::isUtf8("a\xc3\xbc" + row.text), row.length != 0 || row.text.empty());
  }
}

}  // namespace
