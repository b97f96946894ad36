// The operations between two managers: comparison, merge, collision check, and the reports of the
// last.

#include <algorithm>
#include <iterator>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "AscendingLookup.h"
#include "CaseFolding.h"
#include "SchemaManager.h"
#include "TracePoints.h"

using libschema::AscendingLookup;

// What the operations share, for one kind of definition at a time. A look-up that a rule names
// leaves its trace records also where its answer is known without it.
struct SchemaManager::Operations {
  template <typename Definition>
  struct Kind;

  template <typename Definition>
  using Table = typename Kind<Definition>::Table;
  template <typename Definition>
  using Iterator = typename Table<Definition>::iterator;

  // Whether the key of an entry is what its definition gives for one: the first name in lower case,
  // or the OID, in which the key itself lies.
  class NameKeyTest {
   public:
    bool operator()(const std::string& key, const ORVSchema& definition) const {
      const std::vector<std::string>& names = definition.namesInPlace();
      return names.empty() ? key.empty() : m_lowerCase.isFormOf(key, names.front());
    }

   private:
    libschema::LowerCase m_lowerCase;
  };
  struct OidKeyTest {
    bool operator()(std::string_view /*key*/, const ORVSchema& /*definition*/) const {
      return true;
    }
  };

  // A definition met on a walk over a table: what the kind's look-up finds under the key of the
  // entry, and the key that this definition gives, which is the entry's own unless the locale has
  // changed.
  template <typename Definition>
  struct Met {
    const Definition& definition;
    const std::string& key;
    bool isOwnKey;
  };

  template <typename Definition>
  class Walk {
   public:
    using Entry = typename Table<Definition>::value_type;

    Walk(const SchemaManager& manager, Table<Definition>* references)
        : m_manager(manager), m_references(*references), m_inReference(*references) {}

    Met<Definition> meet(const Entry& entry) {
      using Rules = Kind<Definition>;
      if (m_isKeyOf(entry.first, *entry.second)) {
        typename Rules::LookUp trace;
        return {*entry.second, Rules::keyAt(entry), true};
      }
      const Definition& definition = orNew(Rules::lookUp(m_manager, std::string(entry.first)));
      m_key = Rules::keyOf(definition);
      return {definition, m_key, false};
    }

    // What the reference has under the key of a definition met; null when it has nothing.
    const Definition* findInReference(const Met<Definition>& met) {
      const auto found = met.isOwnKey ? m_inReference.find(met.key) : m_references.find(met.key);
      return found == m_references.end() ? nullptr : found->second;
    }

   private:
    const SchemaManager& m_manager;
    Table<Definition>& m_references;
    AscendingLookup<Table<Definition>> m_inReference;
    typename Kind<Definition>::KeyTest m_isKeyOf;
    std::string m_key;  // one that differs from its entry's
  };

  // A look-up whose answer is known already.
  template <typename Definition>
  static const Definition* answerOf(const Definition* definition) {
    typename Kind<Definition>::LookUp trace;
    return definition;
  }

  // An absent definition reads as a newly constructed one.
  template <typename Definition>
  static const Definition& orNew(const Definition* definition) {
    static const Definition kNew;
    return definition == nullptr ? kNew : *definition;
  }

  // Entries to erase once a walk is over.
  template <typename Definition>
  class Erasures {
   public:
    // `key` is what the definition found under the entry gives; it can differ from the entry's own.
    void add(const Iterator<Definition>& entry, const std::string& key) {
      if (entry->first == key) {
        m_entries.push_back(entry);
      } else {
        m_keys.push_back(key);
      }
    }

    void apply(Table<Definition>* table) const {
      if (m_entries.size() == table->size()) {
        table->clear();
        return;
      }
      for (const auto& entry : m_entries) {
        table->erase(entry);
      }
      for (const std::string& key : m_keys) {
        table->erase(key);
      }
    }

   private:
    std::vector<Iterator<Definition>> m_entries;
    std::vector<std::string> m_keys;
  };

  // OIDs to take out of the file sets. Each is taken out at once while anything is traced, since a
  // removal has records of its own; else all at the end of a walk, in the order of the sets.
  class Removals {
   public:
    explicit Removals(SchemaManager* manager) : m_manager(*manager) {}

