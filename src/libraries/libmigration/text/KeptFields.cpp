#include "KeptFields.h"

#include <libschema/SchemaTokens.h>

namespace migration {

KeptFields::KeptFields(const KeptDefinition& definition) {
  setText(Clause::kOid, definition.object->oidInPlace());
  switch (definition.kind) {
    case Kind::kAttributeType:
      takeAttribute(definition.attribute());
      break;
    case Kind::kObjectClass:
      takeClass(definition.objectClass());
      break;
    case Kind::kVendorExtension:
      takeExtension(definition.extension());
      break;
  }
}

void KeptFields::takeAttribute(const Attribute& attribute) {
  setList(Clause::kName, attribute.namesInPlace());
  setText(Clause::kDesc, attribute.descriptionInPlace());
  setFlag(Clause::kObsolete, attribute.getObsolete());
  setList(Clause::kSup, attribute.superiorsInPlace());
  setText(Clause::kEquality, attribute.getEquality());
  setText(Clause::kOrdering, attribute.getOrdering());
  setText(Clause::kSubstr, attribute.getSubstr());
  setText(Clause::kSyntax, attribute.getSyntax());
  setFlag(Clause::kSingleValue, attribute.getSingleValue());
  setFlag(Clause::kCollective, attribute.getCollective());
  setFlag(Clause::kNoUserModification, !attribute.getUserModification());
  setText(Clause::kUsage, attribute.getUsage());
}

void KeptFields::takeClass(const ObjectClass& objectClass) {
  setList(Clause::kName, objectClass.namesInPlace());
  setText(Clause::kDesc, objectClass.descriptionInPlace());
  setFlag(Clause::kObsolete, objectClass.getObsolete());
  setList(Clause::kSup, objectClass.superiorsInPlace());
  const int type = objectClass.getStructuralType();
  setFlag(Clause::kStructural, type == KEY_STRUCTURAL);
  setFlag(Clause::kAuxiliary, type == KEY_AUXILIARY);
  setFlag(Clause::kAbstract, type == KEY_ABSTRACT);
  setList(Clause::kMust, objectClass.reqAttrsInPlace());
  setList(Clause::kMay, objectClass.optAttrsInPlace());
}

void KeptFields::takeExtension(const ORVAttribute& extension) {
  setList(Clause::kDbName, extension.getDbNames());
  setText(Clause::kAccessClass, extension.getAccessClass());
  setText(Clause::kLength, extension.getLength());
  setFlag(Clause::kEquality, extension.hasEquality());
  setFlag(Clause::kOrdering, extension.hasOrdering());
  setFlag(Clause::kSubstr, extension.hasSubstr());
  setFlag(Clause::kApprox, extension.hasApprox());
  setFlag(Clause::kReverse, extension.hasReverse());
}

const char* KeptFields::valueWithout(Clause clause) {
  switch (clause) {
    case Clause::kUsage:
      return "userApplications";
    case Clause::kAccessClass:
      return "normal";
    case Clause::kLength:
      return "0";
    default:
      return "";
  }
}

}  // namespace migration
