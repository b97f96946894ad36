#include "Terminal.h"

#include <unistd.h>

#include <cstdlib>
#include <string_view>

namespace {

std::string_view variable(const char* name) {
  const char* const value = std::getenv(name);
  return value == nullptr ? std::string_view() : value;
}

}  // namespace

bool isOnTerminal() { return ::isatty(STDOUT_FILENO) == 1; }

bool isColourWanted() {
  return isOnTerminal() && variable("NO_COLOR").empty() && variable("TERM") != "dumb";
}
