// A file that a run writes beside its result.

#ifndef SCHEMA_MIGRATE_NEW_FILE_H
#define SCHEMA_MIGRATE_NEW_FILE_H

#include <string>

// Creates `path`, which must not exist, with these bytes, and brings it to the disk. Throws a
// Failure when that cannot be done; then there is no such file.
void writeNewFile(const std::string& path, const std::string& bytes);

#endif  // SCHEMA_MIGRATE_NEW_FILE_H
