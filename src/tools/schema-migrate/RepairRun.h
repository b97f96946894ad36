// One run of `check --repair`.

#ifndef SCHEMA_MIGRATE_REPAIR_RUN_H
#define SCHEMA_MIGRATE_REPAIR_RUN_H

#include <string>

#include "CheckReport.h"
#include "CheckRun.h"
#include "Console.h"

struct RepairOptions {
  std::string out;  // the directory to create
  bool allowForeignParent = false;
};

// Puts a mended copy of the one directory in place, whole, and returns what changed and what is
// left. When an input cannot be read, or the library would never come to the end of the copy,
// nothing is written, and the report has failures. Throws a Failure when the copy cannot be
// written.
CheckReport repairDirectory(const CheckOptions& options, const RepairOptions& repairOptions,
                            Console* console);

#endif  // SCHEMA_MIGRATE_REPAIR_RUN_H
