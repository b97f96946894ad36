// One run of `show`: looks up what is asked for in an installation.

#ifndef SCHEMA_MIGRATE_SHOW_RUN_H
#define SCHEMA_MIGRATE_SHOW_RUN_H

#include <libschema-migration/DefinitionView.h>

#include <optional>
#include <string>
#include <vector>

#include "ShowReport.h"

struct ShowOptions {
  std::string directory;
  std::vector<std::string> names;  // empty: everything
  std::optional<migration::Kind> kind;
  std::string file;     // only definitions of this file; empty: of all
  std::string pattern;  // in a listing: for a name or the OID; empty: all
  migration::Reading reading = migration::Reading::kKept;
  bool isWithInherited = false;
  bool isWithReferrers = false;
  bool isTree = false;
};

ShowReport show(const ShowOptions& options);

#endif  // SCHEMA_MIGRATE_SHOW_RUN_H
