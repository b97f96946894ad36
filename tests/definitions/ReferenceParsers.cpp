#include "ReferenceParsers.h"

#include <algorithm>
#include <initializer_list>

#include "SchemaTokens.h"
#include "Tokens.h"

namespace definitions {

namespace {

bool isOneOf(int token, std::initializer_list<int> tokens) {
  return std::find(tokens.begin(), tokens.end(), token) != tokens.end();
}

std::string quotedEach(const std::vector<std::string>& values) {
  std::string text;
  for (const std::string& value : values) {
    text += "'" + value + "' ";
  }
  return text;
}

std::string joined(const std::vector<std::string>& values, const std::string& separator) {
  std::string text;
  for (std::size_t i = 0; i < values.size(); ++i) {
    text += (i == 0 ? "" : separator) + values[i];
  }
  return text;
}

std::string unlessEmpty(const std::string& value, const std::string& head,
                        const std::string& tail) {
  return value.empty() ? "" : head + value + tail;
}

std::string when(bool isSet, const std::string& text) { return isSet ? text : ""; }

}  // namespace

std::vector<RecordedToken> recordTokens(SchemaLexan* lexer) {
  std::vector<RecordedToken> tokens;
  do {
    const int code = lexer->lexan();
    tokens.push_back({code, support::currentText(lexer), lexer->getLineNumber()});
  } while (tokens.back().code != TOKEN_END);
  return tokens;
}

std::vector<RecordedToken> recordTokens(const std::string& text) {
  support::LexedText input(text);
  return recordTokens(&input.lexer());
}

int TokenTape::lexan() {
  m_read = std::min(m_read + 1, m_tokens.size());
  const int code = m_tokens[m_read - 1].code;
  if (code != TOKEN_END) {
    m_current = code;
  }
  return code;
}

void TokenTape::match(int expected) {
  if (m_current == expected) {
    m_current = lexan();
  }
}

std::string TokenTape::rest() const {
  std::string text;
  for (std::size_t i = std::min(m_read, m_tokens.size() - 1); i < m_tokens.size(); ++i) {
    const RecordedToken& token = m_tokens[i];
    text += (text.empty() ? "" : " ") + std::to_string(token.code);
    if (isOneOf(token.code,
                {TOKEN_NAME, TOKEN_NUMBER, TOKEN_NUMBER_LENGTH, TOKEN_NUMBER_BAD_LENGTH})) {
      text += ":" + token.text;
    }
  }
  return text;
}

// ---- Attribute types ----

int ReferenceAttribute::parse(TokenTape* lexer) {
  lexer->match(lexer->current());
  lexer->match('(');
  int token = lexer->current();
  while (!isOneOf(
      token, {TOKEN_END, KEY_ORVATTRIBUTETYPES, KEY_OBJECTCLASSES, KEY_ATTRIBUTETYPES, ')', '}'})) {
    if (!readClause(lexer, &token)) {
      return kEndless;
    }
  }
  if (token == ')') {
    lexer->lexan();
    return 1;
  }
  return token == '}' ? 1 : 0;
}

// Returns false when the clause never completes.
bool ReferenceAttribute::readClause(TokenTape* lexer, int* token) {
  const auto readValue = [&](std::initializer_list<int> kinds, std::string* value) {
    if (isOneOf(lexer->lexan(), kinds)) {
      *value = lexer->text();
    }
  };
  std::string superior;
  switch (*token) {
    case TOKEN_NUMBER:
    case TOKEN_NAME:
      m_oid = lexer->text();
      break;
    case KEY_NAME:
      return readNames(lexer, token);
    case KEY_DESC:
      readValue({TOKEN_NAME}, &m_description);
      break;
    case KEY_OBSOLETE:
      m_obsolete = true;
      break;
    case KEY_SUP:
      if (isOneOf(lexer->lexan(), {TOKEN_NUMBER, TOKEN_NAME})) {
        m_superiors.push_back(lexer->text());
      }
      break;
    case KEY_EQUALITY:
      readValue({TOKEN_NUMBER, TOKEN_NAME}, &m_equality);
      break;
    case KEY_ORDERING:
      readValue({TOKEN_NUMBER, TOKEN_NAME}, &m_ordering);
      break;
    case KEY_SUBSTR:
      readValue({TOKEN_NUMBER, TOKEN_NAME}, &m_substr);
      break;
    case KEY_SYNTAX:
      readValue({TOKEN_NUMBER, TOKEN_NUMBER_LENGTH, TOKEN_NAME}, &m_syntax);
      break;
    case KEY_SINGLE_VALUE:
      m_singleValue = true;
      break;
    case KEY_NO_USER_MODIFICATION:
      m_userModification = false;
      break;
    case KEY_USAGE:
      readValue({TOKEN_NAME}, &m_usage);
      break;
    case KEY_COLLECTIVE:
      return false;  // no further token is read, so that the clause is met again and again
    default:
      break;
  }
  *token = lexer->lexan();
  return true;
}

bool ReferenceAttribute::readNames(TokenTape* lexer, int* token) {
  lexer->match(KEY_NAME);
  *token = lexer->current();
  do {
    if (isOneOf(*token, {TOKEN_NAME, KEY_OBJECTCLASSES, KEY_ATTRIBUTETYPES}) &&
        std::find(m_names.begin(), m_names.end(), lexer->text()) == m_names.end()) {
      m_names.push_back(lexer->text());
    }
    *token = lexer->lexan();
    if (*token == TOKEN_END) {
      return false;
    }
  } while (!isOneOf(
      *token, {KEY_DESC, KEY_SYNTAX, KEY_OBSOLETE, KEY_SUP, KEY_USAGE, KEY_NO_USER_MODIFICATION,
               KEY_COLLECTIVE, KEY_SINGLE_VALUE, KEY_SUBSTR, KEY_ORDERING, KEY_EQUALITY}));
  return true;
}

std::string ReferenceAttribute::line() const {
  return "attributetypes=( " + m_oid + " NAME ( " + quotedEach(m_names) + " ) " +
         unlessEmpty(m_description, " DESC '", "' ") + when(m_obsolete, "OBSOLETE ") +
         when(!m_superiors.empty(), "SUP " + joined(m_superiors, " ") + " ") +
         unlessEmpty(m_equality, "EQUALITY ", " ") + unlessEmpty(m_ordering, "ORDERING ", " ") +
         unlessEmpty(m_substr, "SUBSTR ", " ") + unlessEmpty(m_syntax, "SYNTAX ", " ") +
         when(m_singleValue, "SINGLE-VALUE ") + when(!m_userModification, "NO-USER-MODIFICATION ") +
         unlessEmpty(m_usage, "USAGE ", " ") + " )\n";
}

// ---- Object classes ----

int ReferenceObjectClass::parse(TokenTape* lexer) {
  lexer->match(lexer->current());
  lexer->match('(');
  int token = lexer->current();
  while (!isOneOf(token, {TOKEN_END, KEY_OBJECTCLASSES, ')', '}', '(', TOKEN_NUMBER_BAD_LENGTH})) {
    if (!readClause(lexer, &token)) {
      return kEndless;
    }
  }
  if (token == ')') {
    lexer->lexan();
    return 1;
  }
  return token == '}' || token == '(' ? 1 : 0;
}

bool ReferenceObjectClass::readClause(TokenTape* lexer, int* token) {
  switch (*token) {
    case TOKEN_NAME:
    case TOKEN_NUMBER:
      m_oid = lexer->text();
      break;
    case KEY_NAME:
      lexer->match(KEY_NAME);
      *token = lexer->current();
      while (!isOneOf(*token, {KEY_DESC, KEY_STRUCTURAL, KEY_AUXILIARY, KEY_ABSTRACT, KEY_OBSOLETE,
                               KEY_SUP, KEY_MUST, KEY_MAY})) {
        if (*token == TOKEN_END) {
          return false;
        }
        if (*token == TOKEN_NAME) {
          m_names.push_back(lexer->text());
        }
        *token = lexer->lexan();
      }
      return true;
    case KEY_DESC:
      if (lexer->lexan() == TOKEN_NAME) {
        m_description = lexer->text();
      }
      break;
    case KEY_STRUCTURAL:
      m_kind = "STRUCTURAL";
      break;
    case KEY_ABSTRACT:
      m_kind = "ABSTRACT";
      break;
    case KEY_AUXILIARY:
      m_kind = "AUXILIARY";
      break;
    case KEY_OBSOLETE:
      m_obsolete = true;
      break;
    case KEY_SUP:
      *token = lexer->lexan();
      if (*token == '(') {
        lexer->match('(');
        *token = readList(lexer, &m_superiors);
        return true;
      }
      if (*token == TOKEN_NAME) {
        m_superiors.push_back(lexer->text());
      }
      break;
    case KEY_MUST:
    case KEY_MAY:
      lexer->match(*token);
      lexer->match('(');
      *token = readList(lexer, *token == KEY_MUST ? &m_required : &m_optional);
      return true;
    default:
      break;
  }
  *token = lexer->lexan();
  return true;
}

int ReferenceObjectClass::readList(TokenTape* lexer, std::vector<std::string>* list) {
  int token = lexer->current();
  while (isOneOf(token, {TOKEN_NAME, '$', KEY_OBJECTCLASSES, KEY_ATTRIBUTETYPES})) {
    if (token != '$') {
      list->push_back(lexer->text());
    }
    token = lexer->lexan();
  }
  if (token == ')') {
    lexer->match(')');
    token = lexer->current();
  }
  return token;
}

std::string ReferenceObjectClass::line() const {
  const std::string names = quotedEach(m_names);
  return "objectclasses=( " + m_oid +
         (m_names.size() > 1 ? " NAME ( " + names + " ) " : " NAME " + names) +
         unlessEmpty(m_description, " DESC '", "' ") + when(m_obsolete, "OBSOLETE ") +
         when(!m_superiors.empty(), "SUP ( " + joined(m_superiors, " $ ") + " ) ") + m_kind + " " +
         when(!m_required.empty(), "MUST ( " + joined(m_required, " $ ") + " ) ") +
         when(!m_optional.empty(), "MAY ( " + joined(m_optional, " $ ") + " ) ") + ")\n";
}

// ---- Vendor extensions ----

int ReferenceORVAttribute::parse(TokenTape* lexer) {
  lexer->match(lexer->current());
  lexer->match('(');
  int token = lexer->current();
  m_ended = false;
  while (!isOneOf(token, {TOKEN_END, KEY_ATTRIBUTETYPES, ')', '}'}) && !(m_ended && token == '(')) {
    if (!readClause(lexer, &token)) {
      return kEndless;
    }
  }
  if (token == ')') {
    lexer->lexan();
    return 1;
  }
  return m_ended || token == '}' ? 1 : 0;
}

bool ReferenceORVAttribute::readClause(TokenTape* lexer, int* token) {
  switch (*token) {
    case TOKEN_NUMBER:
    case TOKEN_NAME:
      m_oid = lexer->text();
      break;
    case KEY_DBNAME:
      return readDatabaseNames(lexer, token);
    case KEY_ACCESS_CLASS:
      lexer->lexan();
      m_access = lexer->text();
      break;
    case KEY_LENGTH:
      lexer->lexan();
      m_length = lexer->text();
      break;
    case KEY_EQUALITY:
      m_equality = true;
      break;
    case KEY_ORDERING:
      m_ordering = true;
      break;
    case KEY_SUBSTR:
      m_substr = true;
      break;
    case KEY_APPROX:
      m_approx = true;
      break;
    case KEY_REVERSE:
      m_reverse = true;
      break;
    default:
      break;
  }
  *token = lexer->lexan();
  return true;
}

bool ReferenceORVAttribute::readDatabaseNames(TokenTape* lexer, int* token) {
  lexer->match(KEY_DBNAME);
  *token = lexer->current();
  while (!isOneOf(*token, {')', KEY_LENGTH, KEY_ACCESS_CLASS, KEY_EQUALITY, KEY_APPROX, KEY_SUBSTR,
                           KEY_ORDERING, KEY_REVERSE})) {
    if (*token == TOKEN_END) {
      return false;
    }
    if (isOneOf(*token,
                {TOKEN_NAME, KEY_OBJECTCLASSES, KEY_ATTRIBUTETYPES, KEY_ORVATTRIBUTETYPES})) {
      m_databaseNames.push_back(lexer->text());
    }
    *token = lexer->lexan();
  }
  if (*token == ')') {
    const int closedOn = lexer->line();
    *token = lexer->lexan();
    m_ended = *token == '(' && lexer->line() > closedOn;
  }
  return true;
}

std::string ReferenceORVAttribute::line() const {
  return "ORVAttributetypes=( " + m_oid + " " +
         when(!m_databaseNames.empty(), "DBNAME ( " + quotedEach(m_databaseNames) + " ) ") +
         unlessEmpty(m_access, "ACCESS-CLASS ", " ") +
         when(m_length != "0", "LENGTH " + m_length + " ") + when(m_equality, "EQUALITY ") +
         when(m_ordering, "ORDERING ") + when(m_substr, "SUBSTR ") + when(m_approx, "APPROX ") +
         when(m_reverse, "REVERSE ") + ")\n";
}

}  // namespace definitions
