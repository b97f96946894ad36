// The page of a fleet.

#include <algorithm>
#include <map>
#include <string>
#include <utility>
#include <vector>

#include "HtmlCounts.h"
#include "HtmlFiles.h"
#include "HtmlReport.h"
#include "Messages.h"

namespace html {

namespace {

const std::vector<Word>& standingWords() {
  static const std::vector<Word> kWords = {
      {"unchanged", "unchanged", "=", "plain"}, {"changed", "changed", "~", "site"},
      {"added", "added", "+", "site"},          {"removed", "removed", "\u2212", "site"},
      {"absent", "lack it", "\u00b7", "plain"}, {"unknown", "have it otherwise", "?", "both"}};
  return kWords;
}

const std::vector<Word>& stateWords() {
  static const std::vector<Word> kWords = {{"ready", "ready", "\u2714", "release"},
                                           {"undecided", "undecided", "?", "conflict"},
                                           {"refused", "refused", "\u2718", "conflict"},
                                           {"decided", "decided", "=", "plain"}};
  return kWords;
}

const char* stateOf(const Json& installation) {
  return installation.at("ready").get<bool>() ? "ready"
         : installation.at("refusals") != 0   ? "refused"
                                              : "undecided";
}

std::string textAt(const Json& value, const char* member) {
  const Json& text = value.at(member);
  return text.is_null() ? "" : text.get<std::string>();
}

std::size_t numberAt(const Json& value, const char* member) {
  return value.at(member).get<std::size_t>();
}

std::string joined(const Json& words, const char* between = ", ") {
  std::string text;
  for (const Json& word : words) {
    text.append(text.empty() ? "" : between).append(word.get_ref<const std::string&>());
  }
  return text;
}

void addClauses(const Json& clauses, Dictionary* item) {
  if (clauses.empty()) {
    return;
  }
  Dictionary* const table = item->AddSectionDictionary("CLAUSES");
  for (const Json& clause : clauses) {
    Dictionary* const row = table->AddSectionDictionary("CLAUSE");
    setText(row, "CLAUSE_NAME", textAt(clause, "clause"));
    setText(row, "BASE", textAt(clause, "base"));
    setText(row, "OLD", textAt(clause, "old"));
    setText(row, "NEW", textAt(clause, "new"));
  }
}

void addAlike(const Json& clauses, Dictionary* item) {
  std::string text;
  for (const Json& clause : clauses) {
    text += (text.empty() ? "" : " \u00b7 ") + textAt(clause, "clause");
    text += clause.at("clause") == clause.at("value") ? "" : " " + textAt(clause, "value");
  }
  if (!text.empty()) {
    addText(item, "ALIKE", "TEXT", text);
  }
}

void setIdentity(const Json& told, Dictionary* item) {
  const std::string kind = textAt(told, "kind");
  setText(item, "KIND", kind);
  setText(item, "KIND_WORD", wordIn(kindWords(), kind).said);
  setText(item, "NAME", textAt(told, "name"));
  setText(item, "OID", textAt(told, "oid"));
}

// What stands where a definition meets an installation.
struct Cell {
  std::string sign;
  const char* style = "plain";
};

Cell cellOf(const Json& group, std::size_t way) {
  const std::string standing = textAt(group, "standing");
  const Word& word = wordIn(standingWords(), standing);
  const bool isWay = standing == "changed" || standing == "added" || standing == "unknown";
  const bool isUndecided = group.at("outcome") == "undecided";
  return {word.sign + (isWay ? std::to_string(way) : "") + (isUndecided ? "!" : ""),
          isUndecided ? "conflict" : word.style};
}

// The definitions of a release against its installations, of which those that are alike in all of
// them share a column.
class Matrix {
 public:
  Matrix(const Json& document, std::size_t release) : m_document(document) {
    for (const Json& installation : document.at("installations")) {
      if (numberAt(installation, "release") == release) {
        m_places[textAt(installation, "name")] = m_names.size();
        m_names.push_back(textAt(installation, "name"));
      }
    }
  }

