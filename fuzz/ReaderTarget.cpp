// The file reader over any bytes: its result, and what it read written and read again, if it is of
// the kind that comes back.

#include <string>

#include "ManagerGroup.h"
#include "RoundTrip.h"
#include "Target.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  const std::string text = fuzz::textOf(data, size);
  if (fuzz::neverEnds(text)) {
    return 0;
  }
  fuzz::write("V3.user.at", text);
  properties::ManagerGroup group(fuzz::folder());
  const properties::ReadResult first = group.readIn(fuzz::folder(), "V3.user.at");
  const bool succeeds = fuzz::isReadWhole(text);
  fuzz::requireEqual(succeeds ? "0" : "1", std::to_string(first.status), "readFile()");
  if (properties::allReadBack(*first.manager, "V3.user.at")) {
    fuzz::requireEqual("",
                       properties::differenceAfterRoundTrip(first.manager, "V3.user.at", &group),
                       "round trip");
  }
  return 0;
}
