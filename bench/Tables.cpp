#include "Tables.h"

#include <cstdio>

namespace bench {

namespace {

// `format` takes one double.
std::string formatted(const char* format, double value) {
  char text[64];
  std::snprintf(text, sizeof text, format, value);
  return text;
}

std::string duration(double seconds) {
  return seconds >= 1      ? formatted("%.2f s", seconds)
         : seconds >= 1e-3 ? formatted("%.2f ms", seconds * 1e3)
                           : formatted("%.0f us", seconds * 1e6);
}

// Nothing where a work handles no definitions.
std::string rate(const char* format, double value) {
  return value == 0 ? "" : formatted(format, value);
}

std::string ratio(double value) { return value == 0 ? "" : formatted("%.2f", value); }

// "goal 1.3, met"; nothing without a goal.
std::string verdict(double value, double goal) {
  if (goal == 0 || value == 0) {
    return "";
  }
  return formatted("%.3g", goal) + (value <= goal ? ", met" : ", **not met**");
}

std::string line(const std::vector<std::string>& cells) {
  std::string text = "|";
  for (const std::string& cell : cells) {
    text += " " + cell + " |";
  }
  return text + "\n";
}

std::string rule(std::size_t textColumns, std::size_t numberColumns) {
  std::string text = "|";
  for (std::size_t i = 0; i < textColumns; ++i) {
    text += "---|";
  }
  for (std::size_t i = 0; i < numberColumns; ++i) {
    text += "---:|";
  }
  return text + "\n";
}

std::string ratios(const std::vector<RatioRow>& rows) {
  std::string text = line({"work", "input", "time", "definitions/s", "MB/s", "÷ libldap", "goal",
                           "÷ floor", "goal"}) +
                     rule(2, 7);
  for (const RatioRow& row : rows) {
    text += line({row.work, row.input, duration(row.seconds),
                  rate("%.0f", row.definitionsPerSecond), rate("%.1f", row.bytesPerSecond / 1e6),
                  ratio(row.toPeer), verdict(row.toPeer, row.peerGoal), ratio(row.toFloor),
                  verdict(row.toFloor, row.floorGoal)});
  }
  return text;
}

std::string memory(const std::vector<MemoryRow>& rows) {
  std::string text =
      line({"input", "library, bytes per definition", "floor", "ratio", "goal"}) + rule(1, 4);
  for (const MemoryRow& row : rows) {
    text += line({row.input, formatted("%.0f", row.library), formatted("%.0f", row.floor),
                  ratio(row.ratio), verdict(row.ratio, row.goal)});
  }
  return text;
}

std::string checks(const std::vector<CheckRow>& rows) {
  std::string text = line({"input", "time", "÷ own reading", "goal", "memory ÷ own reading", "goal",
                           "exponent", "goal"}) +
                     rule(1, 7);
  for (const CheckRow& row : rows) {
    text += line({row.input, duration(row.seconds), ratio(row.toReading),
                  verdict(row.toReading, row.timeGoal), ratio(row.memoryToReading),
                  verdict(row.memoryToReading, row.memoryGoal), ratio(row.exponent),
                  verdict(row.exponent, row.growthGoal)});
  }
  return text;
}

std::string plans(const std::vector<PlanningRow>& rows) {
  std::string text =
      line({"work", "input", "time", "÷ the library's", "goal", "exponent", "goal"}) + rule(2, 5);
  for (const PlanningRow& row : rows) {
    text += line({row.work, row.input, duration(row.seconds), ratio(row.toOwn),
                  verdict(row.toOwn, row.goal), ratio(row.exponent),
                  verdict(row.exponent, row.growthGoal)});
  }
  return text;
}

std::string growth(const std::vector<GrowthRow>& rows) {
  std::string text =
      line({"input", "K", "time at K", "time at 4K", "exponent", "goal"}) + rule(1, 5);
  for (const GrowthRow& row : rows) {
    text += line({row.name, std::to_string(row.size), duration(row.seconds),
                  duration(row.secondsOfFour), formatted("%.2f", row.exponent),
                  verdict(row.exponent, row.goal)});
  }
  return text;
}

}  // namespace

std::string asMarkdown(const Results& results) {
  std::string text;
  const auto section = [&](const char* title, const std::string& table, bool isEmpty) {
    if (!isEmpty) {
      text += (text.empty() ? "### " : "\n### ") + std::string(title) + "\n\n" + table;
    }
  };
  section("Ratios", ratios(results.ratios), results.ratios.empty());
  section("Peak memory", memory(results.memory), results.memory.empty());
  section("Checking an installation", checks(results.checks), results.checks.empty());
  section("Planning and migrating", plans(results.plans), results.plans.empty());
  section("Growth", growth(results.growth), results.growth.empty());
  return text;
}

}  // namespace bench
