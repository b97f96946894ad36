#include "EndlessInput.h"

#include <libschema/SchemaTokens.h>

#include "TokenReader.h"

namespace {

// What became of one definition.
enum class Outcome { kRead, kFailed, kNeverEnds };

constexpr bool startsDefinition(int token) {
  return token == KEY_ATTRIBUTETYPES || token == KEY_ORVATTRIBUTETYPES ||
         token == KEY_OBJECTCLASSES;
}

constexpr DefinitionKind kindOf(int token) {
  return token == KEY_ATTRIBUTETYPES  ? DefinitionKind::kAttributeType
         : token == KEY_OBJECTCLASSES ? DefinitionKind::kObjectClass
                                      : DefinitionKind::kVendorExtension;
}

constexpr bool endsAttributeNames(int token) {
  return token == KEY_DESC || token == KEY_SYNTAX || token == KEY_OBSOLETE || token == KEY_SUP ||
         token == KEY_USAGE || token == KEY_NO_USER_MODIFICATION || token == KEY_COLLECTIVE ||
         token == KEY_SINGLE_VALUE || token == KEY_SUBSTR || token == KEY_ORDERING ||
         token == KEY_EQUALITY;
}

constexpr bool endsClassNames(int token) {
  return token == KEY_DESC || token == KEY_STRUCTURAL || token == KEY_AUXILIARY ||
         token == KEY_ABSTRACT || token == KEY_OBSOLETE || token == KEY_SUP || token == KEY_MUST ||
         token == KEY_MAY;
}

constexpr bool endsDatabaseNames(int token) {
  return token == ')' || token == KEY_LENGTH || token == KEY_ACCESS_CLASS ||
         token == KEY_EQUALITY || token == KEY_APPROX || token == KEY_SUBSTR ||
         token == KEY_ORDERING || token == KEY_REVERSE;
}

constexpr bool belongsToList(int token) {
  return token == TOKEN_NAME || token == '$' || token == KEY_OBJECTCLASSES ||
         token == KEY_ATTRIBUTETYPES;
}

// A single byte that belongs to no word, but is neither a bracket nor any other printing character.
constexpr bool isStrayByte(int token) { return token < ' ' || token == '\x7f'; }

class Forecaster {
 public:
  Forecaster(TokenReader tokens, ForecastObserver* observer)
      : m_tokens(std::move(tokens)), m_observer(observer) {}

  Forecast run();

 private:
  Outcome readAfterKeyword(int keyword, int* token);
  Outcome readDefinition(DefinitionKind kind, const Position* keyword, bool isFirst);

  Outcome attributeType();
  Outcome attributeClause(int* token);
  Outcome objectClass();
  Outcome objectClassClause(int* token);
  Outcome vendorExtension();
  Outcome vendorExtensionClause(int* token);

  int next();
  int afterValue();
  int list();
  int oid();
  Outcome attributeNames(int* token);
  Outcome classNames(int* token);
  Outcome databaseNames(int* token, bool* isComplete);

  Outcome failed(const Position& position, const std::string& problem);
  Outcome notClosed(const std::string& what);
  Outcome neverEnds(const Position& position, const std::string& problem);
  void report(const Position& position, const std::string& problem);
  void reportBrokenString();
  void reportStrayByte(int token);
  std::string definition() const;

  TokenReader m_tokens;
  ForecastObserver* m_observer;
  Forecast m_forecast;

