// A plan that was saved, read back: what it was made from and by which options, so that it can be
// made again, and whether it still holds then.

#ifndef LIBSCHEMA_MIGRATION_SAVED_PLAN_H
#define LIBSCHEMA_MIGRATION_SAVED_PLAN_H

#include <optional>
#include <string>
#include <vector>

#include "Finding.h"
#include "MigrationPlan.h"
#include "Source.h"

namespace migration {

// A file that the migration writes with the layout of NEW's files.
struct PlannedOutput {
  std::string file;  // "V3.user.at"
  std::string sha256;
};

struct SavedPlan {
  const Source* source = nullptr;  // the document, which must stay in place
  std::string command;             // that wrote it
  std::string programVersion;
  PlanRequest request;  // but for the limits, which are not the plan's
  std::vector<PlanInput> inputs;
  std::vector<PlannedOutput> outputs;
};

// Nothing, and a failure at its line, when the document is no saved plan.
std::optional<SavedPlan> readSavedPlan(const Source& source, Failures* failures);

// What holds no longer, now that the plan was made again with the options of `saved`: another
// version of the program, inputs that changed, came or went, and, when all these hold, what the
// document says and its inputs do not give. A plan that has failures must be asked, too: what is
// gone is told here.
Failures changesSince(const SavedPlan& saved, const MigrationPlan& again,
                      const std::string& programVersion);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_SAVED_PLAN_H
