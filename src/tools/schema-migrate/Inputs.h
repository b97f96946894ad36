// Everything that a run reads, opened once and read once: what comes after sees private copies, so
// that it does not matter what becomes of the files meanwhile.

#ifndef SCHEMA_MIGRATE_INPUTS_H
#define SCHEMA_MIGRATE_INPUTS_H

#include <sys/stat.h>

#include <array>
#include <cstddef>
#include <cstdint>
#include <list>
#include <string>
#include <vector>

#include "InputFile.h"
#include "PrivatePlace.h"
#include "SchemaFiles.h"

// One file of an installation.
struct InstalledFile {
  bool isThere = false;
  std::string problem;  // why it cannot be read, as in "it is a directory"; else empty
  mode_t mode = 0;      // its permissions
};

// The schema files of an installation, and their private copies.
struct Installation {
  std::string role;       // "OLD" or "NEW"
  std::string path;       // as messages show it
  std::string directory;  // where the copies are, for the library
  const Directory* copies = nullptr;
  std::array<InstalledFile, kSchemaFiles.size()> files;

  std::string pathOf(std::size_t file) const { return path + "/" + kSchemaFiles[file]; }
};

// A list of OIDs, and its private copy.
struct ListFile {
  std::string path;  // as messages show it
  std::string copy;
};

class Inputs {
 public:
  // All files together may have `limit` bytes.
  explicit Inputs(std::uint64_t limit) : m_limit(limit) {}
  Inputs(const Inputs&) = delete;
  Inputs& operator=(const Inputs&) = delete;

  // Opens what has to be copied. Throws a Failure when a list or the directory cannot be read,
  // there is no V3.* file in it, or there is more than the limit. V3.* files of other names go to
  // *warnings. What is returned stays in place, and is complete once copied.
  const ListFile& openList(const std::string& path);
  const Installation& openInstallation(const std::string& role, const std::string& path,
                                       std::string* warnings);

  // Of all that was opened, in bytes.
  std::uint64_t size() const { return m_size; }

  // Copies all of it, and closes it. Throws a Failure when a file cannot be read to its end, or
  // changes meanwhile. The copy of a list is found in the place itself, that of a schema file in a
  // directory of the installation's own.
  void copyTo(PrivatePlace* place);

 private:
  // An open file, to be copied as `name` to the directory of an installation, or to the place.
  struct Source {
    InputFile file;
    std::string path;
    struct stat status;
    const Installation* installation;  // null for a list
    std::string name;
  };

  // Returns what is the matter with the file, or "".
  std::string add(InputFile file, const std::string& path, const Installation* installation,
                  const std::string& name);
  static void copy(Source* source, const OwnDirectory& directory, std::vector<char>* buffer);

  std::uint64_t m_limit;
  std::uint64_t m_size = 0;
  std::list<ListFile> m_lists;
  std::list<Installation> m_installations;
  std::vector<Source> m_sources;
};

#endif  // SCHEMA_MIGRATE_INPUTS_H
