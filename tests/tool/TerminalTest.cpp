// What all commands have in common on a terminal: width, colour, progress; and none of it where
// there is no terminal.

#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include <array>
#include <chrono>
#include <string>
#include <thread>
#include <vector>

#include "Files.h"
#include "Progress.h"
#include "TerminalRun.h"
#include "ToolRun.h"

namespace {

// The commands, as the program's own help lists them.
std::vector<std::string> allCommands(const ToolFolder& folder) {
  std::vector<std::string> commands;
  bool isInList = false;
  for (const std::string& line : support::splitLines(folder.run({"--help"}).out)) {
    isInList = line == "Subcommands:" || (isInList && !line.empty());
    if (isInList && line.size() > 2 && line[2] != ' ' && line[0] == ' ') {
      commands.push_back(line.substr(2, line.find(' ', 2) - 2));
    }
  }
  return commands;
}

TEST(Help, OfEveryCommandFits80Columns) {
  const ToolFolder folder;
  std::vector<std::string> commands = allCommands(folder);
  EXPECT_GE(commands.size(), 7U);
  EXPECT_LE(widestLine(folder.run({"--help"}).out), 80U);
  for (const std::string& command : commands) {
    SCOPED_TRACE(command);
    const ToolResult help = folder.run({command, "--help"});
    EXPECT_EQ(help.exitCode, 0);
    EXPECT_NE(help.out.find("Usage: schema-migrate " + command), std::string::npos);
    EXPECT_LE(widestLine(help.out), 80U) << help.out;
    EXPECT_NE(help.out.find("--color WHEN"), std::string::npos);
  }
}

TEST(Help, NoExampleIsBrokenWithoutABackslash) {
  const ToolFolder folder;
  for (const std::string& command : allCommands(folder)) {
    SCOPED_TRACE(command);
    const std::vector<std::string> lines = support::splitLines(folder.run({command, "--help"}).out);
    for (std::size_t i = 1; i < lines.size(); ++i) {
      if (lines[i - 1].compare(0, 17, "  schema-migrate ") == 0 &&
          lines[i].compare(0, 6, "      ") == 0) {
        EXPECT_EQ(lines[i - 1].back(), '\\') << lines[i - 1];
      }
    }
  }
}

// An installation and one in which a description and a long list differ.
class OnTerminal : public testing::Test {
 protected:
  OnTerminal() {
    const std::string words = "one two three four five six seven eight nine ten eleven twelve";
    m_folder.install("old", {{"V3.user.at", "attributetypes=( 1.1 NAME 'a' DESC '" + words +
                                                " thirteen fourteen' USAGE userApplications )\n"}});
    m_folder.install("new", {{"V3.user.at", "attributetypes=( 1.1 NAME 'a' DESC '" + words +
                                                "' USAGE userApplications )\n"}});
    m_folder.install("odd", {{"V3.user.at", "attributetypes=( 1.1 NAME 'a' DESC '" + words + " " +
                                                words + "' NOUSAGE userApplications )\n"}});
  }

  std::string on(unsigned short columns, const std::vector<std::string>& arguments,
                 const std::map<std::string, std::string>& environment = {}) const {
    TerminalRun run(m_folder, arguments, {columns, environment});
    std::string text = run.rest();
    run.exitCode();
    return text;
  }

