// The environment's locale is in force when two managers meet, and a file is read under "C": where
// the two fold a letter in different ways, a definition's first name in lower case is not the key
// under which it was entered. What is listed for removal is the name as it is folded then.

#include <gtest/gtest.h>

#include <string>

#include "Installation.h"
#include "PlatformFunctions.h"
#include "UnfreedDefinitions.h"

using namespace support;
using platform::OtherFolding;

namespace {

void compare(Installation* installation, Installation* reference) {
  EXPECT_TRUE((*installation)->compSchemas(reference->manager()));
}

void check(Installation* installation, Installation* reference) {
  EXPECT_TRUE((*installation)->checkCollisions(reference->manager()));
}

std::string bothKinds(const std::string& oid, const std::string& name,
                      const std::string& description = "text") {
  return attributeType("1." + oid, name, description) + objectClass("2." + oid, name, description);
}

// "ITEM" gives "Item", which is no key of either table.
TEST(LocaleFolding, ComparisonKeepsWhatItDoesNotFind) {
  const UnfreedDefinitions unfreed;
  const std::string text = bothKinds("1", "ITEM") + bothKinds("2", "Other");
  Installation installation{{"V3.user.at", text}};
  Installation reference{{"V3.user.at", text}};
  {
    const OtherFolding folding('I', 'I');
    compare(&installation, &reference);
  }
  EXPECT_EQ(stateOf(installation.manager()),
            "attributes: item=1.1(text)\nclasses: item=2.1(text)\nV3.user.at: 1.1 2.1\n");
}

TEST(LocaleFolding, ExcludedDefinitionStaysAndItsOidGoes) {
  const UnfreedDefinitions unfreed;
  Installation installation{{"V3.user.at", bothKinds("1", "ITEM") + bothKinds("2", "Other")}};
  Installation reference;
  installation.exclude({"1.1", "1.2", "2.1", "2.2"});
  {
    const OtherFolding folding('I', 'I');
    compare(&installation, &reference);
  }
  EXPECT_EQ(stateOf(installation.manager()),
            "attributes: item=1.1(text)\nclasses: item=2.1(text)\n");
}

// "Qa" gives "za", which is the key of another: found there, it is compared with what the reference
// has under its own key, and the other entry goes in its place.
TEST(LocaleFolding, ComparisonTakesTheEntryOfTheFoldedName) {
  const UnfreedDefinitions unfreed;
  Installation installation{{"V3.user.at", bothKinds("1", "Qa") + bothKinds("2", "Za")}};
  Installation reference{{"V3.user.at", bothKinds("1", "Qa") + bothKinds("2", "Za", "other")}};
  {
    const OtherFolding folding('Q', 'z');
    compare(&installation, &reference);
  }
  EXPECT_EQ(stateOf(installation.manager()),
            "attributes: qa=1.1(text)\nclasses: qa=2.1(text)\nV3.user.at: 1.2 2.2\n");
}

TEST(LocaleFolding, CheckReportsWhatItCannotRemove) {
  const UnfreedDefinitions unfreed;
  Installation installation{
      {"V3.user.at", bothKinds("1", "ITEM") + bothKinds("2", "Other") + bothKinds("3", "third")}};
  Installation reference{{"V3.user.at", bothKinds("7", "item") + bothKinds("8", "other")}};
  {
    const OtherFolding folding('I', 'I');
    check(&installation, &reference);
  }
  EXPECT_EQ(tablesOf(installation.manager()),
            "attributes: item=1.1(text) other=1.2(text)\n"
            "classes: item=2.1(text) other=2.2(text)\n");
}

// The target has "za" already: it keeps it, and what has been moved is found by its OID there.
TEST(LocaleFolding, MergeIntoATargetThatHasTheFoldedName) {
  const UnfreedDefinitions unfreed;
  Installation target{{"V3.user.at", bothKinds("2", "Za")}};
  Installation source{{"V3.user.at", bothKinds("1", "Qa")}};
  {
    const OtherFolding folding('Q', 'z');
    EXPECT_TRUE(target->mergeSchemas(source.manager()));
  }
  EXPECT_EQ(stateOf(target.manager()),
            "attributes: za=1.2(text)\nclasses: za=2.2(text)\nV3.user.at: 1.2 2.2\n");
  EXPECT_EQ(attributeUnder(target.manager(), "1.1"), "qa=1.1(text)");
  EXPECT_EQ(objectClassUnder(target.manager(), "2.1"), "qa=2.1(text)");
  EXPECT_EQ(tablesOf(source.manager()), "");
  EXPECT_EQ(attributeUnder(source.manager(), "1.1"), "nothing");
}

// What has been moved belongs to the target alone, whatever its name gives now: both managers can
// be destroyed.
TEST(LocaleFolding, MergeLeavesNothingInTheSource) {
  Installation target;
  Installation source{{"V3.user.at", bothKinds("1", "Qa") + bothKinds("2", "Zb")}};
  {
    const OtherFolding folding('Q', 'z');
    EXPECT_TRUE(target->mergeSchemas(source.manager()));
  }
  EXPECT_EQ(stateOf(target.manager()),
            "attributes: za=1.1(text) zb=1.2(text)\nclasses: za=2.1(text) zb=2.2(text)\n"
            "V3.user.at: 1.1 1.2 2.1 2.2\n");
  EXPECT_EQ(tablesOf(source.manager()), "");
}

// A name that gives another one than its key in any of its letters is not found in the reference,
// and its own entry stays.
TEST(LocaleFolding, EveryLetterOfANameCounts) {
  for (const char* name : {"Qabc", "aQbc", "abQc", "abcQ"}) {
    SCOPED_TRACE(name);
    Installation installation{{"V3.user.at", bothKinds("1", name)}};
    Installation reference{{"V3.user.at", bothKinds("1", name)}};
    const std::string whole = stateOf(installation.manager());
    {
      const OtherFolding folding('Q', 'z');
      compare(&installation, &reference);
    }
    EXPECT_EQ(stateOf(installation.manager()), whole);
  }
}

}  // namespace
