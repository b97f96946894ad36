// The manual page and the help of each command know the same options and exit codes.

#include <gtest/gtest.h>

#include <cctype>
#include <set>

#include "ToolRun.h"

namespace {

using Words = std::set<std::string>;

// The options in a text: words that begin with "--".
Words optionsIn(const std::string& text) {
  Words options;
  for (std::size_t at = 0; (at = text.find("--", at)) != std::string::npos;) {
    std::size_t end = at + 2;
    while (end < text.size() &&
           (std::islower(static_cast<unsigned char>(text[end])) != 0 || text[end] == '-')) {
      ++end;
    }
    const bool isWord =
        end > at + 2 && (at == 0 || std::isspace(static_cast<unsigned char>(text[at - 1])) != 0 ||
                         text[at - 1] == ',' || text[at - 1] == '"');
    if (isWord) {
      options.insert(text.substr(at, end - at));
    }
    at = end;
  }
  return options;
}

std::string unescaped(std::string text) {
  for (std::size_t at = 0; (at = text.find("\\-", at)) != std::string::npos; ++at) {
    text.erase(at, 1);
  }
  return text;
}

// The tagged options of a section of the manual page: the line behind each ".TP".
Words optionsOfManual(const std::string& section) {
  Words options;
  bool isInSection = false;
  bool isTag = false;
  for (const std::string& line : support::splitLines(support::readWholeFile(MANUAL))) {
    if (line.compare(0, 4, ".SH ") == 0) {
      isInSection = line == ".SH " + section;
    }
    if (isInSection && isTag) {
      options.merge(optionsIn(unescaped(line)));
    }
    isTag = line == ".TP";
  }
  return options;
}

// The options in the list of a command's help.
Words optionsOfHelp(const std::string& command) {
  const ToolFolder folder;
  Words options;
  bool isInList = false;
  for (const std::string& line : support::splitLines(folder.run({command, "--help"}).out)) {
    if (line == "Options:") {
      isInList = true;
    } else if (line.empty()) {
      isInList = false;
    } else if (isInList && line.compare(0, 3, "  -") == 0) {
      options.merge(optionsIn(line.substr(0, line.find(' ', 2))));
    }
  }
  return options;
}

std::string text(const Words& words) {
  std::string result;
  for (const std::string& word : words) {
    result += word + " ";
  }
  return result;
}

TEST(Manual, KnowsTheOptionsThatHelpKnows) {
  const std::pair<const char*, const char*> kCommands[] = {
      {"check", "CHECK"}, {"show", "SHOW"}, {"explain", "EXPLAIN"}, {"migrate", "MIGRATE"},
      {"diff", "DIFF"},   {"plan", "PLAN"}, {"verify", "VERIFY"}};
  for (const auto& [command, section] : kCommands) {
    const Words ofHelp = optionsOfHelp(command);
    EXPECT_NE(0U, ofHelp.count("--help")) << command;
    Words ofManual = optionsOfManual(section);
    ofManual.erase("--version");
    EXPECT_EQ(text(ofHelp), text(ofManual)) << command;
  }
}

// The first words of the lines below "Exit codes:".
Words exitCodesOfHelp(const std::string& command) {
  const ToolFolder folder;
  Words codes;
  bool isInList = false;
  for (const std::string& line : support::splitLines(folder.run({command, "--help"}).out)) {
    isInList = line == "Exit codes:" || (isInList && !line.empty());
    if (isInList && line.size() > 2 && std::isdigit(static_cast<unsigned char>(line[2])) != 0) {
      codes.insert(line.substr(2, 1));
    }
  }
  return codes;
}

TEST(Manual, KnowsTheExitCodesThatHelpKnows) {
  Words ofManual;
  bool isInSection = false;
  for (const std::string& line : support::splitLines(support::readWholeFile(MANUAL))) {
    if (line.compare(0, 4, ".SH ") == 0) {
      isInSection = line == ".SH EXIT STATUS";
    } else if (isInSection && line.compare(0, 3, ".B ") == 0 && line.size() == 4) {
      ofManual.insert(line.substr(3));
    }
  }
  EXPECT_EQ("0 1 2 3 4 5 ", text(ofManual));
  EXPECT_EQ("0 1 2 3 5 ", text(exitCodesOfHelp("check")));
  EXPECT_EQ("0 1 2 3 5 ", text(exitCodesOfHelp("show")));
  EXPECT_EQ("0 2 5 ", text(exitCodesOfHelp("explain")));
  EXPECT_EQ("0 2 3 4 5 ", text(exitCodesOfHelp("migrate")));
  EXPECT_EQ("0 1 2 3 4 5 ", text(exitCodesOfHelp("diff")));
  EXPECT_EQ("0 1 2 3 5 ", text(exitCodesOfHelp("verify")));
  EXPECT_EQ("0 2 3 4 5 ", text(exitCodesOfHelp("plan")));
}

}  // namespace
