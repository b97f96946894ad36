// Where the output is to appear: a directory, opened once, and a name in it.

#ifndef SCHEMA_MIGRATE_OUTPUT_PLACE_H
#define SCHEMA_MIGRATE_OUTPUT_PLACE_H

#include <sys/stat.h>

#include <string>
#include <vector>

#include "Directory.h"

struct OutputOptions {
  std::string path;
  std::vector<std::string> inputs;        // directories that it must not lie in
  bool allowForeignParent = false;        // when others may rename what lies beside it
  mode_t mask = 022;                      // of the permissions of new files and directories
  std::string option = "--out";           // what it was named by, and
  std::string noun = "output directory";  // what messages call it
};

class OutputPlace {
 public:
  // Throws a Failure unless `path` names nothing, or an empty directory, in a directory that lies
  // in none of the inputs and in which nobody but the user and root may rename it. Leftovers of
  // runs that were killed are named in *warnings, and stay.
  OutputPlace(const OutputOptions& options, std::string* warnings);

  const std::string& path() const { return m_path; }
  const Directory& parent() const { return m_parent; }
  const std::string& name() const { return m_name; }

  // The beginning of the name that it has before it is complete.
  std::string partialPrefix() const { return "." + m_name + ".partial-"; }

  bool replacesEmpty() const { return m_replacesEmpty; }
  const struct stat& replaced() const { return m_replaced; }

  // True when both the name in the parent and the whole path lead to this directory.
  bool holds(const FileIdentity& identity) const;

  // True as long as the path of the parent leads to it.
  bool isParentAtItsPath() const;

 private:
  void checkIsOutside(const std::string& input) const;
  void checkParent(bool allowForeign) const;
  void checkName();
  void findLeftovers(std::string* warnings) const;

  std::string m_noun;
  std::string m_path;
  std::string m_name;
  Directory m_parent{Descriptor(), ""};
  bool m_replacesEmpty = false;
  struct stat m_replaced {};
};

// The directory that `path` lies in, as far as the path tells.
std::string parentOf(const std::string& path);

#endif  // SCHEMA_MIGRATE_OUTPUT_PLACE_H
