#include "DisplayText.h"

#include <libschema-migration/Utf8.h>

#include <algorithm>
#include <array>
#include <clocale>
#include <cstdio>
#include <cwchar>

namespace {

// Columns that the system's tables give a character; the program's own locale knows ASCII only.
int columnsOf(char32_t code) {
  static const locale_t kUnicode = ::newlocale(LC_CTYPE_MASK, "C.UTF-8", nullptr);
  if (code < 0x80) {
    return code >= ' ' && code != 0x7F ? 1 : -1;
  }
  if (kUnicode == nullptr) {
    return code >= 0xA0 ? 1 : -1;
  }
  const locale_t before = ::uselocale(kUnicode);
  const int columns = ::wcwidth(static_cast<wchar_t>(code));
  ::uselocale(before);
  return columns;
}

bool isShowable(char32_t code) {
  constexpr char32_t kSoftHyphen = 0xAD;
  const bool isAccent = code >= 0x300 && code <= 0x36F;
  return isAccent || (code != kSoftHyphen && columnsOf(code) > 0);
}

// How many bytes at the front set a colour; 0 when they do not.
std::size_t colourLength(std::string_view text) {
  if (text.substr(0, 2) != "\x1b[") {
    return 0;
  }
  const std::size_t end = text.find_first_not_of("0123456789;", 2);
  return end != std::string_view::npos && text[end] == 'm' ? end + 1 : 0;
}

// Where the value of a line "  label   value" begins; 0 when it is no such line.
std::size_t valueColumn(std::string_view line, std::size_t indent) {
  constexpr std::size_t kLongestLabel = 24;
  const std::size_t gap = line.find("  ", indent);
  if (gap == std::string_view::npos || gap - indent > kLongestLabel) {
    return 0;
  }
  const std::size_t value = line.find_first_not_of(' ', gap);
  return value == std::string_view::npos ? 0 : displayWidth(line.substr(0, value));
}

// The line in lines of at most `width`, what follows behind `hanging` blanks.
std::string broken(std::string_view line, std::size_t hanging, std::size_t width) {
  std::string result;
  std::size_t column = 0;
  bool isLineEmpty = true;
  const std::size_t indent = std::min(line.find_first_not_of(' '), line.size());
  result.append(line.substr(0, indent));
  column = indent;
  line.remove_prefix(indent);
  while (!line.empty()) {
    const std::size_t blanks = std::min(line.find_first_not_of(' '), line.size());
    const std::size_t end = std::min(line.find(' ', blanks), line.size());
    const std::string_view word = line.substr(blanks, end - blanks);
    const std::size_t wide = displayWidth(word);
    if (!isLineEmpty && column + blanks + wide > width) {
      result += "\n" + std::string(hanging, ' ');
      column = hanging;
    } else {
      result.append(blanks, ' ');
      column += blanks;
    }
    result.append(word);
    column += wide;
    isLineEmpty = false;
    line.remove_prefix(end);
  }
  return result;
}

}  // namespace

std::string asShown(std::string_view text, bool isWithUtf8, std::size_t limit) {
  std::string result;
  while (!text.empty()) {
    if (result.size() >= limit) {
      return result + "...";
    }
    const migration::Utf8Character character = migration::firstCharacter(text);
    const bool isShown = character.length == 1 || (isWithUtf8 && character.length > 1);
    if (isShown && isShowable(character.code)) {
      result.append(text.substr(0, character.length));
      text.remove_prefix(character.length);
      continue;
    }
    // A backslash is left as it is, so that a text is not changed a second time.
    std::array<char, 8> escaped{};
    std::snprintf(escaped.data(), escaped.size(), "\\x%02X",
                  static_cast<unsigned>(static_cast<unsigned char>(text.front())));
    result += escaped.data();
    text.remove_prefix(1);
  }
  return result;
}

std::size_t displayWidth(std::string_view text) {
  std::size_t width = 0;
  while (!text.empty()) {
    if (const std::size_t colour = colourLength(text)) {
      text.remove_prefix(colour);
      continue;
    }
    const migration::Utf8Character character = migration::firstCharacter(text);
    const int columns = character.length == 0 ? 1 : columnsOf(character.code);
    width += static_cast<std::size_t>(std::max(columns, 0));
    text.remove_prefix(std::max<std::size_t>(character.length, 1));
  }
  return width;
}

std::string padded(std::string text, std::size_t width) {
  const std::size_t own = displayWidth(text);
  return text.append(own < width ? width - own : 0, ' ');
}

std::string wrapped(const std::string& first, std::string_view text, std::size_t width) {
  const std::size_t hanging = displayWidth(first);
  // The break is never between the label and the first word.
  const std::string words = broken(text, 0, width > hanging + 8 ? width - hanging : 8);
  std::string result = first;
  for (const char c : words) {
    result += c;
    if (c == '\n') {
      result.append(hanging, ' ');
    }
  }
  return result + "\n";
}

std::string fitted(std::string_view text, std::size_t width) {
  constexpr std::size_t kFurther = 4;
  constexpr std::size_t kLeast = 8;  // columns for what is broken
  std::string result;
  while (!text.empty()) {
    const std::size_t end = text.find('\n');
    const std::string_view line = text.substr(0, end);
    text.remove_prefix(end == std::string_view::npos ? text.size() : end + 1);
    if (displayWidth(line) <= width) {
      result.append(line);
    } else {
      const std::size_t indent = std::min(line.find_first_not_of(' '), line.size());
      const std::size_t value = valueColumn(line, indent);
      const std::size_t hanging = value != 0 ? value : indent + kFurther;
      result += broken(line, hanging + kLeast > width ? 0 : hanging, width);
    }
    result += end == std::string_view::npos ? "" : "\n";
  }
  return result;
}
