#include "ObjectClass.h"

#include <ostream>
#include <utility>

#include "CaseFolding.h"
#include "ClauseShapes.h"
#include "StandardOutput.h"
#include "TracePoints.h"

using libschema::isOneOf;
using libschema::readValue;

namespace {

// What ends NAME. Neither ")" nor the end of the input does.
bool endsNames(int token) {
  return isOneOf(token, {KEY_DESC, KEY_STRUCTURAL, KEY_AUXILIARY, KEY_ABSTRACT, KEY_OBSOLETE,
                         KEY_SUP, KEY_MUST, KEY_MAY});
}

// What ends an object class without a further look at it.
bool endsDefinition(int token) {
  return isOneOf(token, {')', '}', '(', TOKEN_END, KEY_OBJECTCLASSES, TOKEN_NUMBER_BAD_LENGTH});
}

// Reads a single name and a list of names alike, repeated ones too; whatever is no name is passed
// over. The first token after NAME is tested already, so that a class without names reads back. At
// the end of the input the loop does not end. ObjectClassParse.NameFollowedByItsKindHasNoNames,
// ObjectClassParse.NameAtTheEndNeverCompletes.
int readNames(SchemaLexan* lexer, std::vector<std::string>* names) {
  lexer->match(KEY_NAME);
  int token = lexer->getCurrentToken();
  while (!endsNames(token)) {
    if (token == TOKEN_NAME) {
      names->push_back(libschema::textOf(lexer));
    }
    if (token == TOKEN_END) {
      libschema::spin(lexer);
    }
    token = lexer->lexan();
  }
  return token;
}

// SUP takes one name, or a list in parentheses.
int readSuperiors(SchemaLexan* lexer, std::vector<std::string>* superiors) {
  const int token = lexer->lexan();
  if (token == '(') {
    lexer->match('(');
    return libschema::readList(lexer, superiors);
  }
  if (token == TOKEN_NAME) {
    superiors->push_back(libschema::textOf(lexer));
  }
  return lexer->lexan();
}

// MUST and MAY take a list; its "(" may be missing.
int readAttributes(SchemaLexan* lexer, int keyword, std::vector<std::string>* attributes) {
  lexer->match(keyword);
  lexer->match('(');
  return libschema::readList(lexer, attributes);
}

const char* kindName(int structuralType) {
  switch (structuralType) {
    case KEY_AUXILIARY:
      return "AUXILIARY";
    case KEY_ABSTRACT:
      return "ABSTRACT";
    default:
      return "STRUCTURAL";
  }
}

void addList(const char* opening, const std::vector<std::string>& values, libschema::Line* line) {
  if (!values.empty()) {
    line->add(opening).addJoined(values, " $ ").add(" ) ");
  }
}

}  // namespace

ObjectClass::ObjectClass() = default;

ObjectClass::~ObjectClass() = default;

// objectclasses=( OID
//   NAME names  DESC name  OBSOLETE  SUP name or list  STRUCTURAL | AUXILIARY | ABSTRACT
//   MUST list  MAY list )
// in any order, each any number of times.
bool ObjectClass::parse(SchemaLexan* lexer) {
  tracepoint::ObjectClassParse trace;
  lexer->match(lexer->getCurrentToken());
  lexer->match('(');
  int token = lexer->getCurrentToken();
  while (!endsDefinition(token)) {
    token = parseClause(lexer, token);
  }
  if (token == ')') {
    lexer->lexan();
    return true;
  }
  return token == '}' || token == '(';
}

// Reads one clause and returns the token behind it.
int ObjectClass::parseClause(SchemaLexan* lexer, int token) {
  switch (token) {
    case TOKEN_NAME:
    case TOKEN_NUMBER:
      // A bare word or number at clause level is the OID; the last one wins.
      OID = libschema::textOf(lexer);
      return lexer->lexan();
    case KEY_NAME:
      return readNames(lexer, &names);
    case KEY_DESC:
      return readValue(lexer, {TOKEN_NAME}, &description);
    case KEY_STRUCTURAL:
    case KEY_ABSTRACT:
    case KEY_AUXILIARY:
      structuralType = token;
      return lexer->lexan();
    case KEY_OBSOLETE:
      obsolete = true;
      return lexer->lexan();
    case KEY_SUP:
      return readSuperiors(lexer, &superiors);
    case KEY_MUST:
      return readAttributes(lexer, KEY_MUST, &reqAttrs);
    case KEY_MAY:
      return readAttributes(lexer, KEY_MAY, &optAttrs);
    default:
      return lexer->lexan();
  }
}

