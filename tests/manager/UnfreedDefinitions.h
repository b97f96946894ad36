// Definitions that nobody frees, by rule: an entry that an operation erases or replaces, and a
// definition that only an OID index holds. Tests of those rules say so with an object of this
// class, so that the leak checker stays on for all others.

#ifndef LIBSCHEMA_TESTS_UNFREED_DEFINITIONS_H
#define LIBSCHEMA_TESTS_UNFREED_DEFINITIONS_H

namespace support {

// What is allocated while an object of this class lives is no leak to the leak checker: it has to
// be there before the definitions are read. Does nothing in a build without one.
class UnfreedDefinitions {
 public:
  UnfreedDefinitions();
  ~UnfreedDefinitions();
  UnfreedDefinitions(const UnfreedDefinitions&) = delete;
  UnfreedDefinitions& operator=(const UnfreedDefinitions&) = delete;
};

}  // namespace support

#endif  // LIBSCHEMA_TESTS_UNFREED_DEFINITIONS_H
