// What the readings of a schema's text hold, as text to compare.

#ifndef LIBSCHEMA_TESTS_PRINTED_H
#define LIBSCHEMA_TESTS_PRINTED_H

#include <libschema-migration/Finding.h>
#include <libschema-migration/Written.h>

#include <string>

namespace printed {

// A definition a line: where it begins and ends, its kind, how it stands, and its clauses, as in
//   1:16-1:40 attribute type = OID 1.2.3 | NAME 'a' | SUP ( b c )
// A block is "{" in place of "="; a definition that is not closed ends with " …"; a quoted value
// stands in quotes, a comment above it in front.
std::string definitions(const migration::WrittenFile& file);

// An oddity a line: where it is, what it is called, the bytes.
std::string oddities(const migration::WrittenFile& file);

// A finding a line: "1:16 error D208", in the order of their places.
std::string findings(const migration::Findings& findings);

}  // namespace printed

#endif  // LIBSCHEMA_TESTS_PRINTED_H
