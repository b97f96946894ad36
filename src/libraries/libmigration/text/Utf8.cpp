#include "Utf8.h"

namespace migration {

Utf8Character firstCharacter(std::string_view text) {
  const auto byte = [&](std::size_t at) { return static_cast<unsigned char>(text[at]); };
  const unsigned first = byte(0);
  if (first < 0x80) {
    return {first, 1};
  }
  const std::size_t length = first >= 0xC2 && first <= 0xDF   ? 2
                             : first >= 0xE0 && first <= 0xEF ? 3
                             : first >= 0xF0 && first <= 0xF4 ? 4
                                                              : 0;
  if (length == 0 || length > text.size()) {
    return {};
  }
  char32_t code = first & (0xFFU >> (length + 1));
  for (std::size_t at = 1; at < length; ++at) {
    if ((byte(at) & 0xC0U) != 0x80) {
      return {};
    }
    code = (code << 6U) | (byte(at) & 0x3FU);
  }
  constexpr char32_t kLeast[] = {0, 0, 0x80, 0x800, 0x10000};
  const bool isSurrogate = code >= 0xD800 && code <= 0xDFFF;
  return code < kLeast[length] || isSurrogate || code > 0x10FFFF ? Utf8Character()
                                                                 : Utf8Character{code, length};
}

bool isUtf8(std::string_view text) {
  while (!text.empty()) {
    const std::size_t length = firstCharacter(text).length;
    if (length == 0) {
      return false;
    }
    text.remove_prefix(length);
  }
  return true;
}

}  // namespace migration
