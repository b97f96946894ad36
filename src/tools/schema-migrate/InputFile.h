// A file that is only read. Nothing but a regular file is ever opened for reading, so that neither
// a FIFO nor a device can block the program.

#ifndef SCHEMA_MIGRATE_INPUT_FILE_H
#define SCHEMA_MIGRATE_INPUT_FILE_H

#include <cstddef>
#include <cstdint>
#include <string>

#include "Descriptor.h"
#include "Directory.h"

class InputFile {
 public:
  // Opens `path`, or `name` in a directory. When that fails, or it is no regular file, problem()
  // says why.
  explicit InputFile(const std::string& path);
  InputFile(const Directory& directory, const std::string& name);

  // Empty while all is well; otherwise what is the matter, as in "it is a directory".
  const std::string& problem() const { return m_problem; }

  int descriptor() const { return m_descriptor.number(); }

  // Reads up to `size` bytes and returns their number: 0 at the end and after an error, which
  // problem() tells then.
  std::size_t read(char* buffer, std::size_t size);

 private:
  InputFile(int directory, const std::string& name);

  Descriptor m_descriptor;
  std::string m_problem;
};

#endif  // SCHEMA_MIGRATE_INPUT_FILE_H
