// The places of the library's diagnostic files, which have fixed names.

#ifndef LIBSCHEMA_TESTS_DIAGNOSTIC_PLACE_H
#define LIBSCHEMA_TESTS_DIAGNOSTIC_PLACE_H

#include <gtest/gtest.h>
#include <unistd.h>

#include <filesystem>
#include <string>

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

// Gives a file, or a symbolic link, to another user; only root can, and for others it stays theirs.
inline void giveToAnotherUser(const char* path) {
  constexpr uid_t kNobody = 65534;
  if (::geteuid() == 0) {
    EXPECT_EQ(0, ::lchown(path, kNobody, kNobody)) << path;
  }
}

}  // namespace support

#endif  // LIBSCHEMA_TESTS_DIAGNOSTIC_PLACE_H
