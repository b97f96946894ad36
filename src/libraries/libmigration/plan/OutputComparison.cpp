#include "OutputComparison.h"

#include <algorithm>
#include <cstddef>
#include <map>
#include <string_view>
#include <unordered_map>
#include <utility>

#include "Check.h"
#include "ResultIndex.h"
#include "ToldClauses.h"

namespace migration {

namespace {

std::string idOf(Kind kind, const std::string& oid) {
  return static_cast<char>('0' + static_cast<int>(kind)) + oid;
}

std::string idOf(const Entry& entry) {
  return idOf(entry.kind(), entry.kept->object->oidInPlace());
}

Installation installationOf(const PlannedFiles& planned) {
  return Installation::overTexts("planned", planned.texts);
}

// The definitions of one kind and OID, as planned and as found; mostly one each.
struct Group {
  std::vector<const Entry*> planned;
  std::vector<const Entry*> found;
};

class DefinitionComparison {
 public:
  DefinitionComparison(const MigrationPlan& plan, const Installation& planned,
                       const Installation& output)
      : m_output(output) {
    for (const Entry& entry : planned.entries()) {
      enter(entry, &Group::planned);
    }
    for (const Entry& entry : output.entries()) {
      enter(entry, &Group::found);
    }
    for (const Verdict& row : plan.threeWay.differences) {
      if (row.isInResult()) {
        m_rows.emplace(idOf(row.kind(), oidInResult(row)), &row);
      }
    }
  }

  std::vector<OutputDifference> compare() {
    for (const std::string& id : m_order) {
      compareGroup(id, m_groups[id]);
    }
    return std::move(m_differences);
  }

 private:
  void enter(const Entry& entry, std::vector<const Entry*> Group::*side) {
    const std::string id = idOf(entry);
    const auto [at, isNew] = m_groups.try_emplace(id);
    if (isNew) {
      m_order.push_back(id);
    }
    (at->second.*side).push_back(&entry);
  }

  // Whatever is equal is taken out first, so that of several only those are told that differ.
  void compareGroup(const std::string& id, Group& group) {
    const auto isInSameFile = [](const Entry& one, const Entry& other) {
      return one.file->name == other.file->name;
    };
    pair(&group, [&](const Entry& planned, const Entry& found) {
      return isInSameFile(planned, found) && areAlike(planned, found);
    });
    pair(&group, [&](const Entry& planned, const Entry& found) {
      if (areAlike(planned, found)) {
        tellWrongFile(planned, found);
        return true;
      }
      return false;
    });
    pair(&group, [&](const Entry& planned, const Entry& found) {
      tellChange(planned, found);
      if (!isInSameFile(planned, found)) {
        tellWrongFile(planned, found);
      }
      return true;
    });
    for (const Entry* const planned : group.planned) {
      m_differences.push_back({m_output.directory() + "/" + planned->file->name,
                               0,
                               describe(*planned) + " is missing" + reasonOf(id),
                               {}});
    }
    for (const Entry* const found : group.found) {
      tell(*found,
           describe(*found) +
               (m_rows.count(id) == 0 ? " was not planned" : " is there more often than planned"));
    }
  }

  template <typename Match>
  static void pair(Group* group, const Match& isMatch) {
    for (auto planned = group->planned.begin(); planned != group->planned.end();) {
      const auto found =
          std::find_if(group->found.begin(), group->found.end(),
                       [&](const Entry* entry) { return isMatch(**planned, *entry); });
      if (found == group->found.end()) {
        ++planned;
        continue;
      }
      group->found.erase(found);
      planned = group->planned.erase(planned);
    }
  }

  static bool areAlike(const Entry& planned, const Entry& found) {
    return contentOf(*planned.kept).values == contentOf(*found.kept).values;
  }

  void tell(const Entry& found, const std::string& text,
            std::vector<ClauseDifference> clauses = {}) {
    m_differences.push_back(
        {found.file->source->path(), found.place().line, text, std::move(clauses)});
  }

  void tellWrongFile(const Entry& planned, const Entry& found) {
    tell(found, describe(found) + " stands in " + found.file->name + ", and " + planned.file->name +
                    " was planned");
  }

  void tellChange(const Entry& planned, const Entry& found) {
    const Content wanted = contentOf(*planned.kept);
    const Content there = contentOf(*found.kept);
    std::vector<ClauseDifference> clauses;
    for (const Aspect aspect : aspectsOf(planned.kind())) {
      if (wanted[aspect] != there[aspect]) {
        ClauseChange change;
        change.aspect = aspect;
        change.old = wanted[aspect];
        change.latest = there[aspect];
        for (const ToldClause& clause : toldClauses(change)) {
          clauses.push_back({clause.name, clause.old, clause.latest});
        }
      }
    }
    tell(found, describe(planned) + " is not what was planned" + reasonOf(idOf(planned)),
         std::move(clauses));
  }

