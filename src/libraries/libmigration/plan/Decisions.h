// What a person decided about definitions, as a decisions file says it, and what it makes of a
// three-way comparison.

#ifndef LIBSCHEMA_MIGRATION_DECISIONS_H
#define LIBSCHEMA_MIGRATION_DECISIONS_H

#include <cstddef>
#include <cstdint>
#include <map>
#include <string>
#include <string_view>
#include <vector>

#include "Finding.h"
#include "Source.h"
#include "Verdict.h"

namespace migration {

// Whose definition, or whose clause. Of a clause kUnion is NEW's members and then OLD's further
// ones.
enum class Take : std::uint8_t { kNothing, kOld, kNew, kBase, kMerged, kDrop, kUnion };

// "old", "new", "base", "merged", "drop", "union"; empty for kNothing.
std::string_view wordOf(Take take);

// An entry of a decisions file: what somebody has decided about one definition.
struct Decision {
  std::string file;
  std::uint64_t line = 0;  // where its entry begins

  Kind kind = Kind::kAttributeType;
  std::string oid;          // one of these two names the definition, as BASE, OLD or NEW has it
  std::string name;         // any letter case
  std::string fingerprint;  // of the texts that it was made for; empty when it carries none

  Take take = Take::kNothing;
  std::string text;                     // "( 1.2.3 NAME 'a' … )"
  std::map<std::string, Take> clauses;  // by the name of the clause, in capitals
  std::string rename;                   // the first name, and
  std::string renumber;                 // the OID that the site's definition gets
  std::string reason;
};

// Reads a decisions file (TOML, a [[definition]] for each entry) and adds its entries to
// *decisions. What is malformed is a failure at its line, and the entry is left out.
void readDecisions(const Source& source, std::vector<Decision>* decisions, Failures* failures);

// The fingerprint of a definition as BASE, OLD and NEW have it, in the order of the three, and of
// the vendor extension that goes with it: what the readings keep, so that neither place nor layout
// matter.
std::string fingerprintOf(const Verdict& difference);

// Carries the decisions of the request out on the differences. Entries that match nothing or are
// stale (unless that is allowed), contradict another or cannot be carried out are failures, and
// change nothing.
struct ThreeWayRequest;
void applyDecisions(const ThreeWayRequest& request, std::vector<Verdict>* differences,
                    Failures* failures);

class ResultIndex;
// What one decision would come to: *after is the difference with it carried out. Returns what is
// wrong, or "". `result` has everything that the result has so far, and the difference is one of
// its.
std::string tryDecision(const Decision& decision, Prefer prefer, const ResultIndex& result,
                        const Verdict& difference, Verdict* after);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_DECISIONS_H