  // The definition that is being read.
  DefinitionKind m_kind = DefinitionKind::kAttributeType;
  Position m_begin;
  bool m_hasOid = false;
  bool m_isOdd = false;
  int m_previous = 0;
};

// Steps of the reader: text between definitions is passed over.
Forecast Forecaster::run() {
  int token = m_tokens.lexan();
  while (token != TOKEN_END) {
    if (!startsDefinition(token)) {
      token = m_tokens.lexan();
      reportBrokenString();
    } else if (readAfterKeyword(token, &token) != Outcome::kRead) {
      break;
    }
  }
  m_forecast.longestText = m_tokens.longestText();
  return m_forecast;
}

Outcome Forecaster::readAfterKeyword(int keyword, int* token) {
  const Position begin = m_tokens.position();
  const DefinitionKind kind = kindOf(keyword);
  const int opening = m_tokens.lexan();
  if (opening != '=' && opening != '{') {
    m_kind = kind;
    m_begin = begin;
    return failed(
        m_tokens.position(),
        std::string("neither \"=\" nor \"{\" stands behind the word that begins ") +
            (kind == DefinitionKind::kVendorExtension ? "a " : "an ") + nameOf(kind) +
            "; write \"=\" before a single definition, \"{\" before a block of them, or take the word away");
  }
  Outcome outcome = readDefinition(kind, opening == '=' ? &begin : nullptr, true);
  while (opening == '{' && outcome == Outcome::kRead && m_tokens.currentToken() != '}') {
    outcome = readDefinition(kind, nullptr, false);
  }
  *token = m_tokens.currentToken();
  return outcome;
}

// What every definition begins with: the token on which the reader stands is passed over, and "("
// if it comes next.
Outcome Forecaster::readDefinition(DefinitionKind kind, const Position* keyword, bool isFirst) {
  const Position before = m_tokens.position();
  m_tokens.match(m_tokens.currentToken());
  m_kind = kind;
  m_begin = keyword != nullptr ? *keyword : isFirst ? m_tokens.position() : before;
  m_tokens.match('(');
  m_hasOid = false;
  m_isOdd = false;
  m_previous = m_tokens.currentToken();
  const Outcome outcome = kind == DefinitionKind::kAttributeType ? attributeType()
                          : kind == DefinitionKind::kObjectClass ? objectClass()
                                                                 : vendorExtension();
  reportBrokenString();
  if (outcome == Outcome::kRead && m_observer != nullptr) {
    m_observer->definition(kind, m_begin);
  }
  m_isOdd = false;
  return outcome;
}

// ---- Attribute types ----

Outcome Forecaster::attributeType() {
  int token = m_tokens.currentToken();
  for (;;) {
    if (token == TOKEN_END || startsDefinition(token)) {
      return notClosed(token == TOKEN_END ? "the end of the file" : "another definition");
    }
    if (token == ')') {
      m_tokens.lexan();
      return Outcome::kRead;
    }
    if (token == '}') {
      return Outcome::kRead;
    }
    if (attributeClause(&token) == Outcome::kNeverEnds) {
      return Outcome::kNeverEnds;
    }
  }
}

Outcome Forecaster::attributeClause(int* token) {
  switch (*token) {
    case KEY_COLLECTIVE:
      return neverEnds(
          m_tokens.position(),
          "COLLECTIVE stands in " + definition() +
              "; the reader does not get past this word, so reading would never end; remove the word");
    case KEY_NAME:
      return attributeNames(token);
    case TOKEN_NUMBER:
    case TOKEN_NAME:
      *token = oid();
      return Outcome::kRead;
    case KEY_DESC:
    case KEY_SUP:
    case KEY_EQUALITY:
    case KEY_ORDERING:
    case KEY_SUBSTR:
    case KEY_SYNTAX:
    case KEY_USAGE:
      *token = afterValue();
      return Outcome::kRead;
    default:
      *token = next();
      return Outcome::kRead;
  }
}

// Goes on to one of the clause keywords that end it; the first token is not looked at.
Outcome Forecaster::attributeNames(int* token) {
  const Position clause = m_tokens.position();
  m_tokens.match(KEY_NAME);
  m_previous = m_tokens.currentToken();
  do {
    *token = next();
    if (*token == TOKEN_END) {
      return neverEnds(
          clause,
          "nothing ends the NAME clause of " + definition() +
              ": only another clause does, \")\" does not, and none follows to the end of the file, so reading would never end; put a clause behind the names, as in NAME 'a' USAGE userApplications )");
    }
  } while (!endsAttributeNames(*token));
  return Outcome::kRead;
}

// ---- Object classes ----

Outcome Forecaster::objectClass() {
  int token = m_tokens.currentToken();
  for (;;) {
    if (token == TOKEN_END || token == KEY_OBJECTCLASSES) {
      return notClosed(token == TOKEN_END ? "the end of the file" : "another object class");
    }
    if (token == ')') {
      m_tokens.lexan();
      return Outcome::kRead;
    }
    if (token == '}' || token == '(') {
      return Outcome::kRead;
    }
    const Outcome outcome = objectClassClause(&token);
    if (outcome != Outcome::kRead) {
      return outcome;
    }
  }
}

Outcome Forecaster::objectClassClause(int* token) {
  switch (*token) {
    case TOKEN_NUMBER_BAD_LENGTH:
      return failed(
          m_tokens.position(),
          "the length of the number \"" + printable(m_tokens.text()) + "\" in " + definition() +
              " is not complete; write digits and \"}\" behind the \"{\", or take the \"{\" away");
    case KEY_NAME:
      return classNames(token);
    case TOKEN_NUMBER:
    case TOKEN_NAME:
      *token = oid();
      return Outcome::kRead;
    case KEY_DESC:
      *token = afterValue();
      return Outcome::kRead;
    case KEY_SUP:
      *token = next();
      if (*token == '(') {
        m_tokens.match('(');
        *token = list();
      } else {
        reportStrayByte(*token);
        *token = next();
      }
      return Outcome::kRead;
    case KEY_MUST:
    case KEY_MAY:
      m_tokens.match(*token);
      m_tokens.match('(');
      *token = list();
      return Outcome::kRead;
    default:
      *token = next();
      return Outcome::kRead;
  }
}

// Goes on to one of the clause keywords that end it; the first token is looked at too.
Outcome Forecaster::classNames(int* token) {
  const Position clause = m_tokens.position();
  m_tokens.match(KEY_NAME);
  *token = m_tokens.currentToken();
  m_previous = *token;
  while (!endsClassNames(*token)) {
    if (*token == TOKEN_END) {
      return neverEnds(
          clause,
          "nothing ends the NAME clause of " + definition() +
              ": only DESC, OBSOLETE, SUP, the kind of the class, MUST or MAY does, \")\" does not, and none follows to the end of the file, so reading would never end; put the kind behind the names, as in NAME 'a' STRUCTURAL )");
    }
    *token = next();
  }
  return Outcome::kRead;
}

// The members of a list, and ")" if it comes next. Returns the token behind.
int Forecaster::list() {
  int token = m_tokens.currentToken();
  while (belongsToList(token)) {
    token = m_tokens.lexan();
  }
  if (token != ')') {
    reportStrayByte(token);
    m_previous = token;
    return token;
  }
  m_tokens.match(')');
  m_previous = m_tokens.currentToken();
  return m_previous;
}

// ---- Vendor extensions ----

Outcome Forecaster::vendorExtension() {
  int token = m_tokens.currentToken();
  for (;;) {
    if (token == TOKEN_END || token == KEY_ATTRIBUTETYPES) {
      return notClosed(token == TOKEN_END ? "the end of the file" : "an attribute type");
    }
    if (token == ')') {
      m_tokens.lexan();
      return Outcome::kRead;
    }
    if (token == '}') {
      return Outcome::kRead;
    }
    if (token != KEY_DBNAME) {
      vendorExtensionClause(&token);
      continue;
    }
    bool isComplete = false;
    if (databaseNames(&token, &isComplete) == Outcome::kNeverEnds) {
      return Outcome::kNeverEnds;
    }
    if (isComplete) {
      return Outcome::kRead;
    }
  }
}

Outcome Forecaster::vendorExtensionClause(int* token) {
  switch (*token) {
    case TOKEN_NUMBER:
    case TOKEN_NAME:
      *token = oid();
      return Outcome::kRead;
    case KEY_ACCESS_CLASS:
    case KEY_LENGTH:
      *token = afterValue();
      return Outcome::kRead;
    default:
      *token = next();
      return Outcome::kRead;
  }
}

// Goes on to ")" or a clause keyword. A "(" on a line below that ")" belongs to the next extension:
// this one is complete.
Outcome Forecaster::databaseNames(int* token, bool* isComplete) {
  const Position clause = m_tokens.position();
  m_tokens.match(KEY_DBNAME);
  *token = m_tokens.currentToken();
  m_previous = *token;
  while (!endsDatabaseNames(*token)) {
    if (*token == TOKEN_END) {
      return neverEnds(
          clause,
          "nothing ends the DBNAME list of " + definition() +
              ": neither \")\" nor another clause follows to the end of the file, so reading would never end; put \")\" behind the names");
    }
    *token = next();
  }
  if (*token == ')') {
    const std::uint64_t line = m_tokens.countedLine();
    *token = next();
    *isComplete = *token == '(' && m_tokens.countedLine() > line;
  }
  return Outcome::kRead;
}

// ---- Shared ----

// The next token. A definition that begins inside another one is an oddity.
int Forecaster::next() {
  const Position previous = m_tokens.position();
  const int token = m_tokens.lexan();
  if (startsDefinition(m_previous) && (token == '=' || token == '{')) {
    report(
        previous,
        "the " + std::string(nameOf(kindOf(m_previous))) +
            " that begins here is taken for a part of " + definition() +
            ", which nothing ends before, and is lost; close that one, and see that another clause follows its NAME clause");
  }
  m_previous = token;
  return token;
}

// The token behind a keyword's value, whatever the value is.
int Forecaster::afterValue() {
  reportStrayByte(next());
  return next();
}

// A bare word or number: the last one becomes the OID.
int Forecaster::oid() {
  if (m_hasOid) {
    report(
        m_tokens.position(),
        "\"" + printable(m_tokens.text()) + "\" takes the place of the OID of " + definition() +
            ": it stands where a clause begins and is no keyword that is known there; remove it");
  }
  m_hasOid = true;
  return next();
}

Outcome Forecaster::failed(const Position& position, const std::string& problem) {
  m_forecast = {Reading::kFails, position, problem, 0, m_begin};
  return Outcome::kFailed;
}

Outcome Forecaster::notClosed(const std::string& what) {
  return failed(m_tokens.position(), definition() + " is not closed: " + what +
                                         " comes before its \")\"; write \")\" at its end");
}

Outcome Forecaster::neverEnds(const Position& position, const std::string& problem) {
  m_forecast = {Reading::kNeverEnds, position, problem, 0, m_begin};
  return Outcome::kNeverEnds;
}

// Once for each definition, and for the text between two: what follows is mostly a consequence, and
// everything may be one of a string that was cut off.
void Forecaster::report(const Position& position, const std::string& problem) {
  reportBrokenString();
  if (m_observer != nullptr && !m_isOdd) {
    m_observer->oddity(position, problem);
  }
  m_isOdd = true;
}

void Forecaster::reportBrokenString() {
  Position begin;
  std::string end;
  if (m_tokens.takeBrokenString(&begin, &end)) {
    report(
        begin,
        "the text in quotes that begins here is cut off by " + end +
            ", since only printable ASCII characters and TABs belong to it; what stands behind is read as if it were outside, and definitions may get lost; write the text and its closing quote on one line, without other bytes");
  }
}

// `token` stands where a value, or another member of a list, is expected.
void Forecaster::reportStrayByte(int token) {
  if (isStrayByte(token)) {
    report(
        m_tokens.position(),
        "the byte " + printable({static_cast<char>(token)}) +
            " takes the place of a value, or of the rest of a list, in " + definition() +
            "; what stands behind gets lost or is taken for something else; take the byte away, or write the value on the line of its keyword");
  }
}

std::string Forecaster::definition() const {
  return "the " + std::string(nameOf(m_kind)) + " that begins in line " +
         std::to_string(m_begin.line);
}

}  // namespace

const char* nameOf(DefinitionKind kind) {
  switch (kind) {
    case DefinitionKind::kAttributeType:
      return "attribute type";
    case DefinitionKind::kObjectClass:
      return "object class";
    case DefinitionKind::kVendorExtension:
      break;
  }
  return "vendor extension";
}

Forecast foreseeReading(InputFile* file, ForecastObserver* observer) {
  return Forecaster(TokenReader(file), observer).run();
}

Forecast foreseeReading(std::string_view text, ForecastObserver* observer) {
  return Forecaster(TokenReader(text), observer).run();
}
