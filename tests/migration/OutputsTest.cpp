// Outputs as a host program makes them: no other part of the tool, several threads, and what a
// handler of its own removes.

#include <gtest/gtest.h>
#include <libschema-migration/NewFile.h>
#include <libschema-migration/OutputDirectory.h>
#include <libschema-migration/PrivatePlace.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <atomic>
#include <filesystem>
#include <fstream>
#include <memory>
#include <thread>
#include <vector>

#include "Files.h"

namespace {

namespace fs = std::filesystem;

using migration::Failure;
using migration::Failures;
using migration::NewFile;
using migration::NewFileOptions;
using migration::OutputDirectory;
using migration::OutputOptions;
using migration::OutputText;
using migration::Over;
using migration::PrivatePlace;
using migration::Removals;

std::vector<OutputText> textsOf(int number) {
  const std::string bytes(static_cast<std::size_t>(number) * 1000, 'x');
  return {{"V3.user.at", bytes + "\n", std::nullopt},
          {"V3.config.at", "# " + std::to_string(number) + "\n", 0640},
          {"V3.user.at", "inner\n", std::nullopt, "folder"}};
}

class Outputs : public testing::Test {
 protected:
  std::unique_ptr<OutputDirectory> open(const OutputOptions& options) {
    return OutputDirectory::open(options, &removals, &problems);
  }

  // What there is, sorted, but for the folder itself.
  std::vector<std::string> names() const {
    std::vector<std::string> found;
    for (const fs::directory_entry& entry : fs::recursive_directory_iterator(folder.file(""))) {
      found.push_back(entry.path().lexically_relative(folder.path()).string());
    }
    std::sort(found.begin(), found.end());
    return found;
  }

  mode_t modeOf(const std::string& name) const {
    struct stat status {};
    EXPECT_EQ(0, ::stat(folder.file(name).c_str(), &status));
    return status.st_mode & 07777U;
  }

  std::string told(const Failures& all) const {
    std::string text;
    for (const Failure& failure : all) {
      text += (failure.file.empty() ? "-" : failure.file) + ": " + failure.text + "\n";
    }
    for (std::size_t at = 0; (at = text.find(folder.file(""), at)) != std::string::npos;) {
      text.replace(at, folder.file("").size(), "@/");
    }
    return text;
  }

