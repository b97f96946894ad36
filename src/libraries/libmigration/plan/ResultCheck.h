// What the result of a plan breaks that neither OLD nor NEW had. Internal: not installed.

#ifndef LIBSCHEMA_MIGRATION_RESULT_CHECK_H
#define LIBSCHEMA_MIGRATION_RESULT_CHECK_H

#include <map>
#include <string>

#include "Finding.h"
#include "MigrationPlan.h"

namespace migration {

// By which a finding of an input and one of the result are the same.
std::string keyOf(const Finding& finding);

// Findings of error severity, each with what caused it: an outcome, a line of a list, a decision.
Findings newInResult(const MigrationPlan& plan);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_RESULT_CHECK_H
