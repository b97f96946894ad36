// One run of `check`: reads the inputs, and collects what there is to say in a report.

#ifndef SCHEMA_MIGRATE_CHECK_RUN_H
#define SCHEMA_MIGRATE_CHECK_RUN_H

#include <libschema-migration/Finding.h>
#include <libschema-migration/Installation.h>

#include <map>
#include <string>
#include <vector>

#include "CheckReport.h"

struct CheckOptions {
  std::vector<std::string> directories;
  std::vector<std::string> excludeLists;
  std::string withdrawList;  // empty when there is none
  std::string against;       // empty when there is none
  std::map<std::string, migration::Severity> severities;
  bool doWarningsFail = false;
  bool isWithExcerpts = false;
};

CheckReport checkDirectories(const CheckOptions& options);

// The one directory mended, and then checked: what is reported is what remains, under the names of
// the copy `name`, and the changes at their places in the original. *files is the whole copy, which
// nobody has written yet; it means nothing when the report has failures.
CheckReport checkRepaired(const CheckOptions& options, const std::string& name,
                          std::vector<migration::NamedText>* files);

#endif  // SCHEMA_MIGRATE_CHECK_RUN_H
