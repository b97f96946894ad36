// The directory that a run produces. It is filled under a temporary name beside its place
// (.NAME.partial-XXXXXX), brought to the disk, and then renamed into its place: it appears whole or
// not at all. What is not published goes when the object does.

#ifndef SCHEMA_MIGRATE_OUTPUT_DIRECTORY_H
#define SCHEMA_MIGRATE_OUTPUT_DIRECTORY_H

#include <map>
#include <optional>
#include <string>
#include <vector>

#include "OutputPlace.h"
#include "OwnDirectory.h"
#include "Removals.h"

struct OutputText {
  std::string name;
  std::string bytes;
  std::optional<mode_t> mode;  // that of any new file without
  std::string folder{};        // in the output; empty for the output itself
};

class OutputDirectory {
 public:
  // Nothing is created yet; see OutputPlace.
  OutputDirectory(const OutputOptions& options, Removals* removals, std::string* warnings);
  OutputDirectory(const OutputDirectory&) = delete;
  OutputDirectory& operator=(const OutputDirectory&) = delete;

  // Creates the directory under its temporary name.
  void create();

  const Directory& directory() const { return m_own.directory(); }

  // Makes a directory in it.
  void makeFolder(const std::string& name);
  // One that was made; with an empty name the directory itself.
  const Directory& folder(const std::string& name) const;

  // Creates a file in it, or in one of its folders.
  void write(const OutputText& text);

  // Brings every file in it to the disk, and out of the memory that reading back would come from.
  void sync();

  // Brings the directory itself to the disk and renames it into its place. It has the mode of any
  // new directory, or mode and owner of the empty one that it replaces. Throws a Failure, with
  // nothing published, when another directory was put in the place of this one.
  void publish();

  // Whether it is in its place, whole, whatever publish() came to.
  bool isPublished() const { return m_isPublished; }

 private:
  void giveAttributes();
  void rename();
  void takeBack();

  OutputPlace m_place;
  mode_t m_mask;
  Removals* m_removals;
  std::string m_noun;
  OwnDirectory m_own;
  bool m_isPublished = false;
  std::map<std::string, Directory> m_folders;
  struct Written {
    std::string path;
    Descriptor file;
  };
  std::vector<Written> m_files;
};

#endif  // SCHEMA_MIGRATE_OUTPUT_DIRECTORY_H
