// Reads what was written and compares it with what has to be there.

#ifndef SCHEMA_MIGRATE_VERIFICATION_H
#define SCHEMA_MIGRATE_VERIFICATION_H

#include <string>

#include "Inventory.h"
#include "Plan.h"

// Throws a Failure unless the directory holds exactly this: in each of the seven files the header
// and the line of every definition in the plan, byte for byte and in order, which when read again
// by the library are the same definitions again; and NEW's two config files, byte for byte.
void verifyOutput(const std::string& directory, const Plan& plan, const Inventory& newOne);

#endif  // SCHEMA_MIGRATE_VERIFICATION_H
