// What OLD brings that is another definition's in NEW already.

#include <algorithm>

#include "ResultIndex.h"
#include "RuleSupport.h"
#include "ThreeWay.h"

namespace migration {

namespace {

const Values& namesOf(const Entry& entry) { return entry.kept->object->namesInPlace(); }
const Values& dbNamesOf(const Entry& entry) { return entry.kept->extension().getDbNames(); }

// What OLD has beside NEW and, of a definition that NEW has too, beside BASE.
template <typename Get>
Values broughtBy(const MatchRow& match, Get valuesOf) {
  Values brought;
  for (const std::string& value : valuesOf(*match.old)) {
    const bool isOfNew = match.latest != nullptr && contains(valuesOf(*match.latest), value);
    const bool isOfBase =
        match.latest != nullptr && match.base != nullptr && contains(valuesOf(*match.base), value);
    if (!isOfNew && !isOfBase) {
      brought.push_back(value);
    }
  }
  return brought;
}

bool bringsItsOid(const MatchRow& match) {
  return match.latest == nullptr ||
         (oidOf(*match.old) != oidOf(*match.latest) &&
          (match.base == nullptr || oidOf(*match.base) != oidOf(*match.old)));
}

// Whether anything of OLD's comes, or could come, into the result.
bool mayBring(const Verdict& row) {
  return row.match.old != nullptr && (row.isCarried() || row.isUndecided()) && !row.isTaken;
}

// What is taken, with its holder: "its name cn is that of attribute type x (1.2)"; or "".
std::string takenBy(const ResultIndex& index, const Verdict& row) {
  const auto told = [](const std::string& what, const Verdict* holder) {
    return holder == nullptr ? std::string()
                             : what + " belongs to NEW's " + describe(*holder->match.latest->kept);
  };
  std::string reason;
  if (row.kind() == Kind::kVendorExtension) {
    for (const std::string& name : broughtBy(row.match, dbNamesOf)) {
      if (reason.empty()) {
        reason = told("its DBNAME '" + name + "'", index.byDbName(name, &row));
      }
    }
    return reason;
  }
  if (bringsItsOid(row.match)) {
    reason = told("its OID " + oidOf(*row.match.old), index.byOid(oidOf(*row.match.old), &row));
  }
  for (const std::string& name : broughtBy(row.match, namesOf)) {
    if (reason.empty()) {
      reason = told("its name '" + name + "'", index.byName(row.kind(), name, &row));
    }
  }
  return reason;
}

}  // namespace

bool markIfTaken(const ResultIndex& index, Verdict* row) {
  const std::string reason = mayBring(*row) ? takenBy(index, *row) : std::string();
  if (reason.empty()) {
    return false;
  }
  row->isTaken = true;
  if (row->change != Change::kUnknown) {
    row->change = Change::kTaken;
  }
  row->outcome = Outcome::kUndecided;
  row->reason = reason;
  row->result.reset();
  return true;
}

void findTakenOfKept(std::vector<Verdict>* differences) {
  const ResultIndex index(*differences, ResultIndex::Of::kNew);
  for (Verdict& row : *differences) {
    if (row.kind() == Kind::kVendorExtension && row.outcome == Outcome::kKept) {
      markIfTaken(index, &row);
    }
  }
}

// What is taken goes back to NEW's names, which can in turn be what another definition brings.
void findTaken(std::vector<Verdict>* differences) {
  for (bool isChanged = true; isChanged;) {
    isChanged = false;
    const ResultIndex index(*differences, ResultIndex::Of::kNew);
    for (Verdict& row : *differences) {
      isChanged = markIfTaken(index, &row) || isChanged;
    }
    joinExtensions(differences);
  }
}

}  // namespace migration
