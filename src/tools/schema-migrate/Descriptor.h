// An open file or directory, closed with the object; and what is done with one.

#ifndef SCHEMA_MIGRATE_DESCRIPTOR_H
#define SCHEMA_MIGRATE_DESCRIPTOR_H

#include <sys/stat.h>

#include <string_view>

class Descriptor {
 public:
  explicit Descriptor(int number = -1) : m_number(number) {}
  ~Descriptor();
  Descriptor(Descriptor&& other) noexcept;
  Descriptor& operator=(Descriptor&& other) noexcept;
  Descriptor(const Descriptor&) = delete;
  Descriptor& operator=(const Descriptor&) = delete;

  bool isOpen() const { return m_number >= 0; }
  int number() const { return m_number; }

 private:
  int m_number;
};

// Writes all of it. Returns false, with the reason in errno, when that cannot be done.
bool writeAll(int descriptor, std::string_view bytes);

// Which file or directory it is, whatever its name.
struct FileIdentity {
  dev_t device = 0;
  ino_t inode = 0;

  static FileIdentity of(const struct stat& status) { return {status.st_dev, status.st_ino}; }
  bool operator==(const FileIdentity& other) const {
    return device == other.device && inode == other.inode;
  }
  bool operator!=(const FileIdentity& other) const { return !(*this == other); }
};

#endif  // SCHEMA_MIGRATE_DESCRIPTOR_H
