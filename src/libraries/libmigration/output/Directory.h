// A directory that is reached by its descriptor, whatever becomes of its name.

#ifndef LIBSCHEMA_MIGRATION_DIRECTORY_H
#define LIBSCHEMA_MIGRATION_DIRECTORY_H

#include <sys/stat.h>

#include <string>
#include <vector>

#include "Descriptor.h"

namespace migration {

class Directory {
 public:
  // Opens `path`, which messages show. When that fails, isOpen() is false, and errno says why.
  explicit Directory(const std::string& path);

  // Takes over an open directory that messages show as `path`.
  Directory(Descriptor descriptor, std::string path);

  bool isOpen() const { return m_descriptor.isOpen(); }
  int number() const { return m_descriptor.number(); }
  const std::string& path() const { return m_path; }
  std::string pathOf(const std::string& name) const;

  // Opens an entry that is itself a directory, and no link to one; see isOpen().
  Directory open(const std::string& name) const;

  // The names in it but "." and "..", sorted. Returns false, with the reason in errno, when they
  // cannot be read to the last one.
  bool list(std::vector<std::string>* names) const;

  // What `name` is, a link being a link. Returns false, with the reason in errno, if nothing is
  // told.
  bool look(const std::string& name, struct stat* status) const;

  struct stat status() const;
  FileIdentity identity() const { return FileIdentity::of(status()); }

  // True when the entry `name` is this one.
  bool has(const std::string& name, const FileIdentity& identity) const;

 private:
  Descriptor m_descriptor;
  std::string m_path;
};

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_DIRECTORY_H
