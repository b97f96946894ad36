// Inputs that are made to cost much, each in a size and in four times that size: what they cost
// must grow no faster than nearly in proportion.

#ifndef LIBSCHEMA_BENCH_HOSTILE_H
#define LIBSCHEMA_BENCH_HOSTILE_H

#include <cstddef>
#include <functional>
#include <string>
#include <vector>

#include "Measure.h"

namespace bench {

constexpr double kGrowthGoal = 1.4;  // the exponent of n

struct HostileCase {
  std::string name;
  std::size_t size;  // the smaller of the two
  // Writes what the run of this size needs into the folder, and returns the run.
  std::function<Run(std::size_t size, const std::string& folder)> make;
};

const std::vector<HostileCase>& hostileCases();

}  // namespace bench

#endif  // LIBSCHEMA_BENCH_HOSTILE_H
