// One run of `migrate`.

#ifndef SCHEMA_MIGRATE_MIGRATE_RUN_H
#define SCHEMA_MIGRATE_MIGRATE_RUN_H

#include <string>

#include "Console.h"
#include "HtmlOption.h"
#include "PlanOptions.h"
#include "RecordOutput.h"

struct MigrateOptions {
  std::string out;  // the directory to create
  bool allowForeignParent = false;
  bool isInLibraryLayout = false;  // as the library writes, not in NEW's own layout
  bool isDryRun = false;           // everything but the publishing
  bool isJson = false;
  RecordOptions record;
};

// Puts the migrated schema in place, whole and verified, or throws a Failure. The page is written
// before, whether or not the plan can be carried out.
void migrate(const PlanOptions& planOptions, const MigrateOptions& options, HtmlOption* html,
             Console* console);

#endif  // SCHEMA_MIGRATE_MIGRATE_RUN_H
