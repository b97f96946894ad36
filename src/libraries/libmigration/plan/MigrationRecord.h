// What a change ticket needs of a migration: everything that went into it, what it was asked to do,
// and what came of it, as the files of one directory.

#ifndef LIBSCHEMA_MIGRATION_MIGRATION_RECORD_H
#define LIBSCHEMA_MIGRATION_MIGRATION_RECORD_H

#include <cstdint>
#include <string>
#include <vector>

#include "MigrationPlan.h"

namespace migration {

// What a record is made of. Everything that it points to must stay in place for the call.
struct RecordRequest {
  const MigrationPlan* plan = nullptr;  // one that is ready
  std::vector<NamedText> outputs;       // as they are written
  std::string layout;                   // "keep" or "library"
  std::string out;                      // the directory that they are written to
  std::vector<std::string> command;     // the words of the command line, and
  std::string directory;                // where it was given
  std::string programVersion;
  std::int64_t time = 0;   // in seconds from the beginning of 1970
  std::string textReport;  // in text for people, and
  std::string htmlReport;  // as a page; none when it is empty
};

// A file of the record.
struct RecordFile {
  std::string folder;  // in the record: "old"; empty for the record itself
  std::string name;
  std::string bytes;
};

// plan.json, report.txt, report.html, origins.tsv, command.txt; copies of the inputs in the folders
// base, old and new, of lists and decisions in lists, of the output in output; and SHA256SUMS,
// against which `sha256sum -c` checks all of these. The same request gives the same bytes.
std::vector<RecordFile> recordOf(const RecordRequest& request);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_MIGRATION_RECORD_H
