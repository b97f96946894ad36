// Look-ups in an ordered table by keys that mostly ascend, as they do when one ordered table is
// walked against another. A key near the last one is found by stepping on; any other costs an
// ordinary look-up. The table must not lose the entry at which the look-up stands. Internal:
// included by .cpp files only.

#ifndef LIBSCHEMA_ASCENDING_LOOKUP_H
#define LIBSCHEMA_ASCENDING_LOOKUP_H

#include <iterator>
#include <string>

namespace libschema {

template <typename Table>
class AscendingLookup {
 public:
  using Iterator = decltype(std::declval<Table&>().begin());

  explicit AscendingLookup(Table& table) : m_table(table), m_place(table.begin()) {}

  // Returns the entry under `key`, or the table's end.
  Iterator find(const std::string& key) {
    const Iterator place = lowerBound(key);
    return place != m_table.end() && place->first == key ? place : m_table.end();
  }

  // Returns the first entry that is not before `key`, or the table's end.
  Iterator lowerBound(const std::string& key) {
    constexpr int kSteps = 8;
    if (m_place != m_table.begin() && !(std::prev(m_place)->first < key)) {
      return m_place = m_table.lower_bound(key);
    }
    for (int step = 0; step < kSteps; ++step) {
      if (m_place == m_table.end() || !(m_place->first < key)) {
        return m_place;
      }
      ++m_place;
    }
    return m_place = m_table.lower_bound(key);
  }

 private:
  Table& m_table;
  Iterator m_place;  // every entry before it is below the key looked up last
};

}  // namespace libschema

#endif  // LIBSCHEMA_ASCENDING_LOOKUP_H
