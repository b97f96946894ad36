#include "FixedClock.h"

#include "timestamp.h"

std::string getCurrentTimeStamp(int format) {
  return format == 1 ? support::kFixedTimeStamp : "unexpected argument " + std::to_string(format);
}
