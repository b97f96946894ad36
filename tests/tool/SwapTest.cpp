// Somebody puts something else in the place of what a run reads or writes, at each of its system
// calls: nothing but the output is written, changed or removed, what is published is this run's,
// and the run comes to its end.

#include <gtest/gtest.h>
#include <sys/stat.h>
#include <sys/syscall.h>
#include <unistd.h>

#include <filesystem>

#include "CallWatch.h"
#include "Machine.h"
#include "ToolRun.h"

namespace {

namespace fs = std::filesystem;

const ToolFolder::Files kOld = {{"V3.user.at", "attributetypes=( 1.1 NAME 'a' OBSOLETE )\n"}};
const ToolFolder::Files kNew = {{"V3.user.at", "attributetypes=( 1.2 NAME 'b' OBSOLETE )\n"},
                                {"V3.config.at", "# config\n"}};

class Swap : public testing::Test {
 protected:
  Swap() {
    folder.install("old", kOld);
    folder.install("new", kNew);
    folder.install("victim", {{"V3.user.at", "precious\n"}, {"V3.orv.oc", "precious\n"}});
    before = folder.snapshot();
    EXPECT_EQ(0, folder.migrate().exitCode);
    whole = folder.contents("out");
    fs::remove_all(folder.file("out"));
  }

  // A run to @/p/out; before each of these calls, `act` gets its number. Returns its exit code.
  int runWith(const std::vector<int>& calls, const std::function<void(int)>& act) {
    CallWatch watch(calls);
    const pid_t process = folder.startMigrate("old", "p/out", [&] {
      watch.begin();
      ::alarm(20);
    });
    count = watch.serve(process, [&](int number, int) {
      act(number);
      return 0;
    });
    return exitCodeOf(process);
  }

  ToolFolder folder;
  std::string before;
  ToolFolder::Files whole;
  int count = 0;
};

// ---- The output ----

struct Row {
  const char* name;
  // Puts something in the place of the directory that is being written, @/p/`partial`.
  void (*put)(const ToolFolder& folder, const std::string& partial);
};

void PrintTo(const Row& row, std::ostream* out) { *out << row.name; }

const Row kRows[] = {
    {"Link",
     [](const ToolFolder& f, const std::string& partial) {
       fs::rename(f.file("p/" + partial), f.file("p/moved"));
       fs::create_directory_symlink(f.file("victim"), f.file("p/" + partial));
     }},
    {"DirectoryWithFiles",
     [](const ToolFolder& f, const std::string& partial) {
       fs::rename(f.file("p/" + partial), f.file("p/moved"));
       f.install("p/" + partial, {{"V3.user.at", "forged\n"}});
     }},
    {"File",
     [](const ToolFolder& f, const std::string& partial) {
       fs::rename(f.file("p/" + partial), f.file("p/moved"));
       f.write("p/" + partial, "forged\n");
     }},
    {"Nothing",
     [](const ToolFolder& f, const std::string& partial) {
       fs::rename(f.file("p/" + partial), f.file("p/moved"));
     }},
    {"DirectoryAboveIt",
     [](const ToolFolder& f, const std::string&) {
       fs::rename(f.file("p"), f.file("moved-p"));
       fs::create_directory(f.file("p"));
     }},
};

class SwapOfTheOutput : public Swap, public testing::WithParamInterface<Row> {
 protected:
  // The name of the directory that is being written, or "".
  std::string partial() const {
    for (const auto& entry : fs::directory_iterator(folder.file("p"))) {
      const std::string name = entry.path().filename().string();
      if (name.compare(0, 13, ".out.partial-") == 0) {
        return name;
      }
    }
    return "";
  }

