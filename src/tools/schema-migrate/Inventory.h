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
#include "Inputs.h"
#include "SchemaFiles.h"

class Inventory {
 public:
  // Reads the copy of every file, and first makes sure that reading it ends. Throws a Failure, with
  // a line for each file that is unreadable or unparsable. Oddities go to `warnings`. The
  // installation must stay in place.
  Inventory(const Installation& installation, std::string* warnings);
  Inventory(const Inventory&) = delete;
  Inventory& operator=(const Inventory&) = delete;

  // Where the copies are, for the library.
  const std::string& directory() const { return m_installation.directory; }

  // As messages show it.
  std::string pathOf(std::size_t file) const { return m_installation.pathOf(file); }

  bool hasFile(std::size_t file) const { return m_installation.files[file].isThere; }
  const Installation& installation() const { return m_installation; }
  std::uint64_t countOf(std::size_t file) const { return m_counts[file]; }

  // In the order in which the library reads them.
  const std::vector<Definition>& definitions() const { return m_definitions; }

  // Frees what only a comparison of definitions needs.
  void releaseObjects();

 private:
  std::string readFile(std::size_t file, std::string* warnings);
  std::string takeDefinitions(std::size_t file, const std::vector<std::uint64_t>& lines);
  void makeDigests();

  const Installation& m_installation;
  std::array<std::uint64_t, kSchemaFiles.size()> m_counts{};
  std::vector<Definition> m_definitions;
  std::size_t m_longestText = 0;
};

#endif  // SCHEMA_MIGRATE_INVENTORY_H
