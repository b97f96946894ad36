#include "PlanReport.h"

#include <libschema-migration/Content.h>
#include <libschema-migration/Inheritance.h>
#include <libschema-migration/ToldClauses.h>
#include <libschema-migration/Verdict.h>

#include <algorithm>
#include <map>
#include <string_view>
#include <tuple>

#include "Messages.h"

namespace {

using migration::Aspect;
using migration::ClauseChange;
using migration::Entry;
using migration::MigrationPlan;
using migration::Verdict;

bool contains(const std::vector<std::string>& words, std::string_view word) {
  return std::any_of(words.begin(), words.end(),
                     [&](const std::string& each) { return migration::equalFolded(each, word); });
}

bool isNamed(const Verdict& row, const std::vector<std::string>& names) {
  for (const Entry* const entry : {row.match.base, row.match.old, row.match.latest}) {
    if (entry == nullptr) {
      continue;
    }
    const migration::Values& own = entry->kept->object->namesInPlace();
    if (contains(names, entry->kept->object->oidInPlace()) ||
        std::any_of(own.begin(), own.end(),
                    [&](const std::string& name) { return contains(names, name); })) {
      return true;
    }
  }
  return false;
}

// A clause that differs only in what is ignored.
bool isIgnored(const ClauseChange& change, const std::vector<std::string>& ignored) {
  if (change.aspect == Aspect::kDesc) {
    return contains(ignored, "desc");
  }
  const auto normal = [&](migration::Values values) {
    if (contains(ignored, "case")) {
      for (std::string& value : values) {
        value = migration::folded(value);
      }
    }
    if (contains(ignored, "order")) {
      std::sort(values.begin(), values.end());
    }
    return values;
  };
  return (contains(ignored, "case") || contains(ignored, "order")) &&
         normal(change.old) == normal(change.latest);
}

// A vendor extension also goes by the names of its attribute type.
bool isAskedFor(const MigrationPlan& plan, const Verdict& row,
                const std::vector<std::string>& names) {
  return names.empty() || isNamed(row, names) ||
         (row.match.attribute != migration::kNoRow &&
          isNamed(plan.threeWay.differences[row.match.attribute], names));
}

// What OLD or NEW lacks differs in more than its clauses.
bool isAllIgnored(const Verdict& row, const std::vector<std::string>& ignored) {
  return !ignored.empty() && row.match.old != nullptr && row.match.latest != nullptr &&
         !row.clauses.empty() &&
         std::all_of(row.clauses.begin(), row.clauses.end(),
                     [&](const ClauseChange& change) { return isIgnored(change, ignored); });
}

bool isShown(const MigrationPlan& plan, const Verdict& row, const DifferenceFilter& filter) {
  const bool isSame =
      row.outcome == migration::Outcome::kSame || row.outcome == migration::Outcome::kGone;
  if (isSame && !filter.isWithSame) {
    return false;
  }
  return !isAllIgnored(row, filter.ignored) && isAskedFor(plan, row, filter.names) &&
         (filter.kinds.empty() || contains(filter.kinds, wordOf(row.kind()))) &&
         (filter.changes.empty() || contains(filter.changes, wordOf(row.change))) &&
         (filter.risks.empty() || contains(filter.risks, wordOf(row.risk)));
}

// ---- Text ----

constexpr char kBold[] = "\033[1m";
constexpr char kRed[] = "\033[31m";
constexpr char kPlain[] = "\033[0m";

class TextWriter {
 public:
  TextWriter(const MigrationPlan& plan, const PlanStyle& style) : m_plan(plan), m_style(style) {}

  void addDifference(const Verdict& row) {
    const bool isUrgent = row.isUndecided();
    m_text +=
        coloured(isUrgent ? kRed : kBold, printable(describe(row, m_plan.threeWay.differences))) +
        ": " + nameOf(row.change) + (row.isRenamed ? ", renamed" : "") +
        (row.isRenumbered ? ", renumbered" : "") + " -> " +
        coloured(isUrgent ? kRed : kBold, std::string(wordOf(row.outcome)));
    m_text +=
        row.risk == migration::Risk::kNone ? "\n" : " [" + std::string(wordOf(row.risk)) + "]\n";
    addLine("", printable(row.reason));
    addPlaces(row);
    for (const ClauseChange& change : row.clauses) {
      for (const migration::ToldClause& clause : toldClauses(change)) {
        addClause(clause);
      }
    }
    for (const std::string& note : row.notes) {
      addLine("note", printable(note));
    }
    if (!row.decision.empty()) {
      addLine("decided", printable(row.decision));
    }
  }

