// The places of the library's diagnostic files, which have fixed names.

#ifndef LIBSCHEMA_TESTS_DIAGNOSTIC_PLACE_H
#define LIBSCHEMA_TESTS_DIAGNOSTIC_PLACE_H

#include <gtest/gtest.h>
#include <unistd.h>

#include <filesystem>
#include <string>

#include "Machine.h"

namespace support {

constexpr const char* kOpenedFiles[] = {"/tmp/attr.txt", "/tmp/orvattr.txt", "/tmp/objectclass.txt",
                                        "/tmp/lexan.txt"};
constexpr char kTableFile[] = "/tmp/table.txt";

// Clears the place of a diagnostic file for something else, and again when it goes.
class DiagnosticPlace {
 public:
  explicit DiagnosticPlace(const std::string& path) : m_path(path) { clear(); }
  ~DiagnosticPlace() { clear(); }
  DiagnosticPlace(const DiagnosticPlace&) = delete;
  DiagnosticPlace& operator=(const DiagnosticPlace&) = delete;

  const char* path() const { return m_path.c_str(); }

 private:
  void clear() {
    std::error_code error;
    std::filesystem::remove(m_path, error);
    EXPECT_FALSE(std::filesystem::exists(std::filesystem::symlink_status(m_path))) << m_path;
  }

  std::string m_path;
};

// Gives a file, or a symbolic link, to another user where the machine lets this one; else it stays
// as it is.
inline void giveToAnotherUser(const char* path) {
  if (machineCan(Ability::kGiveFilesAway)) {
    EXPECT_EQ(0, ::lchown(path, kAnotherUser, kAnotherGroup)) << path;
  }
}

// The mode of a file that this user cannot open, once it is given away if it can be.
inline mode_t shutMode() { return machineCan(Ability::kGiveFilesAway) ? 0600 : 0; }

}  // namespace support

#endif  // LIBSCHEMA_TESTS_DIAGNOSTIC_PLACE_H
