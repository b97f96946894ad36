// The page of a run of check.

#include <map>
#include <string>
#include <vector>

#include "HtmlCounts.h"
#include "HtmlFiles.h"
#include "HtmlReport.h"
#include "Messages.h"

namespace html {

namespace {

std::string placeText(const Json& told) {
  const std::string file = told.at("file");
  const auto line = told.at("line").get<std::uint64_t>();
  return line == 0 ? file
                   : file + ":" + std::to_string(line) + ":" +
                         std::to_string(told.at("column").get<std::uint64_t>());
}

// How many bytes the first character of a text has.
std::size_t firstLength(const std::string& text) {
  std::size_t length = text.empty() ? 0 : 1;
  while (length < text.size() && (static_cast<unsigned char>(text[length]) & 0xc0U) == 0x80U) {
    ++length;
  }
  return length;
}

void addDefinition(const Json& finding, Dictionary* row) {
  const std::string definition = finding.at("definition");
  if (!definition.empty()) {
    addText(row, "OF", "TEXT", definition);
  }
}

class CheckPage {
 public:
  explicit CheckPage(const Json& document) : m_document(document), m_page("check") {
    for (const Json& rule : document.at("rules")) {
      m_rules[rule.at("id")] = rule.at("what");
    }
  }

  std::string text() {
    addTitle();
    addVerdict();
    addNumbers();
    addFiles();
    addOthers("accepted", "Accepted");
    addOthers("changes", "Mended");
    setProgram(m_document, &m_page);
    return expand(kCheckTemplate, &m_page);
  }

 private:
  using OfRule = std::map<std::string, std::vector<const Json*>>;

  void addTitle() {
    std::string directories;
    for (const Json& directory : m_document.at("directories")) {
      directories += (directories.empty() ? "" : ", ") + directory.get<std::string>();
    }
    setText(&m_page, "ROUTE", directories);
  }

  void addVerdict() {
    const auto errors = m_document.at("counts").at("error").get<std::size_t>();
    const auto warnings = m_document.at("counts").at("warning").get<std::size_t>();
    const Json& failures = m_document.at("failures");
    const bool isGood = m_document.at("exitCode") == 0;
    Dictionary* const verdict = m_page.AddSectionDictionary("VERDICT");
    verdict->SetValue("STYLE_CLASS", isGood ? "good" : "bad");
    verdict->SetValue("SIGN", isGood ? "\u2714" : "\u2718");
    setText(verdict, "TEXT",
            counted(errors, "error") + ", " + counted(warnings, "warning") +
                (failures.empty() ? "." : "; not everything could be checked."));
    if (!failures.empty()) {
      Dictionary* const list = m_page.AddSectionDictionary("FAILURES");
      for (const Json& failure : failures) {
        Dictionary* const row = list->AddSectionDictionary("FAILURE");
        setText(row, "PLACE", placeText(failure));
        setText(row, "TEXT", failure.at("text").get<std::string>());
      }
    }
  }

  void addNumbers() {
    const Json& findings = m_document.at("findings");
    if (findings.empty()) {
      addText(&m_page, "NOTHING", "TEXT", "Nothing was found.");
      return;
    }
    addCounts({"severity", "How severe", "Severity", ""}, severityWords(), m_document.at("counts"),
              &m_page);
    std::map<std::string, std::size_t> counts;
    for (const Json& finding : findings) {
      ++counts[finding.at("rule").get<std::string>()];
    }
    Dictionary* const rules = m_page.AddSectionDictionary("RULES");
    for (const auto& [id, number] : counts) {
      Dictionary* const row = rules->AddSectionDictionary("RULE");
      setText(row, "ID", id);
      setText(row, "TEXT", m_rules[id]);
      setNumber(row, "NUMBER", number);
    }
    addFacet("severity", "Severity", severityWords(), findings, &m_page);
    addFacet("rule", "Rule", {}, findings, &m_page);
  }

