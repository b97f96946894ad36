#include "Settings.h"

#include <algorithm>
#include <array>
#include <tuple>
#include <utility>

#include "Rule.h"

#define TOML_EXCEPTIONS 0
#define TOML_ENABLE_FORMATTERS 0
#include <toml++/toml.h>

namespace migration {

namespace {

constexpr std::array<std::string_view, 3> kSeverityWords = {"off", "warning", "error"};

// One reading of a settings file.
class SettingsReader {
 public:
  SettingsReader(const std::string& path, Settings* settings, Failures* failures)
      : m_path(path), m_settings(settings), m_failures(failures) {}

  void read(const toml::table& file) {
    for (const auto& [key, node] : file) {
      if (key == "rules") {
        readSeverities(node);
      } else if (key == "access-classes") {
        readAccessClasses(node);
      } else if (key == "accepted") {
        readAcceptances(node);
      } else {
        complainOfKey(key);
      }
    }
  }

  void complain(const toml::source_position& place, std::string text) {
    m_failures->push_back({m_path, place.line, place.column, "", std::move(text)});
  }

 private:
  void complain(const toml::node& node, std::string text) {
    complain(node.source().begin, std::move(text));
  }

  void complainOfKey(const toml::key& key) {
    complain(key.source().begin, "the key " + std::string(key.str()) + " is not known here");
  }

  void readSeverities(const toml::node& node) {
    if (!node.is_table()) {
      complain(node, "rules must be a table: [rules], and below it lines as D205 = \"off\"");
      return;
    }
    for (const auto& [rule, value] : *node.as_table()) {
      Severity severity = Severity::kOff;
      if (findRule(rule.str()) == nullptr) {
        complain(rule.source().begin, "there is no rule " + std::string(rule.str()));
      } else if (!value.is_string() || !severityOf(value.as_string()->get(), &severity)) {
        complain(value, R"(a severity must be "error", "warning" or "off")");
      } else {
        m_settings->severities[std::string(rule.str())] = severity;
      }
    }
  }

  void readAccessClasses(const toml::node& node) {
    if (!node.is_array()) {
      complain(node, R"(access-classes must be a list of texts, as ["normal", "critical"])");
      return;
    }
    for (const toml::node& element : *node.as_array()) {
      if (element.is_string()) {
        m_settings->accessClasses.push_back(element.as_string()->get());
      } else {
        complain(element, "an access class must be a text in quotes");
      }
    }
  }

  void readAcceptances(const toml::node& node) {
    if (!node.is_array_of_tables()) {
      complain(node, "accepted must be tables that begin with [[accepted]]");
      return;
    }
    for (const toml::node& element : *node.as_array()) {
      readAcceptance(*element.as_table());
    }
  }

  void readAcceptance(const toml::table& table) {
    Acceptance acceptance;
    acceptance.place = {table.source().begin.line, table.source().begin.column};
    const std::size_t before = m_failures->size();
    for (const auto& [key, value] : table) {
      if (key == "line") {
        readLine(value, &acceptance.line);
      } else if (std::string* const text = textOf(&acceptance, key.str()); text != nullptr) {
        readText(key, value, text);
      } else {
        complainOfKey(key);
      }
    }
    if (m_failures->size() == before && isComplete(table, acceptance)) {
      m_settings->accepted.push_back(std::move(acceptance));
    }
  }

  static std::string* textOf(Acceptance* acceptance, std::string_view key) {
    const std::array<std::pair<std::string_view, std::string*>, 4> texts = {
        {{"rule", &acceptance->rule},
         {"file", &acceptance->file},
         {"definition", &acceptance->definition},
         {"reason", &acceptance->reason}}};
    const auto* const found = std::find_if(texts.begin(), texts.end(),
                                           [&](const auto& text) { return text.first == key; });
    return found == texts.end() ? nullptr : found->second;
  }

  void readLine(const toml::node& value, std::uint64_t* line) {
    if (!value.is_integer() || value.as_integer()->get() < 1) {
      complain(value, "line must be a number from 1");
      return;
    }
    *line = static_cast<std::uint64_t>(value.as_integer()->get());
  }

  void readText(const toml::key& key, const toml::node& value, std::string* text) {
    if (!value.is_string() || value.as_string()->get().empty()) {
      complain(value, std::string(key.str()) + " must be a text in quotes that is not empty");
      return;
    }
    *text = value.as_string()->get();
  }

