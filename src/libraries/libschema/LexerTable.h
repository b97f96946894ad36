// The symbol table of an analyser. Where the analyser is just a SchemaLexan, so that nobody but the
// analyser itself can reach the table, the text of the current word or number need not be stored
// for every token: it is known here, and goes into the table when somebody asks the table for more
// than that text. Internal: not installed.

#ifndef LIBSCHEMA_LEXER_TABLE_H
#define LIBSCHEMA_LEXER_TABLE_H

#include <cstring>
#include <string>
#include <string_view>
#include <utility>

#include "Keywords.h"
#include "SchemaSymbolTable.h"

namespace libschema {

class LexerTable final : public SchemaSymbolTable {
 public:
  // True until the first publish(): the table has the keywords, and one entry behind them at most,
  // whose text is known here. Never true over a symbol table that does not give the index of the
  // last entry, once that is removed, to the next one.
  bool isPrivate() const { return m_isPrivate; }

  // The index of the entry that a word or number with this text is: of a keyword, also by one of
  // its spellings, or of the text behind the keywords; -1 when there is none. Its token code.
  int find(std::string_view text) const {
    const int keyword = keywordIndexOf(text);
    if (keyword >= 0) {
      return keyword;
    }
    if (m_hasText && text.size() == m_text.size() &&
        std::memcmp(text.data(), m_text.data(), text.size()) == 0) {
      return kTextIndex;
    }
    return keywordIndexOf(keywordOfSpelling(text));
  }
  int tokenAt(int index) const { return index == kTextIndex ? m_token : kKeywords[index].token; }

  // Makes `text` the one behind the keywords; returns its index. A borrowed text must stay in place
  // until another one takes its place, or keepText() or publish() was called.
  int borrowText(std::string_view text, int token) {
    m_text = text;
    m_token = token;
    m_hasText = true;
    return kTextIndex;
  }
  int takeText(std::string text, int token) {
    m_kept = std::move(text);
    return borrowText(m_kept, token);
  }
  void keepText() {
    if (m_hasText && m_text.data() != m_kept.data()) {
      m_kept.assign(m_text);
      m_text = m_kept;
    }
  }

  // The table's getValue.
  bool getText(int index, std::string& out) {
    if (index != kTextIndex || !m_hasText) {
      return getValue(index, out);
    }
    // A text is copied to take no more room than it needs.
    if (out.capacity() < m_text.size()) {
      out = std::string(m_text);
    } else {
      out.assign(m_text);
    }
    return true;
  }

  // From now on everything is in the table itself.
  void publish();

 private:
  static constexpr int kTextIndex = kKeywordCount;

  static bool canBePrivate();

  bool m_isPrivate = canBePrivate();
  bool m_hasText = false;
  int m_token = 0;
  std::string_view m_text;  // in the analyser's input, or in m_kept
  std::string m_kept;
};

}  // namespace libschema

#endif  // LIBSCHEMA_LEXER_TABLE_H
