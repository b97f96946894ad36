#include "ORVSchema.h"

#include "CaseFolding.h"

ORVSchema::ORVSchema() = default;

ORVSchema::~ORVSchema() = default;

std::string ORVSchema::firstNameLower() const {
  return names.empty() ? std::string() : libschema::lowered(names.front());
}
