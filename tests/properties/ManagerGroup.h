// Schema managers over generated directories, and a run of operations between them.

#ifndef LIBSCHEMA_TESTS_MANAGER_GROUP_H
#define LIBSCHEMA_TESTS_MANAGER_GROUP_H

#include <map>
#include <memory>
#include <set>
#include <string>
#include <vector>

#include "Choices.h"
#include "GeneratedDirectory.h"
#include "ManagerTables.h"

namespace properties {

struct ReadResult {
  SchemaManager* manager;
  int status;  // what readFile returned
};

// Managers that are destroyed together, with every definition that they read: see
// destroyWithAllDefinitions.
class ManagerGroup {
 public:
  // Writes what it needs into the folder, which exists.
  explicit ManagerGroup(std::string folder) : m_folder(std::move(folder)) {}
  ~ManagerGroup() { destroyWithAllDefinitions(m_read, &m_managers); }
  ManagerGroup(const ManagerGroup&) = delete;
  ManagerGroup& operator=(const ManagerGroup&) = delete;

  // A manager that has read these files, in the order of their names. The group owns it.
  SchemaManager* read(const std::map<std::string, std::string>& files);
  SchemaManager* read(const GeneratedDirectory& directory) { return read(filesOf(directory)); }

  // A manager that has read one file of a folder. The group owns it.
  ReadResult readIn(const std::string& folder, const std::string& file);

  const std::string& folder() const { return m_folder; }

  // Writes a list of OIDs and returns its path.
  std::string writeList(const std::string& text) const;

  const std::vector<std::unique_ptr<SchemaManager>>& managers() const { return m_managers; }

 private:
  std::string m_folder;
  std::vector<std::unique_ptr<SchemaManager>> m_managers;
  std::set<ORVSchema*> m_read;
};

// How often each kind of thing happened in runs.
struct RunCounts {
  unsigned operations = 0;
  unsigned dropped = 0;       // definitions, by a comparison or a check
  unsigned merges = 0;        // that succeeded
  unsigned failedMerges = 0;  // after which a run is over
  unsigned withdrawn = 0;     // definitions
};

// Reads three related directories, then runs up to eight operations between the managers and
// compares all three with the rules after each. "" when they agree all the way; else what differs.
std::string runOperations(Choices* choices, const std::string& folder, RunCounts* counts);

}  // namespace properties

#endif  // LIBSCHEMA_TESTS_MANAGER_GROUP_H
