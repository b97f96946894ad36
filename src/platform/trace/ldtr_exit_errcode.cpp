#include "StandInRecord.h"
#include "ldtr.h"

__attribute__((weak)) void ldtr_exit_errcode(unsigned long identifier, unsigned long /*kind*/,
                                             unsigned long /*entryBit*/, long errorCode,
                                             void const* /*pointer*/) {
  standin::writeRecord(standin::formatted("ldtr exit 0x%08lx error %ld", identifier, errorCode));
}
