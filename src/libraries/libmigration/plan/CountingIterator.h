// How far a parser has come.

#ifndef LIBSCHEMA_MIGRATION_COUNTING_ITERATOR_H
#define LIBSCHEMA_MIGRATION_COUNTING_ITERATOR_H

#include <cstddef>
#include <iterator>

namespace migration {

// Goes through the bytes and tells how far its last copy has come.
class CountingIterator {
 public:
  using iterator_category = std::input_iterator_tag;
  using value_type = char;
  using difference_type = std::ptrdiff_t;
  using pointer = const char*;
  using reference = const char&;

  CountingIterator(const char* at, const char** reached) : m_at(at), m_reached(reached) {}
  reference operator*() const { return *m_at; }
  CountingIterator& operator++() {
    *m_reached = ++m_at;
    return *this;
  }
  bool operator==(const CountingIterator& other) const { return m_at == other.m_at; }
  bool operator!=(const CountingIterator& other) const { return m_at != other.m_at; }

 private:
  const char* m_at;
  const char** m_reached;
};

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_COUNTING_ITERATOR_H
