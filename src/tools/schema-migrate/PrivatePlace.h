// Where the private copies of a run lie: a directory that only the user and root can read, write or
// rename, for the library, which knows files by their paths.

#ifndef SCHEMA_MIGRATE_PRIVATE_PLACE_H
#define SCHEMA_MIGRATE_PRIVATE_PLACE_H

#include <cstdint>
#include <list>
#include <string>
#include <vector>

#include "Directory.h"
#include "OwnDirectory.h"
#include "Removals.h"

struct PrivatePlaceOptions {
  // Directories to make it in. The first with room enough is taken, or else the first in which it
  // can be made.
  std::vector<std::string> candidates;
  std::uint64_t room = 0;  // in bytes
  // Where the system shows the open files of a process. Through it, paths lead to the directory
  // itself, whoever may rename things above it; without it, a candidate is taken only if nobody but
  // the user and root may.
  std::string openFiles = "/proc/self/fd";
};

class PrivatePlace {
 public:
  // Throws a Failure when it can be made in none of the candidates. Leftovers of runs that were
  // killed are named in *warnings, and stay.
  PrivatePlace(const PrivatePlaceOptions& options, Removals* removals, std::string* warnings);
  PrivatePlace(const PrivatePlace&) = delete;
  PrivatePlace& operator=(const PrivatePlace&) = delete;

  // The directory itself; its path() is for messages.
  const OwnDirectory& own() const { return m_own; }

  // The path that the library is given.
  const std::string& path() const { return m_path; }
  std::string pathOf(const std::string& name) const { return m_path + "/" + name; }

  // Makes a directory in it, which goes before it.
  const OwnDirectory& makeDirectory(const std::string& name);

 private:
  bool tryCandidate(const std::string& candidate, const PrivatePlaceOptions& options,
                    bool needsRoom);
  bool findPath(const std::string& openFiles);
  void findLeftovers(std::string* warnings) const;

  Removals* m_removals;
  std::string m_problems;  // of each candidate
  Directory m_base{Descriptor(), ""};
  OwnDirectory m_own;
  std::string m_path;
  std::list<OwnDirectory> m_directories;
};

// True when only the user and root can rename `path` or what it lies in.
bool isBeyondOthers(const std::string& path);

#endif  // SCHEMA_MIGRATE_PRIVATE_PLACE_H
