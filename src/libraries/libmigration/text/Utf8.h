// Characters of UTF-8.

#ifndef LIBSCHEMA_MIGRATION_UTF8_H
#define LIBSCHEMA_MIGRATION_UTF8_H

#include <cstddef>
#include <string_view>

namespace migration {

// A character, and how long it is.
struct Utf8Character {
  char32_t code = 0;
  std::size_t length = 0;  // in bytes; 0 when the bytes are no character
};

// The character at the front of `text`, which is not empty. Over-long forms, surrogates and what
// lies behind U+10FFFF are none.
Utf8Character firstCharacter(std::string_view text);

// Whether the text is characters throughout.
bool isUtf8(std::string_view text);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_UTF8_H
