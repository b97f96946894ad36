// Where generated data come from: a number generator with a seed, or the bytes of a given input.

#ifndef LIBSCHEMA_TESTS_CHOICES_H
#define LIBSCHEMA_TESTS_CHOICES_H

#include <cstddef>
#include <cstdint>
#include <random>

namespace properties {

class Choices {
 public:
  virtual ~Choices() = default;

  // A number from 0 to bound - 1; `bound` is 1 to 256.
  virtual unsigned below(unsigned bound) = 0;

  template <typename List>
  const auto& oneOf(const List& list) {
    return list[below(static_cast<unsigned>(std::size(list)))];
  }
};

class SeededChoices : public Choices {
 public:
  explicit SeededChoices(unsigned seed) : m_random(seed) {}
  unsigned below(unsigned bound) override { return static_cast<unsigned>(m_random() % bound); }

 private:
  std::mt19937 m_random;
};

// One byte for each choice; always 0 when they are used up.
class ByteChoices : public Choices {
 public:
  ByteChoices(const std::uint8_t* bytes, std::size_t size) : m_next(bytes), m_end(bytes + size) {}
  unsigned below(unsigned bound) override { return m_next == m_end ? 0 : *m_next++ % bound; }
  bool areUsedUp() const { return m_next == m_end; }

 private:
  const std::uint8_t* m_next;
  const std::uint8_t* m_end;
};

}  // namespace properties

#endif  // LIBSCHEMA_TESTS_CHOICES_H
