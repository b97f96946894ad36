#include "Attribute.h"

#include <ostream>
#include <utility>

#include "CaseFolding.h"
#include "ClauseShapes.h"
#include "StandardOutput.h"
#include "TracePoints.h"

using libschema::isOneOf;
using libschema::readValue;

namespace {

// The values of USAGE. A definition without the clause has the first; what a file gives is not
// checked against them. They are there before any static object is constructed.
constexpr char userApps[] = "userApplications";
[[maybe_unused]] constexpr char dirOp[] = "directoryOperation";
[[maybe_unused]] constexpr char disOp[] = "distributedOperation";
[[maybe_unused]] constexpr char dsaOp[] = "dSAOperation";

// What ends an attribute type: the end of the input and the keyword of any definition are failures.
bool endsDefinition(int token) {
  return isOneOf(
      token, {')', '}', TOKEN_END, KEY_ORVATTRIBUTETYPES, KEY_OBJECTCLASSES, KEY_ATTRIBUTETYPES});
}

// What ends NAME. Neither ")" nor the end of the input does.
bool endsNames(int token) {
  return isOneOf(token,
                 {KEY_DESC, KEY_SYNTAX, KEY_OBSOLETE, KEY_SUP, KEY_USAGE, KEY_NO_USER_MODIFICATION,
                  KEY_COLLECTIVE, KEY_SINGLE_VALUE, KEY_SUBSTR, KEY_ORDERING, KEY_EQUALITY});
}

// Reads a single name and a list of names alike: whatever is no name is passed over. The first
// token after NAME is taken untested, and ")" does not end the clause, so a definition that closes
// after its names reads on into the next one; at the end of the input the loop does not end.
// AttributeParse.NameReadsOnIntoTheNextDefinition, AttributeParse.NameAtTheEndNeverCompletes.
int readNames(SchemaLexan* lexer, libschema::DistinctNames* names) {
  lexer->match(KEY_NAME);
  int token = lexer->getCurrentToken();
  do {
    if (isOneOf(token, {TOKEN_NAME, KEY_OBJECTCLASSES, KEY_ATTRIBUTETYPES})) {
      names->add(libschema::textOf(lexer));
    }
    token = lexer->lexan();
    if (token == TOKEN_END) {
      libschema::spin(lexer);
    }
  } while (!endsNames(token));
  return token;
}

// Each SUP adds one value, a repeated one too.
int readSuperior(SchemaLexan* lexer, std::vector<std::string>* superiors) {
  if (isOneOf(lexer->lexan(), {TOKEN_NUMBER, TOKEN_NAME})) {
    superiors->push_back(libschema::textOf(lexer));
  }
  return lexer->lexan();
}

}  // namespace

Attribute::Attribute() : usage(userApps) {}

Attribute::~Attribute() = default;

// attributetypes=( OID
//   NAME names  DESC name  OBSOLETE  SUP value  EQUALITY value  ORDERING value  SUBSTR value
//   SYNTAX value  SINGLE-VALUE  COLLECTIVE  NO-USER-MODIFICATION  USAGE name )
// in any order, each any number of times.
int Attribute::parse(SchemaLexan* lexer) {
  tracepoint::AttributeParse trace;
  libschema::DistinctNames distinctNames(&names);
  lexer->match(lexer->getCurrentToken());
  lexer->match('(');
  int token = lexer->getCurrentToken();
  while (!endsDefinition(token)) {
    token = token == KEY_NAME ? readNames(lexer, &distinctNames) : parseClause(lexer, token);
  }
  if (token == ')') {
    lexer->lexan();
    return trace.status(1);
  }
  return trace.status(token == '}' ? 1 : 0);
}

// Reads one clause other than NAME and returns the token behind it.
int Attribute::parseClause(SchemaLexan* lexer, int token) {
  switch (token) {
    case TOKEN_NUMBER:
    case TOKEN_NAME:
      // A bare word or number at clause level is the OID and the last one wins, so an unknown
      // keyword and its value replace it.  AttributeParse.UnknownWordReplacesOid.
      OID = libschema::textOf(lexer);
      return lexer->lexan();
    case KEY_DESC:
      return readValue(lexer, {TOKEN_NAME}, &description);
    case KEY_OBSOLETE:
      isObsolete = true;
      return lexer->lexan();
    case KEY_SUP:
      return readSuperior(lexer, &superiors);
    case KEY_EQUALITY:
      return readValue(lexer, {TOKEN_NUMBER, TOKEN_NAME}, &equality);
    case KEY_ORDERING:
      return readValue(lexer, {TOKEN_NUMBER, TOKEN_NAME}, &ordering);
    case KEY_SUBSTR:
      return readValue(lexer, {TOKEN_NUMBER, TOKEN_NAME}, &substr);
    case KEY_SYNTAX:
      return readValue(lexer, {TOKEN_NUMBER, TOKEN_NUMBER_LENGTH, TOKEN_NAME}, &syntax);
    case KEY_SINGLE_VALUE:
      singleValue = KEY_SINGLE_VALUE;
      return lexer->lexan();
    case KEY_NO_USER_MODIFICATION:
      isUserModifiable = false;
      return lexer->lexan();
    case KEY_USAGE:
      return readValue(lexer, {TOKEN_NAME}, &usage);
    case KEY_COLLECTIVE:
      // No further token is read: the loop meets COLLECTIVE again, for ever.
      // AttributeParse.CollectiveNeverCompletes.
      isCollective = true;
      libschema::spin(lexer);
      return token;
    default:
      return lexer->lexan();
  }
}

