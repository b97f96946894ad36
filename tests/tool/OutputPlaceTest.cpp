// The directory that the output is created in: whose it is, who may write to it, and whether it is
// an input by another name.

#include <gtest/gtest.h>
#include <sys/mount.h>
#include <sys/stat.h>
#include <unistd.h>

#include <filesystem>

#include "DiagnosticPlace.h"
#include "Machine.h"
#include "SmallFileSystem.h"
#include "ToolRun.h"

namespace {

class OutputPlaceOf : public testing::Test {
 protected:
  OutputPlaceOf() {
    folder.install("old", {{"V3.user.at", "attributetypes=( 1.1 NAME 'a' OBSOLETE )\n"}});
    folder.install("new", {{"V3.user.at", "attributetypes=( 1.2 NAME 'b' OBSOLETE )\n"}});
    folder.install("p", {});
  }

  ToolResult runTo(const std::string& out, const std::vector<std::string>& more = {}) const {
    std::vector<std::string> arguments = {"migrate",  "--from",  "@/old", "--to", "@/new",
                                          "--layout", "library", "--out", out};
    arguments.insert(arguments.end(), more.begin(), more.end());
    return folder.run(arguments);
  }

  // Refused as `reason` says, with nothing done; done when told to.
  void expectRefused(const std::string& reason) const {
    const std::string before = folder.snapshot();
    const ToolResult result = runTo("@/p/out");
    EXPECT_EQ(5, result.exitCode);
    EXPECT_EQ("", result.out);
    EXPECT_EQ(
        "@/p/out: error: the directory to create it in, @/p, " + reason +
            ", who could put something else in the place of the output; create it in a directory of your own, or take the risk with --allow-foreign-parent\n",
        result.err);
    EXPECT_EQ(before, folder.snapshot());
    expectDone({"--allow-foreign-parent"});
  }

  void expectDone(const std::vector<std::string>& more) const {
    const ToolResult result = runTo("@/p/out", more);
    EXPECT_EQ(0, result.exitCode);
    EXPECT_EQ("", result.err);
    EXPECT_EQ(7U, folder.contents("p/out").size());
    std::filesystem::remove_all(folder.file("p/out"));
  }

  ToolFolder folder;
};

TEST_F(OutputPlaceOf, EverybodyIsRefusedUnlessItIsSticky) {
  for (const mode_t mode : {0777U, 0703U, 0772U}) {
    ASSERT_EQ(0, ::chmod(folder.file("p").c_str(), mode));
    expectRefused("is writable by everybody and not sticky");
  }
  for (const mode_t mode : {01777U, 0775U, 02770U, 0700U}) {
    ASSERT_EQ(0, ::chmod(folder.file("p").c_str(), mode));
    expectDone({});
  }
}

TEST_F(OutputPlaceOf, AnotherUserIsRefused) {
  SKIP_UNLESS_MACHINE_CAN(kGiveFilesAway);
  support::giveToAnotherUser(folder.file("p").c_str());
  expectRefused("belongs to another user (" + std::to_string(support::kAnotherUser) + ")");
}

TEST_F(OutputPlaceOf, AnInputIsRefusedByEachOfItsNames) {
  std::filesystem::create_directory_symlink("old", folder.file("link"));
  std::filesystem::create_directories(folder.file("old/sub/sub"));
  for (const char* const out : {"@/old/out", "@/link/out", "@/p/../old/out", "@/old/sub/sub/out"}) {
    const ToolResult result = runTo(out);
    EXPECT_EQ(2, result.exitCode);
    EXPECT_EQ("schema-migrate: error: the output directory " + std::string(out) +
                  " lies inside @/old, which is only read; name a place outside\n",
              result.err);
  }
}

TEST_F(OutputPlaceOf, ABoundInputIsRefused) {
  SKIP_UNLESS_MACHINE_CAN(kMountFileSystems);
  std::filesystem::create_directory(folder.file("old/sub"));
  const std::string bound = folder.file("p");
  ASSERT_TRUE(support::SmallFileSystem::canBeMade());
  ASSERT_EQ(0, ::mount(folder.file("old").c_str(), bound.c_str(), nullptr, MS_BIND, nullptr));
  for (const char* const out : {"@/p/out", "@/p/sub/out"}) {
    const ToolResult result = runTo(out);
    EXPECT_EQ(2, result.exitCode);
    EXPECT_EQ("schema-migrate: error: the output directory " + std::string(out) +
                  " lies inside @/old, which is only read; name a place outside\n",
              result.err);
  }
  EXPECT_EQ(0, ::umount2(bound.c_str(), MNT_DETACH));
  EXPECT_EQ(0, runTo("@/p/out").exitCode);
}

}  // namespace
