#include "ClauseShapes.h"

#include <algorithm>
#include <iterator>
#include <typeinfo>
#include <utility>

#include "PlacedLexan.h"

namespace libschema {

std::string textOf(SchemaLexan* lexer) {
  std::string text;
  lexer->getStringValue(lexer->getTokenValIndex(), text);
  return text;
}

int readValue(SchemaLexan* lexer, TokenSet accepted, std::string* value) {
  if (isOneOf(lexer->lexan(), accepted)) {
    lexer->getStringValue(lexer->getTokenValIndex(), *value);
  }
  return lexer->lexan();
}

int readList(SchemaLexan* lexer, std::vector<std::string>* list) {
  // Gathered with room to spare and moved in one piece: lists stay as long as the data is kept.
  constexpr std::size_t kUsual = 24;
  std::vector<std::string> members;
  members.reserve(kUsual);
  int token = lexer->getCurrentToken();
  while (isOneOf(token, {TOKEN_NAME, '$', KEY_OBJECTCLASSES, KEY_ATTRIBUTETYPES})) {
    if (token != '$') {
      members.push_back(textOf(lexer));
    }
    token = lexer->lexan();
  }
  list->insert(list->end(), std::make_move_iterator(members.begin()),
               std::make_move_iterator(members.end()));
  lexer->match(')');
  return token == ')' ? lexer->getCurrentToken() : token;
}

void spin(const SchemaLexan* lexer) {
  if (&typeid(*lexer) == &typeid(PlacedLexan)) {
    throw PlacedLexan::NeverCompletes();
  }
  static volatile int turns = 0;
  static_cast<void>(turns);
}

DistinctNames::DistinctNames(std::vector<std::string>* names)
    : m_names(names), m_index(ByName{names}) {}

bool DistinctNames::isNew(const std::string& name) const {
  return std::find(m_names->begin(), m_names->end(), name) == m_names->end();
}

void DistinctNames::add(std::string name) {
  constexpr std::size_t kShort = 12;
  if (m_names->size() < kShort) {
    if (isNew(name)) {
      m_names->push_back(std::move(name));
    }
    return;
  }
  for (std::size_t i = m_index.size(); i < m_names->size(); ++i) {
    m_index.insert(i);
  }
  m_names->push_back(std::move(name));
  if (!m_index.insert(m_names->size() - 1).second) {
    m_names->pop_back();
  }
}

void appendSpaced(const std::vector<std::string>& values, std::string* text) {
  for (const std::string& value : values) {
    text->append(value).append(" ");
  }
}

void appendJoined(const std::vector<std::string>& values, std::string_view separator,
                  std::string* text) {
  bool isFirst = true;
  for (const std::string& value : values) {
    if (!isFirst) {
      text->append(separator);
    }
    isFirst = false;
    text->append(value);
  }
}

void writeLine(const std::string& line, std::ofstream& out) {
  out.write(line.data(), static_cast<std::streamsize>(line.size()));
  out.flush();
}

std::string reportEntry(const std::string& oid, const std::vector<std::string>& names) {
  std::string entry = "OID --> " + oid + "\nName --> ";
  appendJoined(names, ", ", &entry);
  entry += "\n\n";
  return entry;
}

}  // namespace libschema
