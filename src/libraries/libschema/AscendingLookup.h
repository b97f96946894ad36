// Look-ups in an ordered table or set by keys that ascend, as they do when one ordered table is
// walked against another, or a batch of keys is worked through in order. A key near the last one is
// found by stepping on; one further off costs an ordinary look-up. No key may be below the one
// before. The table must not lose the entry at which the look-up stands, but by erase(). Internal:
// included by .cpp files only.

#ifndef LIBSCHEMA_ASCENDING_LOOKUP_H
#define LIBSCHEMA_ASCENDING_LOOKUP_H

#include <string>
#include <string_view>
#include <type_traits>
#include <utility>

namespace libschema {

template <typename Table>
class AscendingLookup {
 public:
  using Iterator = decltype(std::declval<Table&>().begin());

  explicit AscendingLookup(Table& table)
      : m_table(table), m_place(table.begin()), m_end(table.end()) {}

  // Returns the entry under `key`, or the table's end.
  Iterator find(std::string_view key) { return stepTo(key) ? m_place : m_end; }

  // Enters `key`, with its value in a table, and returns true; returns false, with nothing changed,
  // when it is there already.
  template <typename... Value>
  bool enter(std::string_view key, Value... value) {
    if (stepTo(key)) {
      return false;
    }
    m_place = m_table.emplace_hint(m_place, key, value...);
    return true;
  }

  // Erases the entry that the last find() returned.
  void erase() { m_place = m_table.erase(m_place); }

 private:
  // Goes on to the first entry that is not below `key`. True when it is the one under `key`.
  bool stepTo(std::string_view key) {
    constexpr int kSteps = 8;
    for (int step = 0; step < kSteps; ++step) {
      if (m_place == m_end) {
        return false;
      }
      const int order = keyOf(*m_place).compare(key);
      if (order >= 0) {
        return order == 0;
      }
      ++m_place;
    }
    m_place = lowerBound(key);
    return m_place != m_end && keyOf(*m_place) == key;
  }

  // A set of strings can be asked for a string only.
  Iterator lowerBound(std::string_view key) {
    if constexpr (std::is_same_v<typename Table::key_type, std::string>) {
      return m_table.lower_bound(std::string(key));
    } else {
      return m_table.lower_bound(key);
    }
  }

  static std::string_view keyOf(const std::string& element) { return element; }
  template <typename Key, typename Value>
  static std::string_view keyOf(const std::pair<const Key, Value>& entry) {
    return entry.first;
  }

  Table& m_table;
  Iterator m_place;  // every entry before it is below the key of the last call
  const Iterator m_end;
};

}  // namespace libschema

#endif  // LIBSCHEMA_ASCENDING_LOOKUP_H
