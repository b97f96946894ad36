// R: what SUP, MUST and MAY name.

#include <libschema/SchemaTokens.h>

#include <algorithm>
#include <cstdint>
#include <string>
#include <utility>
#include <vector>

#include "Check.h"
#include "Installation.h"
#include "Rule.h"
#include "RuleSupport.h"

namespace migration {

namespace {

// ---- R401 ----

const char* articleOf(Kind kind) {
  return kind == Kind::kAttributeType ? "no attribute type" : "no object class";
}

void addDangling(const Installation& installation, const Reference& reference, Findings* findings) {
  const Kind other =
      reference.target == Kind::kAttributeType ? Kind::kObjectClass : Kind::kAttributeType;
  std::string text = std::string(keywordOf(reference.clause)) + " names " +
                     std::string(reference.name) + ", and " + articleOf(reference.target) +
                     " of the nine files has this name or OID";
  const Entry* const otherKind = installation.find(other, reference.name);
  if (otherKind != nullptr) {
    text += " (" + describeWithPlace(*otherKind) + " is of another kind)";
  }
  text +=
      "; a server may refuse the whole schema for it; correct the name, define what is "
      "missing, or take the name out";
  addFinding("R401", Severity::kError, *reference.file, reference.offset, std::move(text),
             describe(reference), findings);
}

// ---- R402 ----

// A SUP that names something.
struct Superior {
  Reference reference;
  const Entry* entry;
};

// Finds the sets of definitions that are each other's superiors (strongly connected components of
// more than one, or with an edge to themselves), without recursion: chains can be long.
class Loops {
 public:
  Loops(const Installation& installation, const std::vector<Superior>& superiors)
      : m_installation(installation), m_nodes(installation.entries().size()) {
    for (const Superior& superior : superiors) {
      if (superior.reference.from != nullptr) {
        m_edges.emplace_back(numberOf(*superior.reference.from), numberOf(*superior.entry));
      }
    }
    std::sort(m_edges.begin(), m_edges.end());
    for (const Edge& edge : m_edges) {
      if (m_nodes[edge.first].number == 0) {
        visit(edge.first);
      }
    }
  }

  // Each with its members in the order of reading.
  const std::vector<std::vector<const Entry*>>& all() const { return m_loops; }

  bool areOfOneLoop(const Entry& left, const Entry& right) const {
    const std::uint32_t loop = m_nodes[numberOf(left)].loop;
    return loop != 0 && loop == m_nodes[numberOf(right)].loop;
  }

 private:
  struct Node {
    std::uint32_t number = 0;  // in the order of the visit, from 1
    std::uint32_t lowest = 0;  // the lowest number that it reaches
    std::uint32_t loop = 0;    // from 1; 0 for none
    bool isOpen = false;
  };
  using Edge = std::pair<std::size_t, std::size_t>;  // from a definition to a superior
  using Edges = std::vector<Edge>::const_iterator;
  struct Step {
    std::size_t node;
    Edges next;
    Edges end;
  };

  std::size_t numberOf(const Entry& entry) const {
    return static_cast<std::size_t>(&entry - m_installation.entries().data());
  }

  void open(std::size_t node) {
    ++m_visited;
    m_nodes[node] = {m_visited, m_visited, 0, true};
    m_open.push_back(node);
    const auto begin = std::lower_bound(m_edges.cbegin(), m_edges.cend(), Edge(node, 0));
    const auto end = std::lower_bound(begin, m_edges.cend(), Edge(node + 1, 0));
    m_steps.push_back({node, begin, end});
  }

  void visit(std::size_t start) {
    open(start);
    while (!m_steps.empty()) {
      Step& step = m_steps.back();
      Node& node = m_nodes[step.node];
      if (step.next == step.end) {
        close();
        continue;
      }
      const std::size_t superior = (step.next++)->second;
      if (m_nodes[superior].number == 0) {
        open(superior);
      } else if (m_nodes[superior].isOpen) {
        node.lowest = std::min(node.lowest, m_nodes[superior].number);
      }
    }
  }

