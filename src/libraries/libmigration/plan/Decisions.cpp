// Carrying decisions out.

#include "Decisions.h"

#include <algorithm>
#include <array>
#include <memory>
#include <optional>
#include <set>
#include <unordered_map>
#include <utility>

#include "Check.h"
#include "Digest.h"
#include "Members.h"
#include "Merge.h"
#include "References.h"
#include "ResultIndex.h"
#include "RuleSupport.h"
#include "Source.h"
#include "ThreeWay.h"
#include "ToldClauses.h"

namespace migration {

namespace {

std::string keyOf(Kind kind, std::string_view nameOrOid) {
  return static_cast<char>('0' + static_cast<int>(kind)) + folded(nameOrOid);
}

std::string placeOf(const Decision& decision) {
  return decision.file + ":" + std::to_string(decision.line);
}

// The rows by what a decision may call their definitions: by OLD's names and OIDs, then NEW's, then
// BASE's. A vendor extension also goes by the names of its attribute type.
class RowIndex {
 public:
  explicit RowIndex(std::vector<Verdict>* rows) {
    for (const auto side : {&MatchRow::old, &MatchRow::latest, &MatchRow::base}) {
      for (std::size_t row = 0; row < rows->size(); ++row) {
        add((*rows)[row].match, side, *rows, row);
      }
    }
  }

  std::optional<std::size_t> find(const Decision& decision) const {
    const bool isByOid = !decision.oid.empty();
    const auto& index = isByOid ? m_byOid : m_byName;
    const auto found = index.find(keyOf(decision.kind, isByOid ? decision.oid : decision.name));
    return found == index.end() ? std::nullopt : std::optional<std::size_t>(found->second);
  }

 private:
  void add(const MatchRow& match, const Entry* MatchRow::*side, const std::vector<Verdict>& rows,
           std::size_t row) {
    const Entry* const entry = match.*side;
    if (entry == nullptr) {
      return;
    }
    m_byOid.emplace(keyOf(match.kind, oidOf(*entry)), row);
    const Entry* const named = match.kind != Kind::kVendorExtension ? entry
                               : match.attribute == kNoRow          ? nullptr
                                                           : rows[match.attribute].match.*side;
    if (named != nullptr) {
      for (const std::string& name : named->kept->object->namesInPlace()) {
        m_byName.emplace(keyOf(match.kind, name), row);
      }
    }
  }

