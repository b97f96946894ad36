// A file of OIDs to exclude or to withdraw, as libschema reads it: words separated by white space.
// A word with "#" anywhere begins a comment to the end of the line, and a last word that the end of
// the file follows directly is not used.

#ifndef LIBSCHEMA_MIGRATION_OID_LIST_H
#define LIBSCHEMA_MIGRATION_OID_LIST_H

#include <cstddef>
#include <cstdint>
#include <string_view>
#include <vector>

#include "Source.h"

namespace migration {

// What the library makes of a word.
enum class WordUse : std::uint8_t {
  kTaken,         // an OID of the list
  kLastIsLost,    // the end of the file follows directly
  kCutByComment,  // "#" stands behind its first character: it is not used
};

// A word of the list.
struct OidWord {
  std::string_view text;  // whole, "#" and what follows it included
  std::size_t offset;
  WordUse use;
};

// The words of `source`, in its order, without comments; they refer to its bytes.
std::vector<OidWord> readOidList(const Source& source);

// True for digits in groups of which none has a leading zero, at least two, with dots between them.
bool isNumericOid(std::string_view text);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_OID_LIST_H
