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

bool isDecidedItself(const Verdict& extension, const std::vector<Verdict>& differences) {
  return !extension.decision.empty() &&
         extension.decision != differences[extension.match.attribute].decision;
}

void follow(const Verdict& type, Verdict* extension) {
  const MatchRow& match = extension->match;
  extension->reason = "goes with its attribute type: " + type.reason;
  extension->result.reset();
  if (type.isTaken && match.old != nullptr) {
    extension->isTaken = true;
    extension->change = type.change;
  }
  if (type.isTakenOut) {
    extension->outcome = Outcome::kDropped;
    extension->isTakenOut = true;
    extension->decision = type.decision;
    return;
  }
  if (match.old == nullptr) {
    // Nothing of the site's is asked about.
    extension->outcome = match.latest != nullptr ? Outcome::kNew : Outcome::kGone;
    return;
  }
  extension->outcome = type.outcome;
  extension->isTakenOut = type.isTakenOut;
  extension->decision = type.decision;
  if (type.isCarried()) {
    extension->result = contentOf(*match.old->kept);
    (*extension->result)[Aspect::kOid] = {type.result->oid()};
  }
}

}  // namespace

void joinExtensions(std::vector<Verdict>* differences) {
  for (Verdict& row : *differences) {
    if (row.kind() != Kind::kVendorExtension || row.match.attribute == kNoRow ||
        row.outcome == Outcome::kExcluded || row.outcome == Outcome::kWithdrawn ||
        isDecidedItself(row, *differences)) {
      continue;
    }
    const Verdict& type = (*differences)[row.match.attribute];
    // One whose own DBNAME is taken stays so.
    const bool isTakenItself = row.isTaken && !type.isTaken && type.isInResult();
    if (goesWithItsAttribute(type) && !isTakenItself) {
      follow(type, &row);
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
