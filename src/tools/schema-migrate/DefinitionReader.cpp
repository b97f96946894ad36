#include "DefinitionReader.h"

#include <libschema/Attribute.h>
#include <libschema/ORVAttribute.h>
#include <libschema/ObjectClass.h>
#include <libschema/SchemaLexan.h>
#include <libschema/SchemaTokens.h>

namespace {

template <typename Object>
bool readOne(SchemaLexan* lexer, DefinitionKind kind, bool isInBlock, const DefinitionTaker& take) {
  auto object = std::make_unique<Object>();
  if (!object->parse(lexer)) {
    return false;
  }
  take(kind, isInBlock, std::move(object));
  return true;
}

// What follows the keyword of a definition.
template <typename Object>
bool readForm(SchemaLexan* lexer, DefinitionKind kind, const DefinitionTaker& take) {
  const int opening = lexer->lexan();
  if (opening == '=') {
    return readOne<Object>(lexer, kind, false, take);
  }
  if (opening != '{') {
    return false;
  }
  do {
    if (!readOne<Object>(lexer, kind, true, take)) {
      return false;
    }
  } while (lexer->getCurrentToken() != '}');
  return true;
}

}  // namespace

bool readDefinitions(const std::string& directory, const std::string& fileName,
                     const DefinitionTaker& take) {
  SchemaLexan lexer(directory, fileName);
  if (!lexer.fileIsOpen()) {
    return false;
  }
  int token = lexer.lexan();
  while (token != TOKEN_END) {
    bool isRead = true;
    if (token == KEY_ATTRIBUTETYPES) {
      isRead = readForm<Attribute>(&lexer, DefinitionKind::kAttributeType, take);
    } else if (token == KEY_OBJECTCLASSES) {
      isRead = readForm<ObjectClass>(&lexer, DefinitionKind::kObjectClass, take);
    } else if (token == KEY_ORVATTRIBUTETYPES) {
      isRead = readForm<ORVAttribute>(&lexer, DefinitionKind::kVendorExtension, take);
    } else {
      token = lexer.lexan();
      continue;
    }
    if (!isRead) {
      return false;
    }
    token = lexer.getCurrentToken();
  }
  return true;
}