  std::string reasonOf(const std::string& id) const {
    const auto row = m_rows.find(id);
    return row == m_rows.end() ? ""
                               : " (" + std::string(wordOf(row->second->outcome)) + ": " +
                                     row->second->reason + ")";
  }

  const Installation& m_output;
  std::unordered_map<std::string, Group> m_groups;
  std::vector<std::string> m_order;  // of the groups
  std::unordered_map<std::string, const Verdict*> m_rows;
  std::vector<OutputDifference> m_differences;
};

// ---- Files ----

bool isConfigFile(std::string_view name) { return name.rfind("V3.config.", 0) == 0; }

std::size_t lengthOfFirstLine(std::string_view bytes) {
  const std::size_t end = bytes.find('\n');
  return end == std::string_view::npos ? bytes.size() : end + 1;
}

void compareBytes(const NamedText& text, const SchemaFile& found, bool isWithoutHeader,
                  std::vector<OutputDifference>* differences) {
  std::string_view wanted = text.bytes;
  std::string_view there = found.source->bytes();
  std::size_t skipped = 0;
  if (isWithoutHeader) {
    skipped = lengthOfFirstLine(there);
    there.remove_prefix(skipped);
    wanted.remove_prefix(lengthOfFirstLine(wanted));
  }
  if (wanted == there) {
    return;
  }
  const std::size_t common = static_cast<std::size_t>(
      std::mismatch(wanted.begin(), wanted.end(), there.begin(), there.end()).first -
      wanted.begin());
  const std::uint64_t line = found.source->placeOf(skipped + common).line;
  differences->push_back({found.source->path(),
                          line,
                          isConfigFile(text.name)
                              ? "from here on the file is not NEW's, byte for byte"
                              : "from here on the file is not, byte for byte, what was planned",
                          {}});
}

void compareFiles(const PlannedFiles& planned, const Installation& output,
                  std::vector<OutputDifference>* differences) {
  for (const NamedText& text : planned.texts) {
    const SchemaFile* const found = output.file(text.name);
    if (found == nullptr) {
      differences->push_back({output.directory() + "/" + text.name, 0, "the file is missing", {}});
    } else {
      compareBytes(text, *found, planned.isInLibraryLayout && !isConfigFile(text.name),
                   differences);
    }
  }
  std::vector<std::string> others = output.otherFiles();
  for (const SchemaFile& file : output.files()) {
    const bool isPlanned =
        std::any_of(planned.texts.begin(), planned.texts.end(),
                    [&](const NamedText& text) { return text.name == file.name; });
    if (!isPlanned) {
      others.push_back(file.name);
    }
  }
  for (const std::string& name : others) {
    differences->push_back({output.directory() + "/" + name, 0, "the file was not planned", {}});
  }
}

// ---- Findings ----

using Counts = std::map<std::string, std::size_t>;

std::string keyOf(const Finding& finding) { return finding.rule + finding.definition; }

Findings checked(const Installation& installation) {
  CheckRequest request;
  request.installation = &installation;
  return check(request);
}

void countMost(const Installation& installation, Counts* most) {
  Counts counts;
  for (const Finding& finding : checked(installation)) {
    ++counts[keyOf(finding)];
  }
  for (const auto& [key, count] : counts) {
    std::size_t& known = (*most)[key];
    known = std::max(known, count);
  }
}

}  // namespace

std::vector<OutputDifference> compareOutput(const MigrationPlan& plan, const PlannedFiles& planned,
                                            const Installation& output) {
  const Installation expected = installationOf(planned);
  std::vector<OutputDifference> differences =
      DefinitionComparison(plan, expected, output).compare();
  compareFiles(planned, output, &differences);
  return differences;
}

Findings newInOutput(const MigrationPlan& plan, const PlannedFiles& planned,
                     const Installation& output) {
  Counts known;
  countMost(*plan.old, &known);
  countMost(*plan.latest, &known);
  countMost(installationOf(planned), &known);
  Findings findings;
  Counts seen;
  for (Finding& finding : checked(output)) {
    if (++seen[keyOf(finding)] > known[keyOf(finding)]) {
      findings.push_back(std::move(finding));
    }
  }
  return findings;
}

bool mayBeInLibraryLayout(const Installation& output) {
  constexpr std::string_view kHeader = "# File generated by ";
  return std::any_of(output.files().begin(), output.files().end(), [&](const SchemaFile& file) {
    return !isConfigFile(file.name) && file.source->bytes().substr(0, kHeader.size()) == kHeader;
  });
}

}  // namespace migration
