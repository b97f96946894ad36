#include "ReferenceLexer.h"

#include <cstddef>

namespace {

constexpr int kName = 259;
constexpr int kEnd = 260;
constexpr int kNumber = 2024;
constexpr int kNumberLength = 2025;
constexpr int kNumberBadLength = 2026;
constexpr std::size_t kScratch = 25;

bool isDigit(char c) { return c >= '0' && c <= '9'; }
bool isLetter(char c) { return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z'); }
bool isPunctuation(char c) { return c > ' ' && c <= '~' && !isDigit(c) && !isLetter(c); }

}  // namespace

ReferenceLexer::ReferenceLexer(const std::string& path)
    : m_in(path, std::ios_base::in),
      m_symbols{{"objectclasses", 1002},
                {"NAME", 1003},
                {"DESC", 1004},
                {"SUP", 1005},
                {"AUXILIARY", 1006},
                {"MUST", 1007},
                {"MAY", 1008},
                {"STRUCTURAL", 1009},
                {"attributetypes", 1010},
                {"EQUALITY", 1011},
                {"SYNTAX", 1012},
                {"SINGLE-VALUE", 1013},
                {"USAGE", 1014},
                {"NO-USER-MODIFICATION", 1015},
                {"ORVAttributetypes", 1016},
                {"ACCESS-CLASS", 1017},
                {"DBNAME", 1018},
                {"SUBSTR", 1019},
                {"REVERSE", 1026},
                {"ORDERING", 1020},
                {"COLLECTIVE", 1021},
                {"OBSOLETE", 1022},
                {"ABSTRACT", 1023},
                {"LENGTH", 1024},
                {"APPROX", 1025}} {
  m_in >> std::noskipws;
}

// False when the read did not advance: a failed read leaves no position.
bool ReferenceLexer::readNext() {
  const std::streamoff before = m_position;
  m_in >> m_c;
  m_position = m_in.tellg();
  return m_position != before && m_position != -1;
}

int ReferenceLexer::endBetweenTokens() {
  m_index = -1;
  return kEnd;
}

int ReferenceLexer::lexan() {
  m_position = m_in.tellg();
  if (m_in.eof()) {
    return kEnd;
  }
  for (;;) {
    if (!readNext()) {
      return endBetweenTokens();
    }
    if (m_c == '\n') {
      if (m_in.eof()) {
        return endBetweenTokens();
      }
      ++m_line;
    } else if (m_c == '#') {
      while (readNext() && m_c != '\n') {
      }
      ++m_line;
    } else if (m_c != ' ' && m_c != '\t') {
      break;
    }
  }
  if (isDigit(m_c)) {
    return number();
  }
  if (isLetter(m_c) || m_c == '\'' || m_c == '-') {
    return word();
  }
  if (m_in.eof()) {
    return kEnd;
  }
  m_index = -1;
  m_current = static_cast<signed char>(m_c);
  return m_current;
}

int ReferenceLexer::number() {
  std::string text;
  while (isDigit(m_c) || m_c == '.') {
    if (m_in.eof()) {
      break;
    }
    text += m_c;
    if (!readNext()) {
      break;
    }
  }
  while (m_c == ' ' && !m_in.eof()) {
    readNext();
  }
  int token = kNumber;
  if (!m_in.eof() && m_c == '{') {
    token = kNumberBadLength;
    text += '{';
    readNext();
    if (isDigit(m_c)) {
      while (isDigit(m_c)) {
        text += m_c;
        if (!readNext()) {
          break;
        }
      }
      if (m_c == '}') {
        token = kNumberLength;
        text += '}';
        readNext();
      }
    }
  }
  if (m_in.eof()) {
    return kEnd;
  }
  m_in.putback(m_c);
  const int index = indexOf(text);
  return index >= 0 ? found(index) : store(text, token);
}

int ReferenceLexer::word() {
  const bool isQuoted = m_c == '\'';
  std::string text;
  if (isQuoted) {
    readNext();
  }
  while (isLetter(m_c) || isDigit(m_c) || m_c == '_' || m_c == '-' || m_c == '\t' ||
         (isQuoted && (m_c == ' ' || (isPunctuation(m_c) && m_c != '\'')))) {
    if (m_in.eof()) {
      break;
    }
    text += m_c;
    if (!readNext()) {
      break;
    }
  }
  if (isQuoted) {
    readNext();
  }
  if (m_in.eof()) {
    return kEnd;
  }
  m_in.putback(m_c);
  int index = indexOf(text);
  if (index < 0 && text == "objectClasses") {
    index = indexOf("objectclasses");
  } else if (index < 0 && text == "attributeTypes") {
    index = indexOf("attributetypes");
  } else if (index < 0 && text == "ORVattributeTypes") {
    index = indexOf("ORVAttributetypes");
  }
  return index >= 0 ? found(index) : store(text, kName);
}

int ReferenceLexer::found(int index) {
  m_index = index;
  m_current = m_symbols[static_cast<std::size_t>(index)].token;
  return m_current;
}

int ReferenceLexer::indexOf(const std::string& text) const {
  for (std::size_t i = 0; i < m_symbols.size(); ++i) {
    if (m_symbols[i].text == text) {
      return static_cast<int>(i);
    }
  }
  return -1;
}

int ReferenceLexer::store(const std::string& text, int token) {
  m_symbols.resize(kScratch);
  m_symbols.push_back({text, token});
  return found(static_cast<int>(kScratch));
}

void ReferenceLexer::match(int expected) {
  if (m_current == expected) {
    m_current = lexan();
  }
}

std::string ReferenceLexer::text() const {
  return m_index < 0 ? "" : m_symbols[static_cast<std::size_t>(m_index)].text;
}
