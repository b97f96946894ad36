#include "Removals.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <sys/syscall.h>
#include <unistd.h>

#include <cstdint>
#include <cstring>

namespace {

// An entry as the kernel tells it; readdir() must not be called by a signal handler.
struct KernelEntry {
  std::uint64_t inode;
  std::int64_t offset;
  unsigned short length;
  unsigned char type;
  char name[1];
};

constexpr std::size_t kNameOffset = offsetof(KernelEntry, name);

bool fill(std::array<char, 256>* room, const std::string& text) {
  if (text.size() >= room->size()) {
    return false;
  }
  std::memcpy(room->data(), text.c_str(), text.size() + 1);
  return true;
}

bool isAt(int parent, const char* name, const FileIdentity& identity) {
  struct stat status {};
  return ::fstatat(parent, name, &status, AT_SYMLINK_NOFOLLOW) == 0 &&
         FileIdentity::of(status) == identity;
}

using Remove = bool (*)(int directory, const char* name);

bool removeFile(int directory, const char* name) { return ::unlinkat(directory, name, 0) == 0; }

// Goes through the directory once; returns true when something was removed.
bool removeOnce(int directory, Remove remove) {
  alignas(KernelEntry) std::array<char, 4096> buffer{};
  bool isAny = false;
  ::lseek(directory, 0, SEEK_SET);
  for (;;) {
    const long size = ::syscall(SYS_getdents64, directory, buffer.data(), buffer.size());
    if (size <= 0) {
      return isAny;
    }
    for (long at = 0; at < size;) {
      const char* const entry = buffer.data() + at;
      unsigned short length = 0;
      std::memcpy(&length, entry + offsetof(KernelEntry, length), sizeof length);
      isAny = remove(directory, entry + kNameOffset) || isAny;
      at += length;
    }
  }
}

// A directory with the files in it, but not with directories in it; a link is a file.
bool removeAny(int directory, const char* name) {
  if (removeFile(directory, name)) {
    return true;
  }
  const bool isSelfOrParent = name[0] == '.' && (name[1] == 0 || (name[1] == '.' && name[2] == 0));
  if (isSelfOrParent) {
    return false;
  }
  const int inner = ::openat(directory, name, O_RDONLY | O_DIRECTORY | O_NOFOLLOW | O_CLOEXEC);
  if (inner < 0) {
    return false;
  }
  while (removeOnce(inner, removeFile)) {
  }
  ::close(inner);
  return ::unlinkat(directory, name, AT_REMOVEDIR) == 0;
}

}  // namespace

// What is removed may hide other entries from a listing that is under way.
void removeFiles(int directory) {
  while (removeOnce(directory, removeAny)) {
  }
}

Removals::Entry* Removals::add(int parent, const std::string& name, bool isFile) {
  for (Entry& entry : m_entries) {
    if (!entry.isUsed) {
      if (!fill(&entry.name, name)) {
        return nullptr;
      }
      entry.parent = parent;
      entry.isHeld = false;
      entry.hasPlace = false;
      entry.isFile = isFile;
      entry.isUsed = true;
      return &entry;
    }
  }
  return nullptr;
}

void Removals::hold(Entry* entry, int directory, const FileIdentity& identity) {
  entry->directory = directory;
  entry->identity = identity;
  entry->isHeld = true;
}

bool Removals::setPlace(Entry* entry, const std::string& place) {
  entry->hasPlace = fill(&entry->place, place);
  return entry->hasPlace;
}

void Removals::drop(Entry* entry) { entry->isUsed = false; }

void Removals::settle(Entry* entry) {
  ++m_settledCount;
  drop(entry);
}

Removals::Placed Removals::run() {
  Placed placed{m_settledCount, m_settledCount};
  for (auto entry = m_entries.rbegin(); entry != m_entries.rend(); ++entry) {
    if (!entry->isUsed) {
      continue;
    }
    placed.wanted += entry->hasPlace ? 1 : 0;
    if (entry->hasPlace && isAt(entry->parent, entry->place.data(), entry->identity)) {
      ++placed.inPlace;
      continue;
    }
    if (entry->isHeld && !entry->isFile) {
      removeFiles(entry->directory);
    }
    if (!entry->isHeld || isAt(entry->parent, entry->name.data(), entry->identity)) {
      ::unlinkat(entry->parent, entry->name.data(), entry->isFile ? 0 : AT_REMOVEDIR);
    }
  }
  return placed;
}
