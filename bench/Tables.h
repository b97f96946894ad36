// The results as tables in Markdown.

#ifndef LIBSCHEMA_BENCH_TABLES_H
#define LIBSCHEMA_BENCH_TABLES_H

#include <string>
#include <vector>

namespace bench {

// One work on one input.
struct RatioRow {
  std::string work;
  std::string input;
  double seconds = 0;  // the library's
  double definitionsPerSecond = 0;
  double bytesPerSecond = 0;
  double toPeer = 0;  // library / libldap; 0: no part in the work
  double peerGoal = 0;
  double toFloor = 0;
  double floorGoal = 0;
};

struct MemoryRow {
  std::string input;
  double library = 0;  // bytes per definition
  double floor = 0;
  double ratio = 0;
  double goal = 0;
};

struct GrowthRow {
  std::string name;
  std::size_t size = 0;
  double seconds = 0;
  double secondsOfFour = 0;
  double exponent = 0;
  double goal = 0;
};

// Checking an installation beside the library's own reading of it.
struct CheckRow {
  std::string input;
  double definitions = 0;
  double seconds = 0;
  double toReading = 0;
  double timeGoal = 0;
  double memoryToReading = 0;
  double memoryGoal = 0;
  double exponent = 0;  // from the row before it on; 0 without one
  double growthGoal = 0;
};

// A plan, or a migration by one, beside what the library does of it.
struct PlanningRow {
  std::string work;
  std::string input;
  double definitions = 0;
  double seconds = 0;
  double toOwn = 0;
  double goal = 0;
  double exponent = 0;  // from the row before it on; 0 without one
  double growthGoal = 0;
};

struct Results {
  std::vector<RatioRow> ratios;
  std::vector<MemoryRow> memory;
  std::vector<CheckRow> checks;
  std::vector<PlanningRow> plans;
  std::vector<GrowthRow> growth;
};

std::string asMarkdown(const Results& results);

}  // namespace bench

#endif  // LIBSCHEMA_BENCH_TABLES_H