// The order of the clauses, and every blank, belongs to the file format.
void Attribute::composeLine(std::string* text) const {
  constexpr std::size_t kLiterals = 200;
  libschema::Line line(text, kLiterals + OID.size() + description.size() + equality.size() +
                                 ordering.size() + substr.size() + syntax.size() + usage.size() +
                                 libschema::Line::roomOf(names) +
                                 libschema::Line::roomOf(superiors));
  line.add("attributetypes=( ").add(OID).add(" NAME ( ").addQuoted(names).add(" ) ");
  line.addValue(" DESC '", description, "' ");
  line.addIf(isObsolete, "OBSOLETE ");
  if (!superiors.empty()) {
    line.add("SUP ").addJoined(superiors, " ").add(" ");
  }
  line.addValue("EQUALITY ", equality);
  line.addValue("ORDERING ", ordering);
  line.addValue("SUBSTR ", substr);
  line.addValue("SYNTAX ", syntax);
  line.addIf(singleValue == KEY_SINGLE_VALUE, "SINGLE-VALUE ");
  line.addIf(isCollective, "COLLECTIVE ");
  line.addIf(!isUserModifiable, "NO-USER-MODIFICATION ");
  line.addValue("USAGE ", usage);
  line.add(" )\n");
}

void Attribute::appendLine(std::string* text) const {
  tracepoint::AttributeWrite trace;
  composeLine(text);
}

void Attribute::dump(std::ofstream& out) {
  tracepoint::AttributeWrite trace;
  std::string line;
  composeLine(&line);
  libschema::writeLine(line, out);
}

void Attribute::dump() {
  tracepoint::AttributePrint trace;
  std::string text = "oid --> " + OID + "\nnames --> ";
  libschema::appendSpaced(names, &text);
  text += "\ndescription --> " + description + "\nequality --> " + equality + "\nsyntax --> " +
          syntax + "\nordering --> " + ordering + "\nsubstr --> " + substr + "\nsuperior --> ";
  libschema::appendSpaced(superiors, &text);
  text += "\nusage --> " + usage + "\n";
  libschema::standardOutput() << text << std::flush;
}

int Attribute::attrsEqual(const Attribute& other) { return isEqualTo(other) ? 1 : 0; }

bool Attribute::isEqualTo(const Attribute& other) const {
  tracepoint::AttributeAttrsEqual trace;
  const bool isEqual =
      OID == other.OID && description == other.description && equality == other.equality &&
      usage == other.usage && syntax == other.syntax && ordering == other.ordering &&
      substr == other.substr && singleValue == other.singleValue &&
      isObsolete == other.isObsolete && isCollective == other.isCollective &&
      isUserModifiable == other.isUserModifiable && names.size() == other.names.size() &&
      superiors.size() == other.superiors.size() && libschema::hasPartners(names, other.names) &&
      libschema::hasPartners(superiors, other.superiors);
  return trace.status(isEqual ? 1 : 0) != 0;
}

std::string Attribute::getOid() { return OID; }

std::string Attribute::getDescription() { return description; }

std::vector<std::string> Attribute::getSuperior() { return superiors; }

std::string Attribute::getFirstName() { return names.empty() ? std::string() : names.front(); }

std::vector<std::string> Attribute::getNames() { return names; }

std::string Attribute::getFirstNameLower() { return firstNameLower(); }

std::string Attribute::getSyntaxOid() const { return syntax.substr(0, syntax.find('{')); }

std::string Attribute::getSyntaxLength() const {
  const std::size_t brace = syntax.find('{');
  return brace == std::string::npos || syntax.back() != '}'
             ? std::string()
             : syntax.substr(brace + 1, syntax.size() - brace - 2);
}

bool Attribute::getSingleValue() const { return singleValue == KEY_SINGLE_VALUE; }

std::string Attribute::convert(std::string s) { return libschema::lowered(std::move(s)); }

std::string Attribute::getOidAndName() { return libschema::reportEntry(OID, names); }
