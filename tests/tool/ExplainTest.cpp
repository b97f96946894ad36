// explain: the pages of the rules, and whether what they say is so.

#include <gtest/gtest.h>
#include <libschema-migration/Rule.h>

#include <filesystem>
#include <nlohmann/json.hpp>
#include <set>

#include "ToolRun.h"

namespace {

using migration::ExampleFile;
using migration::RuleInfo;

// The rules that check has to say something about these files, each once.
std::string rulesOf(const std::vector<ExampleFile>& files) {
  const ToolFolder folder;
  std::filesystem::create_directory(folder.file("dir"));
  std::vector<std::string> arguments = {"check", "@/dir", "--format", "json"};
  bool isAgainst = false;
  for (const ExampleFile& file : files) {
    const std::string name = file.name;
    const std::string text(file.bytes);
    if (name.compare(0, 8, "against/") == 0) {
      std::filesystem::create_directory(folder.file("against"));
      folder.write(name, text);
      isAgainst = true;
    } else if (name == "exclude.txt" || name == "withdraw.txt") {
      folder.write(name, text);
      arguments.insert(arguments.end(),
                       {name == "exclude.txt" ? "--exclude-oids" : "--withdraw", "@/" + name});
    } else {
      folder.write("dir/" + name, text);
    }
  }
  if (isAgainst) {
    arguments.insert(arguments.end(), {"--against", "@/against"});
  }
  const ToolResult result = folder.run(arguments);
  const auto document = nlohmann::json::parse(result.out, nullptr, false);
  if (document.is_discarded()) {
    return "no JSON: " + result.out + result.err;
  }
  std::set<std::string> rules;
  for (const auto& finding : document["findings"]) {
    rules.insert(finding["rule"].get<std::string>());
  }
  std::string text;
  for (const std::string& rule : rules) {
    text += (text.empty() ? "" : " ") + rule;
  }
  return text;
}

class EveryRule : public testing::TestWithParam<const RuleInfo*> {};

TEST_P(EveryRule, ExampleHasItAndNoOther) {
  EXPECT_EQ(GetParam()->id, rulesOf(GetParam()->example));
}

TEST_P(EveryRule, NearMissHasItNot) {
  ASSERT_FALSE(GetParam()->nearMiss.empty());
  const std::string rules = rulesOf(GetParam()->nearMiss);
  EXPECT_EQ(std::string::npos, rules.find(GetParam()->id)) << rules;
  EXPECT_NE(0U, rules.find("no JSON")) << rules;
}

TEST_P(EveryRule, PageHasItsParts) {
  const ToolFolder folder;
  const ToolResult result = folder.run({"explain", GetParam()->id});
  EXPECT_EQ(0, result.exitCode);
  EXPECT_EQ("", result.err);
  EXPECT_EQ(0U, result.out.find(std::string(GetParam()->id) + " " + GetParam()->name + " ("));
  for (const char* const part :
       {"\n\n  ", "\n  An example:\n    ", "\n  Why: ", "\n  How to mend it", "\n  This is no "}) {
    EXPECT_NE(std::string::npos, result.out.find(part)) << part << "\n" << result.out;
  }
  for (const std::string& line : support::splitLines(result.out)) {
    for (const char c : line) {
      EXPECT_TRUE(c >= ' ' && c < '\x7f') << line;
    }
  }
}

INSTANTIATE_TEST_SUITE_P(Rules, EveryRule, testing::ValuesIn(migration::allRules()),
                         [](const auto& rule) { return std::string(rule.param->id); });

// A rule that is taken out would not be missed by the tests above.
TEST(Explain, EveryRuleIsThere) {
  const char* const kAll =
      "D201 D202 D203 D204 D205 D206 D207 D208 D209 D210 D211 D212 D213 D214 "
      "I701 I702 I703 "
      "L100 L101 L102 L103 L104 L105 L106 L107 L108 L109 L110 L111 L112 L113 "
      "O501 O502 O503 O504 R401 R402 R403 R404 R405 S801 "
      "T301 T302 T303 T304 T305 T306 T307 V601 V602 V603";
  std::string all;
  for (const RuleInfo* const rule : migration::allRules()) {
    all += (all.empty() ? "" : " ") + std::string(rule->id);
  }
  EXPECT_EQ(kAll, all);
}

TEST(Explain, WithoutARuleListsThem) {
  const ToolFolder folder;
  const ToolResult result = folder.run({"explain"});
  EXPECT_EQ(0, result.exitCode);
  EXPECT_EQ("", result.err);
  std::string identifiers;
  for (const std::string& line : support::splitLines(result.out)) {
    EXPECT_LE(line.size(), 79U) << line;
    if (line.substr(0, 1) != " ") {
      identifiers += line.substr(0, 4) + " ";
    }
  }
  std::string all;
  for (const RuleInfo* const rule : migration::allRules()) {
    all += std::string(rule->id) + " ";
  }
  EXPECT_EQ(all, identifiers);
}

TEST(Explain, APage) {
  const ToolFolder folder;
  for (const char* const name : {"S801", "s801", "accepted-finding-does-not-occur"}) {
    EXPECT_EQ(
        "S801 accepted-finding-does-not-occur (warning)\n"
        "\n"
        "  The settings file accepts a finding that this installation does not have.\n"
        "\n"
        "  An example:\n"
        "    V3.user.at:\n"
        "      attributetypes=( 1.3.6.1.4.1.32473.1.1 NAME 'badge' DESC 'a number' )\n"
        "    .schema-migrate.toml:\n"
        "      [[accepted]]\n"
        "      rule = \"D205\"\n"
        "      file = \"V3.user.at\"\n"
        "      definition = \"badge\"\n"
        "      reason = \"an OID has been applied for\"\n"
        "\n"
        "  Why: An entry that nothing needs hides the next mistake at the same place.\n"
        "\n"
        "  How to mend it: Remove the entry from the settings file; if the definition\n"
        "                  has moved, name its new place.\n"
        "\n"
        "  This is no S801:\n"
        "    V3.user.at:\n"
        "      attributetypes=( badge-oid NAME 'badge' DESC 'a number' )\n"
        "    .schema-migrate.toml:\n"
        "      [[accepted]]\n"
        "      rule = \"D205\"\n"
        "      file = \"V3.user.at\"\n"
        "      definition = \"badge\"\n"
        "      reason = \"an OID has been applied for\"\n",
        folder.run({"explain", name}).out)
        << name;
  }
}

TEST(Explain, AnUnknownRuleIsAUsageError) {
  const ToolFolder folder;
  const ToolResult result = folder.run({"explain", "D999\x1b"});
  EXPECT_EQ(2, result.exitCode);
  EXPECT_EQ("", result.out);
  EXPECT_EQ(
      "schema-migrate: error: there is no rule D999\\x1B; schema-migrate explain lists them\n",
      result.err);
}

}  // namespace
