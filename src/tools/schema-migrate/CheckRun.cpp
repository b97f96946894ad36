#include "CheckRun.h"

#include <libschema-migration/Check.h>
#include <libschema-migration/InputFiles.h>
#include <libschema-migration/Installation.h>
#include <libschema-migration/Repair.h>
#include <libschema-migration/Settings.h>

#include <cstdint>
#include <filesystem>
#include <memory>
#include <optional>
#include <set>
#include <system_error>
#include <tuple>
#include <utility>

#include "Messages.h"

namespace {

using migration::Finding;
using migration::Installation;
using migration::Severity;
using migration::Source;

// One run: reads the inputs, and collects what there is to say in a report.
class CheckRun {
 public:
  explicit CheckRun(const CheckOptions& options) : m_options(options) {}

  CheckReport report() && {
    readOthers();
    for (const std::string& directory : m_options.directories) {
      checkDirectory(directory);
    }
    m_report.exitCode = exitCode();
    return std::move(m_report);
  }

  CheckReport reportOfRepaired(const std::string& name,
                               std::vector<migration::NamedText>* files) && {
    readOthers();
    const std::string& directory = m_options.directories.front();
    const migration::Settings settings = readSettings(directory);
    const Installation original =
        Installation::fromDirectory(directory, migration::ReadLimits(), &m_report.failures);
    *files = repaired(original);
    const Installation copy =
        Installation::fromTexts(name, *files, migration::ReadLimits(), &m_report.failures);
    noteEndless(copy);
    check(copy, settings, m_report.failures.empty());
    m_report.exitCode = exitCode();
    return std::move(m_report);
  }

 private:
  void readOthers() {
    m_report.directories = m_options.directories;
    readLists();
    if (!m_options.against.empty()) {
      m_against = readInstallation(m_options.against);
    }
  }

  std::vector<migration::NamedText> repaired(const Installation& original) {
    std::vector<migration::NamedText> files;
    for (const migration::SchemaFile& file : original.files()) {
      migration::Repair repair = migration::repair(*file.written);
      for (migration::RepairedPlace& place : repair.changes) {
        Finding change;
        change.rule = std::move(place.rule);
        change.severity = Severity::kWarning;
        change.file = file.source->path();
        change.line = place.place.line;
        change.column = place.place.column;
        change.text = std::move(place.text);
        m_report.changes.push_back(std::move(change));
      }
      files.push_back({file.name, std::move(repair.bytes)});
    }
    return files;
  }

  std::unique_ptr<Source> readFile(const std::string& path) {
    return migration::readSource(path, migration::ReadLimits(), &m_report.failures);
  }

  void readLists() {
    for (const std::string& path : m_options.excludeLists) {
      if (auto list = readFile(path); list != nullptr) {
        m_excludeLists.push_back(std::move(list));
      }
    }
    if (!m_options.withdrawList.empty()) {
      m_withdrawList = readFile(m_options.withdrawList);
    }
  }

  Installation readInstallation(const std::string& directory) {
    Installation installation =
        Installation::fromDirectory(directory, migration::ReadLimits(), &m_report.failures);
    noteEndless(installation);
    return installation;
  }

  void noteEndless(const Installation& installation) {
    for (const migration::SchemaFile& file : installation.files()) {
      if (file.kept->ending() == migration::ReadingEnd::kNeverEnds) {
        const migration::Place place = file.source->placeOf(file.kept->endOffset());
        m_report.failures.push_back(
            {file.source->path(), place.line, place.column, "",
             "the library would never come to the end of this file; what is wrong is among the findings"});
      }
    }
  }

  migration::Settings readSettings(const std::string& directory) {
    const std::string path = directory + "/" + migration::kSettingsFile;
    std::error_code error;
    if (std::filesystem::symlink_status(path, error).type() ==
        std::filesystem::file_type::not_found) {
      return {};
    }
    const std::unique_ptr<Source> source = readFile(path);
    return source == nullptr ? migration::Settings()
                             : migration::readSettings(*source, &m_report.failures);
  }

  void checkDirectory(const std::string& directory) {
    const std::size_t failuresBefore = m_report.failures.size();
    const migration::Settings settings = readSettings(directory);
    const Installation installation = readInstallation(directory);
    check(installation, settings, m_report.failures.size() == failuresBefore);
  }

  void check(const Installation& installation, const migration::Settings& settings,
             bool isComplete) {
    migration::CheckRequest request;
    request.installation = &installation;
    request.against = m_against ? &*m_against : nullptr;
    for (const auto& list : m_excludeLists) {
      request.excludeLists.push_back(list.get());
    }
    request.withdrawList = m_withdrawList.get();
    request.severities = m_options.severities;
    tell(installation, migration::checkWithSettings(std::move(request), settings, isComplete));
  }

  void tell(const Installation& installation, migration::JudgedFindings judged) {
    std::map<std::string, Places> places;
    const auto add = [&](const Source& source) {
      places.try_emplace(source.path(), source, m_options.isWithExcerpts);
    };
    for (const migration::SchemaFile& file : installation.files()) {
      add(*file.source);
    }
    for (const auto& list : m_excludeLists) {
      add(*list);
    }
    if (m_withdrawList != nullptr) {
      add(*m_withdrawList);
    }
    const auto reported = [&](Finding finding) {
      const auto place = places.find(finding.file);
      if (place != places.end()) {
        return place->second.reported(std::move(finding));
      }
      ReportedFinding elsewhere;
      elsewhere.character = finding.column;
      elsewhere.finding = std::move(finding);
      return elsewhere;
    };
    for (Finding& finding : judged.findings) {
      if (isNew(finding)) {
        m_report.findings.push_back(reported(std::move(finding)));
      }
    }
    for (migration::AcceptedFinding& accepted : judged.accepted) {
      m_report.accepted.push_back(
          {reported(std::move(accepted.finding)), std::move(accepted.reason)});
    }
  }

  // What is said of a list is said of it for each directory.
  bool isNew(const Finding& finding) {
    if (m_options.directories.size() == 1 || finding.rule.front() != 'O') {
      return true;
    }
    return m_told.emplace(finding.rule, finding.file, finding.line, finding.column, finding.text)
        .second;
  }

  int exitCode() const {
    if (!m_report.failures.empty()) {
      return kBadInput;
    }
    const std::size_t errors = m_report.count(Severity::kError);
    return errors != 0 || (m_options.doWarningsFail && !m_report.findings.empty()) ? kFindings
                                                                                   : kDone;
  }

  const CheckOptions& m_options;
  CheckReport m_report;
  std::vector<std::unique_ptr<Source>> m_excludeLists;
  std::unique_ptr<Source> m_withdrawList;
  std::optional<Installation> m_against;
  std::set<std::tuple<std::string, std::string, std::uint64_t, std::uint64_t, std::string>> m_told;
};

}  // namespace

CheckReport checkDirectories(const CheckOptions& options) { return CheckRun(options).report(); }

CheckReport checkRepaired(const CheckOptions& options, const std::string& name,
                          std::vector<migration::NamedText>* files) {
  return CheckRun(options).reportOfRepaired(name, files);
}
