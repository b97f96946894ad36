// The examples in the man page do what the man page says.

#include <gtest/gtest.h>

#include "ToolRun.h"
#include "Transcript.h"

namespace {

// The lines of the examples, as they are shown.
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

TEST(Manual, ExamplesAreTrue) {
  const ToolFolder folder;
  EXPECT_EQ(4, replay(folder, exampleLines()));
  EXPECT_EQ(7U, folder.contents("migrated").size());
}

}  // namespace