  // Leaves the definition of the last step; when it reaches none that was met before it, all that
  // are open from it on reach each other.
  void close() {
    const std::size_t number = m_steps.back().node;
    m_steps.pop_back();
    const Node node = m_nodes[number];
    if (!m_steps.empty()) {
      Node& below = m_nodes[m_steps.back().node];
      below.lowest = std::min(below.lowest, node.lowest);
    }
    if (node.lowest == node.number) {
      const auto first = std::find(m_open.rbegin(), m_open.rend(), number).base() - 1;
      takeComponent({first, m_open.end()});
      m_open.erase(first, m_open.end());
    }
  }

  void takeComponent(std::vector<std::size_t> members) {
    const Edge toItself(members.front(), members.front());
    const bool isLoop =
        members.size() > 1 || std::binary_search(m_edges.begin(), m_edges.end(), toItself);
    std::sort(members.begin(), members.end());
    std::vector<const Entry*> loop;
    for (const std::size_t member : members) {
      m_nodes[member].isOpen = false;
      if (isLoop) {
        m_nodes[member].loop = static_cast<std::uint32_t>(m_loops.size() + 1);
        loop.push_back(&m_installation.entries()[member]);
      }
    }
    if (isLoop) {
      m_loops.push_back(std::move(loop));
    }
  }

  const Installation& m_installation;
  std::vector<Edge> m_edges;  // in ascending order
  std::vector<Node> m_nodes;  // by the number of an entry
  std::uint32_t m_visited = 0;
  std::vector<std::size_t> m_open;
  std::vector<Step> m_steps;
  std::vector<std::vector<const Entry*>> m_loops;
};

void checkLoops(const Loops& loops, Findings* findings) {
  constexpr std::size_t kNamed = 5;
  for (const std::vector<const Entry*>& members : loops.all()) {
    std::string names;
    for (std::size_t i = 1; i < members.size() && i <= kNamed; ++i) {
      names += (i == 1 ? "" : ", ") + describeWithPlace(*members[i]);
    }
    if (members.size() > kNamed + 1) {
      names += " and " + std::to_string(members.size() - kNamed - 1) + " more";
    }
    addFinding("R402", Severity::kError, *members.front(),
               placeOfClause(*members.front(), Clause::kSup),
               "is its own superior" + (names.empty() ? "" : " by way of " + names) +
                   ", so that what it inherits has no beginning; take the superior out of one of "
                   "them",
               findings);
  }
}

// ---- R403 ----

void checkClassKind(const Loops& loops, const Superior& superior, Findings* findings) {
  const Entry* const entry = superior.reference.from;
  if (entry == nullptr || entry->kind() != Kind::kObjectClass ||
      loops.areOfOneLoop(*entry, *superior.entry)) {
    return;
  }
  const ObjectClass& objectClass = entry->kept->objectClass();
  const ObjectClass& other = superior.entry->kept->objectClass();
  if (other.getStructuralType() == KEY_ABSTRACT ||
      other.getStructuralType() == objectClass.getStructuralType()) {
    return;
  }
  addFinding("R403", Severity::kWarning, *entry, superior.reference.offset,
             "is " + std::string(objectClass.getStructuralTypeName()) + " and its superior, " +
                 describeWithPlace(*superior.entry) + ", is " + other.getStructuralTypeName() +
                 "; a server may refuse it; choose a superior of the same kind, or an ABSTRACT "
                 "one",
             findings);
}

// What is below it needs no finding of its own.
void checkTop(const Entry& entry, Findings* findings) {
  const ObjectClass& objectClass = entry.kept->objectClass();
  const bool hasSuperior = !objectClass.superiorsInPlace().empty() ||
                           (entry.written != nullptr &&
                            entry.file->written->find(*entry.written, Clause::kSup) != nullptr);
  if (objectClass.getStructuralType() == KEY_STRUCTURAL && !hasSuperior) {
    addFinding("R403", Severity::kWarning, entry, entry.kept->offset,
               "is STRUCTURAL and has no superior, so that its superiors reach no ABSTRACT class "
               "at the top, as every entry must; write SUP top",
               findings);
  }
}

// ---- R404 ----

void checkRebound(const Entry& here, const Installation& against, const Reference& reference,
                  Findings* findings) {
  const Entry* const there = against.find(reference.target, reference.name);
  if (there == nullptr || oidOf(here) == oidOf(*there) || !isOidAsWritten(here) ||
      !isOidAsWritten(*there)) {
    return;
  }
  addFinding("R404", Severity::kWarning, *reference.file, reference.offset,
             std::string(keywordOf(reference.clause)) + " names " + std::string(reference.name) +
                 ", which is " + oidOf(here) + " here and " + oidOf(*there) + " in " +
                 there->file->source->path() + ":" + std::to_string(there->place().line) +
                 ", so that the class would mean something else there; rename one of the two",
             describe(reference), findings);
}

// ---- R405 ----

void checkOrder(const Loops& loops, const Superior& superior, Findings* findings) {
  const Reference& reference = superior.reference;
  if (superior.entry->file != reference.file || superior.entry->kept->offset < reference.offset ||
      (reference.from != nullptr && loops.areOfOneLoop(*reference.from, *superior.entry))) {
    return;
  }
  addFinding("R405", Severity::kWarning, *reference.file, reference.offset,
             "its superior " + std::string(reference.name) + " stands behind it, in line " +
                 std::to_string(superior.entry->place().line) +
                 "; a server that reads the file from its beginning does not know it yet; move the "
                 "superior before its use",
             describe(reference), findings);
}

bool isOfAClass(const Reference& reference) {
  return (reference.from != nullptr ? reference.from->kind() : reference.written->kind) ==
         Kind::kObjectClass;
}

// Looks at the references of an installation, some at a time.
class ReferenceCheck {
 public:
  ReferenceCheck(const CheckRequest& request, Findings* findings)
      : m_installation(*request.installation), m_against(request.against), m_findings(*findings) {}

