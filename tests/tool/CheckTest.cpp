// check: its options, its exit codes, its settings file.

#include <gtest/gtest.h>
#include <pty.h>
#include <sys/wait.h>
#include <unistd.h>

#include <fcntl.h>
#include <array>
#include <cstdlib>
#include <nlohmann/json.hpp>

#include "Json.h"
#include "ToolRun.h"

namespace {

constexpr char kTypes[] =
    "attributetypes=( 2.5.4.0 NAME 'objectClass' SYNTAX 1.3.6.1.4.1.1466.115.121.1.38 )\n";

// MAY names nothing: R401, an error. It stands at 2:64.
std::string danglingClasses() {
  return std::string("objectclasses=( 2.5.6.0 NAME 'top' ABSTRACT MUST ( objectClass ) )\n") +
         "objectclasses=( 1.2.3 NAME 'site' SUP top STRUCTURAL MAY ( siteName ) )\n";
}

// A definition in a config file is never written: T305, a warning.
constexpr char kConfig[] =
    "attributetypes=( 1.2.4 NAME 'limit' SYNTAX 1.3.6.1.4.1.1466.115.121.1.27 )\n";

// "RULE severity file:line" of each finding, in their order.
std::string findingsOf(const ToolResult& result) {
  std::string text;
  const auto document = nlohmann::json::parse(result.out, nullptr, false);
  if (document.is_discarded()) {
    return "no JSON: " + result.out;
  }
  for (const auto& finding : document["findings"]) {
    text += finding["rule"].get<std::string>() + " " + finding["severity"].get<std::string>() +
            " " + finding["file"].get<std::string>() + ":" +
            std::to_string(finding["line"].get<int>()) + "\n";
  }
  for (const auto& accepted : document["accepted"]) {
    text += "accepted " + accepted["rule"].get<std::string>() + ": " +
            accepted["reason"].get<std::string>() + "\n";
  }
  return text;
}

// An installation with an error, R401, and a warning, T305.
class Check : public testing::Test {
 protected:
  Check() {
    m_folder.install(
        "old",
        {{"V3.system.at", kTypes}, {"V3.user.oc", danglingClasses()}, {"V3.config.at", kConfig}});
  }

  ToolResult check(std::vector<std::string> arguments) const {
    arguments.insert(arguments.begin(), {"check", "--format", "json", "@/old"});
    return m_folder.run(arguments);
  }

  void settings(const std::string& text) const { m_folder.write("old/.schema-migrate.toml", text); }