// The order of the clauses, and every blank, belongs to the file format.
void ObjectClass::composeLine(std::string* text) const {
  constexpr std::size_t kLiterals = 120;
  libschema::Line line(
      text, kLiterals + OID.size() + description.size() + libschema::Line::roomOf(names) +
                libschema::Line::roomOf(superiors) + libschema::Line::roomOf(reqAttrs) +
                libschema::Line::roomOf(optAttrs));
  const bool isList = names.size() > 1;
  line.add("objectclasses=( ").add(OID).add(isList ? " NAME ( " : " NAME ");
  line.addQuoted(names).addIf(isList, " ) ");
  line.addValue(" DESC '", description, "' ");
  line.addIf(obsolete, "OBSOLETE ");
  addList("SUP ( ", superiors, &line);
  line.add(kindName(structuralType)).add(" ");
  addList("MUST ( ", reqAttrs, &line);
  addList("MAY ( ", optAttrs, &line);
  line.add(")\n");
}

void ObjectClass::appendLine(std::string* text) const {
  tracepoint::ObjectClassWrite trace;
  composeLine(text);
}

void ObjectClass::dump(std::ofstream& out) {
  tracepoint::ObjectClassWrite trace;
  std::string line;
  composeLine(&line);
  libschema::writeLine(line, out);
}

void ObjectClass::dump() {
  tracepoint::ObjectClassPrint trace;
  std::string text = "\n\noid --> " + OID + "\nnames --> ";
  libschema::appendSpaced(names, &text);
  text += "\ndescription --> " + description + "\nsuperior --> ";
  libschema::appendSpaced(superiors, &text);
  text.append("\nstructural type --> ").append(kindName(structuralType));
  text.append("\nObsolete --> ").append(libschema::yesOrNo(obsolete));
  text += "\nrequired Attrs --> ";
  libschema::appendSpaced(reqAttrs, &text);
  text += "\noptional Attrs --> ";
  libschema::appendSpaced(optAttrs, &text);
  text += "\n\n\n";
  libschema::standardOutput() << text << std::flush;
}

bool ObjectClass::objsEqual(const ObjectClass& other) { return isEqualTo(other); }

bool ObjectClass::isEqualTo(const ObjectClass& other) const {
  tracepoint::ObjectClassObjsEqual trace;
  return OID == other.OID && description == other.description && obsolete == other.obsolete &&
         structuralType == other.structuralType && names.size() == other.names.size() &&
         libschema::hasPartners(names, other.names) && reqAttrs.size() == other.reqAttrs.size() &&
         optAttrs.size() == other.optAttrs.size() && superiors.size() == other.superiors.size() &&
         libschema::hasPartners(optAttrs, other.optAttrs) &&
         libschema::hasPartners(reqAttrs, other.reqAttrs) &&
         libschema::hasPartners(superiors, other.superiors);
}

std::string ObjectClass::getOid() { return OID; }

std::string ObjectClass::getDescription() { return description; }

std::vector<std::string> ObjectClass::getSuperior() { return superiors; }

std::string ObjectClass::getFirstName() { return names.empty() ? std::string() : names.front(); }

std::vector<std::string> ObjectClass::getNames() { return names; }

std::string ObjectClass::getFirstNameLower() { return firstNameLower(); }

std::vector<std::string> ObjectClass::getReqAttrs() { return reqAttrs; }

std::vector<std::string> ObjectClass::getOptAttrs() { return optAttrs; }

const char* ObjectClass::getStructuralTypeName() const { return kindName(structuralType); }

std::string ObjectClass::convert(std::string s) { return libschema::lowered(std::move(s)); }

std::string ObjectClass::getOidAndName() { return libschema::reportEntry(OID, names); }
