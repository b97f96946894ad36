// A server's own trace facility and clock. The mask is 0 where the program sets it.

#include <cstdarg>
#include <cstdio>
#include <string>

#include "ldtr.h"
#include "timestamp.h"

#ifndef SERVER_MASK
#define SERVER_MASK 0x04001000
#endif

std::uint64_t trcEvents = SERVER_MASK;
ldtr_function_global ldtr_fun;

namespace {

constexpr unsigned long kReadFile = 0x53051000;

}  // namespace

std::string getCurrentTimeStamp(int format) { return "server clock " + std::to_string(format); }

void ldtr_write(unsigned long level, unsigned long identifier, void const* /*pointer*/) {
  if (identifier == kReadFile) {
    std::printf("server entry %lx level %lx\n", identifier, level);
  }
}

void ldtr_exit_errcode(unsigned long identifier, unsigned long kind, unsigned long entryBit,
                       long errorCode, void const* /*pointer*/) {
  if (identifier == kReadFile) {
    std::printf("server exit %lx kind %lu bit %lu code %ld\n", identifier, kind, entryBit,
                errorCode);
  }
}

void ldtr_formater_local::debug(unsigned long debugLevel, char const* format, ...) {
  std::printf("server debug %lx level %lx %lx: ", identifier(), level(), debugLevel);
  std::va_list arguments;
  va_start(arguments, format);
  std::vprintf(format, arguments);
  va_end(arguments);
}

void ldtr_formater_global::debug(unsigned long debugLevel, char const* format, ...) {
  std::printf("server debug level %lx %lx: %.8s\n", level(), debugLevel, format);
}
