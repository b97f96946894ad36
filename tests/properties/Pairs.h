// Generated pairs of directories for a property, and the managers that read them.

#ifndef LIBSCHEMA_TESTS_PAIRS_H
#define LIBSCHEMA_TESTS_PAIRS_H

#include <gtest/gtest.h>

#include <string>

#include "Choices.h"
#include "Files.h"
#include "GeneratedDirectory.h"
#include "ManagerGroup.h"
#include "ManagerTables.h"

namespace properties {

constexpr unsigned kPairs = 400;

// What a property is tried on: two directories, a folder, and choices for what else it takes.
struct Pair {
  GeneratedDirectory first;
  GeneratedDirectory second;
  std::string folder;
  Choices* choices;
};

template <typename Property>
void forPairs(bool areConsistent, Property property) {
  const support::TemporaryDirectory folder;
  for (unsigned seed = 1; seed <= kPairs; ++seed) {
    SCOPED_TRACE("seed " + std::to_string(seed));
    SeededChoices choices(seed);
    Pair pair;
    pair.folder = folder.path();
    pair.choices = &choices;
    pair.first = areConsistent ? consistentDirectory(&choices) : anyDirectory(&choices);
    pair.second = areConsistent ? consistentDirectory(&choices) : relativeOf(pair.first, &choices);
    property(pair);
    if (testing::Test::HasFailure()) {
      return;
    }
  }
}

// Names and OIDs of the definitions in any relation to each other.
template <typename Property>
void forAnyPairs(Property property) {
  forPairs(false, property);
}

// See consistentDirectory().
template <typename Property>
void forConsistentPairs(Property property) {
  forPairs(true, property);
}

// Calls `action` with each of the three tables, `member` being a pointer to the member of State.
template <typename Action>
void forEachTable(Action action) {
  action(&State::attrTable);
  action(&State::ocTable);
  action(&State::orvAttrTable);
}

inline std::size_t sizeOf(const State& state) {
  return state.attrTable.size() + state.ocTable.size() + state.orvAttrTable.size();
}

}  // namespace properties

#endif  // LIBSCHEMA_TESTS_PAIRS_H
