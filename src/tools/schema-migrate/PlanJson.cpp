// The JSON document of a plan.

#include <libschema-migration/Content.h>

#include <algorithm>
#include <map>

#include "Json.h"
#include "PlanReport.h"
#include "PlanSuperiors.h"

namespace {

using migration::ClauseChange;
using migration::Entry;
using migration::MigrationPlan;
using migration::Verdict;

// The version of the document: it is raised when what is there changes its meaning or goes.
constexpr int kDocumentVersion = 1;

Json placeOf(const Entry* entry) {
  if (entry == nullptr) {
    return nullptr;
  }
  return {{"file", entry->file->source->path()}, {"line", entry->place().line}};
}

Json valueOf(migration::Aspect aspect, const migration::Values& values) {
  if (values.empty()) {
    return nullptr;
  }
  return migration::shownValue(aspect, values);
}

Json clauseOf(const ClauseChange& change) {
  return {{"clause", nameOf(change.aspect)},
          {"base", valueOf(change.aspect, change.base)},
          {"old", valueOf(change.aspect, change.old)},
          {"new", valueOf(change.aspect, change.latest)},
          {"result", change.isDecided ? valueOf(change.aspect, change.result) : Json(nullptr)},
          {"decided", change.isDecided},
          {"risk", wordOf(change.risk)}};
}

// What it says beside the clauses that differ, so that a reader has the whole of it.
Json otherClausesOf(const Verdict& row) {
  const Entry& entry = row.match.latest != nullptr ? *row.match.latest : row.entry();
  const migration::Content content = contentOf(*entry.kept);
  Json clauses = Json::array();
  for (const migration::Aspect aspect : migration::aspectsOf(row.kind())) {
    const bool isTold =
        std::any_of(row.clauses.begin(), row.clauses.end(),
                    [&](const ClauseChange& change) { return change.aspect == aspect; });
    if (!isTold && !shownValue(aspect, content[aspect]).empty()) {
      clauses.push_back(
          {{"clause", nameOf(aspect)}, {"value", shownValue(aspect, content[aspect])}});
    }
  }
  return clauses;
}

std::string nameOfDefinition(const Verdict& row, const std::vector<Verdict>& rows) {
  const bool isExtension = row.kind() == migration::Kind::kVendorExtension;
  if (isExtension && row.match.attribute == migration::kNoRow) {
    return "";
  }
  const Entry& named = isExtension ? rows[row.match.attribute].entry() : row.entry();
  const migration::Values& names = named.kept->object->namesInPlace();
  return names.empty() ? std::string() : names.front();
}

const Entry* inResult(const MigrationPlan& plan, const Verdict& row) {
  if (!row.isInResult() || !plan.result) {
    return nullptr;
  }
  const std::string& oid =
      row.isCarried() ? row.result->oid() : row.match.latest->kept->object->oidInPlace();
  return plan.result->byOid(row.kind(), oid);
}

Json definitionOf(const MigrationPlan& plan, const Verdict& row) {
  Json clauses = Json::array();
  for (const ClauseChange& change : row.clauses) {
    clauses.push_back(clauseOf(change));
  }
  return {{"kind", wordOf(row.kind())},
          {"oid", row.entry().kept->object->oidInPlace()},
          {"name", nameOfDefinition(row, plan.threeWay.differences)},
          {"class", wordOf(row.change)},
          {"renamed", row.isRenamed},
          {"renumbered", row.isRenumbered},
          {"risk", wordOf(row.risk)},
          {"outcome", wordOf(row.outcome)},
          {"reason", row.reason},
          {"notes", row.notes},
          {"decision", row.decision.empty() ? Json(nullptr) : Json(row.decision)},
          {"fingerprint", fingerprintOf(row)},
          {"text", row.isCarried() ? Json(migration::textOf(*row.result)) : Json(nullptr)},
          {"clauses", clauses},
          {"otherClauses", otherClausesOf(row)},
          {"places",
           {{"base", placeOf(row.match.base)},
            {"old", placeOf(row.match.old)},
            {"new", placeOf(row.match.latest)},
            {"result", placeOf(inResult(plan, row))}}}};
}

Json superiorsOf(const MigrationPlan& plan, const ShownDifferences& shown) {
  Json array = Json::array();
  for (const SuperiorNode& node : superiorsAround(plan, shown)) {
    array.push_back({{"kind", wordOf(node.row->kind())},
                     {"oid", node.row->entry().kept->object->oidInPlace()},
                     {"name", nameOfDefinition(*node.row, plan.threeWay.differences)},
                     {"superiors", *node.superiors}});
  }
  return array;
}

Json findingsOf(const migration::Findings& findings) {
  Json array = Json::array();
  for (const migration::Finding& finding : findings) {
    array.push_back(jsonOf(finding));
  }
  return array;
}

Json failuresOf(const migration::Failures& failures) {
  Json array = Json::array();
  for (const migration::Failure& failure : failures) {
    array.push_back({{"file", failure.file},
                     {"line", failure.line},
                     {"column", failure.column},
                     {"rule", failure.rule},
                     {"text", failure.text}});
  }
  return array;
}

Json countsOf(const MigrationPlan& plan) {
  std::map<std::string, std::size_t> classes;
  std::map<std::string, std::size_t> outcomes;
  std::map<std::string, std::size_t> risks;
  for (const Verdict& row : plan.threeWay.differences) {
    ++classes[wordOf(row.change)];
    ++outcomes[std::string(wordOf(row.outcome))];
    ++risks[std::string(wordOf(row.risk))];
  }
  return {{"definitions", plan.threeWay.differences.size()},
          {"class", classes},
          {"outcome", outcomes},
          {"risk", risks}};
}

}  // namespace

std::string renderPlanJson(const MigrationPlan& plan, const ShownDifferences& shown,
                           const std::string& command) {
  Json inputs = Json::array();
  for (const migration::PlanInput& input : plan.inputs) {
    inputs.push_back({{"role", input.role}, {"path", input.path}, {"sha256", input.sha256}});
  }
  Json definitions = Json::array();
  for (const Verdict* const row : shown) {
    definitions.push_back(definitionOf(plan, *row));
  }
  return textOf({{"version", kDocumentVersion},
                 {"program", {{"name", "schema-migrate"}, {"version", SCHEMA_MIGRATE_VERSION}}},
                 {"command", command},
                 {"ready", plan.isReady()},
                 {"inputs", inputs},
                 {"definitions", definitions},
                 {"superiors", superiorsOf(plan, shown)},
                 {"findings", findingsOf(plan.ofInputs)},
                 {"newInResult", findingsOf(plan.newInResult)},
                 {"refusals", failuresOf(plan.refusals)},
                 {"failures", failuresOf(plan.failures)},
                 {"counts", countsOf(plan)}});
}
