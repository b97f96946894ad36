#include "ORVAttribute.h"

#include <ostream>
#include <utility>

#include "CaseFolding.h"
#include "ClauseShapes.h"
#include "StandardOutput.h"
#include "TracePoints.h"

using libschema::isOneOf;

namespace {

// The values of an entry without the clause, there before any static object is constructed.
constexpr char accessClass[] = "normal";
constexpr char kNoLength[] = "0";

// What ends DBNAME. The end of the input does not.
bool endsDatabaseNames(int token) {
  return isOneOf(token, {')', KEY_LENGTH, KEY_ACCESS_CLASS, KEY_EQUALITY, KEY_APPROX, KEY_SUBSTR,
                         KEY_ORDERING, KEY_REVERSE});
}

// What ends an entry. Its own keyword does not: an entry that lacks its ")" runs on into the next
// one, whose OID replaces its own.  ORVAttributeParse.RunsOnIntoTheNextEntry.
bool endsEntry(int token) { return isOneOf(token, {')', '}', TOKEN_END, KEY_ATTRIBUTETYPES}); }

// Takes any token's text as the value: a single character has none, so that the value becomes
// empty. ORVAttributeParse.ValueBeforeTheClosingParenthesisBecomesEmpty.
int readAnyValue(SchemaLexan* lexer, std::string* value) {
  lexer->lexan();
  *value = libschema::textOf(lexer);
  return lexer->lexan();
}

int setFlag(SchemaLexan* lexer, bool* flag) {
  *flag = true;
  return lexer->lexan();
}

}  // namespace

ORVAttribute::ORVAttribute() : access(accessClass), length(kNoLength) {}

ORVAttribute::~ORVAttribute() = default;

// ORVAttributetypes=( OID
//   DBNAME names  ACCESS-CLASS value  LENGTH value  EQUALITY  ORDERING  SUBSTR  APPROX  REVERSE )
// in any order, each any number of times.
bool ORVAttribute::parse(SchemaLexan* lexer) {
  tracepoint::ORVAttributeParse trace;
  lexer->match(lexer->getCurrentToken());
  lexer->match('(');
  int token = lexer->getCurrentToken();
  bool isComplete = false;
  while (!isComplete && !endsEntry(token)) {
    token =
        token == KEY_DBNAME ? parseDatabaseNames(lexer, &isComplete) : parseClause(lexer, token);
  }
  if (token == ')') {
    lexer->lexan();
    return true;
  }
  return isComplete || token == '}';
}

// Reads one clause other than DBNAME and returns the token behind it.
int ORVAttribute::parseClause(SchemaLexan* lexer, int token) {
  switch (token) {
    case TOKEN_NUMBER:
    case TOKEN_NAME:
      // A bare word or number at clause level is the OID; the last one wins.
      OID = libschema::textOf(lexer);
      return lexer->lexan();
    case KEY_ACCESS_CLASS:
      return readAnyValue(lexer, &access);
    case KEY_LENGTH:
      return readAnyValue(lexer, &length);
    case KEY_EQUALITY:
      return setFlag(lexer, &equality);
    case KEY_ORDERING:
      return setFlag(lexer, &ordering);
    case KEY_SUBSTR:
      return setFlag(lexer, &substr);
    case KEY_APPROX:
      return setFlag(lexer, &approx);
    case KEY_REVERSE:
      return setFlag(lexer, &reverse);
    default:
      return lexer->lexan();
  }
}

// Reads the names, and the ")" that ends their list. When the token behind that is a "(" on a later
// line, the next entry of a block begins there: this one is complete without a ")" of its own.
// ORVAttributeParse.ListThatEndsTheLineEndsTheEntry, ORVAttributeParse.ListAtTheEndNeverCompletes.
int ORVAttribute::parseDatabaseNames(SchemaLexan* lexer, bool* isComplete) {
  lexer->match(KEY_DBNAME);
  int token = lexer->getCurrentToken();
  while (!endsDatabaseNames(token)) {
    if (isOneOf(token,
                {TOKEN_NAME, KEY_OBJECTCLASSES, KEY_ATTRIBUTETYPES, KEY_ORVATTRIBUTETYPES})) {
      dbNames.push_back(libschema::textOf(lexer));
    }
    if (token == TOKEN_END) {
      libschema::spin(lexer);
    }
    token = lexer->lexan();
  }
  if (token == ')') {
    const int lineOfList = lexer->getLineNumber();
    token = lexer->lexan();
    const int lineOfToken = lexer->getLineNumber();
    *isComplete = token == '(' && lineOfToken > lineOfList;
  }
  return token;
}

// The order of the clauses, and every blank, belongs to the file format.
void ORVAttribute::composeLine(std::string* text) const {
  constexpr std::size_t kLiterals = 130;
  libschema::Line line(text, kLiterals + OID.size() + access.size() + length.size() +
                                 libschema::Line::roomOf(dbNames));
  line.add("ORVAttributetypes=( ").add(OID).add(" ");
  if (!dbNames.empty()) {
    line.add("DBNAME ( ").addQuoted(dbNames).add(" ) ");
  }
  line.addValue("ACCESS-CLASS ", access);
  if (length != kNoLength) {
    line.add("LENGTH ").add(length).add(" ");
  }
  line.addIf(equality, "EQUALITY ");
  line.addIf(ordering, "ORDERING ");
  line.addIf(substr, "SUBSTR ");
  line.addIf(approx, "APPROX ");
  line.addIf(reverse, "REVERSE ");
  line.add(")\n");
}

void ORVAttribute::appendLine(std::string* text) const {
  tracepoint::ORVAttributeWrite trace;
  composeLine(text);
}

void ORVAttribute::dump(std::ofstream& out) {
  tracepoint::ORVAttributeWrite trace;
  std::string line;
  composeLine(&line);
  libschema::writeLine(line, out);
}

void ORVAttribute::dump() {
  tracepoint::ORVAttributePrint trace;
  std::string text = "oid --> " + OID + "\naccessClass --> " + access + "\nlength --> " + length;
  const auto appendFlag = [&](const char* label, bool flag) {
    text.append(label).append(libschema::yesOrNo(flag));
  };
  appendFlag("\nequality --> ", equality);
  appendFlag("\nordering --> ", ordering);
  appendFlag("\nsubstr --> ", substr);
  appendFlag("\napprox --> ", approx);
  appendFlag("\nreverse --> ", reverse);
  text += "\nnames--> ";
  libschema::appendSpaced(dbNames, &text);
  text += "\n";
  libschema::standardOutput() << text << std::flush;
}

bool ORVAttribute::orvAttrsEqual(const ORVAttribute& other) { return isEqualTo(other); }

bool ORVAttribute::isEqualTo(const ORVAttribute& other) const {
  tracepoint::ORVAttributeOrvAttrsEqual trace;
  return OID == other.OID && access == other.access && equality == other.equality &&
         ordering == other.ordering && substr == other.substr && approx == other.approx &&
         reverse == other.reverse && length == other.length &&
         dbNames.size() == other.dbNames.size() && libschema::hasPartners(dbNames, other.dbNames);
}

std::string ORVAttribute::convert(std::string s) { return libschema::lowered(std::move(s)); }

std::string ORVAttribute::getOidAndName() { return libschema::reportEntry(OID, dbNames); }
