// What is kept when a schema file is written and read again, and what is not.

#ifndef LIBSCHEMA_TESTS_ROUND_TRIP_H
#define LIBSCHEMA_TESTS_ROUND_TRIP_H

#include <string>

#include "ManagerGroup.h"

namespace properties {

// Whether the line written of a definition reads back as the same definition. The reader takes more
// than the writer can express: values that stand in a line without quotes come back only when they
// are one word or number of the kind that the clause takes, and a quoted value that is spelled like
// the number before it is taken for that number. In particular these do not come back:
//   - an OID, superior, matching rule, syntax, usage, list member, access class or length that was
//   read
//     from quotes and is no single word or number, such as 'a b' or '';
//   - a second superior of an attribute type, since SUP is written once;
//   - an empty usage, access class or length, in whose place the default is read;
//   - a number for a usage or for a member of a list of an object class;
//   - a first name, a first database name or, without names, a description that is the OID.
bool readsBack(const Attribute& definition);
bool readsBack(const ObjectClass& definition);
bool readsBack(const ORVAttribute& definition);

// Whether readsBack() holds for everything that writeFile(file) writes.
bool allReadBack(const SchemaManager& manager, const std::string& file);

// Writes a file, reads it into a new manager, and writes it again. "" when the new manager holds,
// in tables and in the set, the definitions that were written, each as it was, and no others, and
// when the second file has the bytes of the first; else what differs. Where several of the
// definitions have one first name, the new manager's name table has the one with the lowest OID.
std::string differenceAfterRoundTrip(SchemaManager* manager, const std::string& file,
                                     ManagerGroup* group);

}  // namespace properties

#endif  // LIBSCHEMA_TESTS_ROUND_TRIP_H
