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

}  // namespace platform

#endif  // LIBSCHEMA_TESTS_PLATFORM_FUNCTIONS_H
