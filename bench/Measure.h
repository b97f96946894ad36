// Measuring: each piece of work runs in a process of its own, so that none finds the heap as
// another has left it, and memory that an operation never gives back does not pile up.

#ifndef LIBSCHEMA_BENCH_MEASURE_H
#define LIBSCHEMA_BENCH_MEASURE_H

#include <functional>
#include <vector>

namespace bench {

struct Sample {
  double seconds = 0;       // CPU time, user and system, of one run
  double peakBytes = 0;     // growth of the largest resident size over the whole child
  bool isComplete = false;  // false when the child did not end well
};

// The CPU time of this process so far, in seconds.
double cpuSeconds();

// The CPU time that `action` takes. Not inlined: a profiler collects inside it only.
template <typename Action>
__attribute__((noinline)) double secondsOf(Action action) {
  const double start = cpuSeconds();
  action();
  return cpuSeconds() - start;
}

// One run of a work: prepares, does the work, cleans up, and returns the seconds of the work alone.
using Run = std::function<double()>;

// Runs it in a child process: once when `repetitions` is 0, or else once unmeasured and then
// `repetitions` times in the same memory, with the mean as the result.
Sample measureInChild(const Run& run, int repetitions);

// How many repetitions in a child make a measurable time.
int repetitionsFor(const Run& run);

double median(std::vector<double> values);

}  // namespace bench

#endif  // LIBSCHEMA_BENCH_MEASURE_H
