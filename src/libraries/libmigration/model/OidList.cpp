#include "OidList.h"

#include <algorithm>

namespace migration {

namespace {

constexpr bool isSpace(char c) { return c == ' ' || (c >= '\t' && c <= '\r'); }

constexpr bool isDigit(char c) { return c >= '0' && c <= '9'; }

}  // namespace

std::vector<OidWord> readOidList(const Source& source) {
  std::vector<OidWord> words;
  const std::string_view bytes = source.bytes();
  for (std::size_t place = 0; place < bytes.size();) {
    if (isSpace(bytes[place])) {
      ++place;
      continue;
    }
    const auto end = static_cast<std::size_t>(
        std::find_if(bytes.begin() + static_cast<std::ptrdiff_t>(place), bytes.end(), isSpace) -
        bytes.begin());
    const std::string_view text = bytes.substr(place, end - place);
    const std::size_t hash = text.find('#');
    if (hash == std::string_view::npos) {
      words.push_back({text, place, end == bytes.size() ? WordUse::kLastIsLost : WordUse::kTaken});
      place = end;
    } else {
      if (hash != 0) {
        words.push_back({text, place, WordUse::kCutByComment});
      }
      // The comment ends with the first line end behind the word.
      place = std::min(bytes.find('\n', end), bytes.size());
    }
  }
  return words;
}

bool isNumericOid(std::string_view text) {
  int groups = 0;
  for (;;) {
    const std::size_t dot = std::min(text.find('.'), text.size());
    const std::string_view group = text.substr(0, dot);
    if (group.empty() || !std::all_of(group.begin(), group.end(), isDigit) ||
        (group.size() > 1 && group.front() == '0')) {
      return false;
    }
    ++groups;
    if (dot == text.size()) {
      return groups > 1;
    }
    text.remove_prefix(dot + 1);
  }
}

}  // namespace migration
