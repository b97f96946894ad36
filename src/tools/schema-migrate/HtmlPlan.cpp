// The page of a plan.

#include <string>
#include <utility>
#include <vector>

#include "HtmlCounts.h"
#include "HtmlDefinition.h"
#include "HtmlFiles.h"
#include "HtmlReport.h"
#include "HtmlTree.h"
#include "Messages.h"

namespace html {

namespace {

// The directory that the files of a role lie in; empty without one.
std::string directoryOf(const Json& document, const char* role) {
  for (const Json& input : document.at("inputs")) {
    if (input.at("role") == role) {
      const std::string path = input.at("path");
      const std::size_t slash = path.rfind('/');
      return slash == std::string::npos ? "." : path.substr(0, slash);
    }
  }
  return "";
}

std::string placeText(const Json& told) {
  const std::string file = told.at("file");
  const auto line = told.at("line").get<std::uint64_t>();
  return line == 0 ? file : file + ":" + std::to_string(line);
}

class PlanPage {
 public:
  explicit PlanPage(const Json& document)
      : m_document(document),
        m_definitions(document.at("definitions")),
        m_names(m_definitions),
        m_page("plan") {
    for (std::size_t at = 0; at < m_definitions.size(); ++at) {
      const std::string outcome = m_definitions[at].at("outcome");
      (outcome == "undecided"                   ? m_undecided
       : outcome == "same" || outcome == "gone" ? m_same
                                                : m_rest)
          .push_back(at);
    }
  }

  std::string text() {
    addTitle();
    addVerdict();
    addNumbers();
    addSections();
    addTree(m_document, m_names, &m_page);
    addFindings();
    addInputs();
    setProgram(m_document, &m_page);
    return expand(kPlanTemplate, &m_page);
  }

 private:
  void addTitle() {
    const std::string command = m_document.at("command");
    m_page.SetValue("TITLE", command == "diff"   ? "Differences"
                             : command == "plan" ? "Plan of a migration"
                                                 : "Migration");
    const std::string base = directoryOf(m_document, "base");
    setText(&m_page, "ROUTE",
            directoryOf(m_document, "old") + " \u2192 " + directoryOf(m_document, "new") +
                (base.empty() ? ", without BASE" : ", BASE " + base));
  }

  void addVerdict() {
    if (m_document.at("ready").get<bool>()) {
      m_page.ShowSection("READY");
      return;
    }
    const Json& outcomes = m_document.at("counts").at("outcome");
    const auto undecided = outcomes.find("undecided");
    const Json& refusals = m_document.at("refusals");
    std::string why;
    if (undecided != outcomes.end()) {
      why = counted(undecided->get<std::size_t>(), "definition") + " undecided";
    }
    if (!refusals.empty()) {
      why += (why.empty() ? "" : ", ") + counted(refusals.size(), "reason") + " below";
    }
    addText(&m_page, "NOT_READY", "WHY_NOT", why);
    if (!refusals.empty()) {
      Dictionary* const list = m_page.AddSectionDictionary("REFUSALS");
      for (const Json& refusal : refusals) {
        Dictionary* const row = list->AddSectionDictionary("REFUSAL");
        setText(row, "PLACE", placeText(refusal));
        setText(row, "TEXT", refusal.at("text").get<std::string>());
        const std::string rule = refusal.at("rule");
        if (!rule.empty()) {
          addText(row, "RULE", "ID", rule);
        }
      }
    }
  }

  void addNumbers() {
    const Json& counts = m_document.at("counts");
    addCounts({"class", "Who changed it", "Class", "same"}, classWords(), counts.at("class"),
              &m_page);
    addCounts({"risk", "How risky it is", "Risk", "none"}, riskWords(), counts.at("risk"), &m_page);
    addCounts({"outcome", "What comes of it", "Outcome", "same"}, outcomeWords(),
              counts.at("outcome"), &m_page);
    addFacet("class", "Class", classWords(), m_definitions, &m_page);
    addFacet("risk", "Risk", riskWords(), m_definitions, &m_page);
    addFacet("kind", "Kind", kindWords(), m_definitions, &m_page);
  }

