// A file that is only read. Nothing but a regular file is ever opened for reading, so that neither
// a FIFO nor a device can block the program.

#ifndef SCHEMA_MIGRATE_INPUT_FILE_H
#define SCHEMA_MIGRATE_INPUT_FILE_H

#include <cstddef>
#include <cstdint>
#include <string>

class InputFile {
 public:
  // Opens `path`. When that fails, or it is no regular file, problem() says why.
  explicit InputFile(const std::string& path);
  ~InputFile();
  InputFile(const InputFile&) = delete;
  InputFile& operator=(const InputFile&) = delete;

  // Empty while all is well; otherwise what is the matter, as in "it is a directory".
  const std::string& problem() const { return m_problem; }

  int descriptor() const { return m_descriptor; }

  // Reads up to `size` bytes and returns their number: 0 at the end and after an error, which
  // problem() tells then.
  std::size_t read(char* buffer, std::size_t size);

 private:
  int m_descriptor = -1;
  std::string m_problem;
};

#endif  // SCHEMA_MIGRATE_INPUT_FILE_H
