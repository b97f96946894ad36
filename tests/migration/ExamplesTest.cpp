// The pages of the L and D rules: each has an example with its finding and no other, and one that
// nearly has it.

#include <gtest/gtest.h>
#include <libschema-migration/Rule.h>

#include <set>
#include <string>

#include "RulesTesting.h"

namespace {

class Examples : public testing::TestWithParam<migration::RuleInfo> {};

std::set<std::string> rulesIn(const std::vector<migration::ExampleFile>& files) {
  std::set<std::string> rules;
  for (const migration::ExampleFile& file : files) {
    for (const migration::Finding& finding : rules_testing::findingsOf(std::string(file.bytes))) {
      rules.insert(finding.rule);
    }
  }
  return rules;
}

TEST_P(Examples, HaveTheFindingAndNoOther) {
  EXPECT_EQ(rulesIn(GetParam().example), std::set<std::string>{GetParam().id});
}

TEST_P(Examples, NearlyHaveIt) { EXPECT_EQ(rulesIn(GetParam().nearMiss).count(GetParam().id), 0U); }

TEST_P(Examples, AreExplained) {
  for (const char* const sentence : {GetParam().what, GetParam().why, GetParam().mend}) {
    EXPECT_EQ(std::string(sentence).back(), '.') << sentence;
  }
}

std::string nameOf(const testing::TestParamInfo<migration::RuleInfo>& info) {
  return info.param.id;
}

INSTANTIATE_TEST_SUITE_P(Text, Examples, testing::ValuesIn(migration::textRules()), nameOf);
INSTANTIATE_TEST_SUITE_P(Definitions, Examples, testing::ValuesIn(migration::definitionRules()),
                         nameOf);

}  // namespace

namespace migration {
void PrintTo(const RuleInfo& rule, std::ostream* out) { *out << rule.id; }
}  // namespace migration