    void add(const std::string& oid) {
      if (tracepoint::isAnythingTraced()) {
        m_manager.dropFromFileSets(oid);
      } else {
        m_oids.push_back(&oid);
      }
    }

    // An OID that came more than once is taken out of as many sets, the first ones that hold it.
    void apply() {
      std::sort(m_oids.begin(), m_oids.end(),
                [](const std::string* left, const std::string* right) { return *left < *right; });
      for (OidSet SchemaManager::*const fileSet : kFileSets) {
        OidSet& set = m_manager.*fileSet;
        AscendingLookup<OidSet> place(set);
        const auto isTaken = [&](const std::string* oid) {
          const bool isHeld = place.find(*oid) != set.end();
          if (isHeld) {
            place.erase();
          }
          return isHeld;
        };
        m_oids.erase(std::remove_if(m_oids.begin(), m_oids.end(), isTaken), m_oids.end());
      }
    }

   private:
    SchemaManager& m_manager;
    std::vector<const std::string*> m_oids;
  };

  // Puts `moved`, whose OID is the key of the entry, in the place of the entry's definition. The
  // key lies in the definition, so it changes with it.
  template <typename Definition>
  static void rebind(OidTable<Definition>* table, typename OidTable<Definition>::iterator place,
                     Definition* moved) {
    const auto next = std::next(place);
    auto node = table->extract(place);
    node.key() = moved->oidInPlace();
    node.mapped() = moved;
    table->insert(next, std::move(node));
  }

  template <typename Definition>
  static void compare(SchemaManager* self, SchemaManager* reference);
  template <typename Definition>
  static bool merge(SchemaManager* self, SchemaManager* source);
  template <typename Definition>
  static void replace(SchemaManager* self, const std::string& name, Iterator<Definition> place,
                      Definition* moved);
  template <typename Definition>
  static void eraseMoved(SchemaManager* source);
  template <typename Definition>
  static void check(SchemaManager* self, SchemaManager* reference);
  static bool isKey(const SchemaManager& reference, const std::string& oid);
  template <typename Definitions>
  static std::string report(const char* noneText, const char* heading, const Definitions& table);
  static OidSet* findFileSet(SchemaManager* self, SchemaManager* source, const std::string& oid);
};

template <>
struct SchemaManager::Operations::Kind<Attribute> {
  using Table = NameTable<Attribute>;
  using LookUp = tracepoint::GetAttr;
  using KeyTest = NameKeyTest;
  static constexpr bool kHasFileSet = true;
  static constexpr bool kPrunesOidTable = true;
  static constexpr Table SchemaManager::*kTable = &SchemaManager::attrTable;
  static constexpr OidTable<Attribute> SchemaManager::*kOidTable = &SchemaManager::attrOidTable;
  static const Attribute* lookUp(const SchemaManager& manager, const std::string& key) {
    return manager.lookUpAttr(key);
  }
  static std::string keyOf(const Attribute& definition) { return definition.getFirstNameLower(); }
  static const std::string& keyAt(const Table::value_type& entry) { return entry.first; }
  static bool areEqual(const Attribute& mine, const Attribute& theirs) {
    return mine.attrsEqual(theirs) != 0;
  }
};

template <>
struct SchemaManager::Operations::Kind<ObjectClass> {
  using Table = NameTable<ObjectClass>;
  using LookUp = tracepoint::GetObjClass;
  using KeyTest = NameKeyTest;
  static constexpr bool kHasFileSet = true;
  static constexpr bool kPrunesOidTable = false;
  static constexpr Table SchemaManager::*kTable = &SchemaManager::ocTable;
  static constexpr OidTable<ObjectClass> SchemaManager::*kOidTable = &SchemaManager::ocOidTable;
  static const ObjectClass* lookUp(const SchemaManager& manager, const std::string& key) {
    return manager.lookUpObjClass(key);
  }
  static std::string keyOf(const ObjectClass& definition) { return definition.getFirstNameLower(); }
  static const std::string& keyAt(const Table::value_type& entry) { return entry.first; }
  static bool areEqual(const ObjectClass& mine, const ObjectClass& theirs) {
    return mine.objsEqual(theirs);
  }
};

