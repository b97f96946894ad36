#include "MigrateSummary.h"

#include <algorithm>
#include <array>
#include <cstddef>
#include <unordered_map>

namespace {

using migration::Entry;
using migration::Installation;
using migration::MigrationPlan;
using migration::Outcome;
using migration::Verdict;

// As an administrator knows the files: the server's first, then the vendor's, then the user's.
constexpr std::array<const char*, 9> kShownOrder = {
    "V3.system.at", "V3.system.oc",      "V3.orv.at",    "V3.orv.oc",   "V3.user.at",
    "V3.user.oc",   "V3.modifiedschema", "V3.config.at", "V3.config.oc"};

enum Origin : std::size_t { kKept, kAdded, kReplaced, kMerged, kOrigins };

Origin originOf(const Verdict& row) {
  if (row.outcome == Outcome::kMerged) {
    return kMerged;
  }
  return !row.isCarried() ? kKept : row.match.latest == nullptr ? kAdded : kReplaced;
}

std::string idOf(migration::Kind kind, const std::string& oid) {
  return static_cast<char>('0' + static_cast<int>(kind)) + oid;
}

struct Row {
  std::size_t old = 0;
  std::size_t latest = 0;
  std::array<std::size_t, kOrigins> written{};

  void add(const Row& other) {
    old += other.old;
    latest += other.latest;
    for (std::size_t origin = 0; origin < kOrigins; ++origin) {
      written[origin] += other.written[origin];
    }
  }
};

std::string column(std::size_t number, std::size_t width) {
  const std::string text = std::to_string(number);
  return std::string(width > text.size() ? width - text.size() : 1, ' ') + text;
}

std::string formatted(std::string name, const Row& row) {
  constexpr std::size_t kNameWidth = 18;
  name.resize(std::max(name.size(), kNameWidth), ' ');
  std::size_t all = 0;
  for (const std::size_t count : row.written) {
    all += count;
  }
  return name + column(row.old, 9) + column(row.latest, 10) + column(row.written[kKept], 9) +
         column(row.written[kAdded], 9) + column(row.written[kReplaced], 10) +
         column(row.written[kMerged], 9) + column(all, 10) + "\n";
}

std::string tableOf(const MigrationPlan& plan, const Installation& result) {
  std::unordered_map<std::string, Origin> origins;
  for (const Verdict& row : plan.threeWay.differences) {
    if (row.isInResult()) {
      origins[idOf(row.kind(), row.isCarried() ? row.result->oid()
                                               : row.match.latest->kept->object->oidInPlace())] =
          originOf(row);
    }
  }
  std::unordered_map<std::string, Row> rows;
  for (const Entry& entry : plan.old->entries()) {
    ++rows[entry.file->name].old;
  }
  for (const Entry& entry : plan.latest->entries()) {
    ++rows[entry.file->name].latest;
  }
  for (const Entry& entry : result.entries()) {
    ++rows[entry.file->name].written[origins[idOf(entry.kind(), entry.kept->object->oidInPlace())]];
  }
  std::string text =
      "File               read OLD  read NEW     kept    added  replaced   merged   written\n";
  Row total;
  for (const char* const file : kShownOrder) {
    if (plan.old->hasFile(file) || result.hasFile(file)) {
      text += formatted(file, rows[file]);
      total.add(rows[file]);
    }
  }
  return text + formatted("Total", total);
}

}  // namespace

std::string summaryOf(const MigrationPlan& plan, const std::vector<migration::NamedText>& result,
                      bool isInLibraryLayout) {
  if (!isInLibraryLayout) {
    return tableOf(plan, *plan.result);
  }
  migration::Failures failures;
  return tableOf(
      plan, Installation::fromTexts("result", result, migration::ReadLimits::none(), &failures));
}
