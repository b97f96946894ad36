// Reads the definitions of one schema file the way the library's manager does, and hands over each
// one with the block form it stood in, which the manager keeps to itself.

#ifndef SCHEMA_MIGRATE_DEFINITION_READER_H
#define SCHEMA_MIGRATE_DEFINITION_READER_H

#include <libschema/ORVSchema.h>

#include <functional>
#include <memory>
#include <string>

#include "EndlessInput.h"

using DefinitionTaker =
    std::function<void(DefinitionKind kind, bool isInBlock, std::unique_ptr<ORVSchema> object)>;

// Returns false when the file cannot be parsed. It must be one on which reading ends.
bool readDefinitions(const std::string& directory, const std::string& fileName,
                     const DefinitionTaker& take);

#endif  // SCHEMA_MIGRATE_DEFINITION_READER_H
