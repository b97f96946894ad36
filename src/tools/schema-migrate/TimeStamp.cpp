// The clock that this program gives the library, in place of the library's stand-in.

#include <libschema/timestamp.h>

#include <array>
#include <ctime>

#include "RunTime.h"

// The local time, as the stand-in tells it, or UTC of the time that is wanted.
std::string getCurrentTimeStamp(int /*format*/) {
  const bool isWanted = timeWanted().has_value();
  const auto time = static_cast<std::time_t>(timeOfRun());
  std::tm broken{};
  if (isWanted) {
    gmtime_r(&time, &broken);
  } else {
    localtime_r(&time, &broken);
  }
  std::array<char, 64> text{};
  const std::size_t length = std::strftime(text.data(), text.size(), "%Y-%m-%d %H:%M:%S", &broken);
  return {text.data(), length};
}
