// Brings the entry records, the debug records of numbered functions, and the clock.

#include "HostRun.h"
#include "ldtr.h"
#include "timestamp.h"

void ldtr_write(unsigned long level, unsigned long identifier, void const* pointer) {
  std::printf("host entry 0x%lx 0x%lx %d\n", level, identifier, pointer == nullptr);
}

void ldtr_formater_local::debug(unsigned long debugLevel, char const* format, ...) {
  std::printf("host debug 0x%lx 0x%lx 0x%lx %s", m_identifier, m_level, debugLevel, format);
}

std::string getCurrentTimeStamp(int format) { return "host time " + std::to_string(format); }

int main(int argumentCount, char** arguments) { return runHost(argumentCount, arguments); }
