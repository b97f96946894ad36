// Runs that are killed, interrupted, or made side by side.

#include <gtest/gtest.h>
#include <sys/wait.h>
#include <unistd.h>

#include <chrono>
#include <csignal>
#include <filesystem>
#include <random>

#include "Machine.h"
#include "ToolRun.h"
#include "TracedRun.h"

namespace {

constexpr char kInterrupted[] =
    "schema-migrate: error: interrupted; the output directory was not written\n";
constexpr char kInterruptedInPlace[] =
    "schema-migrate: error: interrupted; the output directory is complete and in place\n";

class Fault : public testing::Test {
 protected:
  explicit Fault(int types = 3000) {
    std::string many;
    for (int i = 0; i < types; ++i) {
      const std::string number = std::to_string(i);
      many += "attributetypes=( 1.3." + number + " NAME 'n" + number + "' DESC 'd' )\n";
    }
    folder.install("old", {{"V3.user.at", many}});
    folder.install("new", {{"V3.config.at", "# config\n"}});
    inputs = folder.snapshot();
    const auto begin = std::chrono::steady_clock::now();
    const ToolResult result = folder.migrate();
    length = std::chrono::steady_clock::now() - begin;
    EXPECT_EQ(0, result.exitCode) << result.err;
    whole = folder.contents("out");
    EXPECT_EQ(8U, whole.size());
    std::filesystem::remove_all(folder.file("out"));
  }

  // Lets a run go for a while between nothing and a little more than its whole length, and ends it
  // with `signal`.
  int endAtRandom(int signal) {
    const pid_t process = folder.startMigrate("old", "out");
    const auto most = std::chrono::duration_cast<std::chrono::microseconds>(length * 1.2).count();
    ::usleep(std::uniform_int_distribution<unsigned>(0, static_cast<unsigned>(most))(random));
    ::kill(process, signal);
    return exitCodeOf(process);
  }

  // Whatever happened, the output is whole or not there; returns whether it is, and removes it.
  bool takeWholeOrNothing() {
    const bool isThere = std::filesystem::exists(folder.file("out"));
    EXPECT_EQ(isThere ? whole : ToolFolder::Files(), folder.contents("out"));
    std::filesystem::remove_all(folder.file("out"));
    return isThere;
  }

  // And the inputs are what they were. What killed runs left is taken away, and counted.
  int removeLeftovers() {
    int count = 0;
    for (const std::string& name : leftovers()) {
      std::filesystem::remove_all(folder.file(name));
      ++count;
    }
    folder.removePrivateCopies();
    EXPECT_EQ(inputs, folder.snapshot());
    return count;
  }

  std::vector<std::string> leftovers() const {
    std::vector<std::string> names;
    for (const auto& entry : std::filesystem::directory_iterator(folder.path())) {
      const std::string name = entry.path().filename().string();
      if (name.compare(0, 13, ".out.partial-") == 0) {
        names.push_back(name);
      }
    }
    return names;
  }

  // A run names what the others left, a line each, and is not disturbed.
  void expectLeftoversNamed() {
    folder.removePrivateCopies();
    const std::vector<std::string> left = leftovers();
    const ToolResult result = folder.migrate();
    EXPECT_EQ(0, result.exitCode);
    EXPECT_TRUE(takeWholeOrNothing());
    EXPECT_EQ(left.size(), support::splitLines(result.err).size()) << result.err;
    for (const std::string& name : left) {
      EXPECT_NE(
          std::string::npos,
          result.err.find(
              "@/" + name +
              ": warning: left behind by a run that was killed; it is not used, and can be removed\n"))
          << result.err;
    }
    EXPECT_EQ(left, leftovers());
  }

