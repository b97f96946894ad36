// What can be mended in a schema's text without changing what it says.

#ifndef LIBSCHEMA_MIGRATION_REPAIR_H
#define LIBSCHEMA_MIGRATION_REPAIR_H

#include <string>
#include <vector>

#include "Written.h"

namespace migration {

// What was changed at one place.
struct RepairedPlace {
  std::string rule;  // the one whose finding goes: "D208"
  Place place;       // in the text as it was
  std::string text;  // what was done: "parentheses round the value of MAY"
};

struct Repair {
  std::string bytes;  // the whole text, byte for byte as it was but for the changes
  std::vector<RepairedPlace> changes;
};

// Mends
//   D208  a last MUST, MAY or DBNAME without parentheses: they are written round its values;
//   L101  a last word without a line end: the line is ended;
//   L110  a keyword in the wrong letter case: it is written as the reader knows it;
//   D201, D207  X- clauses: each becomes a comment;
//   L113  carriage returns that change the reading: all before a line end go, others become blanks.
// A definition that is not whole, or in which quotes or parentheses are missing, stays as it is but
// for the letter case of its keywords: what it says is not certain.
Repair repair(const WrittenFile& written);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_REPAIR_H
