#include "PlannedRun.h"

#include <libschema-migration/Execution.h>
#include <sys/stat.h>

#include <optional>

#include "Interruption.h"
#include "Messages.h"
#include "OutputDirectory.h"
#include "PlanReport.h"
#include "PrivatePlace.h"
#include "Progress.h"
#include "RunPlaces.h"
#include "Terminal.h"
#include "TextOutput.h"

namespace {

using migration::Execution;
using migration::MigrationPlan;
using migration::NamedText;

std::uint64_t sizeOf(const MigrationPlan& plan) {
  std::uint64_t size = 0;
  for (const auto* const installation : {&plan.old, &plan.latest}) {
    for (const migration::SchemaFile& file : (*installation)->files()) {
      size += file.source->bytes().size();
    }
  }
  return size;
}

void refuseUnlessReady(const MigrationPlan& plan) {
  if (!plan.isReady()) {
    const char* const advice =
        plan.undecidedCount == 0
            ? "refused: nothing was written"
            : "refused: nothing was written; plan --template makes a file in which what is undecided "
              "can be decided";
    throw Failure(kRefused, whyNotReady(plan) + errorLine(advice));
  }
}

std::string linesOf(const migration::Failures& failures) {
  std::string lines;
  for (const migration::Failure& failure : failures) {
    lines += errorLine(failure.file, failure.text);
  }
  return lines;
}

// The result in the layout that is wanted, as the library came to it.
std::vector<NamedText> execute(const MigrationPlan& plan, bool isInLibraryLayout,
                               PrivatePlace* place) {
  for (const char* const folder : migration::kExecutionFolders) {
    place->makeDirectory(folder);
  }
  progress::step("carrying the plan out");
  Execution execution = migration::execute(plan.request, plan.threeWay, place->path());
  if (!execution.failures.empty()) {
    throw Failure(kNotWritten, linesOf(execution.failures) +
                                   errorLine("the library does not come to what was planned; "
                                             "nothing was written"));
  }
  if (!isInLibraryLayout) {
    return std::move(execution.inNewsLayout);
  }
  if (!execution.notCarriedByLibrary.empty()) {
    throw Failure(kRefused, linesOf(execution.notCarriedByLibrary) +
                                errorLine("refused: NEW holds what the library does not write; "
                                          "without --layout library it stays"));
  }
  return std::move(execution.inLibraryLayout);
}

// The mode that NEW's config file has; the others get that of any new file.
std::optional<mode_t> modeOf(const MigrationPlan& plan, const std::string& name) {
  struct stat status {};
  const bool isConfigFile = name.rfind("V3.config.", 0) == 0;
  const std::string path = plan.latest->directory() + "/" + name;
  return isConfigFile && ::stat(path.c_str(), &status) == 0
             ? std::optional<mode_t>(status.st_mode & 07777)
             : std::nullopt;
}

}  // namespace

void migrateByPlan(const MigrateOptions& options, const PlanOptions& planOptions,
                   const PlannedRunOptions& runOptions, Console* console) {
  const mode_t mask = ::umask(0);
  ::umask(mask);
  Removals* const removals = interruption::removals();
  std::string warnings;
  std::vector<std::string> inputs = {options.from, options.to};
  if (!planOptions.request.base.empty()) {
    inputs.push_back(planOptions.request.base);
  }
  OutputDirectory output({options.out, inputs, options.allowForeignParent, mask}, removals,
                         &warnings);
  console->complain(&warnings);
  const std::unique_ptr<MigrationPlan> plan = planOptions.makePlan();
  DifferenceFilter filter;
  filter.isWithSame = runOptions.isJson;
  const ShownDifferences shown = shownOf(*plan, filter);
  const PlanStyle style{isColourWanted(), false};
  if (runOptions.isJson) {
    console->print(renderPlanJson(*plan, shown, "migrate"));
  } else {
    console->printText(renderDifferences(*plan, shown, style));
  }
  refuseUnlessReady(*plan);
  PrivatePlace place(privatePlaceFor(options.out, sizeOf(*plan)), removals, &warnings);
  console->complain(&warnings);
  const std::vector<NamedText> texts = execute(*plan, runOptions.isInLibraryLayout, &place);
  if (runOptions.isDryRun) {
    if (!runOptions.isJson) {
      console->print("\nNot written, as this was a dry run: " + wholePrintable(options.out) + "\n");
    }
    return;
  }
  progress::step("writing and verifying");
  publishTexts(
      texts, [&](const std::string& name) { return modeOf(*plan, name); }, &place, &output);
  if (!runOptions.isJson &&
      !console->write("\nWritten and verified: " + wholePrintable(options.out) + "\n")) {
    throw Failure(
        kNotWritten,
        errorLine(
            options.out,
            "is complete and in place, but the summary cannot be written to standard output"));
  }
}
