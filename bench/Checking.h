// What it costs to check an installation, beside the library's own reading of it.

#ifndef LIBSCHEMA_BENCH_CHECKING_H
#define LIBSCHEMA_BENCH_CHECKING_H

#include "Inputs.h"
#include "Measure.h"

namespace bench {

constexpr double kCheckTimeGoal = 3;
constexpr double kCheckMemoryGoal = 2.5;
constexpr double kCheckGrowthGoal = 1.2;  // the exponent of n

// Reads the older installation of the pair and applies every rule.
Run checkingRun(const Input& input);

// Reads its files into a schema manager.
Run ownReadingRun(const Input& input);

// The goals hold for real installations and from ten thousand definitions on.
bool hasCheckGoals(const Input& input);

}  // namespace bench

#endif  // LIBSCHEMA_BENCH_CHECKING_H
