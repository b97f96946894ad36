// Files and directories that are only read. Nothing but a regular file is ever opened for reading,
// so that neither a FIFO nor a device can block the program; each file is opened once and read
// once, and one that changes while it is read is refused.

#ifndef LIBSCHEMA_MIGRATION_INPUT_FILES_H
#define LIBSCHEMA_MIGRATION_INPUT_FILES_H

#include <cstdint>
#include <limits>
#include <memory>
#include <string>
#include <vector>

#include "Finding.h"
#include "Source.h"

namespace migration {

// How much is read.
struct ReadLimits {
  std::uint64_t bytes = std::uint64_t{1} << 30;  // of all files together
  std::uint64_t used = 0;                        // of them by what was read before
  std::string advice;                            // what to do about more: ends the message

  // For what is in memory anyway.
  static ReadLimits none() { return {std::numeric_limits<std::uint64_t>::max(), 0, ""}; }

  // How much may still be read.
  std::uint64_t room() const { return bytes - used; }
  // Of a file that is larger than the room: "with this file the inputs have more than 1 GiB in
  // all".
  std::string exceeded() const;
};

// What a file holds.
struct FileText {
  std::string bytes;
  unsigned mode = 0;  // the permissions
};

// A directory that is only read, opened once: whatever becomes of its path, this one is read.
class InputDirectory {
 public:
  // Opens it; that it cannot be opened is told by what is asked next.
  explicit InputDirectory(const std::string& path);
  InputDirectory(const InputDirectory&) = delete;
  InputDirectory& operator=(const InputDirectory&) = delete;
  ~InputDirectory();

  // Lists the names in it in ascending order and returns an empty text, or what is the matter;
  // *names is empty then.
  std::string list(std::vector<std::string>* names) const;

  // Reads the whole file `name`, and returns an empty text. Otherwise it returns what is the
  // matter, as in "cannot be read: it is a directory", and text->bytes is empty.
  std::string read(const std::string& name, const ReadLimits& limits, FileText* text) const;

 private:
  int m_descriptor;
  int m_error;  // why it is not open
};

// The same for a file by its path.
std::string readFile(const std::string& path, const ReadLimits& limits, FileText* text);

// The same as a source; null, and a failure with the path, when it cannot be had.
std::unique_ptr<Source> readSource(const std::string& path, const ReadLimits& limits,
                                   Failures* failures);

// The text of a system error, as in "No such file or directory".
std::string systemErrorText(int error);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_INPUT_FILES_H
