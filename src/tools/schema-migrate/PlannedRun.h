// One run of `migrate` by a plan: with BASE, decisions or a preference.

#ifndef SCHEMA_MIGRATE_PLANNED_RUN_H
#define SCHEMA_MIGRATE_PLANNED_RUN_H

#include <string>

#include "Console.h"
#include "MigrateRun.h"
#include "PlanOptions.h"

struct PlannedRunOptions {
  bool isInLibraryLayout = false;  // as the library writes, not in NEW's own layout
  bool isDryRun = false;           // everything but the publishing
  bool isJson = false;
};

// Puts the migrated schema in place, whole and verified, or throws a Failure.
void migrateByPlan(const MigrateOptions& options, const PlanOptions& planOptions,
                   const PlannedRunOptions& runOptions, Console* console);

#endif  // SCHEMA_MIGRATE_PLANNED_RUN_H
