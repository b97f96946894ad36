#include "MigrateRun.h"

#include <libschema-migration/Execution.h>
#include <sys/stat.h>

#include <optional>
#include <utility>
#include <vector>

#include "HtmlReport.h"
#include "Interruption.h"
#include "Messages.h"
#include "MigrateSummary.h"
#include "OutputDirectory.h"
#include "PlanReport.h"
#include "PrivatePlace.h"
#include "Progress.h"
#include "RunPlaces.h"
#include "RunTime.h"
#include "Terminal.h"
#include "TextOutput.h"

namespace {

using migration::Execution;
using migration::MigrationPlan;
using migration::NamedText;

OutputOptions outputOptions(const PlanOptions& planOptions, const MigrateOptions& options) {
  const mode_t mask = ::umask(0);
  ::umask(mask);
  std::vector<std::string> inputs = {planOptions.request.old, planOptions.request.latest};
  if (!planOptions.request.base.empty()) {
    inputs.push_back(planOptions.request.base);
  }
  OutputOptions place;
  place.path = options.out;
  place.inputs = inputs;
  place.allowForeignParent = options.allowForeignParent;
  place.mask = mask;
  return place;
}

OutputOptions recordPlace(const PlanOptions& planOptions, const MigrateOptions& options) {
  OutputOptions place = outputOptions(planOptions, options);
  place.path = options.record.path;
  place.option = "--record";
  place.noun = "record";
  return place;
}

void report(const MigrationPlan& plan, const MigrateOptions& options, HtmlOption* html,
            Console* console) {
  DifferenceFilter all;
  all.isWithSame = true;
  const std::string document =
      options.isJson || html->isWanted() ? renderPlanJson(plan, shownOf(plan, all), "migrate") : "";
  if (html->isWanted()) {
    html->write(renderPlanHtml(document));
  }
  if (options.isJson) {
    console->print(document);
  } else {
    console->printText(renderFindings(plan, Told::kFirst) +
                       renderDifferences(plan, shownOf(plan, {}), {isColourWanted(), false}));
  }
}

void refuseUnlessReady(const MigrationPlan& plan) {
  if (!plan.isReady()) {
    const bool isLoss = plan.refusals.size() > plan.newInResult.size();
    const char* const advice =
        plan.undecidedCount == 0 && isLoss
            ? "refused: nothing was written; what can be mended without changing what is said, "
              "--repair mends in private copies; a .schema-migrate.toml in the directory accepts "
              "what is meant so"
        : plan.undecidedCount == 0
            ? "refused: nothing was written"
            : "refused: nothing was written; plan --template makes a file in which what is undecided "
              "can be decided";
    throw Failure(kRefused, whyNotReady(plan) + errorLine(advice));
  }
}

// The result in the layout that is wanted, as the library came to it.
std::vector<NamedText> execute(const MigrationPlan& plan, bool isInLibraryLayout,
                               PrivatePlace* place) {
  for (const char* const folder : migration::kExecutionFolders) {
    place->makeDirectory(folder);
  }
  progress::step("carrying the plan out");
  Execution execution = migration::execute(plan.request, plan.threeWay, place->path());
  if (!execution.failures.empty() && execution.departsFromPlan) {
    throw Failure(kRefused, linesOf(execution.failures) +
                                errorLine("refused: the server's library does not come to what was "
                                          "planned; nothing was written"));
  }
  if (!execution.failures.empty()) {
    throw Failure(kNotWritten, linesOf(execution.failures));
  }
  if (!isInLibraryLayout) {
    return std::move(execution.inNewsLayout);
  }
  if (!execution.notCarriedByLibrary.empty()) {
    throw Failure(kRefused,
                  linesOf(execution.notCarriedByLibrary) +
                      errorLine("refused: the library does not write these as they are; without "
                                "--layout library they stay"));
  }
  return std::move(execution.inLibraryLayout);
}

// A config file has the mode that NEW's has; the others get that of any new file.
std::vector<OutputText> outputTexts(const MigrationPlan& plan, std::vector<NamedText> texts) {
  std::vector<OutputText> outputs;
  outputs.reserve(texts.size());
  for (NamedText& text : texts) {
    const migration::SchemaFile* const file = plan.latest->file(text.name);
    const bool isConfigFile = text.name.rfind("V3.config.", 0) == 0;
    const bool isCopied = isConfigFile && file != nullptr;
    outputs.push_back({std::move(text.name), std::move(text.bytes),
                       isCopied ? std::optional<mode_t>(file->mode) : std::nullopt});
  }
  return outputs;
}

void summarize(const MigrateOptions& options, const std::string& summary, Console* console) {
  if (!options.isJson && !console->write(summary)) {
    throw Failure(
        kNotWritten,
        options.isDryRun
            ? errorLine("the summary cannot be written to standard output")
            : errorLine(
                  options.out,
                  "is complete and in place, but the summary cannot be written to standard output"));
  }
}

// The output first: a record of what was not written would mislead.
void publishBoth(const MigrateOptions& options, OutputDirectory* output, OutputDirectory* record) {
  try {
    output->publish();
    if (record != nullptr) {
      record->publish();
    }
  } catch (const Failure& failure) {
    if (record == nullptr || record->isPublished()) {
      throw;
    }
    const std::string state =
        output->isPublished()
            ? errorLine(options.out, "is complete and in place, but the record of this run is not")
            : errorLine(options.record.path, "the record was not written either");
    throw Failure(kNotWritten, failure.what() + state);
  }
}

}  // namespace

void migrate(const PlanOptions& planOptions, const MigrateOptions& options, HtmlOption* html,
             Console* console) {
  static_cast<void>(timeWanted());
  html->refuseIn("--out", options.out);
  html->refuseIn("--record", options.record.path);
  html->open();
  interruption::expectOutput();
  Removals* const removals = interruption::removals();
  std::string warnings;
  OutputDirectory output(outputOptions(planOptions, options), removals, &warnings);
  std::optional<OutputDirectory> record;
  if (!options.record.path.empty()) {
    refuseUnlessApart(options.record.path, options.out);
    record.emplace(recordPlace(planOptions, options), removals, &warnings);
  }
  console->complain(&warnings);
  const std::unique_ptr<MigrationPlan> plan = planOptions.makePlan();
  warnings = warningsOf(*plan);
  console->complain(&warnings);
  report(*plan, options, html, console);
  refuseUnlessReady(*plan);
  std::string summary;
  {
    PrivatePlace place(privatePlaceFor(options.out, plan->old->size() + plan->latest->size()),
                       removals, &warnings);
    console->complain(&warnings);
    std::vector<NamedText> texts = execute(*plan, options.isInLibraryLayout, &place);
    summary = "\n" + summaryOf(*plan, texts, options.isInLibraryLayout);
    progress::step("writing and verifying");
    if (record) {
      writeRecord(
          recordRequest(*plan, texts, options.out, options.record, options.isInLibraryLayout),
          &*record);
    }
    writeTexts(outputTexts(*plan, std::move(texts)), &output);
  }
  const std::string shownOut = wholePrintable(options.out);
  if (options.isDryRun) {
    summarize(options,
              summary + "Verified, but not written, as this was a dry run: " + shownOut + "\n",
              console);
    return;
  }
  publishBoth(options, &output, record ? &*record : nullptr);
  summary += "Written and verified: " + shownOut + "\n";
  if (record) {
    summary += "Recorded: " + wholePrintable(options.record.path) + "\n";
  }
  summarize(options, summary, console);
}