  void addText(const std::string& text) { m_text += text; }
  std::string coloured(const char* colour, const std::string& text) const {
    return m_style.isColoured ? colour + text + kPlain : text;
  }
  std::string take() { return std::move(m_text); }

 private:
  void addLine(std::string label, const std::string& value) {
    constexpr std::size_t kLabel = 10;
    if (!label.empty() && !value.empty()) {
      label.resize(std::max(label.size() + 1, kLabel), ' ');
    }
    m_text += "  " + label + value + "\n";
  }

  void addPlaces(const Verdict& row) {
    std::string places;
    const auto add = [&](const char* side, const Entry* entry) {
      if (entry != nullptr) {
        places.append(places.empty() ? "" : ", ")
            .append(side)
            .append(" ")
            .append(placeOf(entry->file->name, entry->place().line));
      }
    };
    add("BASE", row.match.base);
    add("OLD", row.match.old);
    add("NEW", row.match.latest);
    addLine("", printable(places));
  }

  void addClause(const migration::ToldClause& clause) {
    addLine(clause.name, "");
    const auto add = [&](const char* side, const std::string& value) {
      if (!value.empty()) {
        addLine(std::string("  ") + side, wholePrintable(value));
      }
    };
    add("base", clause.base);
    add("old", clause.old);
    add("new", clause.latest);
    if (clause.isDecided) {
      add("result", clause.result);
    } else {
      addLine("  result", "undecided");
    }
  }

  const MigrationPlan& m_plan;
  const PlanStyle& m_style;
  std::string m_text;
};

// "3 added by site, 1 taken".
template <typename Word>
std::string countsOf(const ShownDifferences& shown, Word word) {
  std::map<std::string, std::size_t> counts;
  for (const Verdict* const row : shown) {
    ++counts[std::string(word(*row))];
  }
  std::string text;
  for (const auto& [name, count] : counts) {
    text += "  " + std::to_string(count) + " " + name + "\n";
  }
  return text;
}

// Of a failure, or a finding.
template <typename Told>
std::string placeTold(const Told& told) {
  return told.line == 0 ? told.file : placeOf(told.file, {told.line, told.column});
}

template <typename Told>
std::string textTold(const Told& told) {
  return told.rule.empty() ? told.text : told.text + " [" + told.rule + "]";
}

// Whether the plan is refused for it.
bool isRefused(const MigrationPlan& plan, const migration::Finding& finding) {
  return std::any_of(plan.refusals.begin(), plan.refusals.end(),
                     [&](const migration::Failure& refusal) {
                       return std::tie(refusal.rule, refusal.file, refusal.line, refusal.column) ==
                              std::tie(finding.rule, finding.file, finding.line, finding.column);
                     });
}

std::string directoryOf(const migration::Finding& finding) {
  const std::size_t slash = finding.file.rfind('/');
  return slash == std::string::npos ? finding.file : finding.file.substr(0, slash);
}

// Warnings of one rule in one directory, of which only the first are told.
std::string groupOf(const migration::Finding& finding) {
  const bool isError = finding.severity == migration::Severity::kError;
  return (isError ? "e " : "w ") + finding.rule + " " + directoryOf(finding);
}

// What warns of a habit of writing says the same at each place.
std::size_t mostTold(const migration::Finding& finding) {
  constexpr std::size_t kMost = 10;
  const bool isHabit = finding.rule.front() == 'L' || finding.rule == "T305" ||
                       finding.rule == "T306" || finding.rule == "T307" || finding.rule == "R405";
  return isHabit ? 1 : kMost;
}

std::string lineOf(const migration::Failure& failure) {
  return errorLine(placeTold(failure), textTold(failure));
}

}  // namespace

ShownDifferences shownOf(const MigrationPlan& plan, const DifferenceFilter& filter) {
  ShownDifferences shown;
  for (const Verdict& row : plan.threeWay.differences) {
    if (isShown(plan, row, filter)) {
      shown.push_back(&row);
    }
  }
  return shown;
}

