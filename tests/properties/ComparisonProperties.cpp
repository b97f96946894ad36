// Properties of a comparison, over generated pairs of directories.

#include <gtest/gtest.h>

#include <algorithm>
#include <cstddef>
#include <map>
#include <set>
#include <string>

#include "Pairs.h"

namespace {

using properties::differenceOf;
using properties::forAnyPairs;
using properties::forConsistentPairs;
using properties::forEachTable;
using properties::ManagerGroup;
using properties::OidSet;
using properties::Pair;
using properties::sizeOf;
using properties::State;
using properties::stateOf;

bool areEqual(const Attribute& mine, const Attribute& theirs) { return mine.isEqualTo(theirs); }
bool areEqual(const ObjectClass& mine, const ObjectClass& theirs) { return mine.isEqualTo(theirs); }
bool areEqual(const ORVAttribute& mine, const ORVAttribute& theirs) {
  return mine.isEqualTo(theirs);
}

// The state without its three tables: what a comparison does not prune, but for the file sets.
State withoutTables(State state) {
  state.attrTable.clear();
  state.ocTable.clear();
  state.orvAttrTable.clear();
  return state;
}

// An OID that several files list loses its place in one of them for each definition dropped, and a
// vendor extension counts for none.
TEST(Comparison, OfASetWithItselfLeavesNothing) {
  std::size_t compared = 0;
  forAnyPairs([&](const Pair& pair) {
    ManagerGroup group(pair.folder);
    SchemaManager* const self = group.read(pair.first);
    SchemaManager* const same = group.read(pair.first);
    compared += sizeOf(stateOf(*self));
    ASSERT_TRUE(self->compSchemas(same));
    ASSERT_EQ(sizeOf(stateOf(*self)), 0U);
  });
  EXPECT_GT(compared, properties::kPairs);
}

TEST(Comparison, OfASetWithItselfEmptiesItsFileSetsButForExtensionsElsewhere) {
  forConsistentPairs([](const Pair& pair) {
    ManagerGroup group(pair.folder);
    SchemaManager* const self = group.read(pair.first);
    ASSERT_TRUE(self->compSchemas(group.read(pair.first)));
    std::map<std::string, std::set<std::string>> filesOfOid;
    std::set<std::string> ofExtensionsOnly;
    for (const auto& definition : pair.first) {
      filesOfOid[definition.oid].insert(definition.file);
      if (definition.kind == properties::GeneratedDefinition::kExtension) {
        ofExtensionsOnly.insert(definition.oid);
      }
    }
    for (const auto& definition : pair.first) {
      if (definition.kind != properties::GeneratedDefinition::kExtension) {
        ofExtensionsOnly.erase(definition.oid);
      }
    }
    const State after = stateOf(*self);
    for (const auto& [oid, files] : filesOfOid) {
      const auto holders =
          std::count_if(after.fileSets.begin(), after.fileSets.end(),
                        [&oid = oid](const OidSet& set) { return set.count(oid); });
      const std::size_t dropped = ofExtensionsOnly.count(oid) != 0 ? 0 : 1;
      ASSERT_EQ(static_cast<std::size_t>(holders), files.size() - dropped) << oid;
    }
  });
}

TEST(Comparison, WithAnEmptyReferenceKeepsAllThatIsNotExcluded) {
  std::size_t excluded = 0;
  forAnyPairs([&](const Pair& pair) {
    ManagerGroup group(pair.folder);
    SchemaManager* const self = group.read(pair.first);
    SchemaManager* const empty = group.read(properties::GeneratedDirectory());
    self->readExcludedOids(group.writeList(properties::anyOidList(pair.choices)));
    const State before = stateOf(*self);
    ASSERT_TRUE(self->compSchemas(empty));
    const State after = stateOf(*self);
    forEachTable([&](auto table) {
      auto expected = before.*table;
      for (auto entry = expected.begin(); entry != expected.end();) {
        const bool isExcluded = before.excludedOids.count(entry->second->getOid()) != 0;
        entry = isExcluded ? expected.erase(entry) : std::next(entry);
      }
      excluded += (before.*table).size() - expected.size();
      ASSERT_EQ(after.*table, expected);
    });
    ASSERT_EQ(differenceOf(State(), stateOf(*empty)), "");
  });
  EXPECT_GT(excluded, 50U);
}

// The file sets, too: without exclusions nothing is dropped.
TEST(Comparison, WithAnEmptyReferenceAndNoExclusionsChangesNothing) {
  forAnyPairs([](const Pair& pair) {
    ManagerGroup group(pair.folder);
    SchemaManager* const self = group.read(pair.first);
    const State before = stateOf(*self);
    ASSERT_TRUE(self->compSchemas(group.read(properties::GeneratedDirectory())));
    ASSERT_EQ(differenceOf(before, stateOf(*self)), "");
  });
}

TEST(Comparison, KeepsAndDropsWhatWasThere) {
  std::size_t kept = 0;
  std::size_t dropped = 0;
  forAnyPairs([&](const Pair& pair) {
    ManagerGroup group(pair.folder);
    SchemaManager* const self = group.read(pair.first);
    SchemaManager* const reference = group.read(pair.second);
    self->readExcludedOids(group.writeList(properties::anyOidList(pair.choices)));
    const State before = stateOf(*self);
    ASSERT_TRUE(self->compSchemas(reference));
    const State after = stateOf(*self);
    const State theirs = stateOf(*reference);
    forEachTable([&](auto table) {
      for (const auto& [key, definition] : after.*table) {
        ASSERT_EQ((before.*table).count(key), 1U) << key;
        ASSERT_EQ((before.*table).at(key), definition) << key;
      }
      for (const auto& [key, definition] : before.*table) {
        const bool isExcluded = before.excludedOids.count(definition->getOid()) != 0;
        const bool isEqual =
            (theirs.*table).count(key) != 0 && areEqual(*definition, *(theirs.*table).at(key));
        const bool isKept = (after.*table).count(key) != 0;
        ASSERT_EQ(isKept, !isExcluded && !isEqual) << key;
        ++(isKept ? kept : dropped);
      }
    });
  });
  EXPECT_GT(kept, properties::kPairs);
  EXPECT_GT(dropped, properties::kPairs);
}

// A dropped definition is still found by its OID, and no set grows.
TEST(Comparison, PrunesTablesAndFileSetsOnly) {
  forAnyPairs([](const Pair& pair) {
    ManagerGroup group(pair.folder);
    SchemaManager* const self = group.read(pair.first);
    const State before = stateOf(*self);
    ASSERT_TRUE(self->compSchemas(group.read(pair.second)));
    State expected = withoutTables(before);
    State after = withoutTables(stateOf(*self));
    for (std::size_t i = 0; i < before.fileSets.size(); ++i) {
      ASSERT_TRUE(std::includes(expected.fileSets[i].begin(), expected.fileSets[i].end(),
                                after.fileSets[i].begin(), after.fileSets[i].end()));
      expected.fileSets[i].clear();
      after.fileSets[i].clear();
    }
    ASSERT_EQ(differenceOf(expected, after), "");
  });
}

// What the file sets lose is the OIDs of dropped attribute types and object classes, one place
// each.
TEST(Comparison, DropsOneFilePlacePerAttributeTypeAndObjectClass) {
  forConsistentPairs([](const Pair& pair) {
    ManagerGroup group(pair.folder);
    SchemaManager* const self = group.read(pair.first);
    const State before = stateOf(*self);
    ASSERT_TRUE(self->compSchemas(group.read(pair.second)));
    const State after = stateOf(*self);
    std::multiset<std::string> dropped;
    for (const auto& entry : before.attrTable) {
      if (after.attrTable.count(entry.first) == 0) {
        dropped.insert(entry.second->getOid());
      }
    }
    for (const auto& entry : before.ocTable) {
      if (after.ocTable.count(entry.first) == 0) {
        dropped.insert(entry.second->getOid());
      }
    }
    std::multiset<std::string> lost;
    for (std::size_t i = 0; i < before.fileSets.size(); ++i) {
      for (const std::string& oid : before.fileSets[i]) {
        if (after.fileSets[i].count(oid) == 0) {
          lost.insert(oid);
        }
      }
    }
    ASSERT_EQ(lost, dropped);
  });
}

TEST(Comparison, LeavesTheReferenceAsItWas) {
  forAnyPairs([](const Pair& pair) {
    ManagerGroup group(pair.folder);
    SchemaManager* const self = group.read(pair.first);
    SchemaManager* const reference = group.read(pair.second);
    const std::string list = group.writeList(properties::anyOidList(pair.choices));
    self->readExcludedOids(list);
    reference->readExcludedOids(list);
    const State before = stateOf(*reference);
    ASSERT_TRUE(self->compSchemas(reference));
    ASSERT_EQ(differenceOf(before, stateOf(*reference)), "");
  });
}

}  // namespace
