// schema-bench [--full] [--quick] [--no-growth] [--table FILE] [--once CONTENDER WORK INPUT]
//              [--examples FOLDER] [OLD NEW] [BENCHMARK OPTION...]
//
// Measures the library beside a peer and the floor program, the three in turn, round after round,
// in one run; the ratios are the medians of the rounds' ratios. OLD and NEW are the folders of a
// second pair beside the example. Before anything is measured the library and the floor must have
// written the same bytes and reports on every input.
//
// --once runs one work once in this process, without the others, for a profiler: CONTENDER is
// library, floor or peer; WORK a part of a work's name; INPUT example, real or a number.

#include <benchmark/benchmark.h>

#include <algorithm>
#include <cmath>
#include <cstdlib>
#include <fstream>
#include <iostream>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "Checking.h"
#include "Generator.h"
#include "Hostile.h"
#include "Inputs.h"
#include "Measure.h"
#include "Planning.h"
#include "Tables.h"
#include "Works.h"

// The same stamp in the files of the library and of the floor.
std::string getCurrentTimeStamp(int /*format*/) { return "2001-02-03 04:05:06"; }

namespace {

using bench::Input;
using bench::Origin;
using bench::Run;
using bench::Sample;
using bench::Work;

struct Options {
  bool isFull = false;
  bool isQuick = false;
  bool hasGrowth = true;
  std::string table;
  std::string examples = "examples";
  std::vector<std::string> once;
  std::vector<std::string> folders;
};

bool takeOption(const std::vector<std::string>& words, std::size_t* next, Options* options) {
  const std::string& word = words[*next];
  const std::size_t left = words.size() - *next - 1;
  if (word == "--full") {
    options->isFull = true;
  } else if (word == "--quick") {
    options->isQuick = true;
  } else if (word == "--no-growth") {
    options->hasGrowth = false;
  } else if (word == "--table" && left >= 1) {
    options->table = words[++*next];
  } else if (word == "--examples" && left >= 1) {
    options->examples = words[++*next];
  } else if (word == "--once" && left >= 3) {
    options->once = {words[*next + 1], words[*next + 2], words[*next + 3]};
    *next += 3;
  } else if (word.rfind("--", 0) != 0) {
    options->folders.push_back(word);
  } else {
    return false;
  }
  return true;
}

std::optional<Options> parse(int argc, char** argv) {
  const std::vector<std::string> words(argv + 1, argv + argc);
  Options options;
  for (std::size_t next = 0; next < words.size(); ++next) {
    if (!takeOption(words, &next, &options)) {
      return std::nullopt;
    }
  }
  if (options.folders.size() != 0 && options.folders.size() != 2) {
    return std::nullopt;
  }
  return options;
}

Input exampleInput(const Options& options) {
  const std::string& folder = options.examples;
  Input input = bench::makeInput("example", Origin::kExample, folder + "/old", folder + "/new");
  input.base = folder + "/base";
  input.excluded = folder + "/excluded-oids.txt";
  input.withdrawn = folder + "/withdraw-oids.txt";
  return input;
}

Input generatedInput(std::size_t count, const bench::TemporaryFolder& files) {
  const std::string name = std::to_string(count);
  const std::string older = files.folder(name + "/old");
  const std::string newer = files.folder(name + "/new");
  const std::string base = files.folder(name + "/base");
  if (!bench::generateSchemas(count, bench::kSeed, older, newer, base)) {
    throw std::runtime_error("cannot write the generated schemas");
  }
  Input input = bench::makeInput(name, Origin::kGenerated, older, newer);
  input.base = base;
  return input;
}

std::vector<std::size_t> sizesOf(const Options& options) {
  std::vector<std::size_t> sizes = {1000, 10000};
  if (!options.isQuick) {
    sizes.push_back(100000);
  }
  if (options.isFull) {
    sizes.push_back(1000000);
  }
  return sizes;
}

std::vector<Input> makeInputs(const Options& options, const bench::TemporaryFolder& files) {
  std::vector<Input> inputs;
  inputs.push_back(exampleInput(options));
  if (!options.folders.empty()) {
    inputs.push_back(
        bench::makeInput("real", Origin::kReal, options.folders[0], options.folders[1]));
  }
  for (const std::size_t count : sizesOf(options)) {
    inputs.push_back(generatedInput(count, files));
  }
  return inputs;
}

bool isHuge(const Input& input) { return input.olderFiles.definitions > 200000; }

int roundsOf(const Input& input, const Options& options) {
  return isHuge(input) ? 3 : options.isQuick ? 5 : input.olderFiles.definitions > 50000 ? 7 : 11;
}

// ---- One work on one input ----

struct Contender {
  Run run;
  int repetitions = 1;
  std::vector<double> seconds;
  std::vector<double> bytes;

