// A file that a run writes beside its result.

#ifndef SCHEMA_MIGRATE_NEW_FILE_H
#define SCHEMA_MIGRATE_NEW_FILE_H

#include <string>

enum class Over { kNothing, kWhatIsThere };

// Puts a file with these bytes in the place of `path`: it is written under a temporary name beside
// it (.NAME.partial-XXXXXX), brought to the disk and renamed, so that it is there whole or not at
// all. With kNothing, `path` must not exist. Throws a Failure when that cannot be done; then what
// was there is there, and nothing else, unless the message says otherwise.
void writeNewFile(const std::string& path, const std::string& bytes, Over over = Over::kNothing);

#endif  // SCHEMA_MIGRATE_NEW_FILE_H
