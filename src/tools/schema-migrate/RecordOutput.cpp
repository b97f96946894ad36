#include "RecordOutput.h"

#include <libschema-migration/PlanDocument.h>

#include <filesystem>
#include <utility>

#include "HtmlReport.h"
#include "Messages.h"
#include "MigrateSummary.h"
#include "Outputs.h"
#include "PlanReport.h"
#include "RunTime.h"

void refuseUnlessApart(const std::string& record, const std::string& out) {
  if (!migration::areApart(record, out)) {
    throw Failure(kUsage, errorLine("--record " + record + " and --out " + out +
                                    " must name two directories, neither in the other"));
  }
}

migration::RecordRequest recordRequest(const migration::MigrationPlan& plan,
                                       std::vector<migration::NamedText> outputs,
                                       const std::string& out, const RecordOptions& options,
                                       bool isInLibraryLayout) {
  const std::string foreign = migration::pathNotForDocuments(plan);
  if (!foreign.empty()) {
    throw Failure(kNotWritten,
                  errorLine(options.path, "cannot be written: the path \"" + foreign +
                                              "\" is not UTF-8, and a plan cannot hold it"));
  }
  DifferenceFilter all;
  all.isWithSame = true;
  migration::RecordRequest request;
  request.plan = &plan;
  request.textReport = renderFindings(plan, Told::kAll) +
                       renderDifferences(plan, shownOf(plan, {}), {}) + "\n" +
                       summaryOf(plan, outputs, isInLibraryLayout);
  request.htmlReport = renderPlanHtml(renderPlanJson(plan, shownOf(plan, all), "migrate"));
  request.outputs = std::move(outputs);
  request.layout = isInLibraryLayout ? "library" : "keep";
  request.out = std::filesystem::absolute(out).string();
  request.command = options.words;
  request.directory = std::filesystem::current_path().string();
  request.programVersion = SCHEMA_MIGRATE_VERSION;
  request.time = timeOfRun();
  return request;
}

void writeRecord(const migration::RecordRequest& request, migration::OutputDirectory* record) {
  std::vector<migration::OutputText> texts;
  for (migration::RecordFile& file : migration::recordOf(request)) {
    texts.push_back(
        {std::move(file.name), std::move(file.bytes), std::nullopt, std::move(file.folder)});
  }
  fill(texts, record);
}
