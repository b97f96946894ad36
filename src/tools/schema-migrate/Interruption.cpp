#include "Interruption.h"

#include <unistd.h>

#include <array>
#include <atomic>
#include <csignal>
#include <string_view>

#include "Messages.h"
#include "Progress.h"

namespace {

constexpr std::array<int, 3> kSignals = {SIGINT, SIGTERM, SIGHUP};
constexpr std::string_view kNoOutput = "schema-migrate: error: interrupted\n";
constexpr std::string_view kNotInPlace =
    "schema-migrate: error: interrupted; the output directory was not written\n";
constexpr std::string_view kInPlace =
    "schema-migrate: error: interrupted; the output directory is complete and in place\n";
// Of two, the output directory comes first.
constexpr std::string_view kWithoutRecord =
    "schema-migrate: error: interrupted; the output directory is complete and in place, but the record was not written\n";
constexpr std::string_view kWithRecord =
    "schema-migrate: error: interrupted; the output directory and the record are complete and in place\n";

std::atomic<bool> isOutputExpected{false};

std::string_view messageOf(const migration::Removals::Placed& placed) {
  if (placed.inPlace == 0) {
    return isOutputExpected ? kNotInPlace : kNoOutput;
  }
  if (placed.wanted == 1) {
    return kInPlace;
  }
  return placed.inPlace == placed.wanted ? kWithRecord : kWithoutRecord;
}

// Never destroyed: a signal may come as late as among the last destructors.
migration::Removals* const kEverything = new migration::Removals;

extern "C" void removeAndEnd(int /*signal*/) {
  const std::string_view message = messageOf(kEverything->run());
  progress::erase();
  migration::writeAll(STDERR_FILENO, message);
  ::_exit(kNotWritten);
}

}  // namespace

namespace interruption {

void install() {
  struct sigaction action {};
  action.sa_handler = removeAndEnd;
  for (const int number : kSignals) {
    sigaddset(&action.sa_mask, number);
  }
  for (const int number : kSignals) {
    struct sigaction previous {};
    // A signal that the caller has the program ignore (nohup) stays ignored.
    if (::sigaction(number, nullptr, &previous) == 0 && previous.sa_handler != SIG_IGN) {
      ::sigaction(number, &action, nullptr);
    }
  }
}

migration::Removals* removals() { return kEverything; }

void expectOutput() { isOutputExpected = true; }

}  // namespace interruption
