// The run itself, made with the library.

#ifndef SCHEMA_MIGRATE_MIGRATION_H
#define SCHEMA_MIGRATE_MIGRATION_H

#include <libschema/SchemaManager.h>

#include <memory>
#include <string>
#include <vector>

#include "Inputs.h"
#include "Inventory.h"

// OLD and NEW, and the lists that OLD is read with.
struct Installations {
  const Inventory& oldOne;
  const Inventory& newOne;
  std::vector<const ListFile*> excludeLists;
  const ListFile* withdrawList = nullptr;  // when there is none
};

// The three reports of what OLD adds or changes that collides with NEW, from managers of their own,
// since the check empties tables.
std::string reportCollisions(const Installations& installations);

// Merges OLD into NEW and keeps the result.
class Migration {
 public:
  // Throws a Failure when a copy cannot be read, or the merge is refused after all.
  explicit Migration(const Installations& installations);

  // Writes the seven files that have a set of OIDs into `directory`. Whether all of it arrived
  // there, only reading it back tells.
  void write(const std::string& directory);

 private:
  std::unique_ptr<SchemaManager> m_merged;
};

#endif  // SCHEMA_MIGRATE_MIGRATION_H
