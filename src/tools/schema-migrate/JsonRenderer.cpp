#include <nlohmann/json.hpp>
#include <set>

#include "Json.h"
#include "Renderers.h"

namespace {

// The version of the document: it is raised when what is there changes its meaning or goes.
constexpr int kDocumentVersion = 1;

// A finding with the line that it stands in, cut where it is long, in two parts: what stands before
// the place, and what from the place on.
Json reportedOf(const ReportedFinding& reported) {
  Json json = jsonOf(reported.finding);
  json["source"] = nullptr;
  if (!reported.excerpt.empty()) {
    json["source"] = {{"before", reported.excerpt.substr(0, reported.caret)},
                      {"behind", reported.excerpt.substr(reported.caret)}};
  }
  return json;
}

Json acceptanceOf(const ReportedAcceptance& accepted) {
  Json json = jsonOf(accepted.found.finding);
  json["reason"] = accepted.reason;
  return json;
}

Json failureOf(const migration::Failure& failure) {
  return {{"file", failure.file},
          {"line", failure.line},
          {"column", failure.column},
          {"text", failure.text}};
}

Json changeOf(const migration::Finding& change) {
  Json json = jsonOf(change);
  json.erase("severity");
  return json;
}

}  // namespace

std::string renderJson(const CheckReport& report) {
  Json document = {{"version", kDocumentVersion},
                   {"program", {{"name", "schema-migrate"}, {"version", SCHEMA_MIGRATE_VERSION}}},
                   {"command", "check"},
                   {"directories", report.directories},
                   {"findings", Json::array()},
                   {"rules", Json::array()},
                   {"accepted", Json::array()},
                   {"changes", Json::array()},
                   {"failures", Json::array()},
                   {"counts",
                    {{"error", report.count(migration::Severity::kError)},
                     {"warning", report.count(migration::Severity::kWarning)},
                     {"accepted", report.accepted.size()}}},
                   {"exitCode", report.exitCode}};
  std::set<std::string> rules;
  for (const ReportedFinding& reported : report.findings) {
    document["findings"].push_back(reportedOf(reported));
    rules.insert(reported.finding.rule);
  }
  for (const ReportedAcceptance& accepted : report.accepted) {
    document["accepted"].push_back(acceptanceOf(accepted));
  }
  for (const migration::Finding& change : report.changes) {
    document["changes"].push_back(changeOf(change));
  }
  for (const migration::Failure& failure : report.failures) {
    document["failures"].push_back(failureOf(failure));
  }
  for (const std::string& id : rules) {
    const migration::RuleInfo* const rule = migration::findRule(id);
    document["rules"].push_back({{"id", id},
                                 {"name", rule == nullptr ? "" : rule->name},
                                 {"what", rule == nullptr ? "" : rule->what}});
  }
  return textOf(document);
}
