// Where private copies lie.

#include <gtest/gtest.h>
#include <libschema-migration/PrivatePlace.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

#include <ctime>
#include <filesystem>
#include <fstream>
#include <memory>

#include "DiagnosticPlace.h"
#include "Files.h"
#include "Machine.h"
#include "SmallFileSystem.h"

namespace {

namespace fs = std::filesystem;

using migration::PrivatePlace;
using migration::PrivatePlaceOptions;

constexpr char kNoOpenFiles[] = "/nonexistent";

// In a user namespace that has no root, whatever is root's seems to be somebody else's.
#define SKIP_UNLESS_ROOT_IS_KNOWN()                   \
  if (!migration::isBeyondOthers(folder.file("one"))) \
  GTEST_SKIP() << "here the folder of the test belongs neither to root nor to the user"

class PrivatePlaceIn : public testing::Test {
 protected:
  PrivatePlaceIn() {
    for (const char* const name : {"one", "two"}) {
      fs::create_directory(folder.file(name));
    }
  }

  // The candidate that is taken, as "one" or "two", or what is told when none is.
  std::string taken(const PrivatePlaceOptions& options) {
    migration::Failures failures;
    migration::Failures leftovers;
    const std::unique_ptr<PrivatePlace> place =
        PrivatePlace::make(options, &removals, &failures, &leftovers);
    for (const migration::Failure& left : leftovers) {
      warnings += left.file + ": " + left.text + "\n";
    }
    EXPECT_EQ(place == nullptr ? 1U : 0U, failures.size());
    if (place == nullptr) {
      return failures.front().file + ": " + failures.front().text;
    }
    std::ofstream(place->pathOf("file")) << "text";
    const fs::path path = place->shownPath();
    EXPECT_EQ("text", support::readWholeFile((path / "file").string()));
    struct stat status {};
    EXPECT_EQ(0, ::stat(path.c_str(), &status));
    EXPECT_EQ(0700U, status.st_mode & 0777U);
    return path.parent_path().filename().string();
  }

  std::vector<std::string> both() const { return {folder.file("one"), folder.file("two")}; }

  void setMode(const char* name, mode_t mode) const {
    ASSERT_EQ(0, ::chmod(folder.file(name).c_str(), mode));
  }

  support::TemporaryDirectory folder;
  migration::Removals removals;
  std::string warnings;
};

TEST_F(PrivatePlaceIn, FirstThatCanBeHad) {
  EXPECT_EQ("one", taken({both()}));
  EXPECT_EQ("two", taken({{folder.file("missing"), folder.file("two")}}));
  folder.write("file", "");
  EXPECT_EQ("two", taken({{folder.file("file"), folder.file("two")}}));
  EXPECT_EQ(
      ": no place can be had for the private copies of the files that are read and written; " +
          folder.file("file") + ": Not a directory; " + folder.file("missing") +
          ": No such file or directory; name another directory to make it in",
      taken({{folder.file("file"), folder.file("missing")}}));
  EXPECT_TRUE(fs::is_empty(folder.file("one")));
  EXPECT_TRUE(fs::is_empty(folder.file("two")));
  EXPECT_EQ("", warnings);
}

// Where a path to the directory itself is to be had, nobody can lead it to something else.
TEST_F(PrivatePlaceIn, DirectoryOfOthersWhenItIsReachedByItself) {
  if (::access("/proc/self/fd", X_OK) != 0) {
    GTEST_SKIP() << "/proc is not mounted";
  }
  setMode("one", 0777);
  migration::Failures failures;
  migration::Failures leftovers;
  const std::unique_ptr<PrivatePlace> place =
      PrivatePlace::make({both()}, &removals, &failures, &leftovers);
  ASSERT_NE(nullptr, place);
  fs::rename(folder.file("one"), folder.file("moved"));
  fs::create_directory(folder.file("one"));
  std::ofstream(place->pathOf("file")) << "text";
  const std::string name = fs::path(place->shownPath()).filename();
  EXPECT_TRUE(fs::exists(folder.file("moved/" + name + "/file")));
}

TEST_F(PrivatePlaceIn, NoDirectoryOfOthersOtherwise) {
  SKIP_UNLESS_ROOT_IS_KNOWN();
  EXPECT_EQ("one", taken({both(), 0, kNoOpenFiles}));
  for (const mode_t mode : {0777U, 0770U, 0702U}) {
    setMode("one", mode);
    EXPECT_EQ("two", taken({both(), 0, kNoOpenFiles}));
  }
  setMode("one", 01777);
  EXPECT_EQ("one", taken({both(), 0, kNoOpenFiles}));
  setMode("one", 0777);
  EXPECT_EQ(
      ": no place can be had for the private copies of the files that are read and written; " +
          folder.file("one") +
          ": other users can rename what is in it, or above it; name another directory to make it in",
      taken({{folder.file("one")}, 0, kNoOpenFiles}));
  // Nor one below it.
  fs::create_directory(folder.file("one/below"));
  EXPECT_EQ("two", taken({{folder.file("one/below"), folder.file("two")}, 0, kNoOpenFiles}));
  EXPECT_TRUE(fs::is_empty(folder.file("one/below")));
}

TEST_F(PrivatePlaceIn, NoDirectoryOfAnotherUserOtherwise) {
  SKIP_UNLESS_ROOT_IS_KNOWN();
  SKIP_UNLESS_MACHINE_CAN(kGiveFilesAway);
  support::giveToAnotherUser(folder.file("one").c_str());
  setMode("one", 0755);
  EXPECT_EQ("two", taken({both(), 0, kNoOpenFiles}));
}

// Rather one with room enough than the first; rather the first than none.
TEST_F(PrivatePlaceIn, FirstWithRoom) {
  SKIP_UNLESS_MACHINE_CAN(kMountFileSystems);
  const support::SmallFileSystem small(folder.file("one"), "mode=700,size=64k");
  EXPECT_EQ("one", taken({both(), 60000}));
  EXPECT_EQ("two", taken({both(), 70000}));
  EXPECT_EQ("one", taken({{folder.file("one")}, 70000}));
  EXPECT_EQ("one", taken({both(), std::uint64_t{1} << 62}));
}

// What a killed run left is named, unless that run may be under way.
TEST_F(PrivatePlaceIn, LeftoversAreNamed) {
  const std::string left = folder.file("one/private-copies-abcdef");
  fs::create_directory(left);
  EXPECT_EQ("one", taken({both()}));
  EXPECT_EQ("", warnings);
  const timespec times[2] = {{std::time(nullptr) - 100, 0}, {std::time(nullptr) - 100, 0}};
  ASSERT_EQ(0, ::utimensat(AT_FDCWD, left.c_str(), times, 0));
  const int lock = ::open(left.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
  ASSERT_EQ(0, ::flock(lock, LOCK_EX | LOCK_NB));
  EXPECT_EQ("one", taken({both()}));
  EXPECT_EQ("", warnings);
  ::close(lock);
  EXPECT_EQ("one", taken({both()}));
  EXPECT_EQ(
      left +
          ": private copies left behind by a run that was killed; they are not used, and can be removed\n",
      warnings);
  EXPECT_TRUE(fs::exists(left));
}

}  // namespace
