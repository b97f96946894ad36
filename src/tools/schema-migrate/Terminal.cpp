#include "Terminal.h"

#include <sys/ioctl.h>
#include <unistd.h>

#include <algorithm>
#include <charconv>
#include <cstdlib>
#include <string_view>

namespace {

constexpr std::size_t kUsualWidth = 80;
constexpr std::size_t kLeastWidth = 20;
constexpr std::size_t kMostWidth = 10000;

enum class Wish { kAuto, kAlways, kNever };

Wish colourWish = Wish::kAuto;
bool isUtf8 = false;  // what the terminal takes

std::string_view variable(const char* name) {
  const char* const value = std::getenv(name);
  return value == nullptr ? std::string_view() : value;
}

// 0 for what is no number of columns.
std::size_t columnsOf(std::string_view text) {
  std::size_t columns = 0;
  const char* const end = text.data() + text.size();
  const std::from_chars_result read = std::from_chars(text.data(), end, columns);
  return read.ec == std::errc() && read.ptr == end ? columns : 0;
}

}  // namespace

bool isOnTerminal() { return ::isatty(STDOUT_FILENO) == 1; }

void wishForColour(const std::string& when) {
  colourWish = when == "always" ? Wish::kAlways : when == "never" ? Wish::kNever : Wish::kAuto;
}

bool isColourWanted() {
  return colourWish == Wish::kAuto
             ? isOnTerminal() && variable("NO_COLOR").empty() && variable("TERM") != "dumb"
             : colourWish == Wish::kAlways;
}

std::size_t terminalWidth() {
  std::size_t columns = columnsOf(variable("COLUMNS"));
  winsize size{};
  for (const int stream : {STDOUT_FILENO, STDERR_FILENO}) {
    if (columns == 0 && ::ioctl(stream, TIOCGWINSZ, &size) == 0) {
      columns = size.ws_col;
    }
  }
  return columns == 0 ? kUsualWidth : std::clamp(columns, kLeastWidth, kMostWidth);
}

std::size_t longestLine() { return isOnTerminal() ? terminalWidth() : std::string::npos; }

void noteLocale() {
  for (const char* const name : {"LC_ALL", "LC_CTYPE", "LANG"}) {
    std::string value(variable(name));
    if (!value.empty()) {
      std::transform(value.begin(), value.end(), value.begin(),
                     [](char c) { return c >= 'A' && c <= 'Z' ? static_cast<char>(c + 32) : c; });
      isUtf8 =
          isOnTerminal() && ::isatty(STDERR_FILENO) == 1 &&
          (value.find("utf-8") != std::string::npos || value.find("utf8") != std::string::npos);
      return;
    }
  }
}

bool isUtf8Terminal() { return isUtf8; }
