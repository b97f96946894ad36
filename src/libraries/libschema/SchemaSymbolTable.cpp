#include "SchemaSymbolTable.h"

namespace {

struct Keyword {
  const char* text;
  int token;
};

// In the order of insertion. REVERSE stands nineteenth although its code is the last one.
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

}  // namespace

SchemaSymbolTable::SchemaSymbolTable() {
  for (const Keyword& keyword : kKeywords) {
    insertText(keyword.text, keyword.token, true);
  }
}

SchemaSymbolTable::~SchemaSymbolTable() = default;
