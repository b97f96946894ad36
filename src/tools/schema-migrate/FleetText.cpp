// What `fleet` prints for people.

#include <algorithm>
#include <map>
#include <string>
#include <tuple>

#include "DisplayText.h"
#include "FleetReport.h"
#include "Messages.h"
#include "Terminal.h"

namespace {

using migration::Fleet;
using migration::FleetClause;
using migration::FleetDefinition;
using migration::FleetGroup;
using migration::FleetInstallation;
using migration::FleetQuestion;
using migration::FleetRelease;
using migration::Standing;

constexpr char kBold[] = "\033[1m";
constexpr char kRed[] = "\033[31m";
constexpr char kPlain[] = "\033[0m";

// Names of more installations are left to the other formats.
constexpr std::size_t kMostNames = 24;

std::string number(std::size_t value, std::size_t width) {
  const std::string digits = std::to_string(value);
  return std::string(width - std::min(width, digits.size()), ' ') + digits;
}

std::string kindOf(const std::string& word) {
  std::string text = word;
  std::replace(text.begin(), text.end(), '-', ' ');
  return printable(text);
}

std::string described(const std::string& kind, const std::string& name, const std::string& oid) {
  return kindOf(kind) + " " +
         (name.empty() ? printable(oid) : printable(name) + " (" + printable(oid) + ")");
}

class FleetText {
 public:
  FleetText(const FleetReport& report, bool isColoured)
      : m_report(report), m_fleet(report.fleet), m_isColoured(isColoured), m_width(longestLine()) {}

  std::string make() {
    if (!m_fleet.installations.empty()) {
      addInstallations();
      for (std::size_t at = 0; at < m_fleet.releases.size(); ++at) {
        addRelease(at);
      }
      addQuestions();
    }
    addVerdict();
    return std::move(m_text);
  }

 private:
  // ---- Lines ----

  void addLine(const std::string& first, const std::string& text) {
    m_text += wrapped(first, text, m_width);
  }
  void addHeading(const std::string& text) { m_text += coloured(kBold, text) + "\n"; }
  std::string coloured(const char* colour, const std::string& text) const {
    return m_isColoured ? colour + text + kPlain : text;
  }

  std::string namesOf(const std::vector<std::size_t>& installations) const {
    std::string text;
    const std::size_t shown = std::min(installations.size(), kMostNames);
    for (std::size_t i = 0; i < shown; ++i) {
      text += (i == 0 ? "" : ", ") + printable(m_fleet.installations[installations[i]].name);
    }
    return text + (shown == installations.size()
                       ? ""
                       : ", and " + std::to_string(installations.size() - shown) + " more");
  }

  // ---- Installations ----

  static std::string stateOf(const FleetInstallation& one) {
    const std::string questions =
        one.questions == 0 ? "" : "with " + counted(one.questions, "question");
    return one.isReady         ? "ready"
           : one.refusals == 0 ? questions
                               : "refused for " + counted(one.refusals, "reason") +
                                     (questions.empty() ? "" : ", " + questions);
  }

  void addInstallations() {
    using Key = std::tuple<bool, std::size_t, std::size_t>;
    std::map<Key, std::vector<std::size_t>> states;
    for (std::size_t at = 0; at < m_fleet.installations.size(); ++at) {
      const FleetInstallation& one = m_fleet.installations[at];
      states[{!one.isReady, one.refusals, one.questions}].push_back(at);
    }
    addHeading("Installations");
    for (const auto& [key, installations] : states) {
      addLine(
          number(installations.size(), 5) + " ",
          stateOf(m_fleet.installations[installations.front()]) + ": " + namesOf(installations));
    }
  }

  // ---- Definitions ----

  void addRelease(std::size_t at) {
    const FleetRelease& release = m_fleet.releases[at];
    const bool isAlone = m_fleet.releases.size() == 1;
    m_text += "\n";
    addHeading(isAlone ? "Definitions"
                       : "Definitions of release " + std::to_string(at + 1) + " of " +
                             std::to_string(m_fleet.releases.size()) + ", at " +
                             counted(release.installations, "installation"));
    addLine("  ", release.base.empty() ? "without BASE" : "BASE " + printable(release.base));
    addLine("  ", "NEW " + printable(release.latest));
    if (!release.differing.empty()) {
      addLine("  ", "differs from release 1 in " + listed(release.differing));
    }
    addLine("  ", std::to_string(release.unchangedDefinitions) + " of " +
                      counted(release.definitions, "definition") +
                      " unchanged at every installation");
    addTable(at);
  }

