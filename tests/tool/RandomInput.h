// Texts like schema files, and unlike them, from a seed.

#ifndef LIBSCHEMA_TESTS_RANDOM_INPUT_H
#define LIBSCHEMA_TESTS_RANDOM_INPUT_H

#include <cstdint>
#include <random>
#include <string>

class RandomInput {
 public:
  explicit RandomInput(std::uint32_t seed) : m_random(seed) {}

  // Any pieces that a lexical analyser could stumble over.
  std::string pieces();

  // Definitions of all kinds and forms with a few pieces lost, doubled or put in.
  std::string damagedDefinitions();

 private:
  std::size_t below(std::size_t limit);
  std::string piece();
  std::string definition();

  std::mt19937 m_random;
};

#endif  // LIBSCHEMA_TESTS_RANDOM_INPUT_H
