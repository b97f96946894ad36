#include "Inheritance.h"

#include <algorithm>
#include <cstdint>
#include <deque>
#include <numeric>
#include <unordered_map>
#include <unordered_set>
#include <utility>

#include "TextIndex.h"

namespace migration {

namespace {

// Every superior of `entry`, near ones first, each once, without itself.
std::vector<const Entry*> allSuperiorsOf(const Installation& installation, const Entry& entry) {
  std::vector<const Entry*> found;
  std::unordered_set<const Entry*> met = {&entry};
  std::deque<const Entry*> next = {&entry};
  for (; !next.empty(); next.pop_front()) {
    for (const Entry* const superior : superiorsOf(installation, *next.front())) {
      if (met.insert(superior).second) {
        found.push_back(superior);
        next.push_back(superior);
      }
    }
  }
  return found;
}

const std::string& valueOf(const Attribute& attribute, Clause clause) {
  switch (clause) {
    case Clause::kEquality:
      return attribute.getEquality();
    case Clause::kOrdering:
      return attribute.getOrdering();
    case Clause::kSubstr:
      return attribute.getSubstr();
    default:
      return attribute.getSyntax();
  }
}

std::vector<Inherited> inheritedByAttribute(const Entry& entry,
                                            const std::vector<const Entry*>& superiors) {
  std::vector<Inherited> inherited;
  for (const Clause clause :
       {Clause::kEquality, Clause::kOrdering, Clause::kSubstr, Clause::kSyntax}) {
    if (!valueOf(entry.kept->attribute(), clause).empty()) {
      continue;
    }
    const auto has = [clause](const Entry* superior) {
      return !valueOf(superior->kept->attribute(), clause).empty();
    };
    const auto from = std::find_if(superiors.begin(), superiors.end(), has);
    if (from != superiors.end()) {
      inherited.push_back({clause, valueOf((*from)->kept->attribute(), clause), *from});
    }
  }
  return inherited;
}

std::vector<Inherited> inheritedByClass(const Entry& entry,
                                        const std::vector<const Entry*>& superiors) {
  std::vector<Inherited> inherited;
  std::unordered_set<std::string> met;
  const auto take = [&](Clause clause, const std::vector<std::string>& names, const Entry* from) {
    for (const std::string& name : names) {
      if (met.insert(loweredText(name)).second && from != nullptr) {
        inherited.push_back({clause, name, from});
      }
    }
  };
  take(Clause::kMust, entry.kept->objectClass().reqAttrsInPlace(), nullptr);
  // What a superior demands is demanded though the class itself would only allow it.
  for (const Entry* const superior : superiors) {
    take(Clause::kMust, superior->kept->objectClass().reqAttrsInPlace(), superior);
  }
  take(Clause::kMay, entry.kept->objectClass().optAttrsInPlace(), nullptr);
  for (const Entry* const superior : superiors) {
    take(Clause::kMay, superior->kept->objectClass().optAttrsInPlace(), superior);
  }
  return inherited;
}

// Puts each node below its superiors, and leaves out what closes a loop.
class TreeMaker {
 public:
  TreeMaker(const Installation& installation, Kind kind) : m_installation(installation) {
    for (const Entry& entry : installation.entries()) {
      const std::string name = entry.kept->object->getFirstNameLower();
      if (entry.kind() == kind && installation.byFirstName(kind, name) == &entry) {
        m_tree.nodes.push_back({&entry, {}});
      }
    }
    std::sort(m_tree.nodes.begin(), m_tree.nodes.end(), [](const auto& left, const auto& right) {
      return loweredText(left.entry->kept->object->getFirstName()) <
             loweredText(right.entry->kept->object->getFirstName());
    });
    for (std::size_t i = 0; i < m_tree.nodes.size(); ++i) {
      m_numbers.emplace(m_tree.nodes[i].entry, i);
    }
    m_states.resize(m_tree.nodes.size());
  }

  SuperiorTree make() {
    for (std::size_t i = 0; i < m_tree.nodes.size(); ++i) {
      visit(i);
    }
    return std::move(m_tree);
  }

 private:
  enum class State : std::uint8_t { kNew, kOpen, kDone };
  struct Step {
    std::size_t node;
    std::vector<std::size_t> superiors;
    std::size_t next = 0;
    bool isBelow = false;
  };

  std::vector<std::size_t> superiorsOfNode(std::size_t node) const {
    std::vector<std::size_t> numbers;
    for (const Entry* const superior : superiorsOf(m_installation, *m_tree.nodes[node].entry)) {
      const auto number = m_numbers.find(superior);
      if (number != m_numbers.end()) {
        numbers.push_back(number->second);
      }
    }
    std::sort(numbers.begin(), numbers.end());
    numbers.erase(std::unique(numbers.begin(), numbers.end()), numbers.end());
    return numbers;
  }

