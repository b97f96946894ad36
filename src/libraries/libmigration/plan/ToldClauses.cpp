#include "ToldClauses.h"

#include <algorithm>
#include <cstddef>
#include <utility>

namespace migration {

namespace {

// A side that has no such definition has no values at all.
std::string memberOf(const Values& values, std::size_t member) {
  return values.empty() ? std::string() : values[member];
}

Risk riskOfMember(const ClauseChange& change, std::size_t member) {
  const auto from = [&](const Values& before, const Values& after) {
    return before.empty() || after.empty()
               ? Risk::kNone
               : riskOf(change.aspect, {before[member]}, {after[member]});
  };
  return change.base.empty()
             ? from(change.old, change.latest)
             : std::max(from(change.base, change.old), from(change.base, change.latest));
}

bool differs(const ClauseChange& change, std::size_t member) {
  const std::string* first = nullptr;
  for (const Values* const side : {&change.base, &change.old, &change.latest}) {
    if (side->empty()) {
      continue;
    }
    if (first != nullptr && *first != (*side)[member]) {
      return true;
    }
    first = &(*side)[member];
  }
  return false;
}

}  // namespace

std::vector<ToldClause> toldClauses(const ClauseChange& change) {
  const auto shown = [&](const Values& values) { return shownValue(change.aspect, values); };
  const Values result = change.isDecided ? change.result : Values();
  if (change.aspect != Aspect::kMatching) {
    return {{std::string(nameOf(change.aspect)), shown(change.base), shown(change.old),
             shown(change.latest), shown(result), change.risk, change.isDecided}};
  }
  std::vector<ToldClause> told;
  for (std::size_t member = 0; member < kMatchingNames.size(); ++member) {
    if (differs(change, member)) {
      told.push_back({std::string(kMatchingNames[member]), memberOf(change.base, member),
                      memberOf(change.old, member), memberOf(change.latest, member),
                      memberOf(result, member), riskOfMember(change, member), change.isDecided});
    }
  }
  return told;
}

std::string toldNames(const ClauseChange& change) {
  std::string names;
  for (const ToldClause& clause : toldClauses(change)) {
    names.append(names.empty() ? "" : ", ").append(clause.name);
  }
  return names;
}

std::vector<ToldValue> toldValues(Aspect aspect, const Values& values) {
  std::vector<ToldValue> told;
  if (aspect != Aspect::kMatching) {
    std::string value = shownValue(aspect, values);
    if (!value.empty()) {
      told.push_back({std::string(nameOf(aspect)), std::move(value)});
    }
    return told;
  }
  for (std::size_t member = 0; member < values.size(); ++member) {
    if (!values[member].empty()) {
      told.push_back({std::string(kMatchingNames[member]), values[member]});
    }
  }
  return told;
}

}  // namespace migration
