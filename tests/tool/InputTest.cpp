// Inputs that are missing, of the wrong kind, unreadable or cannot be parsed: exit code 3, the
// place, and nothing written.  Odd bytes that are no error: the right result.

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/socket.h>
#include <sys/stat.h>
#include <sys/un.h>
#include <unistd.h>

#include <filesystem>

#include "Machine.h"
#include "ToolRun.h"

namespace {

struct Row {
  const char* name;
  void (*damage)(const ToolFolder& folder);
  std::vector<std::string> more;
  const char* err;
};

void PrintTo(const Row& row, std::ostream* out) { *out << row.name; }

void makeSocket(const std::string& path) {
  sockaddr_un address{};
  address.sun_family = AF_UNIX;
  ASSERT_LT(path.size(), sizeof address.sun_path);
  path.copy(address.sun_path, path.size());
  const int descriptor = ::socket(AF_UNIX, SOCK_STREAM, 0);
  ASSERT_EQ(0, ::bind(descriptor, reinterpret_cast<sockaddr*>(&address), sizeof address));
  ::close(descriptor);
}

const Row kRows[] = {
    {"OldIsMissing",
     [](const ToolFolder& f) { std::filesystem::remove_all(f.file("old")); },
     {},
     "@/old: error: the directory cannot be read: No such file or directory\n"},
    {"NewIsMissing",
     [](const ToolFolder& f) { std::filesystem::remove_all(f.file("new")); },
     {},
     "@/new: error: the directory cannot be read: No such file or directory\n"},
    {"OldIsAFile",
     [](const ToolFolder& f) {
       std::filesystem::remove_all(f.file("old"));
       f.write("old", "");
     },
     {},
     "@/old: error: the directory cannot be read: Not a directory\n"},
    {"NoSchemaFile",
     [](const ToolFolder& f) { std::filesystem::remove(f.file("new/V3.user.at")); },
     {},
     "@/new: error: no V3.* schema file in the directory; name the directory that holds V3.system.at and its like\n"},
    {"NoSchemaFileInOld",
     [](const ToolFolder& f) {
       std::filesystem::rename(f.file("old/V3.user.at"), f.file("old/user.at"));
     },
     {},
     "@/old: error: no V3.* schema file in the directory; name the directory that holds V3.system.at and its like\n"},
    {"DirectoryForAFile",
     [](const ToolFolder& f) { std::filesystem::create_directory(f.file("old/V3.user.oc")); },
     {},
     "@/old/V3.user.oc: error: cannot be read: it is a directory\n"},
    {"FifoForAFile",
     [](const ToolFolder& f) { ::mkfifo(f.file("old/V3.orv.at").c_str(), 0666); },
     {},
     "@/old/V3.orv.at: error: cannot be read: it is a FIFO\n"},
    {"DeviceForAFile",
     [](const ToolFolder& f) {
       std::filesystem::create_symlink("/dev/zero", f.file("new/V3.config.at"));
     },
     {},
     "@/new/V3.config.at: error: cannot be read: it is a device\n"},
    {"NullDeviceForAFile",
     [](const ToolFolder& f) {
       std::filesystem::create_symlink("/dev/null", f.file("old/V3.system.oc"));
     },
     {},
     "@/old/V3.system.oc: error: cannot be read: it is a device\n"},
    {"SocketForAFile",
     [](const ToolFolder& f) { makeSocket(f.file("new/V3.orv.oc")); },
     {},
     "@/new/V3.orv.oc: error: cannot be read: it is a socket\n"},
    {"LinkToNothing",
     [](const ToolFolder& f) {
       std::filesystem::create_symlink("nothing", f.file("new/V3.user.oc"));
     },
     {},
     "@/new/V3.user.oc: error: cannot be read: No such file or directory\n"},
    {"EachBadFileIsNamed",
     [](const ToolFolder& f) {
       f.write("old/V3.user.oc", "objectclasses=( 1.1\n");
       f.write("old/V3.system.at", "\nattributetypes ( 1.1 )\n");
       f.write("old/V3.user.at", "\n\nattributetypes=( 1.1 NAME 'a' COLLECTIVE )\n");
     },
     {},
     "@/old/V3.system.at:2:1: error: \"attributetypes\" begins a definition, and neither \"=\" nor \"{\" stands behind it, so that the rest of the file is not read; write \"=\" before one definition or \"{\" before several, or take the word away [D211]\n"
     "@/old/V3.system.at:2:16: error: the server's library fails to read this file, and stops here\n"
     "@/old/V3.user.at:3:31: error: the reader does not get past COLLECTIVE, so that reading never ends; take the word away [D202]\n"
     "@/old/V3.user.at:3:31: error: the server's library would never come to the end of this file, and stands here\n"
     "@/old/V3.user.oc:1:15: error: the definition that begins here is not closed, so that it gets lost, or what stands behind it is taken for a part of it; write its \")\" [D204]\n"
     "@/old/V3.user.oc:2:1: error: the server's library fails to read this file, and stops here\n"},
    {"NamesThatNothingEnds",
     [](const ToolFolder& f) { f.write("new/V3.user.oc", "objectclasses=( 1.1 NAME 'a' )\n"); },
     {},
     "@/new/V3.user.oc:1:21: error: no clause that ends NAME stands behind it, and \")\" does not, so that the reader takes what follows for names; put the kind of the class behind the names, such as STRUCTURAL [D203]\n"
     "@/new/V3.user.oc:2:1: error: the server's library would never come to the end of this file, and stands here\n"},
    {"DatabaseNamesThatNothingEnds",
     [](const ToolFolder& f) {
       f.write("old/V3.orv.at", "ORVAttributetypes=( 1.1 DBNAME ( 'a'\n");
     },
     {},
     "@/old/V3.orv.at:1:19: error: the definition that begins here is not closed, so that it gets lost, or what stands behind it is taken for a part of it; write its \")\" [D204]\n"
     "@/old/V3.orv.at:2:1: error: the server's library would never come to the end of this file, and stands here\n"},
    {"ListIsMissing",
     [](const ToolFolder&) {},
     {"--exclude-oids", "@/list"},
     "@/list: error: cannot be read: No such file or directory\n"},
    {"ListIsAFifo",
     [](const ToolFolder& f) { ::mkfifo(f.file("list").c_str(), 0666); },
     {"--withdraw", "@/list"},
     "@/list: error: cannot be read: it is a FIFO\n"},
    {"ListIsADevice",
     [](const ToolFolder&) {},
     {"--exclude-oids", "/dev/zero"},
     "/dev/zero: error: cannot be read: it is a device\n"},
    {"ListIsADirectory",
     [](const ToolFolder&) {},
     {"--withdraw", "@/old"},
     "@/old: error: cannot be read: it is a directory\n"},
    {"MoreThanIsAllowed",
     [](const ToolFolder& f) { f.write("old/V3.user.oc", std::string(984, '#')); },
     {"--max-input", "1K"},
     "@/old/V3.user.oc: error: with this file the inputs have more than 1 KiB in all; if they are meant to, allow more with --max-input\n"},
    {"MoreThanIsAllowedWithAList",
     [](const ToolFolder& f) { f.write("list", std::string(1499, '#') + "\n"); },
     {"--withdraw", "@/list", "--max-input", "1500"},
     "@/list: error: with this file the inputs have more than 1500 bytes in all; if they are meant to, allow more with --max-input\n"},
    {"MoreThanIsAllowedUnlessGiven",
     [](const ToolFolder& f) {
       f.write("new/V3.config.oc", "");
       ASSERT_EQ(0, ::truncate(f.file("new/V3.config.oc").c_str(), off_t{1} << 30));
     },
     {},
     "@/new/V3.config.oc: error: with this file the inputs have more than 1 GiB in all; if they are meant to, allow more with --max-input\n"},
};

class Input : public testing::TestWithParam<Row> {};

TEST_P(Input, IsRefusedWithItsPlace) {
  const ToolFolder folder;
  folder.install("old", {{"V3.user.at", "attributetypes=( 1.1 NAME 'a' OBSOLETE )\n"}});
  folder.install("new", {{"V3.user.at", ""}});
  GetParam().damage(folder);
  const std::string before = folder.snapshot();
  const ToolResult result = folder.migrate(GetParam().more, [] { ::alarm(20); });
  EXPECT_EQ(3, result.exitCode);
  EXPECT_EQ("", result.out);
  EXPECT_EQ(GetParam().err, result.err);
  EXPECT_EQ(before, folder.snapshot());
}

INSTANTIATE_TEST_SUITE_P(Rows, Input, testing::ValuesIn(kRows),
                         [](const auto& row) { return std::string(row.param.name); });

// A list that the library would not take as it is meant; whatever its name holds, it is one line.
TEST(InputListWithoutALastLineEnd, IsRefused) {
  for (const auto& [name, shown] : {std::pair("list", "list"),
                                    {"list\nout: error: forged \x1b[2J\xc3\xa4",
                                     "list\\x0Aout: error: forged \\x1B[2J\\xC3\\xA4"}}) {
    const ToolFolder folder;
    folder.install("old", {{"V3.user.at", "attributetypes=( 1.2 NAME 'a' OBSOLETE )\n"}});
    folder.install("new", {{"V3.user.at", ""}});
    folder.write(name, "1.1\n1.2");
    for (const char* const option : {"--withdraw", "--exclude-oids"}) {
      const ToolResult result = folder.migrate({option, std::string("@/") + name});
      EXPECT_EQ(4, result.exitCode);
      EXPECT_NE(
          std::string::npos,
          result.err.find(
              std::string("@/") + shown +
              ":2:1: error: 1.2 is the last word, and without a line end behind it it is lost; end the line [O501]\n"))
          << result.err;
      EXPECT_FALSE(std::filesystem::exists(folder.file("out")));
    }
  }
}

// What may not be read: a file of either installation, a directory, a list.
TEST(InputWithoutPermission, IsRefused) {
  SKIP_UNLESS_MACHINE_CAN(kGiveUpPrivileges);
  const std::pair<const char*, const char*> kShut[] = {
      {"old/V3.user.at", "@/old/V3.user.at: error: cannot be read: Permission denied\n"},
      {"new/V3.user.oc", "@/new/V3.user.oc: error: cannot be read: Permission denied\n"},
      {"new", "@/new: error: the directory cannot be read: Permission denied\n"},
      {"list", "@/list: error: cannot be read: Permission denied\n"},
  };
  for (const auto& [name, err] : kShut) {
    SCOPED_TRACE(name);
    const ToolFolder folder;
    folder.install("old", {{"V3.user.at", ""}});
    folder.install("new", {{"V3.user.at", ""}, {"V3.user.oc", ""}});
    folder.write("list", "1.1\n");
    ASSERT_EQ(0, ::chmod(folder.file(name).c_str(), 0));
    const ToolResult result = folder.migrate({"--withdraw", "@/list"}, obeyPermissions);
    EXPECT_EQ(3, result.exitCode);
    EXPECT_EQ("", result.out);
    EXPECT_EQ(err, result.err);
    EXPECT_EQ("list new old", folder.names());
    ASSERT_EQ(0, ::chmod(folder.file(name).c_str(), 0700));
  }
}

// As much as is allowed is read.
TEST(InputSize, MayBeWhatIsAllowed) {
  const ToolFolder folder;
  folder.install("old", {{"V3.user.at", std::string(1000, '\n')}});
  folder.install("new", {{"V3.user.at", std::string(20, '\n')}});
  folder.write("list", "1.1\n");
  EXPECT_EQ(0, folder.migrate({"--withdraw", "@/list", "--max-input", "1k"}).exitCode);
  std::filesystem::remove_all(folder.file("out"));
  EXPECT_EQ(3, folder.migrate({"--withdraw", "@/list", "--max-input", "1023"}).exitCode);
}

// A comment needs no line break behind it, and blanks of every kind separate OIDs.
TEST(InputList, TakesWhatTheLibraryTakes) {
  const ToolFolder folder;
  folder.install(
      "old",
      {{"V3.user.at",
        "attributetypes { ( 1.1 NAME 'a' OBSOLETE ) ( 1.2 NAME 'b' OBSOLETE ) ( 1.3 NAME 'c' OBSOLETE ) ( 1.4 NAME 'd' OBSOLETE ) }\n"}});
  folder.install("new", {{"V3.user.at", ""}});
  folder.write("list", "1.1\t1.2\r\n# 1.3 #x 1.4\n# 1.4");
  EXPECT_EQ(0, folder.migrate({"--exclude-oids", "@/list"}).exitCode);
  EXPECT_EQ(
      kHeader +
          std::string(
              "attributetypes=( 1.3 NAME ( 'c'  ) OBSOLETE USAGE userApplications  )\nattributetypes=( 1.4 NAME ( 'd'  ) OBSOLETE USAGE userApplications  )\n"),
      folder.contents("out")["V3.user.at"]);
}

// Empty files are an installation without a definition.
TEST(InputEmpty, GivesEmptyFiles) {
  const ToolFolder folder;
  ToolFolder::Files nothing;
  for (const char* const file :
       {"V3.user.oc", "V3.user.at", "V3.orv.oc", "V3.orv.at", "V3.system.oc", "V3.system.at",
        "V3.modifiedschema", "V3.config.at", "V3.config.oc"}) {
    nothing[file] = "";
  }
  folder.install("old", nothing);
  folder.install("new", nothing);
  const ToolResult result = folder.migrate();
  EXPECT_EQ(0, result.exitCode);
  EXPECT_EQ("", result.err);
  EXPECT_EQ(nothing, folder.contents("out"));
  EXPECT_EQ(nothing, folder.contents("old"));
  EXPECT_EQ(nothing, folder.contents("new"));
}

// A definition of every kind with every clause, cut off behind every byte: the run is made, or
// refused with a place in this file; it never hangs, never leaves anything behind, and the inputs
// are what they were.
TEST(InputCutShort, EndsInAResultOrAMessage) {
  const std::string text =
      "attributetypes=( 1.1 NAME ( 'a' 'b' ) DESC 'd' OBSOLETE SUP c EQUALITY e ORDERING o SUBSTR s "
      "SYNTAX 1.2{3} SINGLE-VALUE NO-USER-MODIFICATION USAGE directoryOperation )\n"
      "objectclasses { ( 1.4 NAME ( 'h' 'g' ) DESC 'd' OBSOLETE SUP ( i $ j ) ABSTRACT MUST ( k $ l ) "
      "MAY ( m $ n ) ) }\n"
      "ORVAttributetypes=( 1.1 DBNAME ( 'a' 'a' ) ACCESS-CLASS normal LENGTH 3 EQUALITY ORDERING "
      "SUBSTR APPROX REVERSE )\n";
  const ToolFolder folder;
  folder.install("new", {{"V3.user.at", ""}});
  int read = 0;
  for (std::size_t length = 0; length <= text.size(); ++length) {
    SCOPED_TRACE("first " + std::to_string(length) + " bytes");
    folder.install("old", {{"V3.user.at", text.substr(0, length)}});
    const std::string before = folder.snapshot();
    const ToolResult result = folder.migrate({}, [] { ::alarm(20); });
    if (result.exitCode == 0) {
      EXPECT_EQ(7U, folder.contents("out").size());
      std::filesystem::remove_all(folder.file("out"));
      ++read;
    } else {
      // Not read to its end, or read otherwise than written.
      EXPECT_TRUE(result.exitCode == 3 || result.exitCode == 4) << result.exitCode;
      EXPECT_EQ(0U, result.err.find("@/old/V3.user.at:")) << result.err;
    }
    ASSERT_EQ(before, folder.snapshot());
  }
  RecordProperty("lengths", static_cast<int>(text.size()) + 1);
  RecordProperty("read", read);
  EXPECT_GT(read, 2);
  EXPECT_LT(read, 60);
}

}  // namespace
