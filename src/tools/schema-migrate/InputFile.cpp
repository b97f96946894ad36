#include "InputFile.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>

#include "Messages.h"

namespace {

const char* kindOf(mode_t mode) {
  switch (mode & S_IFMT) {
    case S_IFDIR:
      return "it is a directory";
    case S_IFIFO:
      return "it is a FIFO";
    case S_IFCHR:
    case S_IFBLK:
      return "it is a device";
    case S_IFSOCK:
      return "it is a socket";
    default:
      return "it is not a regular file";
  }
}

}  // namespace

InputFile::InputFile(const std::string& path) : InputFile(AT_FDCWD, path) {}

InputFile::InputFile(const Directory& directory, const std::string& name)
    : InputFile(directory.number(), name) {}

// Without blocking: a FIFO nobody writes to would hold an ordinary open for ever.
InputFile::InputFile(int directory, const std::string& name)
    : m_descriptor(
          ::openat(directory, name.c_str(), O_RDONLY | O_NONBLOCK | O_NOCTTY | O_CLOEXEC)) {
  struct stat status {};
  if (!m_descriptor.isOpen() || ::fstat(descriptor(), &status) != 0) {
    const int error = errno;
    struct stat named {};
    const bool isSocket = error == ENXIO && ::fstatat(directory, name.c_str(), &named, 0) == 0;
    m_problem = isSocket ? kindOf(named.st_mode) : systemError(error);
  } else if (!S_ISREG(status.st_mode)) {
    m_problem = kindOf(status.st_mode);
  }
}

std::size_t InputFile::read(char* buffer, std::size_t size) {
  if (!m_problem.empty()) {
    return 0;
  }
  ssize_t count = 0;
  do {
    count = ::read(descriptor(), buffer, size);
  } while (count < 0 && errno == EINTR);
  if (count < 0) {
    m_problem = systemError(errno);
    return 0;
  }
  return static_cast<std::size_t>(count);
}
