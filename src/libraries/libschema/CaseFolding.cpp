#include "CaseFolding.h"

#include <algorithm>
#include <cctype>

namespace libschema {

namespace {

// tolower itself is asked only about what some locale may change: never a digit or one of a to z.
char lowered(char c) {
  if ((c >= 'a' && c <= 'z') || (c >= '0' && c <= '9')) {
    return c;
  }
  return static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
}

bool equalLowered(const std::string& left, const std::string& right) {
  return left.size() == right.size() &&
         std::equal(left.begin(), left.end(), right.begin(),
                    [](char a, char b) { return a == b || lowered(a) == lowered(b); });
}

}  // namespace

std::string lowered(std::string text) {
  lower(text.data(), text.size());
  return text;
}

void lower(char* text, std::size_t size) {
  std::transform(text, text + size, text, [](char c) { return lowered(c); });
}

LowerCase::LowerCase() : m_forms() {
  for (std::size_t c = 0; c < m_forms.size(); ++c) {
    m_forms[c] = lowered(static_cast<char>(c));
  }
}

bool hasPartners(const std::vector<std::string>& mine, const std::vector<std::string>& theirs) {
  // Equal lists have the partners at the same places.
  if (mine == theirs) {
    return true;
  }
  constexpr std::size_t kShort = 12;
  if (theirs.size() <= kShort) {
    return std::all_of(mine.begin(), mine.end(), [&](const std::string& member) {
      return std::any_of(theirs.begin(), theirs.end(),
                         [&](const std::string& other) { return equalLowered(member, other); });
    });
  }
  std::vector<std::string> sorted;
  sorted.reserve(theirs.size());
  for (const std::string& other : theirs) {
    sorted.push_back(lowered(other));
  }
  std::sort(sorted.begin(), sorted.end());
  return std::all_of(mine.begin(), mine.end(), [&](const std::string& member) {
    return std::binary_search(sorted.begin(), sorted.end(), lowered(member));
  });
}

}  // namespace libschema
