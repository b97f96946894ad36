// The directories and files that a run has made and that must not outlive it. A signal handler may
// ask for their removal at any moment: between any two calls, what is entered here says what there
// is.

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
    bool isFile = false;
    int parent = -1;
    int directory = -1;
    FileIdentity identity;
    std::array<char, 256> name{};
    std::array<char, 256> place{};
  };

  // How many of those that were to be renamed into their places are there, of how many.
  struct Placed {
    int inPlace = 0;
    int wanted = 0;
  };

  // Enters the directory, or file, that is about to be made as `name` in `parent`, which has to
  // stay open. Returns null when the name is too long, or there are too many.
  Entry* add(int parent, const std::string& name, bool isFile = false);

  // The directory has been made and opened. From now on what is in it is removed, too.
  static void hold(Entry* entry, int directory, const FileIdentity& identity);

  // Once the directory is found under the name `place`, it stays. Returns false when that is too
  // long.
  static bool setPlace(Entry* entry, const std::string& place);

  // The directory is none of these any more; with `settle`, because it is in its place for good.
  static void drop(Entry* entry);
  void settle(Entry* entry);

  // Removes them, the last one first. What is in its place stays, and is told. May be called by a
  // signal handler.
  Placed run();

 private:
  static constexpr std::size_t kMost = 12;

  std::array<Entry, kMost> m_entries;
  std::atomic<int> m_settledCount{0};
};

// Removes every file in the directory, and every directory in it with its files; their names may
// change meanwhile. What is left, is left. May be called by a signal handler.
void removeFiles(int directory);

#endif  // SCHEMA_MIGRATE_REMOVALS_H
