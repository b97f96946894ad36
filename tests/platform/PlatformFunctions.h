// Functions of the C library in a form of the tests' own, for the whole program and the libraries
// in it. They do what the C library does until a test asks for something else.

#ifndef LIBSCHEMA_TESTS_PLATFORM_FUNCTIONS_H
#define LIBSCHEMA_TESTS_PLATFORM_FUNCTIONS_H

#include <string>

namespace platform {

// While an object of this class lives, the locale makes of the character `upper` the character
// `lower`, whatever the library sets.
class OtherFolding {
 public:
  OtherFolding(char upper, char lower);
  ~OtherFolding();
  OtherFolding(const OtherFolding&) = delete;
  OtherFolding& operator=(const OtherFolding&) = delete;
};

// While an object of this class lives, the file cannot be read behind its first piece.
class BrokenFile {
 public:
  explicit BrokenFile(const std::string& path);
  ~BrokenFile();
  BrokenFile(const BrokenFile&) = delete;
  BrokenFile& operator=(const BrokenFile&) = delete;

  // How many reads have failed.
  static int failures();
};

// How many characters have been folded by tolower, and how many texts compared by memcmp, so far.
long foldings();
long comparisons();

// How many times the program has asked for a piece of a file, or of a directory, so far.
int reads();

// While an object of this class lives, the allocation with this number fails, the next being 1.
class FailingAllocation {
 public:
  explicit FailingAllocation(int number);
  ~FailingAllocation();
  FailingAllocation(const FailingAllocation&) = delete;
  FailingAllocation& operator=(const FailingAllocation&) = delete;
};

}  // namespace platform

#endif  // LIBSCHEMA_TESTS_PLATFORM_FUNCTIONS_H
