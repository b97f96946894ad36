// What an installation's own settings file says about its findings: the severity that a rule has
// there, the access classes that are known, and the findings that are accepted, each with a reason.
//
//   access-classes = ["normal", "sensitive", "critical"]
//
//   [rules]
//   D205 = "off"            # or "warning", "error"
//
//   [[accepted]]
//   rule = "L105"
//   file = "V3.user.at"     # the last part of the path that the finding shows
//   line = 12               # or: definition = "cn", by a name, the OID or as the finding shows it
//   reason = "the note is for us"
//
// An entry with neither line nor definition accepts what is said of the file as a whole.

#ifndef LIBSCHEMA_MIGRATION_SETTINGS_H
#define LIBSCHEMA_MIGRATION_SETTINGS_H

#include <cstdint>
#include <functional>
#include <map>
#include <string>
#include <string_view>
#include <vector>

#include "Check.h"
#include "Finding.h"
#include "Source.h"

namespace migration {

// The name of the file, beside the schema files of the installation.
constexpr char kSettingsFile[] = ".schema-migrate.toml";

// An entry that accepts findings.
struct Acceptance {
  std::string rule;
  std::string file;
  std::uint64_t line = 0;  // 0 without one
  std::string definition;  // empty without one
  std::string reason;
  Place place;  // of the entry in the settings file
};

struct Settings {
  std::string path;                            // of the file; empty without one
  std::map<std::string, Severity> severities;  // by rule
  std::vector<std::string> accessClasses;
  std::vector<Acceptance> accepted;
};

// Reads a settings file. What is malformed in it is a failure with its line and column, and is
// otherwise passed over.
Settings readSettings(const Source& source, Failures* failures);

// "off", "warning" and "error" (true, with *severity); any other word is none.
bool severityOf(std::string_view word, Severity* severity);
// The word of a severity.
std::string_view wordOf(Severity severity);

// A finding that is accepted, and why.
struct AcceptedFinding {
  Finding finding;
  std::string reason;
};

// What the settings leave of findings.
struct JudgedFindings {
  Findings findings;  // those that remain, in their order
  std::vector<AcceptedFinding> accepted;
};

// Sorts out what the settings accept. An entry that no finding fits is a finding itself, S801, at
// the end of the others; but not when `couldOccur` says that this run cannot tell.
JudgedFindings judge(const Settings& settings, Findings findings,
                     const std::function<bool(const Acceptance&)>& couldOccur);

// check(), with the severities, access classes and accepted findings of the settings. Severities
// and access classes of the request go before those of the settings. `isComplete` says that every
// file of the installation could be read.
JudgedFindings checkWithSettings(CheckRequest request, const Settings& settings, bool isComplete);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_SETTINGS_H
