// A place in an ordered table that moves forward with ascending keys: the lock-step walk. Where the
// next key is far away it is looked for from the root of the table.

#ifndef LIBSCHEMA_BENCH_FLOOR_CURSOR_H
#define LIBSCHEMA_BENCH_FLOOR_CURSOR_H

#include <map>
#include <string>

namespace minimal {

inline const std::string& keyOf(const std::string& element) { return element; }
template <typename Value>
const std::string& keyOf(const std::pair<const std::string, Value>& element) {
  return element.first;
}

// `Ordered` is a map or a set by std::string, const or not.
template <typename Ordered>
class Cursor {
 public:
  using Iterator = decltype(std::declval<Ordered&>().begin());

  explicit Cursor(Ordered& ordered)
      : m_ordered(ordered), m_place(ordered.begin()), m_end(ordered.end()) {}

  // Moves to the first element that is not before `key`; true when it has that key.
  bool seek(const std::string& key) {
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
    m_place = m_ordered.lower_bound(key);
    return m_place != m_end && keyOf(*m_place) == key;
  }

  // The same for a map: the value under the key, or null.
  const auto* find(const std::string& key) { return seek(key) ? &m_place->second : nullptr; }

  Iterator place() const { return m_place; }
  void erase() { m_place = m_ordered.erase(m_place); }
  void moveTo(Iterator place) { m_place = place; }

 private:
  Ordered& m_ordered;
  Iterator m_place;
  Iterator m_end;
};

}  // namespace minimal

#endif  // LIBSCHEMA_BENCH_FLOOR_CURSOR_H
