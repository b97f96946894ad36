// What a run of `check` has to say: a value, from which every format is rendered.

#ifndef SCHEMA_MIGRATE_CHECK_REPORT_H
#define SCHEMA_MIGRATE_CHECK_REPORT_H

#include <libschema-migration/Finding.h>
#include <libschema-migration/Rule.h>
#include <libschema-migration/Settings.h>
#include <libschema-migration/Source.h>

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

struct ReportedFinding {
  migration::Finding finding;
  std::uint64_t character = 0;  // the column counted in characters of UTF-8; 0 with column 0
  // The line that it stands in, or the part of a long one around the place, when it was asked for;
  // and where in it the place is.
  std::string excerpt;
  std::size_t caret = 0;
};

// A finding that the settings accept.
struct ReportedAcceptance {
  ReportedFinding found;
  std::string reason;
};

struct CheckReport {
  std::vector<std::string> directories;
  std::vector<ReportedFinding> findings;
  std::vector<ReportedAcceptance> accepted;
  migration::Failures failures;  // what could not be checked
  migration::Findings changes;   // what a repair did, at its places in the original
  int exitCode = 0;

  std::size_t count(migration::Severity severity) const;
};

// Works out what a report tells of the places in one source. Of findings that come in the order of
// their places, it reads each line once.
class Places {
 public:
  Places(const migration::Source& source, bool isWithExcerpts)
      : m_source(source), m_isWithExcerpts(isWithExcerpts) {}

  ReportedFinding reported(migration::Finding finding);

 private:
  const migration::Source& m_source;
  bool m_isWithExcerpts;
  // The place that was asked for last.
  std::uint64_t m_line = 0;
  std::size_t m_offset = 0;  // in the line
  std::uint64_t m_character = 1;
};

// Every rule, for a format that tells what they are.
using Rules = std::vector<const migration::RuleInfo*>;

#endif  // SCHEMA_MIGRATE_CHECK_REPORT_H