  // Returns the SUPs that name something.
  std::vector<Superior> run() {
    m_installation.forEachReference([this](const Reference& reference) {
      constexpr std::size_t kAtATime = 64;
      m_waiting.push_back(reference);
      if (m_waiting.size() == kAtATime) {
        lookAtWaiting();
      }
    });
    lookAtWaiting();
    return std::move(m_superiors);
  }

 private:
  void lookAtWaiting() {
    const std::vector<const Entry*> named = m_installation.find(m_waiting);
    for (std::size_t i = 0; i < named.size(); ++i) {
      lookAt(m_waiting[i], named[i]);
    }
    m_waiting.clear();
  }

  void lookAt(const Reference& reference, const Entry* named) {
    if (named == nullptr) {
      if (!m_installation.isDefined(reference.target, reference.name)) {
        addDangling(m_installation, reference, &m_findings);
      }
      return;
    }
    if (reference.clause == Clause::kSup) {
      m_superiors.push_back({reference, named});
    }
    if (m_against != nullptr && isOfAClass(reference)) {
      checkRebound(*named, *m_against, reference, &m_findings);
    }
  }

  const Installation& m_installation;
  const Installation* m_against;
  Findings& m_findings;
  std::vector<Reference> m_waiting;
  std::vector<Superior> m_superiors;
};

}  // namespace

void checkReferences(const CheckRequest& request, Findings* findings) {
  const std::vector<Superior> superiors = ReferenceCheck(request, findings).run();
  const Loops loops(*request.installation, superiors);
  checkLoops(loops, findings);
  for (const Superior& superior : superiors) {
    checkClassKind(loops, superior, findings);
    checkOrder(loops, superior, findings);
  }
  for (const Entry& entry : request.installation->entries()) {
    if (entry.kind() == Kind::kObjectClass) {
      checkTop(entry, findings);
    }
  }
}

}  // namespace migration
