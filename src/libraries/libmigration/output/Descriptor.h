// An open file or directory, closed with the object; and what is done with one.

#ifndef LIBSCHEMA_MIGRATION_DESCRIPTOR_H
#define LIBSCHEMA_MIGRATION_DESCRIPTOR_H

#include <sys/stat.h>

#include <string_view>

namespace migration {

// Owns a descriptor of the system. An object belongs to one thread at a time.
class Descriptor {
 public:
  // Takes `number` over, which is closed with the object; -1 for none.
  explicit Descriptor(int number = -1) : m_number(number) {}
  ~Descriptor();
  // What is moved from has none, or what the other had.
  Descriptor(Descriptor&& other) noexcept;
  Descriptor& operator=(Descriptor&& other) noexcept;
  Descriptor(const Descriptor&) = delete;
  Descriptor& operator=(const Descriptor&) = delete;

  // Whether there is one.
  bool isOpen() const { return m_number >= 0; }
  // For calls of the system; -1 when there is none. It stays this object's.
  int number() const { return m_number; }

 private:
  int m_number;
};

// Writes all of it. Returns false, with the reason in errno, when that cannot be done; then part of
// it may be written. May be called by a signal handler.
bool writeAll(int descriptor, std::string_view bytes);

// Which file or directory it is, whatever its name.
struct FileIdentity {
  dev_t device = 0;  // of the file system, and
  ino_t inode = 0;   // in it

  // That of what the system told this about.
  static FileIdentity of(const struct stat& status) { return {status.st_dev, status.st_ino}; }
  // Whether it is the same one.
  bool operator==(const FileIdentity& other) const {
    return device == other.device && inode == other.inode;
  }
  // Whether it is another one.
  bool operator!=(const FileIdentity& other) const { return !(*this == other); }
};

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_DESCRIPTOR_H
