// Folders and files for a test.

#ifndef LIBSCHEMA_TESTS_FILES_H
#define LIBSCHEMA_TESTS_FILES_H

#include <string>
#include <vector>

namespace support {

// A new folder that goes, with all that is in it, when the object does.
class TemporaryDirectory {
 public:
  TemporaryDirectory();
  ~TemporaryDirectory();
  TemporaryDirectory(const TemporaryDirectory&) = delete;
  TemporaryDirectory& operator=(const TemporaryDirectory&) = delete;

  const std::string& path() const { return m_path; }
  std::string file(const std::string& name) const { return m_path + "/" + name; }

  // Writes a file and returns its path.
  std::string write(const std::string& name, const std::string& text) const;

 private:
  std::string m_path;
};

// The whole file; fails the running test, and returns "", when it cannot be read.
std::string readWholeFile(const std::string& path);

bool fileExists(const std::string& path);

std::vector<std::string> splitLines(const std::string& text);

// What `action` writes to standard output.
template <typename Action>
std::string standardOutputOf(Action action);

}  // namespace support

#include <gtest/gtest.h>

#include <iostream>

template <typename Action>
std::string support::standardOutputOf(Action action) {
  testing::internal::CaptureStdout();
  action();
  std::cout.flush();
  return testing::internal::GetCapturedStdout();
}

#endif  // LIBSCHEMA_TESTS_FILES_H
