// The works that are measured, written once for the library's manager and for the floor's.

#ifndef LIBSCHEMA_BENCH_WORKS_H
#define LIBSCHEMA_BENCH_WORKS_H

#include <functional>
#include <string>
#include <vector>

#include "Inputs.h"
#include "Measure.h"

namespace bench {

// One row of the table: a work, who does it, and what is to be reached.
struct Work {
  std::string name;
  // Each gives the run of a contender on an input; `output` is a folder to write to. The peer's is
  // empty when it has no part in the work.
  using Maker = std::function<Run(const Input&, const std::string& output)>;
  Maker library;
  Maker floor;
  Maker peer;
  std::function<bool(const Input&)> isMeasuredOn;  // empty: on every input
  // At most so much of the other's time; 0, or empty, for no goal.
  std::function<double(const Input&)> floorGoal;
  std::function<double(const Input&)> peerGoal;
  // What one run handles, for the rates.
  std::function<double(const Input&)> definitions;
  std::function<double(const Input&)> bytes;
};

const std::vector<Work>& works();

// The example holds definitions that belong to no file of those that the library writes.
bool mayBeMerged(const Input& input);

// Runs every operation with the library and with the floor on the input and compares all that they
// write and report. Returns "" when nothing differs, or what differs first. `folder` is for the
// files. The peer is held to have met every definition and to have refused none.
std::string verify(const Input& input, const TemporaryFolder& folder);

}  // namespace bench

#endif  // LIBSCHEMA_BENCH_WORKS_H