  std::unordered_map<std::string, std::size_t> m_byOid;
  std::unordered_map<std::string, std::size_t> m_byName;
};

// Makes two rows of one whose sides share the first name alone: a definition of the site's that
// gets another name stands beside NEW's. Returns the row of the site's.
std::size_t split(std::size_t row, std::vector<Verdict>* rows) {
  const std::size_t own = rows->size();
  rows->emplace_back();
  Verdict& theirs = (*rows)[row];
  Verdict& mine = rows->back();
  mine.match = {theirs.kind(), nullptr, theirs.match.old, nullptr, theirs.match.attribute};
  mine.change = theirs.change;
  mine.outcome = Outcome::kUndecided;
  mine.reason = theirs.reason;
  theirs.match.old = nullptr;
  theirs.outcome = Outcome::kNew;
  theirs.result.reset();
  theirs.clauses.clear();
  for (std::size_t extension = 0; extension < own; ++extension) {
    const MatchRow& match = (*rows)[extension].match;
    if (match.kind == Kind::kVendorExtension && match.attribute == row && match.old != nullptr) {
      const std::size_t ofMine = match.latest == nullptr ? extension : split(extension, rows);
      (*rows)[ofMine].match.attribute = own;
      break;
    }
  }
  return own;
}

bool isToBeSplit(const Decision& decision, const Verdict& row) {
  if (row.kind() == Kind::kVendorExtension || row.match.old == nullptr ||
      row.match.latest == nullptr) {
    return false;
  }
  return !decision.renumber.empty() ||
         (!decision.rename.empty() && oidOf(*row.match.old) != oidOf(*row.match.latest));
}

bool decideAlike(const Decision& left, const Decision& right) {
  return left.take == right.take && left.text == right.text && left.clauses == right.clauses &&
         left.rename == right.rename && left.renumber == right.renumber;
}

// Reads the text of a decision: one whole definition of the kind, of which the reader loses
// nothing. Returns what is wrong, or "".
std::string readText(Kind kind, const std::string& text, Content* content) {
  constexpr std::array<const char*, 3> kKeywords = {
      "attributetypes=", "objectclasses=", "ORVAttributetypes="};
  SchemaFile file;
  file.name = "V3.user.at";
  file.source =
      std::make_unique<Source>("decision", kKeywords[static_cast<std::size_t>(kind)] + text + "\n");
  file.written = std::make_unique<WrittenFile>(*file.source);
  file.kept = std::make_unique<KeptFile>(*file.source);
  Findings findings;
  checkText(file, &findings);
  for (const Finding& finding : findings) {
    if (finding.severity == Severity::kError) {
      return "its text: " + finding.text + " [" + finding.rule + "]";
    }
  }
  const std::vector<KeptDefinition>& kept = file.kept->definitions();
  const bool isOne = file.kept->ending() == ReadingEnd::kWhole && kept.size() == 1 &&
                     file.written->definitions().size() == 1 && kept.front().kind == kind &&
                     !kept.front().object->oidInPlace().empty();
  if (!isOne) {
    return "its text is not one whole " + std::string(nameOf(kind)) +
           " from \"(\" to \")\" that the server's reader takes";
  }
  *content = contentOf(kept.front());
  return "";
}

// The clause that a word means; EQUALITY, ORDERING, SUBSTR and SYNTAX of an attribute type are one.
std::optional<Aspect> aspectOf(Kind kind, const std::string& word) {
  for (const Aspect aspect : aspectsOf(kind)) {
    const bool isIts =
        aspect == Aspect::kMatching
            ? std::find(kMatchingNames.begin(), kMatchingNames.end(), word) != kMatchingNames.end()
            : nameOf(aspect) == word;
    if (isIts) {
      return aspect;
    }
  }
  return std::nullopt;
}

// Carries one decision out on its row. Every function returns what is wrong, or "".
class Carrying {
 public:
  Carrying(const Decision& decision, Prefer prefer, const ResultIndex* ofNew, Verdict* row)
      : m_decision(decision), m_prefer(prefer), m_ofNew(ofNew), m_row(*row) {}

  std::string run() {
    Verdict before = m_row;
    std::string problem = decide();
    if (problem.empty()) {
      problem = whyNewsHasToStay();
    }
    if (!problem.empty()) {
      m_row = std::move(before);
      return problem;
    }
    m_row.decision = placeOf(m_decision);
    return "";
  }

 private:
  std::string decide() {
    if (m_row.outcome == Outcome::kExcluded || m_row.outcome == Outcome::kWithdrawn) {
      return "a list of OIDs leaves it out already";
    }
    if (m_row.isNewsOnly && m_decision.take != Take::kNew) {
      return whyNewsOnly();
    }
    if (!m_decision.text.empty()) {
      return takeText();
    }
    if (!m_decision.clauses.empty()) {
      return takeClauses();
    }
    const bool onlyIdentity = m_decision.take == Take::kNothing;
    const std::string problem = onlyIdentity ? (m_row.isCarried() ? "" : takeOld()) : takeWhole();
    return problem.empty() ? changeIdentity() : problem;
  }

