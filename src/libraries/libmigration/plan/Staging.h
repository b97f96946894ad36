// The texts that a migration is carried out on: what the library is to read as OLD and as NEW so
// that its own comparison and merge come to the planned result, and the result in NEW's own layout.

#ifndef LIBSCHEMA_MIGRATION_STAGING_H
#define LIBSCHEMA_MIGRATION_STAGING_H

#include <vector>

#include "Installation.h"
#include "ThreeWay.h"

namespace migration {

// The two installations that libschema merges into the result.
struct StagedTexts {
  // Everything of OLD's that stands in the result, in the file where the result has it, and what
  // the lists name, as OLD has it.
  std::vector<NamedText> old;
  // NEW's files without the definitions that a decision drops, or that have another OID or first
  // name in the result.
  std::vector<NamedText> latest;
};
// Makes them of what was decided; what is undecided stays NEW's.
StagedTexts stage(const ThreeWayRequest& request, const ThreeWay& threeWay);

// The result in NEW's layout: its files byte for byte, a replaced definition where NEW's stood,
// what is added at the end of its file below one comment line, with the comments that stood above
// it in OLD, superiors before their users. The two config files are NEW's.
std::vector<NamedText> inNewsLayout(const ThreeWayRequest& request, const ThreeWay& threeWay);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_STAGING_H
