#include "PlanSuperiors.h"

#include <array>
#include <cstddef>
#include <unordered_map>
#include <unordered_set>

namespace migration {

namespace {

const Entry& latestOf(const Verdict& row) {
  return row.match.latest != nullptr ? *row.match.latest : row.entry();
}

const Values& superiorsOf(const Verdict& row) {
  return row.isCarried() ? (*row.result)[Aspect::kSup]
                         : latestOf(row).kept->object->superiorsInPlace();
}

bool isSameEverywhere(const Verdict& row) {
  return row.outcome == Outcome::kSame || row.outcome == Outcome::kGone;
}

// Definitions by what SUP may call them, and what is chosen among them.
class Around {
 public:
  explicit Around(const std::vector<Verdict>& rows) : m_rows(rows) {
    for (const Verdict& row : rows) {
      if (hasSuperiors(row)) {
        enter(row);
      }
    }
  }

  void choose(const std::vector<const Verdict*>& shown) {
    std::unordered_set<const Verdict*> changed;
    for (const Verdict* const row : shown) {
      if (hasSuperiors(*row) && !isSameEverywhere(*row)) {
        changed.insert(row);
        chooseUpwards(row);
      }
    }
    for (const Verdict& row : m_rows) {
      if (!hasSuperiors(row)) {
        continue;
      }
      for (const std::string& name : superiorsOf(row)) {
        if (changed.count(find(row.kind(), name)) != 0) {
          chooseUpwards(&row);
        }
      }
    }
  }

  std::vector<SuperiorNode> nodes() const {
    std::vector<SuperiorNode> nodes;
    nodes.reserve(m_chosen.size());
    for (const Verdict& row : m_rows) {
      if (m_chosen.count(&row) != 0) {
        nodes.push_back({&row, &superiorsOf(row)});
      }
    }
    return nodes;
  }

 private:
  using Names = std::unordered_map<std::string, const Verdict*>;

  static bool hasSuperiors(const Verdict& row) { return row.kind() != Kind::kVendorExtension; }
  static std::size_t indexOf(Kind kind) { return kind == Kind::kObjectClass ? 1 : 0; }

  void enter(const Verdict& row) {
    Names& names = m_names[indexOf(row.kind())];
    const auto add = [&](const std::string& name) { names.try_emplace(folded(name), &row); };
    for (const Entry* const entry : {row.match.latest, row.match.old, row.match.base}) {
      if (entry != nullptr) {
        add(entry->kept->object->oidInPlace());
        for (const std::string& name : entry->kept->object->namesInPlace()) {
          add(name);
        }
      }
    }
  }

  const Verdict* find(Kind kind, const std::string& name) const {
    const Names& names = m_names[indexOf(kind)];
    const auto found = names.find(folded(name));
    return found == names.end() ? nullptr : found->second;
  }

  void chooseUpwards(const Verdict* row) {
    std::vector<const Verdict*> open = {row};
    while (!open.empty()) {
      const Verdict* const next = open.back();
      open.pop_back();
      if (next == nullptr || !m_chosen.insert(next).second) {
        continue;
      }
      for (const std::string& name : superiorsOf(*next)) {
        open.push_back(find(next->kind(), name));
      }
    }
  }

  const std::vector<Verdict>& m_rows;
  std::array<Names, 2> m_names;
  std::unordered_set<const Verdict*> m_chosen;
};

}  // namespace

std::vector<SuperiorNode> superiorsAround(const MigrationPlan& plan,
                                          const std::vector<const Verdict*>& shown) {
  Around around(plan.threeWay.differences);
  around.choose(shown);
  return around.nodes();
}

}  // namespace migration
