// Opening of diagnostic files, whose names are fixed and lie in a directory that anyone may write
// to. Internal: not installed.

#ifndef LIBSCHEMA_DIAGNOSTIC_FILE_H
#define LIBSCHEMA_DIAGNOSTIC_FILE_H

#include <fstream>
#include <string>

namespace libschema {

// A file that is opened and emptied in any case, and seldom written to.
class DiagnosticFile {
 public:
  DiagnosticFile() = default;
  ~DiagnosticFile();
  DiagnosticFile(const DiagnosticFile&) = delete;
  DiagnosticFile& operator=(const DiagnosticFile&) = delete;

  // Opens `path` for writing, emptied, and returns true. Returns false, with nothing changed, when
  // the path cannot be opened or names anything but a regular file with a single name: no symbolic
  // link is followed, and neither a FIFO nor a device can block the caller.
  bool open(const char* path);

  // The stream that writes to the file; not open when open() returned false.
  std::ofstream& stream();

 private:
  int m_descriptor = -1;  // until the stream has it
  std::ofstream m_stream;
};

// The same for a file that is written to at once: `out` is open afterwards when true is returned.
bool openDiagnosticFile(const std::string& path, std::ofstream* out);

}  // namespace libschema

#endif  // LIBSCHEMA_DIAGNOSTIC_FILE_H
