#include <cstdarg>

#include "StandInRecord.h"
#include "ldtr.h"

__attribute__((weak)) void ldtr_formater_global::debug(unsigned long /*debugLevel*/,
                                                       char const* format, ...) {
  std::va_list arguments;
  va_start(arguments, format);
  standin::writeRecord("ldtr debug ", format, arguments);
  va_end(arguments);
}
