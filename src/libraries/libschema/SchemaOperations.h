// The three operations between two managers, for one kind of definition at a time, and what each
// kind gives for them. Internal: included by .cpp files only.

#ifndef LIBSCHEMA_SCHEMA_OPERATIONS_H
#define LIBSCHEMA_SCHEMA_OPERATIONS_H

#include <string>
#include <string_view>

#include "SchemaManager.h"
#include "TracePoints.h"

struct SchemaManager::Operations {
  // What one kind of definition gives: its tables, the look-up by its keys with that one's trace
  // point, and the key of a definition.
  template <typename Definition>
  struct Kind;

  template <typename Definition>
  static void compare(SchemaManager* self, SchemaManager* reference);
  template <typename Definition>
  static bool merge(SchemaManager* self, SchemaManager* source);
  template <typename Definition>
  static void check(SchemaManager* self, SchemaManager* reference);

  template <typename Definition>
  static void replace(SchemaManager* self, typename Table<Definition>::iterator place,
                      const std::string& key, Definition* moved);
  static OidSet* findFileSet(SchemaManager* self, SchemaManager* source, const std::string& oid);
  static bool isKey(const SchemaManager& reference, std::string_view oid);
  template <typename Definition>
  static std::string report(const char* noneText, const char* heading,
                            const Table<Definition>& table);

  // What makes them fast.
  template <typename Definition>
  class Walk;
  class FileSetRemovals;
  template <typename Definition>
  class Additions;
  class OidErasures;
};

template <>
struct SchemaManager::Operations::Kind<Attribute> {
  using LookUp = tracepoint::GetAttr;
  static constexpr bool kIsKeyedByName = true;
  static constexpr bool kPrunesReference = true;
  static constexpr Table<Attribute> SchemaManager::*kTable = &SchemaManager::attrTable;
  static constexpr Table<Attribute> SchemaManager::*kOidTable = &SchemaManager::attrOidTable;
  static const Attribute* lookUp(const SchemaManager& manager, const std::string& key) {
    return manager.lookUpAttr(key);
  }
  static std::string keyOf(const Attribute& definition) { return definition.firstNameLower(); }
};

template <>
struct SchemaManager::Operations::Kind<ObjectClass> {
  using LookUp = tracepoint::GetObjClass;
  static constexpr bool kIsKeyedByName = true;
  static constexpr bool kPrunesReference = false;
  static constexpr Table<ObjectClass> SchemaManager::*kTable = &SchemaManager::ocTable;
  static constexpr Table<ObjectClass> SchemaManager::*kOidTable = &SchemaManager::ocOidTable;
  static const ObjectClass* lookUp(const SchemaManager& manager, const std::string& key) {
    return manager.lookUpObjClass(key);
  }
  static std::string keyOf(const ObjectClass& definition) { return definition.firstNameLower(); }
};

// Vendor extensions are keyed by OID. Dropping one in a comparison leaves every file set as it is.
template <>
struct SchemaManager::Operations::Kind<ORVAttribute> {
  using LookUp = tracepoint::GetORVAttr;
  static constexpr bool kIsKeyedByName = false;
  static constexpr bool kPrunesReference = false;
  static constexpr Table<ORVAttribute> SchemaManager::*kTable = &SchemaManager::orvAttrTable;
  static const ORVAttribute* lookUp(const SchemaManager& manager, const std::string& key) {
    return manager.lookUpORVAttr(key);
  }
  static const std::string& keyOf(const ORVAttribute& definition) {
    return definition.oidInPlace();
  }
};

#endif  // LIBSCHEMA_SCHEMA_OPERATIONS_H
