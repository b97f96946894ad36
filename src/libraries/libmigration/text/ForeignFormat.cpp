#include "ForeignFormat.h"

#include <algorithm>
#include <array>
#include <cstddef>

namespace migration {

namespace {

using namespace std::string_view_literals;

constexpr std::array<std::string_view, 7> kCompressedBeginnings = {
    "\x1f\x8b"sv, "BZh"sv,        "\xfd\x37zXZ\0"sv, "\x28\xb5\x2f\xfd"sv,
    "\x1f\x9d"sv, "PK\x03\x04"sv, "\x1f\xa0"sv};

constexpr bool beginsWith(std::string_view text, std::string_view beginning) {
  return text.substr(0, beginning.size()) == beginning;
}

constexpr char lowered(char c) {
  return c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c;
}

bool equalsInAnyCase(std::string_view left, std::string_view right) {
  return left.size() == right.size() &&
         std::equal(left.begin(), left.end(), right.begin(),
                    [](char one, char other) { return lowered(one) == lowered(other); });
}

template <std::size_t size>
bool isOneOf(std::string_view word, const std::array<std::string_view, size>& words) {
  return std::any_of(words.begin(), words.end(),
                     [&](std::string_view candidate) { return equalsInAnyCase(word, candidate); });
}

// Text in characters of two bytes has a zero in nearly every pair, always on the same side.
bool isUtf16(std::string_view bytes) {
  if (beginsWith(bytes, "\xff\xfe") || beginsWith(bytes, "\xfe\xff")) {
    return true;
  }
  constexpr std::size_t kLooked = 512;
  const std::string_view beginning = bytes.substr(0, kLooked);
  std::array<std::size_t, 2> zeros{};
  for (std::size_t i = 0; i < beginning.size(); ++i) {
    zeros[i % 2] += beginning[i] == '\0' ? 1 : 0;
  }
  const std::size_t pairs = beginning.size() / 2;
  const std::size_t more = std::max(zeros[0], zeros[1]);
  const std::size_t less = std::min(zeros[0], zeros[1]);
  return pairs >= 4 && more * 4 >= pairs * 3 && less * 10 <= pairs;
}

std::string_view withoutBlanks(std::string_view text) {
  const std::size_t begin = text.find_first_not_of(" \t\r\v\f");
  return begin == std::string_view::npos ? std::string_view() : text.substr(begin);
}

// The first line that is neither empty nor a comment, from its first character on, and all behind.
std::string_view fromFirstLine(std::string_view bytes) {
  if (beginsWith(bytes, "\xef\xbb\xbf")) {
    bytes.remove_prefix(3);
  }
  while (!bytes.empty()) {
    const std::string_view line = withoutBlanks(bytes.substr(0, bytes.find('\n')));
    if (!line.empty() && line.front() != '#') {
      return bytes.substr(static_cast<std::size_t>(line.data() - bytes.data()));
    }
    const std::size_t end = bytes.find('\n');
    bytes = end == std::string_view::npos ? std::string_view() : bytes.substr(end + 1);
  }
  return bytes;
}

constexpr bool belongsToWord(char c) {
  return (lowered(c) >= 'a' && lowered(c) <= 'z') || (c >= '0' && c <= '9') || c == '-' ||
         c == '_' || c == ';' || c == '.';
}

ForeignFormat formatOfText(std::string_view text) {
  constexpr std::array<std::string_view, 9> kLdifNames = {
      "version",     "dn",           "changetype", "attributetypes",   "objectclasses",
      "objectclass", "ldapsyntaxes", "include",    "olcattributetypes"};
  constexpr std::array<std::string_view, 6> kServerWords = {"attributetype",  "attribute",
                                                            "objectclass",    "ldapsyntax",
                                                            "ditcontentrule", "ditstructurerule"};
  const auto end = std::find_if_not(text.begin(), text.end(), belongsToWord);
  const auto size = static_cast<std::size_t>(end - text.begin());
  const std::string_view word = text.substr(0, size);
  const std::string_view directlyBehind = text.substr(size);
  if (beginsWith(directlyBehind, ":") && isOneOf(word, kLdifNames)) {
    return ForeignFormat::kLdif;
  }
  const std::size_t next = directlyBehind.find_first_not_of(" \t\r\n");
  const std::string_view behind =
      next == std::string_view::npos ? std::string_view() : directlyBehind.substr(next);
  if (beginsWith(behind, "(") && isOneOf(word, kServerWords)) {
    return ForeignFormat::kServerSchema;
  }
  const bool isDefinitionOfOid = equalsInAnyCase(word, "objectidentifier") && next > 0 &&
                                 !behind.empty() && belongsToWord(behind.front());
  return isDefinitionOfOid ? ForeignFormat::kServerSchema : ForeignFormat::kNone;
}

}  // namespace

ForeignFormat foreignFormatOf(std::string_view bytes) {
  for (const std::string_view beginning : kCompressedBeginnings) {
    if (beginsWith(bytes, beginning)) {
      return ForeignFormat::kCompressed;
    }
  }
  if (isUtf16(bytes)) {
    return ForeignFormat::kUtf16;
  }
  const std::string_view text = fromFirstLine(bytes);
  if (text.size() > 1 && text[0] == '<' &&
      (text[1] == '?' || text[1] == '!' || belongsToWord(text[1]))) {
    return ForeignFormat::kXml;
  }
  if (!text.empty() && (text[0] == '{' || text[0] == '[')) {
    const std::size_t next = text.find_first_not_of(" \t\r\n", 1);
    if (next != std::string_view::npos &&
        (text[next] == '"' || text[next] == '{' || text[next] == '[')) {
      return ForeignFormat::kJson;
    }
  }
  return formatOfText(text);
}

std::string_view nameOf(ForeignFormat format) {
  switch (format) {
    case ForeignFormat::kNone:
      break;
    case ForeignFormat::kUtf16:
      return "text in UTF-16";
    case ForeignFormat::kCompressed:
      return "a compressed file";
    case ForeignFormat::kXml:
      return "an XML file";
    case ForeignFormat::kJson:
      return "a JSON file";
    case ForeignFormat::kLdif:
      return "an LDIF file";
    case ForeignFormat::kServerSchema:
      return "a schema file in the style of a server's configuration (\"attributetype ( … )\")";
  }
  return "";
}

}  // namespace migration