  // By file in the order of the document, and within each by rule.
  void addFiles() {
    std::vector<std::string> files;
    std::map<std::string, OfRule> byFile;
    std::map<std::string, std::size_t> counts;
    for (const Json& finding : m_document.at("findings")) {
      const std::string file = finding.at("file");
      if (byFile.count(file) == 0) {
        files.push_back(file);
      }
      byFile[file][finding.at("rule")].push_back(&finding);
      ++counts[file];
    }
    for (std::size_t i = 0; i < files.size(); ++i) {
      Dictionary* const section = m_page.AddSectionDictionary("FILE");
      setNumber(section, "N", i);
      setText(section, "PATH", files[i]);
      setText(section, "SHORT", files[i].substr(files[i].rfind('/') + 1));
      setNumber(section, "NUMBER", counts[files[i]]);
      for (const auto& [id, findings] : byFile[files[i]]) {
        addRule(id, findings, section);
      }
    }
  }

  void addRule(const std::string& id, const std::vector<const Json*>& findings,
               Dictionary* section) {
    Dictionary* const rule = section->AddSectionDictionary("RULE");
    setText(rule, "ID", id);
    setText(rule, "TEXT", m_rules[id]);
    setNumber(rule, "NUMBER", findings.size());
    for (const Json* const finding : findings) {
      addFinding(*finding, rule);
    }
  }

  static void addFinding(const Json& finding, Dictionary* rule) {
    Dictionary* const row = rule->AddSectionDictionary("FINDING");
    const std::string severity = finding.at("severity");
    const Word& word = wordIn(severityWords(), severity);
    setText(row, "SEVERITY", severity);
    row->SetValue("STYLE_CLASS", word.style);
    row->SetValue("SIGN", word.sign);
    setText(row, "RULE_ID", finding.at("rule").get<std::string>());
    if (finding.at("line") != 0) {
      Dictionary* const place = row->AddSectionDictionary("AT");
      setNumber(place, "LINE", finding.at("line").get<std::size_t>());
      setNumber(place, "COLUMN", finding.at("column").get<std::size_t>());
    }
    addDefinition(finding, row);
    setText(row, "TEXT", finding.at("text").get<std::string>());
    const Json& source = finding.at("source");
    if (!source.is_null()) {
      const std::string behind = source.at("behind");
      const std::size_t length = firstLength(behind);
      Dictionary* const line = row->AddSectionDictionary("SOURCE");
      setText(line, "BEFORE", source.at("before").get<std::string>());
      // At the end of a line there is no character to mark.
      setText(line, "FIRST", length == 0 ? " " : behind.substr(0, length));
      setText(line, "BEHIND", behind.substr(length));
    }
  }

  void addOthers(const char* member, const char* heading) {
    const Json& told = m_document.at(member);
    if (told.empty()) {
      return;
    }
    for (const char* const name : {"OTHER", "OTHER_LINK"}) {
      Dictionary* const section = m_page.AddSectionDictionary(name);
      section->SetValue("ID", member);
      section->SetValue("HEADING", heading);
      setNumber(section, "NUMBER", told.size());
      for (const Json& finding : name == std::string("OTHER") ? told : Json::array()) {
        Dictionary* const row = section->AddSectionDictionary("TOLD");
        setText(row, "RULE_ID", finding.at("rule").get<std::string>());
        setText(row, "PLACE", placeText(finding));
        addDefinition(finding, row);
        setText(row, "TEXT", finding.at("text").get<std::string>());
        if (finding.contains("reason")) {
          addText(row, "REMARK", "TEXT", finding.at("reason").get<std::string>());
        }
      }
    }
  }

  const Json& m_document;
  std::map<std::string, std::string> m_rules;
  Dictionary m_page;
};

}  // namespace

}  // namespace html

std::string renderCheckHtml(const std::string& document) {
  const Json parsed = Json::parse(document);
  return html::CheckPage(parsed).text();
}
