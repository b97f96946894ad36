// The diagnostic files have fixed names in a directory that anyone may write to. Whatever stands in
// their place, reading goes on and nothing outside them is changed.

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include <deque>
#include <filesystem>
#include <string>
#include <vector>

#include "Calls.h"
#include "DiagnosticPlace.h"
#include "Files.h"
#include "Installation.h"

using namespace support;

namespace {

std::string goodText() { return attributeType("1.1", "a"); }

// A definition of each kind that cannot be parsed would write into the place.
const char* badTextFor(const std::string& path) {
  if (path == "/tmp/orvattr.txt") {
    return "ORVAttributetypes=( 1.1\n";
  }
  return path == "/tmp/objectclass.txt" ? "objectclasses=( 1.1\n" : "attributetypes=( 1.1\n";
}

// Reads a good file and a bad one with something in the place of `path`: the results are the usual
// ones, and the trace tells that the file could not be opened.
void expectReadingGoesOn(const std::string& path) {
  Installation installation;
  const std::string parsing =
      "readFile: Parsing file: V3.user.at in directory: " + installation.path() + " \n";
  const std::string unable = "readFile: unable to open file " + path + "\n";
  int result = -1;
  EXPECT_EQ(messagesOf([&] { result = installation.read("V3.user.at", goodText()); }),
            parsing + unable + "readFile: Successfully parsed the file, V3.user.at.\n");
  EXPECT_EQ(result, 0);
  EXPECT_EQ(stateOf(installation.manager()), "attributes: a=1.1(text)\nV3.user.at: 1.1\n");
  const std::string messages =
      messagesOf([&] { result = installation.read("V3.user.at", badTextFor(path)); });
  EXPECT_EQ(messages.substr(0, (parsing + unable).size()), parsing + unable);
  EXPECT_EQ(result, 1);
  EXPECT_EQ(installation.read("V3.user.at", badTextFor(path)), 1) << "without tracing";
}

}  // namespace

TEST(DiagnosticFiles, SymbolicLinkIsNotFollowed) {
  const TemporaryDirectory directory;
  const std::string target = directory.write("target", "precious\n");
  for (const char* path : kOpenedFiles) {
    SCOPED_TRACE(path);
    const DiagnosticPlace place(path);
    ASSERT_EQ(::symlink(target.c_str(), place.path()), 0);
    giveToAnotherUser(place.path());
    expectReadingGoesOn(path);
    EXPECT_EQ(readWholeFile(target), "precious\n");
    EXPECT_TRUE(std::filesystem::is_symlink(path));
  }
}

TEST(DiagnosticFiles, SymbolicLinkToNothingMakesNoFile) {
  const TemporaryDirectory directory;
  const std::string target = directory.file("target");
  for (const char* path : kOpenedFiles) {
    SCOPED_TRACE(path);
    const DiagnosticPlace place(path);
    ASSERT_EQ(::symlink(target.c_str(), place.path()), 0);
    expectReadingGoesOn(path);
    EXPECT_FALSE(fileExists(target));
  }
}

TEST(DiagnosticFiles, SecondNameOfAnotherFileIsNotEmptied) {
  const TemporaryDirectory directory;
  const std::string target = directory.write("target", "precious\n");
  for (const char* path : kOpenedFiles) {
    SCOPED_TRACE(path);
    const DiagnosticPlace place(path);
    ASSERT_EQ(::link(target.c_str(), place.path()), 0);
    expectReadingGoesOn(path);
    EXPECT_EQ(readWholeFile(target), "precious\n");
  }
}

TEST(DiagnosticFiles, FifoWithoutAReaderDoesNotBlock) {
  for (const char* path : kOpenedFiles) {
    SCOPED_TRACE(path);
    const DiagnosticPlace place(path);
    ASSERT_EQ(::mkfifo(place.path(), 0600), 0);
    expectReadingGoesOn(path);
    EXPECT_TRUE(std::filesystem::is_fifo(path));
  }
}

