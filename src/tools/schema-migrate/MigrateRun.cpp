#include "MigrateRun.h"

#include <sys/stat.h>

#include "Inputs.h"
#include "Interruption.h"
#include "Inventory.h"
#include "Messages.h"
#include "Migration.h"
#include "OidList.h"
#include "OutputDirectory.h"
#include "Plan.h"
#include "PrivatePlace.h"
#include "Report.h"
#include "RunPlaces.h"
#include "SeparateProcess.h"
#include "Verification.h"

namespace {

void refuseIfNeeded(const Plan& plan) {
  if (plan.refusalCount() != 0) {
    throw Failure(kRefused, plan.refusals() +
                                errorLine("refused: " + counted(plan.refusalCount(), "definition") +
                                          " cannot be migrated; nothing was written"));
  }
}

// What a run reads, opened and copied.
struct Opened {
  Inputs inputs;
  std::vector<const ListFile*> excludeLists;
  const ListFile* withdrawList = nullptr;
  const Installation* oldOne = nullptr;
  const Installation* newOne = nullptr;

  Opened(const MigrateOptions& options, std::string* warnings) : inputs(options.maxInput) {
    for (const std::string& path : options.excludeLists) {
      excludeLists.push_back(&inputs.openList(path));
    }
    if (!options.withdrawList.empty()) {
      withdrawList = &inputs.openList(options.withdrawList);
    }
    oldOne = &inputs.openInstallation("OLD", options.from, warnings);
    newOne = &inputs.openInstallation("NEW", options.to, warnings);
  }

  OidLists readLists() const {
    OidLists lists;
    for (const ListFile* const list : excludeLists) {
      readOidList(*list, &lists.excluded);
    }
    if (withdrawList != nullptr) {
      readOidList(*withdrawList, &lists.withdrawn);
    }
    return lists;
  }
};

void copyAll(const OwnDirectory& written, const Installation& newOne, OutputDirectory* output) {
  for (std::size_t file = 0; file < kWrittenFiles; ++file) {
    output->copyIn(written.directory(), kSchemaFiles[file]);
  }
  for (std::size_t file = kWrittenFiles; file < kSchemaFiles.size(); ++file) {
    if (newOne.files[file].isThere) {
      output->copyIn(*newOne.copies, kSchemaFiles[file], newOne.files[file].mode);
    }
  }
}

}  // namespace

// The private copies are read three times: to work the run out, for the collision reports, and for
// the run. What one does not need any more it gives back before the next begins; the check for
// collisions cannot, since it empties tables without deleting what was in them.
void migrate(const MigrateOptions& options, Console* console) {
  const mode_t mask = ::umask(0);
  ::umask(mask);
  Removals* const removals = interruption::removals();
  std::string warnings;
  OutputDirectory output(
      {options.out, {options.from, options.to}, options.allowForeignParent, mask}, removals,
      &warnings);
  console->complain(&warnings);
  Opened opened(options, &warnings);
  PrivatePlace place(privatePlaceFor(options.out, opened.inputs.size()), removals, &warnings);
  console->complain(&warnings);
  opened.inputs.copyTo(&place);
  const OidLists lists = opened.readLists();
  Inventory oldOne(*opened.oldOne, &warnings);
  Inventory newOne(*opened.newOne, &warnings);
  console->complain(&warnings);
  Plan plan(oldOne, newOne, lists);
  oldOne.releaseObjects();
  newOne.releaseObjects();
  refuseIfNeeded(plan);
  warnings = plan.warnings();
  console->complain(&warnings);

  const Installations installations{oldOne, newOne, opened.excludeLists, opened.withdrawList};
  console->print(textFromSeparateProcess([&] { return reportCollisions(installations); }));
  const OwnDirectory& written = place.makeDirectory("written");
  {
    Migration migration(installations);
    migration.write(place.pathOf("written"));
  }
  verifyWritten(written.directory(), place.pathOf("written"), plan);
  output.create();
  copyAll(written, *opened.newOne, &output);
  output.sync();
  verifyOutput(output.directory(), written.directory(), plan, newOne);
  const std::string summary = "\n" + summaryOf(oldOne, newOne, &plan) +
                              "Written and verified: " + wholePrintable(options.out) + "\n";
  output.publish();
  if (!console->write(summary)) {
    throw Failure(
        kNotWritten,
        errorLine(
            options.out,
            "is complete and in place, but the summary cannot be written to standard output"));
  }
}
