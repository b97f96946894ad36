// Schema texts made up from a seed, as people and programs write them, and damaged ones.

#ifndef LIBSCHEMA_TESTS_GENERATED_TEXT_H
#define LIBSCHEMA_TESTS_GENERATED_TEXT_H

#include <cstdint>
#include <random>
#include <string>

namespace generated {

class TextMaker {
 public:
  explicit TextMaker(std::uint64_t seed) : m_random(seed) {}

  // Valid definitions of all kinds, in sections of both forms.
  std::string validText();
  // The same with a few damages: bytes, tokens, clauses.
  std::string damagedText();

 private:
  std::size_t below(std::size_t limit) { return static_cast<std::size_t>(m_random() % limit); }
  bool oneIn(std::size_t count) { return below(count) == 0; }
  std::string oid();
  std::string name();
  std::string names();
  std::string list();
  std::string blank();
  std::string attributeType();
  std::string objectClass();
  std::string vendorExtension();
  void damageByte(std::string* text);
  void damageToken(std::string* text);
  void damageClause(std::string* text);

  std::mt19937_64 m_random;
};

}  // namespace generated

#endif  // LIBSCHEMA_TESTS_GENERATED_TEXT_H
