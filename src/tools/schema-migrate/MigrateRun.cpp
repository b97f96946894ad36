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
  return {options.out, inputs, options.allowForeignParent, mask};
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
    console->printText(renderFindings(plan) +
                       renderDifferences(plan, shownOf(plan, {}), {isColourWanted(), false}));
  }
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
    lines += failure.line == 0
                 ? errorLine(failure.file, failure.text)
                 : errorLine(placeOf(failure.file, {failure.line, failure.column}), failure.text);
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

}  // namespace

void migrate(const PlanOptions& planOptions, const MigrateOptions& options, HtmlOption* html,
             Console* console) {
  html->open();
  Removals* const removals = interruption::removals();
  std::string warnings;
  OutputDirectory output(outputOptions(planOptions, options), removals, &warnings);
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
    writeTexts(outputTexts(*plan, std::move(texts)), &output);
  }
  const std::string shownOut = wholePrintable(options.out);
  if (options.isDryRun) {
    summarize(options,
              summary + "Verified, but not written, as this was a dry run: " + shownOut + "\n",
              console);
    return;
  }
  output.publish();
  summarize(options, summary + "Written and verified: " + shownOut + "\n", console);
}