  void addRow(std::size_t definition) {
    const Json& told = m_document.at("definitions")[definition];
    const bool isShipped = numberAt(told, "unchanged") != 0;
    std::vector<std::size_t> row(m_names.size(), 0);
    std::vector<Cell> cells = {isShipped ? Cell{"=", "plain"} : Cell{"\u00b7", "plain"}};
    for (const Json& group : told.at("groups")) {
      for (const Json& name : group.at("installations")) {
        row[m_places.at(name.get_ref<const std::string&>())] = cells.size();
      }
      cells.push_back(cellOf(group, cells.size()));
    }
    m_definitions.push_back(definition);
    m_rows.push_back(std::move(row));
    m_cells.push_back(std::move(cells));
  }

  void addTo(Dictionary* section) const {
    const std::vector<std::vector<std::size_t>> columns = columnsOf();
    if (m_rows.empty() || columns.size() > kMostColumns) {
      return;
    }
    Dictionary* const matrix = section->AddSectionDictionary("MATRIX");
    setText(matrix, "LABEL", "Definitions against installations");
    for (std::size_t i = 0; i < columns.size(); ++i) {
      const std::string title = columns[i].size() == 1 ? m_names[columns[i].front()]
                                                       : std::to_string(i + 1) + " \u00d7" +
                                                             std::to_string(columns[i].size());
      addText(matrix, "COLUMN", "TEXT", title);
      if (columns[i].size() != 1) {
        std::string names;
        for (const std::size_t at : columns[i]) {
          names += (names.empty() ? "" : ", ") + m_names[at];
        }
        addText(matrix, "LEGEND", "TEXT", title + ": " + names);
      }
    }
    for (std::size_t row = 0; row < m_rows.size(); ++row) {
      addRowTo(row, columns, matrix);
    }
  }

 private:
  static constexpr std::size_t kMostColumns = 60;

  // The installations of each, the largest first.
  std::vector<std::vector<std::size_t>> columnsOf() const {
    std::map<std::vector<std::size_t>, std::vector<std::size_t>> alike;
    for (std::size_t at = 0; at < m_names.size(); ++at) {
      std::vector<std::size_t> column;
      column.reserve(m_rows.size());
      for (const std::vector<std::size_t>& row : m_rows) {
        column.push_back(row[at]);
      }
      alike[std::move(column)].push_back(at);
    }
    std::vector<std::vector<std::size_t>> columns;
    columns.reserve(alike.size());
    for (const auto& [column, installations] : alike) {
      columns.push_back(installations);
    }
    std::stable_sort(columns.begin(), columns.end(), [](const auto& left, const auto& right) {
      return left.size() > right.size();
    });
    return columns;
  }

  void addRowTo(std::size_t at, const std::vector<std::vector<std::size_t>>& columns,
                Dictionary* matrix) const {
    const Json& definition = m_document.at("definitions")[m_definitions[at]];
    Dictionary* const row = matrix->AddSectionDictionary("ROW");
    const std::string name = textAt(definition, "name");
    setNumber(row, "AT", m_definitions[at]);
    setText(row, "NAME", name.empty() ? textAt(definition, "oid") : name);
    for (const std::vector<std::size_t>& column : columns) {
      const Cell& cell = m_cells[at][m_rows[at][column.front()]];
      Dictionary* const told = row->AddSectionDictionary("CELL");
      setText(told, "SIGN", cell.sign);
      told->SetValue("STYLE_CLASS", cell.style);
    }
  }

  const Json& m_document;
  std::map<std::string, std::size_t> m_places;
  std::vector<std::string> m_names;
  std::vector<std::size_t> m_definitions;
  std::vector<std::vector<std::size_t>> m_rows;  // a cell for each installation
  std::vector<std::vector<Cell>> m_cells;        // the cells of each row
};

class FleetPage {
 public:
  explicit FleetPage(const Json& document)
      : m_document(document), m_installations(document.at("installations")), m_page("fleet") {}

  std::string text() {
    setText(&m_page, "ROUTE", counted(m_installations.size(), "installation"));
    setNumber(&m_page, "INSTALLATION_COUNT", m_installations.size());
    setNumber(&m_page, "QUESTION_COUNT", m_document.at("questions").size());
    addVerdict();
    addNumbers();
    addQuestions();
    addReleases();
    addInstallations();
    setProgram(m_document, &m_page);
    return expand(kFleetTemplate, &m_page);
  }

