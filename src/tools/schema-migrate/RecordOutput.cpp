#include "RecordOutput.h"

#include <libschema-migration/PlanDocument.h>

#include <filesystem>
#include <utility>

#include "HtmlReport.h"
#include "Messages.h"
#include "MigrateSummary.h"
#include "PlanReport.h"
#include "RunTime.h"
#include "TextOutput.h"

namespace {

// With a slash at its end, so that one path that begins as another lies in it.
std::string folderPath(const std::string& path) {
  return (std::filesystem::absolute(path) / "").lexically_normal().string();
}

bool begins(const std::string& text, const std::string& beginning) {
  return text.compare(0, beginning.size(), beginning) == 0;
}

}  // namespace

void refuseUnlessApart(const std::string& record, const std::string& out) {
  const std::string recordPath = folderPath(record);
  const std::string outPath = folderPath(out);
  if (begins(recordPath, outPath) || begins(outPath, recordPath)) {
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

void writeRecord(const migration::RecordRequest& request, OutputDirectory* record) {
  std::vector<OutputText> texts;
  for (migration::RecordFile& file : migration::recordOf(request)) {
    texts.push_back(
        {std::move(file.name), std::move(file.bytes), std::nullopt, std::move(file.folder)});
  }
  writeTexts(texts, record);
}
