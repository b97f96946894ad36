#include "NewFile.h"

#include <fcntl.h>
#include <unistd.h>

#include <cerrno>
#include <cstdio>
#include <utility>

#include "Descriptor.h"
#include "Directory.h"
#include "OutputDirectory.h"
#include "OutputStop.h"
#include "OwnDirectory.h"

namespace migration {

namespace {

constexpr int kTries = 100;
constexpr char kOpenFiles[] = "/proc/self/fd";

}  // namespace

// The file itself, whose making is stopped (OutputStop) where it cannot be done.
class NewFile::Parts {
 public:
  Parts(NewFileOptions options, Removals* removals);
  ~Parts();
  Parts(const Parts&) = delete;
  Parts& operator=(const Parts&) = delete;

  void write(const std::string& bytes);
  void put();

 private:
  [[noreturn]] void fail(const std::string& text) const { stopOutput(m_options.path, text); }
  [[noreturn]] void failSystem(const std::string& text) const {
    stopOutputOfSystem(m_options.path, text);
  }
  void look();
  void lookAtWhatIsThere();
  void open();
  template <typename Make>
  void makePartial(const Make& make);
  bool enter();
  void leave();
  void nameIt();
  void rename();

  NewFileOptions m_options;
  Removals m_own;  // for who has none
  Removals* m_removals;
  Directory m_parent;
  std::string m_name;
  std::string m_partial;               // its name before it is in its place
  Removals::Entry* m_entry = nullptr;  // while it has that name
  Descriptor m_file;
  mode_t m_mode = 0;  // of the file that is replaced
  bool m_replaces = false;
};

NewFile::Parts::Parts(NewFileOptions options, Removals* removals)
    : m_options(std::move(options)),
      m_removals(removals == nullptr ? &m_own : removals),
      m_parent(parentOf(m_options.path)) {
  m_name = m_options.path.substr(m_options.path.rfind('/') + 1);
  if (m_name.empty() || m_name == "." || m_name == "..") {
    fail("is no name of a file");
  }
  if (!m_parent.isOpen()) {
    failSystem("the directory to write it in cannot be used");
  }
  look();
}

NewFile::Parts::~Parts() {
  if (m_entry != nullptr) {
    ::unlinkat(m_parent.number(), m_partial.c_str(), 0);
    leave();
  }
}

// Whether there is something, and something to replace.
void NewFile::Parts::look() {
  struct stat status {};
  m_replaces = false;
  if (!m_parent.look(m_name, &status)) {
    if (errno != ENOENT) {
      failSystem("cannot be created");
    }
    return;
  }
  if (m_options.over == Over::kNothing) {
    errno = EEXIST;
    failSystem("cannot be created");
  }
  lookAtWhatIsThere();
  m_replaces = true;
}

void NewFile::Parts::lookAtWhatIsThere() {
  // Opening a pipe for reading would wait for somebody to write to it.
  const Descriptor there(::openat(m_parent.number(), m_name.c_str(),
                                  O_RDONLY | O_NOFOLLOW | O_NONBLOCK | O_NOCTTY | O_CLOEXEC));
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
  m_mode = status.st_mode & 07777;
  if (m_options.over == Over::kFileOfItsKind) {
    std::string bytes(m_options.beginning.size(), '\0');
    const ssize_t size = ::pread(there.number(), bytes.data(), bytes.size(), 0);
    if (size != 0 && bytes != m_options.beginning) {
      fail("is there and is no " + m_options.kind + "; name another file, or remove it");
    }
  }
}

// Entered before it is there, so that an interruption finds it at any time.
bool NewFile::Parts::enter() {
  m_partial = "." + m_name + ".partial-" + randomSuffix();
  m_entry = m_removals->add(m_parent.number(), m_partial, true);
  if (m_entry == nullptr) {
    errno = ENAMETOOLONG;
  }
  return m_entry != nullptr;
}

void NewFile::Parts::leave() { Removals::drop(std::exchange(m_entry, nullptr)); }

// Gives it a name that no other has; `make` returns false, with the reason in errno, when it
// cannot.
template <typename Make>
void NewFile::Parts::makePartial(const Make& make) {
  for (int tries = 1; !enter() || !make(); ++tries) {
    const int error = errno;
    if (m_entry != nullptr) {
      leave();
    }
    errno = error;
    if (error != EEXIST || tries == kTries) {
      failSystem("cannot be created");
    }
  }
  struct stat status {};
  ::fstat(m_file.number(), &status);
  Removals::hold(m_entry, -1, FileIdentity::of(status));
}

// A file without a name goes by itself when the program is killed. Not every file system has them,
// and its name is given by its path below /proc.
void NewFile::Parts::open() {
  if (::access(kOpenFiles, X_OK) == 0) {
    m_file = Descriptor(::openat(m_parent.number(), ".", O_TMPFILE | O_RDWR | O_CLOEXEC, 0666));
  }
  if (m_file.isOpen()) {
    return;
  }
  makePartial([&] {
    m_file = Descriptor(::openat(m_parent.number(), m_partial.c_str(),
                                 O_CREAT | O_EXCL | O_NOFOLLOW | O_RDWR | O_CLOEXEC, 0666));
    return m_file.isOpen();
  });
}

void NewFile::Parts::write(const std::string& bytes) {
  open();
  if ((m_replaces && ::fchmod(m_file.number(), m_mode) != 0) || !writeAll(m_file.number(), bytes) ||
      ::fsync(m_file.number()) != 0) {
    failSystem("cannot be written");
  }
}

void NewFile::Parts::nameIt() {
  if (m_entry != nullptr) {
    return;
  }
  const std::string own = std::string(kOpenFiles) + "/" + std::to_string(m_file.number());
  makePartial([&] {
    return ::linkat(AT_FDCWD, own.c_str(), m_parent.number(), m_partial.c_str(),
                    AT_SYMLINK_FOLLOW) == 0;
  });
}

void NewFile::Parts::rename() {
  const int parent = m_parent.number();
  int result = -1;
  if (!m_replaces) {
    result = ::renameat2(parent, m_partial.c_str(), parent, m_name.c_str(), RENAME_NOREPLACE);
  }
  if (m_replaces || (result != 0 && (errno == EINVAL || errno == ENOSYS))) {
    result = ::renameat(parent, m_partial.c_str(), parent, m_name.c_str());
  }
  if (result != 0) {
    failSystem("cannot be created");
  }
}

void NewFile::Parts::put() {
  // What is there may have changed meanwhile, and only what may be replaced is.
  look();
  nameIt();
  rename();
  leave();
  if (::fsync(m_parent.number()) != 0) {
    failSystem("is complete and in place, but its entry cannot be brought to the disk");
  }
}

NewFile::NewFile() = default;
NewFile::~NewFile() = default;

std::unique_ptr<NewFile> NewFile::open(const NewFileOptions& options, Removals* removals,
                                       Failures* failures) {
  std::unique_ptr<NewFile> file(new NewFile);
  const bool isOpen =
      runToEnd([&] { file->m_parts = std::make_unique<Parts>(options, removals); }, failures);
  return isOpen ? std::move(file) : nullptr;
}

bool NewFile::write(const std::string& bytes, Failures* failures) {
  return runToEnd([&] { m_parts->write(bytes); }, failures);
}

bool NewFile::put(Failures* failures) {
  return runToEnd([&] { m_parts->put(); }, failures);
}

bool writeNewFile(const NewFileOptions& options, const std::string& bytes, Removals* removals,
                  Failures* failures) {
  const std::unique_ptr<NewFile> file = NewFile::open(options, removals, failures);
  return file != nullptr && file->write(bytes, failures) && file->put(failures);
}

}  // namespace migration
