// What a fleet needs of one saved plan. Internal: not installed.

#ifndef LIBSCHEMA_MIGRATION_FLEET_PLAN_H
#define LIBSCHEMA_MIGRATION_FLEET_PLAN_H

#include <array>
#include <cstddef>
#include <cstdint>
#include <map>
#include <string>
#include <vector>

#include "Finding.h"
#include "Fleet.h"
#include "Source.h"

namespace migration {

// A definition that the site may have touched, or that is undecided.
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

// Definitions that nobody but the release touched, which are most of a plan: their texts stand one
// behind another in one text, so that none takes room of its own.
class UntouchedRows {
 public:
  // Keeps kind, side, OID and names.
  void add(const FleetPlanRow& row);

  std::size_t count() const { return m_rows.size(); }
  // Sets these of *row to those of the one at this place.
  void copy(std::size_t at, FleetPlanRow* row) const;

 private:
  struct Row {
    std::size_t begin = 0;
    std::array<std::size_t, 3> lengths{};
    std::uint8_t kind = 0;
    char side = ' ';
  };
  std::string m_bytes;
  std::vector<Row> m_rows;
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
  UntouchedRows untouched;
  // By OLD's OIDs, those of attribute types that a site renumbered, as all know them.
  std::map<std::string, std::string> renumbered;

  // The OID of a vendor extension is no clause of it: it is that of its attribute type.
  void followAttribute(FleetPlanRow* row) const;
};

// Reads it in one pass, whatever the order of its members. Returns false, and a failure at its
// line, when the document is no saved plan.
bool readFleetPlan(const Source& source, FleetPlan* plan, Failures* failures);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_FLEET_PLAN_H
