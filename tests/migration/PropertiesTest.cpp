// What holds for every migration: properties over generated triples of BASE, OLD and NEW. A longer
// run by hand: TRIPLES=50000 migration_properties_test.

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>
#include <filesystem>
#include <functional>
#include <map>
#include <set>
#include <string>
#include <utility>
#include <vector>

#include "Execution.h"
#include "ThreeWay.h"
#include "Triples.h"
#include "UnfreedDefinitions.h"

namespace {

using migration::Change;
using migration::Entry;
using migration::Execution;
using migration::Installation;
using migration::Outcome;
using migration::Prefer;
using migration::ThreeWay;
using migration::ThreeWayRequest;
using migration::Verdict;
using triples::Texts;
using triples::Triple;

class PrivateFolder {
 public:
  PrivateFolder() {
    char name[] = "/tmp/properties-XXXXXX";
    m_path = ::mkdtemp(name);
  }
  ~PrivateFolder() { std::filesystem::remove_all(m_path); }
  PrivateFolder(const PrivateFolder&) = delete;
  PrivateFolder& operator=(const PrivateFolder&) = delete;

  // Empty, with what an execution needs.
  const std::string& emptied() const {
    for (const char* const folder : migration::kExecutionFolders) {
      std::filesystem::remove_all(m_path + "/" + folder);
      std::filesystem::create_directory(m_path + "/" + folder);
    }
    return m_path;
  }

 private:
  std::string m_path;
};

std::string shown(const Texts& texts) {
  std::string all;
  for (const migration::NamedText& text : texts) {
    all += "== " + text.name + "\n" + text.bytes;
  }
  return all;
}

std::string shown(const Triple& triple) {
  return "BASE\n" + shown(triple.base) + "OLD\n" + shown(triple.old) + "NEW\n" +
         shown(triple.latest);
}

std::string shown(const migration::Failures& failures) {
  std::string text;
  for (const migration::Failure& failure : failures) {
    text += failure.file + ": " + failure.text + "\n";
  }
  return text;
}

std::string shown(const Verdict& row) {
  return describe(row) + ": " + nameOf(row.change) + " -> " + std::string(wordOf(row.outcome)) +
         " (" + row.reason + ")" + (row.result ? " " + migration::textOf(*row.result) : "");
}

std::string shown(const ThreeWay& threeWay) {
  std::string text;
  for (const Verdict& row : threeWay.differences) {
    text += shown(row) + "\n";
  }
  return text;
}

// Three installations and what their comparison comes to.
class Compared {
 public:
  explicit Compared(const Triple& triple, std::vector<migration::Decision> decisions = {},
                    Prefer prefer = Prefer::kNothing)
      : m_base(read("BASE", triple.base)),
        m_old(read("OLD", triple.old)),
        m_latest(read("NEW", triple.latest)) {
    request.base = &m_base;
    request.old = &m_old;
    request.latest = &m_latest;
    request.decisions = std::move(decisions);
    request.prefer = prefer;
    threeWay = compareThreeWay(request);
  }
  Compared(const Compared&) = delete;
  Compared& operator=(const Compared&) = delete;

  const std::vector<Verdict>& rows() const { return threeWay.differences; }

  ThreeWayRequest request;
  ThreeWay threeWay;

 private:
  static Installation read(const char* name, const Texts& texts) {
    migration::Failures failures;
    return Installation::fromTexts(name, texts, migration::ReadLimits(), &failures);
  }

