#include "OutputDirectory.h"

#include <dirent.h>
#include <fcntl.h>
#include <sys/file.h>
#include <unistd.h>

#include <array>
#include <cerrno>
#include <climits>
#include <cstdio>
#include <cstdlib>
#include <memory>
#include <vector>

#include "InputFile.h"
#include "Interruption.h"
#include "Messages.h"
#include "SchemaFiles.h"

namespace {

[[noreturn]] void fail(const std::string& path, const std::string& text) {
  throw Failure(kNotWritten, errorLine(path, text));
}

[[noreturn]] void failSystem(const std::string& path, const std::string& text) {
  const int error = errno;
  fail(path, text + ": " + systemError(error));
}

class Descriptor {
 public:
  explicit Descriptor(int number) : m_number(number) {}
  ~Descriptor() {
    if (m_number >= 0) {
      ::close(m_number);
    }
  }
  Descriptor(const Descriptor&) = delete;
  Descriptor& operator=(const Descriptor&) = delete;
  int number() const { return m_number; }
  bool isOpen() const { return m_number >= 0; }

 private:
  int m_number;
};

struct CloseDirectory {
  void operator()(DIR* directory) const { ::closedir(directory); }
};

// The names in a directory but "." and ".."; false when it cannot be read.
bool listDirectory(const std::string& path, std::vector<std::string>* names) {
  const std::unique_ptr<DIR, CloseDirectory> directory(::opendir(path.c_str()));
  if (directory == nullptr) {
    return false;
  }
  while (const dirent* entry = ::readdir(directory.get())) {
    const std::string name = entry->d_name;
    if (name != "." && name != "..") {
      names->push_back(name);
    }
  }
  return true;
}

std::string partialPrefix(const std::string& name) { return "." + name + ".partial-"; }

std::string resolved(const std::string& path) {
  const std::unique_ptr<char, decltype(&std::free)> text(::realpath(path.c_str(), nullptr),
                                                         &std::free);
  return text == nullptr ? std::string() : std::string(text.get());
}

void syncOne(const std::string& path) {
  const Descriptor open(::open(path.c_str(), O_RDONLY | O_NOFOLLOW | O_CLOEXEC));
  if (!open.isOpen() || ::fsync(open.number()) != 0) {
    failSystem(path, "cannot be brought to the disk");
  }
  // What is read back then comes from the disk. Not every file system does so, and none has to.
  static_cast<void>(::posix_fadvise(open.number(), 0, 0, POSIX_FADV_DONTNEED));
}

void writeAll(int descriptor, const char* bytes, std::size_t size, const std::string& path) {
  while (size > 0) {
    const ssize_t count = ::write(descriptor, bytes, size);
    if (count < 0 && errno != EINTR) {
      failSystem(path, "cannot be written");
    }
    const auto done = static_cast<std::size_t>(count > 0 ? count : 0);
    bytes += done;
    size -= done;
  }
}

}  // namespace

OutputDirectory::OutputDirectory(const std::string& path, const std::string& from,
                                 const std::string& to, std::string* warnings)
    : m_path(path) {
  while (m_path.size() > 1 && m_path.back() == '/') {
    m_path.pop_back();
  }
  const std::size_t slash = m_path.rfind('/');
  m_parent = slash == std::string::npos ? "." : slash == 0 ? "/" : m_path.substr(0, slash);
  m_name = m_path.substr(slash == std::string::npos ? 0 : slash + 1);
  if (m_name.empty() || m_name == "." || m_name == "..") {
    throw Failure(kUsage,
                  errorLine("--out must end in the name of the directory to create, not in \"" +
                            printable(path) + "\""));
  }
  checkIsOutside(from);
  checkIsOutside(to);
  checkPlace();
  findLeftovers(warnings);
}

OutputDirectory::~OutputDirectory() {
  remove();
  if (m_lock >= 0) {
    ::close(m_lock);
  }
}

// The inputs are never written, and a directory inside one would be.
void OutputDirectory::checkIsOutside(const std::string& input) const {
  const std::string parent = resolved(m_parent);
  const std::string directory = resolved(input);
  const bool isInside =
      !directory.empty() &&
      (parent == directory || parent.compare(0, directory.size() + 1, directory + "/") == 0);
  if (isInside) {
    throw Failure(kUsage,
                  errorLine("the output directory " + printable(m_path) + " lies inside " +
                            printable(input) + ", which is only read; name a place outside"));
  }
}

void OutputDirectory::checkPlace() {
  struct stat parent {};
  if (::stat(m_parent.c_str(), &parent) != 0) {
    failSystem(m_path, "the directory to create it in, " + m_parent + ", cannot be used");
  }
  if (!S_ISDIR(parent.st_mode)) {
    fail(m_path,
         "the output directory cannot be created in " + m_parent + ", which is not a directory");
  }
  if (::lstat(m_path.c_str(), &m_replaced) != 0) {
    if (errno != ENOENT) {
      failSystem(m_path, "the output directory cannot be looked at");
    }
    return;
  }
  if (!S_ISDIR(m_replaced.st_mode)) {
    fail(m_path, "exists and is not a directory; the output directory must be new or empty");
  }
  std::vector<std::string> names;
  if (!listDirectory(m_path, &names)) {
    failSystem(m_path, "the output directory cannot be read");
  }
  if (!names.empty()) {
    fail(m_path, "the output directory is not empty; name a new or an empty one");
  }
  m_replacesEmpty = true;
}

