#include "ResultIndex.h"
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
  const auto isWanted = [&](const Values& ofNew, const std::string& name) {
    return m_which == Of::kAll ||
           std::any_of(ofNew.begin(), ofNew.end(),
                       [&](const std::string& value) { return equalFolded(value, name); });
  };
  if (difference.kind() == Kind::kVendorExtension) {
    const Values ofNew = latest == nullptr ? Values() : latest->kept->extension().getDbNames();
    for (const std::string& name : dbNamesInResult(difference)) {
      if (isWanted(ofNew, name)) {
        m_byDbName.emplace(folded(name), &difference);
      }
    }
    return;
  }
  const Values ofNew = latest == nullptr ? Values() : latest->kept->object->namesInPlace();
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

const Verdict* ResultIndex::findIn(const Index& index, const std::string& key,
                                   const Verdict* except) {
  const auto [begin, end] = index.equal_range(key);
  for (auto found = begin; found != end; ++found) {
    if (found->second != except) {
      return found->second;
    }
  }
  return nullptr;
}

const Verdict* ResultIndex::byName(Kind kind, std::string_view name, const Verdict* except) const {
  return findIn(m_byName[static_cast<std::size_t>(kind)], folded(name), except);
}

const Verdict* ResultIndex::byOid(std::string_view oid, const Verdict* except) const {
  return findIn(m_byOid, std::string(oid), except);
}

const Verdict* ResultIndex::byDbName(std::string_view name, const Verdict* except) const {
  return findIn(m_byDbName, folded(name), except);
}

}  // namespace migration
