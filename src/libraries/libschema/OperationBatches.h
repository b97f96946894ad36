// What makes the operations between two managers fast: a walk over two tables side by side, and
// changes that are gathered and then made in the order of the table that they change. What an
// operation does, and in which order its trace records come, does not depend on any of it.
// Internal: included by SchemaOperations.cpp only.

#ifndef LIBSCHEMA_OPERATION_BATCHES_H
#define LIBSCHEMA_OPERATION_BATCHES_H

#include <cstddef>
#include <string>
#include <string_view>
#include <type_traits>
#include <vector>

#include "AscendingLookup.h"
#include "CaseFolding.h"
#include "SchemaOperations.h"
#include "SortedKeys.h"
#include "TracePoints.h"

// A walk over a manager's table, side by side with the reference's of the same kind. For each entry
// the kind's look-up is made under its key, on the manager and, where asked for, on the reference,
// with its trace records. What is found gives the key for all that follows: that of the entry, but
// in a locale that folds its name in another way than the one in which it was read.
template <typename Definition>
class SchemaManager::Operations::Walk {
 public:
  Walk(SchemaManager* self, SchemaManager* reference)
      : m_self(*self),
        m_reference(*reference),
        m_table(self->*Rules::kTable),
        m_references(reference->*Rules::kTable),
        m_next(m_table.begin()),
        m_inReference(m_references) {}

  // Goes on to the next entry; false behind the last one.
  bool next() {
    if (m_next == m_table.end()) {
      return false;
    }
    m_entry = m_next++;
    m_isOwnKey = isOwnKey();
    if (m_isOwnKey) {
      m_mine = answerOf(m_entry->second);
    } else {
      m_mine = &orNew(Rules::lookUp(m_self, std::string(m_entry->first)));
      m_key = Rules::keyOf(*m_mine);
    }
    return true;
  }

  const Definition& mine() const { return *m_mine; }

  // Whether the reference has an entry under the key.
  bool isInReference() { return findTheirs() != m_references.end(); }

  // What the look-up finds there; null, and no look-up, when it has none.
  const Definition* lookUpTheirs() {
    const auto theirs = findTheirs();
    if (theirs == m_references.end()) {
      return nullptr;
    }
    return m_isOwnKey ? answerOf(theirs->second)
                      : &orNew(Rules::lookUp(m_reference, std::string(m_entry->first)));
  }

  // Has the entry under the key erased by eraseDropped().
  void drop() {
    if (m_isOwnKey) {
      m_dropped.push_back(m_entry);
    } else {
      m_droppedKeys.push_back(m_key);
    }
  }

  void eraseDropped() {
    if (m_dropped.size() == m_table.size()) {
      m_table.clear();
    } else {
      for (const auto& entry : m_dropped) {
        m_table.erase(entry);
      }
    }
    for (const std::string& key : m_droppedKeys) {
      const auto entry = m_table.find(std::string_view(key));
      if (entry != m_table.end()) {
        m_table.erase(entry);
      }
    }
  }

 private:
  using Rules = Kind<Definition>;
  using Iterator = typename Table<Definition>::iterator;

  // Whether looking the entry up under its key finds itself, with the same key.
  bool isOwnKey() const {
    if constexpr (Rules::kIsKeyedByName) {
      const std::vector<std::string>& names = m_entry->second->namesInPlace();
      return names.empty() ? m_entry->first.empty()
                           : m_lowerCase.isFormOf(m_entry->first, names.front());
    } else {
      return true;
    }
  }

  Iterator findTheirs() {
    return m_isOwnKey ? m_inReference.find(m_entry->first)
                      : m_references.find(std::string_view(m_key));
  }

  // A look-up whose answer is known already leaves its records all the same.
  static const Definition* answerOf(const Definition* definition) {
    typename Rules::LookUp trace;
    return definition;
  }

