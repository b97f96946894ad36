// Edits of a text, collected in any order and made at once.

#ifndef LIBSCHEMA_MIGRATION_TEXT_EDITS_H
#define LIBSCHEMA_MIGRATION_TEXT_EDITS_H

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

namespace migration {

class TextEdits {
 public:
  // The bytes from `begin` to `end` become `text`. Of edits that overlap only the first is made.
  void replace(std::size_t begin, std::size_t end, std::string text);

  // The text with every edit made.
  std::string applyTo(std::string_view text) const;

 private:
  struct Edit {
    std::size_t begin;
    std::size_t end;
    std::string text;
  };
  std::vector<Edit> m_edits;
};

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_TEXT_EDITS_H
