// Stand-in for the server's trace facility. Every symbol that a host program may define itself is
// weak. The records go to standard error, one line each, for the bits given in the environment
// variable LIBSCHEMA_TRACE; without it the stand-in is silent.

#include "ldtr.h"

#include <unistd.h>

#include <array>
#include <cerrno>
#include <cstdarg>
#include <cstdio>
#include <cstdlib>
#include <string>

// The storage behind the weak `trcEvents`. Only this name is ever written, so that a host's own
// mask stays untouched; it is exported because a copy of the mask in an executable must cover both
// names.
extern "C" {
extern std::uint64_t libschema_trace_events;
__attribute__((visibility("default"))) std::uint64_t libschema_trace_events = 0;
}
extern std::uint64_t trcEvents __attribute__((weak, alias("libschema_trace_events")));

__attribute__((weak)) ldtr_function_global ldtr_fun;

namespace {

// The mask that `text` gives in decimal or as 0x…; 0 when it is anything else.
std::uint64_t parseMask(const char* text) {
  if (text == nullptr || *text < '0' || *text > '9') {
    return 0;
  }
  const bool isHex = text[0] == '0' && (text[1] == 'x' || text[1] == 'X');
  if (isHex && text[2] == '\0') {
    return 0;
  }
  errno = 0;
  char* end = nullptr;
  const unsigned long long mask = std::strtoull(text, &end, isHex ? 16 : 10);
  return *end == '\0' && errno == 0 ? mask : 0;
}

__attribute__((constructor)) void readMaskFromEnvironment() {
  libschema_trace_events = parseMask(std::getenv("LIBSCHEMA_TRACE"));
}

void appendFormatted(std::string* line, const char* format, std::va_list arguments) {
  std::va_list again;
  va_copy(again, arguments);
  const int length = std::vsnprintf(nullptr, 0, format, arguments);
  if (length > 0) {
    const std::size_t start = line->size();
    line->resize(start + static_cast<std::size_t>(length) + 1);
    std::vsnprintf(&(*line)[start], static_cast<std::size_t>(length) + 1, format, again);
    line->pop_back();
  }
  va_end(again);
}

// Writes `record` as one line: the line ends that close it go, those inside show as \n.
void writeLine(const std::string& record) {
  std::string line;
  const std::size_t last = record.find_last_not_of('\n');
  const std::size_t length = last == std::string::npos ? 0 : last + 1;
  line.reserve(length + 1);
  for (std::size_t i = 0; i < length; ++i) {
    if (record[i] == '\n') {
      line += "\\n";
    } else {
      line += record[i];
    }
  }
  line += '\n';
  std::size_t done = 0;
  while (done < line.size()) {
    const ssize_t count = ::write(STDERR_FILENO, line.data() + done, line.size() - done);
    if (count < 0 && errno != EINTR) {
      return;
    }
    done += count > 0 ? static_cast<std::size_t>(count) : 0;
  }
}

__attribute__((format(printf, 1, 2))) std::string formatted(const char* format, ...) {
  std::string text;
  std::va_list arguments;
  va_start(arguments, format);
  appendFormatted(&text, format, arguments);
  va_end(arguments);
  return text;
}

}  // namespace

__attribute__((weak)) void ldtr_write(unsigned long level, unsigned long identifier,
                                      void const* /*pointer*/) {
  writeLine(formatted("ldtr entry 0x%08lx level 0x%lx", identifier, level));
}

__attribute__((weak)) void ldtr_exit_errcode(unsigned long identifier, unsigned long /*kind*/,
                                             unsigned long /*entryBit*/, long errorCode,
                                             void const* /*pointer*/) {
  writeLine(formatted("ldtr exit 0x%08lx error %ld", identifier, errorCode));
}

__attribute__((weak)) void ldtr_formater_local::debug(unsigned long /*debugLevel*/,
                                                      char const* format, ...) {
  std::string record = formatted("ldtr debug 0x%08lx ", m_identifier);
  std::va_list arguments;
  va_start(arguments, format);
  appendFormatted(&record, format, arguments);
  va_end(arguments);
  writeLine(record);
}

__attribute__((weak)) void ldtr_formater_global::debug(unsigned long /*debugLevel*/,
                                                       char const* format, ...) {
  std::string record = "ldtr debug ";
  std::va_list arguments;
  va_start(arguments, format);
  appendFormatted(&record, format, arguments);
  va_end(arguments);
  writeLine(record);
}
