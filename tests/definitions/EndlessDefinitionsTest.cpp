// The inputs that never complete. Each runs in a child process that is stopped after a second and
// that has so little memory that a list which grows at the end of the input would end it before
// that.

#include <gtest/gtest.h>

#include <csignal>
#include <functional>
#include <string>
#include <vector>

#include "Attribute.h"
#include "EndlessRuns.h"
#include "ORVAttribute.h"
#include "ObjectClass.h"

namespace {

using definitions::parseWithinLimits;

template <typename Definition>
std::vector<std::string> endsOfParses(const std::vector<std::string>& texts) {
  std::vector<std::function<void()>> actions;
  actions.reserve(texts.size());
  for (const std::string& text : texts) {
    actions.push_back([text] { parseWithinLimits<Definition>(text); });
  }
  return definitions::endsOf(actions);
}

const std::vector<std::string> kAllEndless(5, "endless");

// Definitions whose names no keyword of the following definition ends.
const char kNextObjectClass[] =
    "=( 1.1 NAME 'a' )\nobjectclasses=( 2.2 NAME 'b' ABSTRACT MUST ( c ) MAY ( d ) )\n";
const char kNextAttributeType[] =
    "=( 1.1 NAME 'a' )\nattributetypes=( 2.2 NAME 'b' SYNTAX 1.3 EQUALITY e USAGE u COLLECTIVE )\n";

TEST(AttributeParse, CollectiveNeverCompletes) {
  EXPECT_EXIT(parseWithinLimits<Attribute>("=( 1.1 NAME 'a' COLLECTIVE )\n"),
              testing::KilledBySignal(SIGALRM), "");
  EXPECT_EQ(endsOfParses<Attribute>({"=( COLLECTIVE", "=( COLLECTIVE\n", "= COLLECTIVE )\n",
                                     "=( 1.1 SUP a COLLECTIVE DESC 'd' )\nattributetypes=( 2.2 )\n",
                                     "{ ( 1.1 'COLLECTIVE' ) }\n"}),
            (std::vector<std::string>{"returned", "endless", "endless", "endless", "endless"}));
}

TEST(AttributeParse, NameAtTheEndNeverCompletes) {
  EXPECT_EXIT(parseWithinLimits<Attribute>("=( 1.1 NAME 'a' )\n"), testing::KilledBySignal(SIGALRM),
              "");
  EXPECT_EQ(endsOfParses<Attribute>({"=( 1.1 NAME\n", "=( 1.1 NAME 'a", "=( 1.1 NAME ( 'a' 'b'",
                                     "=( 1.1 NAME DESC )\n", kNextObjectClass}),
            kAllEndless);
}

TEST(ObjectClassParse, NameAtTheEndNeverCompletes) {
  EXPECT_EXIT(parseWithinLimits<ObjectClass>("=( 1.1 NAME 'a' )\n"),
              testing::KilledBySignal(SIGALRM), "");
  EXPECT_EQ(endsOfParses<ObjectClass>({"=( 1.1 NAME\n", "=( 1.1 NAME 'a", "=( 1.1 NAME ( 'a' 'b'",
                                       "=( 1.1 NAME 'a' STRUCTURAL", kNextAttributeType}),
            kAllEndless);
}

TEST(ORVAttributeParse, ListAtTheEndNeverCompletes) {
  EXPECT_EXIT(parseWithinLimits<ORVAttribute>("=( 1.1 DBNAME ( 'a'\n"),
              testing::KilledBySignal(SIGALRM), "");
  EXPECT_EQ(
      endsOfParses<ORVAttribute>({"=( 1.1 DBNAME\n", "=( 1.1 DBNAME 'a", "=( 1.1 DBNAME a }\n",
                                  "=( 1.1 DBNAME 'a' LENGTH",
                                  "=( 1.1 DBNAME ( 'a'\nattributetypes=( 2.2 NAME 'b' DESC 'd'\n"}),
      kAllEndless);
}

TEST(EndlessRuns, TheSameInputsCompletedReturn) {
  EXPECT_EQ(endsOfParses<Attribute>({"=( 1.1 NAME 'a' OBSOLETE )\n"}),
            std::vector<std::string>{"returned"});
  EXPECT_EQ(endsOfParses<ObjectClass>({"=( 1.1 NAME 'a' ABSTRACT )\n"}),
            std::vector<std::string>{"returned"});
  EXPECT_EQ(endsOfParses<ORVAttribute>({"=( 1.1 DBNAME ( 'a' )\n"}),
            std::vector<std::string>{"returned"});
}

TEST(EndlessRuns, AGrowingListIsNotTakenForAnEndlessRun) {
  const std::vector<std::string> ends = definitions::endsOf({[]() noexcept {
    definitions::limitThisProcess();
    for (std::vector<std::string> list;;) {
      list.emplace_back();
    }
  }});
  EXPECT_NE(ends[0], "endless");
  EXPECT_NE(ends[0], "returned");
}

}  // namespace
