#include "PlanFile.h"

#include <libschema-migration/InputFiles.h>
#include <libschema-migration/PlanDocument.h>
#include <sys/stat.h>

#include <utility>

#include "Messages.h"
#include "Outputs.h"
#include "PlanReport.h"
#include "Progress.h"

std::unique_ptr<migration::Source> readPlanFile(const std::string& path,
                                                migration::Failures* failures) {
  // A plan tells of every definition more than the definition says.
  constexpr std::uint64_t kMost = std::uint64_t{1} << 33;
  migration::ReadLimits limits;
  limits.bytes = kMost;
  return migration::readSource(path, limits, failures);
}

void refuseUnlessPlanCanBeSaved(const std::string& path) {
  struct stat status {};
  if (::lstat(path.c_str(), &status) != 0) {
    return;
  }
  migration::Failures failures;
  const std::unique_ptr<migration::Source> source =
      S_ISREG(status.st_mode) ? readPlanFile(path, &failures) : nullptr;
  if (source == nullptr || !migration::readSavedPlan(*source, &failures)) {
    throw Failure(kNotWritten,
                  errorLine(path,
                            "exists and is no saved plan, so it is not replaced; name a new "
                            "file"));
  }
}

void savePlan(const migration::MigrationPlan& plan, const std::string& path) {
  const std::string foreign = migration::pathNotForDocuments(plan);
  if (!foreign.empty()) {
    throw Failure(kNotWritten, errorLine(path, "cannot be written: the path \"" + foreign +
                                                   "\" is not UTF-8, and a plan cannot hold it"));
  }
  refuseUnlessPlanCanBeSaved(path);
  struct stat status {};
  const migration::Over over =
      ::lstat(path.c_str(), &status) == 0 ? migration::Over::kFile : migration::Over::kNothing;
  writeNewFile(path, migration::planDocument(plan, {"plan", SCHEMA_MIGRATE_VERSION}), over);
}

LoadedPlan loadPlan(const std::string& path) {
  LoadedPlan loaded;
  migration::Failures failures;
  loaded.source = readPlanFile(path, &failures);
  std::optional<migration::SavedPlan> saved;
  if (loaded.source != nullptr) {
    saved = migration::readSavedPlan(*loaded.source, &failures);
  }
  if (!saved) {
    throw Failure(kBadInput, linesOf(failures));
  }
  loaded.saved = std::move(*saved);
  return loaded;
}

RemadePlan remakePlan(const std::string& path, const migration::ReadLimits& limits) {
  RemadePlan remade;
  remade.loaded = loadPlan(path);
  migration::PlanRequest request = remade.loaded.saved.request;
  request.limits = limits;
  request.onStep = progress::step;
  remade.again = migration::makePlan(request);
  remade.changes =
      migration::changesSince(remade.loaded.saved, *remade.again, SCHEMA_MIGRATE_VERSION);
  return remade;
}
