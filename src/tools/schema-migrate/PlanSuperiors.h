// The superiors around what a plan changes: what is shown as a tree beside the differences.

#ifndef SCHEMA_MIGRATE_PLAN_SUPERIORS_H
#define SCHEMA_MIGRATE_PLAN_SUPERIORS_H

#include <libschema-migration/MigrationPlan.h>

#include <string>
#include <vector>

#include "PlanReport.h"

struct SuperiorNode {
  const migration::Verdict* row;
  const migration::Values* superiors;  // as written, by name or OID; the plan owns them
};

// What is shown and not the same everywhere, whatever that descends from, and what descends from
// it directly; in the plan's order. SUP is the result's, or what it was in NEW, OLD or BASE where
// the result does not have the definition.
std::vector<SuperiorNode> superiorsAround(const migration::MigrationPlan& plan,
                                          const ShownDifferences& shown);

#endif  // SCHEMA_MIGRATE_PLAN_SUPERIORS_H
