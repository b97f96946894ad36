// Files that are larger than anything in a real installation: the run comes to an end, and what
// it takes of memory is a small multiple of the file. With LARGE_INPUTS=1 in the environment, the
// sizes are the full ones: 1 GiB of blanks, 100 MiB in one quoted string.

#include <gtest/gtest.h>
#include <unistd.h>

#include <algorithm>
#include <cstdint>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iostream>

#include "ToolRun.h"

namespace {

constexpr std::size_t kMiB = std::size_t{1} << 20;

bool isFullSize() { return std::getenv("LARGE_INPUTS") != nullptr; }
std::size_t blanksSize() { return (isFullSize() ? 1024 : 64) * kMiB; }
std::size_t stringSize() { return (isFullSize() ? 100 : 32) * kMiB; }

struct Row {
  const char* name;
  const char* file;  // where it stands
  const char* beginning;
  char repeated;
  const char* end;
  int exitCode;
  const char* err;  // its end; "#" stands for the size in bytes
};

void PrintTo(const Row& row, std::ostream* out) { *out << row.name; }

const Row kRows[] = {
    {"Blanks", "old/V3.user.at", "", ' ', "", 0, ""},
    {"BlanksBeforeADefinition", "new/V3.system.at", "", '\n',
     "attributetypes=( 1.9 NAME 'z' OBSOLETE )\n", 0, ""},
    {"BlanksInACopiedFile", "new/V3.config.at", "", ' ', "\n", 0, ""},
    {"BlanksInAList", "list", "", ' ', "\n", 0, ""},
    {"Description", "old/V3.user.at", "attributetypes=( 1.9 NAME 'z' DESC '", 'x', "' )\n", 0, ""},
    {"DescriptionInNew", "new/V3.user.at", "attributetypes=( 1.9 NAME 'z' DESC '", 'x', "' )\n", 0,
     ""},
    {"DescriptionOfAClass", "old/V3.user.oc", "objectclasses=( 1.9 NAME 'z' DESC '", 'x', "' )\n",
     0, ""},
    {"TextBetweenDefinitions", "old/V3.user.at", "'", 'x', "'\n", 4,
     "that is meant [L109]\nschema-migrate: error: refused: nothing was written; what can be mended without changing what is said, --repair mends in private copies; a .schema-migrate.toml in the directory accepts what is meant so\n"},
    {"StringThatIsNotClosed", "old/V3.user.at", "attributetypes=( 1.9 NAME 'z' DESC '", 'x', "", 3,
     "@/old/V3.user.at:1:#: error: the server's library fails to read this file, and stops here\n"},
};

class LargeInput : public testing::TestWithParam<Row> {
 protected:
  bool isBlank() const { return GetParam().repeated == ' ' || GetParam().repeated == '\n'; }
  std::size_t size() const { return isBlank() ? blanksSize() : stringSize(); }

  // In pieces: what this process has when it starts the program counts as the program's.
  void write(const std::string& name) const {
    std::ofstream out(folder.file(name), std::ios::binary);
    const std::string piece(kMiB, GetParam().repeated);
    out << GetParam().beginning;
    for (std::size_t done = 0; done < size(); done += piece.size()) {
      out << piece;
    }
    out << GetParam().end << std::flush;
    ASSERT_TRUE(out.good());
  }

  ToolFolder folder;
};

TEST_P(LargeInput, TakesLittleMoreMemoryThanItsCopies) {
  const Row& row = GetParam();
  folder.install("old", {{"V3.user.at", "attributetypes=( 1.1 NAME 'a' OBSOLETE )\n"}});
  folder.install("new", {{"V3.user.at", "attributetypes=( 1.2 NAME 'b' OBSOLETE )\n"}});
  folder.write("list", "");
  write(row.file);
  const ToolResult result = folder.migrate({"--exclude-oids", "@/list", "--max-input", "2G"}, [] {
    // What is freed goes back at once, also in a build with the address sanitizer.
    ::setenv("ASAN_OPTIONS", "quarantine_size_mb=0:thread_local_quarantine_size_kb=0", 1);
    ::alarm(600);
  });
  EXPECT_EQ(row.exitCode, result.exitCode);
  std::string err = row.err;
  const std::size_t column = std::string(row.beginning).size() + size() + 1;
  if (const std::size_t at = err.find('#'); at != std::string::npos) {
    err.replace(at, 1, std::to_string(column));
  }
  const std::size_t end =
      err.empty() ? 0 : result.err.size() - std::min(err.size(), result.err.size());
  EXPECT_EQ(err, result.err.substr(end));
  // Of a definition that is carried over: OLD and what is kept of it, what becomes of it and its
  // text, both layouts, and the reading of a layout with the token that is read. Of what is
  // refused: the text, and what is kept of it.
#ifdef __SANITIZE_ADDRESS__
  const std::uintmax_t kCopies = 15;
#else
  const std::uintmax_t kCopies = isBlank() ? 5 : row.exitCode == 0 ? 11 : 4;
#endif
  EXPECT_LT(result.peakBytes, kCopies * std::filesystem::file_size(folder.file(row.file)));
  EXPECT_EQ(row.exitCode == 0, std::filesystem::exists(folder.file("out")));
  std::cout << row.name << ": " << size() / kMiB << " MiB, at most " << result.peakBytes / kMiB
            << " MiB of memory\n";
}

INSTANTIATE_TEST_SUITE_P(Rows, LargeInput, testing::ValuesIn(kRows),
                         [](const auto& row) { return std::string(row.param.name); });

}  // namespace
