// Schema managers over files that a test writes itself, and what a manager holds, as text.

#ifndef LIBSCHEMA_TESTS_INSTALLATION_H
#define LIBSCHEMA_TESTS_INSTALLATION_H

#include <initializer_list>
#include <memory>
#include <string>
#include <vector>

#include "Files.h"
#include "SchemaManager.h"

namespace support {

struct SchemaText {
  std::string file;
  std::string text;
};

// A schema directory and the manager that reads it.
class Installation {
 public:
  // Writes the files and reads them in this order; the running test fails when one cannot be read.
  Installation(std::initializer_list<SchemaText> files = {});
  explicit Installation(const std::vector<SchemaText>& files);

  SchemaManager* operator->() { return m_manager.get(); }
  SchemaManager* manager() { return m_manager.get(); }
  const std::string& path() const { return m_directory.path(); }

  // Writes a file of any kind and returns its path.
  std::string write(const std::string& name, const std::string& text) const;

  // Writes one schema file and returns what readFile says of it.
  int read(const std::string& file, const std::string& text);

  // Has the manager exclude these OIDs.
  void exclude(const std::vector<std::string>& oids);

  // Leaves the manager, with all that it holds, reachable and undestroyed until the process ends.
  void keepForGood();

 private:
  TemporaryDirectory m_directory;
  std::unique_ptr<SchemaManager> m_manager;
};

// One definition as a line of a schema file.
std::string attributeType(const std::string& oid, const std::string& name,
                          const std::string& description = "text");
std::string objectClass(const std::string& oid, const std::string& name,
                        const std::string& description = "text");
std::string vendorExtension(const std::string& oid, const std::string& access = "normal");

// The three tables, a line for each that has entries: key, OID and description (access class):
//   "attributes: cn=2.5.4.3(text) sn=2.5.4.4(text)\nclasses:
//   top=2.5.6.0()\nextensions: 2.5.4.3(normal)\n"
// A vendor extension's key is its OID, which is not repeated.
std::string tablesOf(SchemaManager* manager);

// The six printed file sets, a line for each that has OIDs: "V3.user.at: 2.5.4.3 2.5.4.4\n". The
// empty OID shows as "''".
std::string setsOf(SchemaManager* manager);

// tablesOf and setsOf.
std::string stateOf(SchemaManager* manager);

// What the lookups find under a key: "cn=2.5.4.3(text)", or "nothing".
std::string attributeUnder(SchemaManager* manager, const std::string& key);
std::string objectClassUnder(SchemaManager* manager, const std::string& key);
std::string extensionUnder(SchemaManager* manager, const std::string& key);

// The OIDs of `oids` that the set of V3.modifiedschema holds, blank-separated; the set loses them.
std::string takeFromModifiedSchema(SchemaManager* manager, const std::vector<std::string>& oids);

// What writeSetToFile writes for these OIDs.
std::string writtenFor(SchemaManager* manager, const std::vector<std::string>& oids);

// The whole file that writeFile writes.
std::string writtenFile(SchemaManager* manager, const std::string& file);

}  // namespace support

#endif  // LIBSCHEMA_TESTS_INSTALLATION_H
