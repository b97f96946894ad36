// One definition merged clause by clause from the old release as shipped (base), the installation
// (old) and the new release (new), and how risky each change is.

#ifndef LIBSCHEMA_MIGRATION_MERGE_H
#define LIBSCHEMA_MIGRATION_MERGE_H

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "Content.h"

namespace migration {

// What a change can do: to the entries that a directory holds already, to what entries and
// definitions may be, or only to what people read.
enum class Risk : std::uint8_t { kNone, kCosmetic, kStructure, kData };

// "none", "cosmetic", "structure", "data".
std::string_view wordOf(Risk risk);

// Whose side is taken where a clause was changed in two ways.
enum class Prefer : std::uint8_t { kNothing, kOld, kNew };

// A clause that is not the same everywhere. What a side does not have is empty, and so is the
// result while nobody has decided.
struct ClauseChange {
  Aspect aspect = Aspect::kOid;
  Values base;
  Values old;
  Values latest;  // the new release's
  Values result;
  Risk risk = Risk::kNone;
  bool isInConflict = false;  // changed in two ways; decided by nobody when `isDecided` is false
  bool isDecided = true;
  std::string note;  // something to tell about it; mostly empty
};

struct Merge {
  Content result;  // of an undecided clause the new release's value
  std::vector<ClauseChange> changes;
  bool hasConflict = false;  // one that is not decided
  Risk risk = Risk::kNone;
};

// Merges with a base. Lists of names and attribute types merge member by member, a DESC that was
// changed in two ways is OLD's unless NEW's is preferred; any other clause that was changed in two
// ways is in conflict unless a side is preferred.
Merge mergeWithBase(const Content& base, const Content& old, const Content& latest, Prefer prefer);

// Merges what nobody knows the origin of: every clause that differs, lists too, is in conflict.
Merge mergeWithoutBase(const Content& old, const Content& latest, Prefer prefer);

// A name that became the first one is no alias any more, and an attribute type that has to be there
// is not one that may; the clause that loses a member is told. `base` may be null.
void dropRepeated(const Content* base, const Content& old, const Content& latest, Merge* merge);

// Whether the clause is a list, of which there is a union. An attribute type has one superior.
bool isList(Kind kind, Aspect aspect);

// NEW's members in their order and what OLD has beside them, in OLD's order, at the end.
Values unionOf(const Values& old, const Values& latest);

// How risky it is that a clause goes from one value to another.
Risk riskOf(Aspect aspect, const Values& from, const Values& to);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_MERGE_H
