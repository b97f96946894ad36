#include "RunPlaces.h"

#include <cstdlib>

#include "OutputPlace.h"

PrivatePlaceOptions privatePlaceFor(const std::string& out, std::uint64_t inputSize) {
  // A definition can be written into several files, and all of it is there twice for a while.
  constexpr std::uint64_t kTimes = 5;
  constexpr std::uint64_t kMore = std::uint64_t{1} << 20;
  PrivatePlaceOptions place;
  place.room = kTimes * inputSize + kMore;
  const char* const chosen = std::getenv("TMPDIR");
  if (chosen != nullptr && *chosen != '\0') {
    place.candidates.emplace_back(chosen);
  }
  for (const char* const directory : {"/dev/shm", "/tmp", "/var/tmp"}) {
    place.candidates.emplace_back(directory);
  }
  place.candidates.push_back(parentOf(out));
  return place;
}
