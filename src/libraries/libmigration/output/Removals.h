// The directories and files that are being made and must not outlive their work. A host that ends
// at a signal has its handler call run(): between any two calls, what is entered here says what
// there is. The library installs no handler.
//
// One object serves any number of outputs, in any number of threads; it must outlive them.

#ifndef LIBSCHEMA_MIGRATION_REMOVALS_H
#define LIBSCHEMA_MIGRATION_REMOVALS_H

#include <array>
#include <atomic>
#include <cstddef>
#include <cstdint>
#include <string>

#include "Descriptor.h"

namespace migration {

// What a signal handler removes.
class Removals {
 public:
  // Something that is being made. Who entered it drops or settles it.
  struct Entry;

  // How many of those that were to be renamed into their places are there, of how many.
  struct Placed {
    int inPlace = 0;  // whole, whatever else was interrupted
    int wanted = 0;   // in place or not
  };

  // Nothing is entered.
  Removals();
  // Nothing may be entered any more; nothing is removed.
  ~Removals();
  Removals(const Removals&) = delete;
  Removals& operator=(const Removals&) = delete;

  // Enters the directory, or file, that is about to be made as `name` in the directory `parent`, a
  // descriptor that has to stay open. Returns null when the name is too long; then nothing is
  // entered.
  Entry* add(int parent, const std::string& name, bool isFile = false);

  // It has been made, and a directory opened, which has to stay open. From now on it is removed
  // only as long as it is the one of this identity, and with what is in it.
  static void hold(Entry* entry, int directory, const FileIdentity& identity);

  // Once it is found under the name `place`, it stays. Returns false when that is too long; then it
  // is removed under any name.
  static bool setPlace(Entry* entry, const std::string& place);

  // It is none of these any more; with settle(), because it is in its place for good. While a
  // handler is just removing it, in another thread, they wait.
  static void drop(Entry* entry);
  void settle(Entry* entry);

  // Removes them. What is in its place stays, and is told. May be called by a signal handler, in
  // any thread; meant for the end of the program: what other threads go on to make is left alone.
  Placed run();

 private:
  struct Block;

  static Entry* addTo(Block* block, int parent, const std::string& name, bool isFile);

  std::atomic<Block*> m_newest;
  std::atomic<int> m_settledCount{0};
};

// Removes every file in the directory, and every directory in it with its files; their names may
// change meanwhile. What is left, is left. May be called by a signal handler.
void removeFiles(int directory);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_REMOVALS_H