  std::string whyNewsOnly() const {
    const Entry* const latest = m_row.match.latest;
    if (m_row.behind != nullptr) {
      return whyIdentityStays(m_row) + ": only \"new\" can be taken";
    }
    if (m_row.kind() != Kind::kVendorExtension && !isConfigFile(*latest->file)) {
      return "NEW has another definition under its OID too, and the library finds only that one: "
             "only \"new\" can be taken";
    }
    if (latest == nullptr) {
      return std::string(kNothingBesideItsType) + ": only \"new\" can be taken";
    }
    return std::string("NEW has ") +
           (latest != nullptr && isConfigFile(*latest->file) ? "it" : "its attribute type") +
           " only in a config file, which is carried over as it is: only \"new\" can be taken";
  }

  std::string whyNewsHasToStay() const {
    const bool goes = m_row.isTakenOut || (m_row.isCarried() && m_row.match.latest != nullptr &&
                                           m_row.kind() != Kind::kVendorExtension &&
                                           hasOtherIdentity(*m_row.result, *m_row.match.latest));
    return m_row.behind != nullptr && goes ? whyIdentityStays(m_row) : "";
  }

  std::string takeWhole() {
    switch (m_decision.take) {
      case Take::kOld:
        return takeOld();
      case Take::kNew:
        settle(m_row.match.latest == nullptr ? Outcome::kDropped : Outcome::kNew, std::nullopt);
        return "";
      case Take::kBase:
        if (m_row.match.base == nullptr) {
          return "BASE does not have it";
        }
        settle(Outcome::kText, contentOf(*m_row.match.base->kept));
        return "";
      case Take::kMerged:
        return takeMerged();
      case Take::kDrop:
        settle(Outcome::kDropped, std::nullopt);
        m_row.isTakenOut = true;
        return "";
      default:
        return "";
    }
  }

  std::string takeOld() {
    if (m_row.match.old == nullptr) {
      return "OLD does not have it";
    }
    settle(m_row.match.latest == nullptr ? Outcome::kAdded : Outcome::kOld,
           contentOf(*m_row.match.old->kept));
    return "";
  }

  std::string takeText() {
    Content content;
    std::string problem = readText(m_row.kind(), m_decision.text, &content);
    if (!problem.empty()) {
      return problem;
    }
    settle(Outcome::kText, std::move(content));
    return changeIdentity();
  }

  std::string takeMerged() {
    for (const ClauseChange& change : m_row.clauses) {
      if (change.isInConflict && !change.isDecided && !isList(m_row.kind(), change.aspect)) {
        return "it cannot be merged: " + toldNames(change) +
               " was changed in two ways; decide it by \"clauses\"";
      }
    }
    return merge([this](const ClauseChange& change) {
      return change.isInConflict && isList(m_row.kind(), change.aspect)
                 ? std::optional<Values>(unionOf(change.old, change.latest))
                 : std::nullopt;
    });
  }

  std::string takeClauses() {
    std::unordered_map<int, Take> takes;
    for (const auto& [word, take] : m_decision.clauses) {
      const std::optional<Aspect> aspect = aspectOf(m_row.kind(), word);
      if (!aspect) {
        return word + " is no clause of " +
               (m_row.kind() == Kind::kVendorExtension ? "a " : "an ") +
               std::string(nameOf(m_row.kind()));
      }
      if (take == Take::kBase && m_row.match.base == nullptr) {
        return "BASE does not have it";
      }
      if (take == Take::kUnion && !isList(m_row.kind(), *aspect)) {
        return word + " is no list, and has no union";
      }
      const auto [place, isNew] = takes.emplace(static_cast<int>(*aspect), take);
      if (!isNew && place->second != take) {
        return "EQUALITY, ORDERING, SUBSTR and SYNTAX go together, and are to be taken from two "
               "sides";
      }
    }
    return merge([&](const ClauseChange& change) -> std::optional<Values> {
      const auto take = takes.find(static_cast<int>(change.aspect));
      if (take == takes.end()) {
        return std::nullopt;
      }
      switch (take->second) {
        case Take::kOld:
          return change.old;
        case Take::kNew:
          return change.latest;
        case Take::kBase:
          return change.base;
        default:
          return unionOf(change.old, change.latest);
      }
    });
  }

