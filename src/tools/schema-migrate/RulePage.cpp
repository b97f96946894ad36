#include "RulePage.h"

#include <libschema-migration/Settings.h>

#include <algorithm>
#include <string_view>

#include "DisplayText.h"
#include "Messages.h"
#include "Terminal.h"

namespace {

// The words of `text`, `first` before them.
std::string inLines(const std::string& first, std::string_view text) {
  constexpr std::size_t kWidest = 79;
  return wrapped(first, text, std::min(longestLine(), kWidest));
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

// Lists and settings are the administrator's own files, and no server reads them.
bool isOfLists(const migration::RuleInfo& rule) {
  const std::string id(rule.id);
  return id.front() == 'O' || id.front() == 'S' || id == "T307";
}

}  // namespace

std::string renderPage(const migration::RuleInfo& rule) {
  return std::string(rule.id) + " " + rule.name + " (" +
         std::string(migration::wordOf(rule.severity)) + ")\n\n" + inLines("  ", rule.what) +
         "\n  An example:\n" + renderFiles(rule.example) + "\n" + inLines("  Why: ", rule.why) +
         "\n" +
         inLines(isOfLists(rule) ? "  How to mend it: " : "  How to mend it, in a copy: ",
                 rule.mend) +
         "\n  This is no " + rule.id + ":\n" + renderFiles(rule.nearMiss);
}

std::string renderList(const std::vector<const migration::RuleInfo*>& rules) {
  std::string result;
  for (const migration::RuleInfo* const rule : rules) {
    std::string first =
        std::string(rule->id) + "  " + std::string(migration::wordOf(rule->severity));
    first.resize(15, ' ');
    result += inLines(first, rule->what);
  }
  return result;
}
