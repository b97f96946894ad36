#include "Definition.h"

#include <libschema/Attribute.h>
#include <libschema/ORVAttribute.h>
#include <libschema/ObjectClass.h>

#include "Inventory.h"

namespace {

void appendLine(DefinitionKind kind, ORVSchema* object, std::string* text) {
  switch (kind) {
    case DefinitionKind::kAttributeType:
      return static_cast<Attribute*>(object)->appendLine(text);
    case DefinitionKind::kObjectClass:
      return static_cast<ObjectClass*>(object)->appendLine(text);
    case DefinitionKind::kVendorExtension:
      return static_cast<ORVAttribute*>(object)->appendLine(text);
  }
}

}  // namespace

Digest digestOfLine(DefinitionKind kind, ORVSchema* object, std::string* line) {
  line->clear();
  appendLine(kind, object, line);
  line->pop_back();
  Digest digest;
  digest.add(*line);
  return digest;
}

bool isEqual(const Definition& definition, const Definition& other) {
  ORVSchema* object = definition.object.get();
  ORVSchema* reference = other.object.get();
  switch (definition.kind) {
    case DefinitionKind::kAttributeType:
      return static_cast<Attribute*>(object)->attrsEqual(*static_cast<Attribute*>(reference)) != 0;
    case DefinitionKind::kObjectClass:
      return static_cast<ObjectClass*>(object)->objsEqual(*static_cast<ObjectClass*>(reference));
    case DefinitionKind::kVendorExtension:
      break;
  }
  return static_cast<ORVAttribute*>(object)->orvAttrsEqual(*static_cast<ORVAttribute*>(reference));
}

std::string describe(const Definition& definition) {
  std::string text = nameOf(definition.kind);
  if (!definition.firstName.empty()) {
    text += " " + printable(definition.firstName);
  }
  return text + (definition.oid.empty() ? " (no OID)" : " (" + printable(definition.oid) + ")");
}

std::string placeOf(const Definition& definition) {
  return placeOf(definition.inventory->pathOf(definition.file), definition.line);
}
