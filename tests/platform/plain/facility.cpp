// A facility that records nothing, and a clock.

#include <ctime>

#include "ldtr.h"
#include "timestamp.h"

unsigned long trcEvents = 0;
ldtr_function_global ldtr_fun;

void ldtr_write(unsigned long, unsigned long, void const*) {}

void ldtr_exit_errcode(unsigned long, unsigned long, unsigned long, long, void const*) {}

void ldtr_formater_local::debug(unsigned long, char const*, ...) {}

void ldtr_formater_global::debug(unsigned long, char const*, ...) {}

std::string getCurrentTimeStamp(int) {
  const std::time_t now = std::time(nullptr);
  char text[32];
  std::strftime(text, sizeof text, "%Y-%m-%d %H:%M:%S", std::localtime(&now));
  return text;
}
