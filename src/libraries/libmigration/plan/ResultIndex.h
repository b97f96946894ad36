// Which definition of a migration's result has a name, an OID or a DBNAME.

#ifndef LIBSCHEMA_MIGRATION_RESULT_INDEX_H
#define LIBSCHEMA_MIGRATION_RESULT_INDEX_H

#include <array>
#include <cstddef>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "Verdict.h"

namespace migration {

class ResultIndex {
 public:
  enum class Of {
    kAll,  // everything that the result has
    kNew   // what NEW gives, as far as it keeps it
  };
  ResultIndex(const std::vector<Verdict>& differences, Of which);

  // Another definition than `except` that has it; null when there is none. Names in any letter
  // case, of one kind; OIDs across attribute types and object classes; DBNAME in any letter case.
  // Where `isCarriedOnly`, only of what OLD, or a decision, brings.
  const Verdict* byName(Kind kind, std::string_view name, const Verdict* except,
                        bool isCarriedOnly = false) const;
  const Verdict* byOid(std::string_view oid, const Verdict* except,
                       bool isCarriedOnly = false) const;
  const Verdict* byDbName(std::string_view name, const Verdict* except,
                          bool isCarriedOnly = false) const;

  void add(const Verdict& difference);

  // Attribute types and object classes of NEW that do not count, and stay: their OIDs.
  void addUncounted(const std::vector<const Entry*>& entries);
  const Entry* uncountedByOid(const std::string& oid) const;

 private:
  using Index = std::unordered_multimap<std::string, const Verdict*>;
  static const Verdict* findIn(const Index& index, const std::string& key, const Verdict* except,
                               bool isCarriedOnly);

  Of m_which;
  std::array<Index, 2> m_byName;
  Index m_byOid;
  Index m_byDbName;
  std::unordered_map<std::string, const Entry*> m_uncounted;
};

// What the result has of a definition: its fields there, or NEW's.
Values namesInResult(const Verdict& difference);
std::string oidInResult(const Verdict& difference);
Values dbNamesInResult(const Verdict& difference);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_RESULT_INDEX_H
