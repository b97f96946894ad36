// The settings file of an installation: what it says, what is malformed in it, what it accepts.

#include "Settings.h"

#include <gtest/gtest.h>

#include "Files.h"

namespace {

using migration::Failures;
using migration::Finding;
using migration::Severity;

std::string described(const Failures& failures) {
  std::string text;
  for (const migration::Failure& failure : failures) {
    text += failure.file + ":" + std::to_string(failure.line) + ":" +
            std::to_string(failure.column) + ": " + failure.text + "\n";
  }
  return text;
}

std::string described(const migration::Settings& settings) {
  std::string text = settings.path + "\n";
  for (const auto& [rule, severity] : settings.severities) {
    text += rule + "=" + std::string(wordOf(severity)) + "\n";
  }
  for (const std::string& name : settings.accessClasses) {
    text += "class " + name + "\n";
  }
  for (const migration::Acceptance& accepted : settings.accepted) {
    text += std::to_string(accepted.place.line) + " " + accepted.rule + " " + accepted.file + " " +
            std::to_string(accepted.line) + " \"" + accepted.definition + "\" " + accepted.reason +
            "\n";
  }
  return text;
}

TEST(Settings, EverythingIsRead) {
  const migration::Source source("d/.schema-migrate.toml",
                                 R"(access-classes = ["normal", "critical"]
[rules]
D205 = "off"
L112 = "error"
T306 = "warning"

[[accepted]]
rule = "D205"
file = "V3.user.at"
line = 12
reason = "an OID is applied for"

[[accepted]]
rule = "L105"
file = "V3.user.oc"
definition = "cn"
reason = "known"
)");
  Failures failures;
  EXPECT_EQ(
      "d/.schema-migrate.toml\nD205=off\nL112=error\nT306=warning\nclass normal\nclass critical\n"
      "7 D205 V3.user.at 12 \"\" an OID is applied for\n13 L105 V3.user.oc 0 \"cn\" known\n",
      described(readSettings(source, &failures)));
  EXPECT_EQ("", described(failures));
}

struct MalformedRow {
  const char* name;
  const char* text;
  const char* failures;
};

void PrintTo(const MalformedRow& row, std::ostream* out) { *out << row.name; }

const MalformedRow kMalformed[] = {
    {"NoToml", "rules = [\n", nullptr},
    {"UnknownKey", "\nrule = 1\n", "f:2:1: the key rule is not known here\n"},
    {"RulesIsNoTable", "rules = 1\n",
     "f:1:9: rules must be a table: [rules], and below it lines as D205 = \"off\"\n"},
    {"UnknownRule", "[rules]\nD999 = \"off\"\n", "f:2:1: there is no rule D999\n"},
    {"UnknownSeverity", "[rules]\nD205 = \"fatal\"\n",
     "f:2:8: a severity must be \"error\", \"warning\" or \"off\"\n"},
    {"SeverityIsNoText", "[rules]\nD205 = false\n",
     "f:2:8: a severity must be \"error\", \"warning\" or \"off\"\n"},
    {"AccessClassesIsNoList", "access-classes = \"normal\"\n",
     "f:1:18: access-classes must be a list of texts, as [\"normal\", \"critical\"]\n"},
    {"AccessClassIsNoText", "access-classes = [3]\n",
     "f:1:19: an access class must be a text in quotes\n"},
    {"AcceptedIsNoTable", "accepted = [1]\n",
     "f:1:12: accepted must be tables that begin with [[accepted]]\n"},
    {"NoReason", "[[accepted]]\nrule = \"D205\"\nfile = \"V3.user.at\"\nline = 1\n",
     "f:1:1: this accepted finding has no reason\n"},
    {"NoRule", "[[accepted]]\nreason = \"r\"\nfile = \"V3.user.at\"\nline = 1\n",
     "f:1:1: this accepted finding has no rule\n"},
    {"NoFile", "[[accepted]]\nreason = \"r\"\nrule = \"D205\"\nline = 1\n",
     "f:1:1: this accepted finding has no file\n"},
    {"AcceptedRuleIsUnknown",
     "[[accepted]]\nreason = \"r\"\nrule = \"D20\"\nfile = \"V3.user.at\"\nline = 1\n",
     "f:3:8: there is no rule D20\n"},
    {"TwoPlaces",
     "[[accepted]]\nreason = \"r\"\nrule = \"D205\"\nfile = \"f\"\nline = 1\ndefinition = \"cn\"\n",
     "f:1:1: an accepted finding has its place by line or by definition, not by both\n"},
    {"LineZero", "[[accepted]]\nreason = \"r\"\nrule = \"D205\"\nfile = \"f\"\nline = 0\n",
     "f:5:8: line must be a number from 1\n"},
    {"EmptyReason", "[[accepted]]\nreason = \"\"\nrule = \"D205\"\nfile = \"f\"\nline = 1\n",
     "f:2:10: reason must be a text in quotes that is not empty\n"},
    {"UnknownKeyOfAcceptance",
     "[[accepted]]\nreason = \"r\"\nrule = \"D205\"\nfile = \"f\"\nline = 1\nwhy = \"w\"\n",
     "f:6:1: the key why is not known here\n"},
    {"EveryMistakeInTheOrderOfTheFile", "zebra = 1\n[rules]\nD999 = \"off\"\nD205 = 1\n",
     "f:1:1: the key zebra is not known here\nf:3:1: there is no rule D999\n"
     "f:4:8: a severity must be \"error\", \"warning\" or \"off\"\n"},
};

class MalformedSettings : public testing::TestWithParam<MalformedRow> {};

TEST_P(MalformedSettings, AreNamedWithTheirPlace) {
  const migration::Source source("f", GetParam().text);
  Failures failures;
  const migration::Settings settings = readSettings(source, &failures);
  EXPECT_EQ("f\n", described(settings));
  if (GetParam().failures != nullptr) {
    EXPECT_EQ(GetParam().failures, described(failures));
  } else {
    EXPECT_EQ(0U, described(failures).find("f:1:11: this is no TOML: ")) << described(failures);
  }
}

INSTANTIATE_TEST_SUITE_P(Rows, MalformedSettings, testing::ValuesIn(kMalformed),
                         [](const auto& row) { return std::string(row.param.name); });

struct JudgeRow {
  const char* name;
  const char* place;  // in the settings
  Finding finding;
  bool isAccepted;
};

void PrintTo(const JudgeRow& row, std::ostream* out) { *out << row.name; }

Finding at(const char* file, std::uint64_t line, const char* definition) {
  return {"D205", Severity::kWarning, file, line, 1, "text", definition};
}

const JudgeRow kJudged[] = {
    {"ByLine", "line = 3", at("dir/V3.user.at", 3, ""), true},
    {"ByLineOfTheWholePath", "line = 3", at("V3.user.at", 3, ""), true},
    {"AnotherLine", "line = 3", at("dir/V3.user.at", 4, ""), false},
    {"AnotherFile", "line = 3", at("dir/V3.user.oc", 3, ""), false},
    {"ByName", "definition = 'cn'", at("V3.user.at", 9, "attribute type cn (2.5.4.3)"), true},
    {"ByNameInAnyLetterCase", "definition = 'CN'",
     at("V3.user.at", 9, "attribute type cn (2.5.4.3)"), true},
    {"ByOid", "definition = '2.5.4.3'", at("V3.user.at", 9, "attribute type cn (2.5.4.3)"), true},
    {"ByOidOfAnExtension", "definition = '2.5.4.3'",
     at("V3.user.at", 9, "vendor extension 2.5.4.3"), true},
    {"AsItIsShown", "definition = 'attribute type cn (2.5.4.3)'",
     at("V3.user.at", 9, "attribute type cn (2.5.4.3)"), true},
    {"OfNoOid", "definition = 'cn'", at("V3.user.at", 9, "object class cn"), true},
    {"AnotherDefinition", "definition = 'c'", at("V3.user.at", 9, "attribute type cn (2.5.4.3)"),
     false},
    {"PartOfTheKind", "definition = 'type'", at("V3.user.at", 9, "attribute type cn (2.5.4.3)"),
     false},
    {"DefinitionWithoutOne", "definition = 'cn'", at("V3.user.at", 9, ""), false},
    {"FileAsAWhole", "", at("dir/V3.user.at", 0, ""), true},
    {"FileAsAWholeIsNoLine", "", at("dir/V3.user.at", 1, ""), false},
};

class Judging : public testing::TestWithParam<JudgeRow> {};

TEST_P(Judging, AcceptsByRuleAndPlace) {
  const migration::Source source(
      "f", std::string("[[accepted]]\nrule = \"D205\"\nfile = \"V3.user.at\"\nreason = \"r\"\n") +
               GetParam().place + "\n");
  Failures failures;
  const migration::Settings settings = readSettings(source, &failures);
  ASSERT_EQ("", described(failures));
  const auto couldOccur = [](const migration::Acceptance&) { return true; };
  Finding otherRule = GetParam().finding;
  otherRule.rule = "D206";
  const migration::JudgedFindings judged =
      judge(settings, {GetParam().finding, otherRule}, couldOccur);
  std::string rules;
  for (const Finding& finding : judged.findings) {
    rules += finding.rule + " ";
  }
  EXPECT_EQ(GetParam().isAccepted ? "D206 " : "D205 D206 S801 ", rules);
  ASSERT_EQ(GetParam().isAccepted ? 1U : 0U, judged.accepted.size());
}

INSTANTIATE_TEST_SUITE_P(Rows, Judging, testing::ValuesIn(kJudged),
                         [](const auto& row) { return std::string(row.param.name); });

constexpr char kOne[] =
    "[[accepted]]\nrule = \"D205\"\nfile = \"V3.user.at\"\ndefinition = \"cn\"\nreason = \"r\"\n";

std::string stale(const std::string& settingsText, bool couldOccur) {
  const migration::Source source("d/f", settingsText);
  Failures failures;
  const migration::JudgedFindings judged =
      judge(readSettings(source, &failures), {},
            [&](const migration::Acceptance&) { return couldOccur; });
  std::string text = described(failures);
  for (const Finding& finding : judged.findings) {
    text += finding.file + ":" + std::to_string(finding.line) + ":" +
            std::to_string(finding.column) + ": " + std::string(wordOf(finding.severity)) + ": " +
            finding.text + " [" + finding.rule + "]\n";
  }
  return text;
}

TEST(Settings, AnAcceptedFindingThatDoesNotOccurIsTold) {
  const std::string text =
      "the accepted finding D205 at V3.user.at, definition cn does not occur, so that it would hide a new one there; remove this entry [S801]\n";
  EXPECT_EQ("d/f:1:1: warning: " + text, stale(kOne, true));
  EXPECT_EQ("d/f:3:1: error: " + text,
            stale(std::string("[rules]\nS801 = 'error'\n") + kOne, true));
  EXPECT_EQ("", stale(std::string("[rules]\nS801 = 'off'\n") + kOne, true));
}

TEST(Settings, AnAcceptedFindingThatCannotOccurInThisRunIsNotTold) {
  EXPECT_EQ("", stale(kOne, false));
}

// Findings of other rules before the one that is accepted, as many as there may be.
TEST(Judge, AcceptsWhateverComesBefore) {
  migration::Settings settings;
  settings.accepted.push_back({"L105", "V3.user.at", 2, "", "known", {}});
  migration::Findings findings;
  for (const char* const rule : {"R403", "T305", "D201", "L112", "A1", "Z9"}) {
    findings.push_back({rule, Severity::kWarning, "d/V3.system.at", 1, 1, "text", ""});
  }
  findings.push_back({"L105", Severity::kError, "d/V3.user.at", 2, 1, "text", ""});
  const migration::JudgedFindings judged =
      judge(settings, findings, [](const migration::Acceptance&) { return true; });
  EXPECT_EQ(6U, judged.findings.size());
  ASSERT_EQ(1U, judged.accepted.size());
  EXPECT_EQ("known", judged.accepted.front().reason);
}

}  // namespace
