// Opening of diagnostic files, whose names are fixed and lie in a directory that anyone may write
// to. Internal: not installed.

#ifndef LIBSCHEMA_DIAGNOSTIC_FILE_H
#define LIBSCHEMA_DIAGNOSTIC_FILE_H

#include <fstream>
#include <string>

namespace libschema {

// Opens `path` for writing, emptied, and returns true. Returns false, with `out` not open and
// nothing changed, when the path cannot be opened or names anything but a regular file with a
// single name: no symbolic link is followed, and neither a FIFO nor a device can block the
// caller.
bool openDiagnosticFile(const std::string& path, std::ofstream* out);

}  // namespace libschema

#endif  // LIBSCHEMA_DIAGNOSTIC_FILE_H
