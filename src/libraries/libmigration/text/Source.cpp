#include "Source.h"

#include <algorithm>
#include <cstring>
#include <utility>

namespace migration {

Source::Source(std::string path, std::string bytes)
    : m_path(std::move(path)), m_bytes(std::move(bytes)) {
  m_lineStarts.push_back(0);
  const char* const begin = m_bytes.data();
  const char* const end = begin + m_bytes.size();
  for (const char* next = begin; next != end;) {
    const void* const found = std::memchr(next, '\n', static_cast<std::size_t>(end - next));
    if (found == nullptr) {
      break;
    }
    next = static_cast<const char*>(found) + 1;
    m_lineStarts.push_back(static_cast<std::size_t>(next - begin));
  }
}

Place Source::placeOf(std::size_t offset) const {
  const std::size_t inside = std::min(offset, m_bytes.size());
  const auto next = std::upper_bound(m_lineStarts.begin(), m_lineStarts.end(), inside);
  const std::size_t start = *(next - 1);
  return {static_cast<std::uint64_t>(next - m_lineStarts.begin()), inside - start + 1};
}

std::string_view Source::lineAt(std::size_t offset) const {
  const std::size_t inside = std::min(offset, m_bytes.size());
  const std::size_t start =
      *(std::upper_bound(m_lineStarts.begin(), m_lineStarts.end(), inside) - 1);
  const std::size_t end = m_bytes.find('\n', start);
  return std::string_view(m_bytes).substr(start, end == std::string::npos ? end : end - start);
}

std::string_view Source::line(std::uint64_t number) const {
  return number == 0 || number > m_lineStarts.size() ? std::string_view()
                                                     : lineAt(m_lineStarts[number - 1]);
}

}  // namespace migration
