// What a run of `fleet` found: a value, from which text, JSON and, of that, a page are rendered.

#ifndef SCHEMA_MIGRATE_FLEET_REPORT_H
#define SCHEMA_MIGRATE_FLEET_REPORT_H

#include <libschema-migration/Finding.h>
#include <libschema-migration/Fleet.h>

#include <string>

struct FleetReport {
  migration::Fleet fleet;
  migration::FleetQuery query;
  migration::Failures failures;  // plans that cannot be read
  int exitCode = 0;

  // Whether every installation may go ahead.
  bool isReady() const {
    return failures.empty() && fleet.readyCount == fleet.installations.size();
  }
};

// The installations by how far they are, the definitions with who has them how, and the questions,
// what settles most first.
std::string renderText(const FleetReport& report, bool isColoured);

// One document, as docs/json/fleet.schema.json says.
std::string renderJson(const FleetReport& report);

// What could not be read, and what keeps the installations from being ready; for standard error.
std::string renderComplaints(const FleetReport& report);

#endif  // SCHEMA_MIGRATE_FLEET_REPORT_H