 private:
  void addVerdict() {
    const Json& counts = m_document.at("counts");
    const bool isGood = m_document.at("ready").get<bool>();
    Dictionary* const verdict = m_page.AddSectionDictionary("VERDICT");
    verdict->SetValue("STYLE_CLASS", isGood ? "good" : "bad");
    verdict->SetValue("SIGN", isGood ? "\u2714" : "\u2718");
    setText(verdict, "TEXT",
            std::to_string(numberAt(counts, "ready")) + " of " +
                counted(m_installations.size(), "installation") + " ready; " +
                counted(numberAt(counts, "questions"), "question") + " in all; " +
                std::to_string(numberAt(counts, "refused")) + " refused.");
    const Json& failures = m_document.at("failures");
    if (failures.empty()) {
      return;
    }
    Dictionary* const list = m_page.AddSectionDictionary("FAILURES");
    for (const Json& failure : failures) {
      Dictionary* const row = list->AddSectionDictionary("FAILURE");
      const std::size_t line = numberAt(failure, "line");
      setText(row, "PLACE",
              textAt(failure, "file") + (line == 0 ? "" : ":" + std::to_string(line)));
      setText(row, "TEXT", textAt(failure, "text"));
    }
  }

  void addNumbers() {
    std::map<std::string, std::size_t> states;
    for (const Json& installation : m_installations) {
      ++states[stateOf(installation)];
    }
    addCounts({"state", "Installations", "State", ""}, stateWords(), states, &m_page);
    Json items = Json::array();
    for (const Json& definition : m_document.at("definitions")) {
      items.push_back({{"kind", definition.at("kind")},
                       {"state", definition.at("undecided") == 0 ? "decided" : "undecided"}});
    }
    std::map<std::string, std::size_t> decided;
    for (const Json& item : items) {
      ++decided[item.at("state").get<std::string>()];
    }
    addCounts({"decided", "Definitions", "State", ""}, stateWords(), decided, &m_page);
    for (const Json& question : m_document.at("questions")) {
      items.push_back({{"kind", question.at("kind")}, {"state", "undecided"}});
    }
    if (!items.empty()) {
      addFacet("kind", "Kind", kindWords(), items, &m_page);
      addFacet("state", "State", stateWords(), items, &m_page);
    }
  }

  // Where the definition of a question is told; as many as there are definitions when it is not.
  std::size_t placeOf(const Json& question) const {
    const Json& definitions = m_document.at("definitions");
    for (const char* const member : {"oid", "name"}) {
      for (std::size_t at = 0; at < definitions.size(); ++at) {
        if (definitions[at].at("kind") == question.at("kind") &&
            definitions[at].at(member) == question.at(member)) {
          return at;
        }
      }
    }
    return definitions.size();
  }

  void addQuestions() {
    const Json& questions = m_document.at("questions");
    if (questions.empty()) {
      addText(&m_page, "NOTHING", "TEXT", "Nothing is undecided.");
    }
    for (std::size_t at = 0; at < questions.size(); ++at) {
      addQuestion(at, questions[at]);
    }
  }

  void addQuestion(std::size_t number, const Json& question) {
    Dictionary* const item = m_page.AddSectionDictionary("QUESTION");
    setNumber(item, "N", number);
    setIdentity(question, item);
    const std::size_t place = placeOf(question);
    if (place != m_document.at("definitions").size()) {
      setNumber(item->AddSectionDictionary("TO"), "AT", place);
      item->ShowSection("TO_END");
    }
    setNumber(item, "NUMBER", question.at("installations").size());
    setNumber(item, "READY", numberAt(question, "readyThen"));
    setText(item, "REASON", textAt(question, "reason"));
    addClauses(question.at("clauses"), item);
    addAlike(question.at("otherClauses"), item);
    addChoices(question, item);
    setText(item, "WHERE", joined(question.at("installations")));
  }

  static void addChoices(const Json& question, Dictionary* item) {
    std::vector<std::string> choices;
    if (!question.at("take").empty()) {
      choices.push_back("take " + joined(question.at("take")));
    }
    if (!question.at("openClauses").empty()) {
      choices.push_back("decide " + joined(question.at("openClauses")));
    }
    if (question.at("move").get<bool>()) {
      choices.emplace_back("rename or renumber it");
    }
    if (!choices.empty()) {
      addText(item, "CHOICES", "TEXT", joined(choices, "; or "));
    }
  }

