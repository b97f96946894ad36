// Which definition of the old release as shipped, of the installation and of the new release are
// one and the same.

#ifndef LIBSCHEMA_MIGRATION_MATCHING_H
#define LIBSCHEMA_MIGRATION_MATCHING_H

#include <cstddef>
#include <vector>

#include "Side.h"

namespace migration {

// The number of no row.
constexpr std::size_t kNoRow = static_cast<std::size_t>(-1);

// One definition, as far as the three have it; null where one does not.
struct MatchRow {
  Kind kind = Kind::kAttributeType;
  const Entry* base = nullptr;
  const Entry* old = nullptr;
  const Entry* latest = nullptr;
  std::size_t attribute = kNoRow;  // of a vendor extension: the row of its attribute type
};

// BASE with OLD, BASE with NEW, OLD with NEW, in that order: by OID first; a first name, in any
// letter case, matches only what no OID matched; what is left over is matched by nothing. Vendor
// extensions match as their attribute types do, and by OID where those are not there. `base` may be
// null. The rows of NEW stand in its order, behind them what only the others have, in theirs;
// attribute types, object classes, vendor extensions.
std::vector<MatchRow> matchDefinitions(const Side* base, const Side& old, const Side& latest);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_MATCHING_H
