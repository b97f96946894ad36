#include "Directory.h"

#include <dirent.h>
#include <fcntl.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <memory>
#include <utility>

namespace migration {

namespace {

constexpr int kFlags = O_RDONLY | O_DIRECTORY | O_CLOEXEC;

struct CloseDirectory {
  void operator()(DIR* directory) const { ::closedir(directory); }
};

}  // namespace

Directory::Directory(const std::string& path)
    : m_descriptor(::open(path.c_str(), kFlags)), m_path(path) {}

Directory::Directory(Descriptor descriptor, std::string path)
    : m_descriptor(std::move(descriptor)), m_path(std::move(path)) {}

std::string Directory::pathOf(const std::string& name) const {
  return (m_path == "/" ? "" : m_path) + "/" + name;
}

Directory Directory::open(const std::string& name) const {
  return {Descriptor(::openat(number(), name.c_str(), kFlags | O_NOFOLLOW)), pathOf(name)};
}

bool Directory::list(std::vector<std::string>* names) const {
  // Opened anew, since the listing has a position, and takes the descriptor.
  const int again = ::openat(number(), ".", kFlags);
  const std::unique_ptr<DIR, CloseDirectory> listing(again < 0 ? nullptr : ::fdopendir(again));
  if (listing == nullptr) {
    return false;
  }
  for (;;) {
    errno = 0;
    const dirent* const entry = ::readdir(listing.get());
    if (entry == nullptr) {
      break;
    }
    const std::string name = entry->d_name;
    if (name != "." && name != "..") {
      names->push_back(name);
    }
  }
  const int error = errno;
  std::sort(names->begin(), names->end());
  errno = error;
  return error == 0;
}

bool Directory::look(const std::string& name, struct stat* status) const {
  return ::fstatat(number(), name.c_str(), status, AT_SYMLINK_NOFOLLOW) == 0;
}

struct stat Directory::status() const {
  struct stat status {};
  ::fstat(number(), &status);
  return status;
}

bool Directory::has(const std::string& name, const FileIdentity& identity) const {
  struct stat status {};
  return look(name, &status) && FileIdentity::of(status) == identity;
}

}  // namespace migration
