#include "AnswerFile.h"

#include <fcntl.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

#include <array>
#include <cerrno>
#include <utility>

#include "Messages.h"

namespace {

// The bytes of an open file; false, with the reason in errno, when they cannot be had.
bool readAll(int file, std::string* bytes) {
  std::array<char, 1U << 16U> buffer{};
  bytes->clear();
  while (true) {
    const ssize_t count =
        ::pread(file, buffer.data(), buffer.size(), static_cast<off_t>(bytes->size()));
    if (count == 0) {
      return true;
    }
    if (count < 0 && errno != EINTR) {
      return false;
    }
    bytes->append(buffer.data(), static_cast<std::size_t>(count > 0 ? count : 0));
  }
}

// A new name is on the disk when its directory is.
void syncDirectoryOf(const std::string& path) {
  const std::size_t slash = path.rfind('/');
  const std::string directory = slash == std::string::npos ? "." : path.substr(0, slash + 1);
  const migration::Descriptor opened(::open(directory.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC));
  if (opened.isOpen()) {
    ::fsync(opened.number());
  }
}

}  // namespace

bool AnswerFile::isThere(const std::string& path) {
  struct stat status {};
  return ::stat(path.c_str(), &status) == 0 || errno != ENOENT;
}

AnswerFile::AnswerFile(std::string path) : m_path(std::move(path)) {
  open(!isThere(m_path));
  readWhole();
}

AnswerFile::~AnswerFile() {
  if (m_isCreated && m_known.empty() && isUnchanged()) {
    ::unlink(m_path.c_str());
  }
}

void AnswerFile::open(bool isNew) {
  const int how = O_RDWR | O_APPEND | O_CLOEXEC | O_NONBLOCK | O_NOCTTY;
  m_file =
      migration::Descriptor(::open(m_path.c_str(), how | (isNew ? O_CREAT | O_EXCL : 0), 0666));
  struct stat status {};
  if (!m_file.isOpen() || ::fstat(m_file.number(), &status) != 0) {
    throw Failure(kNotWritten, errorLine(m_path, std::string("cannot be ") +
                                                     (isNew ? "created: " : "written to: ") +
                                                     systemError(errno)));
  }
  if (!S_ISREG(status.st_mode)) {
    throw Failure(kNotWritten, errorLine(m_path, "is no regular file; nothing can be added to it"));
  }
  // Where locks are not to be had the run goes on without.
  if (::flock(m_file.number(), LOCK_EX | LOCK_NB) != 0 && errno == EWOULDBLOCK) {
    throw Failure(kRefused, errorLine(m_path,
                                      "another schema-migrate decide is adding to it; end that one "
                                      "first"));
  }
  m_isCreated = isNew;
  if (isNew) {
    syncDirectoryOf(m_path);
  }
}

void AnswerFile::readWhole() {
  if (!readAll(m_file.number(), &m_known)) {
    throw Failure(kBadInput, errorLine(m_path, "cannot be read: " + systemError(errno)));
  }
}

bool AnswerFile::isUnchanged() const {
  struct stat named {};
  struct stat opened {};
  std::string bytes;
  return ::stat(m_path.c_str(), &named) == 0 && ::fstat(m_file.number(), &opened) == 0 &&
         migration::FileIdentity::of(named) == migration::FileIdentity::of(opened) &&
         readAll(m_file.number(), &bytes) && bytes == m_known;
}

void AnswerFile::reopen() {
  m_sizes.clear();
  m_file = migration::Descriptor();
  open(!isThere(m_path));
  readWhole();
}

std::string AnswerFile::asAppended(const std::string& entry) const {
  if (m_known.empty()) {
    return entry.substr(entry.find_first_not_of('\n'));
  }
  return (m_known.back() == '\n' ? "" : "\n") + entry;
}

migration::Decision AnswerFile::readBack(const std::string& entry,
                                         migration::Failures* failures) const {
  const migration::Source source(m_path, m_known + asAppended(entry));
  std::vector<migration::Decision> decisions;
  readDecisions(source, &decisions, failures);
  return decisions.empty() ? migration::Decision() : decisions.back();
}

void AnswerFile::append(const std::string& entry) {
  const std::string text = asAppended(entry);
  if (!migration::writeAll(m_file.number(), text) || ::fsync(m_file.number()) != 0) {
    const int error = errno;
    shorten(m_known.size());
    throw Failure(kNotWritten,
                  errorLine(m_path, "cannot be written: " + systemError(error) +
                                        "; the last answer is not in it, those before it are"));
  }
  m_sizes.push_back(m_known.size());
  m_known += text;
}

void AnswerFile::takeBack() {
  shorten(m_sizes.back());
  m_known.resize(m_sizes.back());
  m_sizes.pop_back();
}

void AnswerFile::shorten(std::size_t size) {
  if (::ftruncate(m_file.number(), static_cast<off_t>(size)) != 0 ||
      ::fsync(m_file.number()) != 0) {
    throw Failure(kNotWritten, errorLine(m_path, "an entry cannot be taken out of it: " +
                                                     systemError(errno) + "; look at its end"));
  }
}
