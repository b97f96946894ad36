// What nothing but speed would show: how many system calls, foldings and comparisons of texts a
// work takes, and that the last two do not grow faster than the number of definitions.

#include <gtest/gtest.h>

#include <map>
#include <string>

#include "CSymbolTable.h"
#include "Installation.h"
#include "Machine.h"
#include "PlatformFunctions.h"
#include "SystemCalls.h"

using namespace support;
using platform::systemCallsOf;

namespace {

using Counts = std::map<std::string, int>;

// How much more often `mine` has each call than `other`, without those that are equal.
Counts differenceOf(Counts mine, const Counts& other) {
  for (const auto& [name, count] : other) {
    mine[name] -= count;
    if (mine[name] == 0) {
      mine.erase(name);
    }
  }
  return mine;
}

// ---- System calls ----

// Diagnostic files that are empty already are opened, looked at and closed, and that is all.
TEST(Cost, EmptyDiagnosticFilesTakeThreeCallsEach) {
  SKIP_UNLESS_MACHINE_CAN(kTraceProcesses);
  Installation installation;
  installation.read("V3.user.at", "");  // makes them, and empties them
  installation.write("V3.other", "");
  const auto reading = [&](const char* file) {
    return systemCallsOf([&] { installation->readFile(file); });
  };
  EXPECT_EQ(differenceOf(reading("V3.user.at"), reading("V3.other")),
            (Counts{{"close", 4}, {"open", 4}, {"stat", 4}}));
}

// The failure of an attribute type fills two of them, and the next reading empties these.
TEST(Cost, OnlyDiagnosticFilesWithTextAreEmptied) {
  SKIP_UNLESS_MACHINE_CAN(kTraceProcesses);
  Installation installation;
  EXPECT_EQ(installation.read("V3.user.at", "attributetypes=( 1.1 NAME 'a' DESC 'd'\n"), 1);
  installation.write("V3.user.at", "");
  const auto reading = [&] { return systemCallsOf([&] { installation->readFile("V3.user.at"); }); };
  const Counts afterFailure = reading();
  EXPECT_EQ(differenceOf(afterFailure, reading()), (Counts{{"truncate", 2}}));
}

TEST(Cost, WritingTakesOneCallForEach128KiB) {
  SKIP_UNLESS_MACHINE_CAN(kTraceProcesses);
  constexpr std::size_t kPiece = 128 * 1024;
  std::string text;
  for (int number = 0; number < 6000; ++number) {
    text += attributeType("1." + std::to_string(number), "a" + std::to_string(number));
  }
  Installation installation{{"V3.user.at", text}};
  const std::size_t written = writtenFile(installation.manager(), "V3.user.at").size();
  ASSERT_GT(written, 3 * kPiece);
  const Counts counts =
      systemCallsOf([&] { installation->writeFile(installation.path(), "V3.user.at"); });
  EXPECT_EQ(counts.at("write"), static_cast<int>(written / kPiece) + 1);
}

// ---- Foldings and comparisons ----

// Attribute types, object classes and vendor extensions, which come in an order that is no table's.
std::string scattered(int count, const std::string& description) {
  std::string text;
  for (int i = 0; i < count; ++i) {
    const std::string number = std::to_string(100000 + i * 7919 % count);
    const std::string name = "Some-Name-" + number;
    text += attributeType("1.3.6.1.4.1.32473.1." + number, name, description) +
            vendorExtension("1.3.6.1.4.1.32473.1." + number, description) +
            objectClass("1.3.6.1.4.1.32473.2." + number, name, description);
  }
  return text;
}

struct Costs {
  double foldings;
  double comparisons;
};

template <typename Action>
Costs costsOf(int count, Action action) {
  const long foldings = platform::foldings();
  const long comparisons = platform::comparisons();
  action();
  return {static_cast<double>(platform::foldings() - foldings),
          static_cast<double>(platform::comparisons() - comparisons) / count};
}

constexpr int kFew = 128;
constexpr int kMany = 4096;

// The entries are made in the order of the tables: a definition more does not make the others
// dearer.
TEST(Cost, ReadingComparesAsOftenForEachDefinition) {
  const auto reading = [](int count) {
    const std::string text = scattered(count, "text");
    Installation installation;
    installation.write("V3.user.at", text);
    return costsOf(count, [&] { EXPECT_EQ(installation->readFile("V3.user.at"), 0); });
  };
  EXPECT_LT(reading(kMany).comparisons, reading(kFew).comparisons + 2);
}

// The tables are walked side by side, and a table of the characters serves for the names.
TEST(Cost, ComparisonFoldsNoNameAndComparesAsOftenForEachDefinition) {
  const auto comparison = [](int count) {
    Installation installation{{"V3.user.at", scattered(count, "text")}};
    Installation reference{{"V3.user.at", scattered(count, "other")}};
    return costsOf(count, [&] { EXPECT_TRUE(installation->compSchemas(reference.manager())); });
  };
  const Costs few = comparison(kFew);
  const Costs many = comparison(kMany);
  EXPECT_EQ(many.foldings, few.foldings);
  EXPECT_LT(many.comparisons, few.comparisons + 1);
}

TEST(Cost, WritingComparesAsOftenForEachDefinition) {
  const auto writing = [](int count) {
    Installation installation{{"V3.user.at", scattered(count, "text")}};
    return costsOf(
        count, [&] { EXPECT_EQ(installation->writeFile(installation.path(), "V3.user.at"), 0); });
  };
  EXPECT_LT(writing(kMany).comparisons, writing(kFew).comparisons + 1);
}

// The texts of a table are spread: a look-up compares a few of them, however many are as long.
TEST(CSymbolTable, LookUpComparesFewTexts) {
  constexpr int kTexts = 64;
  CSymbolTable table;
  for (int i = 0; i < kTexts; ++i) {
    table.insertValue("word-" + std::to_string(100 + i), i, true);
  }
  const auto lookUps = [&] {
    for (int i = 0; i < kTexts; ++i) {
      EXPECT_EQ(table.lookUpValue("word-" + std::to_string(100 + i)), i);
    }
  };
  EXPECT_LT(costsOf(kTexts, lookUps).comparisons, 6);
}

}  // namespace
