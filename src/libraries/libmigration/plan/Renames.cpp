// References of BASE to what OLD and NEW call by another name. A migration makes the references of
// what it carries over follow a rename, and the result is OLD of the next one: that alone is no
// change of the site's.

#include <array>
#include <unordered_map>

#include "Members.h"
#include "References.h"
#include "RuleSupport.h"
#include "ThreeWay.h"

namespace migration {

namespace {

class SharedRenames {
 public:
  explicit SharedRenames(const std::vector<Verdict>& rows) {
    for (const Verdict& row : rows) {
      const MatchRow& match = row.match;
      if (row.kind() == Kind::kVendorExtension || match.base == nullptr || match.old == nullptr ||
          match.latest == nullptr || foldedFirstNameOf(*match.old).empty() ||
          foldedFirstNameOf(*match.old) != foldedFirstNameOf(*match.latest)) {
        continue;
      }
      for (const std::string& name : match.base->kept->object->namesInPlace()) {
        add(match, name);
      }
      add(match, oidOf(*match.base));
    }
  }

  bool areNone() const { return m_names[0].empty() && m_names[1].empty(); }

  // Null when BASE's definition has no such reference.
  std::shared_ptr<const Content> follow(const MatchRow& match) const {
    Content content = contentOf(*match.base->kept);
    bool isAny = false;
    for (const ReferringAspect& referring : referringAspects(match.kind)) {
      isAny = follow(match, referring, &content[referring.aspect]) || isAny;
    }
    if (!isAny) {
      return nullptr;
    }
    dropRepeatedReferences(&content);
    return std::make_shared<const Content>(std::move(content));
  }

 private:
  void add(const MatchRow& match, const std::string& name) {
    if (!isStillCalled(*match.old, name) && !isStillCalled(*match.latest, name)) {
      m_names[static_cast<std::size_t>(match.kind)].emplace(folded(name),
                                                            firstNameOf(*match.latest));
    }
  }

  static bool isStillCalled(const Entry& entry, const std::string& name) {
    return oidOf(entry) == name || contains(entry.kept->object->namesInPlace(), name);
  }

  // A name that OLD's or NEW's definition still uses there means what it says.
  bool follow(const MatchRow& match, const ReferringAspect& referring, Values* names) const {
    const auto& renames = m_names[static_cast<std::size_t>(referring.target)];
    if (renames.empty() || names->empty()) {
      return false;
    }
    const Values ofOld = valuesOf(match.old, referring.aspect);
    const Values ofNew = valuesOf(match.latest, referring.aspect);
    const Members old(ofOld);
    const Members latest(ofNew);
    bool isAny = false;
    for (std::string& name : *names) {
      const auto renamed = renames.find(folded(name));
      if (renamed != renames.end() && !old.has(name) && !latest.has(name)) {
        name = renamed->second;
        isAny = true;
      }
    }
    return isAny;
  }

  static Values valuesOf(const Entry* entry, Aspect aspect) {
    return entry == nullptr ? Values() : contentOf(*entry->kept)[aspect];
  }

  std::array<std::unordered_map<std::string, std::string>, 2> m_names;
};

}  // namespace

bool dropRepeatedReferences(Content* content) {
  bool isAny = false;
  for (const ReferringAspect& referring : referringAspects(content->kind)) {
    isAny = dropDoubled(&(*content)[referring.aspect]) || isAny;
  }
  return dropMembersOf((*content)[Aspect::kMust], &(*content)[Aspect::kMay]) || isAny;
}

void followSharedRenames(std::vector<Verdict>* differences) {
  const SharedRenames renames(*differences);
  if (renames.areNone()) {
    return;
  }
  for (Verdict& row : *differences) {
    if (row.match.base != nullptr && (row.match.old != nullptr || row.match.latest != nullptr)) {
      row.followedBase = renames.follow(row.match);
    }
  }
}

}  // namespace migration
