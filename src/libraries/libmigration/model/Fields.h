// All fields of a definition as it is kept, whatever its kind.

#ifndef LIBSCHEMA_MIGRATION_FIELDS_H
#define LIBSCHEMA_MIGRATION_FIELDS_H

#include <string>
#include <vector>

#include "Definitions.h"
#include "Kept.h"

namespace migration {

// A clause with its values.
struct Field {
  Clause clause;
  std::vector<std::string> values;  // none for a flag, such as SINGLE-VALUE
};

// The OID, then what the definition has of names, description and the rest, in the order in which
// libschema writes the clauses. What it has by default is there as well: USAGE, the kind of a class
// and ACCESS-CLASS; LENGTH 0, which is no length, is not.
std::vector<Field> fieldsOf(const KeptDefinition& definition);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_FIELDS_H
