// Whole runs with something in the places of the library's diagnostic files: the same result as
// without, nothing blocks, and what stands there, or what it leads to, is not touched.

#include <gtest/gtest.h>
#include <sys/stat.h>
#include <sys/syscall.h>
#include <unistd.h>

#include <cerrno>
#include <cstdlib>
#include <filesystem>
#include <fstream>

#include "DiagnosticPlace.h"
#include "Machine.h"
#include "SmallFileSystem.h"
#include "ToolRun.h"

namespace {

struct Row {
  const char* name;
  void (*put)(const char* place, const std::string& target);
  bool isUntouched;  // else it may be emptied, and stays where it is and whose it is
};

void PrintTo(const Row& row, std::ostream* out) { *out << row.name; }

void putFile(const char* place, mode_t mode) {
  std::ofstream(place) << "theirs\n";
  EXPECT_EQ(0, ::chmod(place, mode));
  support::giveToAnotherUser(place);
}

const Row kRows[] = {
    {"LinkToAFile",
     [](const char* place, const std::string& target) {
       EXPECT_EQ(0, ::symlink(target.c_str(), place));
       support::giveToAnotherUser(place);
     },
     true},
    {"LinkToNothing",
     [](const char* place, const std::string& target) {
       EXPECT_EQ(0, ::symlink((target + "-missing").c_str(), place));
       support::giveToAnotherUser(place);
     },
     true},
    {"SecondNameOfAFile",
     [](const char* place, const std::string& target) {
       EXPECT_EQ(0, ::link(target.c_str(), place));
     },
     true},
    {"Fifo", [](const char* place, const std::string&) { EXPECT_EQ(0, ::mkfifo(place, 0666)); },
     true},
    {"Directory", [](const char* place, const std::string&) { EXPECT_EQ(0, ::mkdir(place, 0777)); },
     true},
    {"AnotherUsersFileThatIsShut",
     [](const char* place, const std::string&) { putFile(place, support::shutMode()); }, true},
    {"AnotherUsersFileThatIsOpen",
     [](const char* place, const std::string&) { putFile(place, 0666); }, false},
};

class WholeRun : public testing::Test {
 protected:
  WholeRun() {
    folder.install(
        "old", {{"V3.user.at",
                 "attributetypes=( 1.1 NAME 'a' OBSOLETE )\nORVAttributetypes=( 1.1 LENGTH 3 )\n"},
                {"V3.user.oc", "objectclasses=( 1.3 NAME 'c' ABSTRACT )\n"}});
    folder.install("new", {{"V3.user.at", "attributetypes=( 1.2 NAME 'b' OBSOLETE )\n"},
                           {"V3.config.at", "# config\n"}});
    folder.write("precious", "precious\n");
    undisturbed = folder.migrate();
    EXPECT_EQ(0, undisturbed.exitCode);
    files = folder.contents("out");
    EXPECT_EQ(8U, files.size());
    std::filesystem::remove_all(folder.file("out"));
  }

  // A run that comes to the same, and changes nothing but that its output is there.
  void expectSameRun(const std::function<void()>& prepare) {
    const std::string before = folder.snapshot();
    const ToolResult result = folder.migrate({}, [&] {
      prepare();
      ::alarm(20);
    });
    EXPECT_EQ(0, result.exitCode);
    EXPECT_EQ(undisturbed.out, result.out);
    EXPECT_EQ(undisturbed.err, result.err);
    EXPECT_EQ(files, folder.contents("out"));
    std::filesystem::remove_all(folder.file("out"));
    EXPECT_EQ(before, folder.snapshot());
  }

  ToolFolder folder;
  ToolResult undisturbed;
  ToolFolder::Files files;
};

class DiagnosticFault : public WholeRun, public testing::WithParamInterface<Row> {
 protected:
  // What stands in the five places.
  std::string standing() const {
    std::string text;
    for (const support::DiagnosticPlace& place : places) {
      const std::string entry = described(place.path());
      text += GetParam().isUntouched ? entry : entry.substr(0, entry.find('\n'));
    }
    return text;
  }

  const support::DiagnosticPlace places[5] = {
      support::DiagnosticPlace("/tmp/attr.txt"), support::DiagnosticPlace("/tmp/orvattr.txt"),
      support::DiagnosticPlace("/tmp/objectclass.txt"), support::DiagnosticPlace("/tmp/lexan.txt"),
      support::DiagnosticPlace("/tmp/table.txt")};
};

TEST_P(DiagnosticFault, ChangesNothing) {
  SKIP_UNLESS_MACHINE_CAN(kGiveUpPrivileges);
  for (const support::DiagnosticPlace& place : places) {
    GetParam().put(place.path(), folder.file("precious"));
  }
  const std::string before = standing();
  expectSameRun(obeyPermissions);
  EXPECT_EQ(before, standing());
}

INSTANTIATE_TEST_SUITE_P(Rows, DiagnosticFault, testing::ValuesIn(kRows),
                         [](const auto& row) { return std::string(row.param.name); });

// For folders that do not lie in /tmp.
class FolderElsewhere {
 public:
  FolderElsewhere() { ::setenv("TMPDIR", BUILD_FOLDER, 1); }
};

class NoSpaceForDiagnostics : private FolderElsewhere, public WholeRun {
 protected:
  ~NoSpaceForDiagnostics() override { ::unsetenv("TMPDIR"); }
};

TEST_F(NoSpaceForDiagnostics, ChangesNothing) {
  SKIP_UNLESS_MACHINE_CAN(kMountFileSystems);
  const support::SmallFileSystem small("/tmp", "mode=1777,size=64k,nr_inodes=1");
  expectSameRun([] {});
  EXPECT_FALSE(support::fileExists("/tmp/attr.txt"));
}

// Neither a place in a directory nor room in a file.
TEST_F(WholeRun, GoesOnWhenDiagnosticFilesCannotBeChanged) {
  SKIP_UNLESS_MACHINE_CAN(kFilterSystemCalls);
  expectSameRun([] { failSystemCalls({SYS_ftruncate}, ENOSPC); });
}

}  // namespace
