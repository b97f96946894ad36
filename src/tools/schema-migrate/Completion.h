// What a shell needs to complete the command line, as a script of that shell.

#ifndef SCHEMA_MIGRATE_COMPLETION_H
#define SCHEMA_MIGRATE_COMPLETION_H

#include <string>

#include "CommandModel.h"

// Each makes a script that needs nothing else of this program: the rules are those of
// libschema-migration.
std::string bashCompletion(const ProgramModel& model);
std::string zshCompletion(const ProgramModel& model);
std::string fishCompletion(const ProgramModel& model);

#endif  // SCHEMA_MIGRATE_COMPLETION_H