// Vendor extensions are keyed by OID. Dropping one in a comparison leaves every file set as it is.
template <>
struct SchemaManager::Operations::Kind<ORVAttribute> {
  using Table = OidTable<ORVAttribute>;
  using LookUp = tracepoint::GetORVAttr;
  using KeyTest = OidKeyTest;
  static constexpr bool kHasFileSet = false;
  static constexpr bool kPrunesOidTable = false;
  static constexpr Table SchemaManager::*kTable = &SchemaManager::orvAttrTable;
  static const ORVAttribute* lookUp(const SchemaManager& manager, const std::string& key) {
    return manager.lookUpORVAttr(key);
  }
  static const std::string& keyOf(const ORVAttribute& definition) {
    return definition.oidInPlace();
  }
  static const std::string& keyAt(const Table::value_type& entry) {
    return entry.second->oidInPlace();
  }
  static bool areEqual(const ORVAttribute& mine, const ORVAttribute& theirs) {
    return mine.orvAttrsEqual(theirs);
  }
};

// ---- Comparison ----

// Drops from the manager's table what is excluded there, and what the reference defines alike.
// Erased definitions are not deleted: the OID indexes still hold them.
template <typename Definition>
void SchemaManager::Operations::compare(SchemaManager* self, SchemaManager* reference) {
  using Rules = Kind<Definition>;
  Table<Definition>& table = self->*Rules::kTable;
  Walk<Definition> walk(*self, &(reference->*Rules::kTable));
  Erasures<Definition> dropped;
  Removals removals(self);
  for (auto entry = table.begin(); entry != table.end(); ++entry) {
    const Met<Definition> met = walk.meet(*entry);
    const Definition* theirs = walk.findInReference(met);
    if (theirs != nullptr) {
      theirs = met.isOwnKey ? answerOf<Definition>(theirs)
                            : &orNew(Rules::lookUp(*reference, std::string(entry->first)));
    }
    const Definition& mine = met.definition;
    const std::string& oid = mine.oidInPlace();
    if (!self->excludes(oid) && (theirs == nullptr || !Rules::areEqual(mine, *theirs))) {
      continue;
    }
    dropped.add(entry, met.key);
    if (Rules::kHasFileSet) {
      removals.add(oid);
    }
  }
  dropped.apply(&table);
  removals.apply();
}

bool SchemaManager::compSchemas(SchemaManager* reference) {
  tracepoint::CompSchemas trace;
  return compAttrTables(reference) && compORVAttrTables(reference) && compObjTables(reference);
}

bool SchemaManager::compAttrTables(SchemaManager* reference) {
  tracepoint::CompAttrTables trace;
  Operations::compare<Attribute>(this, reference);
  return true;
}

bool SchemaManager::compORVAttrTables(SchemaManager* reference) {
  tracepoint::CompORVAttrTables trace;
  Operations::compare<ORVAttribute>(this, reference);
  return true;
}

bool SchemaManager::compObjTables(SchemaManager* reference) {
  tracepoint::CompObjTables trace;
  Operations::compare<ObjectClass>(this, reference);
  return true;
}

// ---- Merge ----

std::set<std::string>* SchemaManager::findOidInSet(SchemaManager* source, std::string oid) {
  return Operations::findFileSet(this, source, oid);
}

SchemaManager::OidSet* SchemaManager::Operations::findFileSet(SchemaManager* self,
                                                              SchemaManager* source,
                                                              const std::string& oid) {
  tracepoint::FindOidInSet trace;
  for (OidSet SchemaManager::*const set : kFileSets) {
    if ((source->*set).count(oid) != 0) {
      return &(self->*set);
    }
  }
  TRACE_DEBUG(trace, "findOidInSet: Unable to find OID, %s, in set.\n", oid.c_str());
  return nullptr;
}