  // Merges, with the values that `decide` gives for clauses.
  template <typename Decide>
  std::string merge(Decide decide) {
    const MatchRow& match = m_row.match;
    if (match.old == nullptr || match.latest == nullptr) {
      return "only what OLD and NEW both have can be merged";
    }
    const Content old = contentOf(*match.old->kept);
    const Content latest = contentOf(*match.latest->kept);
    const Prefer prefer = isOpenToPreference(m_row) ? m_prefer : Prefer::kNothing;
    Merge merged = match.base == nullptr ? mergeWithoutBase(old, latest, prefer)
                                         : mergeWithBase(baseContentOf(m_row), old, latest, prefer);
    std::string open;
    for (ClauseChange& change : merged.changes) {
      if (std::optional<Values> value = decide(change)) {
        merged.result[change.aspect] = *value;
        change.result = std::move(*value);
        change.isDecided = true;
      }
      if (!change.isDecided) {
        open.append(open.empty() ? "" : ", ").append(toldNames(change));
      }
    }
    if (!open.empty()) {
      return "it leaves undecided: " + open;
    }
    if (merged.result[Aspect::kOid].empty()) {
      return "it leaves the definition without an OID";
    }
    const std::optional<Content> base =
        match.base == nullptr ? std::nullopt : std::optional<Content>(baseContentOf(m_row));
    dropRepeated(base ? &*base : nullptr, old, latest, &merged);
    m_row.clauses = std::move(merged.changes);
    const bool isOld = areEqual(merged.result, old) && merged.result.oid() == old.oid();
    const bool isNew = areEqual(merged.result, latest) && merged.result.oid() == latest.oid();
    settle(isOld   ? Outcome::kOld
           : isNew ? Outcome::kNew
                   : Outcome::kMerged,
           isNew ? std::nullopt : std::optional<Content>(std::move(merged.result)));
    return changeIdentity();
  }

  void settle(Outcome outcome, std::optional<Content> result) {
    m_row.outcome = outcome;
    m_row.result = std::move(result);
    m_row.isTakenOut = false;
    if (!m_decision.reason.empty()) {
      m_row.notes.push_back("decided: " + m_decision.reason);
    }
  }

  std::string changeIdentity() {
    if (m_decision.rename.empty() && m_decision.renumber.empty()) {
      return "";
    }
    if (!m_row.isCarried() || m_row.kind() == Kind::kVendorExtension) {
      return "only a definition of the site's that stays can be renamed or renumbered";
    }
    if (!m_decision.rename.empty()) {
      Values& aliases = (*m_row.result)[Aspect::kAliases];
      if (m_ofNew != nullptr && m_row.isTaken && m_row.match.old != nullptr) {
        giveUp(takenNames(*m_ofNew, m_row), &aliases);
      }
      (*m_row.result)[Aspect::kFirstName] = {m_decision.rename};
      dropMembersOf({m_decision.rename}, &aliases);
    }
    if (!m_decision.renumber.empty()) {
      (*m_row.result)[Aspect::kOid] = {m_decision.renumber};
    }
    return "";
  }

  // What is another definition's in NEW cannot stay an alias either.
  void giveUp(const Values& taken, Values* aliases) {
    const Values before = *aliases;
    if (!dropMembersOf(taken, aliases)) {
      return;
    }
    for (const std::string& alias : before) {
      if (!contains(*aliases, alias)) {
        m_row.notes.push_back("its alias '" + alias + "' is another definition's in NEW, and goes");
      }
    }
  }

