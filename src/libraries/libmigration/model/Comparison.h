// Two installations side by side, neither of them changed. Everything refers to the installations,
// and goes with them.

#ifndef LIBSCHEMA_MIGRATION_COMPARISON_H
#define LIBSCHEMA_MIGRATION_COMPARISON_H

#include <cstdint>
#include <vector>

#include "Installation.h"

namespace migration {

// The library's equality, asked from both sides. Definitions of two kinds are never equal.
bool areEqual(const KeptDefinition& left, const KeptDefinition& right);

// What comes of a comparison.
enum class Comparison : std::uint8_t { kEqual, kDifferent, kOnlyLeft, kOnlyRight };

// A definition and its partner.
struct Compared {
  Kind kind;
  Comparison result;
  const Entry* left;   // null for kOnlyRight
  const Entry* right;  // null for kOnlyLeft
};

// Every definition that counts in `left` with its partner in `right`, in the order of `left`, then
// those of `right` without one. Of several under one OID the first counts; partners are of one kind
// and have the same OID or, where no OID finds one, the same first name in any letter case.
std::vector<Compared> compare(const Installation& left, const Installation& right);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_COMPARISON_H
