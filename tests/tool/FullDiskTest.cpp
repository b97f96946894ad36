// A disk that is full, at whatever point of the run: the output directory is there whole or not at
// all, nothing is left beside it, and the inputs are what they were.

#include <gtest/gtest.h>
#include <sys/resource.h>
#include <sys/syscall.h>
#include <unistd.h>

#include <cerrno>
#include <cstdio>
#include <filesystem>

#include "Machine.h"
#include "SmallFileSystem.h"
#include "ToolRun.h"

namespace {

constexpr char kNotWritten[] = ": error: cannot be written: No space left on device\n";
constexpr char kNotCreated[] = ": error: cannot be created: No space left on device\n";

class FullDisk : public testing::Test {
 protected:
  FullDisk() {
    std::string types;
    for (int i = 0; i < 200; ++i) {
      const std::string number = std::to_string(i);
      types += "attributetypes=( 1.3." + number + " NAME 'n" + number + "' DESC 'd' )\n";
    }
    folder.install("old", {{"V3.user.at", types},
                           {"V3.user.oc", "objectclasses=( 1.4 NAME 'c' ABSTRACT )\n"}});
    folder.install("new", {{"V3.system.at", "attributetypes=( 1.2 NAME 's' OBSOLETE )\n"},
                           {"V3.config.at", std::string(9000, '#') + "\n"}});
    EXPECT_EQ(0, folder.migrate().exitCode);
    whole = folder.contents("out");
    EXPECT_EQ(8U, whole.size());
    std::filesystem::remove_all(folder.file("out"));
  }

  // A run to @/small/out; returns what it says when it fails, which must end in exit code 5 with
  // nothing left, and "" when the output is there whole.
  std::string migrateWith(const std::function<void()>& prepare) {
    const std::string before = folder.snapshot();
    const ToolResult result = folder.run({"migrate", "--from", "@/old", "--to", "@/new", "--layout",
                                          "library", "--out", "@/small/out"},
                                         prepare);
    if (result.exitCode == 0) {
      EXPECT_EQ("", result.err);
      EXPECT_EQ(whole, folder.contents("small/out"));
      std::filesystem::remove_all(folder.file("small/out"));
    } else {
      EXPECT_EQ(5, result.exitCode);
      EXPECT_NE("", result.err);
    }
    EXPECT_EQ(before, folder.snapshot());
    return result.err;
  }

  void expectIn(const std::string& part, const std::string& text) {
    EXPECT_NE(std::string::npos, text.find(part)) << text;
  }

  ToolFolder folder;
  ToolFolder::Files whole;
};

// Of a file system, either the inodes run out, at each of the directories and files that a run
// makes, or the blocks, at each of those that its files take.
TEST_F(FullDisk, FileSystemThatIsTooSmall) {
  SKIP_UNLESS_MACHINE_CAN(kMountFileSystems);
  folder.install("small", {});
  const auto migrateOn = [&](const std::string& options) {
    const support::SmallFileSystem small(folder.file("small"), options);
    return migrateWith(nullptr);
  };
  EXPECT_EQ(
      "@/small/out: error: the output directory cannot be created in @/small: No space left on device\n",
      migrateOn("size=1m,nr_inodes=1"));
  for (int files = 0; files < 7; ++files) {
    expectIn(kNotCreated, migrateOn("size=1m,nr_inodes=" + std::to_string(2 + files)));
  }
  expectIn("/V3.config.at: error: cannot be created: No space left on device\n",
           migrateOn("size=1m,nr_inodes=9"));
  EXPECT_EQ("", migrateOn("size=1m,nr_inodes=10"));
  int pages = 1;
  std::string err = migrateOn("size=4k");
  for (; !err.empty() && pages < 50; ++pages) {
    SCOPED_TRACE(std::to_string(4 * pages) + " KiB");
    expectIn(kNotWritten, err);
    err = migrateOn("size=" + std::to_string(4 * (pages + 1)) + "k");
  }
  EXPECT_EQ("", err);
  EXPECT_GT(pages, 6);
  RecordProperty("pages", pages);
}

// A limit on the size of each file cuts it off after any number of bytes.
TEST_F(FullDisk, FileThatIsCutOff) {
  folder.install("small", {});
  int cutOff = 0;
  std::string err = "none yet";
  for (rlim_t bytes = 499; !err.empty() && bytes < 50000; bytes += 499) {
    SCOPED_TRACE(std::to_string(bytes) + " bytes");
    err = migrateWith([&] {
      if (::freopen("/dev/null", "w", stdout) == nullptr) {
        ::_exit(125);
      }
      const rlimit limit{bytes, bytes};
      ::setrlimit(RLIMIT_FSIZE, &limit);
    });
    cutOff += err.empty() ? 0 : 1;
  }
  EXPECT_EQ("", err);
  EXPECT_GT(cutOff, 20);
  RecordProperty("limits", cutOff);
}

struct Row {
  const char* name;
  std::vector<int> systemCalls;
  const char* problem;
};

void PrintTo(const Row& row, std::ostream* out) { *out << row.name; }

const Row kRows[] = {
    // Where room is given to a file only when it goes to the disk.
    {"WhenAFileGoesToTheDisk",
     {SYS_fsync},
     ": error: cannot be brought to the disk: No space left on device\n"},
    {"WhenTheDirectoryGetsItsName",
     {SYS_renameat2},
     "@/small/out: error: the finished directory cannot be renamed to this: No space left on device\n"},
};

class FullDiskAtACall : public FullDisk, public testing::WithParamInterface<Row> {};

TEST_P(FullDiskAtACall, LeavesNothing) {
  SKIP_UNLESS_MACHINE_CAN(kFilterSystemCalls);
  folder.install("small", {});
  expectIn(GetParam().problem,
           migrateWith([] { failSystemCalls(GetParam().systemCalls, ENOSPC); }));
}

INSTANTIATE_TEST_SUITE_P(Rows, FullDiskAtACall, testing::ValuesIn(kRows),
                         [](const auto& row) { return std::string(row.param.name); });

}  // namespace
