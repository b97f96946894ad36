// Everything that one installation's schema files define, as found in the files: what the library
// will read, and where it stands.

#ifndef SCHEMA_MIGRATE_INVENTORY_H
#define SCHEMA_MIGRATE_INVENTORY_H

#include <array>
#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

#include "Definition.h"
#include "SchemaFiles.h"

class Inventory {
 public:
  // `role` is "OLD" or "NEW". Reads every V3.* file of the directory, and first makes sure that
  // reading it ends. Throws a Failure, with a line for each file that is missing, unreadable or
  // unparsable. Files that are not read, and oddities in those that are, go to `warnings`.
  Inventory(std::string role, std::string directory, std::string* warnings);
  Inventory(const Inventory&) = delete;
  Inventory& operator=(const Inventory&) = delete;

  const std::string& role() const { return m_role; }
  const std::string& directory() const { return m_directory; }
  std::string pathOf(std::size_t file) const;

  bool hasFile(std::size_t file) const { return m_hasFile[file]; }
  std::uint64_t countOf(std::size_t file) const { return m_counts[file]; }

  // In the order in which the library reads them.
  const std::vector<Definition>& definitions() const { return m_definitions; }

  // Frees what only a comparison of definitions needs.
  void releaseObjects();

 private:
  void findFiles(std::string* warnings);
  std::string readFile(std::size_t file, std::string* warnings);
  std::string takeDefinitions(std::size_t file, const std::vector<std::uint64_t>& lines);
  void makeDigests();

  std::string m_role;
  std::string m_directory;
  std::array<bool, kSchemaFiles.size()> m_hasFile{};
  std::array<std::uint64_t, kSchemaFiles.size()> m_counts{};
  std::vector<Definition> m_definitions;
  std::size_t m_longestText = 0;
};

#endif  // SCHEMA_MIGRATE_INVENTORY_H