std::string renderUnknownNames(const MigrationPlan& plan, const std::vector<std::string>& names) {
  std::string lines;
  for (const std::string& name : names) {
    const bool isKnown =
        std::any_of(plan.threeWay.differences.begin(), plan.threeWay.differences.end(),
                    [&](const Verdict& row) { return isNamed(row, {name}); });
    if (isKnown) {
      continue;
    }
    std::vector<std::string> near = nearestNames(*plan.old, name);
    for (const std::string& other : nearestNames(*plan.latest, name)) {
      if (!contains(near, other)) {
        near.push_back(other);
      }
    }
    std::string list;
    for (const std::string& other : near) {
      list += (list.empty() ? "; near it: " : ", ") + wholePrintable(other);
    }
    lines += errorLine("nothing here is called " + wholePrintable(name) + list);
  }
  return lines;
}

std::string renderDifferences(const MigrationPlan& plan, const ShownDifferences& shown,
                              const PlanStyle& style) {
  TextWriter writer(plan, style);
  if (!style.isSummaryOnly) {
    for (const Verdict* const row : shown) {
      writer.addDifference(*row);
      writer.addText("\n");
    }
  }
  writer.addText(counted(shown.size(), "difference") + " in " +
                 counted(plan.threeWay.differences.size(), "definition") +
                 (shown.empty() ? "\n" : ", by who changed them:\n"));
  writer.addText(countsOf(shown, [](const Verdict& row) { return nameOf(row.change); }));
  if (!shown.empty()) {
    writer.addText("and by what comes of them:\n");
    writer.addText(countsOf(shown, [](const Verdict& row) { return wordOf(row.outcome); }));
  }
  return writer.take();
}

std::string renderFindings(const MigrationPlan& plan, Told told) {
  std::map<std::string, std::size_t> counts;
  for (const migration::Finding& finding : plan.ofInputs) {
    ++counts[groupOf(finding)];
  }
  std::string lines;
  bool isAnyLeftOut = false;
  std::map<std::string, std::size_t> seen;
  for (const migration::Finding& finding : plan.ofInputs) {
    const std::size_t count = counts[groupOf(finding)];
    const std::size_t most = told == Told::kAll ? count : mostTold(finding);
    const std::size_t number = ++seen[groupOf(finding)];
    if (finding.severity == migration::Severity::kError) {
      lines += errorLine(placeTold(finding), textTold(finding));
    } else if (number <= most || count == most + 1) {
      lines += warningLine(placeTold(finding), textTold(finding));
    } else if (number == most + 1) {
      lines += warningLine(directoryOf(finding),
                           std::to_string(count - most) + " more like this [" + finding.rule + "]");
      isAnyLeftOut = true;
    }
  }
  if (isAnyLeftOut) {
    lines += "Each of them is told by check, and by --format json and --html.\n";
  }
  std::string repairs;
  for (const migration::Finding& repair : plan.repairs) {
    repairs +=
        wholePrintable(placeTold(repair) + ": mended in a private copy: " + textTold(repair)) +
        "\n";
  }
  return (repairs.empty() ? "" : repairs + "\n") +
         (lines.empty() ? "" : "What check says of the inputs:\n" + lines + "\n");
}

std::string warningsOf(const MigrationPlan& plan) {
  std::string lines;
  for (const migration::Finding& finding : plan.ofInputs) {
    const char family = finding.rule.front();
    const bool isUnread = finding.rule == "I702" || finding.rule == "I703";
    const bool isLost = family == 'T' && finding.severity == migration::Severity::kError &&
                        !isRefused(plan, finding);
    if (isUnread || isLost) {
      lines += warningLine(placeTold(finding), textTold(finding));
    }
  }
  return lines;
}

std::string linesOf(const migration::Failures& failures) {
  std::string lines;
  for (const migration::Failure& failure : failures) {
    lines += lineOf(failure);
  }
  return lines;
}

std::string whyNotReady(const MigrationPlan& plan) {
  std::string lines;
  for (const migration::Failure& refusal : plan.refusals) {
    lines += lineOf(refusal);
  }
  for (const Verdict& row : plan.threeWay.differences) {
    if (row.isUndecided()) {
      lines += errorLine("undecided: " + printable(describe(row, plan.threeWay.differences)) +
                         ": " + printable(row.reason));
    }
  }
  return lines;
}

std::string renderReadiness(const MigrationPlan& plan, const PlanStyle& style) {
  if (plan.isReady()) {
    return "Ready: every definition is decided.\n";
  }
  const TextWriter writer(plan, style);
  return writer.coloured(kRed, "Not ready: " + counted(plan.undecidedCount, "definition") +
                                   " undecided, " + counted(plan.refusals.size(), "other reason") +
                                   ".") +
         "\n";
}
