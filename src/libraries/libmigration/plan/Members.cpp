#include "Members.h"

#include <algorithm>

namespace migration {

namespace {

constexpr std::size_t kShort = 12;

template <typename IsToGo>
bool eraseIf(Values* values, IsToGo isToGo) {
  const auto end = std::remove_if(values->begin(), values->end(), isToGo);
  const bool isAny = end != values->end();
  values->erase(end, values->end());
  return isAny;
}

}  // namespace

Members::Members(const Values& values) : m_values(values) {
  if (values.size() > kShort) {
    m_folded.reserve(values.size());
    for (const std::string& value : values) {
      m_folded.insert(folded(value));
    }
  }
}

bool Members::has(std::string_view member) const {
  return m_folded.empty() ? contains(m_values, member) : m_folded.count(folded(member)) != 0;
}

bool dropDoubled(Values* values) {
  std::unordered_set<std::string> met;
  return eraseIf(values,
                 [&](const std::string& value) { return !met.insert(folded(value)).second; });
}

bool dropMembersOf(const Values& others, Values* values) {
  if (others.empty() || values->empty()) {
    return false;
  }
  const Members members(others);
  return eraseIf(values, [&](const std::string& value) { return members.has(value); });
}

}  // namespace migration
