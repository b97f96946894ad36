// The words of a schema's text: which of them the reader knows, which are meant to be one, and what
// each takes in each kind of definition.

#ifndef LIBSCHEMA_MIGRATION_KEYWORDS_H
#define LIBSCHEMA_MIGRATION_KEYWORDS_H

#include <string_view>

#include "Definitions.h"

namespace migration {

// What a word is: the keyword of a clause, the one that begins a section, or neither.
struct Keyword {
  enum Sort : unsigned char { kNone, kClause, kSection };
  Sort sort = kNone;
  Clause clause = Clause::kUnknown;  // of a clause
  Kind kind = Kind::kAttributeType;  // of a section
  std::string_view text;             // as the reader has it, "objectclasses" for "objectClasses"
};

// What the reader takes the word for: letter for letter, and the three spellings that it folds.
Keyword exactKeyword(std::string_view word);

// What the word is meant to be: the same in any letter case, or with "_" for "-".
Keyword anyCaseKeyword(std::string_view word);

// The same with one letter too many, one missing, one wrong or two swapped. Where two keywords are
// as near, the one that a definition of `kind` has.
Keyword nearClauseKeyword(std::string_view word, Kind kind);
Keyword nearSectionKeyword(std::string_view word);

// Whether definitions of the kind have the clause, as the reader knows it.
bool isKnownTo(Kind kind, Clause clause);

// What stands behind the keyword of a clause.
enum class ClauseShape : unsigned char {
  kFlag,   // nothing
  kValue,  // one value
  kList    // one value, or a list in parentheses
};
ClauseShape shapeOf(Kind kind, Clause clause);

// Whether the reader takes a number, with a length or without, as a value of the clause.
bool takesNumber(Kind kind, Clause clause);
bool takesLength(Kind kind, Clause clause);

// Whether the reader leaves a NAME clause at this one.
bool endsNames(Kind kind, Clause clause);

// A word as the reader takes one: a letter or "-", then letters, digits, "_" and "-".
bool isReadersWord(std::string_view word);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_KEYWORDS_H