  const Decision& m_decision;
  Prefer m_prefer;
  const ResultIndex* m_ofNew;  // what NEW gives; null when nothing is renamed
  Verdict& m_row;
};

// What the result would have twice because of a decision; empty when all is well. What NEW itself
// has twice is no decision's fault.
// `self` is the row as the index has it.
std::string clashOf(const ResultIndex& index, const Verdict& row, const Verdict* self) {
  const bool isNews = !row.isCarried();
  const auto told = [](const std::string& what, const Verdict& holder) {
    return "its " + what + " would also be that of " + describe(holder);
  };
  if (!row.isInResult()) {
    return "";
  }
  if (row.kind() == Kind::kVendorExtension) {
    for (const std::string& name : dbNamesInResult(row)) {
      if (const Verdict* const holder = index.byDbName(name, self, isNews)) {
        return told("DBNAME '" + name + "'", *holder);
      }
    }
    return "";
  }
  if (const Verdict* const holder = index.byOid(oidInResult(row), self, isNews)) {
    return told("OID " + oidInResult(row), *holder);
  }
  for (const std::string& name : namesInResult(row)) {
    if (const Verdict* const holder = index.byName(row.kind(), name, self, isNews)) {
      return told("name '" + name + "'", *holder);
    }
  }
  return "";
}

class Applying {
 public:
  Applying(const ThreeWayRequest& request, std::vector<Verdict>* rows, Failures* failures)
      : m_request(request),
        m_decisions(request.decisions),
        m_rows(*rows),
        m_index(rows),
        m_failures(*failures) {}

  void run() {
    findStale();
    splitRenamed();
    // What NEW gives, before anybody takes it.
    m_ofNew.emplace(m_rows, ResultIndex::Of::kNew);
    for (const Decision& decision : m_decisions) {
      const std::optional<std::size_t> row = m_index.find(decision);
      if (row) {
        carryOut(decision, *row);
      } else if (!m_request.allowUnused) {
        fail(decision,
             "it matches no definition of BASE, OLD or NEW; remove it, or allow entries "
             "that match nothing");
      }
    }
    noteUnfit();
    checkResult();
    followIdentities();
  }

 private:
  // Before anything is split, as the entries were made for the whole.
  void findStale() {
    for (const Decision& decision : m_decisions) {
      const std::optional<std::size_t> row = m_index.find(decision);
      if (row && !decision.fingerprint.empty() &&
          decision.fingerprint != fingerprintOf(m_rows[*row])) {
        m_stale.insert(&decision);
      }
    }
  }

  // A definition that gets a name or an OID of its own stands beside NEW's.
  void splitRenamed() {
    bool isSplit = false;
    for (const Decision& decision : m_decisions) {
      const std::optional<std::size_t> row = m_index.find(decision);
      if (row && m_stale.count(&decision) == 0 && isToBeSplit(decision, m_rows[*row])) {
        split(*row, &m_rows);
        isSplit = true;
      }
    }
    if (isSplit) {
      m_index = RowIndex(&m_rows);
    }
  }

  void fail(const Decision& decision, const std::string& text) {
    m_failures.push_back({decision.file, decision.line, 1, "", text});
  }

  // Of a file for many installations there may be an entry for each way in which they have a
  // definition.
  bool isForAnother(const Decision& decision) const {
    return m_request.allowUnused && m_stale.count(&decision) != 0;
  }

  void noteUnfit() {
    for (const auto& [row, decisions] : m_unfit) {
      if (m_made.count(row) == 0) {
        m_rows[row].notes.push_back(
            (decisions.size() == 1
                 ? "a decision about it, made for other texts than these, is not used: "
                 : std::to_string(decisions.size()) +
                       " decisions about it, made for other texts than these, are not used; the "
                       "first: ") +
            placeOf(*decisions.front()));
      }
    }
  }

  void carryOut(const Decision& decision, std::size_t row) {
    if (isForAnother(decision)) {
      m_unfit[row].push_back(&decision);
      return;
    }
    const auto [made, isNew] = m_made.emplace(row, &decision);
    const std::string who = "the decision about " + describe(m_rows[row]);
    if (!isNew) {
      if (!decideAlike(decision, *made->second)) {
        fail(decision,
             who + " contradicts the one at " + placeOf(*made->second) + "; keep one of them");
      }
      return;
    }
    if (m_stale.count(&decision) != 0) {
      fail(decision, who +
                         " is stale: the definition has changed since it was made; look at it "
                         "again, and make it anew");
      return;
    }
    const std::string problem = Carrying(decision, m_request.prefer, &*m_ofNew, &m_rows[row]).run();
    if (!problem.empty()) {
      fail(decision, who + " cannot be carried out: " + problem);
    }
  }

