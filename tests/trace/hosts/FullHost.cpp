// Brings the whole facility and the clock.

#include <cstdarg>
#include <cstdlib>

#include "HostRun.h"
#include "ldtr.h"
#include "timestamp.h"

std::uint64_t trcEvents = 0;
ldtr_function_global ldtr_fun;

void ldtr_write(unsigned long level, unsigned long identifier, void const* pointer) {
  std::printf("host entry 0x%lx 0x%lx %d\n", level, identifier, pointer == nullptr);
}

void ldtr_exit_errcode(unsigned long identifier, unsigned long kind, unsigned long entryBit,
                       long errorCode, void const* pointer) {
  std::printf("host exit 0x%lx %lu %lu %ld %d\n", identifier, kind, entryBit, errorCode,
              pointer == nullptr);
}

void ldtr_formater_local::debug(unsigned long debugLevel, char const* format, ...) {
  std::printf("host debug 0x%lx 0x%lx 0x%lx ", m_identifier, m_level, debugLevel);
  std::va_list arguments;
  va_start(arguments, format);
  std::vprintf(format, arguments);
  va_end(arguments);
}

void ldtr_formater_global::debug(unsigned long debugLevel, char const* format, ...) {
  std::printf("host debug outside 0x%lx 0x%lx ", m_level, debugLevel);
  std::va_list arguments;
  va_start(arguments, format);
  std::vprintf(format, arguments);
  va_end(arguments);
  std::printf("\n");
}

std::string getCurrentTimeStamp(int format) { return "host time " + std::to_string(format); }

// The mask comes from a variable of the host's own.
int main(int argumentCount, char** arguments) {
  if (const char* const mask = std::getenv("HOST_MASK")) {
    trcEvents = std::strtoull(mask, nullptr, 0);
  }
  return runHost(argumentCount, arguments);
}