  // From a definition up to what has no superiors, without recursion: chains can be long.
  void visit(std::size_t start) {
    if (m_states[start] != State::kNew) {
      return;
    }
    std::vector<Step> steps;
    const auto open = [&](std::size_t node) {
      m_states[node] = State::kOpen;
      steps.push_back({node, superiorsOfNode(node)});
    };
    open(start);
    while (!steps.empty()) {
      Step& step = steps.back();
      if (step.next == step.superiors.size()) {
        if (!step.isBelow) {
          m_tree.roots.push_back(step.node);
        }
        m_states[step.node] = State::kDone;
        steps.pop_back();
        continue;
      }
      const std::size_t superior = step.superiors[step.next];
      if (m_states[superior] == State::kNew) {
        open(superior);
        continue;
      }
      ++step.next;
      if (m_states[superior] == State::kDone) {
        m_tree.nodes[superior].below.push_back(step.node);
        step.isBelow = true;
      }
    }
  }

  const Installation& m_installation;
  SuperiorTree m_tree;
  std::unordered_map<const Entry*, std::size_t> m_numbers;
  std::vector<State> m_states;
};

// Insertions, deletions, substitutions and swaps of neighbours, without regard to letter case; any
// number above `limit` stands for more.
std::size_t distance(std::string_view left, std::string_view right, std::size_t limit) {
  if (std::max(left.size(), right.size()) - std::min(left.size(), right.size()) > limit) {
    return limit + 1;
  }
  const std::size_t width = right.size() + 1;
  std::vector<std::size_t> rows(3 * width);
  std::size_t* before = rows.data();
  std::size_t* last = before + width;
  std::size_t* row = last + width;
  std::iota(last, last + width, std::size_t{0});
  for (std::size_t i = 1; i <= left.size(); ++i) {
    row[0] = i;
    for (std::size_t j = 1; j < width; ++j) {
      const bool isEqual = lowered(left[i - 1]) == lowered(right[j - 1]);
      row[j] = std::min({last[j] + 1, row[j - 1] + 1, last[j - 1] + (isEqual ? 0U : 1U)});
      if (i > 1 && j > 1 && lowered(left[i - 1]) == lowered(right[j - 2]) &&
          lowered(left[i - 2]) == lowered(right[j - 1])) {
        row[j] = std::min(row[j], before[j - 2] + 1);
      }
    }
    std::size_t* const oldest = before;
    before = last;
    last = row;
    row = oldest;
  }
  return last[right.size()];
}

}  // namespace

std::vector<const Entry*> superiorsOf(const Installation& installation, const Entry& entry) {
  std::vector<const Entry*> found;
  if (entry.kind() != Kind::kVendorExtension) {
    for (const std::string& name : entry.kept->object->superiorsInPlace()) {
      const Entry* const superior = installation.find(entry.kind(), name);
      if (superior != nullptr) {
        found.push_back(superior);
      }
    }
  }
  return found;
}

std::vector<Inherited> inheritedBy(const Installation& installation, const Entry& entry) {
  const std::vector<const Entry*> superiors = allSuperiorsOf(installation, entry);
  switch (entry.kind()) {
    case Kind::kAttributeType:
      return inheritedByAttribute(entry, superiors);
    case Kind::kObjectClass:
      return inheritedByClass(entry, superiors);
    default:
      return {};
  }
}

SuperiorTree superiorTree(const Installation& installation, Kind kind) {
  if (kind == Kind::kVendorExtension) {
    return {};
  }
  SuperiorTree tree = TreeMaker(installation, kind).make();
  // Numbers are in the order of names.
  std::sort(tree.roots.begin(), tree.roots.end());
  for (SuperiorTree::Node& node : tree.nodes) {
    std::sort(node.below.begin(), node.below.end());
  }
  return tree;
}

std::vector<std::string> nearestNames(const Installation& installation, std::string_view name,
                                      std::size_t count) {
  const std::size_t limit = std::max<std::size_t>(1, name.size() / 3);
  std::vector<std::pair<std::size_t, std::string>> near;
  const auto consider = [&](const std::string& candidate) {
    const std::size_t edits = candidate.empty() ? limit + 1 : distance(name, candidate, limit);
    if (edits <= limit) {
      near.emplace_back(edits, candidate);
    }
  };
  for (const Entry& entry : installation.entries()) {
    consider(entry.kept->object->oidInPlace());
    for (const std::string& each : entry.kept->object->namesInPlace()) {
      consider(each);
    }
  }
  std::sort(near.begin(), near.end());
  near.erase(std::unique(near.begin(), near.end()), near.end());
  std::vector<std::string> names;
  for (std::size_t i = 0; i < near.size() && i < count; ++i) {
    names.push_back(std::move(near[i].second));
  }
  return names;
}

}  // namespace migration
