// The JSON document of a verification.

#include "Json.h"
#include "VerifyRun.h"

namespace {

// The version of the document: it is raised when what is there changes its meaning or goes.
constexpr int kDocumentVersion = 1;

Json changesOf(const migration::Failures& changes) {
  Json array = Json::array();
  for (const migration::Failure& change : changes) {
    array.push_back({{"file", change.file}, {"line", change.line}, {"text", change.text}});
  }
  return array;
}

Json textOrNull(const std::string& text) { return text.empty() ? Json(nullptr) : Json(text); }

Json differencesOf(const std::vector<migration::OutputDifference>& differences) {
  Json array = Json::array();
  for (const migration::OutputDifference& difference : differences) {
    Json clauses = Json::array();
    for (const migration::ClauseDifference& clause : difference.clauses) {
      clauses.push_back({{"clause", clause.name},
                         {"planned", textOrNull(clause.planned)},
                         {"found", textOrNull(clause.found)}});
    }
    array.push_back({{"file", difference.file},
                     {"line", difference.line},
                     {"text", difference.text},
                     {"clauses", clauses}});
  }
  return array;
}

}  // namespace

std::string renderVerificationJson(const VerifyReport& report, const VerifyOptions& options) {
  Json findings = Json::array();
  for (const migration::Finding& finding : report.newFindings) {
    findings.push_back(jsonOf(finding));
  }
  return textOf(
      {{"version", kDocumentVersion},
       {"program", {{"name", "schema-migrate"}, {"version", SCHEMA_MIGRATE_VERSION}}},
       {"command", "verify"},
       {"verified", report.isVerified()},
       {"plan", options.plan},
       {"directory", options.directory},
       {"layout", report.isInLibraryLayout ? "library" : "keep"},
       {"planChanges", changesOf(report.planChanges)},
       {"differences", differencesOf(report.differences)},
       {"newFindings", findings},
       {"counts", {{"definitions", report.definitionCount}, {"files", report.fileCount}}}});
}
