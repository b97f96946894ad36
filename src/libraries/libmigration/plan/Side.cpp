#include "Side.h"

#include <utility>

#include "Content.h"
#include "RuleSupport.h"

namespace migration {

namespace {

// What the library's table has under the key that a definition is entered by.
const Entry* countingFor(const Installation& installation, const Entry& entry) {
  return entry.kind() == Kind::kVendorExtension
             ? installation.byOid(entry.kind(), oidOf(entry))
             : installation.byFirstName(entry.kind(), foldedFirstNameOf(entry));
}

// As the library withdraws: an OID names a class, or else an attribute type, or else an extension.
// Of the first two the entry goes whose name the definition that is found has; a definition whose
// first name is spelled like the OID is found before the one that has the OID.
const Entry* withdrawnBy(const Installation& installation, const std::string& oid) {
  for (const Kind kind : {Kind::kObjectClass, Kind::kAttributeType}) {
    if (const Entry* const indexed = installation.byOid(kind, oid)) {
      const std::string key = kind == Kind::kAttributeType ? folded(oid) : oid;
      const Entry* const named = installation.byFirstName(kind, key);
      return installation.byFirstName(kind,
                                      foldedFirstNameOf(named == nullptr ? *indexed : *named));
    }
  }
  return installation.byOid(Kind::kVendorExtension, oid);
}

template <typename Index, typename Key>
const Entry* findIn(const Index& index, const Key& key) {
  const auto found = index.find(key);
  return found == index.end() ? nullptr : found->second;
}

}  // namespace

std::string foldedFirstNameOf(const Entry& entry) { return folded(firstNameOf(entry)); }

Side::Side(const Installation& installation) : m_installation(&installation) {
  for (const Entry& entry : installation.entries()) {
    if (countingFor(installation, entry) == &entry) {
      enter(entry);
    } else {
      m_uncounted.push_back(&entry);
    }
  }
}

void Side::enter(const Entry& entry) {
  const std::size_t kind = indexOf(entry.kind());
  m_counting[kind].push_back(&entry);
  if (!oidOf(entry).empty()) {
    m_byOid[kind].emplace(oidOf(entry), &entry);
  }
  if (entry.kind() == Kind::kVendorExtension) {
    return;
  }
  std::string name = foldedFirstNameOf(entry);
  if (!name.empty()) {
    m_byName[kind].emplace(std::move(name), &entry);
  }
}

const Entry* Side::byOid(Kind kind, std::string_view oid) const {
  return findIn(m_byOid[indexOf(kind)], oid);
}

const Entry* Side::byFirstName(Kind kind, std::string_view lowerName) const {
  return kind == Kind::kVendorExtension ? nullptr
                                        : findIn(m_byName[indexOf(kind)], std::string(lowerName));
}

std::set<const Entry*> withdrawnBy(const Installation& installation,
                                   const std::set<std::string>& oids) {
  std::set<const Entry*> withdrawn;
  for (const std::string& oid : oids) {
    if (const Entry* const entry = withdrawnBy(installation, oid)) {
      withdrawn.insert(entry);
    }
  }
  return withdrawn;
}

}  // namespace migration
