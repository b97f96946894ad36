// The file that `plan --save` writes and `--plan` reads.

#ifndef SCHEMA_MIGRATE_PLAN_FILE_H
#define SCHEMA_MIGRATE_PLAN_FILE_H

#include <libschema-migration/MigrationPlan.h>
#include <libschema-migration/SavedPlan.h>

#include <memory>
#include <string>

// Its bytes; null, and a failure, when they cannot be had. A plan may be larger than other inputs.
std::unique_ptr<migration::Source> readPlanFile(const std::string& path,
                                                migration::Failures* failures);

// Throws a Failure unless a plan may be saved as `path`: it does not exist, or is a saved plan,
// which is replaced.
void refuseUnlessPlanCanBeSaved(const std::string& path);

// Saves it, whole or not at all. Throws a Failure when that cannot be done.
void savePlan(const migration::MigrationPlan& plan, const std::string& path);

// A plan that was read.
struct LoadedPlan {
  std::unique_ptr<migration::Source> source;
  migration::SavedPlan saved;
};

// Throws a Failure when `path` cannot be read or is no saved plan.
LoadedPlan loadPlan(const std::string& path);

// And made again.
struct RemadePlan {
  LoadedPlan loaded;
  std::unique_ptr<migration::MigrationPlan> again;
  migration::Failures changes;  // what of it holds no longer
};

// The same; the inputs are read as far as the limits let them.
RemadePlan remakePlan(const std::string& path, const migration::ReadLimits& limits);

#endif  // SCHEMA_MIGRATE_PLAN_FILE_H
