// Comparison without regard to letter case, through the standard tolower of the locale in force.
// Internal: included by .cpp files only.

#ifndef LIBSCHEMA_CASE_FOLDING_H
#define LIBSCHEMA_CASE_FOLDING_H

#include <string>
#include <vector>

namespace libschema {

// Returns `text` with every character passed through tolower.
std::string lowered(std::string text);

// True when lowered(text) == folded and lowered(folded) == folded.
bool isLoweredFormOf(const std::string& folded, const std::string& text);

// True when every member of `mine` has a partner in `theirs` with the same lower-case form. The
// test goes one way: several members may share a partner.
bool hasPartners(const std::vector<std::string>& mine, const std::vector<std::string>& theirs);

}  // namespace libschema

#endif  // LIBSCHEMA_CASE_FOLDING_H
