// Where private copies lie: a directory that only the user and root can read, write or rename, for
// code that knows files by their paths, as execute() does. It goes, with what is in it, when the
// object does. An object belongs to one thread at a time.

#ifndef LIBSCHEMA_MIGRATION_PRIVATE_PLACE_H
#define LIBSCHEMA_MIGRATION_PRIVATE_PLACE_H

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "Finding.h"
#include "Removals.h"

namespace migration {

// What place is asked for.
struct PrivatePlaceOptions {
  // Directories to make it in. The first with room enough is taken, or else the first in which it
  // can be made.
  std::vector<std::string> candidates;
  std::uint64_t room = 0;  // in bytes
  // Where the system shows the open files of a process. Through it, paths lead to the directory
  // itself, whoever may rename things above it; without it, a candidate is taken only if nobody but
  // the user and root may.
  std::string openFiles = "/proc/self/fd";
  // What its name begins with, before characters that no other has. Others of the user's that begin
  // so are taken for leftovers, unless they are in use.
  std::string prefix = "private-copies-";
  // What a failure says is to be done, as in "name one in TMPDIR".
  std::string advice = "name another directory to make it in";
};

// The directory.
class PrivatePlace {
 public:
  // Makes it. `removals` may be null when nobody is to remove it at a signal; otherwise it must
  // outlive the object. Returns null, with the reason in *failures, when it can be made in none of
  // the candidates. Leftovers of runs that were killed are named in *leftovers, and stay.
  static std::unique_ptr<PrivatePlace> make(const PrivatePlaceOptions& options, Removals* removals,
                                            Failures* failures, Failures* leftovers);
  // Removes it, with the files in it and in the folders that were made.
  ~PrivatePlace();
  PrivatePlace(const PrivatePlace&) = delete;
  PrivatePlace& operator=(const PrivatePlace&) = delete;

  // The path by which it is reached as long as the object is there, and that of what is in it.
  const std::string& path() const;
  std::string pathOf(const std::string& name) const;

  // Where it was made, as messages show it; others may rename what is above it.
  const std::string& shownPath() const;

  // Makes a folder in it. Returns false, with the reason in *failures, when that cannot be done.
  bool makeFolder(const std::string& name, Failures* failures);

 private:
  class Parts;

  PrivatePlace();

  std::unique_ptr<Parts> m_parts;
};

// True when only the user and root can rename `path` or what it lies in. False also when there is
// no such path.
bool isBeyondOthers(const std::string& path);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_PRIVATE_PLACE_H
