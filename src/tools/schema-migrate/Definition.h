// One definition of an installation's schema file, with what the program needs to know of it.

#ifndef SCHEMA_MIGRATE_DEFINITION_H
#define SCHEMA_MIGRATE_DEFINITION_H

#include <libschema/ORVSchema.h>

#include <cstddef>
#include <cstdint>
#include <memory>
#include <string>

#include "Digest.h"
#include "EndlessInput.h"

class Inventory;

struct Definition {
  DefinitionKind kind = DefinitionKind::kAttributeType;
  std::size_t file = 0;   // its number in kSchemaFiles
  std::size_t index = 0;  // among the definitions of its inventory
  std::uint64_t line = 0;
  bool isInBlock = false;
  const Inventory* inventory = nullptr;
  std::string oid;
  std::string firstName;  // a vendor extension has none
  std::string key;        // the first name in lower case
  Digest lineDigest;      // of the line that the library writes for it, without the line end
  std::unique_ptr<ORVSchema> object;  // null once it is not needed any more
};

// What a line may have beside its longest text. A buffer with room for both does not grow: one that
// has to would for a while be there twice.
constexpr std::size_t kRestOfLine = 4096;

// The digest of the line that the library writes for `object`, without the line end. `line` is a
// buffer for it.
Digest digestOfLine(DefinitionKind kind, ORVSchema* object, std::string* line);

// True when the library takes both for the same definition. Both have their objects and one kind;
// it is `definition` that is compared with `other`.
bool isEqual(const Definition& definition, const Definition& other);

// "attribute type cn (2.5.4.3)".
std::string describe(const Definition& definition);

// "OLD/V3.user.at:12".
std::string placeOf(const Definition& definition);

#endif  // SCHEMA_MIGRATE_DEFINITION_H
