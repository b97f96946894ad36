// What OLD itself has twice: of definitions with one OID the library writes one alone, the object
// class rather than the attribute type, and else the one that it reads first.

#include <string>
#include <unordered_map>

#include "ResultIndex.h"
#include "RuleSupport.h"
#include "ThreeWay.h"

namespace migration {

namespace {

// Whether its OID comes from OLD.
bool bringsOid(const Verdict& row) {
  return row.kind() != Kind::kVendorExtension && row.isCarried() && row.match.old != nullptr &&
         (row.match.latest == nullptr || row.result->oid() != oidOf(*row.match.latest));
}

// What somebody decided stays; another one is asked about then.
bool isRatherWritten(const Verdict& row, const Verdict& other) {
  if (row.decision.empty() != other.decision.empty()) {
    return !row.decision.empty();
  }
  return row.kind() == Kind::kObjectClass && other.kind() == Kind::kAttributeType;
}

}  // namespace

void findDoubled(const ThreeWayRequest& request, std::vector<Verdict>* differences) {
  std::unordered_map<std::string, const Verdict*> written;
  for (const Verdict& row : *differences) {
    if (bringsOid(row)) {
      const auto [place, isFirst] = written.emplace(row.result->oid(), &row);
      if (!isFirst && isRatherWritten(row, *place->second)) {
        place->second = &row;
      }
    }
  }
  for (Verdict& row : *differences) {
    if (!bringsOid(row)) {
      continue;
    }
    const Verdict* const other = written.at(row.result->oid());
    if (other != &row) {
      row.outcome = Outcome::kUndecided;
      row.reason = "its OID " + row.result->oid() + " is that of OLD's " +
                   describe(*other->match.old->kept) + " too, and the library writes only that one";
      row.result.reset();
    }
  }
  joinExtensions(request, differences);
}

}  // namespace migration