// Puts `moved` in the place of the definition that the manager finds under its OID; `place` is the
// entry found under its name. What goes is the definition with the OID, which can be another one
// than that with the name: then the old entry under the name stays, and `moved` is entered by OID
// only. MergeAttrs.NameUnderAnotherOidRemovesTheOtherDefinition.
template <typename Definition>
void SchemaManager::Operations::replace(SchemaManager* self, const std::string& name,
                                        Iterator<Definition> place, Definition* moved) {
  using Rules = Kind<Definition>;
  Table<Definition>& byName = self->*Rules::kTable;
  OidTable<Definition>& byOid = self->*Rules::kOidTable;
  const std::string& oid = moved->oidInPlace();
  const Definition* const replaced = Rules::lookUp(*self, oid);
  if (replaced != nullptr) {
    const std::string replacedName = Rules::keyOf(*replaced);
    const std::string replacedOid = replaced->oidInPlace();
    if (replacedName == name) {
      place->second = moved;
    } else {
      byName.erase(replacedName);
    }
    const auto indexed = byOid.find(replacedOid);
    if (indexed != byOid.end() && replacedOid == oid) {
      rebind(&byOid, indexed, moved);
      return;
    }
    if (indexed != byOid.end()) {
      byOid.erase(indexed);
    }
  }
  byOid.try_emplace(oid, moved);
}

// Erases from the source what has been moved out of it: by the names and by the OIDs of the moved
// definitions.
template <typename Definition>
void SchemaManager::Operations::eraseMoved(SchemaManager* source) {
  using Rules = Kind<Definition>;
  Table<Definition>& table = source->*Rules::kTable;
  typename Rules::KeyTest isKeyOf;
  Erasures<Definition> moved;
  for (auto entry = table.begin(); entry != table.end(); ++entry) {
    if (isKeyOf(entry->first, *entry->second)) {
      moved.add(entry, Rules::keyAt(*entry));
    } else {
      moved.add(entry, Rules::keyOf(*entry->second));
    }
    if constexpr (Rules::kHasFileSet) {
      (source->*Rules::kOidTable).erase(entry->second->oidInPlace());
    }
  }
  moved.apply(&table);
}

// Moves the source's definitions, in the order of their keys. Stops, with the source's tables as
// they were, at one that is lacking here and whose OID is in none of the source's file sets.
template <typename Definition>
bool SchemaManager::Operations::merge(SchemaManager* self, SchemaManager* source) {
  using Rules = Kind<Definition>;
  Table<Definition>& table = self->*Rules::kTable;
  for (const auto& entry : source->*Rules::kTable) {
    Definition* const moved = entry.second;
    const auto& key = Rules::keyOf(*moved);
    const auto place = table.lower_bound(key);
    if (place != table.end() && place->first == key) {
      if constexpr (Rules::kHasFileSet) {
        replace(self, key, place, moved);
      } else {
        rebind(&table, place, moved);
      }
      continue;
    }
    OidSet* const oids = findFileSet(self, source, moved->oidInPlace());
    if (oids == nullptr) {
      return false;
    }
    oids->insert(moved->oidInPlace());
    table.try_emplace(place, key, moved);
    if constexpr (Rules::kHasFileSet) {
      (self->*Rules::kOidTable).try_emplace(moved->oidInPlace(), moved);
    }
  }
  eraseMoved<Definition>(source);
  return true;
}

bool SchemaManager::mergeSchemas(SchemaManager* source) {
  tracepoint::MergeSchemas trace;
  return mergeAttrs(source) && mergeORVAttrs(source) && mergeObjClasses(source);
}

// Of the three passes only this one records its success.  MergeTrace.OnlyMergeAttrsRecordsSuccess.
bool SchemaManager::mergeAttrs(SchemaManager* source) {
  tracepoint::MergeAttrs trace;
  if (!Operations::merge<Attribute>(this, source)) {
    TRACE_DEBUG(trace, "mergeAttrs: findOidInSet returned NULL\n");
    return trace.status(0) != 0;
  }
  return trace.status(1) != 0;
}

bool SchemaManager::mergeORVAttrs(SchemaManager* source) {
  tracepoint::MergeORVAttrs trace;
  if (!Operations::merge<ORVAttribute>(this, source)) {
    TRACE_DEBUG(trace, "mergeORVAttrs: findOidInSet returned NULL\n");
    return trace.status(0) != 0;
  }
  return true;
}

