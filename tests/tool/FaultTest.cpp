// Runs that are killed, interrupted, or made side by side.

#include <gtest/gtest.h>
#include <sys/wait.h>
#include <unistd.h>

#include <csignal>
#include <filesystem>
#include <random>

#include "ToolRun.h"

namespace {

class Fault : public testing::Test {
 protected:
  Fault() {
    std::string many;
    for (int i = 0; i < 3000; ++i) {
      const std::string number = std::to_string(i);
      many += "attributetypes=( 1.3." + number + " NAME 'n" + number + "' DESC 'd' )\n";
    }
    old["V3.user.at"] = many;
    folder.install("old", old);
    folder.install("new", {{"V3.config.at", "# config\n"}});
    const ToolResult result = folder.migrate();
    EXPECT_EQ(0, result.exitCode) << result.err;
    whole = folder.contents("out");
    std::filesystem::remove_all(folder.file("out"));
  }

  // Lets a run go for a while between nothing and its whole length, and ends it with `signal`.
  int endAtRandom(int signal) {
    const pid_t process = folder.startMigrate("out");
    ::usleep(std::uniform_int_distribution<unsigned>(0, 250000)(random));
    ::kill(process, signal);
    return exitCodeOf(process);
  }

  // Whatever happened, the output is whole or not there, and the inputs are what they were.
  void expectWholeOrNothing(bool* isThere) {
    const ToolFolder::Files files = folder.contents("out");
    *isThere = std::filesystem::exists(folder.file("out"));
    EXPECT_EQ(*isThere ? whole : ToolFolder::Files(), files);
    EXPECT_EQ(old, folder.contents("old"));
    std::filesystem::remove_all(folder.file("out"));
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

  ToolFolder folder;
  ToolFolder::Files old;
  ToolFolder::Files whole;
  std::mt19937 random{3};
};

TEST_F(Fault, KilledAtAnyMoment) {
  for (int round = 0; round < 40; ++round) {
    SCOPED_TRACE("round " + std::to_string(round));
    endAtRandom(SIGKILL);
    bool isThere = false;
    expectWholeOrNothing(&isThere);
  }
  // The next run names what the others left, and is not disturbed.
  const std::vector<std::string> left = leftovers();
  const ToolResult result = folder.migrate();
  EXPECT_EQ(0, result.exitCode);
  EXPECT_EQ(whole, folder.contents("out"));
  EXPECT_EQ(left.size(), support::splitLines(result.err).size());
  for (const std::string& name : left) {
    EXPECT_NE(std::string::npos,
              result.err.find("@/" + name + ": warning: left behind by a run that was killed; "));
  }
}

TEST_F(Fault, InterruptedAtAnyMomentLeavesNothing) {
  for (int round = 0; round < 40; ++round) {
    SCOPED_TRACE("round " + std::to_string(round));
    const int signal = round % 2 == 0 ? SIGTERM : SIGINT;
    const int exitCode = endAtRandom(signal);
    bool isThere = false;
    expectWholeOrNothing(&isThere);
    if (isThere) {
      EXPECT_TRUE(exitCode == 0 || exitCode == 128 + signal) << exitCode;
    } else {
      // The signal may come before the program has its handler.
      EXPECT_TRUE(exitCode == 5 || exitCode == 128 + signal) << exitCode;
    }
    EXPECT_EQ(0U, leftovers().size());
  }
}

TEST_F(Fault, RunsSideBySideGiveTheSame) {
  std::vector<pid_t> processes;
  for (int run = 0; run < 8; ++run) {
    processes.push_back(folder.startMigrate("out" + std::to_string(run)));
  }
  for (int run = 0; run < 8; ++run) {
    EXPECT_EQ(0, exitCodeOf(processes[static_cast<std::size_t>(run)]));
    EXPECT_EQ(whole, folder.contents("out" + std::to_string(run)));
  }
}

// Of runs to one place, one gets it and the others say so.
TEST_F(Fault, RunsToOnePlaceDoNotMix) {
  std::vector<pid_t> processes;
  for (int run = 0; run < 4; ++run) {
    processes.push_back(folder.startMigrate("out"));
  }
  int done = 0;
  for (const pid_t process : processes) {
    const int exitCode = exitCodeOf(process);
    EXPECT_TRUE(exitCode == 0 || exitCode == 5) << exitCode;
    done += exitCode == 0 ? 1 : 0;
  }
  EXPECT_EQ(1, done);
  EXPECT_EQ(whole, folder.contents("out"));
  EXPECT_EQ(0U, leftovers().size());
}

}  // namespace
