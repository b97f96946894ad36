#include "InputFiles.h"

#include <dirent.h>
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstddef>
#include <system_error>
#include <utility>

namespace migration {

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

bool isSameTime(const timespec& one, const timespec& other) {
  return one.tv_sec == other.tv_sec && one.tv_nsec == other.tv_nsec;
}

// As it is given: "1 GiB", "1500 bytes".
std::string shownSize(std::uint64_t bytes) {
  constexpr const char* kUnits[] = {"KiB", "MiB", "GiB", "TiB"};
  std::string text = std::to_string(bytes) + (bytes == 1 ? " byte" : " bytes");
  for (const char* const unit : kUnits) {
    if (bytes == 0 || bytes % 1024 != 0) {
      break;
    }
    bytes /= 1024;
    text = std::to_string(bytes) + " " + unit;
  }
  return text;
}

class OpenFile {
 public:
  // Without blocking: a FIFO that nobody writes to would hold an ordinary open for ever.
  OpenFile(int directory, const std::string& name)
      : m_descriptor(
            ::openat(directory, name.c_str(), O_RDONLY | O_NONBLOCK | O_NOCTTY | O_CLOEXEC)) {
    if (m_descriptor < 0 || ::fstat(m_descriptor, &m_status) != 0) {
      const int error = errno;
      struct stat named {};
      const bool isSocket = error == ENXIO && ::fstatat(directory, name.c_str(), &named, 0) == 0;
      m_problem = isSocket ? kindOf(named.st_mode) : systemErrorText(error);
    } else if (!S_ISREG(m_status.st_mode)) {
      m_problem = kindOf(m_status.st_mode);
    }
  }
  OpenFile(const OpenFile&) = delete;
  OpenFile& operator=(const OpenFile&) = delete;
  ~OpenFile() {
    if (m_descriptor >= 0) {
      ::close(m_descriptor);
    }
  }

  // Empty while all is well.
  const std::string& problem() const { return m_problem; }
  std::uint64_t size() const { return static_cast<std::uint64_t>(m_status.st_size); }
  unsigned mode() const { return m_status.st_mode & 07777; }

  // All of it. Of a file that grows no more is read than it had at first, and one byte.
  std::string readAll() {
    std::string bytes(static_cast<std::size_t>(size()) + 1, '\0');
    std::size_t done = 0;
    while (const std::size_t count = read(bytes.data() + done, bytes.size() - done)) {
      done += count;
    }
    if (m_problem.empty()) {
      noteChange(done);
    }
    bytes.resize(done);
    return bytes;
  }

  bool isChanged() const { return m_isChanged; }

 private:
  // 0 at the end, and after an error.
  std::size_t read(char* place, std::size_t size) {
    ssize_t count = 0;
    do {
      count = ::read(m_descriptor, place, size);
    } while (count < 0 && errno == EINTR);
    if (count < 0) {
      m_problem = systemErrorText(errno);
      return 0;
    }
    return static_cast<std::size_t>(count);
  }

  void noteChange(std::size_t read) {
    struct stat after {};
    if (::fstat(m_descriptor, &after) != 0) {
      m_problem = systemErrorText(errno);
      return;
    }
    m_isChanged = read != size() || after.st_size != m_status.st_size ||
                  !isSameTime(after.st_mtim, m_status.st_mtim) ||
                  !isSameTime(after.st_ctim, m_status.st_ctim);
  }

  int m_descriptor;
  struct stat m_status {};
  std::string m_problem;
  bool m_isChanged = false;
};

std::string readFileIn(int directory, const std::string& name, const ReadLimits& limits,
                       FileText* text) {
  text->bytes.clear();
  OpenFile file(directory, name);
  if (file.problem().empty() && file.size() > limits.room()) {
    return limits.exceeded();
  }
  std::string bytes = file.problem().empty() ? file.readAll() : std::string();
  if (!file.problem().empty()) {
    return "cannot be read: " + file.problem();
  }
  if (file.isChanged()) {
    return "changed while it was read; try again when nothing writes to it";
  }
  text->bytes = std::move(bytes);
  text->mode = file.mode();
  return "";
}

struct CloseDirectory {
  void operator()(DIR* directory) const { ::closedir(directory); }
};

constexpr int kDirectoryFlags = O_RDONLY | O_DIRECTORY | O_CLOEXEC;

}  // namespace

std::string ReadLimits::exceeded() const {
  return "with this file the inputs have more than " + shownSize(bytes) + " in all" +
         (advice.empty() ? "" : "; " + advice);
}

std::string systemErrorText(int error) { return std::generic_category().message(error); }

InputDirectory::InputDirectory(const std::string& path)
    : m_descriptor(::open(path.c_str(), kDirectoryFlags)), m_error(m_descriptor < 0 ? errno : 0) {}

InputDirectory::~InputDirectory() {
  if (m_descriptor >= 0) {
    ::close(m_descriptor);
  }
}

std::string InputDirectory::list(std::vector<std::string>* names) const {
  names->clear();
  if (m_error != 0) {
    return systemErrorText(m_error);
  }
  // Opened anew, since the listing has a position, and takes the descriptor.
  const int again = ::openat(m_descriptor, ".", kDirectoryFlags);
  const std::unique_ptr<DIR, CloseDirectory> open(again < 0 ? nullptr : ::fdopendir(again));
  if (open == nullptr) {
    return systemErrorText(errno);
  }
  // The end of the listing is no error, and only errno tells the two apart.
  for (errno = 0; const dirent* const entry = ::readdir(open.get()); errno = 0) {
    names->emplace_back(entry->d_name);
  }
  if (errno != 0) {
    const int error = errno;
    names->clear();
    return systemErrorText(error);
  }
  std::sort(names->begin(), names->end());
  return "";
}

std::string InputDirectory::read(const std::string& name, const ReadLimits& limits,
                                 FileText* text) const {
  return readFileIn(m_descriptor, name, limits, text);
}

std::string readFile(const std::string& path, const ReadLimits& limits, FileText* text) {
  return readFileIn(AT_FDCWD, path, limits, text);
}

std::unique_ptr<Source> readSource(const std::string& path, const ReadLimits& limits,
                                   Failures* failures) {
  FileText text;
  std::string problem = readFile(path, limits, &text);
  if (!problem.empty()) {
    failures->push_back({path, 0, 0, "", std::move(problem)});
    return nullptr;
  }
  return std::make_unique<Source>(path, std::move(text.bytes));
}

}  // namespace migration
