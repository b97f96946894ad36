#include "CheckRun.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <memory>
#include <optional>
#include <utility>

#include "Settings.h"

namespace support {

using migration::CheckRequest;
using migration::ExampleFile;
using migration::Failures;
using migration::Finding;
using migration::Findings;
using migration::Installation;
using migration::NamedText;
using migration::ReadLimits;
using migration::Settings;
using migration::Severity;
using migration::Source;

namespace {

constexpr std::string_view kAgainst = "against/";

bool beginsWith(std::string_view text, std::string_view beginning) {
  return text.substr(0, beginning.size()) == beginning;
}

}  // namespace

Installation installationOf(const Files& files, std::string_view prefix,
                            const std::string& directory) {
  std::vector<NamedText> texts;
  for (const ExampleFile& file : files) {
    const std::string_view name = file.name;
    if (beginsWith(name, prefix) && name.find('/', prefix.size()) == name.npos) {
      texts.push_back({std::string(name.substr(prefix.size())), std::string(file.bytes)});
    }
  }
  Failures failures;
  Installation installation =
      Installation::fromTexts(directory, std::move(texts), ReadLimits(), &failures);
  EXPECT_TRUE(failures.empty());
  return installation;
}

Findings findingsOf(const Files& files) {
  const Installation installation = installationOf(files, "", "old");
  std::optional<Installation> against;
  CheckRequest request;
  request.installation = &installation;
  std::vector<std::unique_ptr<Source>> lists;
  std::unique_ptr<Source> settingsFile;
  for (const ExampleFile& file : files) {
    const std::string_view name = file.name;
    if (beginsWith(name, kAgainst) && !against.has_value()) {
      against = installationOf(files, kAgainst, "new");
      request.against = &*against;
    } else if (beginsWith(name, "exclude")) {
      lists.push_back(std::make_unique<Source>(file.name, std::string(file.bytes)));
      request.excludeLists.push_back(lists.back().get());
    } else if (name == "withdraw.txt") {
      lists.push_back(std::make_unique<Source>(file.name, std::string(file.bytes)));
      request.withdrawList = lists.back().get();
    } else if (name == ".schema-migrate.toml") {
      settingsFile = std::make_unique<Source>(file.name, std::string(file.bytes));
    }
  }
  Failures failures;
  const Settings settings =
      settingsFile == nullptr ? Settings() : readSettings(*settingsFile, &failures);
  EXPECT_TRUE(failures.empty());
  return checkWithSettings(request, settings, true).findings;
}

std::string linesOf(const Findings& findings, std::string_view families) {
  std::string lines;
  for (const Finding& finding : findings) {
    if (families.find(finding.rule.front()) == families.npos) {
      continue;
    }
    const std::string file =
        beginsWith(finding.file, "old/") ? finding.file.substr(4) : finding.file;
    lines += finding.rule + (finding.severity == Severity::kError ? " error " : " warning ") +
             file + ":" + std::to_string(finding.line) + ":" + std::to_string(finding.column) +
             "\n";
  }
  return lines;
}

}  // namespace support
