#include <string_view>

#include "DisplayText.h"
#include "Messages.h"
#include "Renderers.h"

namespace {

using migration::Severity;

class TextRenderer {
 public:
  explicit TextRenderer(const TextStyle& style) : m_style(style) {}

  void place(const std::string& file, std::uint64_t line, std::uint64_t column) {
    std::string text = wholePrintable(file);
    if (line != 0) {
      text += ":" + std::to_string(line) + ":" + std::to_string(column);
    }
    coloured("1", text + ":");
    m_text += ' ';
  }

  void severity(std::string_view word, std::string_view colour) {
    coloured(colour, std::string(word) + ":");
    m_text += ' ';
  }

  void finding(const ReportedFinding& reported) {
    const migration::Finding& finding = reported.finding;
    place(finding.file, finding.line, finding.column);
    const bool isError = finding.severity == Severity::kError;
    severity(migration::wordOf(finding.severity), isError ? "1;31" : "1;35");
    m_text += wholePrintable(finding.text) + " [" + finding.rule + "]\n";
    if (m_style.isWithExcerpts && finding.line != 0) {
      excerpt(reported);
    }
  }

  void line(const std::string& text) { m_text += text + "\n"; }

  std::string text() && { return std::move(m_text); }

 private:
  // A blank for a TAB, so that the caret stands below its place.
  static std::string shown(std::string_view text) {
    std::string result(text);
    for (char& c : result) {
      c = c == '\t' ? ' ' : c;
    }
    return wholePrintable(result);
  }

  // How many bytes of `text`, from its front or from its end, fit into *room columns, which get
  // fewer by that.
  static std::size_t fitting(std::string_view text, bool isFromEnd, std::size_t* room) {
    const auto isInside = [&](std::size_t at) {
      return at < text.size() && (static_cast<unsigned char>(text[at]) & 0xC0U) == 0x80;
    };
    std::size_t count = 0;
    while (count < text.size()) {
      std::size_t next = count + 1;
      while (isFromEnd ? next < text.size() && isInside(text.size() - next) : isInside(next)) {
        ++next;
      }
      const std::size_t at = isFromEnd ? text.size() - next : count;
      const std::size_t width = displayWidth(shown(text.substr(at, next - count)));
      if (width > *room) {
        break;
      }
      *room -= width;
      count = next;
    }
    return count;
  }

  // A line, with a caret below its place; of one that is too wide what stands around it.
  void excerpt(const ReportedFinding& reported) {
    constexpr char kCut[] = "...";
    constexpr std::size_t kIndent = 2;
    std::string_view before = std::string_view(reported.excerpt).substr(0, reported.caret);
    std::string_view behind = std::string_view(reported.excerpt).substr(reported.caret);
    const bool isTooWide = displayWidth(shown(reported.excerpt)) + kIndent > m_style.width;
    std::string start;
    std::string end;
    if (isTooWide) {
      const std::size_t cuts = kIndent + 2 * (sizeof kCut - 1);
      const std::size_t whole = m_style.width > cuts ? m_style.width - cuts : 1;
      std::size_t room = whole / 2;
      const std::size_t left = fitting(before, true, &room);
      room += whole - whole / 2;
      const std::size_t right = fitting(behind, false, &room);
      start = left < before.size() ? kCut : "";
      end = right < behind.size() ? kCut : "";
      before.remove_prefix(before.size() - left);
      behind = behind.substr(0, right);
    }
    start += shown(before);
    m_text += "  " + start + shown(behind) + end + "\n";
    m_text += std::string(displayWidth(start) + kIndent, ' ');
    coloured("1;32", "^");
    m_text += '\n';
  }

  void coloured(std::string_view colour, const std::string& text) {
    if (m_style.isColoured) {
      m_text.append("\x1b[").append(colour).append("m").append(text).append("\x1b[0m");
    } else {
      m_text += text;
    }
  }

  const TextStyle& m_style;
  std::string m_text;
};

std::string countLine(const CheckReport& report) {
  const std::size_t errors = report.count(Severity::kError);
  const std::size_t warnings = report.count(Severity::kWarning);
  std::string text = report.findings.empty()
                         ? "no findings"
                         : counted(errors, "error") + ", " + counted(warnings, "warning");
  if (!report.accepted.empty()) {
    text += "; " + std::to_string(report.accepted.size()) + " accepted";
  }
  if (!report.failures.empty()) {
    text += "; not everything could be checked";
  }
  return text;
}

}  // namespace

std::string renderText(const CheckReport& report, const TextStyle& style) {
  TextRenderer renderer(style);
  for (const migration::Finding& change : report.changes) {
    renderer.place(change.file, change.line, change.column);
    renderer.severity("mended", "1;32");
    renderer.line(wholePrintable(change.text) + " [" + change.rule + "]");
  }
  for (const ReportedFinding& reported : report.findings) {
    renderer.finding(reported);
  }
  renderer.line(countLine(report));
  return std::move(renderer).text();
}

std::string renderFailures(const CheckReport& report) {
  const TextStyle plain;
  TextRenderer renderer(plain);
  for (const migration::Failure& failure : report.failures) {
    renderer.place(failure.file, failure.line, failure.column);
    renderer.severity("error", "");
    renderer.line(wholePrintable(failure.text));
  }
  return std::move(renderer).text();
}
