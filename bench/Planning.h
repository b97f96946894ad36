// diff and migrate beside what the library does of them.

#ifndef LIBSCHEMA_BENCH_PLANNING_H
#define LIBSCHEMA_BENCH_PLANNING_H

#include <functional>
#include <string>
#include <vector>

#include "Inputs.h"
#include "Measure.h"

namespace bench {

constexpr double kDiffGoal = 4;
constexpr double kMigrateGoal = 3;
constexpr double kPlanningGrowthGoal = 1.2;

// Makes runs for an input and a folder to write to.
struct PlanningWork {
  using Maker = std::function<Run(const Input&, const std::string&)>;
  std::string name;
  Maker run;
  Maker own;  // the library's
  double goal = 0;
};

// `diff`: the plan, as the command makes it, beside the library's reading of the three. `migrate`:
// the plan, carried out, beside the library's whole cycle on the two. What is in conflict is OLD's.
const std::vector<PlanningWork>& planningWorks();

}  // namespace bench

#endif  // LIBSCHEMA_BENCH_PLANNING_H
