// Look-ups in an ordered table or set by keys that ascend, as they do when one ordered table is
// walked against another. A key near the last one is found by stepping on; one further off costs an
// ordinary look-up. No key may be below the one before. The table must not lose the entry at which
// the look-up stands, but by erase(). Internal: included by .cpp files only.

#ifndef LIBSCHEMA_ASCENDING_LOOKUP_H
#define LIBSCHEMA_ASCENDING_LOOKUP_H

#include <string>
#include <utility>

namespace libschema {

template <typename Table>
class AscendingLookup {
 public:
  using Iterator = decltype(std::declval<Table&>().begin());

  explicit AscendingLookup(Table& table)
      : m_table(table), m_place(table.begin()), m_end(table.end()) {}

  // Returns the entry under `key`, or the table's end.
  Iterator find(const std::string& key) {
    constexpr int kSteps = 8;
    for (int step = 0; step < kSteps; ++step) {
      if (m_place == m_end) {
        return m_end;
      }
      const int order = keyOf(*m_place).compare(key);
      if (order >= 0) {
        return order == 0 ? m_place : m_end;
      }
      ++m_place;
    }
    m_place = m_table.lower_bound(key);
    return m_place != m_end && keyOf(*m_place) == key ? m_place : m_end;
  }

  // Erases the entry that the last find() returned.
  void erase() { m_place = m_table.erase(m_place); }

 private:
  static const std::string& keyOf(const std::string& element) { return element; }
  template <typename Key, typename Value>
  static const Key& keyOf(const std::pair<const Key, Value>& entry) {
    return entry.first;
  }

  Table& m_table;
  Iterator m_place;  // every entry before it is below the key looked up last
  const Iterator m_end;
};

}  // namespace libschema

#endif  // LIBSCHEMA_ASCENDING_LOOKUP_H
