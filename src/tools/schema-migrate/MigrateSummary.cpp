#include "MigrateSummary.h"

#include <algorithm>
#include <array>
#include <cstddef>
#include <numeric>
#include <string>
#include <string_view>
#include <unordered_map>
#include <utility>
#include <vector>

#include "DisplayText.h"
#include "Terminal.h"

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

struct Column {
  const char* title;
  std::size_t width;  // where there is room
  std::size_t (*value)(const Row& row);
};

std::size_t allOf(const Row& row) {
  return std::accumulate(row.written.begin(), row.written.end(), std::size_t{0});
}

constexpr std::size_t kNameWidth = 18;
constexpr std::array<Column, 7> kColumns = {{
    {"read OLD", 9, [](const Row& row) { return row.old; }},
    {"read NEW", 10, [](const Row& row) { return row.latest; }},
    {"kept", 9, [](const Row& row) { return row.written[kKept]; }},
    {"added", 9, [](const Row& row) { return row.written[kAdded]; }},
    {"replaced", 10, [](const Row& row) { return row.written[kReplaced]; }},
    {"merged", 9, [](const Row& row) { return row.written[kMerged]; }},
    {"written", 10, allOf},
}};

using Rows = std::vector<std::pair<std::string, Row>>;  // by what stands in the first column

std::string atRight(const std::string& text, std::size_t width) {
  return std::string(width > text.size() ? width - text.size() : 1, ' ') + text;
}

std::string asTable(const Rows& rows, const std::array<std::size_t, kColumns.size()>& widths) {
  std::string text = padded("File", kNameWidth);
  for (std::size_t i = 0; i < kColumns.size(); ++i) {
    text += atRight(kColumns[i].title, widths[i]);
  }
  text += "\n";
  for (const auto& [name, row] : rows) {
    text += padded(name, kNameWidth);
    for (std::size_t i = 0; i < kColumns.size(); ++i) {
      text += atRight(std::to_string(kColumns[i].value(row)), widths[i]);
    }
    text += "\n";
  }
  return text;
}

// A table in columns as wide as there is room for, or a line of words for each file.
std::string inWidth(const Rows& rows, std::size_t width) {
  std::array<std::size_t, kColumns.size()> widths{};
  for (std::size_t i = 0; i < kColumns.size(); ++i) {
    widths[i] = kColumns[i].width;
  }
  std::string text = asTable(rows, widths);
  if (text.find('\n') <= width) {
    return text;
  }
  for (std::size_t i = 0; i < kColumns.size(); ++i) {
    widths[i] = std::string_view(kColumns[i].title).size() + 1;
    for (const auto& [name, row] : rows) {
      widths[i] = std::max(widths[i], std::to_string(kColumns[i].value(row)).size() + 1);
    }
  }
  text = asTable(rows, widths);
  if (text.find('\n') <= width) {
    return text;
  }
  text.clear();
  for (const auto& [name, row] : rows) {
    std::string words;
    for (const Column& column : kColumns) {
      words += (words.empty() ? "" : ", ") + std::string(column.title) + " " +
               std::to_string(column.value(row));
    }
    text += name + "\n" + wrapped("  ", words, width);
  }
  return text;
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
  Rows shown;
  Row total;
  for (const char* const file : kShownOrder) {
    if (plan.old->hasFile(file) || result.hasFile(file)) {
      shown.emplace_back(file, rows[file]);
      total.add(rows[file]);
    }
  }
  shown.emplace_back("Total", total);
  return inWidth(shown, longestLine());
}

}  // namespace

std::string summaryOf(const MigrationPlan& plan, const std::vector<migration::NamedText>& result,
                      bool isInLibraryLayout) {
  if (!isInLibraryLayout) {
    return tableOf(plan, *plan.result);
  }
  return tableOf(plan, Installation::overTexts("result", result));
}
