#include "RulePage.h"

#include <libschema-migration/Settings.h>

#include <string_view>

#include "Messages.h"

namespace {

constexpr std::size_t kWidth = 79;

// The words of `text` in lines of at most kWidth columns; `first` before the first one, and as many
// blanks before the others.
std::string wrapped(const std::string& first, std::string_view text) {
  std::string result = first;
  std::size_t column = first.size();
  bool isLineEmpty = true;
  while (!text.empty()) {
    const std::string_view word = text.substr(0, text.find(' '));
    text.remove_prefix(std::min(text.size(), word.size() + 1));
    if (!isLineEmpty && column + 1 + word.size() > kWidth) {
      result += "\n" + std::string(first.size(), ' ');
      column = first.size();
      isLineEmpty = true;
    }
    result += isLineEmpty ? "" : " ";
    result += word;
    column += word.size() + (isLineEmpty ? 0 : 1);
    isLineEmpty = false;
  }
  return result + "\n";
}

// The lines of a file, indented; a last one without its line end says so.
std::string indented(std::string_view bytes) {
  std::string result;
  while (!bytes.empty()) {
    const std::size_t end = bytes.find('\n');
    result += "      " + wholePrintable(bytes.substr(0, end)) + "\n";
    if (end == std::string_view::npos) {
      return result + "      (without a line end)\n";
    }
    bytes.remove_prefix(end + 1);
  }
  return result.empty() ? "      (empty)\n" : result;
}

std::string renderFiles(const std::vector<migration::ExampleFile>& files) {
  std::string result;
  for (const migration::ExampleFile& file : files) {
    result += "    " + std::string(file.name) + ":\n" + indented(file.bytes);
  }
  return result;
}

}  // namespace

std::string renderPage(const migration::RuleInfo& rule) {
  return std::string(rule.id) + " " + rule.name + " (" +
         std::string(migration::wordOf(rule.severity)) + ")\n\n" + wrapped("  ", rule.what) +
         "\n  An example:\n" + renderFiles(rule.example) + "\n" + wrapped("  Why: ", rule.why) +
         "\n" + wrapped("  How to mend it: ", rule.mend) + "\n  This is no " + rule.id + ":\n" +
         renderFiles(rule.nearMiss);
}

std::string renderList(const std::vector<const migration::RuleInfo*>& rules) {
  std::string result;
  for (const migration::RuleInfo* const rule : rules) {
    std::string first =
        std::string(rule->id) + "  " + std::string(migration::wordOf(rule->severity));
    first.resize(15, ' ');
    result += wrapped(first, rule->what);
  }
  return result;
}
