// The directories that a run has made and that must not outlive it. A signal handler may ask for
// their removal at any moment: between any two calls, what is entered here says what there is.

#ifndef SCHEMA_MIGRATE_REMOVALS_H
#define SCHEMA_MIGRATE_REMOVALS_H

#include <array>
#include <atomic>
#include <cstddef>
#include <string>

#include "Descriptor.h"

class Removals {
 public:
  struct Entry {
    std::atomic<bool> isUsed{false};
    std::atomic<bool> isHeld{false};    // the directory is known by its descriptor
    std::atomic<bool> hasPlace{false};  // it is to be renamed to `place`
    int parent = -1;
    int directory = -1;
    FileIdentity identity;
    std::array<char, 256> name{};
    std::array<char, 256> place{};
  };

  // Enters the directory that is about to be made as `name` in `parent`, which has to stay open.
  // Returns null when the name is too long, or there are too many.
  Entry* add(int parent, const std::string& name);

  // The directory has been made and opened. From now on its files are removed, too.
  static void hold(Entry* entry, int directory, const FileIdentity& identity);

  // Once the directory is found under the name `place`, it stays. Returns false when that is too
  // long.
  static bool setPlace(Entry* entry, const std::string& place);

  // The directory is none of these any more; with `settle`, because it is in its place for good.
  static void drop(Entry* entry);
  void settle(Entry* entry);

  // Removes them, the last one first. Returns true when one of them is in its place, and stays. May
  // be called by a signal handler.
  bool run();

 private:
  static constexpr std::size_t kMost = 8;

  std::array<Entry, kMost> m_entries;
  std::atomic<bool> m_isSettled{false};
};

// Removes every file in the directory, whose names may change meanwhile; what is left, is left. May
// be called by a signal handler.
void removeFiles(int directory);

#endif  // SCHEMA_MIGRATE_REMOVALS_H
