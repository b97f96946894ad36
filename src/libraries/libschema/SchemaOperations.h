// What comparison, merge and collision check share, for one kind of definition at a time. Internal:
// included by .cpp files only.

#ifndef LIBSCHEMA_SCHEMA_OPERATIONS_H
#define LIBSCHEMA_SCHEMA_OPERATIONS_H

#include <algorithm>
#include <cstddef>
#include <iterator>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "AscendingLookup.h"
#include "CaseFolding.h"
#include "SchemaManager.h"
#include "TracePoints.h"

// A look-up that a rule names leaves its trace records also where its answer is known without it.
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

  // A walk over a manager's table against the reference's of the same kind.
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
    libschema::AscendingLookup<Table<Definition>> m_inReference;
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

  using OidList = std::vector<const std::string*>;

  static void sort(OidList* oids) {
    std::sort(oids->begin(), oids->end(),
              [](const std::string* left, const std::string* right) { return *left < *right; });
  }

  // Erases the entries of OIDs met in the order of names, in the order of the table.
  template <typename Definition>
  static void eraseAll(OidTable<Definition>* table, OidList oids) {
    sort(&oids);
    libschema::AscendingLookup<OidTable<Definition>> place(*table);
    for (const std::string* const oid : oids) {
      if (place.find(*oid) != table->end()) {
        place.erase();
      }
    }
  }

  // OIDs to take out of the file sets. Each is taken out at once while anything is traced, since a
  // removal has records of its own; else all at the end of a walk, in the order of the sets. What
  // is taken out is the same: removals of different OIDs do not touch each other.
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
      sort(&m_oids);
      for (OidSet SchemaManager::*const fileSet : kFileSets) {
        OidSet& set = m_manager.*fileSet;
        libschema::AscendingLookup<OidSet> place(set);
        std::size_t left = 0;
        for (const std::string* const oid : m_oids) {
          if (place.find(*oid) != set.end()) {
            place.erase();
          } else {
            m_oids[left++] = oid;
          }
        }
        m_oids.resize(left);
      }
    }

   private:
    SchemaManager& m_manager;
    OidList m_oids;
  };

  // What a merge adds, to be entered by OID: in a file set and, unless it is a vendor extension, in
  // the index. The names come in another order than the OIDs, and nobody looks an OID up before the
  // next replacement, so that the entries wait until then and are made in the order of the OIDs.
  template <typename Definition>
  class Additions {
   public:
    explicit Additions(SchemaManager* manager) : m_manager(*manager) {}

    void add(OidSet* set, Definition* moved) { m_waiting.push_back({set, moved}); }

    void enter() {
      // Of definitions with one OID the first one is entered.
      std::stable_sort(m_waiting.begin(), m_waiting.end(),
                       [](const Entry& left, const Entry& right) {
                         return left.moved->oidInPlace() < right.moved->oidInPlace();
                       });
      Place<OidSet> inSet;
      for (const Entry& entry : m_waiting) {
        const std::string& oid = entry.moved->oidInPlace();
        inSet = {entry.set, entry.set->insert(inSet.in(entry.set), oid)};
      }
      if constexpr (Kind<Definition>::kHasFileSet) {
        OidTable<Definition>& index = m_manager.*Kind<Definition>::kOidTable;
        auto place = index.end();
        for (const Entry& entry : m_waiting) {
          place = index.try_emplace(place, entry.moved->oidInPlace(), entry.moved);
        }
      }
      m_waiting.clear();
    }

   private:
    struct Entry {
      OidSet* set;
      Definition* moved;
    };

    // Where the last insertion was, and into which container.
    template <typename Container>
    struct Place {
      Container* container = nullptr;
      typename Container::iterator last = {};

      typename Container::iterator in(Container* wanted) const {
        return container == wanted ? last : wanted->end();
      }
    };

    SchemaManager& m_manager;
    std::vector<Entry> m_waiting;
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

#endif  // LIBSCHEMA_SCHEMA_OPERATIONS_H
