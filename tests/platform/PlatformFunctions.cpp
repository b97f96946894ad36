#include "PlatformFunctions.h"

#include <sys/stat.h>
#include <sys/syscall.h>
#include <unistd.h>

#include <cctype>
#include <cerrno>

namespace {

int otherUpper = -1;
int otherLower = -1;

struct stat brokenFile {};
bool isBroken = false;
int failedReads = 0;

bool isBrokenFile(int descriptor) {
  struct stat status {};
  return isBroken && ::fstat(descriptor, &status) == 0 && status.st_dev == brokenFile.st_dev &&
         status.st_ino == brokenFile.st_ino && ::lseek(descriptor, 0, SEEK_CUR) > 0;
}

}  // namespace

extern "C" {

// As in the "C" locale, but for the one character.
int tolower(int c) noexcept {
  if (c == otherUpper) {
    return otherLower;
  }
  return c >= 'A' && c <= 'Z' ? c + ('a' - 'A') : c;
}

ssize_t read(int descriptor, void* buffer, size_t size) {
  if (isBrokenFile(descriptor)) {
    ++failedReads;
    errno = EIO;
    return -1;
  }
  return ::syscall(SYS_read, descriptor, buffer, size);
}
}

namespace platform {

OtherFolding::OtherFolding(char upper, char lower) {
  otherUpper = static_cast<unsigned char>(upper);
  otherLower = static_cast<unsigned char>(lower);
}

OtherFolding::~OtherFolding() { otherUpper = -1; }

BrokenFile::BrokenFile(const std::string& path) {
  failedReads = 0;
  isBroken = ::stat(path.c_str(), &brokenFile) == 0;
}

BrokenFile::~BrokenFile() { isBroken = false; }

int BrokenFile::failures() { return failedReads; }

}  // namespace platform
