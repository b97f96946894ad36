// The JSON document of a plan.

#include <libschema-migration/PlanDocument.h>

#include "PlanReport.h"

std::string renderPlanJson(const migration::MigrationPlan& plan, const ShownDifferences& shown,
                           const std::string& command) {
  return migration::planDocument(plan, shown, {command, SCHEMA_MIGRATE_VERSION});
}
