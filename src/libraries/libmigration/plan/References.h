// Which clauses of a definition name other definitions.

#ifndef LIBSCHEMA_MIGRATION_REFERENCES_H
#define LIBSCHEMA_MIGRATION_REFERENCES_H

#include <string>
#include <string_view>
#include <vector>

#include "Verdict.h"

namespace migration {

struct ReferringAspect {
  Aspect aspect;
  Kind target;
};

// SUP; of classes also MUST and MAY; none of vendor extensions.
const std::vector<ReferringAspect>& referringAspects(Kind kind);

// A reference that follows a rename can meet one that is there: each stays once, and in MUST rather
// than in MAY. Whether one went.
bool dropRepeatedReferences(Content* content);

struct Renaming {
  Kind kind;
  std::string from;  // a name or an OID
  std::string to;
};

// Replaces the references of what is carried to what is renamed or renumbered, all at once.
void replaceReferences(const std::vector<Renaming>& renamings, std::vector<Verdict>* differences);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_REFERENCES_H
