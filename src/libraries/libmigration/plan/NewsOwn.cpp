// What of NEW's cannot be replaced: the library writes no config file, and behind a definition that
// goes, or gets another OID or name, one can come up that did not count before.

#include <string>
#include <unordered_map>

#include "RuleSupport.h"
#include "ThreeWay.h"

namespace migration {

namespace {

std::string keyOf(Kind kind, const std::string& text) {
  return static_cast<char>('0' + static_cast<int>(kind)) + text;
}

std::string carriedOver(const Entry& entry) {
  return entry.file->name + ", which is carried over as it is";
}

class NewsOwn {
 public:
  NewsOwn(const Installation& latest, const std::vector<const Entry*>& uncounted,
          std::vector<Verdict>* rows)
      : m_latest(latest), m_rows(*rows) {
    for (const Entry* const entry : uncounted) {
      noteUncounted(*entry);
    }
    for (const Verdict& row : m_rows) {
      if (row.kind() == Kind::kVendorExtension && row.match.latest != nullptr &&
          isConfigFile(*row.match.latest->file)) {
        m_behind.emplace(keyOf(row.kind(), oidOf(*row.match.latest)), row.match.latest);
      }
    }
  }

  void keep() {
    for (Verdict& row : m_rows) {
      keepConfigFile(&row);
    }
    for (Verdict& row : m_rows) {
      keepConfigFileOfType(&row);
      keepSharedOid(&row);
      keepIdentity(&row);
    }
  }

 private:
  // One of the same OID and first name outside the config files is replaced with the first.
  void noteUncounted(const Entry& entry) {
    if (entry.kind() == Kind::kVendorExtension) {
      if (isConfigFile(*entry.file)) {
        m_behind.emplace(keyOf(entry.kind(), oidOf(entry)), &entry);
      }
      return;
    }
    m_uncounted.emplace(keyOf(entry.kind(), foldedFirstNameOf(entry)), &entry);
  }

  static void makeNewsOnly(std::string reason, Verdict* row) {
    row->isNewsOnly = true;
    row->outcome = Outcome::kUndecided;
    row->result.reset();
    row->reason = std::move(reason);
  }

  static void keepConfigFile(Verdict* row) {
    const MatchRow& match = row->match;
    if (match.latest == nullptr || !isConfigFile(*match.latest->file)) {
      return;
    }
    row->isNewsOnly = true;
    if (match.old == nullptr || row->change == Change::kSame ||
        row->change == Change::kChangedByRelease) {
      return;
    }
    makeNewsOnly("NEW has it only in " + carriedOver(*match.latest) + ", and " +
                     (row->change == Change::kUnknown ? "OLD's differs" : "the site changed it"),
                 row);
  }

  // Nor can a vendor extension be written beside an attribute type that stands only there, or be
  // added to V3.modifiedschema.
  void keepConfigFileOfType(Verdict* row) {
    if (row->kind() != Kind::kVendorExtension || row->match.attribute == kNoRow) {
      return;
    }
    const Entry* const type = m_rows[row->match.attribute].match.latest;
    if (type == nullptr || row->isNewsOnly) {
      return;
    }
    const bool isAddition = row->match.latest == nullptr && isModifiedSchema(*type->file);
    if (!isConfigFile(*type->file) && !isAddition) {
      return;
    }
    row->isNewsOnly = true;
    if (row->isCarried() || row->isUndecided()) {
      makeNewsOnly(row->match.latest == nullptr
                       ? kNothingBesideItsType
                       : "NEW has its attribute type only in " + carriedOver(*type),
                   row);
    }
  }

  // Of several under one OID the library finds, and replaces, the first alone.
  void keepSharedOid(Verdict* row) const {
    const Entry* const latest = row->match.latest;
    if (row->kind() == Kind::kVendorExtension || latest == nullptr || row->isNewsOnly) {
      return;
    }
    const Entry* const found = m_latest.byOid(row->kind(), oidOf(*latest));
    if (found == nullptr || foldedFirstNameOf(*found) == foldedFirstNameOf(*latest)) {
      return;
    }
    row->isNewsOnly = true;
    if (row->match.old != nullptr && (row->isCarried() || row->isUndecided())) {
      makeNewsOnly("NEW has " + describeWithPlace(*found) +
                       " under its OID too, and the library finds only that one",
                   row);
    }
  }

  const Entry* behind(const Verdict& row) const {
    const Entry& latest = *row.match.latest;
    const auto [begin, end] = m_uncounted.equal_range(keyOf(row.kind(), foldedFirstNameOf(latest)));
    for (auto found = begin; found != end; ++found) {
      if (oidOf(*found->second) != oidOf(latest) || isConfigFile(*found->second->file)) {
        return found->second;
      }
    }
    // An OID that both kinds have is in two files, whatever becomes of one of the two.
    const Kind other =
        row.kind() == Kind::kAttributeType ? Kind::kObjectClass : Kind::kAttributeType;
    if (const Entry* const shared = m_latest.byOid(other, oidOf(latest))) {
      return shared;
    }
    if (row.kind() == Kind::kAttributeType) {
      const auto found = m_behind.find(keyOf(Kind::kVendorExtension, oidOf(latest)));
      return found == m_behind.end() ? nullptr : found->second;
    }
    return nullptr;
  }

  void keepIdentity(Verdict* row) const {
    const MatchRow& match = row->match;
    if (row->kind() == Kind::kVendorExtension || match.latest == nullptr || row->isNewsOnly) {
      return;
    }
    row->behind = behind(*row);
    if (row->behind == nullptr || match.old == nullptr) {
      return;
    }
    const bool isChanging =
        row->isCarried()
            ? hasOtherIdentity(*row->result, *match.latest)
            : row->isUndecided() && hasOtherIdentity(contentOf(*match.old->kept), *match.latest);
    if (isChanging) {
      makeNewsOnly(whyIdentityStays(*row), row);
    }
  }

  const Installation& m_latest;
  std::vector<Verdict>& m_rows;
  std::unordered_multimap<std::string, const Entry*> m_uncounted;
  std::unordered_map<std::string, const Entry*> m_behind;  // extensions in config files
};

}  // namespace

bool hasOtherIdentity(const Content& content, const Entry& latest) {
  const Values& name = content[Aspect::kFirstName];
  return content.oid() != oidOf(latest) ||
         (content.kind != Kind::kVendorExtension &&
          (name.empty() ? std::string() : folded(name.front())) != foldedFirstNameOf(latest));
}

std::string whyIdentityStays(const Verdict& row) {
  return "NEW's OID and first name have to stay, because of " + describeWithPlace(*row.behind) +
         " in NEW, which has one of them too";
}

void keepNewsOwn(const Installation& latest, const std::vector<const Entry*>& uncountedOfNew,
                 std::vector<Verdict>* rows) {
  NewsOwn(latest, uncountedOfNew, rows).keep();
}

}  // namespace migration
