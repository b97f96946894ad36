// One file that appears whole or not at all. It is written without a name, or under a temporary one
// beside its place (.NAME.partial-XXXXXX), brought to the disk and then put in its place. An object
// belongs to one thread at a time.

#ifndef LIBSCHEMA_MIGRATION_NEW_FILE_H
#define LIBSCHEMA_MIGRATION_NEW_FILE_H

#include <cstdint>
#include <memory>
#include <string>

#include "Finding.h"
#include "Removals.h"

namespace migration {

// What of what is there a new file may replace: nothing; any regular file; or a regular file that
// begins in a certain way, or is empty.
enum class Over : std::uint8_t { kNothing, kFile, kFileOfItsKind };

// What file is asked for.
struct NewFileOptions {
  std::string path;
  Over over = Over::kNothing;
  // Of a file of its kind, which what is written must have, too; and what failures call such a
  // file.
  std::string beginning{};
  std::string kind = "file of its kind";
};

// The file that is made.
class NewFile {
 public:
  // Looks whether the file can be made, and makes nothing yet. `removals` may be null when nobody
  // is to remove at a signal what is not complete; otherwise it must outlive the object. Returns
  // null, with the reason in *failures, when the directory cannot be used, or something is there
  // that is not to be replaced. A symbolic link is not followed.
  static std::unique_ptr<NewFile> open(const NewFileOptions& options, Removals* removals,
                                       Failures* failures);
  // Removes what was written and is not in its place.
  ~NewFile();
  NewFile(const NewFile&) = delete;
  NewFile& operator=(const NewFile&) = delete;

  // Brings these bytes to the disk. To be called once. Returns false, with the reason in *failures,
  // when that cannot be done; then only the destructor may be called.
  bool write(const std::string& bytes, Failures* failures);

  // Puts them in their place, at once; a file that is replaced leaves its mode behind. Returns
  // false, with the reason in *failures, when that cannot be done. Then what was there is there,
  // unless the failure says that the file is complete and in place.
  bool put(Failures* failures);

 private:
  class Parts;

  NewFile();

  std::unique_ptr<Parts> m_parts;
};

// The three at once. Returns false, with the reason in *failures, when the file cannot be made.
bool writeNewFile(const NewFileOptions& options, const std::string& bytes, Removals* removals,
                  Failures* failures);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_NEW_FILE_H
