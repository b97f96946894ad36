// References of what is carried to what the release removed or renamed.

#include "References.h"

#include <algorithm>
#include <unordered_map>

#include "ResultIndex.h"
#include "RuleSupport.h"
#include "ThreeWay.h"

namespace migration {

namespace {

class Settling {
 public:
  explicit Settling(std::vector<Verdict>* differences)
      : m_rows(*differences), m_ofNew(*differences, ResultIndex::Of::kNew) {
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
      for (const ReferringAspect& referring : referringAspects(row->kind())) {
        for (std::string& name : (*row->result)[referring.aspect]) {
          settle(row, referring, &name);
        }
      }
    }
  }

 private:
  static std::string keyOf(Kind kind, const std::string& name) {
    return static_cast<char>('0' + static_cast<int>(kind)) + name;
  }

  // A name that OLD wrote means what it meant in OLD.
  void settle(Verdict* row, const ReferringAspect& referring, std::string* name) {
    if (!isOfOld(*row, referring.aspect, *name)) {
      return;
    }
    const auto found = m_byOldName.find(keyOf(referring.target, folded(*name)));
    if (found == m_byOldName.end() || hasInResult(*found->second, *name)) {
      return;
    }
    Verdict* const meant = found->second;
    if (meant->outcome == Outcome::kDropped && meant->decision.empty()) {
      keep(meant, *row);
    } else if (meant->isInResult() && !namesInResult(*meant).empty()) {
      const std::string newName = namesInResult(*meant).front();
      row->notes.push_back(std::string(nameOf(referring.aspect)) + " names '" + *name +
                           "', which is called '" + newName +
                           "' in the result: the reference follows");
      *name = newName;
    }
  }

  static bool isOfOld(const Verdict& row, Aspect aspect, const std::string& name) {
    if (row.match.old == nullptr) {
      return false;
    }
    const Content old = contentOf(*row.match.old->kept);
    return std::any_of(old[aspect].begin(), old[aspect].end(),
                       [&](const std::string& value) { return equalFolded(value, name); });
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
  const ResultIndex m_ofNew;
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
  for (Verdict& row : *differences) {
    if (!row.isCarried() || referringAspects(row.kind()).empty()) {
      continue;
    }
    // What NEW wrote means what it means in NEW.
    const Content latest =
        row.match.latest == nullptr ? Content() : contentOf(*row.match.latest->kept);
    for (const ReferringAspect& referring : referringAspects(row.kind())) {
      for (std::string& name : (*row.result)[referring.aspect]) {
        const auto isName = [&](const std::string& value) { return equalFolded(value, name); };
        const Values& ofNew = latest[referring.aspect];
        if (std::any_of(ofNew.begin(), ofNew.end(), isName)) {
          continue;
        }
        const auto renaming =
            std::find_if(renamings.begin(), renamings.end(), [&](const Renaming& each) {
              return each.kind == referring.target && equalFolded(each.from, name);
            });
        if (renaming != renamings.end()) {
          name = renaming->to;
        }
      }
    }
  }
}

void settleReferences(std::vector<Verdict>* differences) { Settling(differences).run(); }

}  // namespace migration
