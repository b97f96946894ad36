#include <map>
#include <string_view>

#include "Json.h"
#include "Renderers.h"

namespace {

constexpr char kSchema[] = "https://json.schemastore.org/sarif-2.1.0.json";

const char* levelOf(migration::Severity severity) {
  switch (severity) {
    case migration::Severity::kError:
      return "error";
    case migration::Severity::kWarning:
      return "warning";
    case migration::Severity::kOff:
      break;
  }
  return "none";
}

// A path as a URI reference (RFC 3986): what is no unreserved character or "/" as %NN.
std::string uriOf(std::string_view path) {
  constexpr std::string_view kDigits = "0123456789ABCDEF";
  constexpr std::string_view kPlain =
      "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789-._~/";
  std::string uri = path.substr(0, 1) == "/" ? "file://" : "";
  for (const char c : path) {
    if (kPlain.find(c) != std::string_view::npos) {
      uri += c;
    } else {
      const auto byte = static_cast<unsigned char>(c);
      uri += '%';
      uri += kDigits[byte >> 4U];
      uri += kDigits[byte & 0xfU];
    }
  }
  return uri;
}

Json message(const std::string& text) { return {{"text", text}}; }

Json locationOf(const std::string& file, std::uint64_t line, std::uint64_t character) {
  Json physical = {{"artifactLocation", {{"uri", uriOf(file)}}}};
  if (line != 0) {
    physical["region"] = {{"startLine", line}};
    if (character != 0) {
      physical["region"]["startColumn"] = character;
    }
  }
  return {{"physicalLocation", physical}};
}

class SarifRenderer {
 public:
  explicit SarifRenderer(const Rules& rules) {
    for (const migration::RuleInfo* const rule : rules) {
      m_indexes.emplace(rule->id, m_indexes.size());
      m_rules.push_back(ruleOf(*rule));
    }
  }

  void result(const ReportedFinding& reported, const std::string* reason) {
    const migration::Finding& finding = reported.finding;
    Json result = {{"ruleId", finding.rule},
                   {"level", levelOf(finding.severity)},
                   {"message", message(finding.text)}};
    if (const auto index = m_indexes.find(finding.rule); index != m_indexes.end()) {
      result["ruleIndex"] = index->second;
    }
    Json location = locationOf(finding.file, finding.line, reported.character);
    if (!finding.definition.empty()) {
      location["logicalLocations"] = {{{"name", finding.definition}}};
    }
    result["locations"] = Json::array({location});
    if (reason != nullptr) {
      result["suppressions"] = {{{"kind", "external"}, {"justification", *reason}}};
    }
    m_results.push_back(result);
  }

  void failure(const migration::Failure& failure) {
    m_notifications.push_back(
        {{"level", "error"},
         {"message", message(failure.text)},
         {"locations", Json::array({locationOf(failure.file, failure.line, failure.column)})}});
  }

  std::string document(int exitCode) const {
    const Json driver = {
        {"name", "schema-migrate"}, {"version", SCHEMA_MIGRATE_VERSION}, {"rules", m_rules}};
    const Json invocation = {{"executionSuccessful", m_notifications.empty()},
                             {"exitCode", exitCode},
                             {"toolExecutionNotifications", m_notifications}};
    const Json run = {{"tool", {{"driver", driver}}},
                      {"invocations", Json::array({invocation})},
                      {"columnKind", "unicodeCodePoints"},
                      {"results", m_results}};
    return textOf({{"$schema", kSchema}, {"version", "2.1.0"}, {"runs", Json::array({run})}});
  }

 private:
  static Json ruleOf(const migration::RuleInfo& rule) {
    return {{"id", rule.id},
            {"name", rule.name},
            {"shortDescription", message(rule.what)},
            {"fullDescription", message(std::string(rule.what) + " " + rule.why)},
            {"help", message(rule.mend)},
            {"defaultConfiguration", {{"level", levelOf(rule.severity)}}}};
  }

  std::map<std::string, std::size_t> m_indexes;
  Json m_rules = Json::array();
  Json m_results = Json::array();
  Json m_notifications = Json::array();
};

}  // namespace

std::string renderSarif(const CheckReport& report, const Rules& rules) {
  SarifRenderer renderer(rules);
  for (const ReportedFinding& reported : report.findings) {
    renderer.result(reported, nullptr);
  }
  for (const ReportedAcceptance& accepted : report.accepted) {
    renderer.result(accepted.found, &accepted.reason);
  }
  for (const migration::Failure& failure : report.failures) {
    renderer.failure(failure);
  }
  return renderer.document(report.exitCode);
}
