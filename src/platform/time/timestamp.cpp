#include "timestamp.h"

#include <array>
#include <ctime>

// Digits only, so that no locale can change the text.
__attribute__((weak)) std::string getCurrentTimeStamp(int /*format*/) {
  const std::time_t now = std::time(nullptr);
  std::tm local{};
  localtime_r(&now, &local);
  std::array<char, 64> text{};
  const std::size_t length = std::strftime(text.data(), text.size(), "%Y-%m-%d %H:%M:%S", &local);
  return std::string(text.data(), length);
}