  // What the same installations have alike takes one row.
  void addTable(std::size_t release) {
    std::map<std::string, std::vector<const FleetDefinition*>> alike;
    std::vector<std::string> keys;
    for (const FleetDefinition& definition : m_fleet.definitions) {
      if (definition.release == release) {
        const std::string key = keyOf(definition);
        std::vector<const FleetDefinition*>& row = alike[key];
        row.push_back(&definition);
        if (row.size() == 1) {
          keys.push_back(key);
        }
      }
    }
    m_text += keys.empty() ? "" : "\n  has  unchanged  ways  undecided  definition\n";
    for (const std::string& key : keys) {
      addDefinitions(alike[key]);
    }
  }

  // What is the same of those that share a row; of one that has its own it is that one alone.
  static std::string keyOf(const FleetDefinition& definition) {
    const bool isPlain =
        definition.groups.empty() || (definition.groups.size() == 1 && definition.ways <= 1 &&
                                      definition.groups.front().clauses.empty());
    if (!isPlain || definition.undecided != 0) {
      return definition.kind + " " + definition.oid + " " + definition.name + " alone";
    }
    std::string key = definition.kind + " " + std::to_string(definition.has) + " " +
                      std::to_string(definition.unchanged);
    for (const FleetGroup& group : definition.groups) {
      key.append(" ").append(wordOf(group.standing)).append(" ").append(group.outcome);
      for (const std::size_t at : group.installations) {
        key += " " + std::to_string(at);
      }
    }
    return key;
  }

  void addDefinitions(const std::vector<const FleetDefinition*>& alike) {
    const FleetDefinition& first = *alike.front();
    const std::string undecided = number(first.undecided, 9);
    std::string names = described(first.kind, first.name, first.oid);
    if (alike.size() != 1) {
      names = std::to_string(alike.size()) + " " + kindOf(first.kind) +
              (first.kind == "object-class" ? "es:" : "s:");
      for (const FleetDefinition* const one : alike) {
        names += (one == alike.front() ? " " : ", ") +
                 printable(one->name.empty() ? one->oid : one->name);
      }
    }
    addLine(number(first.has, 5) + "  " + number(first.unchanged, 9) + "  " +
                number(first.ways, 4) + "  " +
                (first.undecided == 0 ? undecided : coloured(kRed, undecided)) + "  ",
            names);
    for (const FleetGroup& group : first.groups) {
      addGroup(group, first);
    }
  }

  static std::string standingOf(const FleetGroup& group) {
    if (group.standing != Standing::kUnknown) {
      return std::string(group.standing == Standing::kAbsent ? "lack it" : wordOf(group.standing));
    }
    return group.clauses.empty() ? "have it, and NEW does not" : "have it otherwise than NEW";
  }

  void addGroup(const FleetGroup& group, const FleetDefinition& definition) {
    addLine("      " + number(group.installations.size(), 3) + " ",
            standingOf(group) + " -> " +
                (group.outcome == "undecided" ? coloured(kRed, group.outcome)
                                              : printable(group.outcome)) +
                ": " + namesOf(group.installations));
    for (const FleetClause& clause : group.clauses) {
      const bool isUnknown = group.standing == Standing::kUnknown;
      if (clause.old != (isUnknown ? clause.latest : clause.base) ||
          (definition.ways > 1 && differs(clause.clause, definition))) {
        addValue("            ", clause.clause, clause.old.empty() ? "is not there" : clause.old);
      }
    }
    for (const auto& [clause, value] : group.values) {
      if (definition.ways > 1 && differs(clause, definition)) {
        addValue("            ", clause, value);
      }
    }
  }

  void addValue(const char* indent, const std::string& clause, const std::string& value) {
    addLine(indent, printable(clause) + (clause == value ? "" : " " + wholePrintable(value)));
  }

  // What OLD has in a clause; nothing where it lacks the clause, or the definition.
  static std::string valueOf(const FleetGroup& group, const std::string& clause) {
    for (const FleetClause& one : group.clauses) {
      if (one.clause == clause) {
        return one.old;
      }
    }
    for (const auto& [name, value] : group.values) {
      if (name == clause) {
        return value;
      }
    }
    return "";
  }

