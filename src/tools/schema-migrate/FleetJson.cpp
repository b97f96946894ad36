// The document of `fleet`.

#include "FleetReport.h"
#include "Json.h"

namespace {

using migration::FleetClause;
using migration::FleetDefinition;
using migration::FleetGroup;
using migration::FleetInstallation;
using migration::FleetQuestion;
using migration::FleetRelease;
using migration::FleetValue;

// The version of the document: it is raised when what is there changes its meaning or goes.
constexpr int kDocumentVersion = 1;

Json orNull(const std::string& text) { return text.empty() ? Json(nullptr) : Json(text); }

class FleetDocument {
 public:
  explicit FleetDocument(const FleetReport& report) : m_report(report), m_fleet(report.fleet) {}

  Json make() const {
    return {{"version", kDocumentVersion},
            {"program", {{"name", "schema-migrate"}, {"version", SCHEMA_MIGRATE_VERSION}}},
            {"command", "fleet"},
            {"exitCode", m_report.exitCode},
            {"ready", m_report.isReady()},
            {"options",
             {{"definition", orNull(m_report.query.definition)},
              {"all", m_report.query.isWithUnchanged}}},
            {"releases", listOf(m_fleet.releases)},
            {"installations", listOf(m_fleet.installations)},
            {"definitions", listOf(m_fleet.definitions)},
            {"questions", listOf(m_fleet.questions)},
            {"failures", failures()},
            {"counts",
             {{"installations", m_fleet.installations.size()},
              {"ready", m_fleet.readyCount},
              {"refused", m_fleet.refusedCount},
              {"questions", m_fleet.questionCount}}}};
  }

 private:
  template <typename Value>
  Json listOf(const std::vector<Value>& values) const {
    Json array = Json::array();
    for (const Value& value : values) {
      array.push_back(jsonOf(value));
    }
    return array;
  }

  Json namesOf(const std::vector<std::size_t>& installations) const {
    Json names = Json::array();
    for (const std::size_t at : installations) {
      names.push_back(m_fleet.installations[at].name);
    }
    return names;
  }

  static Json jsonOf(const FleetClause& clause) {
    return {{"clause", clause.clause},
            {"base", orNull(clause.base)},
            {"old", orNull(clause.old)},
            {"new", orNull(clause.latest)}};
  }

  static Json jsonOf(const FleetValue& value) {
    return {{"clause", value.first}, {"value", value.second}};
  }

  static Json jsonOf(const FleetRelease& release) {
    return {{"base", orNull(release.base)},
            {"new", release.latest},
            {"differsFromFirst", release.differing},
            {"installations", release.installations},
            {"definitions", release.definitions},
            {"unchangedDefinitions", release.unchangedDefinitions}};
  }

  static Json jsonOf(const FleetInstallation& installation) {
    return {{"name", installation.name},
            {"plan", installation.path},
            {"release", installation.release + 1},
            {"ready", installation.isReady},
            {"definitions", installation.definitions},
            {"undecided", installation.undecided},
            {"questions", installation.questions},
            {"refusals", installation.refusals}};
  }

  Json jsonOf(const FleetGroup& group) const {
    return {{"standing", wordOf(group.standing)},
            {"class", group.change},
            {"outcome", group.outcome},
            {"clauses", listOf(group.clauses)},
            {"otherClauses", listOf(group.values)},
            {"installations", namesOf(group.installations)}};
  }

  Json jsonOf(const FleetDefinition& definition) const {
    return {{"release", definition.release + 1},
            {"kind", definition.kind},
            {"oid", definition.oid},
            {"name", definition.name},
            {"has", definition.has},
            {"unchanged", definition.unchanged},
            {"ways", definition.ways},
            {"undecided", definition.undecided},
            {"groups", listOf(definition.groups)}};
  }

  Json jsonOf(const FleetQuestion& question) const {
    return {{"kind", question.kind},
            {"oid", question.oid},
            {"name", question.name},
            {"fingerprint", question.fingerprint},
            {"reason", question.reason},
            {"clauses", listOf(question.clauses)},
            {"otherClauses", listOf(question.values)},
            {"by", question.isByName ? "name" : "oid"},
            {"take", question.takes},
            {"openClauses", question.openClauses},
            {"move", question.mayMove},
            {"installations", namesOf(question.installations)},
            {"readyThen", question.readyThen}};
  }

  Json failures() const {
    Json array = Json::array();
    for (const migration::Failure& failure : m_report.failures) {
      array.push_back({{"file", failure.file},
                       {"line", failure.line},
                       {"column", failure.column},
                       {"text", failure.text}});
    }
    return array;
  }

  const FleetReport& m_report;
  const migration::Fleet& m_fleet;
};

}  // namespace

std::string renderJson(const FleetReport& report) { return textOf(FleetDocument(report).make()); }
