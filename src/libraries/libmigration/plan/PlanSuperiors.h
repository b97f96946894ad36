// The superiors around what a plan changes: what is shown as a tree beside the differences.

#ifndef LIBSCHEMA_MIGRATION_PLAN_SUPERIORS_H
#define LIBSCHEMA_MIGRATION_PLAN_SUPERIORS_H

#include <vector>

#include "MigrationPlan.h"

namespace migration {

struct SuperiorNode {
  const Verdict* row;
  const Values* superiors;  // as written, by name or OID; the plan owns them
};

// What is shown and not the same everywhere, whatever that descends from, and what descends from
// it directly; in the plan's order. SUP is the result's, or what it was in NEW, OLD or BASE where
// the result does not have the definition.
std::vector<SuperiorNode> superiorsAround(const MigrationPlan& plan,
                                          const std::vector<const Verdict*>& shown);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_PLAN_SUPERIORS_H
