// The order into which keys are brought, against the standard library's.

#include "SortedKeys.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <initializer_list>
#include <random>
#include <string>
#include <utility>
#include <vector>

namespace {

using Keys = std::vector<std::string>;
using Numbered = std::vector<std::pair<std::string, std::size_t>>;

Numbered sorted(const Keys& keys) {
  libschema::SortedKeys<std::size_t> sortedKeys;
  for (std::size_t i = 0; i < keys.size(); ++i) {
    sortedKeys.add(keys[i], i);
  }
  Numbered result;
  for (const auto& entry : sortedKeys.inOrder()) {
    result.emplace_back(entry.key, entry.value);
  }
  return result;
}

Numbered stablySorted(const Keys& keys) {
  Numbered result;
  for (std::size_t i = 0; i < keys.size(); ++i) {
    result.emplace_back(keys[i], i);
  }
  std::stable_sort(result.begin(), result.end(),
                   [](const auto& left, const auto& right) { return left.first < right.first; });
  return result;
}

// Keys of few different characters, zero and the highest one among them, behind a common beginning.
Keys randomKeys(std::mt19937* random, std::size_t count, std::size_t common, std::size_t longest) {
  static constexpr char kCharacters[] = {'\0', '.', '1', '2', 'a', '\xff'};
  Keys keys;
  for (std::size_t i = 0; i < count; ++i) {
    std::string key(common, '7');
    for (std::size_t left = (*random)() % (longest + 1); left > 0; --left) {
      key += kCharacters[(*random)() % sizeof kCharacters];
    }
    keys.push_back(key);
  }
  return keys;
}

TEST(SortedKeys, AreInTheOrderOfStrings) {
  std::mt19937 random(1);
  using Sizes = std::initializer_list<std::size_t>;
  for (const std::size_t count : Sizes{0, 1, 2, 12, 13, 100, 1000}) {
    for (const std::size_t common : Sizes{0, 5, 8, 100}) {
      for (const std::size_t longest : Sizes{0, 1, 3, 8, 9, 30}) {
        SCOPED_TRACE(testing::Message() << count << " keys, " << common << " + " << longest);
        const Keys keys = randomKeys(&random, count, common, longest);
        EXPECT_EQ(sorted(keys), stablySorted(keys));
        const Keys reversed(keys.rbegin(), keys.rend());
        EXPECT_EQ(sorted(reversed), stablySorted(reversed));
      }
    }
  }
}

// Every second one goes, and what is left can be added to.
TEST(SortedKeys, RemoveInOrder) {
  libschema::SortedKeys<int> keys;
  for (const char* key : {"b", "a", "d", "c"}) {
    keys.add(key, 0);
  }
  std::string asked;
  keys.removeInOrder([&](const auto& entry) {
    asked += entry.key;
    return entry.key == "b" || entry.key == "d";
  });
  EXPECT_EQ(asked, "abcd");
  keys.add("b", 0);
  std::string left;
  for (const auto& entry : keys.inOrder()) {
    left += entry.key;
  }
  EXPECT_EQ(left, "abc");
}

}  // namespace
