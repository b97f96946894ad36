// Generated schema directories that have much in common.

#ifndef LIBSCHEMA_TESTS_GENERATED_DIRECTORY_H
#define LIBSCHEMA_TESTS_GENERATED_DIRECTORY_H

#include <map>
#include <string>
#include <vector>

#include "Choices.h"

namespace properties {

struct GeneratedDefinition {
  enum Kind { kAttribute, kClass, kExtension };
  Kind kind;
  std::string file;
  std::string oid;
  std::vector<std::string> names;  // of a vendor extension: its database names
  std::string clauses;             // what else stands in the definition
};

using GeneratedDirectory = std::vector<GeneratedDefinition>;

// Up to a dozen definitions out of few names and OIDs, in any of the nine files, so that they share
// and repeat names and OIDs in every way. Some have no name or no OID, and some a name that is
// spelled like an OID.
GeneratedDirectory anyDirectory(Choices* choices);

// The same with definitions taken out, changed and added; sometimes with hardly any left.
GeneratedDirectory relativeOf(const GeneratedDirectory& directory, Choices* choices);

// Definitions that fit together, with those of every other such directory too: a name and an OID
// always stand for the same definition, of the same kind, and all stand in one of the six files
// that comparison and merge maintain. The definitions' other clauses and their files differ.
GeneratedDirectory consistentDirectory(Choices* choices);

// The text of each file that has definitions, by name.
std::map<std::string, std::string> filesOf(const GeneratedDirectory& directory);

// A list of OIDs that the definitions have, or may have.
std::string anyOidList(Choices* choices);

}  // namespace properties

#endif  // LIBSCHEMA_TESTS_GENERATED_DIRECTORY_H
