// What a fleet needs of one saved plan. Internal: not installed.

#ifndef LIBSCHEMA_MIGRATION_FLEET_PLAN_H
#define LIBSCHEMA_MIGRATION_FLEET_PLAN_H

#include <cstddef>
#include <string>
#include <vector>

#include "Finding.h"
#include "Fleet.h"
#include "Source.h"

namespace migration {

// A definition of a plan. Of one that the site did not touch in any case, no texts are kept.
struct FleetPlanRow {
  std::string kind;
  std::string oid;  // OLD's, when it has it
  std::string name;
  std::string commonOid;  // by which all installations of a release know it
  std::string commonName;
  char side = ' ';  // whose these are: 'b' BASE's, 'n' NEW's without BASE, 's' the site's own, 'r'
                    // the release's
  std::string change;
  std::string outcome;
  std::string reason;
  std::string fingerprint;
  bool isInBase = false;
  bool isInOld = false;
  bool isInNew = false;
  std::vector<FleetClause> clauses;
  std::vector<FleetValue> values;
  // What can be decided about it.
  bool isQuestion = false;
  bool isByName = false;
  bool mayMove = false;
  std::vector<std::string> takes;
  std::vector<std::string> openClauses;

  bool isUndecided() const { return outcome == "undecided"; }
};

struct FleetPlanFile {
  std::string role;
  std::string path;
  std::string sha256;
};

struct FleetPlan {
  std::string base;  // empty without BASE
  std::string latest;
  bool isReady = false;
  std::size_t refusals = 0;
  std::vector<FleetPlanFile> files;  // of BASE and NEW
  std::vector<FleetPlanRow> rows;
};

// Reads it in one pass, whatever the order of its members. Returns false, and a failure at its
// line, when the document is no saved plan.
bool readFleetPlan(const Source& source, FleetPlan* plan, Failures* failures);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_FLEET_PLAN_H
