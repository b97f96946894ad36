// What the readings of a schema's text have in common: the kinds of definition, their clauses, and
// the names that both have.

#ifndef LIBSCHEMA_MIGRATION_DEFINITIONS_H
#define LIBSCHEMA_MIGRATION_DEFINITIONS_H

#include <cstdint>
#include <string_view>

namespace migration {

// What is defined.
enum class Kind : std::uint8_t { kAttributeType, kObjectClass, kVendorExtension };

// "attribute type", "object class", "vendor extension".
std::string_view nameOf(Kind kind);
// "attribute-type", "object-class", "vendor-extension".
std::string_view wordOf(Kind kind);

// The clauses of all three kinds.
enum class Clause : std::uint8_t {
  kOid,
  kName,
  kDesc,
  kObsolete,
  kSup,
  kEquality,
  kOrdering,
  kSubstr,
  kSyntax,
  kSingleValue,
  kCollective,
  kNoUserModification,
  kUsage,
  kStructural,
  kAuxiliary,
  kAbstract,
  kMust,
  kMay,
  kDbName,
  kAccessClass,
  kLength,
  kApprox,
  kReverse,
  kExtension,  // X-…: the keyword as written tells which
  kUnknown     // a word at clause level that is none of these
};

// The keyword, as "SINGLE-VALUE"; "OID" for the first; empty for the last two.
std::string_view keywordOf(Clause clause);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_DEFINITIONS_H
