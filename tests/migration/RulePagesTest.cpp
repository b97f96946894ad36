// The page of every rule: its example has its finding and no other, its near miss has none of it,
// and it says what stands in rules.txt; SCHEMA_UPDATE_GOLDEN=1 rewrites that file.

#include <gtest/gtest.h>

#include <cstdlib>
#include <fstream>
#include <iterator>
#include <set>
#include <string>

#include "CheckRun.h"
#include "Settings.h"

namespace {

using migration::allRules;
using migration::Finding;
using migration::findRule;
using migration::RuleInfo;

std::string rulesIn(const support::Files& files) {
  std::set<std::string> rules;
  for (const Finding& finding : support::findingsOf(files)) {
    rules.insert(finding.rule);
  }
  std::string text;
  for (const std::string& rule : rules) {
    text += (text.empty() ? "" : " ") + rule;
  }
  return text;
}

TEST(RulePages, ExampleHasItsFindingAndNoOther) {
  for (const RuleInfo* const rule : allRules()) {
    SCOPED_TRACE(rule->id);
    EXPECT_EQ(rule->id, rulesIn(rule->example));
  }
}

// The severity of a text or definition rule depends on what is kept.
TEST(RulePages, ExampleHasTheSeverityOfItsRule) {
  for (const RuleInfo* const rule : allRules()) {
    SCOPED_TRACE(rule->id);
    if (rule->id[0] == 'L' || rule->id[0] == 'D') {
      continue;
    }
    for (const Finding& finding : support::findingsOf(rule->example)) {
      EXPECT_EQ(rule->severity, finding.severity) << finding.text;
    }
  }
}

TEST(RulePages, NearMissHasNoFindingOfTheRule) {
  for (const RuleInfo* const rule : allRules()) {
    SCOPED_TRACE(rule->id);
    EXPECT_FALSE(rule->nearMiss.empty());
    for (const Finding& finding : support::findingsOf(rule->nearMiss)) {
      EXPECT_NE(rule->id, finding.rule) << finding.text;
    }
  }
}

std::string textsOf(const RuleInfo& rule) {
  return std::string(rule.id) + " " + rule.name + ": " + std::string(wordOf(rule.severity)) +
         "\n  " + rule.what + "\n  " + rule.why + "\n  " + rule.mend + "\n";
}

TEST(RulePages, SayWhatIsSettled) {
  std::string texts;
  for (const RuleInfo* const rule : allRules()) {
    texts += textsOf(*rule);
  }
  if (std::getenv("SCHEMA_UPDATE_GOLDEN") != nullptr) {
    std::ofstream(RULE_TEXTS) << texts;
  }
  std::ifstream settled(RULE_TEXTS);
  EXPECT_EQ(std::string(std::istreambuf_iterator<char>(settled), {}), texts);
}

TEST(RulePages, IdentifiersAscendAndAreFound) {
  std::string before;
  for (const RuleInfo* const rule : allRules()) {
    EXPECT_LT(before, rule->id);
    EXPECT_EQ(rule, findRule(rule->id));
    before = rule->id;
  }
  EXPECT_EQ(nullptr, findRule("T300"));
}

}  // namespace
