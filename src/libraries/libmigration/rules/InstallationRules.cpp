// I: which files an installation has.

#include <algorithm>
#include <string>
#include <utility>
#include <vector>

#include "Check.h"
#include "Rule.h"
#include "TextIndex.h"

namespace migration {

namespace {

void add(const char* rule, const Installation& installation, const std::string& name,
         std::string text, Findings* findings) {
  findings->push_back(
      {rule, Severity::kWarning, installation.directory() + "/" + name, 0, 0, std::move(text), ""});
}

void checkOtherFile(const Installation& installation, const std::string& name, Findings* findings) {
  const auto meant = std::find_if(kSchemaFiles.begin(), kSchemaFiles.end(),
                                  [&](const char* file) { return equalsFolded(name, file); });
  if (meant != kSchemaFiles.end()) {
    add("I703", installation, name,
        "is not read, since its name differs from " + std::string(*meant) +
            " in letter case; rename it if it belongs to the schema",
        findings);
  } else if (name.compare(0, 3, "V3.") == 0) {
    add("I702", installation, name,
        "is not read, since no schema file has this name; rename it if it belongs to the schema, "
        "or move it to another directory",
        findings);
  }
}

}  // namespace

void checkInstallation(const CheckRequest& request, Findings* findings) {
  const Installation& installation = *request.installation;
  for (const char* const name : kSchemaFiles) {
    if (request.against != nullptr && request.against->hasFile(name) &&
        !installation.hasFile(name)) {
      add("I701", installation, name,
          "is missing, and " + request.against->directory() +
              " has it; look whether all files of the installation were copied",
          findings);
    }
  }
  for (const std::string& name : installation.otherFiles()) {
    checkOtherFile(installation, name, findings);
  }
}

const std::vector<RuleInfo>& installationRules() {
  static constexpr std::string_view kBadge =
      "attributetypes=( 1.3.6.1.4.1.99999.1 NAME 'badge' DESC 'badge' )\n";
  static constexpr std::string_view kClass =
      "objectclasses=( 1.3.6.1.4.1.99999.2 NAME 'visitor' AUXILIARY MAY ( badge ) )\n";
  static const std::vector<RuleInfo> kRules = {
      {"I701",
       "file-is-missing",
       Severity::kWarning,
       "The other installation has a file that this one does not have.",
       "A file that was forgotten when the installation was copied is a part of the schema that "
       "gets lost.",
       "Look whether all files were copied; a file that an installation really lacks is no mistake.",
       {{"V3.user.at", kBadge}, {"against/V3.user.at", kBadge}, {"against/V3.user.oc", kClass}},
       {{"V3.user.at", kBadge}, {"V3.user.oc", kClass}, {"against/V3.user.at", kBadge}}},
      {"I702",
       "file-is-unknown",
       Severity::kWarning,
       "The name of a file begins with V3. and is none of the nine.",
       "The library does not read it, whatever it holds.",
       "Rename it if it belongs to the schema, or move it to another directory.",
       {{"V3.user.at", kBadge}, {"V3.user.at.bak", kBadge}},
       {{"V3.user.at", kBadge}, {"V4.user.at", kBadge}}},
      {"I703",
       "file-name-in-another-letter-case",
       Severity::kWarning,
       "The name of a file differs from that of a schema file in letter case only.",
       "The library does not read it.",
       "Rename it.",
       {{"V3.user.at", kBadge}, {"V3.User.oc", kClass}},
       {{"V3.user.at", kBadge}, {"V3.user.oc", kClass}}},
  };
  return kRules;
}

}  // namespace migration
