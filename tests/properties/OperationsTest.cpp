// Runs of operations between managers of three related directories, against the rules step by step.

#include <gtest/gtest.h>

#include "Choices.h"
#include "Files.h"
#include "ManagerGroup.h"

namespace {

TEST(Operations, FollowTheRules) {
  const support::TemporaryDirectory folder;
  properties::RunCounts counts;
  for (unsigned seed = 1; seed <= 1500; ++seed) {
    properties::SeededChoices choices(seed);
    ASSERT_EQ(properties::runOperations(&choices, folder.path(), &counts), "") << "seed " << seed;
  }
  // The runs are of any worth only if each of these happens often.
  EXPECT_GT(counts.operations, 3000U);
  EXPECT_GT(counts.dropped, 1000U);
  EXPECT_GT(counts.merges, 300U);
  EXPECT_GT(counts.failedMerges, 100U);
  EXPECT_GT(counts.withdrawn, 100U);
}

}  // namespace
