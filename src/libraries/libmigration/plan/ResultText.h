// How a definition of the result stands in a file of NEW's layout.

#ifndef LIBSCHEMA_MIGRATION_RESULT_TEXT_H
#define LIBSCHEMA_MIGRATION_RESULT_TEXT_H

#include <string>
#include <string_view>

#include "Verdict.h"

namespace migration {

// "keyword=(…)" and a line end.
std::string lineOf(Kind kind, std::string_view text);

// Whether the lines of a text end in CR LF.
bool endsLinesWithReturns(std::string_view text);
// `text` with the line ends of a file that does, or does not.
std::string withLineEnds(const std::string& text, bool areReturns);
// The same of a definition; it stays as it is where the library would read it otherwise then.
std::string withLineEnds(Kind kind, const std::string& definition, bool areReturns);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_RESULT_TEXT_H
