// Diagnostic files that cannot be opened or written: those of another user, and those that find no
// room. Reading comes to the same as ever.

#include <fcntl.h>
#include <gtest/gtest.h>
#include <linux/capability.h>
#include <sys/resource.h>
#include <sys/stat.h>
#include <sys/syscall.h>
#include <unistd.h>

#include <csignal>
#include <fstream>
#include <functional>
#include <memory>
#include <string>

#include "Calls.h"
#include "DiagnosticPlace.h"
#include "Files.h"
#include "Installation.h"
#include "Machine.h"
#include "SmallFileSystem.h"

using namespace support;

namespace {

// For as long as it lives, permissions hold for this process even if it is root's.
class ObeyedPermissions {
 public:
  ObeyedPermissions() {
    EXPECT_EQ(0, ::syscall(SYS_capget, &m_header, m_data));
    __user_cap_data_struct lowered[2] = {m_data[0], m_data[1]};
    lowered[0].effective &= ~((1U << CAP_DAC_OVERRIDE) | (1U << CAP_DAC_READ_SEARCH));
    EXPECT_EQ(0, ::syscall(SYS_capset, &m_header, lowered));
  }
  ~ObeyedPermissions() { EXPECT_EQ(0, ::syscall(SYS_capset, &m_header, m_data)); }
  ObeyedPermissions(const ObeyedPermissions&) = delete;
  ObeyedPermissions& operator=(const ObeyedPermissions&) = delete;

 private:
  __user_cap_header_struct m_header = {_LINUX_CAPABILITY_VERSION_3, 0};
  __user_cap_data_struct m_data[2] = {};
};

// For as long as it lives, this process has no more of something.
class Limit {
 public:
  Limit(int resource, rlim_t most) : m_resource(resource) {
    std::signal(SIGXFSZ, SIG_IGN);
    EXPECT_EQ(0, ::getrlimit(kindOf(m_resource), &m_previous));
    const rlimit lowered{most, m_previous.rlim_max};
    EXPECT_EQ(0, ::setrlimit(kindOf(m_resource), &lowered));
  }
  ~Limit() { EXPECT_EQ(0, ::setrlimit(kindOf(m_resource), &m_previous)); }
  Limit(const Limit&) = delete;
  Limit& operator=(const Limit&) = delete;

 private:
  static __rlimit_resource kindOf(int resource) { return static_cast<__rlimit_resource>(resource); }

  int m_resource;
  rlimit m_previous{};
};

// The descriptor that the next file gets.
rlim_t nextDescriptor() {
  const int descriptor = ::open("/dev/null", O_RDONLY);
  EXPECT_EQ(0, ::close(descriptor));
  return static_cast<rlim_t>(descriptor);
}

void installFiles(const Installation& installation) {
  installation.write("V3.user.at", attributeType("1.1", "a") + vendorExtension("1.1", "normal"));
  installation.write("V3.user.oc", objectClass("2.1", "c"));
  installation.write("V3.system.at", attributeType("1.2", "b") + "attributetypes=( 1.3\n");
  installation.write("V3.system.oc", objectClass("2.2", "d") + "objectclasses=( 2.3\n");
  installation.write("V3.orv.at", attributeType("1.4", "e") + "ORVAttributetypes=( 1.4\n");
  installation.write("V3.orv.oc", "objectclasses 2.4\n");
}

// Reads good files and a file that fails in each of the ways; returns the results and, but for the
// diagnostic files that could not be opened, the messages.
std::string readFiles(Installation* installation) {
  std::string results;
  const std::string messages = messagesOf([&] {
    for (const char* const file :
         {"V3.user.at", "V3.user.oc", "V3.system.at", "V3.system.oc", "V3.orv.at", "V3.orv.oc"}) {
      results += std::to_string((*installation)->readFile(file)) + " ";
    }
  });
  for (const std::string& line : splitLines(messages)) {
    if (line.find("unable to open file") == std::string::npos) {
      results += "\n" + line.substr(0, line.find(" in directory"));
    }
  }
  return results;
}

// What reading comes to, and what the manager has then, with nothing in the way.
std::string expectedReading() {
  Installation installation;
  installFiles(installation);
  const std::string results = readFiles(&installation);
  EXPECT_EQ("0 0 1 1 1 1 ", results.substr(0, 12));
  return results + "\n" + stateOf(installation.manager());
}

// The same with what `disturb` does just before, and with what `restore` does behind.
void expectSameReading(Installation* installation, const std::function<void()>& disturb,
                       const std::function<void()>& restore) {
  installFiles(*installation);
  disturb();
  const std::string results = readFiles(installation);
  restore();
  EXPECT_EQ(expectedReading(), results + "\n" + stateOf(installation->manager()));
}

struct stat statusOf(const char* path) {
  struct stat status {};
  EXPECT_EQ(0, ::lstat(path, &status)) << path;
  return status;
}

// Files of this size, as many as there is room for.
class Filler {
 public:
  explicit Filler(std::size_t size) : m_text(size, 'x') {}

