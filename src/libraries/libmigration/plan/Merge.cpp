#include "Merge.h"

#include <algorithm>
#include <array>
#include <cstdlib>
#include <utility>

#include "Members.h"

namespace migration {

namespace {

bool hasAllOf(const Values& values, const Values& members) {
  const Members all(values);
  return std::all_of(members.begin(), members.end(),
                     [&](const std::string& member) { return all.has(member); });
}

bool isMemberList(Aspect aspect) {
  return aspect == Aspect::kAliases || aspect == Aspect::kMust || aspect == Aspect::kMay;
}

// NEW's members less those that OLD took out of the base's, then those that OLD added to them.
Values mergedMembers(const Values& base, const Values& old, const Values& latest) {
  const Members ofBase(base);
  const Members ofOld(old);
  const Members ofNew(latest);
  Values merged;
  for (const std::string& member : latest) {
    if (ofOld.has(member) || !ofBase.has(member)) {
      merged.push_back(member);
    }
  }
  for (const std::string& member : old) {
    if (!ofBase.has(member) && !ofNew.has(member)) {
      merged.push_back(member);
    }
  }
  return merged;
}

// The length that LENGTH limits to; none is no limit.
unsigned long long limitOf(const Values& values) {
  const unsigned long long length =
      values.empty() ? 0 : std::strtoull(values.front().c_str(), nullptr, 10);
  return length == 0 ? ~0ULL : length;
}

bool differInLetterCaseOnly(const Values& from, const Values& to) {
  return std::equal(from.begin(), from.end(), to.begin(), to.end(), equalFolded);
}

Risk riskOfMembers(Aspect aspect, const Values& from, const Values& to) {
  const bool isAdded = !hasAllOf(from, to);
  const bool isRemoved = !hasAllOf(to, from);
  if (!isAdded && !isRemoved) {
    return Risk::kCosmetic;
  }
  switch (aspect) {
    case Aspect::kAliases:
      return isRemoved ? Risk::kStructure : Risk::kCosmetic;
    case Aspect::kMust:
      return isAdded ? Risk::kData : Risk::kStructure;
    case Aspect::kMay:
      return isRemoved ? Risk::kData : Risk::kStructure;
    default:
      return Risk::kStructure;
  }
}

void decide(ClauseChange* change, Prefer prefer) {
  change->isInConflict = true;
  change->isDecided = prefer != Prefer::kNothing;
  change->result = prefer == Prefer::kOld ? change->old : change->latest;
  if (change->aspect == Aspect::kDesc) {
    change->isInConflict = false;
    change->isDecided = true;
    change->result = prefer == Prefer::kNew ? change->latest : change->old;
    change->note = prefer == Prefer::kNew ? "DESC differs; the new release's is preferred"
                                          : "DESC differs; the site's is taken";
  }
}

void add(ClauseChange change, Merge* merge) {
  merge->result[change.aspect] = change.result;
  merge->hasConflict = merge->hasConflict || !change.isDecided;
  merge->risk = std::max(merge->risk, change.risk);
  merge->changes.push_back(std::move(change));
}

}  // namespace

std::string_view wordOf(Risk risk) {
  constexpr std::array<std::string_view, 4> kWords = {"none", "cosmetic", "structure", "data"};
  return kWords[static_cast<std::size_t>(risk)];
}

bool isList(Kind kind, Aspect aspect) {
  return isMemberList(aspect) || (aspect == Aspect::kSup && kind == Kind::kObjectClass);
}

Values unionOf(const Values& old, const Values& latest) { return mergedMembers({}, old, latest); }

Risk riskOf(Aspect aspect, const Values& from, const Values& to) {
  if (from == to) {
    return Risk::kNone;
  }
  if (aspect == Aspect::kAliases || aspect == Aspect::kMust || aspect == Aspect::kMay ||
      aspect == Aspect::kSup) {
    return riskOfMembers(aspect, from, to);
  }
  if (aspect != Aspect::kOid && differInLetterCaseOnly(from, to)) {
    return Risk::kCosmetic;
  }
  switch (aspect) {
    case Aspect::kDesc:
      return Risk::kCosmetic;
    case Aspect::kMatching:
    case Aspect::kDbName:
      return Risk::kData;
    case Aspect::kSingleValue:
      return to.empty() ? Risk::kStructure : Risk::kData;
    case Aspect::kLength:
      return limitOf(to) < limitOf(from) ? Risk::kData : Risk::kStructure;
    default:
      return Risk::kStructure;
  }
}

void dropRepeated(const Content* base, const Content& old, const Content& latest, Merge* merge) {
  Content& result = merge->result;
  const auto tell = [&](Aspect aspect, const char* note) {
    const auto change =
        std::find_if(merge->changes.begin(), merge->changes.end(),
                     [&](const ClauseChange& each) { return each.aspect == aspect; });
    if (change != merge->changes.end()) {
      change->result = result[aspect];
      change->note = note;
      return;
    }
    ClauseChange added;
    added.aspect = aspect;
    added.base = base == nullptr ? Values() : (*base)[aspect];
    added.old = old[aspect];
    added.latest = latest[aspect];
    added.result = result[aspect];
    added.risk = riskOf(aspect, added.latest, added.result);
    added.note = note;
    merge->changes.push_back(std::move(added));
  };
  if (dropMembersOf(result[Aspect::kFirstName], &result[Aspect::kAliases])) {
    tell(Aspect::kAliases, "");
  }
  if (dropMembersOf(result[Aspect::kMust], &result[Aspect::kMay])) {
    tell(Aspect::kMay, "a member of both MUST and MAY stays in MUST");
  }
}

Merge mergeWithBase(const Content& base, const Content& old, const Content& latest, Prefer prefer) {
  Merge merge;
  merge.result = latest;
  for (const Aspect aspect : aspectsOf(latest.kind)) {
    ClauseChange change;
    change.aspect = aspect;
    change.base = base[aspect];
    change.old = old[aspect];
    change.latest = latest[aspect];
    const bool isSites = !areEqual(aspect, change.base, change.old);
    const bool isReleases = !areEqual(aspect, change.base, change.latest);
    if (!isSites && !isReleases) {
      continue;
    }
    change.risk = std::max(riskOf(aspect, change.base, change.old),
                           riskOf(aspect, change.base, change.latest));
    if (!isSites || areEqual(aspect, change.old, change.latest)) {
      change.result = change.latest;
    } else if (!isReleases) {
      change.result = change.old;
    } else if (isMemberList(aspect)) {
      change.result = mergedMembers(change.base, change.old, change.latest);
    } else {
      decide(&change, prefer);
    }
    add(std::move(change), &merge);
  }
  dropRepeated(&base, old, latest, &merge);
  return merge;
}

Merge mergeWithoutBase(const Content& old, const Content& latest, Prefer prefer) {
  Merge merge;
  merge.result = latest;
  for (const Aspect aspect : aspectsOf(latest.kind)) {
    if (areEqual(aspect, old[aspect], latest[aspect])) {
      continue;
    }
    ClauseChange change;
    change.aspect = aspect;
    change.old = old[aspect];
    change.latest = latest[aspect];
    change.risk = riskOf(aspect, change.old, change.latest);
    decide(&change, prefer);
    add(std::move(change), &merge);
  }
  dropRepeated(nullptr, old, latest, &merge);
  return merge;
}

}  // namespace migration