  ToolFolder m_folder;
};

const std::vector<std::vector<std::string>> kReports = {
    {"diff", "--from", "old", "--to", "new"},
    {"plan", "--from", "old", "--to", "new"},
    {"migrate", "--from", "old", "--to", "new", "--prefer", "old", "--dry-run", "--out", "out"},
    {"check", "odd"},
    {"explain", "D208"},
    {"explain"},
    {"show", "old", "--list"},
};

TEST_F(OnTerminal, ReportsFitItsWidth) {
  for (const std::vector<std::string>& report : kReports) {
    SCOPED_TRACE(report.front());
    for (const unsigned short columns : std::array<unsigned short, 2>{60, 72}) {
      const std::string screen = onScreen(on(columns, report));
      EXPECT_LE(widestLine(screen), columns) << screen;
      EXPECT_GT(widestLine(screen), 10U) << screen;
    }
  }
}

TEST_F(OnTerminal, TheTableOfAMigrationHasWhatRoomThereIs) {
  const std::vector<std::string>& migrate = kReports[2];
  ASSERT_EQ(migrate.front(), "migrate");
  EXPECT_NE(
      onScreen(on(90, migrate))
          .find("File               read OLD  read NEW     kept    added  replaced   merged   "
                "written\n"
                "V3.user.at                1         1        0        0         1        0  "
                "       1\n"),
      std::string::npos)
      << onScreen(on(90, migrate));
  EXPECT_NE(onScreen(on(80, migrate))
                .find("File               read OLD read NEW kept added replaced merged written\n"
                      "V3.user.at                1        1    0     0        1      0       1\n"),
            std::string::npos)
      << onScreen(on(80, migrate));
  EXPECT_NE(onScreen(on(40, migrate))
                .find("V3.user.at\n"
                      "  read OLD 1, read NEW 1, kept 0, added\n"
                      "  0, replaced 1, merged 0, written 1\n"),
            std::string::npos)
      << onScreen(on(40, migrate));
}

TEST_F(OnTerminal, AWrappedValueStandsBelowItsBeginning) {
  EXPECT_NE(onScreen(on(60, kReports.front()))
                .find("    old     'one two three four five six seven eight nine\n"
                      "            ten eleven twelve thirteen fourteen'\n"),
            std::string::npos)
      << onScreen(on(60, kReports.front()));
}

TEST_F(OnTerminal, AnExcerptThatIsTooWideIsCutRoundItsPlace) {
  const std::string screen = onScreen(on(60, {"check", "odd"}));
  const std::vector<std::string> lines = support::splitLines(screen);
  bool isThere = false;
  for (std::size_t i = 0; i + 1 < lines.size(); ++i) {
    if (lines[i].compare(0, 5, "  ...") == 0) {
      const std::size_t caret = lines[i + 1].find('^');
      ASSERT_NE(caret, std::string::npos) << screen;
      EXPECT_EQ(lines[i].substr(caret, 7), "NOUSAGE") << screen;
      isThere = true;
    }
  }
  EXPECT_TRUE(isThere) << screen;
}

TEST_F(OnTerminal, ColourIsWhatIsAskedFor) {
  const std::vector<std::string>& diff = kReports.front();
  const auto with = [&](const std::string& when) {
    std::vector<std::string> words = diff;
    words.push_back("--color=" + when);
    return words;
  };
  const auto isColoured = [](const std::string& text) {
    return text.find("\x1b[") != std::string::npos;
  };
  EXPECT_TRUE(isColoured(on(80, diff)));
  EXPECT_FALSE(isColoured(on(80, diff, {{"NO_COLOR", "1"}})));
  EXPECT_TRUE(isColoured(on(80, diff, {{"NO_COLOR", ""}})));
  EXPECT_FALSE(isColoured(on(80, diff, {{"TERM", "dumb"}})));
  EXPECT_FALSE(isColoured(on(80, with("never"))));
  EXPECT_TRUE(isColoured(on(80, with("always"), {{"NO_COLOR", "1"}})));
}

TEST_F(OnTerminal, WhatIsNoTerminalGetsNeitherColourNorLineBreaks) {
  ::setenv("COLUMNS", "30", 1);
  const ToolResult plain = m_folder.run({"diff", "--from", "@/old", "--to", "@/new"});
  ::unsetenv("COLUMNS");
  EXPECT_EQ(plain.out.find('\x1b'), std::string::npos);
  EXPECT_NE(plain.out.find("    old     'one two three four five six seven eight nine ten eleven "
                           "twelve thirteen fourteen'\n"),
            std::string::npos);
  const ToolResult coloured =
      m_folder.run({"diff", "--from", "@/old", "--to", "@/new", "--color", "always"});
  EXPECT_NE(coloured.out.find("\x1b[1m"), std::string::npos);
  for (const char* const format : {"json", "sarif", "github"}) {
    const ToolResult document =
        m_folder.run({"check", "@/odd", "--format", format, "--color", "always"});
    EXPECT_EQ(document.out.find('\x1b'), std::string::npos) << format;
  }
  const ToolResult wrong =
      m_folder.run({"diff", "--from", "@/old", "--to", "@/new", "--color", "sometimes"});
  EXPECT_EQ(wrong.exitCode, 2);
  EXPECT_EQ(wrong.err,
            "schema-migrate: error: --color: must be auto, always or never; schema-migrate diff "
            "--help tells how it is used\n");
}

TEST_F(OnTerminal, DocumentsStayWholeLines) {
  const std::string text = on(40, {"diff", "--from", "old", "--to", "new", "--format", "json"});
  EXPECT_NE(text.find("one two three four five six seven eight nine ten eleven twelve thirteen"),
            std::string::npos);
}

// ---- Progress ----

int work(const char* first, double seconds) {
  progress::step(first);
  const auto end = std::chrono::steady_clock::now() + std::chrono::duration<double>(seconds);
  while (std::chrono::steady_clock::now() < end) {
    std::this_thread::sleep_for(std::chrono::milliseconds(5));
  }
  progress::end();
  return ::write(STDOUT_FILENO, "done\n", 5) == 5 ? 0 : 1;
}

std::string watched(double seconds, const TerminalSettings& settings = {}) {
  const ToolFolder folder;
  TerminalRun run(
      folder, [&] { return work("reading a long text", seconds); }, settings);
  std::string text = run.rest();
  EXPECT_EQ(run.exitCode(), 0);
  return text;
}

TEST(Progress, IsToldFromTheSecondSecondOnAndErased) {
  const std::string text = watched(2.5);
  EXPECT_NE(text.find("schema-migrate: reading a long text, 1 s"), std::string::npos) << text;
  EXPECT_NE(text.find("schema-migrate: reading a long text, 2 s"), std::string::npos) << text;
  EXPECT_EQ(onScreen(text), "done\n");
  EXPECT_EQ(text.find('\x1b'), std::string::npos);
}

TEST(Progress, IsNotToldOfWhatIsDoneWithinASecond) { EXPECT_EQ(watched(0.3), "done\r\n"); }

TEST(Progress, IsNotToldToATerminalThatCannotEraseIt) {
  EXPECT_EQ(watched(1.3, {80, {{"TERM", "dumb"}}}), "done\r\n");
}

TEST(Progress, FitsANarrowTerminal) {
  const std::string text = watched(1.3, {30, {}});
  EXPECT_NE(text.find("\rschema-migrate: reading a lon"), std::string::npos) << text;
  EXPECT_EQ(text.find("reading a long"), std::string::npos) << text;
  EXPECT_EQ(onScreen(text), "done\n");
}

// Two equal installations of `count` definitions.
void install(const ToolFolder& folder, std::size_t count) {
  std::string types;
  for (std::size_t i = 0; i < count; ++i) {
    const std::string number = std::to_string(i);
    types += "attributetypes=( 1." + number + " NAME 'a" + number +
             "' DESC 'd' USAGE userApplications )\n";
  }
  for (const char* const name : {"old", "new"}) {
    ::mkdir(folder.file(name).c_str(), 0777);
    folder.write(std::string(name) + "/V3.user.at", types);
  }
}

// Each command that can take long, on as much as takes it longer than a second and a half.
TEST(Progress, IsToldByTheCommandsThatTakeLong) {
  const ToolFolder folder;
  const std::vector<std::vector<std::string>> kCommands = {
      {"check", "old"},
      {"diff", "--from", "old", "--to", "new", "--stat"},
      {"plan", "--from", "old", "--to", "new", "--prefer", "new"},
      {"migrate", "--from", "old", "--to", "new", "--prefer", "new", "--dry-run", "--out", "out"},
  };
  double perDefinition = 50e-6;  // seconds, to begin with
  for (const std::vector<std::string>& command : kCommands) {
    SCOPED_TRACE(command.front());
    std::string text;
    double seconds = 0;
    for (int tries = 0; seconds < 1.6 && tries < 8; ++tries) {
      const auto count = static_cast<std::size_t>(2.0 / perDefinition);
      install(folder, count);
      const auto start = std::chrono::steady_clock::now();
      TerminalRun run(folder, command);
      text = run.rest();
      run.exitCode();
      seconds = std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
      perDefinition = seconds / static_cast<double>(count);
    }
    EXPECT_NE(text.find("\rschema-migrate: "), std::string::npos) << text.substr(0, 400);
    EXPECT_NE(text.find(", 1 s"), std::string::npos) << text.substr(0, 400);
    EXPECT_EQ(onScreen(text).find(" 1 s"), std::string::npos) << onScreen(text).substr(0, 400);
  }
}

}  // namespace
