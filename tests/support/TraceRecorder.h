// A host's own trace facility, which keeps what it is given.

#ifndef LIBSCHEMA_TESTS_TRACE_RECORDER_H
#define LIBSCHEMA_TESTS_TRACE_RECORDER_H

#include <cstdint>
#include <string>
#include <vector>

namespace support {

constexpr std::uint64_t kAllEvents = 0x0403f000;  // entry and exit of both kinds, and debug
constexpr std::uint64_t kDebugEvents = 0x04000000;

// Records for as long as it lives, with the given event bits on; afterwards all bits are off again.
class TraceRecorder {
 public:
  explicit TraceRecorder(std::uint64_t events);
  ~TraceRecorder();
  TraceRecorder(const TraceRecorder&) = delete;
  TraceRecorder& operator=(const TraceRecorder&) = delete;

  // The records so far, in order:
  //   "entry 0x53030200 level 0x3200000"
  //   "exit 0x53030200 kind 33 bit 4096 code 0"
  //   "debug 0x53051000 level 0x3400000 0xc8010000: the text"   (with its line end)
  //   "debug global level 0x3400000 0xc8010000: the text"
  // A record whose pointer is not null ends in " pointer".
  std::vector<std::string> records() const;

  // Only the texts of the debug records, with their line ends.
  std::vector<std::string> messages() const;

  // The formats of the same records.
  std::vector<std::string> formats() const;

  void clear();
};

}  // namespace support

#endif  // LIBSCHEMA_TESTS_TRACE_RECORDER_H
