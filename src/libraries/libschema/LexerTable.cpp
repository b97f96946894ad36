#include "LexerTable.h"

namespace libschema {

void LexerTable::publish() {
  if (m_isPrivate && m_hasText) {
    removeValue(kTextIndex);
    insertValue(std::string(m_text), m_token, false);
  }
  m_isPrivate = false;
}

// Asked of a table once: the answer is the same for every one.
bool LexerTable::canBePrivate() {
  static const bool answer = [] {
    SchemaSymbolTable table;
    for (int i = 0; i < kKeywordCount; ++i) {
      if (table.lookUpValue(std::string(kKeywords[i].text)) != i) {
        return false;
      }
    }
    const int first = table.insertValue(std::string(), TOKEN_NAME, false);
    table.removeValue(first);
    const int second = table.insertValue(std::string(), TOKEN_NAME, false);
    return first == kTextIndex && second == kTextIndex;
  }();
  return answer;
}

}  // namespace libschema
