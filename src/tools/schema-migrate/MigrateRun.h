// One run of `migrate`.

#ifndef SCHEMA_MIGRATE_MIGRATE_RUN_H
#define SCHEMA_MIGRATE_MIGRATE_RUN_H

#include <cstdint>
#include <string>
#include <vector>

#include "Console.h"

struct MigrateOptions {
  std::string from;
  std::string to;
  std::string out;
  std::vector<std::string> excludeLists;
  std::string withdrawList;  // empty when there is none
  std::uint64_t maxInput = std::uint64_t{1} << 30;
  bool allowForeignParent = false;
};

// Puts the migrated schema in place, whole and verified, or throws a Failure.
void migrate(const MigrateOptions& options, Console* console);

#endif  // SCHEMA_MIGRATE_MIGRATE_RUN_H
