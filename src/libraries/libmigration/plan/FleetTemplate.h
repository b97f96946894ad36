// A decisions file to be filled in for many installations.

#ifndef LIBSCHEMA_MIGRATION_FLEET_TEMPLATE_H
#define LIBSCHEMA_MIGRATION_FLEET_TEMPLATE_H

#include <string>

#include "Fleet.h"

namespace migration {

// A [[definition]] for each question of the fleet, what settles most first: where it is asked, the
// clauses that differ, and the choices that there are at each of these installations in comments,
// with the fingerprint, and nothing chosen. With --allow-unused the file holds for all of them. An
// entry in which nothing is chosen is an error when the file is read, so that none is forgotten.
std::string decisionsTemplate(const Fleet& fleet);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_FLEET_TEMPLATE_H
