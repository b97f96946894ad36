// What a schema manager holds: its tables with the definitions themselves, and its OID sets. The
// tests of whole states need all of it, the OID indexes included, which no operation shows
// completely.

#ifndef LIBSCHEMA_TESTS_MANAGER_TABLES_H
#define LIBSCHEMA_TESTS_MANAGER_TABLES_H

#include <array>
#include <cstddef>
#include <map>
#include <memory>
#include <set>
#include <string>
#include <vector>

#include "SchemaManager.h"

namespace properties {

template <typename Definition>
using Table = std::map<std::string, Definition*>;
using OidSet = std::set<std::string>;

// The six sets that comparison and merge maintain, in the order in which they are searched.
constexpr std::array<const char*, 6> kFileNames = {"V3.user.oc", "V3.user.at",   "V3.orv.oc",
                                                   "V3.orv.at",  "V3.system.oc", "V3.system.at"};

// A copy of the tables (the definitions in them are the manager's own) and of the sets.
struct State {
  Table<Attribute> attrTable;
  Table<ObjectClass> ocTable;
  Table<ORVAttribute> orvAttrTable;
  Table<Attribute> attrOidTable;
  Table<ObjectClass> ocOidTable;
  std::array<OidSet, kFileNames.size()> fileSets;
  OidSet modSchemaOids;
  OidSet excludedOids;
};

State stateOf(const SchemaManager& manager);

// "" when both hold the same definitions, the very same objects, under the same keys, and the same
// OIDs; else a text that names what differs.
std::string differenceOf(const State& expected, const State& actual);

// The members by which two vendor extensions differ, which no operation tells.
const std::vector<std::string>& databaseNamesOf(const ORVAttribute& extension);
const std::string& accessOf(const ORVAttribute& extension);
const std::string& lengthOf(const ORVAttribute& extension);

// Definitions in the hands of a test that uses them to the end: `managers` are destroyed, and what
// they leave unfreed by rule (what was erased or replaced, or is held by an OID index only) is
// freed behind them, so that the leak checker has its eye on everything else. `read` are the
// definitions that the managers read, as definitionsOf gave them right after reading. Definitions
// that two managers share after a failed merge go once.
std::set<ORVSchema*> definitionsOf(const SchemaManager& manager);
void destroyWithAllDefinitions(const std::set<ORVSchema*>& read,
                               std::vector<std::unique_ptr<SchemaManager>>* managers);

}  // namespace properties

#endif  // LIBSCHEMA_TESTS_MANAGER_TABLES_H
