#include "SmallFileSystem.h"

#include <gtest/gtest.h>
#include <sched.h>
#include <sys/mount.h>
#include <unistd.h>

#include <fstream>

#include "Files.h"

namespace support {

namespace {

bool writeTo(const char* path, const std::string& text) {
  std::ofstream out(path);
  out << text << std::flush;
  return out.good();
}

std::string mapOfItself(unsigned id) {
  return std::to_string(id) + " " + std::to_string(id) + " 1\n";
}

// Who is not root has to be root of a user namespace of its own first; every id stays what it is.
bool leaveMountsOfOthers() {
  const uid_t user = ::geteuid();
  const gid_t group = ::getegid();
  if (::unshare(CLONE_NEWNS) == 0) {
    return true;
  }
  return ::unshare(CLONE_NEWUSER | CLONE_NEWNS) == 0 && writeTo("/proc/self/setgroups", "deny\n") &&
         writeTo("/proc/self/uid_map", mapOfItself(user)) &&
         writeTo("/proc/self/gid_map", mapOfItself(group));
}

bool mountOver(const std::string& directory, const std::string& options) {
  return ::mount("small", directory.c_str(), "tmpfs", 0, options.c_str()) == 0;
}

bool tryToMount() {
  const TemporaryDirectory directory;
  return leaveMountsOfOthers() && ::mount("none", "/", "none", MS_REC | MS_PRIVATE, nullptr) == 0 &&
         mountOver(directory.path(), "size=4k") && ::umount(directory.path().c_str()) == 0;
}

}  // namespace

bool SmallFileSystem::canBeMade() {
  static const bool can = tryToMount();
  return can;
}

SmallFileSystem::SmallFileSystem(const std::string& directory, const std::string& options)
    : m_directory(directory) {
  EXPECT_TRUE(canBeMade());
  EXPECT_TRUE(mountOver(directory, options)) << directory << " " << options;
}

SmallFileSystem::~SmallFileSystem() { EXPECT_EQ(0, ::umount2(m_directory.c_str(), MNT_DETACH)); }

}  // namespace support