  ToolFolder folder;
  std::string inputs;
  ToolFolder::Files whole;
  std::chrono::steady_clock::duration length{};
  std::mt19937 random{3};
};

TEST_F(Fault, KilledAtAnyMoment) {
  for (int round = 0; round < 200; ++round) {
    SCOPED_TRACE("round " + std::to_string(round));
    endAtRandom(SIGKILL);
    takeWholeOrNothing();
  }
  expectLeftoversNamed();
  removeLeftovers();
}

class FaultInASmallRun : public Fault {
 protected:
  FaultInASmallRun() : Fault(20) {}
};

// Once before and once behind every change that the run makes to a file system, so that no state
// that a killed run can leave is missed.
TEST_F(FaultInASmallRun, KilledAtEveryChange) {
  SKIP_UNLESS_MACHINE_CAN(kTraceProcesses);
  int changes = 0;
  int withLeftover = 0;
  int withOutput = 0;
  for (bool isKilled = true; isKilled; ++changes) {
    for (const bool isBehind : {false, true}) {
      SCOPED_TRACE("change " + std::to_string(changes + 1) + (isBehind ? ", behind" : ", before"));
      int exitCode = 0;
      const pid_t process = folder.startMigrate("old", "out", waitForTracer);
      isKilled = endAt(process, {changes + 1, isBehind}, SIGKILL, &exitCode);
      const bool isThere = takeWholeOrNothing();
      EXPECT_EQ(isKilled ? 128 + SIGKILL : 0, exitCode);
      EXPECT_TRUE(isKilled || isThere);
      withOutput += isKilled && isThere ? 1 : 0;
      if (!leftovers().empty() && !isThere) {
        expectLeftoversNamed();
        withLeftover += removeLeftovers();
      }
      EXPECT_EQ(inputs, folder.snapshot());
      ASSERT_FALSE(HasFailure());
    }
  }
  // The directory, seven files with their opening, writing and syncing, a copy, mode and name.
  EXPECT_GT(withLeftover, 30);
  EXPECT_GT(withOutput, 0);
  RecordProperty("changes", changes);
}

// At every change, the message says what is there.
TEST_F(FaultInASmallRun, InterruptedAtEveryChange) {
  SKIP_UNLESS_MACHINE_CAN(kTraceProcesses);
  int changes = 0;
  int inPlace = 0;
  for (bool isInterrupted = true; isInterrupted; ++changes) {
    for (const bool isBehind : {false, true}) {
      SCOPED_TRACE("change " + std::to_string(changes + 1) + (isBehind ? ", behind" : ", before"));
      int exitCode = 0;
      const pid_t process = folder.startMigrate("old", "out", waitForTracer);
      isInterrupted = endAt(process, {changes + 1, isBehind}, SIGTERM, &exitCode);
      const bool isThere = takeWholeOrNothing();
      EXPECT_EQ(isInterrupted ? 5 : 0, exitCode);
      EXPECT_EQ(!isInterrupted ? ""
                : isThere      ? kInterruptedInPlace
                               : kInterrupted,
                folder.complaintsOf("out"));
      EXPECT_EQ("", folder.privateCopies());
      EXPECT_EQ(0, removeLeftovers());
      inPlace += isInterrupted && isThere ? 1 : 0;
      ASSERT_FALSE(HasFailure());
    }
  }
  // Behind the new name, and around bringing it to the disk.
  EXPECT_GE(inPlace, 3);
  RecordProperty("changes", changes);
}

TEST_F(Fault, InterruptedAtAnyMomentLeavesNothing) {
  for (int round = 0; round < 100; ++round) {
    SCOPED_TRACE("round " + std::to_string(round));
    const int signal = round % 2 == 0 ? SIGTERM : SIGINT;
    const int exitCode = endAtRandom(signal);
    const bool isThere = takeWholeOrNothing();
    // The signal may come before the program has its handler.
    if (exitCode == 5) {
      EXPECT_EQ(isThere ? kInterruptedInPlace : kInterrupted, folder.complaintsOf("out"));
    } else {
      EXPECT_EQ(isThere ? 0 : 128 + signal, exitCode);
    }
    EXPECT_EQ("", folder.privateCopies());
    EXPECT_EQ(0, removeLeftovers());
  }
}

// Of runs to one place, one gets it and the others say so.
TEST_F(Fault, RunsToOnePlaceDoNotMix) {
  std::vector<pid_t> processes;
  for (int run = 0; run < 4; ++run) {
    processes.push_back(folder.startMigrate("old", "out"));
  }
  int done = 0;
  for (const pid_t process : processes) {
    const int exitCode = exitCodeOf(process);
    EXPECT_TRUE(exitCode == 0 || exitCode == 5) << exitCode;
    done += exitCode == 0 ? 1 : 0;
  }
  EXPECT_EQ(1, done);
  EXPECT_TRUE(takeWholeOrNothing());
  EXPECT_EQ(0, removeLeftovers());
}

// ---- Eight at once ----

// What a run came to and wrote.
struct Outcome {
  int exitCode;
  std::string out;
  std::string err;
  ToolFolder::Files files;
};

bool operator==(const Outcome& one, const Outcome& other) {
  return one.exitCode == other.exitCode && one.out == other.out && one.err == other.err &&
         one.files == other.files;
}

void PrintTo(const Outcome& outcome, std::ostream* out) {
  *out << outcome.exitCode << "\n" << outcome.out << outcome.err;
  for (const auto& file : outcome.files) {
    *out << file.first << "\n" << file.second;
  }
}

class SideBySide : public testing::Test {
 protected:
  static constexpr int kRuns = 8;

