#include "Messages.h"

#include <cstring>

#include "DisplayText.h"
#include "Terminal.h"

namespace {

constexpr char kProgram[] = "schema-migrate";

// Whatever the names of files may hold, it is one line.
std::string line(const std::string& place, const char* severity, const std::string& text) {
  return wholePrintable(place + ": " + severity + ": " + text) + "\n";
}

}  // namespace

std::string errorLine(const std::string& text) { return line(kProgram, "error", text); }

std::string errorLine(const std::string& place, const std::string& text) {
  return line(place, "error", text);
}

std::string warningLine(const std::string& text) { return line(kProgram, "warning", text); }

std::string warningLine(const std::string& place, const std::string& text) {
  return line(place, "warning", text);
}

std::string placeOf(const std::string& path, std::uint64_t line) {
  return path + ":" + std::to_string(line);
}

std::string placeOf(const std::string& path, const Position& position) {
  return placeOf(path, position.line) + ":" + std::to_string(position.column);
}

std::string systemError(int errorNumber) { return std::strerror(errorNumber); }

std::string counted(std::uint64_t count, const std::string& noun) {
  return std::to_string(count) + " " + noun + (count == 1 ? "" : "s");
}

std::string printable(const std::string& text) {
  constexpr std::size_t kLongest = 200;
  return asShown(text, isUtf8Terminal(), kLongest);
}

std::string wholePrintable(std::string_view text) { return asShown(text, isUtf8Terminal()); }
