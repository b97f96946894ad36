// The output directory: where it may be, that it appears whole or not at all, and what is found out
// about the files in it.

#include <gtest/gtest.h>
#include <sys/resource.h>
#include <sys/stat.h>
#include <unistd.h>

#include <csignal>
#include <filesystem>

#include "DiagnosticPlace.h"
#include "Machine.h"
#include "ToolRun.h"

namespace {

const ToolFolder::Files kOld = {{"V3.user.at", "attributetypes=( 1.1 NAME 'a' OBSOLETE )\n"}};
const ToolFolder::Files kNew = {{"V3.user.at", "attributetypes=( 1.2 NAME 'b' OBSOLETE )\n"},
                                {"V3.config.at", "# config\n"}};

class Output : public testing::Test {
 protected:
  Output() {
    folder.install("old", kOld);
    folder.install("new", kNew);
  }

  // A run that must fail, with everything in its place afterwards.
  void expectFailure(const std::string& err, const std::vector<std::string>& arguments,
                     const std::function<void()>& prepare = nullptr) {
    const std::string names = folder.names();
    const ToolResult result = folder.run(arguments, prepare);
    EXPECT_EQ(5, result.exitCode);
    EXPECT_EQ(err, result.err);
    EXPECT_EQ(names, folder.names());
    EXPECT_EQ(kOld, folder.contents("old"));
    EXPECT_EQ(kNew, folder.contents("new"));
  }

  std::vector<std::string> to(const std::string& out) const {
    return {"migrate", "--from", "@/old", "--to", "@/new", "--layout", "library", "--out", out};
  }

  mode_t modeOf(const std::string& name) const {
    struct stat status {};
    EXPECT_EQ(0, ::stat(folder.file(name).c_str(), &status));
    return status.st_mode & 07777;
  }

