// What every fuzzing target does: it takes bytes, in LLVMFuzzerTestOneInput, and ends the process
// when something does not hold. Each is linked twice: with libFuzzer, which makes up the bytes, and
// with ReplayMain.cpp, which takes them from files.

#ifndef LIBSCHEMA_FUZZ_TARGET_H
#define LIBSCHEMA_FUZZ_TARGET_H

#include <cstddef>
#include <cstdint>
#include <string>

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size);

namespace fuzz {

// Has half of the inputs, by their length, run with all trace events on.
void traceByLength(std::size_t size);

// The bytes as text, after traceByLength.
std::string textOf(const std::uint8_t* data, std::size_t size);

// Prints `what` and ends the process unless it holds.
void require(bool holds, const std::string& what);

// The same for two texts that have to be equal.
void requireEqual(const std::string& expected, const std::string& actual, const std::string& what);

// The folder of this process, in memory where the system has such a place. It goes with the
// process.
const std::string& folder();

// Writes a file in that folder and returns its path.
std::string write(const std::string& name, const std::string& text);

std::string read(const std::string& path);

// Whether the library would never come back from reading a schema file with this text. All targets
// that read schema files leave these inputs, and no others, out. They are settled behaviour:
//   - COLLECTIVE where a clause of an attribute type begins;
//   - a NAME clause that the end of the file is met in;
//   - a DBNAME list that the end of the file is met in.
// It is the guard by which the migration library refuses such files.
bool neverEnds(const std::string& text);

// Whether the library reads it without a failure.
bool isReadWhole(const std::string& text);

}  // namespace fuzz

#endif  // LIBSCHEMA_FUZZ_TARGET_H
