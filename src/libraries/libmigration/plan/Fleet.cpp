#include "Fleet.h"

#include <algorithm>
#include <array>
#include <limits>
#include <map>
#include <set>
#include <tuple>
#include <unordered_map>
#include <unordered_set>

#include "Content.h"
#include "Digest.h"
#include "FleetPlan.h"

namespace migration {

namespace {

constexpr std::size_t kNone = std::numeric_limits<std::size_t>::max();

// What OLD says, whichever of it differs from BASE or NEW.
std::string digestOf(const FleetPlanRow& row) {
  std::map<std::string_view, std::string_view> values;
  for (const FleetClause& clause : row.clauses) {
    values[clause.clause] = clause.old;
  }
  for (const FleetValue& value : row.values) {
    values[value.first] = value.second;
  }
  std::string text;
  for (const auto& [clause, value] : values) {
    if (!value.empty()) {
      text.append(clause).append(1, '\0').append(value).append(1, '\0');
    }
  }
  return sha256Of(text);
}

Standing standingWithBase(const FleetPlanRow& row) {
  if (!row.isInBase) {
    return row.isInOld ? Standing::kAdded : Standing::kAbsent;
  }
  if (!row.isInOld) {
    return Standing::kRemoved;
  }
  if (row.change == "changed-by-release") {
    return Standing::kUnchanged;
  }
  // The others have a clause for each difference; one between BASE and NEW is not the site's.
  const bool isChanged = row.change == "changed-by-site" ||
                         std::any_of(row.clauses.begin(), row.clauses.end(),
                                     [](const FleetClause& c) { return c.base != c.old; });
  return isChanged ? Standing::kChanged : Standing::kUnchanged;
}

Standing standingOf(const FleetPlanRow& row, bool hasBase) {
  return hasBase                ? standingWithBase(row)
         : !row.isInOld         ? Standing::kAbsent
         : row.change == "same" ? Standing::kUnchanged
                                : Standing::kUnknown;
}

bool hasIt(Standing standing) {
  return standing != Standing::kRemoved && standing != Standing::kAbsent;
}

// Whether it is one of the ways in which a definition is had otherwise than unchanged.
bool isOwnWay(Standing standing) { return hasIt(standing) && standing != Standing::kUnchanged; }

std::string questionKeyOf(const FleetPlanRow& row) { return row.kind + " " + row.fingerprint; }

std::size_t orderOf(const std::string& kind) {
  constexpr std::array<std::string_view, 3> kKinds = {"attribute-type", "object-class",
                                                      "vendor-extension"};
  return static_cast<std::size_t>(std::find(kKinds.begin(), kKinds.end(), kind) - kKinds.begin());
}

std::string baseNameOf(const std::string& path) { return path.substr(path.rfind('/') + 1); }

// The files of BASE and NEW by what they are called, each with its digest.
std::vector<std::pair<std::string, std::string>> inputsOf(const FleetPlan& plan) {
  std::vector<std::pair<std::string, std::string>> files;
  for (const FleetPlanFile& file : plan.files) {
    if (file.role == "base" || file.role == "new") {
      files.emplace_back((file.role == "base" ? "BASE " : "NEW ") + baseNameOf(file.path),
                         file.sha256);
    }
  }
  std::sort(files.begin(), files.end());
  return files;
}

// What `others` have otherwise than `files`, each name once.
std::vector<std::string> differencesOf(
    const std::vector<std::pair<std::string, std::string>>& files,
    const std::vector<std::pair<std::string, std::string>>& others) {
  std::vector<std::pair<std::string, std::string>> unlike;
  std::set_symmetric_difference(files.begin(), files.end(), others.begin(), others.end(),
                                std::back_inserter(unlike));
  std::set<std::string> names;
  for (const auto& file : unlike) {
    names.insert(file.first);
  }
  return {names.begin(), names.end()};
}

void keepCommon(const std::vector<std::string>& others, std::vector<std::string>* words) {
  words->erase(std::remove_if(words->begin(), words->end(),
                              [&](const std::string& word) {
                                return std::find(others.begin(), others.end(), word) ==
                                       others.end();
                              }),
               words->end());
}

}  // namespace

std::string_view wordOf(Standing standing) {
  constexpr std::array<std::string_view, 6> kWords = {"unchanged", "changed", "added",
                                                      "removed",   "absent",  "unknown"};
  return kWords[static_cast<std::size_t>(standing)];
}

class FleetReader::Collection {
 public:
  explicit Collection(FleetQuery query) : m_query(std::move(query)) {}

