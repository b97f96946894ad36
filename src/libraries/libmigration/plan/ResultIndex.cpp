#include "ResultIndex.h"

#include "Members.h"
#include "RuleSupport.h"

namespace migration {

Values namesInResult(const Verdict& difference) {
  if (difference.isCarried()) {
    return difference.result->names();
  }
  const Entry* const latest = difference.match.latest;
  return latest == nullptr ? Values() : latest->kept->object->namesInPlace();
}

std::string oidInResult(const Verdict& difference) {
  if (difference.isCarried()) {
    return difference.result->oid();
  }
  const Entry* const latest = difference.match.latest;
  return latest == nullptr ? std::string() : oidOf(*latest);
}

Values dbNamesInResult(const Verdict& difference) {
  if (difference.isCarried()) {
    return (*difference.result)[Aspect::kDbName];
  }
  const Entry* const latest = difference.match.latest;
  return latest == nullptr ? Values() : latest->kept->extension().getDbNames();
}

ResultIndex::ResultIndex(const std::vector<Verdict>& differences, Of which) : m_which(which) {
  for (const Verdict& difference : differences) {
    const bool isWanted =
        difference.isInResult() && (which == Of::kAll || difference.match.latest != nullptr);
    if (isWanted) {
      add(difference);
    }
  }
}

void ResultIndex::add(const Verdict& difference) {
  const Entry* const latest = difference.match.latest;
  const auto isWanted = [&](const Members& ofNew, const std::string& name) {
    return m_which == Of::kAll || ofNew.has(name);
  };
  if (difference.kind() == Kind::kVendorExtension) {
    const Values dbNames = latest == nullptr ? Values() : latest->kept->extension().getDbNames();
    const Members ofNew(dbNames);
    for (const std::string& name : dbNamesInResult(difference)) {
      if (isWanted(ofNew, name)) {
        m_byDbName.emplace(folded(name), &difference);
      }
    }
    return;
  }
  const Values names = latest == nullptr ? Values() : latest->kept->object->namesInPlace();
  const Members ofNew(names);
  for (const std::string& name : namesInResult(difference)) {
    if (isWanted(ofNew, name)) {
      m_byName[static_cast<std::size_t>(difference.kind())].emplace(folded(name), &difference);
    }
  }
  const std::string oid = oidInResult(difference);
  if (m_which == Of::kAll || (latest != nullptr && oid == oidOf(*latest))) {
    m_byOid.emplace(oid, &difference);
  }
}

void ResultIndex::addUncounted(const std::vector<const Entry*>& entries) {
  for (const Entry* const entry : entries) {
    if (entry->kind() != Kind::kVendorExtension) {
      m_uncounted.emplace(oidOf(*entry), entry);
    }
  }
}

const Entry* ResultIndex::uncountedByOid(const std::string& oid) const {
  const auto found = m_uncounted.find(oid);
  return found == m_uncounted.end() ? nullptr : found->second;
}

const Verdict* ResultIndex::findIn(const Index& index, const std::string& key,
                                   const Verdict* except, bool isCarriedOnly) {
  const auto [begin, end] = index.equal_range(key);
  for (auto found = begin; found != end; ++found) {
    if (found->second != except && (!isCarriedOnly || found->second->isCarried())) {
      return found->second;
    }
  }
  return nullptr;
}

const Verdict* ResultIndex::byName(Kind kind, std::string_view name, const Verdict* except,
                                   bool isCarriedOnly) const {
  return findIn(m_byName[static_cast<std::size_t>(kind)], folded(name), except, isCarriedOnly);
}

const Verdict* ResultIndex::byOid(std::string_view oid, const Verdict* except,
                                  bool isCarriedOnly) const {
  return findIn(m_byOid, std::string(oid), except, isCarriedOnly);
}

const Verdict* ResultIndex::byDbName(std::string_view name, const Verdict* except,
                                     bool isCarriedOnly) const {
  return findIn(m_byDbName, folded(name), except, isCarriedOnly);
}

}  // namespace migration