  // An absent definition reads as a newly constructed one.
  static const Definition& orNew(const Definition* definition) {
    static const Definition kNew;
    return definition == nullptr ? kNew : *definition;
  }

  const SchemaManager& m_self;
  const SchemaManager& m_reference;
  Table<Definition>& m_table;
  Table<Definition>& m_references;
  Iterator m_next;
  Iterator m_entry;
  libschema::AscendingLookup<Table<Definition>> m_inReference;
  std::conditional_t<Rules::kIsKeyedByName, libschema::LowerCase, std::nullptr_t> m_lowerCase = {};
  bool m_isOwnKey = true;
  std::string m_key;  // where it is not the entry's
  const Definition* m_mine = nullptr;
  std::vector<Iterator> m_dropped;
  std::vector<std::string> m_droppedKeys;
};

// OIDs that leave the file sets. Each leaves at once while anything is traced, since a removal has
// records of its own; else all leave at the end, set by set. What leaves is the same: removals of
// different OIDs do not touch each other.
class SchemaManager::Operations::FileSetRemovals {
 public:
  explicit FileSetRemovals(SchemaManager* manager) : m_manager(*manager) {}

  void add(const std::string& oid) {
    if (tracepoint::isAnythingTraced()) {
      m_manager.dropFromFileSets(oid);
    } else {
      m_oids.add(oid, nullptr);
    }
  }

  // An OID that came more than once leaves as many sets, the first ones that hold it.
  void apply() {
    for (OidSet SchemaManager::*const fileSet : kFileSets) {
      OidSet& set = m_manager.*fileSet;
      libschema::AscendingLookup<OidSet> place(set);
      m_oids.removeInOrder([&](const auto& oid) {
        const bool isHeld = place.find(oid.key) != set.end();
        if (isHeld) {
          place.erase();
        }
        return isHeld;
      });
    }
  }

 private:
  SchemaManager& m_manager;
  libschema::SortedKeys<std::nullptr_t> m_oids;
};

// OIDs whose entries leave a table by OID.
class SchemaManager::Operations::OidErasures {
 public:
  void add(const std::string& oid) { m_oids.add(oid, nullptr); }

  template <typename Definition>
  void apply(Table<Definition>* table) {
    libschema::AscendingLookup<Table<Definition>> place(*table);
    for (const auto& oid : m_oids.inOrder()) {
      if (place.find(oid.key) != table->end()) {
        place.erase();
      }
    }
  }

 private:
  libschema::SortedKeys<std::nullptr_t> m_oids;
};

// What a merge adds by OID: to a file set and, unless it is a vendor extension, to the index.
// Nobody looks an OID up before the next replacement, so that the entries can wait until then.
template <typename Definition>
class SchemaManager::Operations::Additions {
 public:
  explicit Additions(SchemaManager* manager) : m_manager(*manager) {}

  void add(OidSet* set, Definition* moved) { m_waiting.add(moved->oidInPlace(), {set, moved}); }

  // Of definitions with one OID the first one is entered.
  void enter() {
    for (OidSet SchemaManager::*const fileSet : kFileSets) {
      OidSet& set = m_manager.*fileSet;
      libschema::AscendingLookup<OidSet> place(set);
      for (const auto& oid : m_waiting.inOrder()) {
        if (oid.value.set == &set) {
          place.enter(oid.key);
        }
      }
    }
    if constexpr (Kind<Definition>::kIsKeyedByName) {
      libschema::AscendingLookup<Table<Definition>> place(m_manager.*Kind<Definition>::kOidTable);
      for (const auto& oid : m_waiting.inOrder()) {
        place.enter(oid.key, oid.value.moved);
      }
    }
    m_waiting.clear();
  }

 private:
  struct Addition {
    OidSet* set;
    Definition* moved;
  };

  SchemaManager& m_manager;
  libschema::SortedKeys<Addition> m_waiting;
};

#endif  // LIBSCHEMA_OPERATION_BATCHES_H
