// The host that the targets run in: a clock that stands still, so that files can be compared, and a
// trace facility that formats every record and forgets it.

#include <array>
#include <cstdarg>
#include <cstdint>
#include <cstdio>
#include <string>

#include "ldtr.h"
#include "timestamp.h"

std::uint64_t trcEvents = 0;
ldtr_function_global ldtr_fun;

namespace {

void format(const char* text, std::va_list arguments) {
  std::array<char, 256> buffer{};
  std::vsnprintf(buffer.data(), buffer.size(), text, arguments);
}

}  // namespace

void ldtr_write(unsigned long /*level*/, unsigned long /*identifier*/, void const* /*pointer*/) {}

void ldtr_exit_errcode(unsigned long /*identifier*/, unsigned long /*kind*/,
                       unsigned long /*entryBit*/, long /*errorCode*/, void const* /*pointer*/) {}

void ldtr_formater_local::debug(unsigned long /*debugLevel*/, char const* text, ...) {
  std::va_list arguments;
  va_start(arguments, text);
  format(text, arguments);
  va_end(arguments);
}

void ldtr_formater_global::debug(unsigned long /*debugLevel*/, char const* text, ...) {
  std::va_list arguments;
  va_start(arguments, text);
  format(text, arguments);
  va_end(arguments);
}

std::string getCurrentTimeStamp(int /*format*/) { return "2001-02-03 04:05:06"; }
