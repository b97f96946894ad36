// The file that the symbol table is dumped to when a file cannot be parsed has a fixed name too.
// Whatever stands in its place, reading goes on and nothing outside it is changed.

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include <filesystem>
#include <string>

#include "Calls.h"
#include "DiagnosticPlace.h"
#include "Files.h"
#include "Installation.h"

using namespace support;

namespace {

// Reads a bad file: no message speaks of the table, and the analyser's state is written.
void expectTableIsPassedOver() {
  Installation installation;
  EXPECT_EQ(messagesOf([&] { installation.read("V3.user.at", "attributetypes 1.1\n"); }),
            "readFile: Parsing file: V3.user.at in directory: " + installation.path() +
                " \n"
                "readFile: There was an error parsing the file, V3.user.at.\n"
                "readFile: (3).ATTR: Error occured as } was not found\n");
  EXPECT_NE(readWholeFile("/tmp/lexan.txt"), "");
}

}  // namespace

TEST(DiagnosticTable, SymbolicLinkIsNotFollowed) {
  const TemporaryDirectory directory;
  const std::string target = directory.write("target", "precious\n");
  const DiagnosticPlace place(kTableFile);
  ASSERT_EQ(::symlink(target.c_str(), place.path()), 0);
  expectTableIsPassedOver();
  EXPECT_EQ(readWholeFile(target), "precious\n");
  EXPECT_TRUE(std::filesystem::is_symlink(kTableFile));
}

TEST(DiagnosticTable, SymbolicLinkToNothingMakesNoFile) {
  const TemporaryDirectory directory;
  const std::string target = directory.file("target");
  const DiagnosticPlace place(kTableFile);
  ASSERT_EQ(::symlink(target.c_str(), place.path()), 0);
  expectTableIsPassedOver();
  EXPECT_FALSE(fileExists(target));
}

TEST(DiagnosticTable, SecondNameOfAnotherFileIsNotEmptied) {
  const TemporaryDirectory directory;
  const std::string target = directory.write("target", "precious\n");
  const DiagnosticPlace place(kTableFile);
  ASSERT_EQ(::link(target.c_str(), place.path()), 0);
  expectTableIsPassedOver();
  EXPECT_EQ(readWholeFile(target), "precious\n");
}

TEST(DiagnosticTable, FifoWithoutAReaderDoesNotBlock) {
  const DiagnosticPlace place(kTableFile);
  ASSERT_EQ(::mkfifo(place.path(), 0600), 0);
  expectTableIsPassedOver();
}

TEST(DiagnosticTable, FifoWithAReaderIsNotWrittenTo) {
  const DiagnosticPlace place(kTableFile);
  ASSERT_EQ(::mkfifo(place.path(), 0600), 0);
  const int reader = ::open(place.path(), O_RDONLY | O_NONBLOCK);
  ASSERT_GE(reader, 0);
  expectTableIsPassedOver();
  char byte = 0;
  EXPECT_LE(::read(reader, &byte, 1), 0);
  ::close(reader);
}

TEST(DiagnosticTable, DirectoryInPlaceIsLeft) {
  const DiagnosticPlace place(kTableFile);
  ASSERT_EQ(::mkdir(place.path(), 0700), 0);
  expectTableIsPassedOver();
  EXPECT_TRUE(std::filesystem::is_directory(kTableFile));
}
