// The clauses of a definition as they are told. EQUALITY, ORDERING, SUBSTR and SYNTAX merge as one
// clause, and a decision about one of them is about all; each that differs is told by itself.

#ifndef LIBSCHEMA_MIGRATION_TOLD_CLAUSES_H
#define LIBSCHEMA_MIGRATION_TOLD_CLAUSES_H

#include <string>
#include <vector>

#include "Content.h"
#include "Merge.h"

namespace migration {

// A clause that is not the same everywhere, as it is shown; empty where a side has none, and the
// result while nobody has decided.
struct ToldClause {
  std::string name;
  std::string base;
  std::string old;
  std::string latest;  // the new release's
  std::string result;
  Risk risk = Risk::kNone;
  bool isDecided = true;
};

// Each clause of the change that differs somewhere.
std::vector<ToldClause> toldClauses(const ClauseChange& change);

// Their names: "SUP", "EQUALITY, SYNTAX".
std::string toldNames(const ClauseChange& change);

// The clause with these values: what it is called, and what is shown; nothing where there is none.
struct ToldValue {
  std::string name;
  std::string value;
};

// The clauses of an aspect that these values are written in.
std::vector<ToldValue> toldValues(Aspect aspect, const Values& values);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_TOLD_CLAUSES_H
