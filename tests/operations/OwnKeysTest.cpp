// A manager owns its keys: after a merge that failed, and the end of one of the two managers, the
// other one still finds and writes what is its own.

#include <gtest/gtest.h>

#include <optional>
#include <ostream>
#include <string>
#include <vector>

#include "Files.h"
#include "Installation.h"

using namespace support;

namespace {

// Definitions of the three kinds under long OIDs and names: those of even and of odd numbers take
// turns in the order of every table. The merge fails in the middle.
constexpr int kCount = 60;
constexpr int kMiddle = 30;

std::string oidOf(int number) { return "1.3.6.1.4.1.32473.17.29." + std::to_string(100 + number); }
std::string nameOf(int number) { return "nameOfSomeLength" + std::to_string(100 + number); }

std::string definitionsFrom(int first) {
  std::string text;
  for (int number = first; number < kCount; number += 2) {
    text += attributeType(oidOf(number), nameOf(number)) + vendorExtension(oidOf(number)) +
            objectClass(oidOf(number) + ".7", nameOf(number));
  }
  return text;
}

// What a manager finds of the definitions from a number on, and what it writes of them.
std::string foundFrom(int first, SchemaManager* manager) {
  std::string found;
  std::vector<std::string> oids;
  for (int number = first; number < kCount; number += 2) {
    const std::string oid = oidOf(number);
    found += attributeUnder(manager, oid) + " " + attributeUnder(manager, nameOf(number)) + " " +
             objectClassUnder(manager, oid + ".7") + " " + extensionUnder(manager, oid) + "\n";
    oids.push_back(oid);
    oids.push_back(oid + ".7");
  }
  return found + writtenFor(manager, oids);
}

// A pass, and a definition in the middle of it that belongs to no file set.
struct FailingPass {
  const char* name;
  std::string definition;
};

void PrintTo(const FailingPass& pass, std::ostream* out) { *out << pass.name; }

const FailingPass kFailingPasses[] = {
    {"AttributeTypes", attributeType(oidOf(kMiddle) + ".1", nameOf(kMiddle) + "1")},
    {"VendorExtensions", vendorExtension(oidOf(kMiddle) + ".1")},
    {"ObjectClasses", objectClass(oidOf(kMiddle) + ".1", nameOf(kMiddle) + "1")},
};

class OwnKeys : public testing::TestWithParam<FailingPass> {
 protected:
  OwnKeys() {
    target->read("V3.system.at", definitionsFrom(0));
    source->read("V3.user.at", definitionsFrom(1));
    source->read("V3.config.at", GetParam().definition);
    EXPECT_FALSE((*target)->mergeSchemas(source->manager()));
  }

  std::optional<Installation> target{std::in_place};
  std::optional<Installation> source{std::in_place};
};

TEST_P(OwnKeys, TargetGoesOnWithoutTheSource) {
  const std::string before = foundFrom(0, target->manager());
  source.reset();
  EXPECT_EQ(foundFrom(0, target->manager()), before);
  target->keepForGood();
}

// What the pass had not reached, and what later passes would have moved, is the source's own.
TEST_P(OwnKeys, SourceGoesOnWithoutTheTarget) {
  const std::string before = foundFrom(kMiddle + 1, source->manager());
  target.reset();
  EXPECT_EQ(foundFrom(kMiddle + 1, source->manager()), before);
  source->keepForGood();
}

INSTANTIATE_TEST_SUITE_P(FailingIn, OwnKeys, testing::ValuesIn(kFailingPasses),
                         [](const auto& row) { return std::string(row.param.name); });

}  // namespace
