// Properties of a collision check, over generated pairs of directories.

#include <gtest/gtest.h>

#include <cstddef>
#include <string>

#include "Pairs.h"

namespace {

using properties::differenceOf;
using properties::forAnyPairs;
using properties::forEachTable;
using properties::ManagerGroup;
using properties::Pair;
using properties::sizeOf;
using properties::State;
using properties::stateOf;

bool isKeyOf(const State& state, const std::string& oid) {
  return state.attrTable.count(oid) != 0 || state.ocTable.count(oid) != 0 ||
         state.orvAttrTable.count(oid) != 0;
}

// Both sides see a name that both have (for vendor extensions: an OID). What one side alone sees is
// a definition whose OID is a key in the other set: a vendor extension's, or a name spelled like
// it.
TEST(Collisions, AreSymmetricUnderASharedKey) {
  std::size_t shared = 0;
  std::size_t oneSided = 0;
  forAnyPairs([&](const Pair& pair) {
    ManagerGroup group(pair.folder);
    SchemaManager* const first = group.read(pair.first);
    SchemaManager* const second = group.read(pair.second);
    SchemaManager* const firstAgain = group.read(pair.first);
    SchemaManager* const secondAgain = group.read(pair.second);
    const State firstBefore = stateOf(*first);
    const State secondBefore = stateOf(*second);
    ASSERT_TRUE(first->checkCollisions(secondAgain));
    ASSERT_TRUE(second->checkCollisions(firstAgain));
    const State firstAfter = stateOf(*first);
    const State secondAfter = stateOf(*second);
    forEachTable([&](auto table) {
      for (const auto& [key, definition] : firstBefore.*table) {
        const bool isShared = (secondBefore.*table).count(key) != 0;
        const bool isSeen = (firstAfter.*table).count(key) != 0;
        ASSERT_EQ(isSeen, isShared || isKeyOf(secondBefore, definition->getOid())) << key;
        ASSERT_EQ((secondAfter.*table).count(key), isShared ? 1U : 0U) << key;
        shared += isShared ? 1 : 0;
        oneSided += isSeen && !isShared ? 1 : 0;
      }
    });
  });
  EXPECT_GT(shared, properties::kPairs);
  EXPECT_GT(oneSided, 50U);
}

TEST(Collisions, WithAnEmptyReferenceThereAreNone) {
  forAnyPairs([](const Pair& pair) {
    ManagerGroup group(pair.folder);
    SchemaManager* const self = group.read(pair.first);
    SchemaManager* const empty = group.read(properties::GeneratedDirectory());
    ASSERT_TRUE(self->checkCollisions(empty));
    ASSERT_EQ(sizeOf(stateOf(*self)), 0U);
    ASSERT_EQ(differenceOf(State(), stateOf(*empty)), "");
  });
}

TEST(Collisions, OfASetWithItselfAreAllItsDefinitions) {
  forAnyPairs([](const Pair& pair) {
    ManagerGroup group(pair.folder);
    SchemaManager* const self = group.read(pair.first);
    const State before = stateOf(*self);
    ASSERT_TRUE(self->checkCollisions(group.read(pair.first)));
    ASSERT_EQ(differenceOf(before, stateOf(*self)), "");
  });
}

// The definitions that are left are the same objects; indexes and sets stay whole, exclusions play
// no part.
TEST(Collisions, ACheckPrunesTheThreeTablesOnly) {
  forAnyPairs([](const Pair& pair) {
    ManagerGroup group(pair.folder);
    SchemaManager* const self = group.read(pair.first);
    self->readExcludedOids(group.writeList(properties::anyOidList(pair.choices)));
    State expected = stateOf(*self);
    ASSERT_TRUE(self->checkCollisions(group.read(pair.second)));
    const State after = stateOf(*self);
    forEachTable([&](auto table) {
      for (const auto& [key, definition] : after.*table) {
        ASSERT_EQ((expected.*table).count(key), 1U) << key;
        ASSERT_EQ((expected.*table).at(key), definition) << key;
      }
      expected.*table = after.*table;
    });
    ASSERT_EQ(differenceOf(expected, after), "");
  });
}

TEST(Collisions, TheReferenceLosesTheCollidingAttributesFromItsOidIndexOnly) {
  std::size_t lost = 0;
  forAnyPairs([&](const Pair& pair) {
    ManagerGroup group(pair.folder);
    SchemaManager* const self = group.read(pair.first);
    SchemaManager* const reference = group.read(pair.second);
    State expected = stateOf(*reference);
    ASSERT_TRUE(self->checkCollisions(reference));
    for (const auto& entry : stateOf(*self).attrTable) {
      lost += expected.attrOidTable.erase(entry.second->getOid());
    }
    ASSERT_EQ(differenceOf(expected, stateOf(*reference)), "");
  });
  EXPECT_GT(lost, properties::kPairs);
}

}  // namespace
