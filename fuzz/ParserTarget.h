// The parser of one kind of definition over any bytes, against a second one that works on recorded
// tokens. The bytes are taken for what stands in a block: behind the keyword of the kind and "{".

#ifndef LIBSCHEMA_FUZZ_PARSER_TARGET_H
#define LIBSCHEMA_FUZZ_PARSER_TARGET_H

#include <fstream>
#include <string>
#include <utility>
#include <vector>

#include "Attribute.h"
#include "ORVAttribute.h"
#include "ObjectClass.h"
#include "ReferenceParsers.h"
#include "Target.h"

namespace fuzz {

inline std::vector<definitions::RecordedToken> record(SchemaLexan* lexer) {
  std::vector<definitions::RecordedToken> tokens;
  do {
    const int code = lexer->lexan();
    std::string text;
    lexer->getStringValue(lexer->getTokenValIndex(), text);
    tokens.push_back({code, text, lexer->getLineNumber()});
  } while (tokens.back().code != TOKEN_END);
  return tokens;
}

inline bool areEqual(const Attribute& left, const Attribute& right) {
  return left.isEqualTo(right);
}
inline bool areEqual(const ObjectClass& left, const ObjectClass& right) {
  return left.isEqualTo(right);
}
inline bool areEqual(const ORVAttribute& left, const ORVAttribute& right) {
  return left.isEqualTo(right);
}

// What holds for every definition, whatever was read.
template <typename Definition>
void checkDefinition(Definition* definition, const std::string& line) {
  const Definition copy = *definition;
  Definition assigned;
  assigned = copy;
  require(areEqual(*definition, copy) && areEqual(assigned, *definition), "a copy is not equal");
  require(definition->getOid() == definition->oidInPlace(), "getOid()");
  require(definition->getNames() == definition->namesInPlace(), "getNames()");
  requireEqual(definition->convert(definition->getFirstName()), definition->getFirstNameLower(),
               "getFirstNameLower()");
  require(definition->getOidAndName().find("OID --> " + definition->getOid() + "\nName --> ") == 0,
          "getOidAndName()");
  const std::string path = folder() + "/line";
  std::ofstream out(path);
  definition->dump(out);
  out.close();
  requireEqual(line, read(path), "dump(std::ofstream&)");
  definition->dump();
}

template <typename Definition, typename Reference>
void parseBlock(const std::string& keyword, const std::string& text) {
  const std::string block = keyword + "{" + text;
  if (neverEnds(block)) {
    return;
  }
  constexpr char kFile[] = "V3.user.at";
  write(kFile, block);
  std::vector<definitions::RecordedToken> tokens;
  {
    SchemaLexan lexer(folder(), kFile);
    tokens = record(&lexer);
  }
  definitions::TokenTape tape(std::move(tokens));
  SchemaLexan lexer(folder(), kFile);
  for (int i = 0; i < 2; ++i) {
    requireEqual(std::to_string(tape.lexan()), std::to_string(lexer.lexan()), "lexan()");
  }
  int result = 1;
  while (result == 1 && tape.current() != '}') {
    Definition definition;
    Reference reference;
    result = reference.parse(&tape);
    requireEqual(std::to_string(result), definition.parse(&lexer) ? "1" : "0", "result");
    std::string line;
    definition.appendLine(&line);
    requireEqual(reference.line(), line, "line");
    requireEqual(std::to_string(tape.current()), std::to_string(lexer.getCurrentToken()),
                 "current token");
    requireEqual(std::to_string(tape.line()), std::to_string(lexer.getLineNumber()), "line number");
    checkDefinition(&definition, line);
  }
}

}  // namespace fuzz

#endif  // LIBSCHEMA_FUZZ_PARSER_TARGET_H
