// Where a run keeps its private copies.

#ifndef SCHEMA_MIGRATE_RUN_PLACES_H
#define SCHEMA_MIGRATE_RUN_PLACES_H

#include <cstdint>
#include <string>

#include "PrivatePlace.h"

// In memory where it can be had; beside the output `out` at last. `inputSize` is that of everything
// that is read, in bytes.
PrivatePlaceOptions privatePlaceFor(const std::string& out, std::uint64_t inputSize);

#endif  // SCHEMA_MIGRATE_RUN_PLACES_H
