// Vendor extensions go with their attribute types where these are not in both OLD and NEW, or
// taken.

#include "ResultIndex.h"
#include "ThreeWay.h"

namespace migration {

namespace {

bool goesWithItsAttribute(const Verdict& type) {
  return type.match.old == nullptr || type.match.latest == nullptr || type.isTaken ||
         !type.isInResult();
}

bool isDecidedItself(const Verdict& type, const Verdict& extension) {
  return !extension.decision.empty() && extension.decision != type.decision;
}

void noteTaken(const Verdict& type, Verdict* extension) {
  if (type.isTaken && extension->match.old != nullptr) {
    extension->isTaken = true;
    extension->change = type.change;
  }
}

// Of what OLD and NEW both have, a decision may take clauses of both; then the extension is no
// less judged by itself.
bool isDecidedByClauses(const Verdict& type) {
  return !type.decision.empty() && type.match.old != nullptr && type.match.latest != nullptr &&
         (type.outcome == Outcome::kMerged || type.outcome == Outcome::kText);
}

void follow(const ThreeWayRequest& request, const Verdict& type, Verdict* extension) {
  const MatchRow& match = extension->match;
  extension->result.reset();
  if (isDecidedByClauses(type)) {
    extension->isTaken = false;
    judgeAlone(request, extension);
    return;
  }
  extension->reason = "goes with its attribute type: " + type.reason;
  noteTaken(type, extension);
  extension->decision = type.decision;
  if (type.isTakenOut) {
    extension->outcome = Outcome::kDropped;
    extension->isTakenOut = true;
    return;
  }
  extension->isTakenOut = false;
  if (match.old == nullptr) {
    // Nothing of the site's is asked about.
    extension->outcome = match.latest != nullptr ? Outcome::kNew : Outcome::kGone;
    extension->decision.clear();
    return;
  }
  extension->outcome = type.outcome;
  if (type.isCarried() && extension->isNewsOnly) {
    extension->outcome = Outcome::kUndecided;
    extension->reason = kNothingBesideItsType;
    extension->decision.clear();
    return;
  }
  if (type.isCarried()) {
    extension->result = contentOf(*match.old->kept);
    (*extension->result)[Aspect::kOid] = {type.result->oid()};
    if (type.outcome == Outcome::kText) {
      extension->outcome = match.latest == nullptr ? Outcome::kAdded : Outcome::kOld;
    }
  }
}

}  // namespace

void joinExtension(const ThreeWayRequest& request, const Verdict& type, Verdict* row) {
  // One whose own DBNAME is taken stays so.
  const bool isTakenItself = row->isTaken && !type.isTaken && type.isInResult();
  if (row->outcome != Outcome::kExcluded && row->outcome != Outcome::kWithdrawn &&
      !isDecidedItself(type, *row) && goesWithItsAttribute(type) && !isTakenItself) {
    follow(request, type, row);
  }
}

void joinExtensions(const ThreeWayRequest& request, std::vector<Verdict>* differences) {
  for (Verdict& row : *differences) {
    if (row.kind() == Kind::kVendorExtension && row.match.attribute != kNoRow) {
      joinExtension(request, (*differences)[row.match.attribute], &row);
    }
  }
}

void noteExtensions(std::vector<Verdict>* differences) {
  for (const Verdict& row : *differences) {
    if (row.kind() == Kind::kVendorExtension && row.match.attribute != kNoRow) {
      Verdict& type = (*differences)[row.match.attribute];
      if (goesWithItsAttribute(type)) {
        type.extensions = {row.match.base, row.match.old, row.match.latest};
      }
    }
  }
}

void followOids(std::vector<Verdict>* differences) {
  for (Verdict& row : *differences) {
    if (row.kind() != Kind::kVendorExtension || row.match.attribute == kNoRow ||
        !row.isInResult()) {
      continue;
    }
    const Verdict& type = (*differences)[row.match.attribute];
    const std::string oid = type.isInResult() ? oidInResult(type) : oidInResult(row);
    if (oid == oidInResult(row)) {
      continue;
    }
    if (!row.isCarried()) {
      row.result = contentOf(*row.match.latest->kept);
    }
    (*row.result)[Aspect::kOid] = {oid};
  }
}

}  // namespace migration