  void add(const std::string& installation, const std::string& path, FleetPlan* plan) {
    const std::size_t here = m_fleet.installations.size();
    FleetInstallation added;
    added.name = installation;
    added.path = path;
    added.release = releaseOf(*plan);
    added.isReady = plan->isReady;
    added.definitions = plan->rows.size() + plan->untouched.count();
    added.refusals = plan->refusals;
    ++m_fleet.releases[added.release].installations;
    const bool hasBase = !plan->base.empty();
    std::set<std::string> questions;  // a plan may have the same definition twice
    for (FleetPlanRow& row : plan->rows) {
      added.undecided += row.isUndecided() ? 1 : 0;
      count(here, added.release, standingOf(row, hasBase), hasBase, row);
      if (row.isQuestion && questions.insert(questionKeyOf(row)).second && isAskedFor(row)) {
        ask(here, &row);
      }
    }
    added.questions = questions.size();
    FleetPlanRow untouched;
    for (std::size_t at = 0; at < plan->untouched.count(); ++at) {
      plan->untouched.copy(at, &untouched);
      plan->followAttribute(&untouched);
      count(here, added.release, untouched.side == 'r' ? Standing::kAbsent : Standing::kUnchanged,
            hasBase, untouched);
    }
    m_fleet.installations.push_back(std::move(added));
  }

  Fleet take() {
    countInstallations();
    settleDefinitions();
    rankQuestions();
    return std::move(m_fleet);
  }

 private:
  // A definition, as long as plans come.
  struct Counted {
    std::size_t lastPlan = kNone;  // that has it
    bool isTouched = false;
    std::size_t has = 0;
    std::size_t unchanged = 0;
    std::size_t undecided = 0;
    std::size_t shown = kNone;  // where it stands among the fleet's definitions
  };

  std::size_t releaseOf(const FleetPlan& plan) {
    std::vector<std::pair<std::string, std::string>> files = inputsOf(plan);
    std::string text = plan.base.empty() ? "-" : "+";
    for (const auto& [name, digest] : files) {
      text.append(name).append(1, '\0').append(digest).append(1, '\0');
    }
    const auto [place, isNew] = m_releases.emplace(sha256Of(text), m_fleet.releases.size());
    if (isNew) {
      FleetRelease release;
      release.base = plan.base;
      release.latest = plan.latest;
      if (m_fleet.releases.empty()) {
        m_filesOfFirst = std::move(files);
      } else {
        release.differing = differencesOf(m_filesOfFirst, files);
      }
      m_fleet.releases.push_back(std::move(release));
    }
    return place->second;
  }

  bool isAskedFor(const FleetPlanRow& row) const {
    const std::string& wanted = m_query.definition;
    return wanted.empty() || equalFolded(wanted, row.commonOid) ||
           equalFolded(wanted, row.commonName) || equalFolded(wanted, row.oid) ||
           (!row.name.empty() && equalFolded(wanted, row.name));
  }

  // The place of a definition; one that a plan has twice counts twice.
  Counted& countedOf(std::size_t here, std::size_t release, const FleetPlanRow& row) {
    const std::string& own = row.commonOid.empty() ? row.commonName : row.commonOid;
    m_key.assign(std::to_string(release)).append(1, ' ').append(row.kind).append(1, ' ');
    m_key.append(1, row.side);
    for (const char c : own) {
      m_key += c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c;
    }
    for (;;) {
      Counted& counted = m_counted[m_key];
      if (counted.lastPlan != here) {
        counted.lastPlan = here;
        return counted;
      }
      m_key += " again";
    }
  }

  void count(std::size_t here, std::size_t release, Standing standing, bool hasBase,
             const FleetPlanRow& row) {
    Counted& counted = countedOf(here, release, row);
    counted.has += hasIt(standing) ? 1 : 0;
    counted.unchanged += standing == Standing::kUnchanged ? 1 : 0;
    counted.undecided += row.isUndecided() ? 1 : 0;
    const bool isTouched =
        isOwnWay(standing) || standing == Standing::kRemoved || row.isUndecided();
    counted.isTouched = counted.isTouched || isTouched;
    const bool isGrouped = isTouched || (standing == Standing::kAbsent && !hasBase);
    if (!isAskedFor(row) ||
        (!isGrouped && !m_query.isWithUnchanged && m_query.definition.empty())) {
      return;
    }
    if (counted.shown == kNone) {
      counted.shown = m_fleet.definitions.size();
      m_fleet.definitions.emplace_back();
      FleetDefinition& definition = m_fleet.definitions.back();
      definition.release = release;
      definition.kind = row.kind;
      definition.oid = row.commonOid;
      definition.name = row.commonName;
    }
    if (isGrouped) {
      group(here, counted.shown, standing, row);
    }
  }

  void group(std::size_t here, std::size_t shown, Standing standing, const FleetPlanRow& row) {
    const std::string digest = hasIt(standing) ? digestOf(row) : "";
    std::vector<FleetGroup>& groups = m_fleet.definitions[shown].groups;
    std::string key = std::to_string(shown) + " " + std::string(wordOf(standing)) + " " +
                      row.change + " " + row.outcome + " " + digest;
    const auto [place, isNew] = m_groups.emplace(std::move(key), groups.size());
    if (isNew) {
      groups.push_back({standing, row.change, row.outcome, row.clauses, row.values, {}});
      if (isOwnWay(standing) && m_ways.insert(std::to_string(shown) + " " + digest).second) {
        ++m_fleet.definitions[shown].ways;
      }
    }
    groups[place->second].installations.push_back(here);
  }

