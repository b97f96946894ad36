// The members of a list, to be asked for in any letter case: in little time however long it is.

#ifndef LIBSCHEMA_MIGRATION_MEMBERS_H
#define LIBSCHEMA_MIGRATION_MEMBERS_H

#include <string>
#include <string_view>
#include <unordered_set>

#include "Content.h"

namespace migration {

class Members {
 public:
  // Refers to `values`, which must stay in place.
  explicit Members(const Values& values);

  bool has(std::string_view member) const;

 private:
  const Values& m_values;
  std::unordered_set<std::string> m_folded;  // of a long list
};

// Takes out what stands in the list a second time, in any letter case. Whether there was such.
bool dropDoubled(Values* values);

// Takes out of `values` what `others` have, in any letter case. Whether there was such.
bool dropMembersOf(const Values& others, Values* values);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_MEMBERS_H
