// A file of OIDs to exclude or to withdraw: words separated by white space; a word with "#" in it
// begins a comment that goes to the end of the line.

#ifndef SCHEMA_MIGRATE_OID_LIST_H
#define SCHEMA_MIGRATE_OID_LIST_H

#include <set>
#include <string>

#include "Inputs.h"

// Adds the words of the copy to `oids`. Throws a Failure when it cannot be read, and when the file
// ends in a word, which the library would not take.
void readOidList(const ListFile& list, std::set<std::string>* oids);

#endif  // SCHEMA_MIGRATE_OID_LIST_H
