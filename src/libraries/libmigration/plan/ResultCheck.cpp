#include "ResultCheck.h"

#include <algorithm>
#include <unordered_map>
#include <utility>

#include "Check.h"
#include "OidList.h"
#include "ResultIndex.h"
#include "RuleSupport.h"

namespace migration {

namespace {

// A reference that dangles, a name that is another one's now, two definitions with one name: what
// only warns about a habit of writing breaks nothing.
bool isBroken(const Finding& finding) {
  const bool isHarmless = finding.rule == "R405" || finding.rule == "T305" ||
                          finding.rule == "T306" || finding.rule == "T307";
  const char family = finding.rule.front();
  return finding.severity == Severity::kError ||
         ((family == 'T' || family == 'R' || family == 'V') && !isHarmless);
}

bool hasName(const Entry* entry, std::string_view name) {
  if (entry == nullptr) {
    return false;
  }
  const Values& names = entry->kept->object->namesInPlace();
  return equalFolded(entry->kept->object->oidInPlace(), name) || contains(names, name);
}

class ResultCheck {
 public:
  explicit ResultCheck(const MigrationPlan& plan) : m_plan(plan) {
    for (const Verdict& row : plan.threeWay.differences) {
      if (row.isInResult()) {
        m_rows[idOf(row.kind(), oidInResult(row))] = &row;
      }
    }
  }

  Findings make() {
    noteDangling();
    CheckRequest request;
    request.installation = &*m_plan.result;
    std::map<std::string, std::size_t> seen;
    for (Finding& finding : check(request)) {
      const std::string key = keyOf(finding);
      const auto known = m_plan.knownFindings.find(key);
      const bool isKnown = ++seen[key] <= (known == m_plan.knownFindings.end() ? 0 : known->second);
      if (!isKnown && isBroken(finding)) {
        add(std::move(finding));
      }
    }
    findRebound();
    return std::move(m_findings);
  }

 private:
  static std::string idOf(Kind kind, const std::string& oid) {
    return static_cast<char>('0' + static_cast<int>(kind)) + oid;
  }

  const Verdict* rowOf(const Entry* entry) const {
    const auto found =
        entry == nullptr ? m_rows.end() : m_rows.find(idOf(entry->kind(), oidOf(*entry)));
    return found == m_rows.end() ? nullptr : found->second;
  }

  // ---- What dangles ----

  void noteDangling() {
    for (const Reference& reference : m_plan.result->danglingReferences()) {
      m_dangling[placeKey(reference.file->source->path(), reference.place())] = reference;
    }
  }

  static std::string placeKey(const std::string& file, const Place& place) {
    return file + ":" + std::to_string(place.line) + ":" + std::to_string(place.column);
  }

  void add(Finding finding) {
    finding.severity = Severity::kError;
    const auto dangling = m_dangling.find(placeKey(finding.file, {finding.line, finding.column}));
    if (finding.rule == "R401" && dangling != m_dangling.end()) {
      finding.text = textOf(dangling->second);
    } else if (const std::string cause = causeAt(finding); !cause.empty()) {
      finding.text += "; it stands there because " + cause;
    }
    finding.text += " (new in this result)";
    m_findings.push_back(std::move(finding));
  }

  // Referrer, clause, missing name, and why it is missing.
  std::string textOf(const Reference& reference) const {
    std::string text = std::string(keywordOf(reference.clause)) + " of " + describe(reference) +
                       " names " + std::string(reference.name) + ", which is not in the result: ";
    const Verdict* const missing = missingBy(reference);
    if (missing != nullptr) {
      text += describe(*missing) + causeOf(*missing);
    } else {
      text += "no " + std::string(nameOf(reference.target)) + " has this name";
    }
    const Verdict* const referrer = rowOf(reference.from);
    return text + "; decide otherwise about one of the two" +
           (referrer == nullptr || referrer->decision.empty()
                ? ""
                : " (the referring one is decided at " + referrer->decision + ")");
  }

