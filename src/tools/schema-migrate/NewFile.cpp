#include "NewFile.h"

#include <fcntl.h>
#include <unistd.h>

#include <cerrno>
#include <cstdio>

#include "Descriptor.h"
#include "Directory.h"
#include "Interruption.h"
#include "Messages.h"
#include "OutputPlace.h"
#include "OwnDirectory.h"
#include "Removals.h"

namespace {

[[noreturn]] void failSystem(const std::string& path, const std::string& text) {
  const int error = errno;
  throw Failure(kNotWritten, errorLine(path, text + ": " + systemError(error)));
}

// A new file under a name that no other has; it goes when the object does, unless it was renamed.
class PartialFile {
 public:
  explicit PartialFile(const std::string& path) : m_path(path), m_parent(parentOf(path)) {
    if (!m_parent.isOpen()) {
      failSystem(m_path, "cannot be created, as the directory to create it in cannot be used");
    }
    const std::size_t slash = path.rfind('/');
    m_name = path.substr(slash == std::string::npos ? 0 : slash + 1);
    if (m_name.empty() || m_name == "." || m_name == "..") {
      throw Failure(kNotWritten, errorLine(m_path, "cannot be created: it names a directory"));
    }
  }
  PartialFile(const PartialFile&) = delete;
  PartialFile& operator=(const PartialFile&) = delete;
  ~PartialFile() {
    if (m_file.isOpen()) {
      ::unlinkat(m_parent.number(), m_partial.c_str(), 0);
    }
    if (m_entry != nullptr) {
      Removals::drop(m_entry);
    }
  }

  void write(const std::string& bytes) {
    constexpr int kTries = 100;
    for (int tries = 1; !open(); ++tries) {
      if (errno != EEXIST || tries == kTries) {
        failSystem(m_path, "cannot be created");
      }
    }
    if (!writeAll(m_file.number(), bytes) || ::fsync(m_file.number()) != 0) {
      failSystem(m_path, "cannot be written");
    }
  }

  void rename(Over over) {
    struct stat there {};
    if (over == Over::kNothing && m_parent.look(m_name, &there)) {
      errno = EEXIST;
      failSystem(m_path, "cannot be created");
    }
    const int parent = m_parent.number();
    int result = -1;
    if (over == Over::kNothing) {
      result = ::renameat2(parent, m_partial.c_str(), parent, m_name.c_str(), RENAME_NOREPLACE);
    }
    const bool isWithout = result != 0 && (errno == EINVAL || errno == ENOSYS);
    if (over == Over::kWhatIsThere || isWithout) {
      result = ::renameat(parent, m_partial.c_str(), parent, m_name.c_str());
    }
    if (result != 0) {
      failSystem(m_path, "cannot be created");
    }
    m_file = Descriptor();
    if (::fsync(parent) != 0) {
      failSystem(m_path, "is complete and in place, but its entry cannot be brought to the disk");
    }
  }

 private:
  // Entered before it is there, so that an interruption finds it at any time.
  bool open() {
    m_partial = "." + m_name + ".partial-" + randomSuffix();
    m_entry = interruption::removals()->add(m_parent.number(), m_partial, true);
    if (m_entry == nullptr) {
      errno = ENAMETOOLONG;
      return false;
    }
    m_file = Descriptor(::openat(m_parent.number(), m_partial.c_str(),
                                 O_WRONLY | O_CREAT | O_EXCL | O_NOFOLLOW | O_CLOEXEC, 0666));
    if (!m_file.isOpen()) {
      const int error = errno;
      Removals::drop(m_entry);
      m_entry = nullptr;
      errno = error;
      return false;
    }
    struct stat status {};
    ::fstat(m_file.number(), &status);
    Removals::hold(m_entry, -1, FileIdentity::of(status));
    return true;
  }

  std::string m_path;
  Directory m_parent;
  std::string m_name;
  std::string m_partial;
  Descriptor m_file;
  Removals::Entry* m_entry = nullptr;
};

}  // namespace

void writeNewFile(const std::string& path, const std::string& bytes, Over over) {
  struct stat status {};
  if (over == Over::kNothing && ::lstat(path.c_str(), &status) == 0) {
    errno = EEXIST;
    failSystem(path, "cannot be created");
  }
  PartialFile file(path);
  file.write(bytes);
  file.rename(over);
}
