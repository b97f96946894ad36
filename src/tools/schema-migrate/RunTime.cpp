#include "RunTime.h"

#include <charconv>
#include <cstdlib>
#include <ctime>
#include <string_view>
#include <system_error>

#include "Messages.h"

namespace {

// The last second of the year 9999: later ones have no text of the usual length.
constexpr std::int64_t kMost = 253402300799;

}  // namespace

std::optional<std::int64_t> timeWanted() {
  const char* const variable = std::getenv("SOURCE_DATE_EPOCH");
  if (variable == nullptr || *variable == '\0') {
    return std::nullopt;
  }
  const std::string_view text = variable;
  std::int64_t seconds = 0;
  const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), seconds);
  if (error != std::errc() || end != text.data() + text.size() || seconds < 0 || seconds > kMost) {
    throw Failure(kUsage,
                  errorLine("SOURCE_DATE_EPOCH is \"" + printable(variable) +
                            "\", which is no number of seconds from the beginning of 1970"));
  }
  return seconds;
}

std::int64_t timeOfRun() { return timeWanted().value_or(std::time(nullptr)); }
