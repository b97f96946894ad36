#include "Report.h"

#include <algorithm>
#include <array>
#include <cstddef>
#include <cstdint>

#include "Messages.h"
#include "SchemaFiles.h"

namespace {

// As an administrator knows the files: the server's first, then the vendor's, then the user's.
constexpr std::array<std::size_t, 9> kShownOrder = {5, 4, 3, 2, 1, 0, 6, 7, 8};

struct Row {
  std::uint64_t readOld = 0;
  std::uint64_t readNew = 0;
  std::uint64_t kept = 0;
  std::uint64_t added = 0;
  std::uint64_t replaced = 0;
};

Row rowOf(std::size_t file, const Inventory& oldOne, const Inventory& newOne, Plan* plan) {
  Row row;
  row.readOld = oldOne.countOf(file);
  row.readNew = newOne.countOf(file);
  if (file >= kWrittenFiles) {
    row.kept = row.readNew;
    return row;
  }
  for (const Definition* const definition : plan->contents(file)) {
    switch (plan->fateOf(*definition)) {
      case Fate::kAdded:
        ++row.added;
        break;
      case Fate::kReplaces:
        ++row.replaced;
        break;
      default:
        ++row.kept;
    }
  }
  return row;
}

std::string column(std::uint64_t number, std::size_t width) {
  const std::string text = std::to_string(number);
  return std::string(width > text.size() ? width - text.size() : 1, ' ') + text;
}

std::string formatted(std::string name, const Row& row) {
  constexpr std::size_t kNameWidth = 18;
  name.resize(std::max(name.size(), kNameWidth), ' ');
  return name + column(row.readOld, 9) + column(row.readNew, 10) + column(row.kept, 9) +
         column(row.added, 9) + column(row.replaced, 10) +
         column(row.kept + row.added + row.replaced, 10) + "\n";
}

void addTo(Row* total, const Row& row) {
  total->readOld += row.readOld;
  total->readNew += row.readNew;
  total->kept += row.kept;
  total->added += row.added;
  total->replaced += row.replaced;
}

std::string tableOf(const Inventory& oldOne, const Inventory& newOne, Plan* plan) {
  std::string text =
      "File               read OLD  read NEW     kept    added  replaced   written\n";
  Row total;
  for (const std::size_t file : kShownOrder) {
    const Row row = rowOf(file, oldOne, newOne, plan);
    if (file < kWrittenFiles || newOne.hasFile(file)) {
      text += formatted(kSchemaFiles[file], row);
    } else if (oldOne.hasFile(file)) {
      text += formatted(std::string(kSchemaFiles[file]) + " (*)", row);
    }
    addTo(&total, row);
  }
  return text + formatted("Total", total);
}

std::string balanceOf(const Inventory& oldOne, const Balance& balance) {
  std::string text = "Of OLD's " + counted(oldOne.definitions().size(), "definition") + ":\n";
  const auto add = [&text](std::uint64_t count, const char* what) {
    if (count != 0) {
      text += "  " + std::to_string(count) + " " + what + "\n";
    }
  };
  add(balance.same, "the same in NEW");
  add(balance.added, "added to NEW's");
  add(balance.replacing, "in the place of NEW's");
  add(balance.excluded, "excluded");
  add(balance.withdrawn, "withdrawn");
  add(balance.repeated, "repeated, or superseded by V3.modifiedschema");
  add(balance.notCarried, "lost; see the warnings");
  return text;
}

}  // namespace

std::string summaryOf(const Inventory& oldOne, const Inventory& newOne, Plan* plan) {
  std::string text = tableOf(oldOne, newOne, plan);
  for (std::size_t file = kWrittenFiles; file < kSchemaFiles.size(); ++file) {
    if (newOne.hasFile(file)) {
      text += std::string(kSchemaFiles[file]) + " is NEW's, unchanged.\n";
    } else if (oldOne.hasFile(file)) {
      text +=
          "(*) NEW has no " + std::string(kSchemaFiles[file]) + ", and so the output has none.\n";
    }
  }
  return text + balanceOf(oldOne, plan->balance());
}
