// Reads and sets the library's event mask, without one of its own.

#include <cinttypes>

#include "HostRun.h"
#include "ldtr.h"

int main(int argumentCount, char** arguments) {
  std::printf("mask 0x%" PRIx64 "\n", trcEvents);
  trcEvents = 0x1000;
  const int result = runHost(argumentCount, arguments);
  trcEvents = 0;
  return result + runHost(argumentCount, arguments);
}
