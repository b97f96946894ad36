// The definitions of one installation that count: those that the library's tables hold once it has
// read the nine files and withdrawn what a list names. An attribute type or object class counts
// when it is the first of its first name, a vendor extension when it is the first of its OID.

#ifndef LIBSCHEMA_MIGRATION_SIDE_H
#define LIBSCHEMA_MIGRATION_SIDE_H

#include <array>
#include <cstddef>
#include <set>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "Installation.h"

namespace migration {

class Side {
 public:
  // The installation must stay in place.
  explicit Side(const Installation& installation);

  // The one that it was made of.
  const Installation& installation() const { return *m_installation; }

  // In the order of reading, by kind.
  const std::vector<const Entry*>& of(Kind kind) const { return m_counting[indexOf(kind)]; }

  // Those of the same that do not count, in the order of reading.
  const std::vector<const Entry*>& uncounted() const { return m_uncounted; }

  // The one that counts with this OID, with this first name in lower case; null when there is none.
  // An empty key finds nothing, and vendor extensions have no names.
  const Entry* byOid(Kind kind, std::string_view oid) const;
  const Entry* byFirstName(Kind kind, std::string_view lowerName) const;

 private:
  static std::size_t indexOf(Kind kind) { return static_cast<std::size_t>(kind); }
  void enter(const Entry& entry);

  const Installation* m_installation;
  std::array<std::vector<const Entry*>, 3> m_counting;
  std::vector<const Entry*> m_uncounted;
  std::array<std::unordered_map<std::string_view, const Entry*>, 3> m_byOid;
  std::array<std::unordered_map<std::string, const Entry*>, 2> m_byName;
};

// What the library takes out of the tables of an installation when it withdraws these OIDs.
std::set<const Entry*> withdrawnBy(const Installation& installation,
                                   const std::set<std::string>& oids);

// The first name in lower case, empty without a name.
std::string foldedFirstNameOf(const Entry& entry);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_SIDE_H