  support::TemporaryDirectory folder;
  Removals removals;
  OutputDirectory::Problems problems;
  Failures failures;
};

TEST_F(Outputs, AreThereWholeOrNotAtAll) {
  {
    const auto output = open({folder.file("out"), {}});
    ASSERT_NE(nullptr, output);
    EXPECT_EQ("", output->temporaryPath());
    EXPECT_EQ(std::vector<std::string>(), names());
    ASSERT_TRUE(output->fill(textsOf(1), &failures));
    EXPECT_FALSE(fs::exists(folder.file("out")));
    EXPECT_TRUE(fs::exists(output->temporaryPath()));
    EXPECT_FALSE(output->isPublished());
    ASSERT_TRUE(output->publish(&failures));
    EXPECT_TRUE(output->isPublished());
  }
  EXPECT_EQ((std::vector<std::string>{"out", "out/V3.config.at", "out/V3.user.at", "out/folder",
                                      "out/folder/V3.user.at"}),
            names());
  EXPECT_EQ("inner\n", support::readWholeFile(folder.file("out/folder/V3.user.at")));
  EXPECT_EQ(0640U, modeOf("out/V3.config.at"));
  EXPECT_EQ(0755U, modeOf("out"));
  EXPECT_EQ(0755U, modeOf("out/folder"));
  {
    const auto second = open({folder.file("second"), {}});
    ASSERT_TRUE(second != nullptr && second->fill(textsOf(1), &failures));
  }
  EXPECT_FALSE(fs::exists(folder.file("second")));
  EXPECT_EQ(5U, names().size());
  EXPECT_TRUE(failures.empty());
}

TEST_F(Outputs, RefusalsAreValues) {
  fs::create_directories(folder.file("in/sub"));
  folder.write("file", "text");
  fs::create_directory(folder.file("full"));
  folder.write("full/a", "");
  struct Row {
    const char* path;
    bool isOfRequest;
    const char* text;
  };
  const Row rows[] = {
      {"in/sub/out", true,
       "-: the output directory @/in/sub/out lies inside @/in, which is only read; name a place "
       "outside\n"},
      {"..", true,
       "-: the path must end in the name of the directory to create, not in \"@/..\"\n"},
      {"file", false,
       "@/file: exists and is not a directory; the output directory must be new or empty\n"},
      {"full", false, "@/full: the output directory is not empty; name a new or an empty one\n"},
      {"none/out", false,
       "@/none/out: the directory to create it in, @/none, cannot be used: No such file or "
       "directory\n"},
  };
  const std::vector<std::string> before = names();
  for (const Row& row : rows) {
    problems = {};
    EXPECT_EQ(nullptr, open({folder.file(row.path), {folder.file("in")}}));
    EXPECT_EQ(row.text, told(problems.failures));
    EXPECT_EQ(row.isOfRequest, problems.isOfRequest) << row.path;
  }
  EXPECT_EQ(before, names());
}

// The advice names an option only where the host has one.
TEST_F(Outputs, RiskIsTakenByWhateverTheHostCallsIt) {
  fs::create_directory(folder.file("open"));
  ASSERT_EQ(0, ::chmod(folder.file("open").c_str(), 0777));
  OutputOptions options{folder.file("open/out"), {}};
  EXPECT_EQ(nullptr, open(options));
  options.riskOption = "accept_risk";
  EXPECT_EQ(nullptr, open(options));
  const std::string text =
      "@/open/out: the directory to create it in, @/open, is writable by everybody and not sticky, "
      "who could put something else in the place of the output; create it in a directory of your "
      "own";
  EXPECT_EQ(text + "\n" + text + ", or take the risk with accept_risk\n", told(problems.failures));
  options.allowForeignParent = true;
  EXPECT_NE(nullptr, open(options));
}

TEST_F(Outputs, WhatCannotBePublishedIsToldAndGoes) {
  const auto output = open({folder.file("out"), {}});
  ASSERT_TRUE(output != nullptr && output->fill(textsOf(1), &failures));
  folder.write("out", "somebody else's");
  EXPECT_FALSE(output->publish(&failures));
  EXPECT_FALSE(output->isPublished());
  EXPECT_EQ("@/out: something else was put there while this run was under way; it was left alone\n",
            told(failures));
  EXPECT_EQ("somebody else's", support::readWholeFile(folder.file("out")));
}

// Several threads, with one list of what a handler would remove, and each with another output.
TEST_F(Outputs, SeveralThreadsMakeTheirOwn) {
  constexpr int kThreads = 8;
  constexpr int kEach = 5;
  std::atomic<int> published{0};
  std::vector<std::thread> threads;
  threads.reserve(kThreads);
  for (int thread = 0; thread < kThreads; ++thread) {
    threads.emplace_back([&, thread] {
      for (int i = 0; i < kEach; ++i) {
        const int number = thread * kEach + i;
        OutputDirectory::Problems own;
        Failures ownFailures;
        const auto place =
            PrivatePlace::make({{folder.file("")}}, &removals, &ownFailures, &ownFailures);
        const auto output = OutputDirectory::open({folder.file("out" + std::to_string(number)), {}},
                                                  &removals, &own);
        const bool isMade = place != nullptr && place->makeFolder("a", &ownFailures) &&
                            output != nullptr && output->fill(textsOf(number), &ownFailures) &&
                            (i == 0 || output->publish(&ownFailures)) &&
                            writeNewFile({folder.file("file" + std::to_string(number))}, "text",
                                         &removals, &ownFailures);
        published += isMade && ownFailures.empty() ? 1 : 0;
      }
    });
  }
  for (std::thread& thread : threads) {
    thread.join();
  }
  EXPECT_EQ(kThreads * kEach, published);
  for (int number = 0; number < kThreads * kEach; ++number) {
    const std::string out = folder.file("out" + std::to_string(number));
    EXPECT_EQ(number % kEach != 0, fs::exists(out)) << out;
    if (number % kEach != 0) {
      EXPECT_EQ(textsOf(number)[0].bytes, support::readWholeFile(out + "/V3.user.at"));
    }
  }
  // Nothing else is left, and nothing is left to remove.
  EXPECT_EQ(kThreads * (kEach - 1) * 5 + kThreads * kEach, static_cast<int>(names().size()));
  EXPECT_EQ(kThreads * (kEach - 1), removals.run().inPlace);
}

// More than one block of entries, and what is in its place stays.
TEST_F(Outputs, HandlerRemovesWhatIsNotInItsPlace) {
  constexpr int kCount = 30;
  std::vector<std::unique_ptr<OutputDirectory>> outputs;
  for (int number = 0; number < kCount; ++number) {
    outputs.push_back(open({folder.file("out" + std::to_string(number)), {}}));
    ASSERT_TRUE(outputs.back() != nullptr && outputs.back()->fill(textsOf(number), &failures));
  }
  const auto place = PrivatePlace::make({{folder.file("")}}, &removals, &failures, &failures);
  ASSERT_TRUE(place != nullptr && place->makeFolder("a", &failures));
  std::ofstream(place->pathOf("a/file")) << "text";
  const auto file = NewFile::open({folder.file("file")}, &removals, &failures);
  ASSERT_TRUE(file != nullptr && file->write("text", &failures));
  ASSERT_TRUE(outputs[7]->publish(&failures));
  const Removals::Placed placed = removals.run();
  EXPECT_EQ(1, placed.inPlace);
  EXPECT_EQ(kCount, placed.wanted);
  const std::vector<std::string> left = {"out7", "out7/V3.config.at", "out7/V3.user.at",
                                         "out7/folder", "out7/folder/V3.user.at"};
  EXPECT_EQ(left, names());
  // The objects go as ever.
  outputs.clear();
  EXPECT_EQ(left, names());
}

TEST_F(Outputs, FileReplacesWhatItMay) {
  EXPECT_TRUE(writeNewFile({folder.file("a")}, "first", nullptr, &failures));
  EXPECT_FALSE(writeNewFile({folder.file("a")}, "second", nullptr, &failures));
  EXPECT_EQ("@/a: cannot be created: File exists\n", told(failures));
  EXPECT_EQ("first", support::readWholeFile(folder.file("a")));
  failures.clear();
  ASSERT_EQ(0, ::chmod(folder.file("a").c_str(), 0604));
  EXPECT_TRUE(writeNewFile({folder.file("a"), Over::kFile}, "second", nullptr, &failures));
  EXPECT_EQ("second", support::readWholeFile(folder.file("a")));
  EXPECT_EQ(0604U, modeOf("a"));
  const NewFileOptions ofItsKind = {folder.file("a"), Over::kFileOfItsKind, "sec", "list"};
  EXPECT_TRUE(writeNewFile(ofItsKind, "second again", nullptr, &failures));
  EXPECT_TRUE(failures.empty());
  folder.write("a", "else");
  EXPECT_FALSE(writeNewFile(ofItsKind, "second", nullptr, &failures));
  fs::create_symlink("a", folder.file("link"));
  EXPECT_FALSE(writeNewFile({folder.file("link"), Over::kFile}, "x", nullptr, &failures));
  EXPECT_FALSE(writeNewFile({folder.file(""), Over::kFile}, "x", nullptr, &failures));
  EXPECT_FALSE(writeNewFile({folder.file("none/a"), Over::kFile}, "x", nullptr, &failures));
  EXPECT_EQ(
      "@/a: is there and is no list; name another file, or remove it\n"
      "@/link: is a symbolic link, which is not followed; name the file itself\n"
      "@/: is no name of a file\n"
      "@/none/a: the directory to write it in cannot be used: No such file or directory\n",
      told(failures));
  EXPECT_EQ("else", support::readWholeFile(folder.file("a")));
  EXPECT_EQ((std::vector<std::string>{"a", "link"}), names());
}

TEST_F(Outputs, PathsApart) {
  EXPECT_TRUE(migration::areApart("a", "b"));
  EXPECT_TRUE(migration::areApart("a", "ab"));
  EXPECT_FALSE(migration::areApart("a", "a/"));
  EXPECT_FALSE(migration::areApart("a/b", "a"));
  EXPECT_FALSE(migration::areApart("./a", "c/../a/b"));
}

}  // namespace
