// What `diff`, `plan` and `migrate` tell of a plan: in text for people, and as one JSON document.
// Both show the same definitions.

#ifndef SCHEMA_MIGRATE_PLAN_REPORT_H
#define SCHEMA_MIGRATE_PLAN_REPORT_H

#include <libschema-migration/MigrationPlan.h>

#include <cstddef>
#include <string>
#include <vector>

// Which differences are shown. An empty list leaves nothing out.
struct DifferenceFilter {
  std::vector<std::string> names;    // names or OIDs of definitions, in any letter case
  std::vector<std::string> kinds;    // "object-class"
  std::vector<std::string> changes;  // "changed-by-both-in-conflict"
  std::vector<std::string> risks;    // "data"
  std::vector<std::string> ignored;  // clauses that do not count: "desc", "order", "case"
  bool isWithSame = false;           // also what is the same
};

using ShownDifferences = std::vector<const migration::Verdict*>;
ShownDifferences shownOf(const migration::MigrationPlan& plan, const DifferenceFilter& filter);

// Of the names asked for, those that nothing in BASE, OLD or NEW has: a line each, with what may
// have been meant.
std::string renderUnknownNames(const migration::MigrationPlan& plan,
                               const std::vector<std::string>& names);

struct PlanStyle {
  bool isColoured = false;
  bool isSummaryOnly = false;
};

// A paragraph for each difference and a count of each class and outcome.
std::string renderDifferences(const migration::MigrationPlan& plan, const ShownDifferences& shown,
                              const PlanStyle& style);

// What was mended in private copies of the inputs, and what the rules of check say of them, a line
// each; empty when there is nothing. Where a rule warns of many places in a directory, only the
// first are told and the others counted, unless all are wanted.
enum class Told { kFirst, kAll };
std::string renderFindings(const migration::MigrationPlan& plan, Told told);

// A line for each definition that counts for nothing, and for each file that is not read, for
// standard error.
std::string warningsOf(const migration::MigrationPlan& plan);

// A line for each, for standard error.
std::string linesOf(const migration::Failures& failures);

// A line for whatever refuses the plan and for each definition that is undecided, for standard
// error.
std::string whyNotReady(const migration::MigrationPlan& plan);

// Whether it is ready, in a line.
std::string renderReadiness(const migration::MigrationPlan& plan, const PlanStyle& style);

// The document of `command` ("diff", "plan", "migrate"), as docs/json/plan.schema.json says.
std::string renderPlanJson(const migration::MigrationPlan& plan, const ShownDifferences& shown,
                           const std::string& command);

#endif  // SCHEMA_MIGRATE_PLAN_REPORT_H
