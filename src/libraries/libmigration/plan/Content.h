// What a definition says, clause by clause, in values that can be compared and merged: every clause
// is a list of texts, empty when the definition does not have it.

#ifndef LIBSCHEMA_MIGRATION_CONTENT_H
#define LIBSCHEMA_MIGRATION_CONTENT_H

#include <array>
#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "Definitions.h"
#include "Kept.h"

namespace migration {

// The clauses that are compared and decided as one. The matching rules and the syntax of an
// attribute type belong together: four texts, in the order EQUALITY, ORDERING, SUBSTR, SYNTAX.
enum class Aspect : std::uint8_t {
  kOid,
  kFirstName,
  kAliases,
  kDesc,
  kObsolete,
  kSup,
  kMatching,
  kSingleValue,
  kCollective,
  kNoUserModification,
  kUsage,
  kClassKind,
  kMust,
  kMay,
  kDbName,
  kAccessClass,
  kLength,
  kIndexEquality,  // the flags of a vendor extension
  kIndexOrdering,
  kIndexSubstr,
  kIndexApprox,
  kIndexReverse
};
// How many there are.
constexpr std::size_t kAspectCount = 22;

// The texts of one clause.
using Values = std::vector<std::string>;

// "SYNTAX", "NAME" for the first name, "ALIASES", "KIND" of a class, "EQUALITY" for the flag, too.
// Of kMatching, whose members are told by kMatchingNames, "MATCHING".
std::string_view nameOf(Aspect aspect);
constexpr std::array<std::string_view, 4> kMatchingNames = {"EQUALITY", "ORDERING", "SUBSTR",
                                                            "SYNTAX"};

// The aspects that definitions of a kind have, in the order in which they are told.
const std::vector<Aspect>& aspectsOf(Kind kind);

struct Content {
  Kind kind = Kind::kAttributeType;
  std::array<Values, kAspectCount> values;

  // The values of a clause.
  const Values& operator[](Aspect aspect) const { return values[static_cast<std::size_t>(aspect)]; }
  Values& operator[](Aspect aspect) { return values[static_cast<std::size_t>(aspect)]; }

  // The OID, which every definition has.
  const std::string& oid() const { return (*this)[Aspect::kOid].front(); }
  // The first name and the further ones.
  Values names() const;
};

// What a definition says, as the library keeps it.
Content contentOf(const KeptDefinition& definition);

// Whether two definitions say the same in one clause: names and lists without regard to letter case
// and order, DBNAME in its order, everything else letter for letter.
bool areEqual(Aspect aspect, const Values& left, const Values& right);

// Whether they are equal in every clause. The OID is no clause of vendor extensions.
bool areEqual(const Content& left, const Content& right);

// The same without making fields: the library's equality in both directions, the same first name,
// and DBNAME in order.
bool haveEqualContent(const KeptDefinition& left, const KeptDefinition& right);

// The value of a clause as it is shown: members joined by " $ ", names and descriptions quoted; of
// kMatching one text "EQUALITY a ORDERING b …". Empty when there is none.
std::string shownValue(Aspect aspect, const Values& values);

// The definition in the syntax of a schema file, from "(" to ")", as it can be read again.
std::string textOf(const Content& fields);

// `text` with the letters A to Z in lower case, whatever the locale is.
std::string folded(std::string_view text);
bool equalFolded(std::string_view left, std::string_view right);
// Whether one of the values is `member`, in any letter case.
bool contains(const Values& values, std::string_view member);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_CONTENT_H
