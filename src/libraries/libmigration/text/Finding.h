// What is said about a place in a file: by a rule, or because the file cannot be had.

#ifndef LIBSCHEMA_MIGRATION_FINDING_H
#define LIBSCHEMA_MIGRATION_FINDING_H

#include <cstdint>
#include <string>
#include <vector>

namespace migration {

// How bad a finding is; one of kOff is not told.
enum class Severity : std::uint8_t { kOff, kWarning, kError };

// What a rule has found.
struct Finding {
  std::string rule;  // "D208"
  Severity severity = Severity::kError;
  std::string file;          // the path as messages show it
  std::uint64_t line = 0;    // from 1; 0 for a file, or a directory, as a whole
  std::uint64_t column = 0;  // from 1, in bytes; 0 with line 0
  std::string text;          // one sentence: what, why it matters, what to do
  std::string definition;    // "attribute type cn (2.5.4.3)"; empty outside definitions
};

// In the order that who finds them says.
using Findings = std::vector<Finding>;

// Something that could not be done. Line and column are 0 where they mean nothing, and the rule is
// empty where none is behind it.
struct Failure {
  std::string file;
  std::uint64_t line = 0;
  std::uint64_t column = 0;
  std::string rule;
  std::string text;
};

// In the order in which they happened.
using Failures = std::vector<Failure>;

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_FINDING_H
