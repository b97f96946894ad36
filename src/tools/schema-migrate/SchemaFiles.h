// The nine schema files of an installation, by number.

#ifndef SCHEMA_MIGRATE_SCHEMA_FILES_H
#define SCHEMA_MIGRATE_SCHEMA_FILES_H

#include <array>
#include <cstddef>
#include <string>

// The first six are those whose OIDs comparison and merge maintain, in the order in which the
// library searches them; the first seven have a set of OIDs and are written from it.
constexpr std::array<const char*, 9> kSchemaFiles = {
    "V3.user.oc",   "V3.user.at",        "V3.orv.oc",    "V3.orv.at",    "V3.system.oc",
    "V3.system.at", "V3.modifiedschema", "V3.config.at", "V3.config.oc",
};
constexpr std::size_t kMergedFiles = 6;
constexpr std::size_t kWrittenFiles = 7;
constexpr std::size_t kModifiedSchema = 6;
constexpr std::size_t kNoSchemaFile = kSchemaFiles.size();

// The order in which an installation is read. The first definition of a name counts, and what an
// administrator changed on the server is to count before what it was changed from.
constexpr std::array<std::size_t, 9> kReadingOrder = {kModifiedSchema, 5, 4, 3, 2, 1, 0, 7, 8};

// The number of the file with this name, or kNoSchemaFile.
std::size_t schemaFileNumber(const std::string& name);

#endif  // SCHEMA_MIGRATE_SCHEMA_FILES_H
