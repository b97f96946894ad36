// The fields of a definition that is kept, by the clauses that they come from.

#ifndef LIBSCHEMA_MIGRATION_KEPT_FIELDS_H
#define LIBSCHEMA_MIGRATION_KEPT_FIELDS_H

#include <array>
#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

#include "Kept.h"

namespace migration {

class KeptFields {
 public:
  // The definition must stay in place, unchanged.
  explicit KeptFields(const KeptDefinition& definition);

  // Null where the field is no such one.
  const std::string* text(Clause clause) const { return m_texts[number(clause)]; }
  const std::vector<std::string>* list(Clause clause) const { return m_lists[number(clause)]; }
  // Whether the clause is a flag of this kind; whether it is set. The kind of a class is a flag of
  // three.
  bool isFlag(Clause clause) const { return (m_isFlag >> number(clause) & 1U) != 0; }
  bool isSet(Clause clause) const { return (m_isSet >> number(clause) & 1U) != 0; }

  // What a text is without its clause.
  static const char* valueWithout(Clause clause);

  static constexpr std::size_t kClauses = 25;

 private:
  static std::size_t number(Clause clause) { return static_cast<std::size_t>(clause); }
  void setText(Clause clause, const std::string& text) { m_texts[number(clause)] = &text; }
  void setList(Clause clause, const std::vector<std::string>& list) {
    m_lists[number(clause)] = &list;
  }
  void setFlag(Clause clause, bool isSet) {
    m_isFlag |= 1U << number(clause);
    m_isSet |= (isSet ? 1U : 0U) << number(clause);
  }
  void takeAttribute(const Attribute& attribute);
  void takeClass(const ObjectClass& objectClass);
  void takeExtension(const ORVAttribute& extension);

  std::array<const std::string*, kClauses> m_texts{};
  std::array<const std::vector<std::string>*, kClauses> m_lists{};
  std::uint32_t m_isFlag = 0;
  std::uint32_t m_isSet = 0;
};

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_KEPT_FIELDS_H
