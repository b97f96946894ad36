#include "Transcript.h"

#include <gtest/gtest.h>
#include <unistd.h>

#include <filesystem>
#include <sstream>
#include <utility>

namespace {

struct Shown {
  std::string command;
  std::string output;
  std::string exitCode = "0\n";
};

std::vector<Shown> shownBy(const std::vector<std::string>& lines) {
  std::vector<Shown> all;
  bool isExitCode = false;
  for (const std::string& line : lines) {
    if (line == "$ echo $?") {
      isExitCode = true;
    } else if (line.compare(0, 2, "$ ") == 0) {
      all.push_back({line.substr(2), ""});
      isExitCode = false;
    } else if (isExitCode) {
      all.back().exitCode = line + "\n";
    } else {
      all.back().output += line + "\n";
    }
  }
  return all;
}

}  // namespace

int replay(const ToolFolder& folder, const std::vector<std::string>& lines) {
  int runs = 0;
  for (const Shown& shown : shownBy(lines)) {
    std::istringstream words(shown.command);
    std::vector<std::string> arguments;
    for (std::string word; words >> word;) {
      arguments.push_back(word);
    }
    if (arguments[0] == "cat") {
      const std::filesystem::path file = folder.file(arguments[1]);
      std::filesystem::create_directories(file.parent_path());
      folder.write(arguments[1], shown.output);
      continue;
    }
    EXPECT_EQ("schema-migrate", arguments[0]);
    arguments.erase(arguments.begin());
    const ToolResult result =
        folder.run(arguments, [&] { static_cast<void>(!::chdir(folder.path().c_str())); });
    EXPECT_EQ(shown.exitCode, std::to_string(result.exitCode) + "\n") << shown.command;
    EXPECT_EQ("", result.err) << shown.command;
    EXPECT_EQ(shown.output, result.out) << shown.command;
    ++runs;
  }
  return runs;
}
