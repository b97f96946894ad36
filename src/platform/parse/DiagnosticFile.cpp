#include "DiagnosticFile.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>
#include <ext/stdio_filebuf.h>

#include <utility>

namespace libschema {

bool openDiagnosticFile(const std::string& path, std::ofstream* out) {
  constexpr int kFlags = O_WRONLY | O_CREAT | O_NOFOLLOW | O_NONBLOCK | O_NOCTTY | O_CLOEXEC;
  const int descriptor = ::open(path.c_str(), kFlags, 0666);
  if (descriptor < 0) {
    return false;
  }
  // The file is emptied only now that it is known to be an ordinary one with no second name.
  struct stat status {};
  if (::fstat(descriptor, &status) != 0 || !S_ISREG(status.st_mode) || status.st_nlink != 1 ||
      ::ftruncate(descriptor, 0) != 0) {
    ::close(descriptor);
    return false;
  }
  // The stream takes over the descriptor and closes it.
  __gnu_cxx::stdio_filebuf<char> buffer(descriptor, std::ios_base::out);
  *out->rdbuf() = std::move(buffer);
  out->clear();
  return out->is_open();
}

}  // namespace libschema
