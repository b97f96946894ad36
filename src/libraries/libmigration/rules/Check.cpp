#include "Check.h"

#include <algorithm>
#include <cstddef>
#include <tuple>
#include <utility>

namespace migration {

namespace {

// The files of the installation as they are read, whether they are there or not, then the lists.
class FileOrder {
 public:
  explicit FileOrder(const CheckRequest& request)
      : m_request(request), m_prefix(request.installation->directory() + "/") {}

  std::size_t of(const std::string& path) const {
    if (path.compare(0, m_prefix.size(), m_prefix) == 0) {
      const std::size_t number = schemaFileNumber(std::string_view(path).substr(m_prefix.size()));
      if (number != kSchemaFiles.size()) {
        return number;
      }
    }
    const auto list = std::find_if(m_request.excludeLists.begin(), m_request.excludeLists.end(),
                                   [&](const Source* each) { return each->path() == path; });
    const auto number = static_cast<std::size_t>(list - m_request.excludeLists.begin());
    const bool isOther =
        list == m_request.excludeLists.end() &&
        (m_request.withdrawList == nullptr || m_request.withdrawList->path() != path);
    return kSchemaFiles.size() + (isOther ? 0 : 1 + number);
  }

 private:
  const CheckRequest& m_request;
  std::string m_prefix;
};

void setSeverities(const std::map<std::string, Severity>& severities, Findings* findings) {
  for (Finding& finding : *findings) {
    const auto given = severities.find(finding.rule);
    if (given != severities.end()) {
      finding.severity = given->second;
    }
  }
  findings->erase(
      std::remove_if(findings->begin(), findings->end(),
                     [](const Finding& finding) { return finding.severity == Severity::kOff; }),
      findings->end());
}

void sortFindings(const CheckRequest& request, Findings* findings) {
  const FileOrder order(request);
  std::vector<std::pair<std::size_t, Finding>> ordered;
  ordered.reserve(findings->size());
  for (Finding& finding : *findings) {
    const std::size_t file = order.of(finding.file);
    ordered.emplace_back(file, std::move(finding));
  }
  std::stable_sort(ordered.begin(), ordered.end(), [](const auto& left, const auto& right) {
    const auto keyOf = [](const auto& each) {
      return std::tie(each.first, each.second.file, each.second.line, each.second.column,
                      each.second.rule, each.second.text);
    };
    return keyOf(left) < keyOf(right);
  });
  for (std::size_t i = 0; i < ordered.size(); ++i) {
    (*findings)[i] = std::move(ordered[i].second);
  }
}

}  // namespace

Findings check(const CheckRequest& request) {
  Findings findings;
  for (const SchemaFile& file : request.installation->files()) {
    checkText(file, &findings);
  }
  checkTables(request, &findings);
  checkReferences(request, &findings);
  checkLists(request, &findings);
  checkExtensions(request, &findings);
  checkInstallation(request, &findings);
  setSeverities(request.severities, &findings);
  sortFindings(request, &findings);
  return findings;
}

}  // namespace migration
