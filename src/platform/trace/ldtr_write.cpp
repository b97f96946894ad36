#include "StandInRecord.h"
#include "ldtr.h"

__attribute__((weak)) void ldtr_write(unsigned long level, unsigned long identifier,
                                      void const* /*pointer*/) {
  standin::writeRecord(standin::formatted("ldtr entry 0x%08lx level 0x%lx", identifier, level));
}
