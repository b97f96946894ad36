#include "NewFile.h"

#include <fcntl.h>
#include <unistd.h>

#include <cerrno>

#include "Descriptor.h"
#include "Messages.h"

void writeNewFile(const std::string& path, const std::string& bytes) {
  const Descriptor file(
      ::open(path.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_NOFOLLOW | O_CLOEXEC, 0666));
  if (!file.isOpen()) {
    throw Failure(kNotWritten, errorLine(path, "cannot be created: " + systemError(errno)));
  }
  if (!writeAll(file.number(), bytes) || ::fsync(file.number()) != 0) {
    const int error = errno;
    ::unlink(path.c_str());
    throw Failure(kNotWritten, errorLine(path, "cannot be written: " + systemError(error)));
  }
}
