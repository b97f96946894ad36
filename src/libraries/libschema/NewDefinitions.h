// The definitions of one kind that a file brings: kept while it is read, and entered into the
// tables once for all, in the order of the keys. Internal: included by .cpp files only.

#ifndef LIBSCHEMA_NEW_DEFINITIONS_H
#define LIBSCHEMA_NEW_DEFINITIONS_H

#include <algorithm>
#include <cstddef>
#include <memory>
#include <memory_resource>
#include <set>
#include <string>
#include <string_view>
#include <vector>

#include "AscendingLookup.h"
#include "CaseFolding.h"
#include "SortedKeys.h"

namespace libschema {

template <typename Definition>
class NewDefinitions {
 public:
  NewDefinitions() = default;
  NewDefinitions(const NewDefinitions&) = delete;
  NewDefinitions& operator=(const NewDefinitions&) = delete;

  // What no table has taken is deleted.
  ~NewDefinitions() {
    for (const Added& added : m_added) {
      if (!added.isTaken) {
        delete added.definition;
      }
    }
  }

  // Its first name is folded here, in the locale that is in force.
  void add(std::unique_ptr<Definition> definition) {
    m_added.push_back({definition.get(), false});
    const Definition& added = *definition.release();
    const std::size_t number = m_added.size() - 1;
    const std::vector<std::string>& names = added.namesInPlace();
    m_byOid.add(copyOf(added.oidInPlace()), number);
    m_byName.add(names.empty() ? std::string_view() : loweredCopyOf(names.front()), number);
  }

  // Enter what was added, as if one after the other: a table keeps what it has under a key, and a
  // definition that one of them takes is no longer this object's.
  template <typename Table>
  void enterByName(Table* table) {
    enter(&m_byName, table);
  }
  template <typename Table>
  void enterByOid(Table* table, std::set<std::string>* oids) {
    if (oids != nullptr) {
      AscendingLookup<std::set<std::string>> place(*oids);
      for (const auto& entry : m_byOid.inOrder()) {
        place.enter(entry.key);
      }
    }
    enter(&m_byOid, table);
  }

 private:
  struct Added {
    Definition* definition;
    bool isTaken;
  };
  using Keys = SortedKeys<std::size_t>;

  template <typename Table>
  void enter(Keys* keys, Table* table) {
    AscendingLookup<Table> place(*table);
    for (const auto& entry : keys->inOrder()) {
      Added& added = m_added[entry.value];
      if (place.enter(entry.key, added.definition)) {
        added.isTaken = true;
      }
    }
    keys->clear();
  }

  // Copies that lie close together, unlike the texts of the definitions.
  std::string_view copyOf(const std::string& text) { return {newCopy(text), text.size()}; }
  std::string_view loweredCopyOf(const std::string& text) {
    char* const copy = newCopy(text);
    lower(copy, text.size());
    return {copy, text.size()};
  }
  char* newCopy(const std::string& text) {
    auto* const copy = static_cast<char*>(m_texts.allocate(text.size(), 1));
    std::copy(text.begin(), text.end(), copy);
    return copy;
  }

  std::pmr::monotonic_buffer_resource m_texts{std::pmr::new_delete_resource()};
  std::vector<Added> m_added;
  Keys m_byName;
  Keys m_byOid;
};

}  // namespace libschema

#endif  // LIBSCHEMA_NEW_DEFINITIONS_H
