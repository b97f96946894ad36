#include "MigrateRun.h"

#include <libschema-migration/Execution.h>

#include <memory>
#include <optional>
#include <utility>
#include <vector>

#include "HtmlReport.h"
#include "Messages.h"
#include "MigrateSummary.h"
#include "Outputs.h"
#include "PlanReport.h"
#include "Progress.h"
#include "RunTime.h"
#include "Terminal.h"

namespace {

using migration::Execution;
using migration::MigrationPlan;
using migration::NamedText;
using migration::OutputDirectory;

migration::OutputOptions outputOptions(const PlanOptions& planOptions,
                                       const MigrateOptions& options) {
  std::vector<std::string> inputs = {planOptions.request.old, planOptions.request.latest};
  if (!planOptions.request.base.empty()) {
    inputs.push_back(planOptions.request.base);
  }
  migration::OutputOptions place;
  place.path = options.out;
  place.option = "--out";
  place.inputs = inputs;
  place.allowForeignParent = options.allowForeignParent;
  return place;
}

migration::OutputOptions recordPlace(const PlanOptions& planOptions,
                                     const MigrateOptions& options) {
  migration::OutputOptions place = outputOptions(planOptions, options);
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
                               const migration::PrivatePlace& place) {
  progress::step("carrying the plan out");
  Execution execution = migration::execute(plan.request, plan.threeWay, place.path());
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
std::vector<migration::OutputText> outputTexts(const MigrationPlan& plan,
                                               std::vector<NamedText> texts) {
  std::vector<migration::OutputText> outputs;
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
    publish(output);
    if (record != nullptr) {
      publish(record);
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
  std::string warnings;
  const std::unique_ptr<OutputDirectory> output =
      openOutput(outputOptions(planOptions, options), &warnings);
  std::unique_ptr<OutputDirectory> record;
  if (!options.record.path.empty()) {
    refuseUnlessApart(options.record.path, options.out);
    record = openOutput(recordPlace(planOptions, options), &warnings);
  }
  console->complain(&warnings);
  const std::unique_ptr<MigrationPlan> plan = planOptions.makePlan();
  warnings = warningsOf(*plan);
  console->complain(&warnings);
  report(*plan, options, html, console);
  refuseUnlessReady(*plan);
  std::string summary;
  {
    const std::unique_ptr<migration::PrivatePlace> place =
        makePrivatePlace(options.out, plan->old->size() + plan->latest->size(), &warnings);
    console->complain(&warnings);
    std::vector<NamedText> texts = execute(*plan, options.isInLibraryLayout, *place);
    summary = "\n" + summaryOf(*plan, texts, options.isInLibraryLayout);
    progress::step("writing and verifying");
    if (record) {
      writeRecord(
          recordRequest(*plan, texts, options.out, options.record, options.isInLibraryLayout),
          record.get());
    }
    fill(outputTexts(*plan, std::move(texts)), output.get());
  }
  const std::string shownOut = wholePrintable(options.out);
  if (options.isDryRun) {
    summarize(options,
              summary + "Verified, but not written, as this was a dry run: " + shownOut + "\n",
              console);
    return;
  }
  publishBoth(options, output.get(), record.get());
  summary += "Written and verified: " + shownOut + "\n";
  if (record) {
    summary += "Recorded: " + wholePrintable(options.record.path) + "\n";
  }
  summarize(options, summary, console);
}
