// A decisions file to be filled in.

#ifndef LIBSCHEMA_MIGRATION_DECISIONS_TEMPLATE_H
#define LIBSCHEMA_MIGRATION_DECISIONS_TEMPLATE_H

#include <string>

#include "MigrationPlan.h"

namespace migration {

// A [[definition]] for each definition that is undecided: its texts in BASE, OLD and NEW, what
// depends on it and the possible choices in comments, with its fingerprint, and nothing chosen. An
// entry in which nothing is chosen is an error when the file is read, so that none is forgotten.
std::string decisionsTemplate(const MigrationPlan& plan);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_DECISIONS_TEMPLATE_H
