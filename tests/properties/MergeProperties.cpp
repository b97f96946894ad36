// Properties of a merge, over generated pairs of directories.

#include <gtest/gtest.h>

#include <algorithm>
#include <cstddef>
#include <set>
#include <string>

#include "Pairs.h"
#include "Rules.h"

namespace {

using properties::differenceOf;
using properties::fileOf;
using properties::forAnyPairs;
using properties::forConsistentPairs;
using properties::forEachTable;
using properties::ManagerGroup;
using properties::Pair;
using properties::sizeOf;
using properties::State;
using properties::stateOf;

// Between definitions that fit together: where a name stands under several OIDs, an OID under
// several names, or a name is spelled like an OID, other definitions are replaced than the one with
// the name, and an OID index can go on with what it has. The rules for those are in OperationsTest.
TEST(Merge, EveryDefinitionOfTheSourceIsFoundByNameAndOid) {
  std::size_t replaced = 0;
  std::size_t added = 0;
  forConsistentPairs([&](const Pair& pair) {
    ManagerGroup group(pair.folder);
    SchemaManager* const self = group.read(pair.first);
    SchemaManager* const source = group.read(pair.second);
    const State mine = stateOf(*self);
    const State theirs = stateOf(*source);
    ASSERT_TRUE(self->mergeSchemas(source));
    const State after = stateOf(*self);
    for (const auto& [name, definition] : theirs.attrTable) {
      ASSERT_EQ(after.attrTable.at(name), definition);
      ASSERT_EQ(after.attrOidTable.at(definition->getOid()), definition);
      ASSERT_EQ(self->getAttr(name).attrsEqual(*definition), 1);
      ASSERT_EQ(self->getAttr(definition->getOid()).attrsEqual(*definition), 1);
    }
    for (const auto& [name, definition] : theirs.ocTable) {
      ASSERT_EQ(after.ocTable.at(name), definition);
      ASSERT_EQ(after.ocOidTable.at(definition->getOid()), definition);
      ASSERT_TRUE(self->getObjClass(name).objsEqual(*definition));
      ASSERT_TRUE(self->getObjClass(definition->getOid()).objsEqual(*definition));
    }
    for (const auto& [oid, definition] : theirs.orvAttrTable) {
      ASSERT_EQ(after.orvAttrTable.at(oid), definition);
      ASSERT_TRUE(self->getORVAttr(oid).orvAttrsEqual(*definition));
    }
    forEachTable([&](auto table) {
      for (const auto& [key, definition] : mine.*table) {
        if ((theirs.*table).count(key) == 0) {
          ASSERT_EQ((after.*table).at(key), definition);
        }
      }
      for (const auto& entry : theirs.*table) {
        ++((mine.*table).count(entry.first) != 0 ? replaced : added);
      }
    });
  });
  EXPECT_GT(replaced, properties::kPairs);
  EXPECT_GT(added, properties::kPairs);
}

// A definition that is new joins the set of the first file in which the source lists its OID. One
// that replaces another leaves the sets as they are.
TEST(Merge, TheFileSetsHoldTheOidsOfTheSource) {
  forConsistentPairs([](const Pair& pair) {
    ManagerGroup group(pair.folder);
    SchemaManager* const self = group.read(pair.first);
    SchemaManager* const source = group.read(pair.second);
    State expected = stateOf(*self);
    const State theirs = stateOf(*source);
    ASSERT_TRUE(self->mergeSchemas(source));
    const State after = stateOf(*self);
    const State mine = expected;
    forEachTable([&](auto table) {
      for (const auto& [key, definition] : theirs.*table) {
        if ((mine.*table).count(key) == 0) {
          expected.fileSets[fileOf(theirs, definition->getOid())].insert(definition->getOid());
        }
      }
    });
    ASSERT_EQ(after.fileSets, expected.fileSets);
    for (const auto& oids : theirs.fileSets) {
      for (const std::string& oid : oids) {
        ASSERT_LT(fileOf(after, oid), after.fileSets.size()) << oid;
      }
    }
    ASSERT_EQ(after.modSchemaOids, mine.modSchemaOids);
    ASSERT_EQ(after.excludedOids, mine.excludedOids);
  });
}

// Of its OID indexes the source loses the OIDs of what was moved; its sets stay whole.
TEST(Merge, TheSourceLosesItsDefinitionsAndNothingElse) {
  std::size_t merged = 0;
  forAnyPairs([&](const Pair& pair) {
    ManagerGroup group(pair.folder);
    SchemaManager* const self = group.read(pair.first);
    SchemaManager* const source = group.read(pair.second);
    source->readExcludedOids(group.writeList(properties::anyOidList(pair.choices)));
    State expected = stateOf(*source);
    if (!self->mergeSchemas(source)) {
      return;
    }
    merged += sizeOf(expected);
    for (const auto& entry : expected.attrTable) {
      expected.attrOidTable.erase(entry.second->getOid());
    }
    for (const auto& entry : expected.ocTable) {
      expected.ocOidTable.erase(entry.second->getOid());
    }
    expected.attrTable.clear();
    expected.ocTable.clear();
    expected.orvAttrTable.clear();
    ASSERT_EQ(differenceOf(expected, stateOf(*source)), "");
  });
  EXPECT_GT(merged, properties::kPairs);
}

// The passes before the failing one have moved what they move.
TEST(Merge, AFailingPassAndThoseBehindItLeaveTheSourceAsItWas) {
  std::set<std::string> failing;
  forAnyPairs([&](const Pair& pair) {
    ManagerGroup group(pair.folder);
    SchemaManager* const self = group.read(pair.first);
    SchemaManager* const source = group.read(pair.second);
    State expected = stateOf(*source);
    if (self->mergeSchemas(source)) {
      return;
    }
    const State after = stateOf(*source);
    if (!after.attrTable.empty()) {
      failing.insert("attribute types");
    } else {
      for (const auto& entry : expected.attrTable) {
        expected.attrOidTable.erase(entry.second->getOid());
      }
      expected.attrTable.clear();
      if (!after.orvAttrTable.empty()) {
        failing.insert("vendor extensions");
      } else {
        expected.orvAttrTable.clear();
        failing.insert("object classes");
      }
    }
    ASSERT_EQ(differenceOf(expected, after), "");
  });
  EXPECT_EQ(failing.size(), 3U);
}

// Merging what a comparison left brings a set up to the other one: nothing of that differs any
// more. The merge fails exactly when the comparison dropped an attribute type, with the last place
// of its OID in a file, and kept its vendor extension, which the target lacks.
TEST(Merge, OfWhatAComparisonLeftLeavesNoDifference) {
  std::size_t merged = 0;
  std::size_t failed = 0;
  forConsistentPairs([&](const Pair& pair) {
    ManagerGroup group(pair.folder);
    SchemaManager* const customised = group.read(pair.first);
    SchemaManager* const whole = group.read(pair.first);
    SchemaManager* const target = group.read(pair.second);
    ASSERT_TRUE(customised->compSchemas(target));
    const State left = stateOf(*customised);
    const State there = stateOf(*target);
    bool haveFiles = true;
    for (const auto& entry : left.orvAttrTable) {
      haveFiles = haveFiles && (there.orvAttrTable.count(entry.first) != 0 ||
                                fileOf(left, entry.first) != left.fileSets.size());
    }
    ASSERT_EQ(target->mergeSchemas(customised), haveFiles);
    ++(haveFiles ? merged : failed);
    if (haveFiles) {
      ASSERT_TRUE(whole->compSchemas(target));
      ASSERT_EQ(sizeOf(stateOf(*whole)), 0U);
    }
  });
  EXPECT_GT(merged, 100U);
  EXPECT_GT(failed, 10U);
}

}  // namespace
