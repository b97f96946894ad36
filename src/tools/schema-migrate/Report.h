// What a run prints on standard output.

#ifndef SCHEMA_MIGRATE_REPORT_H
#define SCHEMA_MIGRATE_REPORT_H

#include <string>

#include "Inventory.h"
#include "Plan.h"

// The table of files and what became of OLD's definitions.
std::string summaryOf(const Inventory& oldOne, const Inventory& newOne, Plan* plan);

#endif  // SCHEMA_MIGRATE_REPORT_H