  // Eight different installations; two of them are refused.
  SideBySide() {
    folder.install("new", {{"V3.system.at", "attributetypes=( 1.2 NAME 's' DESC 'shipped' )\n"}});
    for (int run = 0; run < kRuns; ++run) {
      std::string types = run == 2   ? "attributetypes=( 1.1\n"
                          : run == 5 ? "attributetypes=( 1.2 NAME 'other' OBSOLETE )\n"
                                     : "attributetypes=( 1.2 NAME 's' DESC 'changed' )\n";
      for (int i = 0; i < 150 * (run + 1); ++i) {
        const std::string name = std::to_string(run) + "x" + std::to_string(i);
        types += "attributetypes=( 1." + std::to_string(run) + "." + std::to_string(i) +
                 " NAME 'n" + name + "' DESC '" + name + "' )\n";
      }
      folder.install(old(run), {{"V3.user.at", types}});
    }
  }

  static std::string old(int run) { return "old" + std::to_string(run); }

  pid_t start(int run) const { return folder.startMigrate(old(run), "out" + std::to_string(run)); }

  Outcome take(int run, pid_t process) const {
    const std::string name = "out" + std::to_string(run);
    const int exitCode = exitCodeOf(process);
    Outcome outcome{exitCode, folder.printedBy(name), folder.complaintsOf(name),
                    folder.contents(name)};
    std::filesystem::remove_all(folder.file(name));
    return outcome;
  }

  ToolFolder folder;
};

// The library's diagnostic files are the same for all of them.
TEST_F(SideBySide, GivesWhatOneAfterTheOtherGives) {
  const std::string before = folder.snapshot();
  std::vector<Outcome> expected;
  for (int run = 0; run < kRuns; ++run) {
    expected.push_back(take(run, start(run)));
    EXPECT_EQ(run == 2 ? 3 : run == 5 ? 4 : 0, expected.back().exitCode) << run;
    EXPECT_EQ(run == 2 || run == 5 ? 0U : 7U, expected.back().files.size());
  }
  for (int round = 0; round < 5; ++round) {
    std::vector<pid_t> processes;
    for (int run = 0; run < kRuns; ++run) {
      processes.push_back(start(run));
    }
    for (int run = 0; run < kRuns; ++run) {
      SCOPED_TRACE("round " + std::to_string(round) + ", run " + std::to_string(run));
      EXPECT_EQ(expected[static_cast<std::size_t>(run)],
                take(run, processes[static_cast<std::size_t>(run)]));
    }
    EXPECT_EQ(before, folder.snapshot());
  }
}

}  // namespace
