// The keywords of the schema-file language, in the order of the symbol table. Internal: included by
// .cpp files only.

#ifndef LIBSCHEMA_KEYWORDS_H
#define LIBSCHEMA_KEYWORDS_H

#include <array>
#include <cstddef>
#include <cstring>
#include <string_view>

#include "SchemaTokens.h"

namespace libschema {

struct Keyword {
  std::string_view text;
  int token;
};

// REVERSE stands nineteenth although its code is the last one.
constexpr Keyword kKeywords[] = {
    {"objectclasses", KEY_OBJECTCLASSES},
    {"NAME", KEY_NAME},
    {"DESC", KEY_DESC},
    {"SUP", KEY_SUP},
    {"AUXILIARY", KEY_AUXILIARY},
    {"MUST", KEY_MUST},
    {"MAY", KEY_MAY},
    {"STRUCTURAL", KEY_STRUCTURAL},
    {"attributetypes", KEY_ATTRIBUTETYPES},
    {"EQUALITY", KEY_EQUALITY},
    {"SYNTAX", KEY_SYNTAX},
    {"SINGLE-VALUE", KEY_SINGLE_VALUE},
    {"USAGE", KEY_USAGE},
    {"NO-USER-MODIFICATION", KEY_NO_USER_MODIFICATION},
    {"ORVAttributetypes", KEY_ORVATTRIBUTETYPES},
    {"ACCESS-CLASS", KEY_ACCESS_CLASS},
    {"DBNAME", KEY_DBNAME},
    {"SUBSTR", KEY_SUBSTR},
    {"REVERSE", KEY_REVERSE},
    {"ORDERING", KEY_ORDERING},
    {"COLLECTIVE", KEY_COLLECTIVE},
    {"OBSOLETE", KEY_OBSOLETE},
    {"ABSTRACT", KEY_ABSTRACT},
    {"LENGTH", KEY_LENGTH},
    {"APPROX", KEY_APPROX},
};
constexpr int kKeywordCount = static_cast<int>(std::size(kKeywords));

// A spelling of a definition's start, and the keyword that it stands for.
struct Spelling {
  std::string_view text;
  std::string_view keyword;
};
constexpr Spelling kSpellings[] = {
    {"objectClasses", "objectclasses"},
    {"attributeTypes", "attributetypes"},
    {"ORVattributeTypes", "ORVAttributetypes"},
};

// The keyword that a text is spelled as; empty when it is none of the spellings.
inline std::string_view keywordOfSpelling(std::string_view text) {
  for (const Spelling& spelling : kSpellings) {
    if (text == spelling.text) {
      return spelling.keyword;
    }
  }
  return {};
}

// ---- The keywords by their text ----

constexpr std::size_t kKeywordPlaces = 64;

// No two keywords have one place.
constexpr std::size_t keywordPlaceOf(std::string_view text) {
  return (text.size() + static_cast<unsigned char>(text.front()) * std::size_t{3} +
          static_cast<unsigned char>(text.back()) * std::size_t{12}) %
         kKeywordPlaces;
}

constexpr std::array<signed char, kKeywordPlaces> placeKeywords() {
  std::array<signed char, kKeywordPlaces> places{};
  for (signed char& place : places) {
    place = -1;
  }
  for (int i = 0; i < kKeywordCount; ++i) {
    places[keywordPlaceOf(kKeywords[i].text)] = static_cast<signed char>(i);
  }
  return places;
}

constexpr std::array<signed char, kKeywordPlaces> kIndexes = placeKeywords();

constexpr bool everyKeywordHasItsPlace() {
  for (int i = 0; i < kKeywordCount; ++i) {
    if (kIndexes[keywordPlaceOf(kKeywords[i].text)] != i) {
      return false;
    }
  }
  return true;
}
static_assert(everyKeywordHasItsPlace());

// The index of the keyword with exactly this text, or -1.
inline int keywordIndexOf(std::string_view text) {
  const int index = text.empty() ? -1 : kIndexes[keywordPlaceOf(text)];
  if (index < 0 || kKeywords[index].text.size() != text.size() ||
      std::memcmp(kKeywords[index].text.data(), text.data(), text.size()) != 0) {
    return -1;
  }
  return index;
}

}  // namespace libschema

#endif  // LIBSCHEMA_KEYWORDS_H
