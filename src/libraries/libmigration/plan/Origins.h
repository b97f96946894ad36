// Where each definition of an output came from.

#ifndef LIBSCHEMA_MIGRATION_ORIGINS_H
#define LIBSCHEMA_MIGRATION_ORIGINS_H

#include <cstdint>
#include <string>
#include <vector>

#include "MigrationPlan.h"

namespace migration {

// Where a text stood.
struct SourcePlace {
  std::string side;  // "base", "old", "new"
  std::string path;
  std::uint64_t line = 0;
};

// A definition as it stands in the output.
struct Origin {
  std::string file;  // "V3.user.at"
  std::uint64_t line = 0;
  Kind kind = Kind::kAttributeType;
  std::string oid;
  std::string name;  // the first one; empty without
  Outcome outcome = Outcome::kSame;
  // Whose text it is: one place, or those of all that were merged; none where a decision gives the
  // text.
  std::vector<SourcePlace> sources;
  std::string decision;  // "FILE:LINE"; mostly empty
};

// Every definition of the files that a migration by this plan writes, in their order.
std::vector<Origin> originsOf(const MigrationPlan& plan, const std::vector<NamedText>& outputs);

// A table with a line for each, its columns separated by tabs, below a line that names them.
std::string tableOf(const std::vector<Origin>& origins);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_ORIGINS_H
