// The time that a run writes into what it makes.

#ifndef SCHEMA_MIGRATE_RUN_TIME_H
#define SCHEMA_MIGRATE_RUN_TIME_H

#include <cstdint>
#include <optional>

// In seconds from the beginning of 1970: what SOURCE_DATE_EPOCH says, so that two runs can be equal
// byte for byte. Nothing when it is not set. Throws a Failure when it is no such number.
std::optional<std::int64_t> timeWanted();

// The same, or the time that it is.
std::int64_t timeOfRun();

#endif  // SCHEMA_MIGRATE_RUN_TIME_H
