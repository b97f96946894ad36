// What OLD brings that is another definition's in NEW already.

#include <algorithm>
#include <cstddef>
#include <string>
#include <unordered_map>
#include <vector>

#include "Members.h"
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
  Values brought = valuesOf(*match.old);
  if (match.latest != nullptr) {
    dropMembersOf(valuesOf(*match.latest), &brought);
    if (match.base != nullptr) {
      dropMembersOf(valuesOf(*match.base), &brought);
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

// Whether the two, which have nothing of the other release to go with, may be one and the same that
// got another first name and another OID.
bool mayBeRenamed(const Verdict& row, const Verdict& holder) {
  return row.match.latest == nullptr && holder.match.old == nullptr &&
         foldedFirstNameOf(*row.match.old) != foldedFirstNameOf(*holder.match.latest);
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
    const std::string& oid = oidOf(*row.match.old);
    reason = told("its OID " + oid, index.byOid(oid, &row));
    const Entry* const uncounted = reason.empty() ? index.uncountedByOid(oid) : nullptr;
    if (uncounted != nullptr) {
      reason = "its OID " + oid + " belongs to NEW's " + describeWithPlace(*uncounted);
    }
  }
  for (const std::string& name : broughtBy(row.match, namesOf)) {
    const Verdict* const holder = index.byName(row.kind(), name, &row);
    if (reason.empty() && holder != nullptr) {
      reason = told("its name '" + name + "'", holder);
      reason += mayBeRenamed(row, *holder) ? ", which may be the same one, renamed" : "";
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
  row->decision.clear();
  row->result.reset();
  return true;
}

Values takenNames(const ResultIndex& index, const Verdict& row) {
  Values taken;
  for (const std::string& name : row.match.old->kept->object->namesInPlace()) {
    if (index.byName(row.kind(), name, &row) != nullptr) {
      taken.push_back(name);
    }
  }
  return taken;
}

void findTakenExtensions(std::vector<Verdict>* differences) {
  const ResultIndex index(*differences, ResultIndex::Of::kNew);
  for (Verdict& row : *differences) {
    const bool isFollower =
        row.kind() == Kind::kVendorExtension && row.match.attribute != kNoRow && row.isCarried() &&
        (row.decision.empty() || row.decision == (*differences)[row.match.attribute].decision);
    if (isFollower) {
      const bool wasTaken = row.isTaken;
      row.isTaken = false;
      row.isTaken = markIfTaken(index, &row) || wasTaken;
    }
  }
}

namespace {

// What is taken goes back to NEW's names, which can in turn be what another definition brings:
// those that bring them are looked at again.
class Taking {
 public:
  Taking(const ThreeWayRequest& request, const std::vector<const Entry*>& uncountedOfNew,
         std::vector<Verdict>* rows)
      : m_request(request),
        m_rows(*rows),
        m_index(*rows, ResultIndex::Of::kNew),
        m_extensionOf(rows->size(), kNoRow) {
    m_index.addUncounted(uncountedOfNew);
    for (std::size_t row = 0; row < m_rows.size(); ++row) {
      if (m_rows[row].match.attribute != kNoRow) {
        m_extensionOf[m_rows[row].match.attribute] = row;
      }
      noteBringer(row);
    }
  }

  void run() {
    for (std::size_t row = m_rows.size(); row > 0; --row) {
      m_waiting.push_back(row - 1);
    }
    while (!m_waiting.empty()) {
      const std::size_t row = m_waiting.back();
      m_waiting.pop_back();
      if (markIfTaken(m_index, &m_rows[row])) {
        giveBack(row);
        joinExtensionOf(row);
      }
    }
  }

 private:
  static std::string keyOf(char sort, const std::string& text) { return sort + folded(text); }
  static char sortOf(Kind kind) { return kind == Kind::kAttributeType ? 'a' : 'c'; }

  void noteBringer(std::size_t number) {
    const Verdict& row = m_rows[number];
    if (!mayBring(row)) {
      return;
    }
    if (row.kind() == Kind::kVendorExtension) {
      for (const std::string& name : broughtBy(row.match, dbNamesOf)) {
        m_bringers.emplace(keyOf('d', name), number);
      }
      return;
    }
    for (const std::string& name : broughtBy(row.match, namesOf)) {
      m_bringers.emplace(keyOf(sortOf(row.kind()), name), number);
    }
    if (bringsItsOid(row.match)) {
      m_bringers.emplace(keyOf('o', oidOf(*row.match.old)), number);
    }
  }

  void giveBack(std::size_t number) {
    const Verdict& row = m_rows[number];
    if (row.match.latest == nullptr) {
      return;
    }
    m_index.add(row);
    if (row.kind() == Kind::kVendorExtension) {
      for (const std::string& name : dbNamesOf(*row.match.latest)) {
        lookAgain(keyOf('d', name));
      }
      return;
    }
    for (const std::string& name : namesOf(*row.match.latest)) {
      lookAgain(keyOf(sortOf(row.kind()), name));
    }
    lookAgain(keyOf('o', oidOf(*row.match.latest)));
  }

  void lookAgain(const std::string& key) {
    const auto [begin, end] = m_bringers.equal_range(key);
    for (auto bringer = begin; bringer != end; ++bringer) {
      m_waiting.push_back(bringer->second);
    }
  }

  void joinExtensionOf(std::size_t type) {
    const std::size_t extension = m_extensionOf[type];
    if (extension == kNoRow) {
      return;
    }
    const bool wasCarried = m_rows[extension].isCarried();
    joinExtension(m_request, m_rows[type], &m_rows[extension]);
    if (wasCarried && !m_rows[extension].isCarried()) {
      giveBack(extension);
    }
  }

  const ThreeWayRequest& m_request;
  std::vector<Verdict>& m_rows;
  ResultIndex m_index;
  std::vector<std::size_t> m_extensionOf;  // by the row of the attribute type
  std::unordered_multimap<std::string, std::size_t> m_bringers;
  std::vector<std::size_t> m_waiting;
};

}  // namespace

void findTaken(const ThreeWayRequest& request, const std::vector<const Entry*>& uncountedOfNew,
               std::vector<Verdict>* differences) {
  Taking(request, uncountedOfNew, differences).run();
}

}  // namespace migration
