#include "TokenReader.h"

#include <libschema/SchemaSymbolTable.h>
#include <libschema/SchemaTokens.h>

#include <algorithm>
#include <cstddef>

namespace {

constexpr std::size_t kBufferSize = std::size_t{1} << 16;

struct Keyword {
  std::string_view text;
  int token;
};

// Spellings that count as the first word of a definition too, though they are no keywords.
constexpr Keyword kSpellings[] = {
    {"objectClasses", KEY_OBJECTCLASSES},
    {"attributeTypes", KEY_ATTRIBUTETYPES},
    {"ORVattributeTypes", KEY_ORVATTRIBUTETYPES},
};

// The token of a keyword; -1 for any other text.
int keywordToken(const std::string& text) {
  static SchemaSymbolTable keywords;
  const int index = keywords.lookUpValue(text);
  if (index >= 0) {
    return keywords.getTokenValue(index);
  }
  for (const Keyword& spelling : kSpellings) {
    if (text == spelling.text) {
      return spelling.token;
    }
  }
  return -1;
}

// The character classes of the "C" locale.
constexpr bool isDigit(char c) { return c >= '0' && c <= '9'; }
constexpr bool isLetter(char c) { return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z'); }
constexpr bool isPrinting(char c) { return c >= ' ' && c <= '~'; }

constexpr bool belongsToWord(char c) {
  return isLetter(c) || isDigit(c) || c == '_' || c == '-' || c == '\t';
}

constexpr bool belongsToQuoted(char c) { return (isPrinting(c) && c != '\'') || c == '\t'; }

}  // namespace

TokenReader::TokenReader(InputFile* file) : m_file(file), m_buffer(kBufferSize) {}

TokenReader::TokenReader(std::string_view text)
    : m_next(text.data()), m_limit(text.data() + text.size()) {}

bool TokenReader::refill() {
  if (m_file == nullptr) {
    return false;
  }
  // The last character read stays in front, so that it can be put back.
  m_buffer[0] = m_next == nullptr ? '\0' : *(m_next - 1);
  m_next = m_buffer.data() + 1;
  m_limit = m_next;
  const std::size_t count = m_file->read(m_buffer.data() + 1, kBufferSize - 1);
  if (count == 0) {
    return false;
  }
  m_limit = m_next + count;
  return true;
}

bool TokenReader::read(char* c) {
  if (m_next == m_limit && !refill()) {
    m_isAtEnd = true;
    return false;
  }
  *c = *m_next++;
  ++m_offset;
  if (*c == '\n') {
    m_previousLineStart = m_lineStart;
    m_lineStart = m_offset;
    ++m_line;
  }
  return true;
}

void TokenReader::putBack() {
  --m_next;
  --m_offset;
  if (*m_next == '\n') {
    m_lineStart = m_previousLineStart;
    --m_line;
  }
}

// Reads the first character of the next token.
bool TokenReader::skipToToken(char* c) {
  while (read(c)) {
    if (*c == '\n') {
      ++m_countedLine;
    } else if (*c == '#') {
      while (read(c) && *c != '\n') {
      }
      ++m_countedLine;
    } else if (*c != ' ' && *c != '\t') {
      return true;
    }
  }
  return false;
}

int TokenReader::lexan() {
  int token = TOKEN_END;
  char c = '\0';
  if (!m_isAtEnd && skipToToken(&c)) {
    m_position = {m_line, m_offset - m_lineStart};
    token = readToken(c);
  }
  if (token == TOKEN_END) {
    m_position = {m_line, m_offset - m_lineStart + 1};
  } else {
    m_current = token;
  }
  return token;
}

int TokenReader::readToken(char c) {
  if (isDigit(c)) {
    return readNumber(c);
  }
  if (isLetter(c) || c == '\'' || c == '-') {
    return readWord(c);
  }
  return static_cast<signed char>(c);
}

void TokenReader::match(int expected) {
  if (m_current == expected) {
    m_current = lexan();
  }
}

int TokenReader::readNumber(char c) {
  m_text.clear();
  do {
    m_text += c;
    if (!read(&c)) {
      return TOKEN_END;
    }
  } while (isDigit(c) || c == '.');
  while (c == ' ') {
    if (!read(&c)) {
      return TOKEN_END;
    }
  }
  if (c != '{') {
    putBack();
    return lookUp(TOKEN_NUMBER);
  }
  int token = TOKEN_NUMBER_BAD_LENGTH;
  do {
    m_text += c;
    if (!read(&c)) {
      return TOKEN_END;
    }
  } while (isDigit(c));
  if (c == '}' && m_text.back() != '{') {
    token = TOKEN_NUMBER_LENGTH;
    m_text += c;
    if (!read(&c)) {
      return TOKEN_END;
    }
  }
  putBack();
  return lookUp(token);
}

int TokenReader::readWord(char c) {
  if (c == '\'') {
    return readQuoted(c);
  }
  m_text.clear();
  while (belongsToWord(c)) {
    m_text += c;
    if (!read(&c)) {
      return TOKEN_END;
    }
  }
  putBack();
  return lookUp(TOKEN_NAME);
}

// What ended a quoted string is dropped, whatever it was.
int TokenReader::readQuoted(char c) {
  m_text.clear();
  bool isRead = read(&c);
  while (isRead && belongsToQuoted(c)) {
    m_text += c;
    isRead = read(&c);
  }
  if (!isRead) {
    noteBrokenString("the end of the file");
    return TOKEN_END;
  }
  if (c != '\'') {
    noteBrokenString(c == '\n' ? "the end of the line" : "the byte " + printable({c}));
  }
  if (!read(&c)) {
    return TOKEN_END;
  }
  putBack();
  return lookUp(TOKEN_NAME);
}

void TokenReader::noteBrokenString(const std::string& end) {
  if (m_brokenBy.empty()) {
    m_brokenString = m_position;
    m_brokenBy = end;
  }
}

bool TokenReader::takeBrokenString(Position* begin, std::string* end) {
  *begin = m_brokenString;
  *end = std::move(m_brokenBy);
  m_brokenBy.clear();
  return !end->empty();
}

// Quotes make no difference: a keyword in quotes is that keyword. A text that was stored last is
// the token that it was then, so that 1.2 behind '1.2' is a name.
int TokenReader::lookUp(int token) {
  m_longestText = std::max(m_longestText, m_text.size());
  m_textIsStored = false;
  if (m_hasStored && m_text == m_stored) {
    return m_storedToken;
  }
  const int keyword = keywordToken(m_text);
  if (keyword >= 0) {
    return keyword;
  }
  m_text.swap(m_stored);
  m_storedToken = token;
  m_hasStored = true;
  m_textIsStored = true;
  return token;
}
