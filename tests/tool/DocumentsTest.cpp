// The manual pages and the help know the same commands, options and exit codes.

#include <gtest/gtest.h>

#include <cctype>
#include <filesystem>
#include <regex>
#include <set>

#include "ToolRun.h"

namespace {

using Words = std::set<std::string>;

std::string text(const Words& words) {
  std::string result;
  for (const std::string& word : words) {
    result += word + " ";
  }
  return result;
}

std::vector<std::string> helpOf(const std::string& command) {
  const ToolFolder folder;
  std::vector<std::string> arguments{"--help"};
  if (!command.empty()) {
    arguments.insert(arguments.begin(), command);
  }
  return support::splitLines(folder.run(arguments).out);
}

std::string pageOf(const std::string& command) {
  return MANUALS "/schema-migrate" + (command.empty() ? "" : "-" + command) + ".1.scd";
}

// The first groups of what matches in the lines of a section, which begins with a line `title`. It
// ends with a line that matches `end`.
Words foundIn(const std::vector<std::string>& lines, const std::string& title,
              const std::string& end, const std::string& pattern) {
  const std::regex ending(end);
  const std::regex searched(pattern);
  Words words;
  bool isInSection = false;
  for (const std::string& line : lines) {
    isInSection = line == title || (isInSection && !std::regex_match(line, ending));
    if (isInSection) {
      for (std::sregex_iterator at(line.begin(), line.end(), searched), last; at != last; ++at) {
        words.insert(at->str(1));
      }
    }
  }
  return words;
}

Words inHelp(const std::string& command, const std::string& title, const std::string& pattern) {
  return foundIn(helpOf(command), title, "", pattern);
}

Words inPage(const std::string& command, const std::string& title, const std::string& pattern) {
  return foundIn(support::splitLines(support::readWholeFile(pageOf(command))), "# " + title, "# .*",
                 pattern);
}

Words commandsOfHelp() { return inHelp("", "Subcommands:", "^  ([a-z]+) "); }

TEST(Manual, HasAPageForEachCommand) {
  const Words commands = commandsOfHelp();
  EXPECT_EQ(1U, commands.count("check"));
  EXPECT_EQ(text(commands), text(inPage("", "COMMANDS", "^\\*([a-z]+)\\*$")));
  Words pages;
  for (const auto& entry : std::filesystem::directory_iterator(MANUALS)) {
    std::smatch match;
    const std::string name = entry.path().filename().string();
    if (std::regex_match(name, match, std::regex("schema-migrate-([a-z]+)\\.1\\.scd"))) {
      pages.insert(match.str(1));
    }
  }
  EXPECT_EQ(text(commands), text(pages));
}

TEST(Manual, KnowsTheOptionsThatHelpKnows) {
  Words commands = commandsOfHelp();
  commands.insert("");
  for (const std::string& command : commands) {
    const Words ofHelp = inHelp(command, "Options:", "^  (?:-h,)?(--[a-z-]+)");
    EXPECT_EQ(1U, ofHelp.count("--help")) << command;
    EXPECT_EQ(text(ofHelp), text(inPage(command, "OPTIONS", "^(?:\\*-h\\*, )?\\*(--[a-z-]+)\\*")))
        << command;
  }
}

TEST(Manual, KnowsTheExitCodesThatHelpKnows) {
  Words commands = commandsOfHelp();
  commands.insert("");
  for (const std::string& command : commands) {
    const Words ofHelp = inHelp(command, "Exit codes:", "^  ([0-9]+)  ");
    EXPECT_EQ(1U, ofHelp.count("0")) << command;
    EXPECT_EQ(text(ofHelp), text(inPage(command, "EXIT STATUS", "^\\*([0-9]+)\\*$"))) << command;
  }
}

TEST(Manual, ExitCodesAreThoseThatAreSettled) {
  const std::pair<const char*, const char*> kCodes[] = {
      {"", "0 1 2 3 4 5 "},      {"check", "0 1 2 3 5 "},  {"show", "0 1 2 3 5 "},
      {"explain", "0 2 5 "},     {"diff", "0 1 2 3 4 5 "}, {"plan", "0 2 3 4 5 "},
      {"migrate", "0 2 3 4 5 "}, {"completion", "0 2 5 "},
  };
  for (const auto& [command, codes] : kCodes) {
    EXPECT_EQ(codes, text(inHelp(command, "Exit codes:", "^  ([0-9]+)  "))) << command;
  }
}

}  // namespace
