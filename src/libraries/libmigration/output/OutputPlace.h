// Where the output is to appear: a directory, opened once, and a name in it.

#ifndef LIBSCHEMA_MIGRATION_OUTPUT_PLACE_H
#define LIBSCHEMA_MIGRATION_OUTPUT_PLACE_H

#include <sys/stat.h>

#include <string>

#include "Directory.h"
#include "OutputDirectory.h"

namespace migration {

class OutputPlace {
 public:
  // Stopped (OutputStop) unless the path names nothing, or an empty directory, in a directory that
  // lies in none of the inputs and in which nobody but the user and root may rename it. Leftovers
  // of runs that were killed are named in *leftovers, and stay.
  OutputPlace(const OutputOptions& options, Failures* leftovers);

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
  void checkParent(const OutputOptions& options) const;
  void checkName();
  void findLeftovers(Failures* leftovers) const;

  std::string m_noun;
  std::string m_path;
  std::string m_name;
  Directory m_parent{Descriptor(), ""};
  bool m_replacesEmpty = false;
  struct stat m_replaced {};
};

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_OUTPUT_PLACE_H