TEST(DiagnosticFiles, FifoWithAReaderIsNotWrittenTo) {
  for (const char* path : kOpenedFiles) {
    SCOPED_TRACE(path);
    const DiagnosticPlace place(path);
    ASSERT_EQ(::mkfifo(place.path(), 0600), 0);
    const int reader = ::open(place.path(), O_RDONLY | O_NONBLOCK);
    ASSERT_GE(reader, 0);
    expectReadingGoesOn(path);
    char byte = 0;
    EXPECT_LE(::read(reader, &byte, 1), 0);
    ::close(reader);
  }
}

TEST(DiagnosticFiles, DirectoryInPlaceIsLeft) {
  for (const char* path : kOpenedFiles) {
    SCOPED_TRACE(path);
    const DiagnosticPlace place(path);
    ASSERT_EQ(::mkdir(place.path(), 0700), 0);
    expectReadingGoesOn(path);
    EXPECT_TRUE(std::filesystem::is_directory(path));
  }
}

TEST(DiagnosticFiles, AllFourAreTriedInOrder) {
  const DiagnosticPlace attr("/tmp/attr.txt");
  const DiagnosticPlace orvattr("/tmp/orvattr.txt");
  const DiagnosticPlace objectclass("/tmp/objectclass.txt");
  const DiagnosticPlace lexan("/tmp/lexan.txt");
  for (const char* path : kOpenedFiles) {
    ASSERT_EQ(::mkdir(path, 0700), 0) << path;
  }
  Installation installation;
  int result = -1;
  EXPECT_EQ(messagesOf([&] { result = installation.read("V3.user.at", goodText()); }),
            "readFile: Parsing file: V3.user.at in directory: " + installation.path() +
                " \n"
                "readFile: unable to open file /tmp/attr.txt\n"
                "readFile: unable to open file /tmp/orvattr.txt\n"
                "readFile: unable to open file /tmp/objectclass.txt\n"
                "readFile: unable to open file /tmp/lexan.txt\n"
                "readFile: Successfully parsed the file, V3.user.at.\n");
  EXPECT_EQ(result, 0);
  EXPECT_EQ(stateOf(installation.manager()), "attributes: a=1.1(text)\nV3.user.at: 1.1\n");
  EXPECT_EQ(installation.read("V3.user.at", "objectclasses=( 1.1\n"), 1);
}

// Each record has a format of its own, without arguments.
TEST(DiagnosticFiles, RecordsOfThoseThatDoNotOpenTakeNoArgument) {
  std::vector<std::string> expected;
  std::deque<DiagnosticPlace> places;
  for (const char* path : kOpenedFiles) {
    places.emplace_back(path);
    ASSERT_EQ(::mkdir(path, 0700), 0) << path;
    expected.push_back(std::string("readFile: unable to open file ") + path + "\n");
  }
  Installation installation;
  installation.write("V3.user.at", goodText());
  const TraceRecorder recorder(kDebugEvents);
  EXPECT_EQ(installation->readFile("V3.user.at"), 0);
  std::vector<std::string> formats;
  for (const std::string& format : recorder.formats()) {
    if (format.find("unable to open") != std::string::npos) {
      formats.push_back(format);
    }
  }
  EXPECT_EQ(formats, expected);
}

TEST(DiagnosticFiles, AreMadeWhenMissing) {
  const DiagnosticPlace attr("/tmp/attr.txt");
  const DiagnosticPlace orvattr("/tmp/orvattr.txt");
  const DiagnosticPlace objectclass("/tmp/objectclass.txt");
  const DiagnosticPlace lexan("/tmp/lexan.txt");
  const DiagnosticPlace table(kTableFile);
  Installation installation;
  EXPECT_EQ(installation.read("V3.user.at", goodText()), 0);
  for (const char* path : kOpenedFiles) {
    EXPECT_EQ(readWholeFile(path), "") << path;
  }
  EXPECT_FALSE(fileExists(kTableFile));
  EXPECT_EQ(installation.read("V3.user.at", "objectclasses=( 1.1\n"), 1);
  EXPECT_TRUE(fileExists(kTableFile));
}