  explicit Contender(Run toRun) : run(std::move(toRun)) {
    if (run) {
      repetitions = bench::repetitionsFor(run);
    }
  }

  void measure() {
    if (!run) {
      return;
    }
    const Sample sample = bench::measureInChild(run, repetitions);
    if (!sample.isComplete) {
      throw std::runtime_error("a measured process did not end well");
    }
    seconds.push_back(sample.seconds);
    bytes.push_back(sample.peakBytes);
  }
};

double medianRatio(const std::vector<double>& above, const std::vector<double>& below) {
  std::vector<double> ratios;
  for (std::size_t i = 0; i < above.size() && i < below.size(); ++i) {
    ratios.push_back(above[i] / below[i]);
  }
  return bench::median(ratios);
}

void measureWork(benchmark::State& state, const Work& work, const Input& input,
                 const std::string& output, bench::Results* results) {
  Contender library(work.library(input, output));
  Contender peer(work.peer ? work.peer(input, output) : Run());
  Contender floor(work.floor(input, output));
  for (auto _ : state) {
    library.measure();
    peer.measure();
    floor.measure();
    state.SetIterationTime(library.seconds.back());
  }
  bench::RatioRow row;
  row.work = work.name;
  row.input = input.name;
  row.seconds = bench::median(library.seconds);
  row.definitionsPerSecond = work.definitions(input) / row.seconds;
  row.bytesPerSecond = work.bytes(input) / row.seconds;
  row.toPeer = medianRatio(library.seconds, peer.seconds);
  row.peerGoal = work.peerGoal ? work.peerGoal(input) : 0;
  row.toFloor = medianRatio(library.seconds, floor.seconds);
  row.floorGoal = work.floorGoal ? work.floorGoal(input) : 0;
  state.counters["definitions/s"] = row.definitionsPerSecond;
  state.counters["bytes/s"] = row.bytesPerSecond;
  state.counters["library/libldap"] = row.toPeer;
  state.counters["library/floor"] = row.toFloor;
  results->ratios.push_back(row);
}

// Reading every file once, in children that do nothing else.
void measureMemory(benchmark::State& state, const Work& reading, const Input& input,
                   bench::Results* results) {
  Contender library(reading.library(input, ""));
  Contender floor(reading.floor(input, ""));
  library.repetitions = floor.repetitions = 0;
  for (auto _ : state) {
    library.measure();
    floor.measure();
    state.SetIterationTime(library.seconds.back());
  }
  const double definitions = reading.definitions(input);
  bench::MemoryRow row;
  row.input = input.name;
  row.library = bench::median(library.bytes) / definitions;
  row.floor = bench::median(floor.bytes) / definitions;
  row.ratio = row.library / row.floor;
  row.goal = input.olderFiles.definitions > 50000 && input.origin == Origin::kGenerated ? 1.1 : 0;
  state.counters["bytes/definition"] = row.library;
  state.counters["library/floor"] = row.ratio;
  results->memory.push_back(row);
}

// Time in repeated runs, memory in children that do it once. The inputs come in the order of their
// sizes; growth is from one generated one to the next.
void measureCheck(benchmark::State& state, const Input& input, bench::Results* results) {
  Contender checking(bench::checkingRun(input));
  Contender reading(bench::ownReadingRun(input));
  Contender checkingOnce(bench::checkingRun(input));
  Contender readingOnce(bench::ownReadingRun(input));
  checkingOnce.repetitions = readingOnce.repetitions = 0;
  for (auto _ : state) {
    checking.measure();
    reading.measure();
    checkingOnce.measure();
    readingOnce.measure();
    state.SetIterationTime(checking.seconds.back());
  }
  bench::CheckRow row;
  row.input = input.name;
  row.definitions = input.olderFiles.definitions;
  row.seconds = bench::median(checking.seconds);
  row.toReading = medianRatio(checking.seconds, reading.seconds);
  row.memoryToReading = medianRatio(checkingOnce.bytes, readingOnce.bytes);
  if (bench::hasCheckGoals(input)) {
    row.timeGoal = bench::kCheckTimeGoal;
    row.memoryGoal = bench::kCheckMemoryGoal;
  }
  if (input.origin == Origin::kGenerated && !results->checks.empty() &&
      bench::hasCheckGoals(input)) {
    const bench::CheckRow& before = results->checks.back();
    row.exponent =
        std::log(row.seconds / before.seconds) / std::log(row.definitions / before.definitions);
    row.growthGoal = bench::kCheckGrowthGoal;
  }
  state.counters["check/own reading"] = row.toReading;
  state.counters["memory/own reading"] = row.memoryToReading;
  results->checks.push_back(row);
}

// diff beside the library's reading of the three, or migrate beside the library's cycle.
void measurePlanning(benchmark::State& state, const bench::PlanningWork& work, const Input& input,
                     const std::string& output, bench::Results* results) {
  Contender planning(work.run(input, output));
  Contender own(work.own(input, output));
  for (auto _ : state) {
    planning.measure();
    own.measure();
    state.SetIterationTime(planning.seconds.back());
  }
  bench::PlanningRow row;
  row.work = work.name;
  row.input = input.name;
  row.definitions = input.olderFiles.definitions;
  row.seconds = bench::median(planning.seconds);
  row.toOwn = medianRatio(planning.seconds, own.seconds);
  row.goal = bench::hasCheckGoals(input) ? work.goal : 0;
  const bool isNext = !results->plans.empty() && results->plans.back().work == row.work;
  if (input.origin == Origin::kGenerated && bench::hasCheckGoals(input) && isNext) {
    const bench::PlanningRow& before = results->plans.back();
    row.exponent =
        std::log(row.seconds / before.seconds) / std::log(row.definitions / before.definitions);
    row.growthGoal = bench::kPlanningGrowthGoal;
  }
  state.counters["to the library's"] = row.toOwn;
  results->plans.push_back(row);
}

void measureGrowth(benchmark::State& state, const bench::HostileCase& hostile,
                   bench::Results* results) {
  const bench::TemporaryFolder files;
  Contender one(hostile.make(hostile.size, files.folder("one")));
  Contender four(hostile.make(4 * hostile.size, files.folder("four")));
  // As often as each other, so that neither finds the heap warmer.
  one.repetitions = four.repetitions = std::max(3, four.repetitions);
  for (auto _ : state) {
    one.measure();
    four.measure();
    state.SetIterationTime(four.seconds.back());
  }
  bench::GrowthRow row;
  row.name = hostile.name;
  row.size = hostile.size;
  row.seconds = bench::median(one.seconds);
  row.secondsOfFour = bench::median(four.seconds);
  row.exponent = std::log(medianRatio(four.seconds, one.seconds)) / std::log(4.0);
  row.goal = bench::kGrowthGoal;
  state.counters["exponent"] = row.exponent;
  results->growth.push_back(row);
}

// ---- The run ----

bool verifyAll(const std::vector<Input>& inputs, const bench::TemporaryFolder& files) {
  for (const Input& input : inputs) {
    // In a child: what it reads shall not make the processes that are measured larger.
    const Sample sample = bench::measureInChild(
        [&] {
          const std::string difference = bench::verify(input, files);
          if (!difference.empty()) {
            std::cerr << "The library and the others differ on " << input.name << ": " << difference
                      << '\n';
            std::exit(1);
          }
          return 0.0;
        },
        0);
    if (!sample.isComplete) {
      return false;
    }
  }
  return true;
}

template <typename Measure>
void add(const std::string& name, int rounds, Measure measure) {
  benchmark::RegisterBenchmark(name.c_str(), measure)
      ->UseManualTime()
      ->Iterations(rounds)
      ->Unit(benchmark::kMillisecond);
}

void addAll(const std::vector<Input>& inputs, const Options& options, const std::string& output,
            bench::Results* results) {
  for (const Work& work : bench::works()) {
    for (const Input& input : inputs) {
      if (work.isMeasuredOn && !work.isMeasuredOn(input)) {
        continue;
      }
      add(work.name + "/" + input.name, roundsOf(input, options),
          [&, output, results](benchmark::State& state) {
            measureWork(state, work, input, output, results);
          });
    }
  }
  const Work& reading = bench::works()[1];
  for (const Input& input : inputs) {
    if (input.olderFiles.definitions >= 1000) {
      add("peak memory/" + input.name, 3,
          [&, results](benchmark::State& state) { measureMemory(state, reading, input, results); });
    }
  }
  for (const Input& input : inputs) {
    add("check/" + input.name, roundsOf(input, options),
        [&, results](benchmark::State& state) { measureCheck(state, input, results); });
  }
  for (const bench::PlanningWork& work : bench::planningWorks()) {
    for (const Input& input : inputs) {
      if (!bench::mayBeMerged(input)) {
        continue;
      }
      add(work.name + "/" + input.name, roundsOf(input, options),
          [&, output, results](benchmark::State& state) {
            measurePlanning(state, work, input, output, results);
          });
    }
  }
  if (!options.hasGrowth) {
    return;
  }
  for (const bench::HostileCase& hostile : bench::hostileCases()) {
    add("growth/" + hostile.name, options.isQuick ? 3 : 7,
        [&, results](benchmark::State& state) { measureGrowth(state, hostile, results); });
  }
}

int runOnce(const Options& options) {
  const bench::TemporaryFolder files;
  const std::string& name = options.once[2];
  const Input input =
      name == "example" ? exampleInput(options)
      : name == "real"
          ? bench::makeInput(name, Origin::kReal, options.folders.at(0), options.folders.at(1))
          : generatedInput(std::strtoull(name.c_str(), nullptr, 10), files);
  for (const Work& work : bench::works()) {
    if (work.name.find(options.once[1]) != std::string::npos) {
      const Work::Maker& maker = options.once[0] == "library" ? work.library
                                 : options.once[0] == "floor" ? work.floor
                                                              : work.peer;
      std::cout << work.name << ": " << maker(input, files.folder("out"))() << " s\n";
      return 0;
    }
  }
  std::cerr << "schema-bench: no such work\n";
  return 2;
}

int runAll(const Options& options) {
  const bench::TemporaryFolder files;
  const std::vector<Input> inputs = makeInputs(options, files);
  if (!verifyAll(inputs, files)) {
    return 1;
  }
  bench::Results results;
  addAll(inputs, options, files.folder("out"), &results);
  benchmark::RunSpecifiedBenchmarks();
  if (options.table.empty()) {
    std::cout << bench::asMarkdown(results);
  } else {
    std::ofstream(options.table) << bench::asMarkdown(results);
  }
  return 0;
}

}  // namespace

int main(int argc, char** argv) {
  benchmark::Initialize(&argc, argv);
  const std::optional<Options> options = parse(argc, argv);
  if (!options) {
    std::cerr
        << "usage: schema-bench [--full] [--quick] [--no-growth] [--table FILE]\n"
           "                    [--examples FOLDER] [--once CONTENDER WORK INPUT] [OLD NEW]\n";
    return 2;
  }
  try {
    return options->once.empty() ? runAll(*options) : runOnce(*options);
  } catch (const std::exception& error) {
    std::cerr << "schema-bench: " << error.what() << '\n';
    return 1;
  }
}
