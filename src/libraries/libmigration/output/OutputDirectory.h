// A directory that appears whole or not at all. It is filled under a temporary name beside its
// place
// (.NAME.partial-XXXXXX), brought to the disk, read back, and then renamed into its place. Nothing
// is ever written over: the place is new, or an empty directory, which is replaced.
//
// What is asked for, and what goes wrong, are values. Nothing is printed, no signal handler is
// installed, and the mask of the process stays as it is. An object belongs to one thread at a time;
// different objects, which may share their Removals, are independent of each other.

#ifndef LIBSCHEMA_MIGRATION_OUTPUT_DIRECTORY_H
#define LIBSCHEMA_MIGRATION_OUTPUT_DIRECTORY_H

#include <sys/types.h>

#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "Finding.h"
#include "Removals.h"

namespace migration {

// What directory is asked for.
struct OutputOptions {
  std::string path;                 // of the directory to make
  std::vector<std::string> inputs;  // directories that it must not lie in
  // Also when somebody else may rename what lies beside it, and so put something else there.
  bool allowForeignParent = false;
  mode_t mask = 022;  // of the permissions of new files and directories

  // How failures call it: what it was named by, as in "--out"; what it is; and by what, if
  // anything, the host is told allowForeignParent.
  std::string option = "the path";
  std::string noun = "output directory";
  std::string riskOption{};
};

// A file of the output.
struct OutputText {
  std::string name;
  std::string bytes;
  std::optional<mode_t> mode;  // that of any new file without
  std::string folder{};        // in the output; empty for the output itself
};

// The directory that is made.
class OutputDirectory {
 public:
  // Why there is none, and what else was seen.
  struct Problems {
    Failures failures;  // empty when it can be made
    // What was asked for cannot be, however things are on the system: no name of a directory, or a
    // place inside of an input.
    bool isOfRequest = false;
    // What runs that were killed left beside it; they stay. Told with and without failures.
    Failures leftovers;
  };

  // Looks whether the directory can be made, and makes nothing yet. `removals` may be null when
  // nobody is to remove at a signal what is not complete; otherwise it must outlive the object.
  // Returns null, with the reason in *problems, unless the path names nothing, or an empty
  // directory, in a directory that lies in none of the inputs and in which nobody but the user and
  // root may rename it.
  static std::unique_ptr<OutputDirectory> open(const OutputOptions& options, Removals* removals,
                                               Problems* problems);
  // Removes what was made and is not in its place.
  ~OutputDirectory();
  OutputDirectory(const OutputDirectory&) = delete;
  OutputDirectory& operator=(const OutputDirectory&) = delete;

  // Creates the directory under its temporary name with these files, their folders and no others,
  // brings them to the disk, and verifies them. To be called once. Returns false, with the reason
  // in *failures, when that cannot be done; then only the destructor may be called.
  bool fill(const std::vector<OutputText>& texts, Failures* failures);

  // Whether the directory holds these files, byte for byte, and no others. To be called between
  // fill() and publish(). Returns false, with the first difference in *failures, when it does not.
  bool verify(const std::vector<OutputText>& texts, Failures* failures) const;

  // Brings the directory itself to the disk and renames it into its place. It has the mode of any
  // new directory, or mode and owner of the empty one that it replaces. Returns false, with the
  // reason in *failures and nothing published, when that cannot be done, or when another directory
  // was put in the place of this one; see isPublished() for the one case besides.
  bool publish(Failures* failures);

  // Whether it is in its place, whole, whatever publish() came to: of a directory that is in its
  // place the entry may still not be on the disk.
  bool isPublished() const;

  // Where it is filled, as failures show it; empty before fill().
  std::string temporaryPath() const;

 private:
  struct Parts;

  OutputDirectory();

  std::unique_ptr<Parts> m_parts;
};

// Whether the two paths name different directories, neither of them in the other, as far as the
// paths tell.
bool areApart(const std::string& left, const std::string& right);

// The directory that `path` lies in, as far as the path tells.
std::string parentOf(const std::string& path);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_OUTPUT_DIRECTORY_H
