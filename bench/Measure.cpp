#include "Measure.h"

#include <malloc.h>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <ctime>
#include <fstream>

namespace bench {

namespace {

// What the parent had in memory, and gave back, takes no part in what follows.
void forgetPeak() {
  ::malloc_trim(0);
  std::ofstream("/proc/self/clear_refs") << "5";
}

double largestResidentBytes() {
  rusage usage{};
  getrusage(RUSAGE_SELF, &usage);
  return static_cast<double>(usage.ru_maxrss) * 1024;
}

Sample measureHere(const Run& run, int repetitions) {
  Sample sample;
  forgetPeak();
  const double before = largestResidentBytes();
  if (repetitions > 0) {
    run();
  }
  for (int i = 0; i < repetitions; ++i) {
    sample.seconds += run();
  }
  if (repetitions > 0) {
    sample.seconds /= repetitions;
  } else {
    sample.seconds = run();
  }
  sample.peakBytes = largestResidentBytes() - before;
  sample.isComplete = true;
  return sample;
}

}  // namespace

double cpuSeconds() {
  timespec now{};
  clock_gettime(CLOCK_PROCESS_CPUTIME_ID, &now);
  return static_cast<double>(now.tv_sec) + static_cast<double>(now.tv_nsec) * 1e-9;
}

Sample measureInChild(const Run& run, int repetitions) {
  Sample sample;
  int ends[2];
  if (::pipe(ends) != 0) {
    return sample;
  }
  const pid_t child = ::fork();
  if (child == 0) {
    const Sample result = measureHere(run, repetitions);
    const bool isSent = ::write(ends[1], &result, sizeof result) == sizeof result;
    ::_exit(isSent ? 0 : 1);
  }
  ::close(ends[1]);
  Sample received;
  if (child > 0 && ::read(ends[0], &received, sizeof received) == sizeof received) {
    sample = received;
  }
  ::close(ends[0]);
  int status = 0;
  if (child > 0 && (::waitpid(child, &status, 0) != child || status != 0)) {
    sample.isComplete = false;
  }
  return sample;
}

int repetitionsFor(const Run& run) {
  constexpr double kEnough = 0.03;
  constexpr double kMost = 100;
  const double seconds = measureInChild(run, 0).seconds;
  return seconds <= 0 ? 1 : static_cast<int>(std::clamp(kEnough / seconds, 1.0, kMost));
}

double median(std::vector<double> values) {
  if (values.empty()) {
    return 0;
  }
  std::sort(values.begin(), values.end());
  const std::size_t middle = values.size() / 2;
  return values.size() % 2 != 0 ? values[middle] : (values[middle - 1] + values[middle]) / 2;
}

}  // namespace bench
