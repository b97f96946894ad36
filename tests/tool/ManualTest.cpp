// The example in the man page does what the man page says.

#include <gtest/gtest.h>
#include <unistd.h>

#include <filesystem>
#include <sstream>

#include "ToolRun.h"

namespace {

// The lines of the example, as they are shown.
std::vector<std::string> exampleLines() {
  std::vector<std::string> lines;
  bool isInExample = false;
  for (std::string line : support::splitLines(support::readWholeFile(MANUAL))) {
    if (line == ".EX" || line == ".EE") {
      isInExample = line == ".EX";
      continue;
    }
    for (std::size_t at = 0; (at = line.find("\\-", at)) != std::string::npos;) {
      line.erase(at, 1);
    }
    if (isInExample) {
      lines.push_back(line);
    }
  }
  return lines;
}

// The commands of the example, each with what it prints.
std::vector<std::pair<std::string, std::string>> exampleCommands() {
  std::vector<std::pair<std::string, std::string>> commands;
  for (const std::string& line : exampleLines()) {
    if (line.compare(0, 2, "$ ") == 0) {
      commands.emplace_back(line.substr(2), "");
    } else {
      commands.back().second += line + "\n";
    }
  }
  return commands;
}

TEST(Manual, ExampleIsTrue) {
  const ToolFolder folder;
  int runs = 0;
  for (const auto& [command, output] : exampleCommands()) {
    std::istringstream words(command);
    std::vector<std::string> arguments;
    for (std::string word; words >> word;) {
      arguments.push_back(word);
    }
    if (arguments[0] == "cat") {
      const std::filesystem::path file = folder.file(arguments[1]);
      std::filesystem::create_directories(file.parent_path());
      folder.write(arguments[1], output);
      continue;
    }
    ASSERT_EQ("schema-migrate", arguments[0]);
    arguments.erase(arguments.begin());
    const ToolResult result =
        folder.run(arguments, [&] { static_cast<void>(!::chdir(folder.path().c_str())); });
    EXPECT_EQ(0, result.exitCode);
    EXPECT_EQ("", result.err);
    EXPECT_EQ(output, result.out);
    ++runs;
  }
  EXPECT_EQ(1, runs);
  EXPECT_EQ(7U, folder.contents("migrated").size());
}

}  // namespace
