// The predicate by which the targets leave inputs out, tried on the seed corpus, on all that the
// files begin with, and on the files with pieces taken out or put in twice: what it calls endless
// does not end within a second, everything else ends.

#include <gtest/gtest.h>
#include <sys/wait.h>
#include <unistd.h>

#include <csignal>
#include <cstddef>
#include <filesystem>
#include <random>
#include <set>
#include <string>
#include <vector>

#include "ManagerGroup.h"
#include "SchemaManager.h"
#include "Target.h"

namespace {

constexpr char kFile[] = "V3.user.at";
constexpr std::size_t kAtATime = 16;
constexpr std::size_t kEndlessTried = 96;

std::vector<std::string> filesIn(const std::string& target) {
  std::set<std::filesystem::path> paths;
  for (const auto& entry : std::filesystem::directory_iterator(CORPUS "/" + target)) {
    paths.insert(entry.path());
  }
  std::vector<std::string> texts;
  for (const auto& path : paths) {
    texts.push_back(fuzz::read(path));
  }
  return texts;
}

// The seeds of the targets that read definitions, as whole files.
std::vector<std::string> seeds() {
  std::vector<std::string> texts = filesIn("reader");
  const auto add = [&](const std::string& target, const std::string& beginning) {
    for (const std::string& text : filesIn(target)) {
      texts.push_back(beginning + text);
    }
  };
  add("attribute", "attributetypes{");
  add("objectclass", "objectclasses{");
  add("orvattribute", "ORVAttributetypes{");
  return texts;
}

// The text with one to three pieces, as blanks part them, lost or doubled.
std::string damaged(const std::string& text, std::mt19937* random) {
  std::vector<std::string> pieces;
  std::string piece;
  for (const char c : text) {
    piece += c;
    if (c == ' ' || c == '\n') {
      pieces.push_back(piece);
      piece.clear();
    }
  }
  pieces.push_back(piece);
  for (auto count = (*random)() % 3 + 1; count > 0; --count) {
    std::string& chosen = pieces[(*random)() % pieces.size()];
    chosen = (*random)() % 3 == 0 ? chosen + chosen : "";
  }
  std::string result;
  for (const std::string& kept : pieces) {
    result += kept;
  }
  return result;
}

std::set<std::string> sample() {
  std::set<std::string> texts;
  std::mt19937 random(20010203);
  for (const std::string& seed : seeds()) {
    for (std::size_t length = 0; length <= seed.size(); ++length) {
      texts.insert(seed.substr(0, length));
    }
    for (int i = 0; i < 100; ++i) {
      texts.insert(damaged(seed, &random));
    }
  }
  return texts;
}

// Reads the text, in a folder of its own, in a child process that is stopped after a second.
pid_t startReading(const std::string& text, std::size_t number) {
  const std::string folder = fuzz::folder() + "/" + std::to_string(number);
  std::filesystem::create_directory(folder);
  fuzz::write(std::to_string(number) + "/" + kFile, text);
  const pid_t child = ::fork();
  if (child == 0) {
    std::signal(SIGALRM, SIG_DFL);
    ::alarm(1);
    SchemaManager manager(folder);
    manager.readFile(kFile);
    ::_exit(0);
  }
  return child;
}

bool isStoppedByAlarm(pid_t child) {
  int status = 0;
  EXPECT_EQ(::waitpid(child, &status, 0), child);
  return WIFSIGNALED(status) && WTERMSIG(status) == SIGALRM;
}

TEST(EndlessInputs, DoNotEndWithinASecond) {
  std::vector<std::string> endless;
  for (const std::string& text : sample()) {
    if (fuzz::neverEnds(text)) {
      endless.push_back(text);
    }
  }
  ASSERT_GT(endless.size(), kEndlessTried);
  const std::size_t step = endless.size() / kEndlessTried;
  for (std::size_t first = 0; first < kEndlessTried; first += kAtATime) {
    std::vector<pid_t> children;
    for (std::size_t i = 0; i < kAtATime; ++i) {
      children.push_back(startReading(endless[(first + i) * step], i));
    }
    for (std::size_t i = 0; i < kAtATime; ++i) {
      EXPECT_TRUE(isStoppedByAlarm(children[i])) << endless[(first + i) * step];
    }
  }
}

// A part of the sample, evenly. The alarm would end the whole test.
TEST(EndlessInputs, AreAllThatDoNotEnd) {
  std::size_t number = 0;
  std::size_t read = 0;
  for (const std::string& text : sample()) {
    if (number++ % 4 == 0 && !fuzz::neverEnds(text)) {
      fuzz::write(kFile, text);
      properties::ManagerGroup group(fuzz::folder());
      ::alarm(30);
      const int status = group.readIn(fuzz::folder(), kFile).status;
      ::alarm(0);
      const bool succeeds = fuzz::isReadWhole(text);
      ASSERT_EQ(status, succeeds ? 0 : 1) << text;
      ++read;
    }
  }
  EXPECT_GT(read, 500U);
}

}  // namespace
