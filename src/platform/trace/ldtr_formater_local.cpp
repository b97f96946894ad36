#include <cstdarg>

#include "StandInRecord.h"
#include "ldtr.h"

__attribute__((weak)) void ldtr_formater_local::debug(unsigned long /*debugLevel*/,
                                                      char const* format, ...) {
  std::va_list arguments;
  va_start(arguments, format);
  standin::writeRecord(standin::formatted("ldtr debug 0x%08lx ", m_identifier), format, arguments);
  va_end(arguments);
}
