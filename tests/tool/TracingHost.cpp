// A host's own trace facility, with every event bit on: it formats each record, as any would, and
// writes to the file named in HOST_RECORDS how many there were of each kind.

#include <cstdarg>
#include <cstdint>
#include <cstdio>
#include <cstdlib>

#include "ldtr.h"

std::uint64_t trcEvents = ~std::uint64_t{0};
ldtr_function_global ldtr_fun;

namespace {

struct Counts {
  int entries = 0;
  int exits = 0;
  int messages = 0;

  ~Counts() {
    const char* const name = std::getenv("HOST_RECORDS");
    if (std::FILE* const file = name == nullptr ? nullptr : std::fopen(name, "w")) {
      std::fprintf(file, "entries %d exits %d messages %d\n", entries, exits, messages);
      std::fclose(file);
    }
  }
};

Counts counts;

void format(const char* text, std::va_list arguments) {
  char buffer[256];
  counts.messages += std::vsnprintf(buffer, sizeof buffer, text, arguments) > 0 ? 1 : 0;
}

}  // namespace

void ldtr_write(unsigned long /*level*/, unsigned long /*identifier*/, void const* /*pointer*/) {
  ++counts.entries;
}

void ldtr_exit_errcode(unsigned long /*identifier*/, unsigned long /*kind*/,
                       unsigned long /*entryBit*/, long /*errorCode*/, void const* /*pointer*/) {
  ++counts.exits;
}

void ldtr_formater_local::debug(unsigned long /*debugLevel*/, char const* text, ...) {
  std::va_list arguments;
  va_start(arguments, text);
  format(text, arguments);
  va_end(arguments);
}

void ldtr_formater_global::debug(unsigned long /*debugLevel*/, char const* text, ...) {
  std::va_list arguments;
  va_start(arguments, text);
  format(text, arguments);
  va_end(arguments);
}