  bool isComplete(const toml::table& table, const Acceptance& acceptance) {
    const std::array<std::pair<const char*, const std::string*>, 3> required = {
        {{"rule", &acceptance.rule}, {"file", &acceptance.file}, {"reason", &acceptance.reason}}};
    for (const auto& [key, text] : required) {
      if (text->empty()) {
        complain(table, "this accepted finding has no " + std::string(key));
        return false;
      }
    }
    if (findRule(acceptance.rule) == nullptr) {
      complain(*table.get("rule"), "there is no rule " + acceptance.rule);
      return false;
    }
    if (acceptance.line != 0 && !acceptance.definition.empty()) {
      complain(table, "an accepted finding has its place by line or by definition, not by both");
      return false;
    }
    return true;
  }

  const std::string& m_path;
  Settings* m_settings;
  Failures* m_failures;
};

std::string_view lastPartOf(std::string_view path) {
  return path.substr(path.rfind('/') == std::string_view::npos ? 0 : path.rfind('/') + 1);
}

bool isEqualButForCase(std::string_view left, std::string_view right) {
  const auto lower = [](char c) { return c >= 'A' && c <= 'Z' ? static_cast<char>(c + 32) : c; };
  return std::equal(left.begin(), left.end(), right.begin(), right.end(),
                    [&](char a, char b) { return lower(a) == lower(b); });
}

// `shown` is "attribute type cn (2.5.4.3)", "object class person" or "vendor extension 2.5.4.3".
bool isNamed(std::string_view shown, std::string_view wanted) {
  if (isEqualButForCase(shown, wanted)) {
    return true;
  }
  const std::size_t last = shown.rfind(' ');
  if (last == std::string_view::npos) {
    return false;
  }
  const std::string_view word = shown.substr(last + 1);
  if (word.size() < 2 || word.front() != '(' || word.back() != ')') {
    return isEqualButForCase(word, wanted);
  }
  const std::string_view before = shown.substr(0, last);
  return isEqualButForCase(word.substr(1, word.size() - 2), wanted) ||
         isEqualButForCase(before.substr(before.rfind(' ') + 1), wanted);
}

bool fits(const Acceptance& acceptance, const Finding& finding) {
  if (acceptance.rule != finding.rule ||
      (acceptance.file != finding.file && acceptance.file != lastPartOf(finding.file))) {
    return false;
  }
  return acceptance.definition.empty() ? acceptance.line == finding.line
                                       : isNamed(finding.definition, acceptance.definition);
}

// "D205 at V3.user.at, line 3", "D205 at V3.user.at, definition cn".
std::string describe(const Acceptance& acceptance) {
  std::string text = acceptance.rule + " at " + acceptance.file;
  if (!acceptance.definition.empty()) {
    text += ", definition " + acceptance.definition;
  } else if (acceptance.line != 0) {
    text += ", line " + std::to_string(acceptance.line);
  }
  return text;
}

Finding unused(const Settings& settings, const Acceptance& acceptance, Severity severity) {
  return {"S801",
          severity,
          settings.path,
          acceptance.place.line,
          acceptance.place.column,
          "the accepted finding " + describe(acceptance) +
              " does not occur, so that it would hide a new one there; remove this entry",
          ""};
}

bool isList(const Source* list, const Acceptance& acceptance) {
  return list != nullptr &&
         (acceptance.file == list->path() || acceptance.file == lastPartOf(list->path()));
}

// Whether this run looks for what the entry accepts: a rule may be off, or about a list or another
// installation that was not given.
bool couldOccur(const CheckRequest& request, const Acceptance& acceptance) {
  const auto severity = request.severities.find(acceptance.rule);
  if (severity != request.severities.end() && severity->second == Severity::kOff) {
    return false;
  }
  if (acceptance.rule == "R404" || acceptance.rule == "I701") {
    return request.against != nullptr;
  }
  if (acceptance.rule.front() == 'O' || acceptance.rule == "T307") {
    return isList(request.withdrawList, acceptance) ||
           std::any_of(request.excludeLists.begin(), request.excludeLists.end(),
                       [&](const Source* list) { return isList(list, acceptance); });
  }
  return true;
}

constexpr char kExampleType[] =
    "attributetypes=( 1.3.6.1.4.1.32473.1.1 NAME 'badge' DESC 'a number' )\n";

}  // namespace

bool severityOf(std::string_view word, Severity* severity) {
  const auto* const found = std::find(kSeverityWords.begin(), kSeverityWords.end(), word);
  if (found == kSeverityWords.end()) {
    return false;
  }
  *severity = static_cast<Severity>(found - kSeverityWords.begin());
  return true;
}

std::string_view wordOf(Severity severity) {
  return kSeverityWords[static_cast<std::size_t>(severity)];
}

Settings readSettings(const Source& source, Failures* failures) {
  Settings settings;
  settings.path = source.path();
  Failures found;
  SettingsReader reader(settings.path, &settings, &found);
  const toml::parse_result result = toml::parse(source.bytes(), source.path());
  if (result) {
    reader.read(result.table());
  } else {
    reader.complain(result.error().source().begin,
                    "this is no TOML: " + std::string(result.error().description()));
  }
  // Tables are walked in the order of their keys; a file is read from its beginning.
  std::stable_sort(found.begin(), found.end(), [](const Failure& left, const Failure& right) {
    return std::tie(left.line, left.column) < std::tie(right.line, right.column);
  });
  std::stable_sort(settings.accepted.begin(), settings.accepted.end(),
                   [](const Acceptance& left, const Acceptance& right) {
                     return left.place.line < right.place.line;
                   });
  failures->insert(failures->end(), found.begin(), found.end());
  return settings;
}

JudgedFindings judge(const Settings& settings, Findings findings,
                     const std::function<bool(const Acceptance&)>& couldOccur) {
  JudgedFindings judged;
  std::vector<bool> isUsed(settings.accepted.size(), false);
  std::map<std::string_view, std::vector<std::size_t>> byRule;
  for (std::size_t index = 0; index < settings.accepted.size(); ++index) {
    byRule[settings.accepted[index].rule].push_back(index);
  }
  for (Finding& finding : findings) {
    const Acceptance* by = nullptr;
    // The keys refer to the settings: that of a finding, which moves, must not become one.
    if (const auto ofRule = byRule.find(finding.rule); ofRule != byRule.end()) {
      for (const std::size_t index : ofRule->second) {
        if (fits(settings.accepted[index], finding)) {
          by = &settings.accepted[index];
          isUsed[index] = true;
        }
      }
    }
    if (by == nullptr) {
      judged.findings.push_back(std::move(finding));
    } else {
      judged.accepted.push_back({std::move(finding), by->reason});
    }
  }
  const auto severity = settings.severities.find("S801");
  const Severity given =
      severity == settings.severities.end() ? Severity::kWarning : severity->second;
  for (std::size_t index = 0; index < settings.accepted.size(); ++index) {
    if (!isUsed[index] && given != Severity::kOff && couldOccur(settings.accepted[index])) {
      judged.findings.push_back(unused(settings, settings.accepted[index], given));
    }
  }
  return judged;
}

JudgedFindings checkWithSettings(CheckRequest request, const Settings& settings, bool isComplete) {
  request.severities.insert(settings.severities.begin(), settings.severities.end());
  if (request.knownAccessClasses.empty()) {
    request.knownAccessClasses = settings.accessClasses;
  }
  Settings inEffect = settings;
  inEffect.severities = request.severities;
  return judge(inEffect, check(request), [&](const Acceptance& acceptance) {
    return isComplete && couldOccur(request, acceptance);
  });
}

const std::vector<RuleInfo>& settingsRules() {
  static const std::vector<RuleInfo> kRules = {
      {"S801",
       "accepted-finding-does-not-occur",
       Severity::kWarning,
       "The settings file accepts a finding that this installation does not have.",
       "An entry that nothing needs hides the next mistake at the same place.",
       "Remove the entry from the settings file; if the definition has moved, name its new place.",
       {{"V3.user.at", kExampleType},
        {kSettingsFile,
         "[[accepted]]\nrule = \"D205\"\nfile = \"V3.user.at\"\ndefinition = \"badge\"\n"
         "reason = \"an OID has been applied for\"\n"}},
       {{"V3.user.at", "attributetypes=( badge-oid NAME 'badge' DESC 'a number' )\n"},
        {kSettingsFile,
         "[[accepted]]\nrule = \"D205\"\nfile = \"V3.user.at\"\ndefinition = \"badge\"\n"
         "reason = \"an OID has been applied for\"\n"}}}};
  return kRules;
}

}  // namespace migration
