#include "Source.h"

#include <algorithm>
#include <cstring>
#include <utility>

namespace migration {

namespace {

constexpr std::size_t kStretch = 1024;

}  // namespace

Source::Source(std::string path, std::string bytes)
    : m_path(std::move(path)), m_owned(std::move(bytes)), m_bytes(m_owned) {
  divide();
}

Source::Source(std::string path, Borrowed borrowed)
    : m_path(std::move(path)), m_bytes(borrowed.bytes) {
  divide();
}

void Source::divide() {
  m_stretches.reserve(m_bytes.size() / kStretch + 1);
  Stretch next{1, 0};
  for (std::size_t begin = 0;; begin += kStretch) {
    m_stretches.push_back(next);
    if (m_bytes.size() - begin < kStretch) {
      return;
    }
    count(begin, begin + kStretch, &next);
  }
}

// Counts the line ends from one place to another.
void Source::count(std::size_t from, std::size_t to, Stretch* stretch) const {
  while (from < to) {
    const void* const found = std::memchr(m_bytes.data() + from, '\n', to - from);
    if (found == nullptr) {
      return;
    }
    from = static_cast<std::size_t>(static_cast<const char*>(found) - m_bytes.data()) + 1;
    ++stretch->line;
    stretch->lineStart = from;
  }
}

Place Source::placeOf(std::size_t offset) const {
  const std::size_t inside = std::min(offset, m_bytes.size());
  Stretch found = m_stretches[inside / kStretch];
  count(inside / kStretch * kStretch, inside, &found);
  return {found.line, inside - found.lineStart + 1};
}

std::string_view Source::lineAt(std::size_t offset) const {
  const std::size_t inside = std::min(offset, m_bytes.size());
  const std::size_t start = inside - (placeOf(inside).column - 1);
  const std::size_t end = m_bytes.find('\n', start);
  return m_bytes.substr(start, end == std::string_view::npos ? end : end - start);
}

std::string_view Source::line(std::uint64_t number) const {
  if (number == 0) {
    return {};
  }
  // The last stretch that begins in a line before that one, or in the first.
  const auto next = std::lower_bound(
      m_stretches.begin(), m_stretches.end(), number,
      [](const Stretch& stretch, std::uint64_t wanted) { return stretch.line < wanted; });
  const Stretch from = next == m_stretches.begin() ? *next : *(next - 1);
  std::size_t start = from.lineStart;
  for (std::uint64_t line = from.line; line < number; ++line) {
    const std::size_t end = m_bytes.find('\n', start);
    if (end == std::string_view::npos) {
      return {};
    }
    start = end + 1;
  }
  return lineAt(start);
}

}  // namespace migration
