// Lists of OIDs, of any bytes: what they exclude, and what they withdraw from a small schema.

#include <string>

#include "ManagerGroup.h"
#include "Rules.h"
#include "Target.h"

namespace {

// An OID of each kind, one of two kinds, one of an extension alone, names that share an OID or are
// spelled like one.
constexpr char kModifiedSchema[] =
    "attributetypes=( 1.1 NAME 'cn' DESC 'a' )\n"
    "attributetypes=( 1.2 NAME '1.3' DESC 'named like an OID' )\n"
    "attributetypes=( 1.3 NAME 'sn' DESC 'c' )\n"
    "attributetypes=( 1.4 NAME 'CN' DESC 'the name of another one' )\n"
    "objectclasses=( 1.5 NAME 'top' ABSTRACT )\n"
    "objectclasses=( 1.1 NAME 'person' STRUCTURAL )\n"
    "ORVAttributetypes=( 1.1 DBNAME ( 'cn' 'cn' ) )\n"
    "ORVAttributetypes=( 1.6 DBNAME ( 'alone' 'alone' ) )\n"
    "attributetypes=( site-oid NAME 'site' DESC 'a word' )\n";
constexpr char kUserAttributes[] = "attributetypes=( 1.7 NAME 'mail' DESC 'not modified' )\n";

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  const std::string list = fuzz::textOf(data, size);
  properties::ManagerGroup group(fuzz::folder());
  SchemaManager* const manager =
      group.read({{"V3.modifiedschema", kModifiedSchema}, {"V3.user.at", kUserAttributes}});
  properties::State expected = properties::stateOf(*manager);
  const std::string path = fuzz::write("list", list);

  expected.excludedOids = properties::oidsIn(list);
  fuzz::require(manager->readExcludedOids(path) == 0, "readExcludedOids()");
  for (const std::string& oid : expected.excludedOids) {
    fuzz::require(manager->isExcluded(oid), "isExcluded()");
  }
  fuzz::requireEqual("", properties::differenceOf(expected, properties::stateOf(*manager)),
                     "exclusion");

  properties::withdraw(&expected, expected.excludedOids);
  fuzz::require(manager->modifySchema(path) == 0, "modifySchema()");
  fuzz::requireEqual("", properties::differenceOf(expected, properties::stateOf(*manager)),
                     "withdrawal");
  fuzz::require(manager->isModFileEmpty() == expected.modSchemaOids.empty(), "isModFileEmpty()");
  return 0;
}
