#include "PlatformFunctions.h"

#include <sys/stat.h>
#include <sys/syscall.h>
#include <unistd.h>

#include <cctype>
#include <cerrno>
#include <cstdlib>
#include <new>

namespace {

int otherUpper = -1;
int otherLower = -1;

struct stat brokenFile {};
bool isBroken = false;
int failedReads = 0;
int allReads = 0;

int allocationsToGo = 0;  // up to the one that fails; 0 when none does

long foldedCharacters = 0;
long comparedTexts = 0;

bool isBrokenFile(int descriptor) {
  struct stat status {};
  return isBroken && ::fstat(descriptor, &status) == 0 && status.st_dev == brokenFile.st_dev &&
         status.st_ino == brokenFile.st_ino && ::lseek(descriptor, 0, SEEK_CUR) > 0;
}

}  // namespace

extern "C" {

// As in the "C" locale, but for the one character.
int tolower(int c) noexcept {
  ++foldedCharacters;
  if (c == otherUpper) {
    return otherLower;
  }
  return c >= 'A' && c <= 'Z' ? c + ('a' - 'A') : c;
}

int memcmp(const void* left, const void* right, size_t size) noexcept {
  ++comparedTexts;
  const auto* mine = static_cast<const unsigned char*>(left);
  const auto* other = static_cast<const unsigned char*>(right);
  for (size_t i = 0; i < size; ++i) {
    if (mine[i] != other[i]) {
      return mine[i] < other[i] ? -1 : 1;
    }
  }
  return 0;
}

ssize_t read(int descriptor, void* buffer, size_t size) {
  ++allReads;
  if (isBrokenFile(descriptor)) {
    ++failedReads;
    errno = EIO;
    return -1;
  }
  return ::syscall(SYS_read, descriptor, buffer, size);
}
}

void* operator new(std::size_t size) {
  if (allocationsToGo > 0 && --allocationsToGo == 0) {
    throw std::bad_alloc();
  }
  if (void* const memory = std::malloc(size == 0 ? 1 : size)) {
    return memory;
  }
  throw std::bad_alloc();
}

void* operator new(std::size_t size, const std::nothrow_t& /*tag*/) noexcept {
  return std::malloc(size == 0 ? 1 : size);
}

void operator delete(void* memory) noexcept { std::free(memory); }
void operator delete(void* memory, std::size_t /*size*/) noexcept { std::free(memory); }

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

long foldings() { return foldedCharacters; }

long comparisons() { return comparedTexts; }

int reads() { return allReads; }

FailingAllocation::FailingAllocation(int number) { allocationsToGo = number; }

FailingAllocation::~FailingAllocation() { allocationsToGo = 0; }

}  // namespace platform