  void ask(std::size_t here, FleetPlanRow* row) {
    const auto [place, isNew] = m_questions.emplace(questionKeyOf(*row), m_fleet.questions.size());
    if (isNew) {
      FleetQuestion question;
      question.kind = std::move(row->kind);
      question.oid = std::move(row->oid);
      question.name = std::move(row->name);
      question.isByName = row->isByName;
      question.fingerprint = std::move(row->fingerprint);
      question.reason = std::move(row->reason);
      question.clauses = std::move(row->clauses);
      question.values = std::move(row->values);
      question.takes = std::move(row->takes);
      question.openClauses = std::move(row->openClauses);
      question.mayMove = row->mayMove;
      m_fleet.questions.push_back(std::move(question));
    } else {
      FleetQuestion& question = m_fleet.questions[place->second];
      keepCommon(row->takes, &question.takes);
      keepCommon(row->openClauses, &question.openClauses);
      question.mayMove = question.mayMove && row->mayMove;
    }
    m_fleet.questions[place->second].installations.push_back(here);
  }

  void countInstallations() {
    for (const FleetInstallation& installation : m_fleet.installations) {
      m_fleet.readyCount += installation.isReady ? 1 : 0;
      m_fleet.refusedCount += installation.refusals != 0 ? 1 : 0;
      m_fleet.questionCount += installation.questions;
    }
  }

  void settleDefinitions() {
    std::vector<bool> isShown(m_fleet.definitions.size());
    for (const auto& [key, counted] : m_counted) {
      FleetRelease& release = m_fleet.releases[std::stoul(key)];
      ++release.definitions;
      release.unchangedDefinitions += counted.isTouched ? 0 : 1;
      if (counted.shown == kNone) {
        continue;
      }
      FleetDefinition& definition = m_fleet.definitions[counted.shown];
      definition.has = counted.has;
      definition.unchanged = counted.unchanged;
      definition.undecided = counted.undecided;
      // Without BASE, what all of them lack is the release's.
      isShown[counted.shown] =
          counted.isTouched || m_query.isWithUnchanged || !m_query.definition.empty();
      std::stable_sort(definition.groups.begin(), definition.groups.end(),
                       [](const FleetGroup& left, const FleetGroup& right) {
                         return left.installations.size() > right.installations.size();
                       });
    }
    std::vector<FleetDefinition> shown;
    for (std::size_t at = 0; at < isShown.size(); ++at) {
      if (isShown[at]) {
        shown.push_back(std::move(m_fleet.definitions[at]));
      }
    }
    const auto orderOfOne = [](const FleetDefinition& one) {
      return std::make_tuple(one.release, orderOf(one.kind), folded(one.name), one.oid);
    };
    std::stable_sort(shown.begin(), shown.end(),
                     [&](const FleetDefinition& left, const FleetDefinition& right) {
                       return orderOfOne(left) < orderOfOne(right);
                     });
    m_fleet.definitions = std::move(shown);
  }

  // What settles most comes first; each is told with what is ready once all before it are settled.
  void rankQuestions() {
    const auto orderOfOne = [](const FleetQuestion& one) {
      return std::make_tuple(std::numeric_limits<std::size_t>::max() - one.installations.size(),
                             orderOf(one.kind), folded(one.name), one.oid);
    };
    std::stable_sort(m_fleet.questions.begin(), m_fleet.questions.end(),
                     [&](const FleetQuestion& left, const FleetQuestion& right) {
                       return orderOfOne(left) < orderOfOne(right);
                     });
    std::vector<std::size_t> open;
    open.reserve(m_fleet.installations.size());
    for (const FleetInstallation& installation : m_fleet.installations) {
      open.push_back(installation.questions);
    }
    std::size_t ready = m_fleet.readyCount;
    for (FleetQuestion& question : m_fleet.questions) {
      for (const std::size_t at : question.installations) {
        ready += --open[at] == 0 && m_fleet.installations[at].refusals == 0 ? 1 : 0;
      }
      question.readyThen = ready;
    }
  }

  FleetQuery m_query;
  Fleet m_fleet;
  std::vector<std::pair<std::string, std::string>> m_filesOfFirst;
  std::unordered_map<std::string, std::size_t> m_releases;
  std::string m_key;  // whose room is used again and again
  std::unordered_map<std::string, Counted> m_counted;
  std::unordered_map<std::string, std::size_t> m_groups;
  std::unordered_set<std::string> m_ways;
  std::unordered_map<std::string, std::size_t> m_questions;
};

FleetReader::FleetReader(FleetQuery query)
    : m_collection(std::make_unique<Collection>(std::move(query))) {}

FleetReader::~FleetReader() = default;

bool FleetReader::add(const std::string& installation, const Source& plan, Failures* failures) {
  FleetPlan read;
  if (!readFleetPlan(plan, &read, failures)) {
    return false;
  }
  m_collection->add(installation, plan.path(), &read);
  return true;
}

Fleet FleetReader::take() { return m_collection->take(); }

}  // namespace migration
