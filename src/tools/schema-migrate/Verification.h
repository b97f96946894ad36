// Reads what was written and compares it with what has to be there.

#ifndef SCHEMA_MIGRATE_VERIFICATION_H
#define SCHEMA_MIGRATE_VERIFICATION_H

#include <string>

#include "Directory.h"
#include "Inventory.h"
#include "Plan.h"

// What the library wrote, in the private place. Throws a Failure unless each of the seven files
// holds exactly the header and the line of every definition in the plan, in order, which when read
// again by the library are the same definitions again. `path` is the directory's for the library.
void verifyWritten(const Directory& written, const std::string& path, const Plan& plan);

// What is to be published. Throws a Failure unless `output` holds what is in `written`, and NEW's
// two config files, byte for byte.
void verifyOutput(const Directory& output, const Directory& written, const Plan& plan,
                  const Inventory& newOne);

#endif  // SCHEMA_MIGRATE_VERIFICATION_H
