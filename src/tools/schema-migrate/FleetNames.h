// What the installations of a fleet are called.

#ifndef SCHEMA_MIGRATE_FLEET_NAMES_H
#define SCHEMA_MIGRATE_FLEET_NAMES_H

#include <string>
#include <vector>

struct NamedPlan {
  std::string name;
  std::string path;
};

// Of each word, PLAN or NAME=PLAN, the plan's file, which of a directory is plan.json in it, and
// the name of its installation: NAME, or as much of the end of the path as tells it from the
// others. Throws a Failure when two would be called alike.
std::vector<NamedPlan> namePlans(const std::vector<std::string>& words);

#endif  // SCHEMA_MIGRATE_FLEET_NAMES_H
