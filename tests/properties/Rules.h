// The operations between two managers once more, on copies of what the managers hold: each rule
// written down in the plainest way, one step after the other, to be compared with what the managers
// do.

#ifndef LIBSCHEMA_TESTS_RULES_H
#define LIBSCHEMA_TESTS_RULES_H

#include <cstddef>
#include <string>

#include "ManagerTables.h"

namespace properties {

void compareAttributes(State* self, const State& reference);
void compareExtensions(State* self, const State& reference);
void compareClasses(State* self, const State& reference);

// False, at once, for a definition that can join no set.
bool mergeAttributes(State* self, State* source);
bool mergeExtensions(State* self, State* source);
bool mergeClasses(State* self, State* source);

void checkClasses(State* self, const State& reference);
void checkAttributes(State* self, State* reference);
void checkExtensions(State* self, const State& reference);

// The whole operations, in the order of passes that each has.
void compareAll(State* self, const State& reference);
bool mergeAll(State* self, State* source);
void checkAll(State* self, State* reference);

// The three reports of a check, one after the other: object classes, vendor extensions, attribute
// types.
std::string reportsOf(const State& state);

// Index of the first set that holds the OID; the number of sets when none does.
std::size_t fileOf(const State& state, const std::string& oid);

// Withdraws the definitions with these OIDs.
void withdraw(State* self, const OidSet& oids);

// 0, or 32 when no set held the OID.
int dropFromFileSets(State* self, const std::string& oid);

// The OIDs that a list of this text names.
OidSet oidsIn(const std::string& list);

}  // namespace properties

#endif  // LIBSCHEMA_TESTS_RULES_H
