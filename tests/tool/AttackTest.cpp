// Another user owns the directory of the output, or of an input, and swaps what is in it as fast as
// he can while the run is under way. With ATTACKS in the environment, that many runs of each kind.

#include <gtest/gtest.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <csignal>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <iostream>

#include "DiagnosticPlace.h"
#include "Machine.h"
#include "ToolRun.h"

namespace {

namespace fs = std::filesystem;

int rounds() {
  const char* const text = std::getenv("ATTACKS");
  return text == nullptr ? 5 : std::atoi(text);
}

// A process of another user that does something over and over, as long as the object lives.
class Attacker {
 public:
  explicit Attacker(void (*act)(int round)) : m_process(::fork()) {
    if (m_process != 0) {
      return;
    }
    if (::setgid(support::kAnotherGroup) != 0 || ::setuid(support::kAnotherUser) != 0) {
      ::_exit(125);
    }
    ::alarm(60);
    for (int round = 0;; ++round) {
      act(round);
    }
  }
  ~Attacker() {
    ::kill(m_process, SIGKILL);
    int status = 0;
    ::waitpid(m_process, &status, 0);
    EXPECT_TRUE(WIFSIGNALED(status) && WTERMSIG(status) == SIGKILL);
  }
  Attacker(const Attacker&) = delete;
  Attacker& operator=(const Attacker&) = delete;

 private:
  pid_t m_process;
};

class Attack : public testing::Test {
 protected:
  Attack() {
    folder.install("old", {{"V3.user.at", "attributetypes=( 1.1 NAME 'a' OBSOLETE )\n"}});
    folder.install("new", {{"V3.user.at", "attributetypes=( 1.2 NAME 'b' OBSOLETE )\n"},
                           {"V3.config.at", "# config\n"}});
    folder.install("victim", {});
    for (const char* const name :
         {"V3.user.oc", "V3.user.at", "V3.orv.oc", "V3.system.at", "V3.config.at"}) {
      folder.write(std::string("victim/") + name, "precious\n");
    }
    EXPECT_EQ(0, ::chmod(folder.path().c_str(), 0755));
    before = folder.snapshot();
    EXPECT_EQ(0, folder.migrate().exitCode);
    whole = folder.contents("out");
    fs::remove_all(folder.file("out"));
  }

  // A directory of the other user's, in which he acts.
  void giveAway(const std::string& name) const {
    support::giveToAnotherUser(folder.file(name).c_str());
  }

  void attackTheOutput(void (*act)(int round)) {
    int published = 0;
    for (int round = 0; round < rounds(); ++round) {
      SCOPED_TRACE("round " + std::to_string(round));
      folder.install("p", {});
      giveAway("p");
      ToolResult result;
      {
        ASSERT_EQ(0, ::chdir(folder.file("p").c_str()));
        const Attacker attacker(act);
        ASSERT_EQ(0, ::chdir("/"));
        result = folder.run({"migrate", "--from", "@/old", "--to", "@/new", "--layout", "library",
                             "--out", "@/p/out", "--allow-foreign-parent"},
                            [] { ::alarm(30); });
      }
      EXPECT_TRUE(result.exitCode == 0 || result.exitCode == 5) << result.exitCode;
      EXPECT_EQ(result.exitCode == 0, result.err.empty()) << result.err;
      EXPECT_EQ(result.exitCode == 0 ? whole : ToolFolder::Files(), folder.contents("p/out"))
          << result.err;
      published += result.exitCode == 0 ? 1 : 0;
      fs::remove_all(folder.file("p"));
      EXPECT_EQ(before, folder.snapshot());
    }
    std::cout << rounds() << " attacks, " << published << " published\n";
  }

  ToolFolder folder;
  std::string before;
  ToolFolder::Files whole;
};

// Takes the directory that is being written away, and calls `put` with its name.
void takeAway(int round, void (*put)(const std::string& name)) {
  std::error_code error;
  for (const auto& entry : fs::directory_iterator(".", error)) {
    const std::string name = entry.path().filename().string();
    if (name.compare(0, 13, ".out.partial-") == 0 && !fs::is_symlink(entry.symlink_status(error)) &&
        ::rename(name.c_str(), ("moved-" + std::to_string(round)).c_str()) == 0) {
      put(name);
      return;
    }
  }
}

TEST_F(Attack, LinkInThePlaceOfTheOutput) {
  SKIP_UNLESS_MACHINE_CAN(kGiveFilesAway);
  attackTheOutput([](int round) {
    takeAway(round, [](const std::string& name) {
      static_cast<void>(!::symlink("../victim", name.c_str()));
    });
  });
}

// Put in the place of the directory, and taken away again.
TEST_F(Attack, LinkThatComesAndGoes) {
  SKIP_UNLESS_MACHINE_CAN(kGiveFilesAway);
  attackTheOutput([](int round) {
    static std::string taken;
    const std::string moved = "moved-" + std::to_string(round - 1);
    if (!taken.empty()) {
      ::unlink(taken.c_str());
      ::rename(moved.c_str(), taken.c_str());
      taken.clear();
    }
    takeAway(round, [](const std::string& name) {
      static_cast<void>(!::symlink("../victim", name.c_str()));
      taken = name;
    });
  });
}

TEST_F(Attack, DirectoryInThePlaceOfTheOutput) {
  SKIP_UNLESS_MACHINE_CAN(kGiveFilesAway);
  attackTheOutput([](int round) {
    takeAway(round, [](const std::string& name) {
      ::mkdir(name.c_str(), 0777);
      if (std::FILE* const file = std::fopen((name + "/V3.user.at").c_str(), "w")) {
        std::fclose(file);
      }
    });
  });
}

// A file that is a FIFO now and then, or hardly ends, or is replaced, or becomes longer.
TEST_F(Attack, InputThatIsSwapped) {
  SKIP_UNLESS_MACHINE_CAN(kGiveFilesAway);
  int done = 0;
  for (int round = 0; round < rounds(); ++round) {
    SCOPED_TRACE("round " + std::to_string(round));
    giveAway("old");
    ToolResult result;
    {
      ASSERT_EQ(0, ::chdir(folder.file("old").c_str()));
      const Attacker attacker([](int step) {
        constexpr char kText[] = "attributetypes=( 1.1 NAME 'a' OBSOLETE )\n";
        constexpr off_t kEndless = off_t{1} << 40;
        ::unlink("new");
        if (step % 3 == 0) {
          ::mkfifo("new", 0644);
        } else if (std::FILE* const file = std::fopen("new", "w")) {
          std::fputs(kText, file);
          std::fclose(file);
          if (step % 3 == 1) {
            static_cast<void>(!::truncate("new", kEndless));
          }
        }
        ::rename("new", "V3.user.at");
      });
      ASSERT_EQ(0, ::chdir("/"));
      result = folder.migrate({}, [] { ::alarm(30); });
    }
    EXPECT_TRUE(result.exitCode == 0 || result.exitCode == 3) << result.exitCode << result.err;
    EXPECT_EQ(result.exitCode == 0 ? whole : ToolFolder::Files(), folder.contents("out"));
    done += result.exitCode == 0 ? 1 : 0;
    fs::remove_all(folder.file("out"));
    fs::remove_all(folder.file("old"));
    folder.install("old", {});
  }
  std::cout << rounds() << " attacks, " << done << " done\n";
}

}  // namespace