  ToolFolder folder;
};

TEST_F(Output, IsCreatedWithTheModeOfAnyNewDirectory) {
  EXPECT_EQ(0, folder.migrate({}, [] { ::umask(027); }).exitCode);
  EXPECT_EQ(8U, folder.contents("out").size());
  EXPECT_EQ(0750U, modeOf("out"));
  EXPECT_EQ(0640U, modeOf("out/V3.user.at"));
}

// What is copied from NEW keeps the mode that it has there, whatever the mask.
TEST_F(Output, KeepsTheModeOfACopiedFile) {
  for (const mode_t mode : {0600U, 0444U, 0666U, 0751U}) {
    ASSERT_EQ(0, ::chmod(folder.file("new/V3.config.at").c_str(), mode));
    EXPECT_EQ(0, folder.migrate({}, [] { ::umask(027); }).exitCode);
    EXPECT_EQ(mode, modeOf("out/V3.config.at"));
    EXPECT_EQ(0640U, modeOf("out/V3.user.at"));
    std::filesystem::remove_all(folder.file("out"));
  }
}

// The group of a directory with this bit goes to what is made in it, and the bit to directories.
TEST_F(Output, InheritsTheSetgidBitAsAnyNewDirectory) {
  std::filesystem::create_directory(folder.file("group"));
  ASSERT_EQ(0, ::chmod(folder.file("group").c_str(), 02755));
  EXPECT_EQ(0, folder.run(to("@/group/out"), [] { ::umask(022); }).exitCode);
  EXPECT_EQ(02755U, modeOf("group/out"));
  EXPECT_EQ(0644U, modeOf("group/out/V3.user.at"));
  EXPECT_EQ(0, folder.run(to("@/out"), [] { ::umask(022); }).exitCode);
  EXPECT_EQ(0755U, modeOf("out"));
}

TEST_F(Output, ReplacesAnEmptyDirectoryAndKeepsItsModeAndOwner) {
  ASSERT_TRUE(std::filesystem::create_directory(folder.file("out")));
  ASSERT_EQ(0, ::chmod(folder.file("out").c_str(), 0710));
  support::giveToAnotherUser(folder.file("out").c_str());
  struct stat before {};
  ASSERT_EQ(0, ::stat(folder.file("out").c_str(), &before));
  EXPECT_EQ(0, folder.migrate().exitCode);
  EXPECT_EQ(8U, folder.contents("out").size());
  EXPECT_EQ(0710U, modeOf("out"));
  struct stat status {};
  ASSERT_EQ(0, ::stat(folder.file("out").c_str(), &status));
  EXPECT_EQ(before.st_uid, status.st_uid);
  EXPECT_EQ(before.st_gid, status.st_gid);
}

TEST_F(Output, MayBeNamedWithASlashOrFromTheWorkingDirectory) {
  EXPECT_EQ(0, folder.run(to("@/one//")).exitCode);
  EXPECT_EQ(
      0,
      folder.run(to("two"), [&] { static_cast<void>(!::chdir(folder.path().c_str())); }).exitCode);
  EXPECT_EQ("new old one two", folder.names());
}

TEST_F(Output, ThatIsNotEmptyIsLeftAlone) {
  folder.install("out", {{"mine", "x"}});
  expectFailure("@/out: error: the output directory is not empty; name a new or an empty one\n",
                to("@/out"));
  EXPECT_EQ((ToolFolder::Files{{"mine", "x"}}), folder.contents("out"));
}

TEST_F(Output, ThatIsAFileIsLeftAlone) {
  folder.write("out", "mine");
  expectFailure(
      "@/out: error: exists and is not a directory; the output directory must be new or empty\n",
      to("@/out"));
  EXPECT_EQ("mine", support::readWholeFile(folder.file("out")));
}

TEST_F(Output, ThatIsALinkIsLeftAlone) {
  std::filesystem::create_directory(folder.file("empty"));
  std::filesystem::create_symlink("empty", folder.file("out"));
  expectFailure(
      "@/out: error: exists and is not a directory; the output directory must be new or empty\n",
      to("@/out"));
}

TEST_F(Output, WithoutAPlaceToCreateItIn) {
  folder.write("file", "");
  expectFailure(
      "@/a/out: error: the directory to create it in, @/a, cannot be used: No such file or directory\n",
      to("@/a/out"));
  expectFailure(
      "@/file/out: error: the output directory cannot be created in @/file, which is not a directory\n",
      to("@/file/out"));
}

TEST_F(Output, WithoutPermission) {
  SKIP_UNLESS_MACHINE_CAN(kGiveUpPrivileges);
  std::filesystem::create_directory(folder.file("shut"));
  ASSERT_EQ(0, ::chmod(folder.file("shut").c_str(), 0555));
  expectFailure(
      "@/shut/out: error: the output directory cannot be created in @/shut: Permission denied\n",
      to("@/shut/out"), obeyPermissions);
}

TEST_F(Output, ThatDoesNotFitIsRemoved) {
  std::string many = "attributetypes {\n";
  for (int i = 0; i < 2000; ++i) {
    many += "( 1.3." + std::to_string(i) + " NAME 'n" + std::to_string(i) + "' OBSOLETE )\n";
  }
  many += "}\n";
  folder.install("large", {{"V3.user.at", many}});
  const ToolResult result = folder.run(
      {"migrate", "--from", "@/large", "--to", "@/new", "--layout", "library", "--out", "@/out"},
      [&] {
        if (::freopen("/dev/null", "w", stdout) == nullptr) {
          ::_exit(125);
        }
        const rlimit limit{many.size(), many.size()};
        ::setrlimit(RLIMIT_FSIZE, &limit);
      });
  EXPECT_EQ(5, result.exitCode);
  EXPECT_NE(std::string::npos,
            result.err.find("/V3.user.at: error: a private copy cannot be written"))
      << result.err;
  EXPECT_EQ("large new old", folder.names());
}

TEST_F(Output, CopyThatDoesNotFitIsRemoved) {
  folder.write("new/V3.config.oc", std::string(100000, '\n'));
  const ToolResult result = folder.migrate({}, [] {
    const rlimit limit{50000, 50000};
    ::setrlimit(RLIMIT_FSIZE, &limit);
  });
  EXPECT_EQ(5, result.exitCode);
  EXPECT_NE(
      std::string::npos,
      result.err.find("/V3.config.oc: error: a private copy cannot be written: File too large\n"))
      << result.err;
  EXPECT_EQ("new old", folder.names());
}

TEST_F(Output, LeftoverOfAKilledRunIsNamedAndLeft) {
  folder.install(".out.partial-abcdef", {{"V3.user.at", "half"}});
  const ToolResult result = folder.migrate();
  EXPECT_EQ(0, result.exitCode);
  EXPECT_EQ(
      "@/.out.partial-abcdef: warning: left behind by a run that was killed; it is not used, and can be removed\n",
      result.err);
  EXPECT_EQ((ToolFolder::Files{{"V3.user.at", "half"}}), folder.contents(".out.partial-abcdef"));
  EXPECT_EQ(8U, folder.contents("out").size());
}

// Whatever a name holds, a message is one line of printable characters.
TEST_F(Output, LeftoverCannotForgeALine) {
  folder.install(".out.partial-a\nout: error: forged\x1b[2J", {});
  const ToolResult result = folder.migrate();
  EXPECT_EQ(0, result.exitCode);
  EXPECT_EQ(
      "@/.out.partial-a\\x0Aout: error: forged\\x1B[2J: warning: left behind by a run that was killed; it is not used, and can be removed\n",
      result.err);
}

TEST_F(Output, NameIsPrintable) {
  const ToolResult result = folder.run(to("@/out\n\x1b[2J"));
  EXPECT_EQ(0, result.exitCode);
  EXPECT_EQ("Written and verified: @/out\\x0A\\x1B[2J\n",
            result.out.substr(result.out.find("Written")));
}

// Who starts the program may have told the system to forget processes that end.
TEST_F(Output, DoesNotDependOnHowProcessesEnd) {
  const ToolResult result = folder.migrate({}, [] { ::signal(SIGCHLD, SIG_IGN); });
  EXPECT_EQ(0, result.exitCode);
  EXPECT_EQ("", result.err);
  EXPECT_EQ(8U, folder.contents("out").size());
}

// A warning that nobody gets to read stops the run: of a leftover, of a file that is not read, and
// of a definition that gets lost.
TEST_F(Output, WarningThatCannotBePrintedStopsTheRun) {
  const auto fullError = [] {
    if (::freopen("/dev/full", "w", stderr) == nullptr) {
      ::_exit(125);
    }
  };
  EXPECT_EQ(0, folder.migrate({}, fullError).exitCode);
  std::filesystem::remove_all(folder.file("out"));
  const std::pair<const char*, const char*> kCauses[] = {
      {".out.partial-abcdef", ""},
      {"old/V3.other", "x"},
      {"old/V3.orv.at", "ORVAttributetypes=( 1.9 LENGTH 3 )\n"},
  };
  for (const auto& [name, text] : kCauses) {
    SCOPED_TRACE(name);
    if (*text == '\0') {
      folder.install(name, {});
    } else {
      folder.write(name, text);
    }
    const std::string before = folder.snapshot();
    EXPECT_EQ(0, folder.migrate().exitCode);
    std::filesystem::remove_all(folder.file("out"));
    EXPECT_EQ(5, folder.migrate({}, fullError).exitCode);
    EXPECT_EQ(before, folder.snapshot());
    std::filesystem::remove_all(folder.file(name));
  }
}

TEST_F(Output, ReportThatCannotBePrintedStopsTheRun) {
  const ToolResult result = folder.migrate({}, [] {
    if (::freopen("/dev/full", "w", stdout) == nullptr) {
      ::_exit(125);
    }
  });
  EXPECT_EQ(5, result.exitCode);
  EXPECT_EQ("schema-migrate: error: the report cannot be written to standard output\n", result.err);
  EXPECT_EQ("new old", folder.names());
}

// The summary comes when the output is in place.
TEST_F(Output, SummaryThatCannotBePrintedIsTold) {
  const rlim_t report = folder.withPath(folder.migrate().out).find("\nFile ");
  std::filesystem::remove_all(folder.file("out"));
  const ToolResult result = folder.migrate({}, [&] {
    const rlimit limit{report + 10, report + 10};
    ::setrlimit(RLIMIT_FSIZE, &limit);
  });
  EXPECT_EQ(5, result.exitCode);
  EXPECT_EQ(
      "@/out: error: is complete and in place, but the summary cannot be written to standard output\n",
      result.err);
  EXPECT_EQ(8U, folder.contents("out").size());
  EXPECT_EQ("new old out", folder.names());
}

// With standard output closed, a file of the output would be opened in its place.
TEST_F(Output, IsNotMixedUpWithAClosedStandardOutput) {
  folder.migrate({}, [] {
    ::close(STDIN_FILENO);
    ::close(STDOUT_FILENO);
    ::close(STDERR_FILENO);
  });
  EXPECT_EQ(
      kHeader +
          std::string(
              "attributetypes=( 1.1 NAME ( 'a'  ) OBSOLETE USAGE userApplications  )\nattributetypes=( 1.2 NAME ( 'b'  ) OBSOLETE USAGE userApplications  )\n"),
      folder.contents("out")["V3.user.at"]);
}

// ---- Definitions that writing would change ----

struct Row {
  const char* name;
  const char* definition;
};

void PrintTo(const Row& row, std::ostream* out) { *out << row.name; }

const Row kRows[] = {
    {"SuperiorWithABlank", "SUP 'a b'"},
    {"UsageThatIsEmpty", "USAGE ''"},
    {"UsageThatIsANumber", "USAGE '12'"},
    {"ValueThatNeverEnds", "EQUALITY 'a COLLECTIVE b'"},
    {"ValueThatBeginsAnother", "SYNTAX 'a attributetypes b'"},
    {"TwoSuperiors", "SUP b SUP c"},
    {"ValueWithARemark", "EQUALITY '1.2 # y'"},
    {"ValueThatCloses", "EQUALITY 'a ) b'"},
    {"ValueThatOpensABlock", "EQUALITY 'a ) attributetypes { ( 3.3'"},
};

class Unwritable : public testing::TestWithParam<Row> {};

constexpr char kUnwritable[] =
    " would not be read again as it is written: a value in quotes that is neither a name nor a description, an empty value and a second SUP do not survive; decide what comes of it, with a text of its own or NEW's, or exclude its OID\n";

TEST_P(Unwritable, DefinitionIsFoundOutAndNothingIsLeft) {
  for (const char* const layout : {"keep", "library"}) {
    SCOPED_TRACE(layout);
    const ToolFolder folder;
    folder.install("old", {{"V3.user.at", std::string("# first\nattributetypes=( 1.1 NAME 'a' ") +
                                              GetParam().definition + " )\n"}});
    folder.install("new", kNew);
    const ToolResult result = folder.run(
        {"migrate", "--from", "@/old", "--to", "@/new", "--layout", layout, "--out", "@/out"},
        [] { ::alarm(20); });
    EXPECT_EQ(4, result.exitCode);
    EXPECT_EQ(
        std::string("@/old/V3.user.at:2:16: error: attribute type a (1.1)") + kUnwritable +
            "schema-migrate: error: refused: the server's library does not come to what was planned; nothing was written\n",
        result.err);
    EXPECT_EQ("new old", folder.names());
  }
}

// The culprit is told from the others in its file, wherever it stands among them, and whichever
// installation they are of.
TEST_P(Unwritable, DefinitionIsToldFromTheOthers) {
  for (const char* const oid : {"1.0", "1.2", "1.4", "9.9"}) {
    SCOPED_TRACE(oid);
    const ToolFolder folder;
    folder.install("old", {{"V3.user.at",
                            "attributetypes=( 1.1 NAME 'first' OBSOLETE )\n"
                            "attributetypes=( " +
                                std::string(oid) + " NAME 'a' " + GetParam().definition + " )\n"}});
    folder.install("new", {{"V3.user.at",
                            "attributetypes=( 1.3 NAME 'b' OBSOLETE )\n"
                            "attributetypes=( 1.5 NAME 'last' OBSOLETE )\n"}});
    const ToolResult result = folder.migrate({}, [] { ::alarm(20); });
    EXPECT_EQ(4, result.exitCode);
    EXPECT_EQ("@/old/V3.user.at:2:16: error: attribute type a (" + std::string(oid) + ")",
              result.err.substr(0, result.err.find(" would not be read again")));
  }
}

// The library's writer makes one of two superiors: nothing is lost without a decision.
TEST(SecondSuperior, HasToBeDecided) {
  const ToolFolder folder;
  const std::string line = "attributetypes=( 1.1 NAME 'a' SUP b SUP c )\n";
  const std::string others =
      "attributetypes=( 1.2 NAME 'b' OBSOLETE )\nattributetypes=( 1.3 NAME 'c' OBSOLETE )\n";
  folder.install("old", {{"V3.user.at", line + others}});
  folder.install("new", {{"V3.user.at", others}});
  folder.write("d.toml",
               "[[definition]]\nkind = \"attribute-type\"\noid = \"1.1\"\ntext = \"( 1.1 NAME 'a' "
               "SUP b )\"\n");
  for (const std::string layout : {"keep", "library"}) {
    std::vector<std::string> words = {"migrate", "--from", "@/old",    "--to", "@/new",
                                      "--out",   "@/out",  "--layout", layout};
    const ToolResult refused = folder.run(words);
    EXPECT_EQ(4, refused.exitCode);
    EXPECT_EQ(
        "@/old/V3.user.at:1:16: error: attribute type a (1.1) would not be read again as it is "
        "written: a value in quotes that is neither a name nor a description, an empty value and a "
        "second SUP do not survive; decide what comes of it, with a text of its own or NEW's, or "
        "exclude its OID\n",
        refused.err.substr(0, refused.err.find('\n') + 1));
    EXPECT_EQ("d.toml new old", folder.names());
    words.insert(words.end(), {"--decisions", "@/d.toml"});
    EXPECT_EQ(0, folder.run(words).exitCode);
    const std::string written = folder.contents("out")["V3.user.at"];
    EXPECT_NE(std::string::npos, written.find("SUP b")) << written;
    EXPECT_EQ(std::string::npos, written.find("SUP c")) << written;
    std::filesystem::remove_all(folder.file("out"));
  }
}

INSTANTIATE_TEST_SUITE_P(Rows, Unwritable, testing::ValuesIn(kRows),
                         [](const auto& row) { return std::string(row.param.name); });

}  // namespace
