// Everything that is to be known before a migration: the inputs with their digests, what comes of
// every definition, what the rules say of the inputs and of the result, and why it must not go
// ahead.

#ifndef LIBSCHEMA_MIGRATION_MIGRATION_PLAN_H
#define LIBSCHEMA_MIGRATION_MIGRATION_PLAN_H

#include <cstddef>
#include <cstdint>
#include <functional>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "Finding.h"
#include "Installation.h"
#include "ThreeWay.h"

namespace migration {

// What is to be planned, and with which options.
struct PlanRequest {
  std::string base;  // directories; empty for no BASE
  std::string old;
  std::string latest;  // NEW
  std::vector<std::string> excludeLists;
  std::string withdrawList;  // empty without one
  std::vector<std::string> decisions;
  Prefer prefer = Prefer::kNothing;
  bool allowUnused = false;  // decisions that match nothing, or are for other texts
  bool acceptBase = false;   // a BASE that equals OLD, or NEW
  bool isRepaired = false;   // what can be mended is mended, in memory
  // Whether the rules look at the inputs and at the result. A plan of which they do not tells what
  // differs and what comes of it, and is none to carry out.
  bool isChecked = true;
  ReadLimits limits;
  // Called with what is done next, as in "reading OLD": a plan of many definitions takes its time.
  std::function<void(const char* step)> onStep;
};

// A file that the plan was made from.
struct PlanInput {
  std::string role;  // "base", "old", "new", "settings", "exclude", "withdraw", "decisions"
  std::string path;
  std::string sha256;
};

struct MigrationPlan {
  PlanRequest asked;
  std::vector<PlanInput> inputs;
  ThreeWay threeWay;

  // What was mended, at its places in the files. Everything else is of the mended texts; the files
  // as they were read are kept beside them, by "base", "old" and "new".
  Findings repairs;
  std::map<std::string, std::vector<NamedText>> asRead;

  // What the rules say of BASE, OLD and NEW, of the lists, and of the result what neither OLD nor
  // NEW had. What the settings of a directory accept is left out.
  Findings ofInputs;
  Findings newInResult;

  // Inputs that cannot be had or read; nothing else means anything then.
  Failures failures;
  // Why the migration must not go ahead, beside what is undecided.
  Failures refusals;
  std::size_t undecidedCount = 0;

  // Whether the migration may go ahead.
  bool isReady() const {
    return asked.isChecked && failures.empty() && refusals.empty() && undecidedCount == 0;
  }

  // What everything above refers to.
  ThreeWayRequest request;
  std::optional<Installation> base;
  std::optional<Installation> old;
  std::optional<Installation> latest;
  std::vector<std::unique_ptr<Source>> lists;
  std::vector<const Source*> oidLists;

  // How often OLD or NEW has what the rules find, by rule and definition; the result may, too.
  std::map<std::string, std::size_t> knownFindings;
  // The first of the refusals are there whatever is decided.
  std::size_t inputRefusalCount = 0;

  // The result in NEW's layout, as it stands with what is undecided left at NEW's.
  std::vector<NamedText> resultTexts;
  std::optional<Installation> result;  // over these texts
};

// Works the plan out. Nothing is written.
std::unique_ptr<MigrationPlan> makePlan(const PlanRequest& request);

// Works out anew what follows from decisions, with these in the place of the plan's. Nothing is
// read again. What referred to the plan's differences no longer does.
void decideAnew(std::vector<Decision> decisions, MigrationPlan* plan);

}  // namespace migration

#endif  // LIBSCHEMA_MIGRATION_MIGRATION_PLAN_H
