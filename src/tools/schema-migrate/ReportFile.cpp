#include "ReportFile.h"

#include <fcntl.h>
#include <unistd.h>

#include <cerrno>
#include <utility>

#include "Messages.h"
#include "OutputPlace.h"

ReportFile::ReportFile(const std::string& path, std::string beginning)
    : m_path(path), m_beginning(std::move(beginning)), m_parent(parentOf(path)) {
  m_name = path.substr(path.rfind('/') + 1);
  if (m_name.empty() || m_name == "." || m_name == "..") {
    fail("is no name of a file");
  }
  if (!m_parent.isOpen()) {
    failSystem("the directory to write it in cannot be used");
  }
  m_replaces = look();
}

ReportFile::~ReportFile() {
  if (!m_partial.empty()) {
    ::unlinkat(m_parent.number(), m_partial.c_str(), 0);
  }
}

void ReportFile::fail(const std::string& text) const {
  throw Failure(kNotWritten, errorLine(m_path, text));
}

void ReportFile::failSystem(const std::string& text) const {
  const int error = errno;
  fail(text + ": " + systemError(error));
}

// Whether there is something to replace.
bool ReportFile::look() {
  // Opening a pipe for reading would wait for somebody to write to it.
  const Descriptor there(::openat(m_parent.number(), m_name.c_str(),
                                  O_RDONLY | O_NOFOLLOW | O_NONBLOCK | O_NOCTTY | O_CLOEXEC));
  if (!there.isOpen() && errno == ENOENT) {
    return false;
  }
  if (!there.isOpen() && errno == ELOOP) {
    fail("is a symbolic link, which is not followed; name the file itself");
  }
  if (!there.isOpen()) {
    failSystem("cannot be replaced");
  }
  struct stat status {};
  if (::fstat(there.number(), &status) != 0 || !S_ISREG(status.st_mode)) {
    fail("is no regular file; name another one");
  }
  std::string bytes(m_beginning.size(), '\0');
  const ssize_t size = ::pread(there.number(), bytes.data(), bytes.size(), 0);
  if (size != 0 && bytes != m_beginning) {
    fail("is there and is no report of this program; name another file, or remove it");
  }
  m_mode = status.st_mode & 07777;
  return true;
}

// A file without a name goes by itself when the program is killed. Not every file system has them.
void ReportFile::open() {
  m_file = Descriptor(::openat(m_parent.number(), ".", O_TMPFILE | O_RDWR | O_CLOEXEC, 0666));
  if (m_file.isOpen()) {
    return;
  }
  m_partial = "." + m_name + ".partial-" + std::to_string(::getpid());
  m_file = Descriptor(::openat(m_parent.number(), m_partial.c_str(),
                               O_CREAT | O_EXCL | O_NOFOLLOW | O_RDWR | O_CLOEXEC, 0666));
  if (!m_file.isOpen()) {
    const int error = errno;
    m_partial.clear();
    errno = error;
    failSystem("cannot be created");
  }
}

void ReportFile::write(const std::string& bytes) {
  open();
  if ((m_replaces && ::fchmod(m_file.number(), m_mode) != 0) || !writeAll(m_file.number(), bytes) ||
      ::fsync(m_file.number()) != 0) {
    failSystem("cannot be written");
  }
}

void ReportFile::nameIt() {
  if (!m_partial.empty()) {
    return;
  }
  const std::string name = "." + m_name + ".partial-" + std::to_string(::getpid());
  const std::string own = "/proc/self/fd/" + std::to_string(m_file.number());
  if (::linkat(AT_FDCWD, own.c_str(), m_parent.number(), name.c_str(), AT_SYMLINK_FOLLOW) != 0) {
    failSystem("cannot be created");
  }
  m_partial = name;
}

void ReportFile::put() {
  // What is there may have changed meanwhile, and only a report is replaced.
  look();
  nameIt();
  if (::renameat(m_parent.number(), m_partial.c_str(), m_parent.number(), m_name.c_str()) != 0) {
    failSystem("cannot be created");
  }
  m_partial.clear();
  if (::fsync(m_parent.number()) != 0) {
    failSystem("cannot be brought to the disk");
  }
}
