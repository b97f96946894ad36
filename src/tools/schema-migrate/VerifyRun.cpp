#include "VerifyRun.h"

#include <libschema-migration/Digest.h>
#include <libschema-migration/Execution.h>
#include <libschema-migration/Settings.h>

#include <algorithm>
#include <utility>

#include "Messages.h"
#include "Outputs.h"
#include "PlanFile.h"

namespace {

using migration::Failures;
using migration::Installation;
using migration::MigrationPlan;
using migration::OutputDifference;
using migration::PlannedFiles;

Installation readOutput(const VerifyOptions& options) {
  Failures failures;
  Installation output = Installation::fromDirectory(options.directory, options.limits, &failures);
  if (!failures.empty()) {
    std::string lines;
    for (const migration::Failure& failure : failures) {
      lines += errorLine(failure.file, failure.text);
    }
    throw Failure(kBadInput, lines);
  }
  return output;
}

// Why nothing can have been migrated by the plan as it was saved.
Failures whyNotMigrated(const VerifyOptions& options, const MigrationPlan& plan) {
  Failures reasons;
  if (!plan.isReady()) {
    reasons.push_back({options.plan, 0, 0, "",
                       "is not ready (" + counted(plan.undecidedCount, "definition") +
                           " undecided, " + counted(plan.refusals.size(), "other reason") +
                           "), so that no migration was made by it"});
  }
  return reasons;
}

// Without the plan's inputs nothing is known but the SHA-256 of the files, in NEW's layout.
std::vector<OutputDifference> compareDigests(const migration::SavedPlan& saved,
                                             const Installation& output) {
  std::vector<OutputDifference> differences;
  for (const migration::PlannedOutput& planned : saved.outputs) {
    const migration::SchemaFile* const file = output.file(planned.file);
    if (file == nullptr) {
      differences.push_back(
          {output.directory() + "/" + planned.file, 0, "the file is missing", {}});
      continue;
    }
    const std::string digest = migration::sha256Of(file->source->bytes());
    if (digest != planned.sha256) {
      differences.push_back({file->source->path(),
                             0,
                             "its SHA-256 is " + digest + ", and the plan has " + planned.sha256,
                             {}});
    }
  }
  return differences;
}

PlannedFiles inLibraryLayout(const VerifyOptions& options, const MigrationPlan& plan,
                             Console* console) {
  std::uint64_t size = 0;
  for (const auto* const installation : {&plan.old, &plan.latest}) {
    for (const migration::SchemaFile& file : (*installation)->files()) {
      size += file.source->bytes().size();
    }
  }
  std::string warnings;
  const std::unique_ptr<migration::PrivatePlace> place =
      makePrivatePlace(options.directory, size, &warnings);
  console->complain(&warnings);
  migration::Execution execution = migration::execute(plan.request, plan.threeWay, place->path());
  const bool isCarried = execution.failures.empty() && execution.notCarriedByLibrary.empty();
  return {isCarried ? std::move(execution.inLibraryLayout) : std::vector<migration::NamedText>(),
          true};
}

void compare(const VerifyOptions& options, const MigrationPlan& plan, const Installation& output,
             Console* console, VerifyReport* report) {
  PlannedFiles planned{plan.resultTexts, false};
  report->differences = compareOutput(plan, planned, output);
  if (!report->differences.empty() && mayBeInLibraryLayout(output)) {
    PlannedFiles other = inLibraryLayout(options, plan, console);
    std::vector<OutputDifference> differences = compareOutput(plan, other, output);
    // NEW itself may have been written by the library: the layout is that which fits better.
    if (!other.texts.empty() && differences.size() < report->differences.size()) {
      planned = std::move(other);
      report->differences = std::move(differences);
    }
  }
  report->isInLibraryLayout = planned.isInLibraryLayout;
  report->newFindings = newInOutput(plan, planned, output);
}

std::string line(const std::string& file, std::uint64_t number, const std::string& text) {
  return wholePrintable(number == 0 ? file : placeOf(file, number)) + ": " + wholePrintable(text) +
         "\n";
}

std::string shown(const std::string& value) {
  return value.empty() ? "(none)" : wholePrintable(value);
}

std::string rendered(const OutputDifference& difference) {
  std::string text = line(difference.file, difference.line, difference.text);
  for (const migration::ClauseDifference& clause : difference.clauses) {
    text += "  " + clause.name + "\n";
    text += "    planned " + shown(clause.planned) + "\n";
    text += "    found   " + shown(clause.found) + "\n";
  }
  return text;
}

std::string rendered(const migration::Finding& finding) {
  const std::string place =
      finding.line == 0 ? finding.file : placeOf(finding.file, {finding.line, finding.column});
  return wholePrintable(place) + ": " + std::string(wordOf(finding.severity)) + ": " +
         wholePrintable(finding.text) + " (new in this result) [" + finding.rule + "]\n";
}

}  // namespace

VerifyReport verify(const VerifyOptions& options, Console* console) {
  const Installation output = readOutput(options);
  const RemadePlan plan = remakePlan(options.plan, options.limits);
  VerifyReport report;
  report.definitionCount = output.entries().size();
  report.fileCount = output.files().size();
  report.planChanges = plan.changes;
  if (!report.planChanges.empty() || !plan.again->failures.empty()) {
    report.differences = compareDigests(plan.loaded.saved, output);
    return report;
  }
  report.planChanges = whyNotMigrated(options, *plan.again);
  if (report.planChanges.empty()) {
    compare(options, *plan.again, output, console, &report);
  }
  return report;
}

std::string renderVerification(const VerifyReport& report, const VerifyOptions& options) {
  std::string text;
  for (const migration::Failure& change : report.planChanges) {
    text += line(change.file, change.line, change.text);
  }
  for (const OutputDifference& difference : report.differences) {
    text += rendered(difference);
  }
  for (const migration::Finding& finding : report.newFindings) {
    text += rendered(finding);
  }
  const std::string directory = wholePrintable(options.directory);
  const std::string plan = wholePrintable(options.plan);
  if (report.isVerified()) {
    return text + "Verified: " + directory + " is what " + plan +
           " says: " + counted(report.definitionCount, "definition") + " in " +
           counted(report.fileCount, "file") +
           (report.isInLibraryLayout ? ", as the library writes them.\n"
                                     : ", laid out as NEW's.\n");
  }
  if (!report.planChanges.empty()) {
    text += plan + " does not hold, so the definitions were not compared" +
            (report.differences.empty() ? ".\n" : ", but the SHA-256 of the files.\n");
  }
  return text + "Not verified: " + directory + ": " + counted(report.planChanges.size(), "reason") +
         " against the plan, " + counted(report.differences.size(), "difference") + ", " +
         counted(report.newFindings.size(), "new finding") + ".\n";
}
