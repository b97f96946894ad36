// What is worked out beforehand is what the library then does: on generated pairs of installations,
// in which names and OIDs are few, so that they meet in every way.

#include "Plan.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <random>

#include "Messages.h"
#include "Migration.h"
#include "SeparateProcess.h"
#include "StagedRun.h"
#include "ToolRun.h"
#include "Verification.h"

namespace {

class PairMaker {
 public:
  explicit PairMaker(std::uint32_t seed) : m_random(seed) {}

  // Some of the nine files with a few definitions each.
  ToolFolder::Files installation() {
    ToolFolder::Files files = {{"V3.user.at", ""}};
    for (const char* const name : kSchemaFiles) {
      if (below(3) == 0) {
        for (std::size_t count = below(6); count > 0; --count) {
          files[name] += definition();
        }
      }
    }
    return files;
  }

  std::string list() {
    std::string text;
    for (std::size_t count = below(3); count > 0; --count) {
      text += oid() + "\n";
    }
    return text;
  }

 private:
  std::size_t below(std::size_t limit) { return m_random() % limit; }

  std::string oid() { return "1." + std::to_string(1 + below(7)); }

  // A name now and then is spelled like an OID, and an OID like a name.
  std::string name() {
    return below(20) == 0
               ? oid()
               : std::string(1, static_cast<char>((below(2) == 0 ? 'a' : 'A') + below(7)));
  }

  std::string body(std::size_t kind) {
    std::string text = "( " + (below(15) == 0 ? "" : below(20) == 0 ? name() : oid());
    const std::string description = std::string(" DESC '") + (below(3) == 0 ? "x" : "y") + "'";
    if (kind == 2) {
      return text + " LENGTH " + std::to_string(1 + below(2)) + " )\n";
    }
    text += below(20) == 0 ? "" : " NAME ( '" + name() + "' '" + name() + "' )";
    return text + description + (kind == 1 ? " ABSTRACT )\n" : " )\n");
  }

  std::string definition() {
    const char* const kKeywords[] = {"attributetypes", "objectclasses", "ORVAttributetypes"};
    const std::size_t kind = below(3);
    if (below(4) == 0) {
      return std::string(kKeywords[kind]) + " {\n" + body(kind) + body(kind) + "}\n";
    }
    return std::string(kKeywords[kind]) + "=" + body(kind);
  }

  std::mt19937 m_random;
};

struct Counts {
  int runs = 0;
  int refused = 0;
  int refusedByTheLibrary = 0;
  std::uint64_t lost = 0;
};

std::uint64_t sumOf(const Balance& balance) {
  return balance.added + balance.replacing + balance.same + balance.excluded + balance.withdrawn +
         balance.repeated + balance.notCarried;
}

std::size_t occurrencesOf(const std::string& part, const std::string& text) {
  std::size_t count = 0;
  for (std::size_t at = 0; (at = text.find(part, at)) != std::string::npos; ++at) {
    ++count;
  }
  return count;
}

// Works one pair out, makes the migration, and compares the two. Returns what is wrong.
std::string problemOf(const ToolFolder& folder, Counts* counts) {
  StagedRun run(folder);
  const Inventory& oldOne = run.oldOne;
  const Plan plan(oldOne, run.newOne, run.lists);
  const Installations installations{oldOne, run.newOne, {run.exclude}, run.withdraw};
  const std::size_t lacking = occurrencesOf(": NEW lacks it", plan.refusals());
  ++counts->runs;
  counts->refused += plan.refusalCount() != 0 ? 1 : 0;
  if (lacking != plan.refusalCount()) {
    // The library does make such a merge, with what the refusal warns of.
    return "";
  }
  try {
    Migration migration(installations);
    if (lacking != 0) {
      return "the library makes a merge that was refused:\n" + plan.refusals();
    }
    const OwnDirectory& written = run.place.makeDirectory("written");
    migration.write(run.place.pathOf("written"));
    verifyWritten(written.directory(), run.place.pathOf("written"), plan);
  } catch (const Failure& failure) {
    ++counts->refusedByTheLibrary;
    return lacking != 0 && failure.exitCode() == kRefused ? "" : failure.what();
  }
  counts->lost += plan.balance().notCarried;
  return sumOf(plan.balance()) == oldOne.definitions().size() ? ""
                                                              : "not every definition is counted";
}

void install(const ToolFolder& folder, PairMaker* maker) {
  for (const char* const name : {"old", "new"}) {
    std::filesystem::remove_all(folder.file(name));
  }
  folder.install("new", maker->installation());
  folder.install("old", maker->installation());
  folder.write("exclude", maker->list());
  folder.write("withdraw", maker->list());
}

std::string describePair(const ToolFolder& folder) {
  std::string text;
  for (const char* const name : {"old", "new"}) {
    for (const auto& file : folder.contents(name)) {
      text += std::string(name) + "/" + file.first + ":\n" + file.second;
    }
  }
  return text + "exclude: " + support::readWholeFile(folder.file("exclude")) +
         "withdraw: " + support::readWholeFile(folder.file("withdraw"));
}

TEST(Plan, IsWhatTheLibraryDoes) {
  constexpr int kRounds = 1500;
  const ToolFolder folder;
  // In a process of its own: a merge that was refused leaves two managers that nobody may delete.
  const std::string problem = textFromSeparateProcess([&]() -> std::string {
    PairMaker maker(4);
    Counts counts;
    for (int round = 0; round < kRounds; ++round) {
      install(folder, &maker);
      const std::string wrong = problemOf(folder, &counts);
      if (!wrong.empty()) {
        return "round " + std::to_string(round) + ": " + wrong + "\n" + describePair(folder);
      }
    }
    // Each way must have been gone, or the pairs are no test.
    const int made = counts.runs - counts.refused;
    const bool isTest =
        made > 100 && counts.refused > 100 && counts.refusedByTheLibrary > 100 && counts.lost > 100;
    return isTest ? ""
                  : "made " + std::to_string(made) + ", refused " + std::to_string(counts.refused) +
                        ", by the library " + std::to_string(counts.refusedByTheLibrary) +
                        ", lost " + std::to_string(counts.lost);
  });
  EXPECT_EQ("", problem);
}

}  // namespace
