#include "InputFiles.h"

#include <dirent.h>
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstddef>
#include <limits>
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

class OpenFile {
 public:
  // Without blocking: a FIFO that nobody writes to would hold an ordinary open for ever.
  explicit OpenFile(const std::string& path)
      : m_descriptor(::open(path.c_str(), O_RDONLY | O_NONBLOCK | O_NOCTTY | O_CLOEXEC)) {
    struct stat status {};
    if (m_descriptor < 0 || ::fstat(m_descriptor, &status) != 0) {
      const int error = errno;
      struct stat named {};
      const bool isSocket = error == ENXIO && ::stat(path.c_str(), &named) == 0;
      m_problem = isSocket ? kindOf(named.st_mode) : systemErrorText(error);
    } else if (!S_ISREG(status.st_mode)) {
      m_problem = kindOf(status.st_mode);
    } else {
      m_size = static_cast<std::uint64_t>(status.st_size);
    }
  }
  OpenFile(const OpenFile&) = delete;
  OpenFile& operator=(const OpenFile&) = delete;
  ~OpenFile() {
    if (m_descriptor >= 0) {
      ::close(m_descriptor);
    }
  }

  const std::string& problem() const { return m_problem; }
  std::uint64_t size() const { return m_size; }

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

 private:
  int m_descriptor;
  std::uint64_t m_size = 0;
  std::string m_problem;
};

struct CloseDirectory {
  void operator()(DIR* directory) const { ::closedir(directory); }
};

}  // namespace

std::string systemErrorText(int error) { return std::generic_category().message(error); }

std::string readRegularFile(const std::string& path, std::uint64_t limit, std::string* bytes) {
  limit = std::min<std::uint64_t>(limit, std::numeric_limits<std::int64_t>::max());
  bytes->clear();
  OpenFile file(path);
  // What the file grows by while it is read is read as well, so that its end is met in any case.
  constexpr std::size_t kStep = 1 << 16;
  std::uint64_t room = file.size() + 1;
  std::size_t size = 0;
  while (file.problem().empty() && room <= limit + 1) {
    bytes->resize(static_cast<std::size_t>(room));
    const std::size_t count = file.read(bytes->data() + size, bytes->size() - size);
    size += count;
    if (count == 0) {
      break;
    }
    if (size == bytes->size()) {
      room = size > limit ? limit + 2 : std::min<std::uint64_t>(size + kStep, limit + 1);
    }
  }
  bytes->resize(size);
  std::string problem = file.problem();
  if (problem.empty() && (room > limit + 1 || size > limit)) {
    problem = "it is larger than the limit of " + std::to_string(limit) + " bytes";
  }
  if (!problem.empty()) {
    bytes->clear();
  }
  return problem;
}

std::unique_ptr<Source> readSource(const std::string& path, std::uint64_t limit,
                                   Failures* failures) {
  std::string bytes;
  const std::string problem = readRegularFile(path, limit, &bytes);
  if (!problem.empty()) {
    failures->push_back({path, 0, 0, "", "cannot be read: " + problem});
    return nullptr;
  }
  return std::make_unique<Source>(path, std::move(bytes));
}

std::string listDirectory(const std::string& path, std::vector<std::string>* names) {
  names->clear();
  const std::unique_ptr<DIR, CloseDirectory> open(::opendir(path.c_str()));
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

}  // namespace migration
