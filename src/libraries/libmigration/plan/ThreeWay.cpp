#include "ThreeWay.h"
#include "RuleSupport.h"
#include "ToldClauses.h"

#include <algorithm>
#include <string_view>
#include <unordered_map>
#include <utility>

namespace migration {

namespace {

using Rows = std::vector<Verdict>;

bool areEqual(const Entry* left, const Entry* right) {
  return left == nullptr || right == nullptr ? left == right
                                             : haveEqualContent(*left->kept, *right->kept);
}

bool areEqualThroughout(const Rows& rows, const Entry* MatchRow::*left,
                        const Entry* MatchRow::*right) {
  return std::all_of(rows.begin(), rows.end(), [&](const Verdict& row) {
    return areEqual(row.match.*left, row.match.*right);
  });
}

std::string suspiciousBase(const Rows& rows) {
  if (areEqualThroughout(rows, &MatchRow::old, &MatchRow::latest)) {
    return "";
  }
  return areEqualThroughout(rows, &MatchRow::base, &MatchRow::old)      ? "OLD"
         : areEqualThroughout(rows, &MatchRow::base, &MatchRow::latest) ? "NEW"
                                                                        : "";
}

// BASE's reference may follow a rename.
bool isEqualToBase(const Verdict& row, const Entry* other) {
  return row.followedBase == nullptr || other == nullptr
             ? areEqual(row.match.base, other)
             : migration::areEqual(*row.followedBase, contentOf(*other->kept));
}

// Whether the second is a definition of the first under another name or another OID.
void noteIdentity(const Entry* left, const Entry* right, Verdict* row) {
  if (left == nullptr || right == nullptr || row->kind() == Kind::kVendorExtension) {
    return;
  }
  const bool isSameOid = oidOf(*left) == oidOf(*right);
  const bool isSameName = foldedFirstNameOf(*left) == foldedFirstNameOf(*right);
  row->isRenamed = isSameOid && !isSameName;
  row->isRenumbered = !isSameOid && isSameName;
}

// The clauses that changed from BASE.
void noteChanges(const Entry& to, Values ClauseChange::*target, Verdict* row) {
  const Content before = baseContentOf(*row);
  const Content after = contentOf(*to.kept);
  for (const Aspect aspect : aspectsOf(before.kind)) {
    if (!areEqual(aspect, before[aspect], after[aspect])) {
      ClauseChange change;
      change.aspect = aspect;
      change.base = before[aspect];
      change.*target = after[aspect];
      change.risk = riskOf(aspect, before[aspect], after[aspect]);
      row->clauses.push_back(std::move(change));
    }
  }
}

void set(Change change, Outcome outcome, std::string reason, Verdict* row) {
  row->change = change;
  row->outcome = outcome;
  row->reason = std::move(reason);
}

std::string clausesInConflict(const Verdict& row) {
  std::string text;
  for (const ClauseChange& change : row.clauses) {
    if (!change.isDecided) {
      text.append(text.empty() ? "" : ", ").append(toldNames(change));
    }
  }
  return text;
}

// What came of a merge, but for the reason.
void take(Merge merge, Verdict* row) {
  row->clauses = std::move(merge.changes);
  row->risk = merge.risk;
  row->result.reset();
  for (const ClauseChange& change : row->clauses) {
    if (!change.note.empty()) {
      row->notes.push_back(change.note);
    }
  }
  if (merge.hasConflict) {
    row->outcome = Outcome::kUndecided;
    return;
  }
  Content old = contentOf(*row->match.old->kept);
  if (areEqual(merge.result, old) && merge.result.oid() == old.oid()) {
    row->outcome = Outcome::kOld;
    row->result = std::move(old);
  } else if (areEqual(merge.result, contentOf(*row->match.latest->kept))) {
    row->outcome = Outcome::kNew;
  } else {
    row->outcome = Outcome::kMerged;
    row->result = std::move(merge.result);
  }
}

Merge mergeOf(const Verdict& row, Prefer prefer) {
  const Content old = contentOf(*row.match.old->kept);
  const Content latest = contentOf(*row.match.latest->kept);
  return row.match.base == nullptr ? mergeWithoutBase(old, latest, prefer)
                                   : mergeWithBase(baseContentOf(row), old, latest, prefer);
}

// ---- One definition, by who has it ----

void classifyInAll(Verdict* row) {
  const MatchRow& match = row->match;
  const bool isSites = !isEqualToBase(*row, match.old);
  const bool isReleases = !isEqualToBase(*row, match.latest);
  if (!isSites && !isReleases) {
    set(Change::kSame, Outcome::kSame, "nobody changed it", row);
    return;
  }
  if (isSites && isReleases && areEqual(match.old, match.latest)) {
    set(Change::kSame, Outcome::kSame, "the site and the release changed it alike", row);
    return;
  }
  take(mergeOf(*row, Prefer::kNothing), row);
  if (!isSites) {
    set(Change::kChangedByRelease, Outcome::kNew, "only the release changed it", row);
    row->result.reset();
  } else if (!isReleases) {
    set(Change::kChangedBySite, Outcome::kOld, "only the site changed it", row);
    row->result = contentOf(*match.old->kept);
  } else if (row->isUndecided()) {
    set(Change::kInConflict, Outcome::kUndecided,
        "the site and the release changed it in two ways: " + clausesInConflict(*row), row);
  } else {
    set(Change::kMergeable, row->outcome, "the site and the release changed different parts of it",
        row);
  }
}

void classifyAddedByBoth(bool hasBase, Verdict* row) {
  if (areEqual(row->match.old, row->match.latest)) {
    set(Change::kSame, Outcome::kSame,
        hasBase ? "the site and the release added it alike" : "OLD and NEW define it alike", row);
    return;
  }
  take(mergeOf(*row, Prefer::kNothing), row);
  const Outcome outcome = row->outcome;
  if (!hasBase) {
    set(Change::kUnknown, outcome,
        row->isUndecided() ? "OLD and NEW differ, and without BASE nobody can tell who changed: " +
                                 clausesInConflict(*row)
                           : "OLD and NEW differ in DESC alone",
        row);
  } else if (row->isUndecided()) {
    set(Change::kInConflict, outcome,
        "the site and the release each added it, and differ in: " + clausesInConflict(*row), row);
  } else {
    set(Change::kMergeable, outcome,
        "the site and the release each added it, and differ in DESC alone", row);
  }
}

void classifyOldOnly(bool hasBase, Verdict* row) {
  row->result = contentOf(*row->match.old->kept);
  row->risk = Risk::kStructure;
  set(hasBase ? Change::kAddedBySite : Change::kUnknown, Outcome::kAdded,
      hasBase ? "the site added it" : "only OLD has it", row);
}

void classifyNewOnly(bool hasBase, Verdict* row) {
  row->risk = Risk::kStructure;
  set(hasBase ? Change::kAddedByRelease : Change::kUnknown, Outcome::kNew,
      hasBase ? "the release added it" : "only NEW has it", row);
}

void classifyRemovedByRelease(Verdict* row) {
  noteChanges(*row->match.old, &ClauseChange::old, row);
  const bool isUnchanged = isEqualToBase(*row, row->match.old);
  set(Change::kRemovedByRelease, isUnchanged ? Outcome::kDropped : Outcome::kUndecided,
      isUnchanged ? "the release removed it, and the site had not changed it"
                  : "the release removed it, and the site had changed it",
      row);
  row->risk = Risk::kData;
}

void classifyRemovedBySite(Verdict* row) {
  noteChanges(*row->match.latest, &ClauseChange::latest, row);
  set(Change::kRemovedBySite, Outcome::kNew, "the site removed it; the release still has it", row);
  row->risk = Risk::kData;
}

void classifyOne(bool hasBase, Verdict* row) {
  const MatchRow& match = row->match;
  if (match.old != nullptr && match.latest != nullptr) {
    match.base != nullptr ? classifyInAll(row) : classifyAddedByBoth(hasBase, row);
  } else if (match.old != nullptr) {
    match.base != nullptr ? classifyRemovedByRelease(row) : classifyOldOnly(hasBase, row);
  } else if (match.latest != nullptr) {
    match.base != nullptr ? classifyRemovedBySite(row) : classifyNewOnly(hasBase, row);
  } else {
    set(Change::kSame, Outcome::kGone, "the site and the release removed it", row);
    row->risk = Risk::kData;
  }
}

// ---- What holds beside the classes ----

// The library writes a vendor extension behind its attribute type alone.
void leaveOutOrphan(Verdict* row) {
  if (row->kind() == Kind::kVendorExtension && row->match.attribute == kNoRow &&
      row->match.latest == nullptr && row->match.old != nullptr) {
    row->outcome = Outcome::kDropped;
    row->reason = "no attribute type has its OID, and the server's library writes it nowhere";
    row->result.reset();
  }
}

void leaveOut(Outcome outcome, const char* reason, Verdict* row) {
  row->outcome = outcome;
  row->reason = reason;
  row->result.reset();
}

}  // namespace

void applyLists(const ThreeWayRequest& request, std::vector<Verdict>* rows) {
  const std::set<const Entry*> withdrawn = withdrawnBy(*request.old, request.withdrawn);
  for (Verdict& row : *rows) {
    if (row.match.old == nullptr) {
      continue;
    }
    if (withdrawn.count(row.match.old) != 0) {
      leaveOut(Outcome::kWithdrawn, "the list for withdrawal names its OID", &row);
    } else if (request.excluded.count(oidOf(*row.match.old)) != 0) {
      leaveOut(Outcome::kExcluded, "a list of excluded OIDs names it", &row);
    }
  }
}

void classify(const ThreeWayRequest& request, Rows* rows) {
  for (Verdict& row : *rows) {
    noteIdentity(row.match.old != nullptr ? row.match.old : row.match.base,
                 row.match.latest != nullptr ? row.match.latest : row.match.base, &row);
    classifyOne(request.base != nullptr, &row);
    leaveOutOrphan(&row);
  }
}

bool isOpenToPreference(const Verdict& row) {
  const MatchRow& match = row.match;
  return match.old != nullptr && match.latest != nullptr && !row.isTaken && !row.isNewsOnly &&
         (row.kind() == Kind::kVendorExtension || oidOf(*match.old) == oidOf(*match.latest));
}

namespace {

void preferSide(const ThreeWayRequest& request, Verdict* row) {
  const bool wasUndecided = row->isUndecided();
  row->notes.clear();
  take(mergeOf(*row, request.prefer), row);
  if (wasUndecided) {
    row->reason += request.prefer == Prefer::kOld ? "; OLD's is preferred" : "; NEW's is preferred";
  }
}

bool isAskedAbout(const Verdict& row) {
  return row.change == Change::kInConflict || row.change == Change::kMergeable ||
         row.change == Change::kUnknown;
}

}  // namespace

void applyPreference(const ThreeWayRequest& request, Rows* rows) {
  if (request.prefer == Prefer::kNothing) {
    return;
  }
  for (Verdict& row : *rows) {
    if (isAskedAbout(row) && isOpenToPreference(row) && row.outcome != Outcome::kExcluded &&
        row.outcome != Outcome::kWithdrawn) {
      preferSide(request, &row);
    }
  }
}

void judgeAlone(const ThreeWayRequest& request, Verdict* row) {
  row->clauses.clear();
  row->notes.clear();
  classifyOne(request.base != nullptr, row);
  if (request.prefer != Prefer::kNothing && isAskedAbout(*row) && isOpenToPreference(*row)) {
    preferSide(request, row);
  }
}

namespace {

// What came to be NEW's, by references that follow, is NEW's.
void giveToNew(Verdict* row) {
  if (row->isCarried() && row->match.latest != nullptr &&
      row->result->values == contentOf(*row->match.latest->kept).values) {
    row->result.reset();
    row->outcome = row->decision.empty() ? Outcome::kNew : row->outcome;
  }
}

// What the clauses come to is what stands in the result, whoever decided it.
void showResult(Verdict* row) {
  if (row->isUndecided()) {
    return;
  }
  const Content latest = row->match.latest == nullptr || row->isTakenOut
                             ? Content()
                             : contentOf(*row->match.latest->kept);
  for (ClauseChange& change : row->clauses) {
    change.isDecided = true;
    change.result = row->isCarried() ? (*row->result)[change.aspect] : latest[change.aspect];
  }
}

}  // namespace

ThreeWay compareThreeWay(const ThreeWayRequest& request) {
  const Side old(*request.old);
  const Side latest(*request.latest);
  std::optional<Side> base;
  if (request.base != nullptr) {
    base.emplace(*request.base);
  }
  ThreeWay result;
  for (const MatchRow& match : matchDefinitions(base ? &*base : nullptr, old, latest)) {
    result.differences.emplace_back();
    result.differences.back().match = match;
  }
  Rows& rows = result.differences;
  if (base) {
    result.suspiciousBase = suspiciousBase(rows);
  }
  result.uncountedOfNew = latest.uncounted();
  followSharedRenames(&rows);
  classify(request, &rows);
  keepNewsOwn(*request.latest, result.uncountedOfNew, &rows);
  joinExtensions(request, &rows);
  findTaken(request, result.uncountedOfNew, &rows);
  findDoubled(request, &rows);
  noteExtensions(&rows);
  applyLists(request, &rows);
  applyPreference(request, &rows);
  applyDecisions(request, &rows, &result.failures);
  joinExtensions(request, &rows);
  settleReferences(result.uncountedOfNew, &rows);
  findDoubled(request, &rows);
  joinExtensions(request, &rows);
  findTakenExtensions(&rows);
  followOids(&rows);
  for (Verdict& row : rows) {
    giveToNew(&row);
    showResult(&row);
  }
  placeAdditions(*request.old, &rows);
  writeTexts(&rows);
  return result;
}

}  // namespace migration
