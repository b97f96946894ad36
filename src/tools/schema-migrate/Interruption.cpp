#include "Interruption.h"

#include <unistd.h>

#include <array>
#include <climits>
#include <cstddef>
#include <cstring>

#include "Messages.h"
#include "SchemaFiles.h"

namespace {

constexpr std::array<int, 3> kSignals = {SIGINT, SIGTERM, SIGHUP};
constexpr char kMessage[] =
    "schema-migrate: error: interrupted; the output directory was not written\n";

using Path = std::array<char, PATH_MAX + 64>;

// Made beforehand: a signal handler must not build strings.
Path unfinishedDirectory;
std::array<Path, kSchemaFiles.size()> unfinishedFiles;

void fill(Path* path, const std::string& text) {
  const std::size_t length = text.size() < path->size() ? text.size() : 0;
  std::memcpy(path->data(), text.data(), length);
  (*path)[length] = '\0';
}

extern "C" void removeAndEnd(int /*signal*/) {
  if (unfinishedDirectory[0] != '\0') {
    for (const Path& file : unfinishedFiles) {
      ::unlink(file.data());
    }
    ::rmdir(unfinishedDirectory.data());
  }
  const ssize_t ignored = ::write(STDERR_FILENO, kMessage, sizeof kMessage - 1);
  static_cast<void>(ignored);
  ::_exit(kNotWritten);
}

sigset_t interruptions() {
  sigset_t set;
  sigemptyset(&set);
  for (const int number : kSignals) {
    sigaddset(&set, number);
  }
  return set;
}

void setAction(void (*handler)(int)) {
  struct sigaction action {};
  action.sa_handler = handler;
  action.sa_mask = interruptions();
  for (const int number : kSignals) {
    struct sigaction previous {};
    // A signal that the caller has the program ignore (nohup) stays ignored.
    if (::sigaction(number, nullptr, &previous) == 0 && previous.sa_handler != SIG_IGN) {
      ::sigaction(number, &action, nullptr);
    }
  }
}

}  // namespace

namespace interruption {

void install() { setAction(removeAndEnd); }

void uninstall() { setAction(SIG_DFL); }

void setUnfinished(const std::string& directory) {
  const Hold hold;
  fill(&unfinishedDirectory, directory);
  for (std::size_t file = 0; file < kSchemaFiles.size(); ++file) {
    fill(&unfinishedFiles[file], directory + "/" + kSchemaFiles[file]);
  }
}

Hold::Hold() {
  const sigset_t set = interruptions();
  ::sigprocmask(SIG_BLOCK, &set, &m_previous);
}

Hold::~Hold() { ::sigprocmask(SIG_SETMASK, &m_previous, nullptr); }

}  // namespace interruption
