// One system call of a run fails, whichever it is.

#include <gtest/gtest.h>
#include <sys/syscall.h>
#include <unistd.h>

#include <cerrno>
#include <filesystem>

#include "CallWatch.h"
#include "Machine.h"
#include "ToolRun.h"

namespace {

class CallFault : public testing::Test {
 protected:
  CallFault() {
    ToolFolder::Files old = {{"V3.user.at", "attributetypes=( 1.1 NAME 'a' OBSOLETE )\n"},
                             {"V3.user.oc", "objectclasses=( 1.4 NAME 'c' ABSTRACT )\n"}};
    folder.install("old", old);
    folder.install("new", {{"V3.system.at", "attributetypes=( 1.2 NAME 's' OBSOLETE )\n"},
                           {"V3.config.at", "# config\n"}});
    inputs = folder.snapshot();
    EXPECT_EQ(0, folder.migrate().exitCode);
    whole = folder.contents("out");
    std::filesystem::remove_all(folder.file("out"));
  }

  // A run whose `number`th of these calls fails with `error`; 0 for none. Returns its exit code.
  int runWith(const std::vector<int>& calls, int number, int error) {
    CallWatch watch(calls);
    const pid_t process = folder.startMigrate("old", "out", [&] {
      watch.begin();
      ::alarm(20);
    });
    count = watch.serve(process, [&](int at, int) { return at == number ? error : 0; });
    const int exitCode = exitCodeOf(process);
    isThere = std::filesystem::exists(folder.file("out"));
    EXPECT_EQ(isThere ? whole : ToolFolder::Files(), folder.contents("out"));
    std::filesystem::remove_all(folder.file("out"));
    err = folder.complaintsOf("out");
    return exitCode;
  }

  ToolFolder folder;
  std::string inputs;
  ToolFolder::Files whole;
  int count = 0;  // of the calls in the last run
  bool isThere = false;
  std::string err;
};

// So many entries that the listing takes several calls: the names that come after a failure must
// not be missing without a word.
TEST_F(CallFault, ListingThatFailsPartWay) {
  SKIP_UNLESS_MACHINE_CAN(kFilterSystemCalls);
  for (int i = 0; i < 2000; ++i) {
    folder.write("old/0-some-other-file-with-a-long-name-" + std::to_string(i), "");
  }
  EXPECT_EQ(0, runWith({SYS_getdents64}, 0, 0));
  const int calls = count;
  int ofOld = 0;
  for (int number = 1; number <= calls; ++number) {
    SCOPED_TRACE("listing " + std::to_string(number) + " of " + std::to_string(calls));
    const int exitCode = runWith({SYS_getdents64}, number, EIO);
    EXPECT_EQ(exitCode == 0, isThere);
    if (exitCode != 0) {
      EXPECT_NE(std::string::npos, err.find(": Input/output error\n")) << err;
    }
    ofOld +=
        err == "@/old: error: the directory cannot be read: Input/output error\n" && exitCode == 3
            ? 1
            : 0;
    folder.removePrivateCopies();
  }
  EXPECT_GE(ofOld, 3);
  RecordProperty("listings", calls);
}

// Eight files, the directory, and the directory that it lies in.
TEST_F(CallFault, SyncThatFails) {
  SKIP_UNLESS_MACHINE_CAN(kFilterSystemCalls);
  constexpr int kSyncs = 10;
  for (int number = 1; number <= kSyncs; ++number) {
    SCOPED_TRACE("sync " + std::to_string(number));
    EXPECT_EQ(5, runWith({SYS_fsync}, number, EIO));
    EXPECT_EQ(number == kSyncs, isThere);
    const char* const text =
        number == kSyncs
            ? "@/out: error: is complete and in place, but its entry cannot be brought to the disk: Input/output error\n"
            : ": error: cannot be brought to the disk: Input/output error\n";
    EXPECT_NE(std::string::npos, err.find(text)) << err;
    EXPECT_EQ("", folder.privateCopies());
    EXPECT_EQ(inputs, folder.snapshot());
  }
  EXPECT_EQ(0, runWith({SYS_fsync}, 0, 0));
  EXPECT_EQ(kSyncs, count);
}

// Each of the calls by which something is made, given a mode or a name.
TEST_F(CallFault, ChangeThatFails) {
  SKIP_UNLESS_MACHINE_CAN(kFilterSystemCalls);
  const std::vector<int> calls = {SYS_mkdirat, SYS_fchmod, SYS_renameat2};
  EXPECT_EQ(0, runWith(calls, 0, 0));
  const int changes = count;
  int failed = 0;
  for (int number = 1; number <= changes; ++number) {
    for (const int error : {ENOSPC, EACCES, EROFS}) {
      SCOPED_TRACE("change " + std::to_string(number) + ", error " + std::to_string(error));
      const int exitCode = runWith(calls, number, error);
      EXPECT_TRUE(exitCode == 0 || exitCode == 5) << exitCode;
      EXPECT_EQ(exitCode == 0, isThere);
      failed += exitCode == 5 && !err.empty() ? 1 : 0;
      EXPECT_EQ("", folder.privateCopies());
      EXPECT_EQ(inputs, folder.snapshot());
    }
  }
  // Where the first place for private copies cannot be had, another is taken.
  EXPECT_EQ(3 * (changes - 1), failed);
}

// The lock only tells other runs that this one is under way.
TEST_F(CallFault, LockThatCannotBeHad) {
  SKIP_UNLESS_MACHINE_CAN(kFilterSystemCalls);
  for (const int error : {ENOSYS, ENOLCK, EOPNOTSUPP, EINVAL}) {
    const ToolResult result = folder.migrate({}, [&] { failSystemCalls({SYS_flock}, error); });
    EXPECT_EQ(0, result.exitCode);
    EXPECT_EQ("", result.err);
    EXPECT_EQ(whole, folder.contents("out"));
    std::filesystem::remove_all(folder.file("out"));
  }
  folder.install(".out.partial-abcdef", {});
  const ToolResult result = folder.migrate({}, [] { failSystemCalls({SYS_flock}, ENOLCK); });
  EXPECT_EQ(0, result.exitCode);
  EXPECT_EQ(
      "@/.out.partial-abcdef: warning: left behind by a run that was killed, or being written by one that is under way, which cannot be told here; it is not used, and can be removed once no other run is\n",
      result.err);
}

}  // namespace
