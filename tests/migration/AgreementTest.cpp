// Where no finding is told both readings agree, and where one is told that says they differ, they
// do: over texts that are made up, and damaged ones.

#include <gtest/gtest.h>

#include <cstdint>
#include <string>

#include "Agreement.h"
#include "GeneratedText.h"
#include "RulesTesting.h"

namespace {

TEST(Agreement, OfValidTextsWithoutFindings) {
  for (std::uint64_t seed = 0; seed < 1500; ++seed) {
    const std::string text = generated::TextMaker(seed).validText();
    const migration::SchemaFile file = rules_testing::fileOf("V3.user.at", text);
    migration::Findings findings;
    migration::checkText(file, &findings);
    for (const migration::Finding& finding : findings) {
      EXPECT_EQ(finding.rule, "L112") << "seed " << seed << "\n" << finding.text << "\n" << text;
    }
    ASSERT_EQ(agreement::linesOf(*file.written, true), agreement::linesOf(*file.kept, true))
        << "seed " << seed << "\n"
        << text;
  }
}

TEST(Agreement, OfDamagedTextsAsTheFindingsSay) {
  for (std::uint64_t seed = 0; seed < 8000; ++seed) {
    const std::string text = generated::TextMaker(seed).damagedText();
    const migration::SchemaFile file = rules_testing::fileOf("V3.user.at", text);
    migration::Findings findings;
    migration::checkText(file, &findings);
    ASSERT_EQ(agreement::brokenRule(file, findings), "") << "seed " << seed << "\n" << text;
  }
}

}  // namespace
