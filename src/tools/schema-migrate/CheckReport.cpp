#include "CheckReport.h"

#include <algorithm>
#include <string_view>
#include <utility>

namespace {

// The most of a line that is shown on either side of the place.
constexpr std::size_t kExcerptBefore = 60;
constexpr std::size_t kExcerptBehind = 80;

bool beginsCharacter(char c) { return (static_cast<unsigned char>(c) & 0xc0U) != 0x80; }

void excerpt(std::string_view line, std::size_t offset, ReportedFinding* reported) {
  const std::size_t begin = offset > kExcerptBefore ? offset - kExcerptBefore : 0;
  const std::size_t end = std::min(line.size(), offset + kExcerptBehind);
  reported->excerpt = begin == 0 ? "" : "...";
  reported->caret = reported->excerpt.size() + offset - begin;
  reported->excerpt += line.substr(begin, end - begin);
  reported->excerpt += end == line.size() ? "" : "...";
}

}  // namespace

std::size_t CheckReport::count(migration::Severity severity) const {
  return static_cast<std::size_t>(std::count_if(
      findings.begin(), findings.end(),
      [&](const ReportedFinding& reported) { return reported.finding.severity == severity; }));
}

ReportedFinding Places::reported(migration::Finding finding) {
  ReportedFinding result;
  result.finding = std::move(finding);
  if (result.finding.line == 0 || result.finding.column == 0) {
    return result;
  }
  const std::string_view line = m_source.line(result.finding.line);
  const std::size_t offset =
      std::min(static_cast<std::size_t>(result.finding.column - 1), line.size());
  if (result.finding.line != m_line || offset < m_offset) {
    m_line = result.finding.line;
    m_offset = 0;
    m_character = 1;
  }
  for (; m_offset < offset; ++m_offset) {
    m_character += beginsCharacter(line[m_offset]) ? 1 : 0;
  }
  result.character = m_character;
  if (m_isWithExcerpts) {
    excerpt(line, offset, &result);
  }
  return result;
}
