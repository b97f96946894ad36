#include "ShowRun.h"

#include <fnmatch.h>
#include <libschema-migration/Inheritance.h>
#include <libschema-migration/Installation.h>

#include <algorithm>
#include <set>
#include <utility>

#include "Messages.h"

namespace {

using migration::DefinitionView;
using migration::Entry;
using migration::Installation;
using migration::Kind;

ShownPlace placeOf(const DefinitionView& view) {
  return {view.path(), view.place().line, view.title()};
}

ShownPlace placeOf(const Entry& entry) { return placeOf(DefinitionView(&entry)); }

std::string clauseText(migration::Clause clause, std::string_view value) {
  return std::string(migration::keywordOf(clause)) + " " + std::string(value);
}

class ShowRun {
 public:
  explicit ShowRun(const ShowOptions& options)
      : m_options(options),
        m_installation(Installation::fromDirectory(options.directory, migration::ReadLimits(),
                                                   &m_report.failures)) {
    m_report.isWithInherited = options.isWithInherited;
    m_report.isWithReferrers = options.isWithReferrers;
  }

  ShowReport report() && {
    if (m_options.isTree) {
      tree();
    } else if (m_options.names.empty()) {
      list();
    } else {
      definitions();
    }
    m_report.exitCode = !m_report.failures.empty()  ? kBadInput
                        : !m_report.unknown.empty() ? kFindings
                                                    : kDone;
    return std::move(m_report);
  }

 private:
  bool isAskedFor(const DefinitionView& view) const {
    return (!m_options.kind || *m_options.kind == view.kind()) &&
           (m_options.file.empty() || m_options.file == view.file().name);
  }

  bool hasPattern(const DefinitionView& view) const {
    std::vector<std::string> texts = view.names();
    texts.push_back(view.oid());
    return m_options.pattern.empty() ||
           std::any_of(texts.begin(), texts.end(), [&](const std::string& text) {
             return ::fnmatch(m_options.pattern.c_str(), text.c_str(), FNM_CASEFOLD) == 0;
           });
  }

  void list() {
    for (const DefinitionView& view : definitionsOf(m_installation, m_options.reading)) {
      if (isAskedFor(view) && hasPattern(view)) {
        m_report.list.push_back(placeOf(view));
      }
    }
  }

  // All that have a name, and behind them the vendor extensions of the attribute types among them.
  void definitions() {
    const std::vector<DefinitionView> views = definitionsOf(m_installation, m_options.reading);
    for (const std::string& name : m_options.names) {
      std::set<std::string> oids;
      bool isFound = false;
      for (const DefinitionView& view : views) {
        if (isAskedFor(view) && view.isCalled(name)) {
          isFound = true;
          add(view);
          if (view.kind() == Kind::kAttributeType) {
            oids.insert(view.oid());
          }
        }
      }
      for (const DefinitionView& view : views) {
        if (view.kind() == Kind::kVendorExtension && isAskedFor(view) && !view.isCalled(name) &&
            oids.count(view.oid()) != 0) {
          add(view);
        }
      }
      if (!isFound) {
        addUnknown(name);
      }
    }
  }

  void addUnknown(const std::string& name) {
    ShownNothing unknown{name, {}, {}};
    for (const migration::UnkeptEntry& unkept : m_installation.unkept()) {
      const DefinitionView view(unkept.file, unkept.written, nullptr);
      if (m_options.reading == migration::Reading::kKept && isAskedFor(view) &&
          view.isCalled(name)) {
        unknown.written.push_back(placeOf(view));
      }
    }
    if (unknown.written.empty()) {
      unknown.near = nearestNames(m_installation, name);
    }
    m_report.unknown.push_back(std::move(unknown));
  }

  void add(const DefinitionView& view) {
    ShownDefinition shown;
    shown.place = placeOf(view);
    shown.oid = view.oid();
    for (const migration::ClauseText& clause : view.clauses()) {
      shown.clauses.push_back(clause.text());
    }
    if (const Entry* const entry = view.entry(); entry != nullptr) {
      addUse(*entry, &shown);
      addRelations(*entry, &shown);
    }
    m_report.definitions.push_back(std::move(shown));
  }

  void addUse(const Entry& entry, ShownDefinition* shown) const {
    ORVSchema& object = *entry.kept->object;
    const Entry* const used =
        entry.kind() == Kind::kVendorExtension
            ? m_installation.byOid(entry.kind(), object.oidInPlace())
            : m_installation.byFirstName(entry.kind(), object.getFirstNameLower());
    if (used != nullptr && used->kept != entry.kept) {
      shown->insteadOfIt.push_back(placeOf(*used));
    }
  }

  void addRelations(const Entry& entry, ShownDefinition* shown) const {
    if (m_options.isWithInherited) {
      for (const migration::Inherited& inherited : inheritedBy(m_installation, entry)) {
        shown->inherited.push_back(
            {clauseText(inherited.clause, inherited.value), placeOf(*inherited.from)});
      }
    }
    if (m_options.isWithReferrers) {
      for (const migration::Reference& reference : m_installation.referrersOf(entry)) {
        shown->referrers.push_back(
            {clauseText(reference.clause, reference.name),
             {reference.file->source->path(), reference.place().line, describe(reference)}});
      }
    }
  }

  void tree() {
    const Kind kind = m_options.kind.value_or(Kind::kObjectClass);
    const migration::SuperiorTree tree = superiorTree(m_installation, kind);
    if (m_options.names.empty()) {
      for (const std::size_t root : tree.roots) {
        grow(tree, root);
      }
    }
    for (const std::string& name : m_options.names) {
      const Entry* const top = m_installation.find(kind, name);
      const auto node = std::find_if(tree.nodes.begin(), tree.nodes.end(), [&](const auto& each) {
        return top != nullptr && each.entry->kept == top->kept;
      });
      if (node == tree.nodes.end()) {
        addUnknown(name);
      } else {
        grow(tree, static_cast<std::size_t>(node - tree.nodes.begin()));
      }
    }
  }

  void grow(const migration::SuperiorTree& tree, std::size_t root) {
    std::vector<std::pair<std::size_t, std::size_t>> next = {{root, 0}};
    while (!next.empty()) {
      const auto [number, depth] = next.back();
      next.pop_back();
      const migration::SuperiorTree::Node& node = tree.nodes[number];
      const bool isFirst = m_grown.insert(number).second;
      m_report.tree.push_back(lineOf(*node.entry, depth, !isFirst && !node.below.empty()));
      for (auto below = node.below.rbegin(); isFirst && below != node.below.rend(); ++below) {
        next.emplace_back(*below, depth + 1);
      }
    }
  }

  static std::string nameOf(const Entry& entry) {
    const std::string name = entry.kept->object->getFirstName();
    return name.empty() ? entry.kept->object->getOid() : name;
  }

  ShownTreeLine lineOf(const Entry& entry, std::size_t depth, bool isShownAbove) const {
    ShownTreeLine line;
    line.name = nameOf(entry);
    line.depth = depth;
    line.isShownAbove = isShownAbove;
    line.place = placeOf(entry);
    for (const std::string& superior : entry.kept->object->superiorsInPlace()) {
      const Entry* const found = m_installation.find(entry.kind(), superior);
      if (found == nullptr) {
        line.notDefined.push_back(superior);
      } else {
        line.superiors.push_back(nameOf(*found));
      }
    }
    return line;
  }

  const ShowOptions& m_options;
  ShowReport m_report;
  Installation m_installation;
  std::set<std::size_t> m_grown;
};

}  // namespace

ShowReport show(const ShowOptions& options) { return ShowRun(options).report(); }
