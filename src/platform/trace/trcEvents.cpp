// The stand-in's event mask: the bits given in the environment variable LIBSCHEMA_TRACE, without it
// none.

#include <cerrno>
#include <cstdlib>

#include "ldtr.h"

// The storage behind the weak `trcEvents`. Only this name is ever written, so that a host's own
// mask stays untouched; it is exported because a copy of the mask in an executable must cover both
// names.
extern "C" {
extern std::uint64_t libschema_trace_events;
__attribute__((visibility("default"))) std::uint64_t libschema_trace_events = 0;
}
extern std::uint64_t trcEvents __attribute__((weak, alias("libschema_trace_events")));

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

// Before the constructors of static objects, wherever they are linked, so that what these do is
// traced too.
constexpr int kFirstOfAll = 101;

__attribute__((constructor(kFirstOfAll))) void readMaskFromEnvironment() {
  libschema_trace_events = parseMask(std::getenv("LIBSCHEMA_TRACE"));
}

}  // namespace
