// A directory that this run makes for itself: only the user reaches what is in it, and everything
// in it is reached by its descriptor. Who may rename things beside it can take its name away, but
// neither read nor change what is in it, nor make this run touch anything else. It goes, with the
// files in it, when the object does, unless it was kept.

#ifndef LIBSCHEMA_MIGRATION_OWN_DIRECTORY_H
#define LIBSCHEMA_MIGRATION_OWN_DIRECTORY_H

#include <sys/types.h>

#include <string>

#include "Descriptor.h"
#include "Directory.h"
#include "Removals.h"

namespace migration {

class OwnDirectory {
 public:
  // None yet.
  OwnDirectory() = default;
  ~OwnDirectory();
  OwnDirectory(const OwnDirectory&) = delete;
  OwnDirectory& operator=(const OwnDirectory&) = delete;

  // Makes it in `parent`, which has to stay in place, under `name`, or `name` and six more
  // characters that no other has, and locks it as long as the run is under way, where locks are to
  // be had. Returns "", or what was the matter.
  std::string make(const Directory& parent, const std::string& name, Removals* removals);
  std::string makeUnique(const Directory& parent, const std::string& prefix, Removals* removals);

  bool isMade() const { return m_entry != nullptr; }
  const Directory& directory() const { return m_directory; }
  const std::string& name() const { return m_name; }
  const FileIdentity& identity() const { return m_identity; }

  // True as long as its name in the parent is its own.
  bool isAtItsName() const;

  // Creates a file, which must not exist, for writing; see isOpen().
  Descriptor createFile(const std::string& name, mode_t mode) const;

  // Once it is found under the name `place`, an interruption does not remove it any more. Returns
  // false when there is no such name.
  bool setPlace(const std::string& place);

  // It is in its place, and stays when the object goes.
  void keep();

  // Removes it now, with the files in it.
  void remove();

 private:
  std::string open();

  void forget();

  Removals* m_removals = nullptr;
  const Directory* m_parent = nullptr;
  std::string m_name;
  Directory m_directory{Descriptor(), ""};
  FileIdentity m_identity;
  Removals::Entry* m_entry = nullptr;
};

// Six characters to make a name unique.
std::string randomSuffix();

enum class Use { kInUse, kLeftBehind, kUnknown };

// Whether a run that is under way holds the directory `name` in `parent`.
Use useOf(const Directory& parent, const std::string& name);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_OWN_DIRECTORY_H
