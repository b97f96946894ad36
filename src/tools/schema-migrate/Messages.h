// What the program says on standard error, and the codes with which it ends.

#ifndef SCHEMA_MIGRATE_MESSAGES_H
#define SCHEMA_MIGRATE_MESSAGES_H

#include <cstdint>
#include <stdexcept>
#include <string>
#include <string_view>

enum ExitCode : int {
  kDone = 0,
  kFindings = 1,
  kUsage = 2,
  kBadInput = 3,
  kRefused = 4,
  kNotWritten = 5,
};

// A place in a file, counted in bytes from 1.
struct Position {
  std::uint64_t line = 1;
  std::uint64_t column = 1;
};

// Ends the run: the lines of what() go to standard error, and the program ends with `exitCode`.
class Failure : public std::runtime_error {
 public:
  Failure(ExitCode exitCode, const std::string& lines)
      : std::runtime_error(lines), m_exitCode(exitCode) {}
  ExitCode exitCode() const { return m_exitCode; }

 private:
  ExitCode m_exitCode;
};

// One line each, with its line end: "schema-migrate: error: TEXT", "PLACE: error: TEXT" and the
// same with "warning". A place is a path, or what placeOf makes of one. Whatever is in them, the
// line is printable.
std::string errorLine(const std::string& text);
std::string errorLine(const std::string& place, const std::string& text);
std::string warningLine(const std::string& text);
std::string warningLine(const std::string& place, const std::string& text);

// "PATH:LINE" and "PATH:LINE:COLUMN".
std::string placeOf(const std::string& path, std::uint64_t line);
std::string placeOf(const std::string& path, const Position& position);

// The text that goes with `errorNumber`, as in "No such file or directory".
std::string systemError(int errorNumber);

// "1 definition", "2 definitions".
std::string counted(std::uint64_t count, const std::string& noun);

// Bytes that a terminal could take for a command as \xNN, and those of 128 and more unless they are
// characters that the terminal shows; a long text is cut short.
std::string printable(const std::string& text);

// The same, not cut short.
std::string wholePrintable(std::string_view text);

#endif  // SCHEMA_MIGRATE_MESSAGES_H