  // What is decided must not be twice in the result.
  void checkResult() {
    const ResultIndex index(m_rows, ResultIndex::Of::kAll);
    for (const auto& [row, decision] : m_made) {
      if (m_rows[row].decision.empty()) {
        continue;
      }
      const std::string who =
          "the decision about " + describe(m_rows[row]) + " cannot be carried out: ";
      const std::string clash = clashOf(index, m_rows[row], &m_rows[row]);
      if (!clash.empty()) {
        fail(*decision, who + clash + "; rename or renumber it, or take NEW's");
      } else if (lacksItsAttribute(m_rows[row])) {
        fail(*decision, who + "its attribute type is not in the result");
      }
    }
  }

  bool lacksItsAttribute(const Verdict& extension) const {
    if (extension.kind() != Kind::kVendorExtension || !extension.isCarried()) {
      return false;
    }
    return extension.match.attribute == kNoRow || !m_rows[extension.match.attribute].isInResult();
  }

  // References to what is renamed or renumbered follow.
  void followIdentities() {
    std::vector<Renaming> renamings;
    for (const auto& [row, decision] : m_made) {
      const Verdict& renamed = m_rows[row];
      if (renamed.decision.empty() || renamed.match.old == nullptr || !renamed.isCarried()) {
        continue;
      }
      const Values& names = renamed.match.old->kept->object->namesInPlace();
      if (!decision->rename.empty() && !names.empty()) {
        renamings.push_back({renamed.kind(), names.front(), decision->rename});
      }
      if (!decision->renumber.empty()) {
        renamings.push_back({renamed.kind(), oidOf(*renamed.match.old), decision->renumber});
      }
    }
    if (!renamings.empty()) {
      replaceReferences(renamings, &m_rows);
    }
  }

  const ThreeWayRequest& m_request;
  const std::vector<Decision>& m_decisions;
  std::vector<Verdict>& m_rows;
  RowIndex m_index;
  std::optional<ResultIndex> m_ofNew;
  Failures& m_failures;
  std::set<const Decision*> m_stale;
  std::map<std::size_t, std::vector<const Decision*>> m_unfit;  // stale, and that is allowed
  std::map<std::size_t, const Decision*> m_made;
};

}  // namespace

std::string fingerprintOf(const Verdict& difference) {
  std::string text;
  for (const auto side : {&MatchRow::base, &MatchRow::old, &MatchRow::latest}) {
    const Entry* const entry = difference.match.*side;
    text += entry == nullptr ? "-" : textOf(contentOf(*entry->kept));
    text += '\n';
  }
  const auto& extensions = difference.extensions;
  if (std::any_of(extensions.begin(), extensions.end(),
                  [](const Entry* extension) { return extension != nullptr; })) {
    for (const Entry* const extension : extensions) {
      text += extension == nullptr ? "-" : textOf(contentOf(*extension->kept));
      text += '\n';
    }
  }
  return "sha256:" + sha256Of(text);
}

std::string tryDecision(const Decision& decision, Prefer prefer, const ResultIndex& result,
                        const Verdict& difference, Verdict* after) {
  *after = difference;
  const std::string problem = Carrying(decision, prefer, nullptr, after).run();
  return problem.empty() ? clashOf(result, *after, &difference) : problem;
}

void applyDecisions(const ThreeWayRequest& request, std::vector<Verdict>* differences,
                    Failures* failures) {
  if (!request.decisions.empty()) {
    Applying(request, differences, failures).run();
  }
}

}  // namespace migration