// A run that is under way holds a lock on its directory.
void OutputDirectory::findLeftovers(std::string* warnings) const {
  const std::string prefix = partialPrefix(m_name);
  std::vector<std::string> names;
  listDirectory(m_parent, &names);
  for (const std::string& name : names) {
    if (name.compare(0, prefix.size(), prefix) != 0) {
      continue;
    }
    const std::string path = m_parent + "/" + name;
    const Descriptor open(::open(path.c_str(), O_RDONLY | O_DIRECTORY | O_NOFOLLOW | O_CLOEXEC));
    const bool isInUse = open.isOpen() && ::flock(open.number(), LOCK_EX | LOCK_NB) != 0;
    *warnings += warningLine(
        path,
        isInUse
            ? "another run is writing to the same output directory; the one that ends first gets it"
            : "left behind by a run that was killed; it is not used, and can be removed");
  }
}

const std::string& OutputDirectory::create() {
  std::string path = m_parent + "/" + partialPrefix(m_name) + "XXXXXX";
  const interruption::Hold hold;
  if (::mkdtemp(path.data()) == nullptr) {
    failSystem(m_path, "the output directory cannot be created in " + m_parent);
  }
  m_partial = path;
  interruption::setUnfinished(m_partial);
  m_lock = ::open(m_partial.c_str(), O_RDONLY | O_DIRECTORY | O_NOFOLLOW | O_CLOEXEC);
  if (m_lock < 0 || ::flock(m_lock, LOCK_EX | LOCK_NB) != 0) {
    failSystem(m_partial, "the directory cannot be locked");
  }
  return m_partial;
}

void OutputDirectory::copyIn(const std::string& source, const std::string& fileName) {
  InputFile input(source);
  const std::string path = m_partial + "/" + fileName;
  const Descriptor output(
      ::open(path.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_NOFOLLOW | O_CLOEXEC, 0666));
  if (!output.isOpen()) {
    failSystem(path, "cannot be created");
  }
  std::vector<char> buffer(std::size_t{1} << 16);
  while (const std::size_t count = input.read(buffer.data(), buffer.size())) {
    writeAll(output.number(), buffer.data(), count, path);
  }
  if (!input.problem().empty()) {
    throw Failure(kBadInput, errorLine(source, "cannot be read: " + input.problem()));
  }
}

void OutputDirectory::sync() {
  std::vector<std::string> names;
  if (!listDirectory(m_partial, &names)) {
    failSystem(m_partial, "cannot be read");
  }
  for (const std::string& name : names) {
    syncOne(m_partial + "/" + name);
  }
}

// Owner and mode of the empty directory that it replaces, or the mode of any new directory.
void OutputDirectory::giveAttributes() {
  mode_t mode = 0777;
  if (m_replacesEmpty) {
    mode = m_replaced.st_mode & 07777;
    struct stat own {};
    const bool isOther = ::fstat(m_lock, &own) == 0 &&
                         (own.st_uid != m_replaced.st_uid || own.st_gid != m_replaced.st_gid);
    if (isOther && ::fchown(m_lock, m_replaced.st_uid, m_replaced.st_gid) != 0) {
      failSystem(m_path,
                 "the owner of the empty directory cannot be given to the one that replaces it");
    }
  } else {
    const mode_t mask = ::umask(0);
    ::umask(mask);
    mode &= ~mask;
  }
  if (::fchmod(m_lock, mode) != 0) {
    failSystem(m_partial, "its mode cannot be set");
  }
}

void OutputDirectory::publish() {
  giveAttributes();
  if (::fsync(m_lock) != 0) {
    failSystem(m_partial, "cannot be brought to the disk");
  }
  const interruption::Hold hold;
  rename();
  m_partial.clear();
  interruption::setUnfinished("");
  interruption::uninstall();
  const Descriptor parent(::open(m_parent.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC));
  if (!parent.isOpen() || ::fsync(parent.number()) != 0) {
    failSystem(m_path, "is complete and in place, but its entry cannot be brought to the disk");
  }
}

// Never over anything but an empty directory: a plain rename of a directory does not either.
void OutputDirectory::rename() {
  int result = -1;
  if (!m_replacesEmpty) {
    result = ::renameat2(AT_FDCWD, m_partial.c_str(), AT_FDCWD, m_path.c_str(), RENAME_NOREPLACE);
  }
  if (m_replacesEmpty || (result != 0 && (errno == EINVAL || errno == ENOSYS))) {
    result = ::rename(m_partial.c_str(), m_path.c_str());
  }
  if (result != 0 && (errno == EEXIST || errno == ENOTEMPTY)) {
    fail(m_path, "something else was put there while this run was under way; it was left alone");
  }
  if (result != 0) {
    failSystem(m_path, "the finished directory cannot be renamed to this");
  }
}

void OutputDirectory::remove() {
  if (m_partial.empty()) {
    return;
  }
  for (const char* const file : kSchemaFiles) {
    ::unlink((m_partial + "/" + file).c_str());
  }
  ::rmdir(m_partial.c_str());
  m_partial.clear();
  interruption::setUnfinished("");
}