  void addReleases() {
    const Json& releases = m_document.at("releases");
    for (std::size_t at = 0; at < releases.size(); ++at) {
      const Json& release = releases[at];
      Dictionary* const section = m_page.AddSectionDictionary("RELEASE");
      setNumber(section, "N", at);
      setText(section, "HEADING",
              releases.size() == 1 ? "Definitions" : "Release " + std::to_string(at + 1));
      setText(section, "ROUTE",
              (release.at("base").is_null() ? "without BASE" : "BASE " + textAt(release, "base")) +
                  " \u2192 NEW " + textAt(release, "new") + ", at " +
                  counted(numberAt(release, "installations"), "installation"));
      if (!release.at("differsFromFirst").empty()) {
        addText(section, "DIFFERS", "TEXT",
                "Differs from release 1 in " + joined(release.at("differsFromFirst")));
      }
      setText(section, "SAME",
              std::to_string(numberAt(release, "unchangedDefinitions")) + " of " +
                  counted(numberAt(release, "definitions"), "definition") +
                  " unchanged at every installation.");
      addDefinitions(at + 1, section);
    }
  }

  void addDefinitions(std::size_t release, Dictionary* section) {
    const Json& definitions = m_document.at("definitions");
    Matrix matrix(m_document, release);
    std::size_t count = 0;
    for (std::size_t at = 0; at < definitions.size(); ++at) {
      if (numberAt(definitions[at], "release") == release) {
        matrix.addRow(at);
        addDefinition(at, definitions[at], section);
        ++count;
      }
    }
    setNumber(section, "NUMBER", count);
    matrix.addTo(section);
  }

  static void addDefinition(std::size_t number, const Json& definition, Dictionary* section) {
    Dictionary* const item = section->AddSectionDictionary("DEFINITION");
    const bool isUndecided = definition.at("undecided") != 0;
    setNumber(item, "N", number);
    setIdentity(definition, item);
    item->SetValue("STATE", isUndecided ? "undecided" : "decided");
    item->SetValue("STYLE_CLASS", isUndecided ? "conflict" : "plain");
    setNumber(item, "HAS", numberAt(definition, "has"));
    setNumber(item, "UNCHANGED", numberAt(definition, "unchanged"));
    setNumber(item, "WAYS", numberAt(definition, "ways"));
    setNumber(item, "UNDECIDED", numberAt(definition, "undecided"));
    std::size_t way = 0;
    for (const Json& group : definition.at("groups")) {
      Dictionary* const told = item->AddSectionDictionary("GROUP");
      const Cell cell = cellOf(group, ++way);
      setText(told, "SIGN", cell.sign);
      told->SetValue("STYLE_CLASS", cell.style);
      setNumber(told, "NUMBER", group.at("installations").size());
      setText(told, "STANDING", wordIn(standingWords(), textAt(group, "standing")).said);
      setText(told, "OUTCOME", textAt(group, "outcome"));
      addClauses(group.at("clauses"), told);
      addAlike(group.at("otherClauses"), told);
      setText(told, "WHERE", joined(group.at("installations")));
    }
  }

  void addInstallations() {
    for (const Json& installation : m_installations) {
      Dictionary* const row = m_page.AddSectionDictionary("INSTALLATION");
      const Word& state = wordIn(stateWords(), stateOf(installation));
      setText(row, "NAME", textAt(installation, "name"));
      row->SetValue("SIGN", state.sign);
      row->SetValue("STYLE_CLASS", state.style);
      row->SetValue("STATE", state.said);
      setNumber(row, "RELEASE_NUMBER", numberAt(installation, "release"));
      setNumber(row, "QUESTIONS", numberAt(installation, "questions"));
      setNumber(row, "REFUSALS", numberAt(installation, "refusals"));
      setText(row, "PATH", textAt(installation, "plan"));
    }
  }

  const Json& m_document;
  const Json& m_installations;
  Dictionary m_page;
};

}  // namespace

}  // namespace html

std::string renderFleetHtml(const std::string& document) {
  const Json parsed = Json::parse(document);
  return html::FleetPage(parsed).text();
}