  Installation m_base;
  Installation m_old;
  Installation m_latest;
};

std::vector<std::string> definitionsOf(const Texts& texts) {
  migration::Failures failures;
  const Installation result =
      Installation::fromTexts("result", texts, migration::ReadLimits(), &failures);
  std::vector<std::string> all;
  for (const Entry& entry : result.entries()) {
    all.push_back(std::string(nameOf(entry.kind())) +
                  migration::textOf(migration::contentOf(*entry.kept)));
  }
  std::sort(all.begin(), all.end());
  return all;
}

// Where one OID means two definitions, the order of the sides tells which of them is meant.
bool hasSharedOid(const Texts& texts) {
  migration::Failures failures;
  const Installation installation =
      Installation::fromTexts("", texts, migration::ReadLimits(), &failures);
  std::set<std::string> oids;
  std::set<std::string> again;
  for (const Entry& entry : installation.entries()) {
    const bool isExtension = entry.kind() == migration::Kind::kVendorExtension;
    const std::string& oid = entry.kept->object->oidInPlace();
    const std::vector<std::string>& names = entry.kept->object->namesInPlace();
    const std::string id = oid + " " + (names.empty() ? std::string() : names.front());
    if (!isExtension && again.insert(id).second && !oids.insert(oid).second) {
      return true;
    }
  }
  return false;
}

bool hasSharedOid(const Triple& triple) {
  return hasSharedOid(triple.base) || hasSharedOid(triple.old) || hasSharedOid(triple.latest);
}

// Runs `property` on many triples, easy and hard ones, and shows the first for which it fails.
void forTriples(unsigned count,
                const std::function<std::string(triples::Generator*, Triple)>& property) {
  if (const char* const wanted = std::getenv("TRIPLES")) {
    count = static_cast<unsigned>(std::strtoul(wanted, nullptr, 10));
  }
  const char* const first = std::getenv("FIRST_TRIPLE");
  const unsigned begin =
      first == nullptr ? 0 : static_cast<unsigned>(std::strtoul(first, nullptr, 10));
  for (unsigned seed = begin; seed < begin + count; ++seed) {
    triples::Generator generator(seed);
    const Triple triple = generator.triple(seed % 2 == 1);
    const std::string problem = property(&generator, triple);
    ASSERT_EQ(problem, "") << "seed " << seed << "\n" << shown(triple);
  }
}

TEST(Properties, AnExecutedPlanIsThePlanAndTheResultMigratesToItself) {
  const PrivateFolder folder;
  const support::UnfreedDefinitions unfreed;
  forTriples(150, [&](triples::Generator*, const Triple& triple) -> std::string {
    const Compared first(triple);
    const Execution execution = execute(first.request, first.threeWay, folder.emptied());
    if (!execution.failures.empty()) {
      return shown(execution.failures) + shown(first.threeWay);
    }
    if (hasSharedOid(triple)) {
      return "";
    }
    const Compared second({triple.base, execution.inNewsLayout, triple.latest});
    const Execution again = execute(second.request, second.threeWay, folder.emptied());
    if (!again.failures.empty()) {
      return "again: " + shown(again.failures) + shown(second.threeWay);
    }
    if (definitionsOf(execution.inNewsLayout) != definitionsOf(again.inNewsLayout)) {
      return "first\n" + shown(first.threeWay) + shown(execution.inNewsLayout) + "second\n" +
             shown(second.threeWay) + shown(again.inNewsLayout);
    }
    return "";
  });
}

TEST(Properties, TheReleaseMigratedToItselfChangesNoByte) {
  const PrivateFolder folder;
  const support::UnfreedDefinitions unfreed;
  forTriples(60, [&](triples::Generator*, const Triple& triple) -> std::string {
    const Compared same({triple.base, triple.latest, triple.latest});
    for (const Verdict& row : same.rows()) {
      if (row.outcome != Outcome::kSame && row.outcome != Outcome::kGone) {
        return shown(row);
      }
    }
    const Execution execution = execute(same.request, same.threeWay, folder.emptied());
    return shown(execution.failures) +
           (shown(execution.inNewsLayout) == shown(triple.latest)
                ? ""
                : "bytes differ\n" + shown(same.threeWay) + shown(execution.inNewsLayout));
  });
}

// But for what the site still refers to.
TEST(Properties, WhatTheSiteLeftAloneBecomesNews) {
  forTriples(400, [&](triples::Generator*, const Triple& triple) -> std::string {
    const Compared compared({triple.base, triple.base, triple.latest});
    for (const Verdict& row : compared.rows()) {
      const bool isNews = row.outcome == Outcome::kNew || row.outcome == Outcome::kSame ||
                          row.outcome == Outcome::kDropped;
      if (!isNews) {
        return shown(row);
      }
    }
    return "";
  });
}

// But for what the site removed, and for config files.
TEST(Properties, WhatTheReleaseLeftAloneStaysTheSites) {
  forTriples(400, [&](triples::Generator*, const Triple& triple) -> std::string {
    const Compared compared({triple.base, triple.old, triple.base});
    for (const Verdict& row : compared.rows()) {
      const Verdict& whole =
          row.match.attribute == migration::kNoRow ? row : compared.rows()[row.match.attribute];
      const bool isRemoved =
          row.outcome == Outcome::kNew && (whole.match.old == nullptr || row.match.old == nullptr);
      const bool isOrphan = row.match.latest == nullptr && row.outcome == Outcome::kDropped &&
                            row.match.attribute == migration::kNoRow;
      const bool isSites = row.outcome == Outcome::kOld || row.outcome == Outcome::kAdded ||
                           row.outcome == Outcome::kSame;
      const bool isDoubled =
          row.isUndecided() && row.reason.find("too, and the library") != std::string::npos;
      // The site's reference to what stays as NEW calls it is NEW's.
      const bool isFollowing = row.outcome == Outcome::kNew && !row.notes.empty() &&
                               row.notes.back().find("the reference follows") != std::string::npos;
      if (!isRemoved && !isOrphan && !isSites && !isDoubled && !isFollowing && !row.isNewsOnly &&
          !row.isTaken) {
        return shown(row);
      }
    }
    return "";
  });
}

Change swapped(Change change) {
  switch (change) {
    case Change::kAddedBySite:
      return Change::kAddedByRelease;
    case Change::kAddedByRelease:
      return Change::kAddedBySite;
    case Change::kRemovedBySite:
      return Change::kRemovedByRelease;
    case Change::kRemovedByRelease:
      return Change::kRemovedBySite;
    case Change::kChangedBySite:
      return Change::kChangedByRelease;
    case Change::kChangedByRelease:
      return Change::kChangedBySite;
    default:
      return change;
  }
}

std::string placeOf(const Entry* entry) {
  return entry == nullptr ? std::string("-")
                          : entry->file->name + ":" + std::to_string(entry->kept->offset) + " ";
}

TEST(Properties, SwappingTheSidesSwapsTheWords) {
  forTriples(400, [&](triples::Generator*, const Triple& triple) -> std::string {
    if (hasSharedOid(triple)) {
      return "";
    }
    const Compared straight(triple);
    const Compared turned({triple.base, triple.latest, triple.old});
    std::map<std::string, Change> words;
    for (const Verdict& row : turned.rows()) {
      words[placeOf(row.match.base) + placeOf(row.match.latest) + placeOf(row.match.old)] =
          row.change;
    }
    for (const Verdict& row : straight.rows()) {
      const auto found =
          words.find(placeOf(row.match.base) + placeOf(row.match.old) + placeOf(row.match.latest));
      if (found == words.end()) {
        return "matched otherwise: " + shown(row) + "\n" + shown(turned.threeWay);
      }
      const bool isTaken = row.change == Change::kTaken || found->second == Change::kTaken;
      if (!isTaken && found->second != swapped(row.change)) {
        return shown(row) + " is swapped " + nameOf(found->second);
      }
    }
    return "";
  });
}

// ---- Decisions ----

std::string idOf(const Verdict& row) {
  return placeOf(row.match.base) + placeOf(row.match.old) + placeOf(row.match.latest);
}

std::string outcomeOf(const Verdict& row) {
  return std::string(wordOf(row.outcome)) +
         (row.result ? " " + migration::textOf(*row.result) : "") + (row.isTakenOut ? " out" : "");
}

// The names and OIDs that a definition has, or has had.
std::set<std::string> namesOf(const Verdict& row) {
  std::set<std::string> names;
  for (const Entry* const entry : {row.match.base, row.match.old, row.match.latest}) {
    if (entry != nullptr) {
      names.insert(entry->kept->object->oidInPlace());
      for (const std::string& name : entry->kept->object->namesInPlace()) {
        names.insert(migration::folded(name));
      }
    }
  }
  return names;
}

bool refersTo(const Verdict& row, const std::set<std::string>& names) {
  for (const Entry* const entry : {row.match.base, row.match.old, row.match.latest}) {
    if (entry == nullptr) {
      continue;
    }
    const migration::Content content = migration::contentOf(*entry->kept);
    for (const migration::Aspect aspect :
         {migration::Aspect::kSup, migration::Aspect::kMust, migration::Aspect::kMay}) {
      for (const std::string& name : content[aspect]) {
        if (names.count(migration::folded(name)) != 0) {
          return true;
        }
      }
    }
  }
  return false;
}

migration::Decision someDecision(triples::Generator* generator, const Verdict& row) {
  static const migration::Take kTakes[] = {migration::Take::kOld, migration::Take::kNew,
                                           migration::Take::kBase, migration::Take::kMerged,
                                           migration::Take::kDrop};
  migration::Decision decision;
  decision.file = "d.toml";
  decision.line = 1;
  decision.kind = row.kind();
  decision.oid = row.entry().kept->object->oidInPlace();
  decision.fingerprint = fingerprintOf(row);
  const bool isNamed = row.kind() != migration::Kind::kVendorExtension && row.match.old != nullptr;
  const int way = generator->pick(isNamed ? 8 : 5);
  if (way < 5) {
    decision.take = kTakes[way];
  } else if (way == 5) {
    decision.rename = "renamed";
  } else if (way == 6) {
    decision.renumber = "9.99";
  } else {
    decision.text = migration::textOf(migration::contentOf(*row.match.old->kept));
  }
  return decision;
}

// What may differ by one decision: what it names, its extension, what refers to one of them, and
// what is kept, or not, by such references, and so on.
std::set<std::string> withinReach(const Compared& before, const Verdict& named) {
  std::vector<const Verdict*> reached = {&named};
  std::set<std::string> ids = {idOf(named)};
  for (std::size_t next = 0; next < reached.size(); ++next) {
    const std::set<std::string> names = namesOf(*reached[next]);
    for (const Verdict& row : before.rows()) {
      const bool isExtension = row.match.attribute != migration::kNoRow &&
                               &before.rows()[row.match.attribute] == reached[next];
      const bool isKept = row.match.latest == nullptr && row.match.base != nullptr &&
                          refersTo(*reached[next], namesOf(row));
      if ((isExtension || isKept || refersTo(row, names)) && ids.insert(idOf(row)).second) {
        reached.push_back(&row);
      }
    }
  }
  return ids;
}

TEST(Properties, ADecisionChangesNothingButWhatItNamesAndWhatGoesWithIt) {
  forTriples(400, [&](triples::Generator* generator, const Triple& triple) -> std::string {
    const Compared before(triple);
    if (before.rows().empty() || hasSharedOid(triple)) {
      return "";
    }
    const Verdict& named = before.rows()[static_cast<std::size_t>(
        generator->pick(static_cast<int>(before.rows().size())))];
    const migration::Decision decision = someDecision(generator, named);
    const Compared after(triple, {decision});
    if (!after.threeWay.failures.empty()) {
      return "";
    }
    const std::set<std::string> reach = withinReach(before, named);
    std::map<std::string, std::string> outcomes;
    for (const Verdict& row : after.rows()) {
      outcomes[idOf(row)] = outcomeOf(row);
    }
    for (const Verdict& row : before.rows()) {
      const auto found = outcomes.find(idOf(row));
      const bool isSame = found != outcomes.end() && found->second == outcomeOf(row);
      if (!isSame && reach.count(idOf(row)) == 0) {
        return "decided " + shown(named) + "\n" + shown(row) + "\nthen\n" + shown(after.threeWay);
      }
    }
    return "";
  });
}

// A decision that can be carried out comes to a result that the library makes.
TEST(Properties, ADecidedPlanIsCarriedOut) {
  const PrivateFolder folder;
  const support::UnfreedDefinitions unfreed;
  forTriples(100, [&](triples::Generator* generator, const Triple& triple) -> std::string {
    const Compared before(triple);
    std::vector<migration::Decision> decisions;
    for (const Verdict& row : before.rows()) {
      if (generator->pick(3) == 0) {
        decisions.push_back(someDecision(generator, row));
        decisions.back().line = decisions.size();
        if (!decisions.back().rename.empty()) {
          decisions.back().rename += std::to_string(decisions.size());
        }
        if (!decisions.back().renumber.empty()) {
          decisions.back().renumber += std::to_string(decisions.size());
        }
      }
    }
    const Compared after(triple, decisions);
    if (!after.threeWay.failures.empty()) {
      return "";
    }
    const Execution execution = execute(after.request, after.threeWay, folder.emptied());
    return execution.failures.empty() ? "" : shown(execution.failures) + shown(after.threeWay);
  });
}

TEST(Properties, APreferenceLeavesWhatIsTakenRemovedOrRenumbered) {
  const PrivateFolder folder;
  const support::UnfreedDefinitions unfreed;
  forTriples(100, [&](triples::Generator* generator, const Triple& triple) -> std::string {
    const Compared before(triple);
    const Prefer prefer = generator->pick(2) == 0 ? Prefer::kOld : Prefer::kNew;
    const Compared after(triple, {}, prefer);
    for (std::size_t row = 0; row < before.rows().size(); ++row) {
      const Verdict& mine = before.rows()[row];
      const bool isOpen = mine.match.old != nullptr && mine.match.latest != nullptr &&
                          !mine.isTaken && !mine.isNewsOnly;
      if (mine.isUndecided() && !isOpen && !after.rows()[row].isUndecided()) {
        return shown(mine) + " is " + shown(after.rows()[row]);
      }
    }
    const Execution execution = execute(after.request, after.threeWay, folder.emptied());
    return execution.failures.empty() ? "" : shown(execution.failures) + shown(after.threeWay);
  });
}

}  // namespace