  const Verdict* missingBy(const Reference& reference) const {
    for (const Verdict& row : m_plan.threeWay.differences) {
      const MatchRow& match = row.match;
      if (row.kind() == reference.target &&
          (hasName(match.old, reference.name) || hasName(match.latest, reference.name) ||
           hasName(match.base, reference.name))) {
        return &row;
      }
    }
    return nullptr;
  }

  // " is excluded at FILE:LINE".
  std::string causeOf(const Verdict& row) const {
    std::string text;
    if (row.isInResult()) {
      text = " has other names there";
    } else if (row.outcome == Outcome::kExcluded || row.outcome == Outcome::kWithdrawn) {
      text = " is " + std::string(wordOf(row.outcome)) + listedAt(row);
    } else if (row.isUndecided()) {
      text = " is undecided";
    } else {
      text = " is left out, as " + row.reason;
    }
    return row.decision.empty() ? text : text + ", decided at " + row.decision;
  }

  std::string listedAt(const Verdict& row) const {
    if (row.match.old == nullptr) {
      return "";
    }
    const std::string& oid = oidOf(*row.match.old);
    for (const Source* const list : m_plan.oidLists) {
      for (const OidWord& word : readOidList(*list)) {
        if (word.use == WordUse::kTaken && word.text == oid) {
          return " at " + list->path() + ":" + std::to_string(list->placeOf(word.offset).line);
        }
      }
    }
    return "";
  }

  // Why the definition at the place of a finding stands there.
  std::string causeAt(const Finding& finding) const {
    for (const Entry& entry : m_plan.result->entries()) {
      if (entry.file->source->path() == finding.file &&
          describe(*entry.kept) == finding.definition) {
        const Verdict* const row = rowOf(&entry);
        return row == nullptr
                   ? std::string()
                   : row->reason +
                         (row->decision.empty() ? std::string() : ", decided at " + row->decision);
      }
    }
    return "";
  }

  // ---- What means something else ----

  // A name in a definition of OLD that is carried over, and that NEW's does not have.
  void findRebound() {
    m_plan.result->forEachReference([&](const Reference& reference) {
      const Verdict* const row = rowOf(reference.from);
      if (row == nullptr || !row->isCarried() || row->match.old == nullptr ||
          isReleases(*row, reference)) {
        return;
      }
      const Entry* const before = m_plan.old->find(reference.target, reference.name);
      const Entry* const now = m_plan.result->find(reference.target, reference.name);
      if (before == nullptr || now == nullptr || oidOf(*before) == oidOf(*now)) {
        return;
      }
      const Verdict* const other = rowOf(now);
      const bool isLeftOut = other != nullptr && (other->outcome == Outcome::kExcluded ||
                                                  other->outcome == Outcome::kWithdrawn);
      if (other != nullptr && other->match.old == before && !isLeftOut) {
        return;  // the same definition, under another OID
      }
      const Place place = reference.place();
      m_findings.push_back(
          {"R404", Severity::kError, reference.file->source->path(), place.line, place.column,
           std::string(keywordOf(reference.clause)) + " of " + describe(reference) + " names " +
               std::string(reference.name) + ", which is " + describe(*before->kept) +
               " in OLD and " + describe(*now->kept) + " in the result" +
               (other == nullptr ? "" : ", as " + other->reason) +
               "; decide otherwise about one of the two, or rename OLD's (new in this result)",
           describe(*reference.from)});
    });
  }

  // Whether NEW's definition, of which clauses were merged, names it itself.
  static bool isReleases(const Verdict& row, const Reference& reference) {
    if (row.match.latest == nullptr) {
      return false;
    }
    const Content content = contentOf(*row.match.latest->kept);
    const Aspect aspect = reference.clause == Clause::kMust  ? Aspect::kMust
                          : reference.clause == Clause::kMay ? Aspect::kMay
                                                             : Aspect::kSup;
    return contains(content[aspect], reference.name);
  }

  const MigrationPlan& m_plan;
  std::unordered_map<std::string, const Verdict*> m_rows;
  std::unordered_map<std::string, Reference> m_dangling;
  Findings m_findings;
};

}  // namespace

std::string keyOf(const Finding& finding) { return finding.rule + finding.definition; }

Findings newInResult(const MigrationPlan& plan) { return ResultCheck(plan).make(); }

}  // namespace migration
