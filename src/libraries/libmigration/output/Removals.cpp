#include "Removals.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <sys/syscall.h>
#include <unistd.h>

#include <cstdint>
#include <cstring>
#include <ctime>

namespace migration {

namespace {

// What becomes of an entry. Only who takes it from one state to the next may touch the rest of it.
enum State : int {
  kFree,
  kBeingMade,  // add() fills it
  kEntered,
  kBeingRemoved,  // run() has it
  kRemoved,       // until it is dropped
};

constexpr std::size_t kInBlock = 12;

}  // namespace

struct Removals::Entry {
  std::atomic<int> state{kFree};
  std::atomic<bool> isHeld{false};    // the directory is known by its descriptor
  std::atomic<bool> hasPlace{false};  // it is to be renamed to `place`
  bool isFile = false;
  int parent = -1;
  int directory = -1;
  FileIdentity identity;
  std::array<char, 256> name{};
  std::array<char, 256> place{};
};

// Blocks are added and never taken away, so that a handler can go through them at any time.
struct Removals::Block {
  std::array<Entry, kInBlock> entries;
  Block* older = nullptr;
};

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

void removeEntered(const Removals::Entry& entry) {
  if (entry.isHeld && !entry.isFile) {
    removeFiles(entry.directory);
  }
  if (!entry.isHeld || isAt(entry.parent, entry.name.data(), entry.identity)) {
    ::unlinkat(entry.parent, entry.name.data(), entry.isFile ? 0 : AT_REMOVEDIR);
  }
}

}  // namespace

// What is removed may hide other entries from a listing that is under way.
void removeFiles(int directory) {
  while (removeOnce(directory, removeAny)) {
  }
}

Removals::Removals() : m_newest(new Block) {}

Removals::~Removals() {
  for (const Block* block = m_newest; block != nullptr;) {
    const Block* const older = block->older;
    delete block;
    block = older;
  }
}

Removals::Entry* Removals::addTo(Block* block, int parent, const std::string& name, bool isFile) {
  for (Entry& entry : block->entries) {
    int state = kFree;
    if (!entry.state.compare_exchange_strong(state, kBeingMade)) {
      continue;
    }
    static_cast<void>(fill(&entry.name, name));
    entry.parent = parent;
    entry.isHeld = false;
    entry.hasPlace = false;
    entry.isFile = isFile;
    entry.state = kEntered;
    return &entry;
  }
  return nullptr;
}

Removals::Entry* Removals::add(int parent, const std::string& name, bool isFile) {
  if (name.size() >= Entry().name.size()) {
    return nullptr;
  }
  for (Block* block = m_newest; block != nullptr; block = block->older) {
    Entry* const entry = addTo(block, parent, name, isFile);
    if (entry != nullptr) {
      return entry;
    }
  }
  // Nobody else sees it before the entry is in it.
  auto* const block = new Block;
  Entry* const entry = addTo(block, parent, name, isFile);
  block->older = m_newest;
  while (!m_newest.compare_exchange_weak(block->older, block)) {
  }
  return entry;
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

void Removals::drop(Entry* entry) {
  constexpr timespec kMoment{0, 1000000};
  for (;;) {
    int state = kEntered;
    if (entry->state.compare_exchange_strong(state, kFree)) {
      return;
    }
    if (state == kRemoved) {
      entry->state = kFree;
      return;
    }
    ::nanosleep(&kMoment, nullptr);
  }
}

void Removals::settle(Entry* entry) {
  ++m_settledCount;
  drop(entry);
}

Removals::Placed Removals::run() {
  Placed placed{m_settledCount, m_settledCount};
  for (Block* block = m_newest; block != nullptr; block = block->older) {
    for (auto entry = block->entries.rbegin(); entry != block->entries.rend(); ++entry) {
      int state = kEntered;
      if (!entry->state.compare_exchange_strong(state, kBeingRemoved)) {
        continue;
      }
      placed.wanted += entry->hasPlace ? 1 : 0;
      if (entry->hasPlace && isAt(entry->parent, entry->place.data(), entry->identity)) {
        ++placed.inPlace;
      } else {
        removeEntered(*entry);
      }
      entry->state = kRemoved;
    }
  }
  return placed;
}

}  // namespace migration
