#include "DiagnosticFile.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>
#include <ext/stdio_filebuf.h>

#include <utility>

namespace libschema {

namespace {

// Returns the descriptor of the emptied file, or -1.
int openEmptied(const char* path) {
  constexpr int kFlags = O_WRONLY | O_CREAT | O_NOFOLLOW | O_NONBLOCK | O_NOCTTY | O_CLOEXEC;
  const int descriptor = ::open(path, kFlags, 0666);
  if (descriptor < 0) {
    return -1;
  }
  // The file is emptied only now that it is known to be an ordinary one with no second name.
  struct stat status {};
  if (::fstat(descriptor, &status) != 0 || !S_ISREG(status.st_mode) || status.st_nlink != 1 ||
      (status.st_size != 0 && ::ftruncate(descriptor, 0) != 0)) {
    ::close(descriptor);
    return -1;
  }
  return descriptor;
}

// The stream takes over the descriptor and closes it.
void attach(int descriptor, std::ofstream* out) {
  __gnu_cxx::stdio_filebuf<char> buffer(descriptor, std::ios_base::out);
  *out->rdbuf() = std::move(buffer);
  out->clear();
}

}  // namespace

DiagnosticFile::~DiagnosticFile() {
  if (m_descriptor >= 0) {
    ::close(m_descriptor);
  }
}

bool DiagnosticFile::open(const char* path) {
  m_descriptor = openEmptied(path);
  return m_descriptor >= 0;
}

std::ofstream& DiagnosticFile::stream() {
  if (m_descriptor >= 0) {
    attach(std::exchange(m_descriptor, -1), &m_stream);
  }
  return m_stream;
}

bool openDiagnosticFile(const std::string& path, std::ofstream* out) {
  const int descriptor = openEmptied(path.c_str());
  if (descriptor >= 0) {
    attach(descriptor, out);
  }
  return out->is_open();
}

}  // namespace libschema
