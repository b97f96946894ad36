// References of what is carried to what the release removed or renamed.

#include "References.h"

#include <array>
#include <optional>
#include <unordered_map>
#include <utility>

#include "Members.h"
#include "ResultIndex.h"
#include "RuleSupport.h"
#include "ThreeWay.h"

namespace migration {

namespace {

class Settling {
 public:
  Settling(const std::vector<const Entry*>& uncountedOfNew, std::vector<Verdict>* differences)
      : m_rows(*differences), m_ofNew(*differences, ResultIndex::Of::kNew) {
    m_ofNew.addUncounted(uncountedOfNew);
    for (Verdict& row : m_rows) {
      if (row.match.old != nullptr && row.kind() != Kind::kVendorExtension) {
        for (const std::string& name : row.match.old->kept->object->namesInPlace()) {
          m_byOldName.emplace(keyOf(row.kind(), folded(name)), &row);
        }
        m_byOldName.emplace(keyOf(row.kind(), oidOf(*row.match.old)), &row);
      }
      if (row.isCarried()) {
        m_waiting.push_back(&row);
      }
    }
  }

  void run() {
    while (!m_waiting.empty()) {
      Verdict* const row = m_waiting.back();
      m_waiting.pop_back();
      if (!referringAspects(row->kind()).empty()) {
        settleAll(row);
      }
    }
  }

 private:
  static std::string keyOf(Kind kind, const std::string& name) {
    return static_cast<char>('0' + static_cast<int>(kind)) + name;
  }

  // A name that OLD wrote means what it meant in OLD; so does one that a person wrote and that
  // nothing in the result has.
  void settleAll(Verdict* row) {
    const Content old = row->match.old == nullptr ? Content() : contentOf(*row->match.old->kept);
    const bool isText = row->outcome == Outcome::kText;
    bool isAny = false;
    for (const ReferringAspect& referring : referringAspects(row->kind())) {
      const Members ofOld(old[referring.aspect]);
      for (std::string& name : (*row->result)[referring.aspect]) {
        const bool isOfOld =
            ofOld.has(name) || (isText && !isNamedInResult(referring.target, name));
        isAny = (isOfOld && settle(row, referring, &name)) || isAny;
      }
    }
    if (isAny && dropRepeatedReferences(&*row->result)) {
      row->notes.emplace_back("what it names twice now is named once, in MUST rather than in MAY");
    }
  }

  // Whether the name became another one.
  bool settle(Verdict* row, const ReferringAspect& referring, std::string* name) {
    const auto found = m_byOldName.find(keyOf(referring.target, folded(*name)));
    if (found == m_byOldName.end() || hasInResult(*found->second, *name)) {
      return false;
    }
    Verdict* const meant = found->second;
    if (meant->outcome == Outcome::kDropped && meant->decision.empty()) {
      keep(meant, *row);
      return false;
    }
    if (!meant->isInResult() || namesInResult(*meant).empty()) {
      return false;
    }
    const std::string newName = namesInResult(*meant).front();
    row->notes.push_back(std::string(nameOf(referring.aspect)) + " names '" + *name +
                         "', which is called '" + newName +
                         "' in the result: the reference follows");
    *name = newName;
    return true;
  }

  bool isNamedInResult(Kind kind, const std::string& name) {
    if (!m_ofAll) {
      m_ofAll.emplace(m_rows, ResultIndex::Of::kAll);
    }
    return m_ofAll->byName(kind, name, nullptr) != nullptr ||
           m_ofAll->byOid(name, nullptr) != nullptr;
  }

  static bool hasInResult(const Verdict& meant, const std::string& name) {
    if (!meant.isInResult()) {
      return false;
    }
    const Values names = namesInResult(meant);
    return oidInResult(meant) == name ||
           std::any_of(names.begin(), names.end(),
                       [&](const std::string& value) { return equalFolded(value, name); });
  }

  void keep(Verdict* dropped, const Verdict& referrer) {
    dropped->outcome = Outcome::kKept;
    dropped->result = contentOf(*dropped->match.old->kept);
    dropped->reason =
        "the release removed it, but the site's " + describe(referrer) + " refers to it";
    if (markIfTaken(m_ofNew, dropped)) {
      return;
    }
    m_waiting.push_back(dropped);
  }

  std::vector<Verdict>& m_rows;
  ResultIndex m_ofNew;
  std::optional<ResultIndex> m_ofAll;  // before anything is kept
  std::unordered_map<std::string, Verdict*> m_byOldName;
  std::vector<Verdict*> m_waiting;
};

}  // namespace

const std::vector<ReferringAspect>& referringAspects(Kind kind) {
  static const std::vector<ReferringAspect> kOfAttributeType = {
      {Aspect::kSup, Kind::kAttributeType}};
  static const std::vector<ReferringAspect> kOfObjectClass = {{Aspect::kSup, Kind::kObjectClass},
                                                              {Aspect::kMust, Kind::kAttributeType},
                                                              {Aspect::kMay, Kind::kAttributeType}};
  static const std::vector<ReferringAspect> kOfExtension = {};
  return kind == Kind::kAttributeType ? kOfAttributeType
         : kind == Kind::kObjectClass ? kOfObjectClass
                                      : kOfExtension;
}

void replaceReferences(const std::vector<Renaming>& renamings, std::vector<Verdict>* differences) {
  std::array<std::unordered_map<std::string, const Renaming*>, 2> byName;
  for (const Renaming& renaming : renamings) {
    byName[static_cast<std::size_t>(renaming.kind)].emplace(folded(renaming.from), &renaming);
  }
  for (Verdict& row : *differences) {
    if (!row.isCarried() || referringAspects(row.kind()).empty()) {
      continue;
    }
    // What NEW wrote means what it means in NEW.
    const Content latest =
        row.match.latest == nullptr ? Content() : contentOf(*row.match.latest->kept);
    for (const ReferringAspect& referring : referringAspects(row.kind())) {
      const Members ofNew(latest[referring.aspect]);
      const auto& renamed = byName[static_cast<std::size_t>(referring.target)];
      for (std::string& name : (*row.result)[referring.aspect]) {
        const auto renaming = ofNew.has(name) ? renamed.end() : renamed.find(folded(name));
        if (renaming != renamed.end()) {
          name = renaming->second->to;
        }
      }
    }
  }
}

void settleReferences(const std::vector<const Entry*>& uncountedOfNew,
                      std::vector<Verdict>* differences) {
  Settling(uncountedOfNew, differences).run();
}

}  // namespace migration
