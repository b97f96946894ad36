// Values under texts.

#include "TextIndex.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace {

using migration::TextIndex;

std::vector<std::uint32_t> valuesOf(const TextIndex& index, std::string_view text) {
  std::vector<std::uint32_t> values;
  for (std::uint32_t node = index.first(text); node != TextIndex::kNone; node = index.next(node)) {
    values.push_back(index.value(node));
  }
  return values;
}

// One by one the room for them grows again and again, and each is found behind every growth.
TEST(TextIndex, FindsEachWhileItGrows) {
  constexpr std::uint32_t kTexts = 3000;
  std::vector<std::string> texts;
  texts.reserve(kTexts);
  TextIndex index(TextIndex::Case::kExact);
  for (std::uint32_t i = 0; i < kTexts; ++i) {
    texts.push_back("name" + std::to_string(i));
    index.add(texts.back(), i);
    if ((i & (i + 1)) == 0 || i + 1 == kTexts) {
      for (std::uint32_t j = 0; j <= i; ++j) {
        ASSERT_EQ(std::vector<std::uint32_t>({j}), valuesOf(index, texts[j])) << "of " << i;
      }
    }
  }
  EXPECT_EQ(TextIndex::kNone, index.first("name3000"));
  EXPECT_TRUE(index.repeated().empty());
}

// The same, all at once, behind those that are there.
TEST(TextIndex, KeepsTheOrderUnderOneText) {
  std::vector<std::string> texts;
  std::vector<TextIndex::Item> items;
  constexpr std::uint32_t kTexts = 100;
  texts.reserve(kTexts);
  for (std::uint32_t i = 0; i < kTexts; ++i) {
    texts.push_back((i % 2 == 0 ? "Name" : "nAME") + std::to_string(i % 10));
    items.push_back({texts.back(), i});
  }
  TextIndex index(TextIndex::Case::kFolded);
  index.add("name3", 1000);
  index.addAll(items);
  EXPECT_EQ(std::vector<std::uint32_t>({1000, 3, 13, 23, 33, 43, 53, 63, 73, 83, 93}),
            valuesOf(index, "NAME3"));
  ASSERT_EQ(10U, index.repeated().size());
  EXPECT_EQ("name3", index.text(index.repeated().front()));
  EXPECT_EQ("Name0", index.text(index.repeated()[1]));
  EXPECT_EQ(TextIndex::kNone, index.first("name"));
}

}  // namespace