  void addSection(const char* id, const char* heading, const char* nothing,
                  const std::vector<std::size_t>& definitions, const DefinitionWriter& writer) {
    Dictionary* const section = m_page.AddSectionDictionary("SECTION");
    section->SetValue("SECTION_ID", id);
    section->SetValue("HEADING", heading);
    setNumber(section, "NUMBER", definitions.size());
    if (definitions.empty()) {
      addText(section, "NOTHING", "TEXT", nothing);
    }
    for (const std::size_t at : definitions) {
      writer.addWhole(at, section);
    }
  }

  void addSections() {
    setNumber(&m_page, "UNDECIDED_COUNT", m_undecided.size());
    setNumber(&m_page, "REST_COUNT", m_rest.size());
    const bool hasBase = !directoryOf(m_document, "base").empty();
    const DefinitionWriter writer(m_definitions, m_names, hasBase);
    addSection("undecided", "Undecided", "Nothing is undecided.", m_undecided, writer);
    addSection("rest", "Decided", "No other difference.", m_rest, writer);
    if (m_same.empty()) {
      return;
    }
    setNumber(m_page.AddSectionDictionary("SAME_LINK"), "NUMBER", m_same.size());
    Dictionary* const same = m_page.AddSectionDictionary("SAME");
    setNumber(same, "NUMBER", m_same.size());
    for (const std::size_t at : m_same) {
      writer.addLine(at, same);
    }
  }

  void addFindings() {
    const std::size_t number =
        m_document.at("newInResult").size() + m_document.at("findings").size();
    if (number == 0) {
      return;
    }
    setNumber(m_page.AddSectionDictionary("FINDINGS_LINK"), "NUMBER", number);
    Dictionary* const section = m_page.AddSectionDictionary("FINDINGS");
    setNumber(section, "NUMBER", number);
    addGroup("In the result, and neither in OLD nor in NEW", m_document.at("newInResult"), section);
    addGroup("In the inputs", m_document.at("findings"), section);
  }

  void addGroup(const char* heading, const Json& findings, Dictionary* section) {
    if (findings.empty()) {
      return;
    }
    Dictionary* const group = section->AddSectionDictionary("GROUP");
    group->SetValue("HEADING", heading);
    for (const Json& finding : findings) {
      Dictionary* const row = group->AddSectionDictionary("FINDING");
      const Word& severity =
          wordIn(severityWords(), finding.at("severity").get_ref<const std::string&>());
      setText(row, "RULE", finding.at("rule").get<std::string>());
      row->SetValue("SEVERITY", severity.said);
      row->SetValue("SIGN", severity.sign);
      setText(row, "PLACE", placeText(finding));
      setText(row, "TEXT", finding.at("text").get<std::string>());
      const std::string definition = finding.at("definition");
      if (!definition.empty()) {
        m_names.addSentence("PART", definition, Names::kNowhere, row->AddSectionDictionary("OF"));
      }
    }
  }

  void addInputs() {
    for (const Json& input : m_document.at("inputs")) {
      Dictionary* const row = m_page.AddSectionDictionary("INPUT");
      setText(row, "ROLE", input.at("role").get<std::string>());
      setText(row, "PATH", input.at("path").get<std::string>());
      setText(row, "DIGEST", input.at("sha256").get<std::string>());
    }
  }

  const Json& m_document;
  const Json& m_definitions;
  Names m_names;
  Dictionary m_page;
  std::vector<std::size_t> m_undecided;
  std::vector<std::size_t> m_rest;
  std::vector<std::size_t> m_same;
};

}  // namespace

}  // namespace html

std::string renderPlanHtml(const std::string& document) {
  const Json parsed = Json::parse(document);
  return html::PlanPage(parsed).text();
}