  ToolFolder m_folder;
};

struct Row {
  const char* name;
  std::vector<std::string> arguments;
  const char* settings;
  int exitCode;
  const char* findings;
};

void PrintTo(const Row& row, std::ostream* out) { *out << row.name; }

const Row kRows[] = {
    {"AnError", {}, "", 1, "R401 error @/old/V3.user.oc:2\nT305 warning @/old/V3.config.at:1\n"},
    {"ARuleIsOff", {"--rule", "R401=off"}, "", 0, "T305 warning @/old/V3.config.at:1\n"},
    {"ARuleIsAWarning",
     {"--rule", "R401=warning"},
     "",
     0,
     "R401 warning @/old/V3.user.oc:2\nT305 warning @/old/V3.config.at:1\n"},
    {"TwoRules", {"--rule", "R401=off", "--rule=T305=off"}, "", 0, ""},
    {"WarningsFail",
     {"--rule", "R401=off", "--fail-on", "warning"},
     "",
     1,
     "T305 warning @/old/V3.config.at:1\n"},
    {"NothingFailsOnWarnings",
     {"--rule", "R401=off", "--rule", "T305=off", "--fail-on", "warning"},
     "",
     0,
     ""},
    {"SettingsSetSeverities",
     {},
     "[rules]\nR401 = 'off'\nT305 = 'error'\n",
     1,
     "T305 error @/old/V3.config.at:1\n"},
    {"OptionsGoBeforeSettings",
     {"--rule", "T305=off"},
     "[rules]\nR401 = 'off'\nT305 = 'error'\n",
     0,
     ""},
    {"SettingsAccept",
     {},
     "[[accepted]]\nrule = 'R401'\nfile = 'V3.user.oc'\ndefinition = 'site'\nreason = 'to come'\n",
     0,
     "T305 warning @/old/V3.config.at:1\naccepted R401: to come\n"},
    {"AnAcceptedFindingDoesNotOccur",
     {"--rule", "T305=off"},
     "[[accepted]]\nrule = 'R401'\nfile = 'V3.user.oc'\nline = 2\nreason = 'to come'\n"
     "[[accepted]]\nrule = 'R401'\nfile = 'V3.user.oc'\nline = 7\nreason = 'gone'\n",
     0,
     "S801 warning @/old/.schema-migrate.toml:6\naccepted R401: to come\n"},
    {"AnAcceptedFindingOfARuleThatIsOff",
     {"--rule", "T305=off", "--rule", "R401=off"},
     "[[accepted]]\nrule = 'R401'\nfile = 'V3.user.oc'\nline = 7\nreason = 'gone'\n",
     0,
     ""},
    {"AnAcceptedFindingAboutAListThatWasNotGiven",
     {"--rule", "T305=off", "--rule", "R401=off"},
     "[[accepted]]\nrule = 'O503'\nfile = 'exclude.txt'\nline = 1\nreason = 'later'\n",
     0,
     ""},
    {"AnAcceptedFindingAboutAnotherInstallationThatWasNotGiven",
     {"--rule", "T305=off", "--rule", "R401=off"},
     "[[accepted]]\nrule = 'I701'\nfile = 'V3.user.at'\nreason = 'later'\n",
     0,
     ""},
};

class CheckRows : public Check, public testing::WithParamInterface<Row> {};

TEST_P(CheckRows, Tells) {
  if (*GetParam().settings != '\0') {
    settings(GetParam().settings);
  }
  const ToolResult result = check(GetParam().arguments);
  EXPECT_EQ(GetParam().exitCode, result.exitCode);
  EXPECT_EQ(GetParam().findings, findingsOf(result));
  EXPECT_EQ("", result.err);
}

INSTANTIATE_TEST_SUITE_P(Rows, CheckRows, testing::ValuesIn(kRows),
                         [](const auto& row) { return std::string(row.param.name); });

TEST_F(Check, NothingIsChanged) {
  const std::string before = m_folder.snapshot();
  check({});
  EXPECT_EQ(before, m_folder.snapshot());
}

TEST_F(Check, OfNothingWrong) {
  m_folder.install("good", {{"V3.system.at", kTypes}, {"V3.user.oc", "# no class\n"}});
  const ToolResult result = m_folder.run({"check", "@/good", "--rule", "L112=off"});
  EXPECT_EQ(0, result.exitCode);
  EXPECT_EQ("no findings\n", result.out);
  EXPECT_EQ("", result.err);
}

TEST_F(Check, SeveralDirectoriesEachWithItsSettings) {
  m_folder.install(
      "new", {{"V3.config.at", kConfig}, {".schema-migrate.toml", "[rules]\nT305 = 'error'\n"}});
  const ToolResult result = check({"@/new"});
  EXPECT_EQ(1, result.exitCode);
  EXPECT_EQ(
      "R401 error @/old/V3.user.oc:2\nT305 warning @/old/V3.config.at:1\n"
      "T305 error @/new/V3.config.at:1\n",
      findingsOf(result));
}

TEST_F(Check, WhatIsWrongWithAListIsSaidOnce) {
  m_folder.install("new", {{"V3.system.at", kTypes}});
  m_folder.write("exclude.txt", "2.5.4.0\n2.5.4.0\n");
  const ToolResult result = check({"@/new", "--exclude-oids", "@/exclude.txt"});
  EXPECT_EQ(
      "R401 error @/old/V3.user.oc:2\nT305 warning @/old/V3.config.at:1\n"
      "O504 warning @/exclude.txt:2\n",
      findingsOf(result));
}

TEST_F(Check, AgainstAnotherInstallation) {
  m_folder.install("new", {{"V3.system.at", kTypes}, {"V3.orv.at", ""}});
  const ToolResult result = check({"--against", "@/new", "--rule", "T305=off"});
  EXPECT_NE(std::string::npos, findingsOf(result).find("I701 warning")) << findingsOf(result);
}

TEST_F(Check, WhatCannotBeReadIsToldBesideTheFindings) {
  m_folder.install("old/V3.orv.at", {});
  const ToolResult result = check({"--exclude-oids", "@/none.txt"});
  EXPECT_EQ(3, result.exitCode);
  EXPECT_EQ("R401 error @/old/V3.user.oc:2\nT305 warning @/old/V3.config.at:1\n",
            findingsOf(result));
  EXPECT_EQ(
      "@/none.txt: error: cannot be read: No such file or directory\n"
      "@/old/V3.orv.at: error: cannot be read: it is a directory\n",
      result.err);
}

TEST_F(Check, WhatIsMalformedInSettingsIsToldBesideTheFindings) {
  settings("[rules]\nR401 = 'fatal'\nT305 = 'off'\n");
  const ToolResult result = check({});
  EXPECT_EQ(3, result.exitCode);
  EXPECT_EQ("R401 error @/old/V3.user.oc:2\n", findingsOf(result));
  EXPECT_EQ(
      "@/old/.schema-migrate.toml:2:8: error: a severity must be \"error\", \"warning\" or \"off\"\n",
      result.err);
}

TEST_F(Check, NoDirectory) {
  const ToolResult result = m_folder.run({"check", "@/none"});
  EXPECT_EQ(3, result.exitCode);
  EXPECT_EQ("no findings; not everything could be checked\n", result.out);
  EXPECT_EQ("@/none: error: the directory cannot be read: No such file or directory\n", result.err);
}

TEST_F(Check, WhereTheLibraryWouldNeverComeToTheEnd) {
  m_folder.write("old/V3.user.at", "attributetypes=( 1.2.5 NAME 'c' COLLECTIVE )\n");
  const ToolResult result = check({"--rule", "T305=off"});
  EXPECT_EQ(3, result.exitCode);
  EXPECT_NE(std::string::npos, findingsOf(result).find("D202 error @/old/V3.user.at:1\n"));
  EXPECT_NE(std::string::npos, findingsOf(result).find("R401 error @/old/V3.user.oc:2\n"));
  EXPECT_EQ(
      "@/old/V3.user.at:1:33: error: the library would never come to the end of this file; what is wrong is among the findings\n",
      result.err);
}

TEST_F(Check, TextWithContext) {
  const ToolResult result = m_folder.run({"check", "@/old", "--context", "--rule", "T305=off"});
  EXPECT_EQ(1, result.exitCode);
  const std::vector<std::string> lines = support::splitLines(result.out);
  ASSERT_EQ(4U, lines.size()) << result.out;
  EXPECT_EQ(0U, lines[0].find("@/old/V3.user.oc:2:60: error: ")) << lines[0];
  EXPECT_EQ("[R401]", lines[0].substr(lines[0].size() - 6));
  EXPECT_EQ("  objectclasses=( 1.2.3 NAME 'site' SUP top STRUCTURAL MAY ( siteName ) )", lines[1]);
  EXPECT_EQ(std::string(61, ' ') + "^", lines[2]);
  EXPECT_EQ("1 error, 0 warnings", lines[3]);
}

TEST_F(Check, EveryFormatOfARunKeepsToItsSchema) {
  if (!canValidateJson()) {
    GTEST_SKIP() << "python3-jsonschema is not here";
  }
  EXPECT_EQ("", problemsOf(check({}).out, CHECK_SCHEMA));
  EXPECT_EQ("", problemsOf(check({"@/none"}).out, CHECK_SCHEMA));
  EXPECT_EQ("", problemsOf(m_folder.withPath(
                               m_folder.run({"check", "@/old", "@/none", "--format", "sarif"}).out),
                           SARIF_SCHEMA));
}

TEST_F(Check, GithubAnnotations) {
  const ToolResult result = m_folder.run({"check", "@/old", "--format", "github"});
  const std::vector<std::string> lines = support::splitLines(result.out);
  ASSERT_EQ(2U, lines.size()) << result.out;
  EXPECT_EQ(0U, lines[0].find("::error file=@/old/V3.user.oc,line=2,col=60,title=R401::"));
  EXPECT_EQ(0U, lines[1].find("::warning file=@/old/V3.config.at,line=1,col=")) << lines[1];
}

// What a run prints on a terminal.
std::string onTerminal(const ToolFolder& folder, const std::vector<const char*>& variables) {
  int terminal = -1;
  const pid_t child = ::forkpty(&terminal, nullptr, nullptr, nullptr);
  if (child == 0) {
    ::setenv("TERM", "xterm", 1);
    for (const char* const variable : variables) {
      ::setenv(variable, variable == std::string("TERM") ? "dumb" : "1", 1);
    }
    ::execl(SCHEMA_MIGRATE, SCHEMA_MIGRATE, "check", folder.file("old").c_str(), "--rule",
            "T305=off", static_cast<char*>(nullptr));
    ::_exit(127);
  }
  std::string text;
  std::array<char, 4096> buffer{};
  for (ssize_t count = 0; (count = ::read(terminal, buffer.data(), buffer.size())) > 0;) {
    text.append(buffer.data(), static_cast<std::size_t>(count));
  }
  ::close(terminal);
  EXPECT_EQ(1, exitCodeOf(child));
  return text;
}

TEST_F(Check, ATerminalGetsContextAndColour) {
  const std::string text = onTerminal(m_folder, {});
  EXPECT_NE(std::string::npos, text.find("\x1b[1;31merror:\x1b[0m")) << text;
  EXPECT_NE(std::string::npos, text.find("\x1b[1;32m^\x1b[0m")) << text;
}

TEST_F(Check, ATerminalGetsNoColourWhereNoneIsWanted) {
  for (const char* const variable : {"NO_COLOR", "TERM"}) {
    const std::string text = onTerminal(m_folder, {variable});
    EXPECT_EQ(std::string::npos, text.find('\x1b')) << text;
    EXPECT_NE(std::string::npos, text.find(" ^\r\n")) << text;
  }
}

TEST_F(Check, AReportThatCannotBeWrittenFails) {
  const ToolResult result = m_folder.run({"check", "@/old"}, [] {
    static_cast<void>(::dup2(::open("/dev/full", O_WRONLY), STDOUT_FILENO));
  });
  EXPECT_EQ(5, result.exitCode);
  EXPECT_EQ("schema-migrate: error: the report cannot be written to standard output\n", result.err);
}

TEST_F(Check, AHostileNameIsShownPrintable) {
  m_folder.install("a\x1b[31m", {{"V3.config.at", kConfig}});
  const ToolResult result = m_folder.run({"check", "@/a\x1b[31m"});
  EXPECT_EQ(0U, result.out.find("@/a\\x1B[31m/V3.config.at:1:")) << result.out;
  EXPECT_EQ(std::string::npos, result.out.find('\x1b'));
}

struct UsageRow {
  const char* name;
  std::vector<std::string> arguments;
  const char* err;
};

void PrintTo(const UsageRow& row, std::ostream* out) { *out << row.name; }

const UsageRow kUsageRows[] = {
    {"NoDirectory", {}, "DIR is required"},
    {"EmptyDirectory", {""}, "DIR: the name is empty"},
    {"UnknownRule",
     {"@/old", "--rule", "D999=off"},
     "--rule: there is no rule D999; schema-migrate explain lists them"},
    {"RuleWithoutSeverity",
     {"@/old", "--rule", "R401"},
     "--rule: must be as in D205=off, with error, warning or off"},
    {"UnknownSeverity",
     {"@/old", "--rule", "R401=fatal"},
     "--rule: must be as in D205=off, with error, warning or off"},
    {"UnknownFormat",
     {"@/old", "--format", "xml"},
     "--format: must be text, json, sarif or github"},
    {"UnknownFailOn", {"@/old", "--fail-on", "never"}, "--fail-on: must be error or warning"},
    {"UnknownOption", {"@/old", "--force"}, "The following argument was not expected: --force"},
};

class CheckUsage : public Check, public testing::WithParamInterface<UsageRow> {};

TEST_P(CheckUsage, IsRefused) {
  std::vector<std::string> arguments = GetParam().arguments;
  arguments.insert(arguments.begin(), "check");
  const ToolResult result = m_folder.run(arguments);
  EXPECT_EQ(2, result.exitCode);
  EXPECT_EQ("", result.out);
  EXPECT_EQ(std::string("schema-migrate: error: ") + GetParam().err +
                "; schema-migrate check --help tells how it is used\n",
            result.err);
}

INSTANTIATE_TEST_SUITE_P(Rows, CheckUsage, testing::ValuesIn(kUsageRows),
                         [](const auto& row) { return std::string(row.param.name); });

}  // namespace
