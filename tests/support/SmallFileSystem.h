// A file system with little room.

#ifndef LIBSCHEMA_TESTS_SMALL_FILE_SYSTEM_H
#define LIBSCHEMA_TESTS_SMALL_FILE_SYSTEM_H

#include <string>

namespace support {

// Mounted over a directory for as long as the object lives, and seen by this process and its
// children only.
class SmallFileSystem {
 public:
  // False where this process may not mount anything, as in many containers.
  static bool canBeMade();

  // `options` are those of a tmpfs, such as "size=8k,nr_inodes=3"; the directory itself is an
  // inode.
  SmallFileSystem(const std::string& directory, const std::string& options);
  ~SmallFileSystem();
  SmallFileSystem(const SmallFileSystem&) = delete;
  SmallFileSystem& operator=(const SmallFileSystem&) = delete;

 private:
  std::string m_directory;
};

}  // namespace support

#endif  // LIBSCHEMA_TESTS_SMALL_FILE_SYSTEM_H