  int fill() const {
    int count = 0;
    while (std::ofstream(name(count), std::ios::binary) << m_text << std::flush) {
      ++count;
    }
    return count;
  }

  void empty() const {
    for (int i = 0; ::unlink(name(i).c_str()) == 0; ++i) {
    }
  }

 private:
  static std::string name(int i) { return "/tmp/filler-" + std::to_string(i); }

  std::string m_text;
};

TEST(DiagnosticFiles, AnotherUsersFileThatIsShutStaysAsItIs) {
  for (const char* const path : {kOpenedFiles[0], kOpenedFiles[1], kOpenedFiles[2], kOpenedFiles[3],
                                 static_cast<const char*>(kTableFile)}) {
    SCOPED_TRACE(path);
    const DiagnosticPlace place(path);
    std::ofstream(path) << "theirs\n";
    ASSERT_EQ(0, ::chmod(path, shutMode()));
    giveToAnotherUser(path);
    const struct stat before = statusOf(path);
    {
      const ObeyedPermissions obeyed;
      Installation installation;
      expectSameReading(
          &installation, [] {}, [] {});
    }
    const struct stat after = statusOf(path);
    EXPECT_EQ(before.st_ino, after.st_ino);
    EXPECT_EQ(before.st_uid, after.st_uid);
    EXPECT_EQ(before.st_mode, after.st_mode);
    EXPECT_EQ(before.st_mtim.tv_nsec, after.st_mtim.tv_nsec);
    EXPECT_EQ(7, after.st_size);
  }
}

// Root may open it, unless the system guards such files; it stays where it is and whose it is.
TEST(DiagnosticFiles, AnotherUsersFileThatIsOpenIsNotReplaced) {
  for (const char* const path : kOpenedFiles) {
    SCOPED_TRACE(path);
    const DiagnosticPlace place(path);
    std::ofstream(path) << "theirs\n";
    giveToAnotherUser(path);
    const struct stat before = statusOf(path);
    Installation installation;
    expectSameReading(
        &installation, [] {}, [] {});
    const struct stat after = statusOf(path);
    EXPECT_EQ(before.st_ino, after.st_ino);
    EXPECT_EQ(before.st_uid, after.st_uid);
    EXPECT_EQ(before.st_mode, after.st_mode);
  }
}

// Of the means of this process: no file can grow, or none can be opened besides the schema file.
TEST(DiagnosticFiles, NoRoomUnderTheLimitsOfTheProcess) {
  for (const int limited : {RLIMIT_FSIZE, RLIMIT_NOFILE}) {
    SCOPED_TRACE(limited == RLIMIT_FSIZE ? "size of files" : "open files");
    Installation installation;
    std::unique_ptr<Limit> limit;
    expectSameReading(
        &installation,
        [&] {
          limit = limited == RLIMIT_FSIZE
                      ? std::make_unique<Limit>(RLIMIT_FSIZE, 0)
                      : std::make_unique<Limit>(RLIMIT_NOFILE, nextDescriptor() + 1);
        },
        [&] { limit.reset(); });
  }
}

// Of the file system, which runs out of blocks or of inodes.
TEST(DiagnosticFiles, NoSpaceInTheFileSystem) {
  SKIP_UNLESS_MACHINE_CAN(kMountFileSystems);
  for (const bool isOutOfInodes : {false, true}) {
    SCOPED_TRACE(isOutOfInodes ? "inodes" : "blocks");
    const SmallFileSystem small("/tmp", "mode=1777,size=256k,nr_inodes=40");
    Installation installation;
    const Filler filler(isOutOfInodes ? 0 : 32768);
    const auto fill = [&] { EXPECT_GT(filler.fill(), 5); };
    const auto empty = [&] {
      filler.empty();
      EXPECT_EQ(!isOutOfInodes, fileExists(kOpenedFiles[0]));
      EXPECT_TRUE(isOutOfInodes || readWholeFile(kOpenedFiles[0]).empty());
    };
    expectSameReading(&installation, fill, empty);
  }
}

}  // namespace