  // Whether two of the ways in which a definition is had differ in a clause.
  static bool differs(const std::string& clause, const FleetDefinition& definition) {
    const FleetGroup* first = nullptr;
    for (const FleetGroup& group : definition.groups) {
      if (group.standing == Standing::kRemoved || group.standing == Standing::kAbsent) {
        continue;
      }
      if (first == nullptr) {
        first = &group;
      } else if (valueOf(group, clause) != valueOf(*first, clause)) {
        return true;
      }
    }
    return false;
  }

  // ---- Questions ----

  void addQuestions() {
    if (m_fleet.questions.empty()) {
      return;
    }
    m_text += "\n";
    addHeading("What to decide; what settles most comes first");
    m_text += "\n  settles at  then ready  question\n";
    for (const FleetQuestion& question : m_fleet.questions) {
      addLine(
          number(question.installations.size(), 12) + "  " + number(question.readyThen, 10) + "  ",
          described(question.kind, question.name, question.oid) + ": " +
              printable(question.reason));
      addLine("      at ", namesOf(question.installations));
      for (const FleetClause& clause : question.clauses) {
        addClause(clause);
      }
      addChoices(question);
    }
  }

  void addClause(const FleetClause& clause) {
    addLine("      ", printable(clause.clause));
    for (const auto& [side, value] :
         {std::pair<const char*, const std::string&>("base", clause.base),
          {"old ", clause.old},
          {"new ", clause.latest}}) {
      if (!value.empty()) {
        addLine("        " + std::string(side) + "  ", wholePrintable(value));
      }
    }
  }

  void addChoices(const FleetQuestion& question) {
    std::string choices;
    const auto add = [&](const std::string& choice) {
      choices += (choices.empty() ? "" : "; or ") + choice;
    };
    if (!question.takes.empty()) {
      add("take " + listed(question.takes));
    }
    if (!question.openClauses.empty()) {
      add("decide " + listed(question.openClauses));
    }
    if (question.mayMove) {
      add("rename or renumber it");
    }
    if (!choices.empty()) {
      addLine("      ", choices);
    }
  }

  static std::string listed(const std::vector<std::string>& words) {
    std::string text;
    for (const std::string& word : words) {
      text += (text.empty() ? "" : ", ") + printable(word);
    }
    return text;
  }

  // ---- The end ----

  void addVerdict() {
    const std::size_t all = m_fleet.installations.size();
    m_text += m_text.empty() ? "" : "\n";
    if (m_report.isReady()) {
      m_text += "Ready: " + counted(all, "installation") + ".\n";
      return;
    }
    std::string text = "Not ready: " + std::to_string(all - m_fleet.readyCount) + " of " +
                       counted(all, "installation");
    text += m_fleet.questionCount == 0
                ? ""
                : "; " + counted(m_fleet.questionCount, "question") + " in all";
    text += m_fleet.refusedCount == 0
                ? ""
                : "; " + std::to_string(m_fleet.refusedCount) + " refused, whatever is decided";
    text += m_report.failures.empty()
                ? ""
                : "; " + counted(m_report.failures.size(), "plan") + " not read";
    addLine("", coloured(kRed, text + "."));
  }

  const FleetReport& m_report;
  const Fleet& m_fleet;
  bool m_isColoured;
  std::size_t m_width;
  std::string m_text;
};

}  // namespace

std::string renderText(const FleetReport& report, bool isColoured) {
  return FleetText(report, isColoured).make();
}

std::string renderComplaints(const FleetReport& report) {
  std::string lines;
  for (const migration::Failure& failure : report.failures) {
    lines += errorLine(
        failure.line == 0 ? failure.file : placeOf(failure.file, {failure.line, failure.column}),
        failure.text);
  }
  const Fleet& fleet = report.fleet;
  if (!report.query.definition.empty() && fleet.definitions.empty() &&
      !fleet.installations.empty()) {
    lines += errorLine("nothing here is called " + wholePrintable(report.query.definition));
  }
  std::size_t asked = 0;
  for (const FleetInstallation& one : fleet.installations) {
    asked += one.questions != 0 ? 1 : 0;
  }
  if (asked != 0) {
    lines += errorLine("undecided: " + counted(fleet.questionCount, "question") + " at " +
                       counted(asked, "installation"));
  }
  for (const FleetInstallation& one : fleet.installations) {
    if (one.refusals != 0) {
      lines += errorLine(one.path, "refused for " + counted(one.refusals, "reason") +
                                       ", which schema-migrate plan tells");
    }
  }
  return lines;
}
