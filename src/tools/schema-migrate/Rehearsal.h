// A migration made on references to definitions, before it is made on the definitions: withdrawal,
// comparison and merge as the library does them. What the merge could not do, or could do only by
// losing a definition of OLD or removing another one of NEW, is a refusal, and is left out of the
// rest.

#ifndef SCHEMA_MIGRATE_REHEARSAL_H
#define SCHEMA_MIGRATE_REHEARSAL_H

#include <cstddef>
#include <set>
#include <string>
#include <vector>

#include "Definition.h"
#include "Inventory.h"
#include "Tables.h"

// What became of a definition.
enum class Fate {
  kStays,      // of NEW: it stays; of OLD: it is in no table that is compared and merged
  kWithdrawn,  // this one and those that follow: of OLD
  kExcluded,
  kSame,      // NEW defines it alike
  kAdded,     // NEW lacks it
  kReplaces,  // it comes in the place of NEW's
  kRefused,
  kReplaced,  // of NEW: OLD's comes in its place
};

struct OidLists {
  std::set<std::string> excluded;
  std::set<std::string> withdrawn;
};

// A value for each definition of both installations.
template <typename Value>
class PerDefinition {
 public:
  PerDefinition(const Inventory& oldOne, const Inventory& newOne)
      : m_oldOne(&oldOne),
        m_ofOld(oldOne.definitions().size()),
        m_ofNew(newOne.definitions().size()) {}

  Value& operator[](const Definition& definition) {
    return (definition.inventory == m_oldOne ? m_ofOld : m_ofNew)[definition.index];
  }

 private:
  const Inventory* m_oldOne;
  std::vector<Value> m_ofOld;
  std::vector<Value> m_ofNew;
};

struct Refusal {
  const Definition* definition;
  std::string reason;  // with what to do about it
};

class Rehearsal {
 public:
  // The inventories need their objects, and must stay in place.
  Rehearsal(const Inventory& oldOne, const Inventory& newOne);

  void run(const OidLists& lists);

  const Tables& oldTables() const { return m_old; }
  const Tables& newTables() const { return m_new; }
  Fate fateOf(const Definition& definition) { return m_fates[definition]; }
  const std::vector<Refusal>& refusals() const { return m_refusals; }

  // Frees the tables, which are empty from then on.
  void releaseTables();

 private:
  void withdraw(const std::set<std::string>& oids);
  void compare(DefinitionKind kind, const std::set<std::string>& excluded);
  void merge(DefinitionKind kind);
  void replace(const Definition& moved, const Definition& named);
  void add(const Definition& moved);
  void refuse(const Definition& definition, const std::string& reason);

  const Inventory& m_oldOne;
  Tables m_old;
  Tables m_new;
  PerDefinition<Fate> m_fates;
  std::vector<Refusal> m_refusals;
};

#endif  // SCHEMA_MIGRATE_REHEARSAL_H
