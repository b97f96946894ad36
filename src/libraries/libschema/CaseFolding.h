// Comparison without regard to letter case, through the standard tolower of the locale in force.
// Internal: included by .cpp files only.

#ifndef LIBSCHEMA_CASE_FOLDING_H
#define LIBSCHEMA_CASE_FOLDING_H

#include <array>
#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

namespace libschema {

// Returns `text` with every character passed through tolower.
std::string lowered(std::string text);

// The same in place.
void lower(char* text, std::size_t size);

// What tolower makes of each character, in the locale that is in force at the construction.
class LowerCase {
 public:
  LowerCase();

  // True when lowered(text) == folded and lowered(folded) == folded.
  bool isFormOf(std::string_view folded, std::string_view text) const {
    if (folded.size() != text.size()) {
      return false;
    }
    for (std::size_t i = 0; i < folded.size(); ++i) {
      if (of(text[i]) != folded[i] || of(folded[i]) != folded[i]) {
        return false;
      }
    }
    return true;
  }

 private:
  char of(char c) const { return m_forms[static_cast<unsigned char>(c)]; }

  std::array<char, 256> m_forms;
};

// True when every member of `mine` has a partner in `theirs` with the same lower-case form. The
// test goes one way: several members may share a partner.
bool hasPartners(const std::vector<std::string>& mine, const std::vector<std::string>& theirs);

}  // namespace libschema

#endif  // LIBSCHEMA_CASE_FOLDING_H
