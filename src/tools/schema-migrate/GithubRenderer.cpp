#include <string_view>

#include "Messages.h"
#include "Renderers.h"

namespace {

// In a workflow command "%" and line ends are escaped, in its properties ":" and "," too.
std::string escaped(std::string_view text, std::string_view special) {
  constexpr std::string_view kDigits = "0123456789ABCDEF";
  std::string result;
  for (const char c : text) {
    if (special.find(c) == std::string_view::npos) {
      result += wholePrintable({&c, 1});
    } else {
      const auto byte = static_cast<unsigned char>(c);
      result += '%';
      result += kDigits[byte >> 4U];
      result += kDigits[byte & 0xfU];
    }
  }
  return result;
}

std::string dataOf(std::string_view text) { return escaped(text, "%\r\n"); }

std::string propertyOf(std::string_view text) { return escaped(text, "%\r\n:,"); }

std::string placeOf(const std::string& file, std::uint64_t line, std::uint64_t character) {
  std::string text = "file=" + propertyOf(file);
  if (line != 0) {
    text += ",line=" + std::to_string(line) + ",col=" + std::to_string(character);
  }
  return text;
}

}  // namespace

std::string renderGithub(const CheckReport& report) {
  std::string text;
  for (const ReportedFinding& reported : report.findings) {
    const migration::Finding& finding = reported.finding;
    text.append("::").append(migration::wordOf(finding.severity)).append(" ");
    text += placeOf(finding.file, finding.line, reported.character);
    text += ",title=" + propertyOf(finding.rule) + "::" + dataOf(finding.text) + "\n";
  }
  for (const migration::Failure& failure : report.failures) {
    text += "::error " + placeOf(failure.file, failure.line, failure.column);
    text += "::" + dataOf(failure.text) + "\n";
  }
  return text;
}
