// The directory that is made, below OutputDirectory. Its functions are stopped (OutputStop) where
// something cannot be done.

#ifndef LIBSCHEMA_MIGRATION_OUTPUT_WORK_H
#define LIBSCHEMA_MIGRATION_OUTPUT_WORK_H

#include <map>
#include <string>
#include <vector>

#include "OutputDirectory.h"
#include "OutputPlace.h"
#include "OwnDirectory.h"
#include "Removals.h"

namespace migration {

class OutputWork {
 public:
  // Nothing is created yet; see OutputPlace.
  OutputWork(const OutputOptions& options, Removals* removals, Failures* leftovers);
  OutputWork(const OutputWork&) = delete;
  OutputWork& operator=(const OutputWork&) = delete;

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
  // new directory, or mode and owner of the empty one that it replaces. Stopped, with
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

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_OUTPUT_WORK_H