  // What was in the way of the run is what it was, and nothing of the run is left but empty
  // directories that were taken away from it.
  void expectNothingElse() {
    for (const char* const name : {"p/moved", "moved-p"}) {
      if (!fs::exists(folder.file(name))) {
        continue;
      }
      for (const auto& entry : fs::recursive_directory_iterator(folder.file(name))) {
        EXPECT_TRUE(entry.is_directory()) << entry.path();
        EXPECT_EQ(std::string::npos, entry.path().string().find("/out")) << entry.path();
      }
    }
    EXPECT_EQ("", folder.privateCopies());
    fs::remove_all(folder.file("p"));
    fs::remove_all(folder.file("moved-p"));
    EXPECT_EQ(before, folder.snapshot());
  }
};

TEST_P(SwapOfTheOutput, PublishesNothingElse) {
  SKIP_UNLESS_MACHINE_CAN(kFilterSystemCalls);
  const std::vector<int> calls = {SYS_mkdirat,   SYS_openat,   SYS_fchmod,
                                  SYS_renameat2, SYS_unlinkat, SYS_fsync};
  // An undisturbed run: from when to when there is something to take away.
  int first = 0;
  int last = 0;
  folder.install("p", {});
  EXPECT_EQ(0, runWith(calls, [&](int number) {
              if (!partial().empty()) {
                first = first == 0 ? number : first;
                last = number;
              }
            }));
  expectNothingElse();
  int swaps = 0;
  int refused = 0;
  for (int number = first; number <= last; ++number) {
    SCOPED_TRACE("call " + std::to_string(number));
    folder.install("p", {});
    std::string name;
    const int exitCode = runWith(calls, [&](int at) {
      if (at == number) {
        name = partial();
        GetParam().put(folder, name);
      }
    });
    ++swaps;
    refused += exitCode == 5 ? 1 : 0;
    EXPECT_TRUE(exitCode == 0 || exitCode == 5) << exitCode;
    EXPECT_EQ(exitCode == 0 ? whole : ToolFolder::Files(), folder.contents("p/out"));
    EXPECT_EQ(exitCode == 0, fs::exists(fs::symlink_status(folder.file("p/out"))));
    EXPECT_EQ(exitCode == 0, folder.complaintsOf("p/out").empty()) << folder.complaintsOf("p/out");
    if (fs::is_regular_file(folder.file("p/" + name + "/V3.user.at"))) {
      EXPECT_NE(ToolFolder::Files(), folder.contents("p/" + name));
    }
    expectNothingElse();
    ASSERT_FALSE(HasFailure());
  }
  // The name is looked for when it is made, opened, renamed and removed.
  EXPECT_GT(swaps, 20);
  EXPECT_GT(refused, swaps / 2);
  RecordProperty("swaps", swaps);
}

INSTANTIATE_TEST_SUITE_P(Rows, SwapOfTheOutput, testing::ValuesIn(kRows),
                         [](const auto& row) { return std::string(row.param.name); });

// ---- The inputs ----

struct InputRow {
  const char* name;
  int call;  // before each of which it is done
  void (*put)(const ToolFolder& folder);
  bool isChange;  // of the file itself
};

void PrintTo(const InputRow& row, std::ostream* out) { *out << row.name; }

constexpr off_t kEndless = off_t{1} << 40;

const InputRow kInputRows[] = {
    {"Fifo", SYS_openat,
     [](const ToolFolder& f) {
       fs::remove(f.file("old/V3.user.at"));
       EXPECT_EQ(0, ::mkfifo(f.file("old/V3.user.at").c_str(), 0666));
     },
     false},
    {"TextThatHardlyEnds", SYS_openat,
     [](const ToolFolder& f) {
       fs::remove(f.file("old/V3.user.at"));
       f.write("old/V3.user.at", "");
       EXPECT_EQ(0, ::truncate(f.file("old/V3.user.at").c_str(), kEndless));
     },
     false},
    {"DefinitionThatNeverEnds", SYS_openat,
     [](const ToolFolder& f) {
       fs::remove(f.file("old/V3.user.at"));
       f.write("old/V3.user.at", "attributetypes=( 1.1 NAME 'a' COLLECTIVE )\n");
     },
     false},
    {"FileThatBecomesLonger", SYS_read,
     [](const ToolFolder& f) {
       f.write("old/V3.user.at", kOld.at("V3.user.at") + kOld.at("V3.user.at"));
     },
     true},
    {"FileThatBecomesEndless", SYS_read,
     [](const ToolFolder& f) {
       EXPECT_EQ(0, ::truncate(f.file("old/V3.user.at").c_str(), kEndless));
     },
     true},
    {"FileThatBecomesEmpty", SYS_read, [](const ToolFolder& f) { f.write("old/V3.user.at", ""); },
     true},
    {"DirectoryOfOld", SYS_openat,
     [](const ToolFolder& f) {
       fs::rename(f.file("old"), f.file("old-moved"));
       EXPECT_EQ(0, ::mkfifo(f.file("old").c_str(), 0666));
     },
     false},
};

class SwapOfAnInput : public Swap, public testing::WithParamInterface<InputRow> {};

TEST_P(SwapOfAnInput, EndsInAResultOrAMessage) {
  SKIP_UNLESS_MACHINE_CAN(kFilterSystemCalls);
  int undisturbed = 0;
  int told = 0;
  bool isChangeTold = false;
  folder.install("p", {});
  EXPECT_EQ(0, runWith({GetParam().call}, [](int) {}));
  fs::remove_all(folder.file("p"));
  // What is put there stays there, so that the first moments after the reading stand for the later.
  for (int number = 1, last = count; number <= last && undisturbed < 10; ++number) {
    SCOPED_TRACE("call " + std::to_string(number));
    folder.install("p", {});
    const int exitCode = runWith({GetParam().call}, [&](int at) {
      if (at == number) {
        GetParam().put(folder);
      }
    });
    const std::string err = folder.complaintsOf("p/out");
    EXPECT_TRUE(exitCode == 0 || exitCode == 3) << exitCode << err;
    EXPECT_EQ(exitCode == 0, err.empty()) << err;
    told += exitCode == 3 ? 1 : 0;
    const bool isBehind = told > 0;  // behind the first moment of the reading
    undisturbed += isBehind && exitCode == 0 && folder.contents("p/out") == whole ? 1 : 0;
    isChangeTold =
        isChangeTold ||
        err ==
            "@/old/V3.user.at: error: changed while it was read; try again when nothing writes to it\n";
    EXPECT_EQ(exitCode == 0, fs::exists(folder.file("p/out")));
    EXPECT_EQ("", folder.privateCopies());
    fs::remove_all(folder.file("p"));
    fs::remove_all(folder.file("old"));
    fs::remove_all(folder.file("old-moved"));
    folder.install("old", kOld);
    ASSERT_FALSE(HasFailure());
  }
  EXPECT_EQ(10, undisturbed);
  EXPECT_GT(told, 0);
  EXPECT_TRUE(isChangeTold || !GetParam().isChange);
  RecordProperty("told", told);
}

INSTANTIATE_TEST_SUITE_P(Rows, SwapOfAnInput, testing::ValuesIn(kInputRows),
                         [](const auto& row) { return std::string(row.param.name); });

}  // namespace
