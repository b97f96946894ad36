#include "TextEdits.h"

#include <algorithm>
#include <utility>

namespace migration {

void TextEdits::replace(std::size_t begin, std::size_t end, std::string text) {
  m_edits.push_back({begin, end, std::move(text)});
}

std::string TextEdits::applyTo(std::string_view text) const {
  std::vector<const Edit*> ordered;
  for (const Edit& edit : m_edits) {
    ordered.push_back(&edit);
  }
  std::stable_sort(ordered.begin(), ordered.end(),
                   [](const Edit* left, const Edit* right) { return left->begin < right->begin; });
  std::string result;
  std::size_t done = 0;
  for (const Edit* const edit : ordered) {
    if (edit->begin < done) {
      continue;
    }
    result.append(text.substr(done, edit->begin - done)).append(edit->text);
    done = edit->end;
  }
  return result.append(text.substr(done));
}

}  // namespace migration
