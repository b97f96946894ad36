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
      if (!isRemoved && !isOrphan && !isSites && !isDoubled && !row.isNewsOnly && !row.isTaken) {
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

}  // namespace
