// A plan as one JSON document, as docs/json/plan.schema.json says: what `diff`, `plan` and
// `migrate` tell programs, and what a saved plan is. The same plan gives the same bytes.

#ifndef LIBSCHEMA_MIGRATION_PLAN_DOCUMENT_H
#define LIBSCHEMA_MIGRATION_PLAN_DOCUMENT_H

#include <string>
#include <vector>

#include "MigrationPlan.h"

namespace migration {

// What stands in a document beside the plan.
struct DocumentOrigin {
  std::string command;         // "diff", "plan" or "migrate"
  std::string programVersion;  // of the program that writes it
};

// The document and a line end, in printable ASCII: whatever a file holds reaches no terminal as a
// command. A byte that is not UTF-8 reads U+FFFD. It holds the definitions that are `shown`, in
// their order.
std::string planDocument(const MigrationPlan& plan, const std::vector<const Verdict*>& shown,
                         const DocumentOrigin& origin);
// The same with all definitions of the plan.
std::string planDocument(const MigrationPlan& plan, const DocumentOrigin& origin);

// The first of the paths that the plan was made from that is not UTF-8, so that a document cannot
// hold it; empty when there is none.
std::string pathNotForDocuments(const MigrationPlan& plan);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_PLAN_DOCUMENT_H
