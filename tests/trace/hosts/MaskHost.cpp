// Brings the event mask only.

#include <cinttypes>

#include "HostRun.h"
#include "ldtr.h"

std::uint64_t trcEvents = 0x2000;

int main(int argumentCount, char** arguments) {
  std::printf("mask 0x%" PRIx64 "\n", trcEvents);
  return runHost(argumentCount, arguments);
}