bool SchemaManager::mergeObjClasses(SchemaManager* source) {
  tracepoint::MergeObjClasses trace;
  if (!Operations::merge<ObjectClass>(this, source)) {
    TRACE_DEBUG(trace, "mergeObjClasses: findOidInSet returned NULL\n");
    return trace.status(0) != 0;
  }
  return true;
}

// ---- Collision check ----

// Whether the OID is a key of any of the three tables. Two of them have names for keys: an OID is
// found there only when a definition's first name is spelled like it.
// CheckCollisions.OidIsLookedUpAmongNames.
bool SchemaManager::Operations::isKey(const SchemaManager& reference, const std::string& oid) {
  return reference.ocTable.count(oid) != 0 || reference.attrTable.count(oid) != 0 ||
         reference.orvAttrTable.count(oid) != 0;
}

// Leaves in the manager's table what collides with the reference by its key (first name, or OID of
// a vendor extension) or by its OID.
template <typename Definition>
void SchemaManager::Operations::check(SchemaManager* self, SchemaManager* reference) {
  using Rules = Kind<Definition>;
  Table<Definition>& table = self->*Rules::kTable;
  Walk<Definition> walk(*self, &(reference->*Rules::kTable));
  Erasures<Definition> dropped;
  std::vector<const std::string*> collidingOids;
  for (auto entry = table.begin(); entry != table.end(); ++entry) {
    const Met<Definition> met = walk.meet(*entry);
    const std::string& oid = met.definition.oidInPlace();
    if (walk.findInReference(met) == nullptr && !isKey(*reference, oid)) {
      dropped.add(entry, met.key);
    } else if (Rules::kPrunesOidTable) {
      collidingOids.push_back(&oid);
    }
  }
  dropped.apply(&table);
  for (const std::string* const oid : collidingOids) {
    reference->attrOidTable.erase(*oid);
  }
}

// The order of the passes is its own: comparison and merge take object classes last.
// CheckCollisions.ObjectClassesComeFirst.
bool SchemaManager::checkCollisions(SchemaManager* reference) {
  tracepoint::CheckCollisions trace;
  return checkObjClasses(reference) && checkAttrs(reference) && checkORVAttrs(reference);
}

bool SchemaManager::checkObjClasses(SchemaManager* reference) {
  tracepoint::CheckObjClasses trace;
  Operations::check<ObjectClass>(this, reference);
  return true;
}

// The one change to the reference: its OID index loses the OIDs of the colliding attribute types.
// CheckAttrs.CollidingOidsLeaveTheOidIndexOfTheReference.
bool SchemaManager::checkAttrs(SchemaManager* reference) {
  tracepoint::CheckAttrs trace;
  Operations::check<Attribute>(this, reference);
  return true;
}

bool SchemaManager::checkORVAttrs(SchemaManager* reference) {
  tracepoint::CheckORVAttrs trace;
  Operations::check<ORVAttribute>(this, reference);
  return true;
}

// ---- Reports ----

template <typename Definitions>
std::string SchemaManager::Operations::report(const char* noneText, const char* heading,
                                              const Definitions& table) {
  if (table.empty()) {
    return noneText;
  }
  std::string text = heading;
  for (const auto& entry : table) {
    text += entry.second->getOidAndName();
  }
  return text;
}

std::string SchemaManager::getOcTable() {
  tracepoint::GetOcTable trace;
  return Operations::report("No objectClasses definition collisions found.\n",
                            "The following objectClasses definition collisions found:\n", ocTable);
}

std::string SchemaManager::getORVAttrTable() {
  tracepoint::GetORVAttrTable trace;
  return Operations::report("No ORVAttributeTypes definition collisions found.\n",
                            "The following ORVAttributeTypes definition collisions found:\n",
                            orvAttrTable);
}

std::string SchemaManager::getAttrTable() {
  tracepoint::GetAttrTable trace;
  return Operations::report("No attributeTypes definition collisions found.\n",
                            "The following attributeTypes collisions found:\n", attrTable);
}
