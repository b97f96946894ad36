// The names of one definition, without regard to letter case. Internal.

#ifndef LIBSCHEMA_MIGRATION_NAME_INDEX_H
#define LIBSCHEMA_MIGRATION_NAME_INDEX_H

#include <cstddef>
#include <string>
#include <string_view>
#include <unordered_set>
#include <vector>

namespace migration {

class NameIndex {
 public:
  void clear() {
    m_few.clear();
    m_many.clear();
  }

  // False when the name, or one that differs in letter case alone, is there already. The text must
  // stay in place up to clear().
  bool add(std::string_view name) {
    constexpr std::size_t kFew = 12;
    if (m_many.empty()) {
      for (const std::string_view other : m_few) {
        if (isSame(name, other)) {
          return false;
        }
      }
      m_few.push_back(name);
      if (m_few.size() > kFew) {
        for (const std::string_view other : m_few) {
          m_many.insert(lowered(other));
        }
      }
      return true;
    }
    return m_many.insert(lowered(name)).second;
  }

 private:
  static char lower(char c) { return c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c; }
  static bool isSame(std::string_view left, std::string_view right) {
    if (left.size() != right.size()) {
      return false;
    }
    for (std::size_t i = 0; i < left.size(); ++i) {
      if (lower(left[i]) != lower(right[i])) {
        return false;
      }
    }
    return true;
  }
  static std::string lowered(std::string_view text) {
    std::string made(text);
    for (char& c : made) {
      c = lower(c);
    }
    return made;
  }

  std::vector<std::string_view> m_few;
  std::unordered_set<std::string> m_many;
};

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_NAME_INDEX_H
