// The tables and OID sets that a schema manager has after reading an installation, with references
// to the inventory's definitions in place of its own. On them a run is worked out before it is
// made.

#ifndef SCHEMA_MIGRATE_TABLES_H
#define SCHEMA_MIGRATE_TABLES_H

#include <array>
#include <cstddef>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "Definition.h"
#include "Inventory.h"

// The two kinds that are keyed by name, and indexed by OID.
constexpr std::array<DefinitionKind, 2> kNamedKinds = {DefinitionKind::kAttributeType,
                                                       DefinitionKind::kObjectClass};

class Tables {
 public:
  using Table = std::unordered_map<std::string_view, const Definition*>;

  Tables() = default;

  // Every table keeps the first definition under a key. The inventory must stay in place.
  explicit Tables(const Inventory& inventory);

  // What comparison and merge walk over, by kind: attribute types and object classes by lower-cased
  // first name, vendor extensions by OID.
  Table& walked(DefinitionKind kind) { return m_walked[static_cast<std::size_t>(kind)]; }
  const Definition* walkedAt(DefinitionKind kind, std::string_view key) const;

  // Attribute types and object classes by OID.
  Table& byOid(DefinitionKind kind) { return m_byOid[static_cast<std::size_t>(kind)]; }
  const Definition* atOid(DefinitionKind kind, std::string_view oid) const;

  // The key of a definition among those of its kind that are walked over.
  static std::string_view keyOf(const Definition& definition);

  // What the manager's look-up of an attribute type or object class finds: a name before an OID.
  const Definition* lookUp(DefinitionKind kind, const std::string& key) const;

  // The walked definitions of a kind in the order of their keys.
  std::vector<const Definition*> inOrder(DefinitionKind kind) const;

  // Takes the OID out of the first of the six merged file sets that holds it.
  void dropFromFileSets(const std::string& oid);

  // The first of the six that holds the OID, or kNoSchemaFile.
  std::size_t fileSetOf(const std::string& oid) const;

  void addToFileSet(std::size_t file, const std::string& oid);

  // An OID and the files of the seven whose sets hold it.
  struct FiledOid {
    std::string_view oid;
    unsigned files;
    bool isIn(std::size_t file) const { return (files >> file & 1U) != 0; }
  };

  // Every OID that is in a set, in no order.
  std::vector<FiledOid> filedOids() const;

  // The definitions that are written for an OID: none, one, or an attribute type and its extension.
  std::array<const Definition*, 2> writtenFor(std::string_view oid) const;

  // The definition of the same kind that came earlier in the reading under the same key, or the
  // same OID, and for which this one was not entered there; null when it was entered.
  const Definition* earlierByKey(const Definition& read) const {
    return m_earlier[read.index].byKey;
  }
  const Definition* earlierByOid(const Definition& read) const {
    return m_earlier[read.index].byOid;
  }

 private:
  struct Earlier {
    const Definition* byKey = nullptr;
    const Definition* byOid = nullptr;
  };

  void enter(const Definition& definition);

  std::array<Table, 3> m_walked;
  std::array<Table, 2> m_byOid;
  std::unordered_map<std::string_view, unsigned> m_sets;  // a bit for each file
  std::vector<Earlier> m_earlier;                         // by the index of a definition read
};

#endif  // SCHEMA_MIGRATE_TABLES_H
