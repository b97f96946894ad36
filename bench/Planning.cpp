#include "Planning.h"

#include <libschema-migration/Execution.h>
#include <libschema-migration/MigrationPlan.h>

#include <algorithm>
#include <cstdlib>
#include <filesystem>
#include <memory>

#include "SchemaManager.h"
#include "Works.h"

namespace bench {

namespace {

// As `diff` makes it for its text, or as `migrate` does.
std::unique_ptr<migration::MigrationPlan> planOf(const Input& input, bool isChecked) {
  migration::PlanRequest request;
  request.isChecked = isChecked;
  request.base = input.base;
  request.old = input.older;
  request.latest = input.newer;
  if (!input.excluded.empty()) {
    request.excludeLists = {input.excluded};
  }
  request.withdrawList = input.withdrawn;
  request.prefer = migration::Prefer::kOld;
  return migration::makePlan(request);
}

void endUnless(bool isWell) {
  if (!isWell) {
    std::exit(1);
  }
}

Run diffRun(const Input& input, const std::string& /*output*/) {
  return [&input] {
    std::unique_ptr<migration::MigrationPlan> plan;
    const double seconds = secondsOf([&] { plan = planOf(input, false); });
    endUnless(plan->failures.empty() && !plan->threeWay.differences.empty());
    return seconds;
  };
}

Run readingRun(const Input& input, const std::string& /*output*/) {
  return [&input] {
    std::vector<std::unique_ptr<SchemaManager>> managers;
    return secondsOf([&] {
      for (const std::string& directory : {input.base, input.older, input.newer}) {
        if (directory.empty()) {
          continue;
        }
        managers.push_back(std::make_unique<SchemaManager>(directory));
        for (const std::string& name : kReadable) {
          if (std::filesystem::exists(directory + "/" + name)) {
            managers.back()->readFile(name);
          }
        }
      }
    });
  };
}

Run migrateRun(const Input& input, const std::string& output) {
  return [&input, output] {
    for (const char* const folder : migration::kExecutionFolders) {
      std::filesystem::remove_all(output + "/" + folder);
      std::filesystem::create_directory(output + "/" + folder);
    }
    migration::Execution execution;
    std::unique_ptr<migration::MigrationPlan> plan;
    const double seconds = secondsOf([&] {
      plan = planOf(input, true);
      execution = migration::execute(plan->request, plan->threeWay, output);
    });
    endUnless(execution.failures.empty() && !execution.inNewsLayout.empty());
    return seconds;
  };
}

Run cycleRun(const Input& input, const std::string& output) {
  const auto cycle = std::find_if(works().begin(), works().end(),
                                  [](const Work& work) { return work.name == "whole cycle"; });
  return cycle->library(input, output);
}

}  // namespace

const std::vector<PlanningWork>& planningWorks() {
  static const std::vector<PlanningWork> kWorks = {{"diff", diffRun, readingRun, kDiffGoal},
                                                   {"migrate", migrateRun, cycleRun, kMigrateGoal}};
  return kWorks;
}

}  // namespace bench
