// Files and directories that are only read. Nothing but a regular file is ever opened for reading,
// so that neither a FIFO nor a device can block the program; each file is opened once and read
// once.

#ifndef LIBSCHEMA_MIGRATION_INPUT_FILES_H
#define LIBSCHEMA_MIGRATION_INPUT_FILES_H

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "Finding.h"
#include "Source.h"

namespace migration {

// The text of a system error, as in "No such file or directory".
std::string systemErrorText(int error);

// Reads the whole file, at most `limit` bytes, and returns an empty text. Otherwise it returns what
// is the matter, as in "it is a directory", and *bytes is empty.
std::string readRegularFile(const std::string& path, std::uint64_t limit, std::string* bytes);

// The same as a source; null, and a failure with the path, when it cannot be had.
std::unique_ptr<Source> readSource(const std::string& path, std::uint64_t limit,
                                   Failures* failures);

// Lists the names in a directory in ascending order and returns an empty text, or what is the
// matter; *names is empty then.
std::string listDirectory(const std::string& path, std::vector<std::string>* names);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_INPUT_FILES_H
