// The directory that a run produces. It is filled under a temporary name beside its place
// (.NAME.partial-XXXXXX), brought to the disk, and then renamed into its place: it appears whole or
// not at all. What is not published goes when the object does.

#ifndef SCHEMA_MIGRATE_OUTPUT_DIRECTORY_H
#define SCHEMA_MIGRATE_OUTPUT_DIRECTORY_H

#include <sys/stat.h>

#include <string>

class OutputDirectory {
 public:
  // `path` must not exist, or be an empty directory, and lie in none of the two input directories.
  // Throws a Failure when it cannot be had. Nothing is created yet. Leftovers of runs that were
  // killed are named in *warnings, and stay.
  OutputDirectory(const std::string& path, const std::string& from, const std::string& to,
                  std::string* warnings);
  ~OutputDirectory();
  OutputDirectory(const OutputDirectory&) = delete;
  OutputDirectory& operator=(const OutputDirectory&) = delete;

  // Creates the directory under its temporary name and returns that path.
  const std::string& create();

  const std::string& partialPath() const { return m_partial; }

  // Creates a file in it with the bytes of the file `source`.
  void copyIn(const std::string& source, const std::string& fileName);

  // Brings every file in it to the disk, and out of the memory that reading back would come from.
  void sync();

  // Brings the directory itself to the disk and renames it into its place. It has the mode of any
  // new directory, or mode and owner of the empty one that it replaces.
  void publish();

 private:
  void checkPlace();
  void checkIsOutside(const std::string& input) const;
  void findLeftovers(std::string* warnings) const;
  void giveAttributes();
  void rename();
  void remove();

  std::string m_path;
  std::string m_parent;
  std::string m_name;
  bool m_replacesEmpty = false;
  struct stat m_replaced {};
  std::string m_partial;  // "" while there is none
  int m_lock = -1;        // held as long as the run is under way
};

#endif  // SCHEMA_MIGRATE_OUTPUT_DIRECTORY_H
