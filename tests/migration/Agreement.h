// Whether two readings of a text agree, told by other means than the library's own: both are
// written down in one form, and the texts compared.

#ifndef LIBSCHEMA_TESTS_AGREEMENT_H
#define LIBSCHEMA_TESTS_AGREEMENT_H

#include <libschema-migration/Check.h>
#include <libschema-migration/Installation.h>

#include <string>

namespace agreement {

// A line for each definition: kind, OID and every field. Clauses that the reader has no field for
// are there as they stand. `isWhole` tells whether letter case counts.
std::string linesOf(const migration::WrittenFile& file, bool isExact);
std::string linesOf(const migration::KeptFile& file, bool isExact);

// What does not hold of the findings of a file, empty when all does:
//   - without findings both readings are the same, letter for letter;
//   - without errors they are the same but for the letter case of the words that the reader folds;
//   - a finding that is an error because the readings differ is only there where they do.
std::string brokenRule(const migration::SchemaFile& file, const migration::Findings& findings);

}  // namespace agreement

#endif  // LIBSCHEMA_TESTS_AGREEMENT_H
