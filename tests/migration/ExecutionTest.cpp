// A plan carried out by the library is the plan: on written cases and on generated triples.

#include "Execution.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>
#include <filesystem>
#include <random>
#include <string>
#include <utility>
#include <vector>

#include "Installation.h"
#include "ThreeWay.h"
#include "UnfreedDefinitions.h"

namespace {

using migration::Execution;
using migration::Installation;
using migration::NamedText;
using migration::ThreeWay;
using migration::ThreeWayRequest;
using migration::Verdict;

class PrivateFolder {
 public:
  PrivateFolder() {
    char name[] = "/tmp/execution-XXXXXX";
    m_path = ::mkdtemp(name);
    for (const char* const folder : migration::kExecutionFolders) {
      std::filesystem::create_directory(m_path + "/" + folder);
    }
  }
  ~PrivateFolder() { std::filesystem::remove_all(m_path); }
  PrivateFolder(const PrivateFolder&) = delete;
  PrivateFolder& operator=(const PrivateFolder&) = delete;
  const std::string& path() const { return m_path; }

 private:
  std::string m_path;
};

Installation installationOf(const std::string& name, std::vector<NamedText> texts) {
  migration::Failures failures;
  Installation installation =
      Installation::fromTexts(name, std::move(texts), migration::ReadLimits(), &failures);
  EXPECT_TRUE(failures.empty());
  return installation;
}

std::string textOf(const migration::Failures& failures) {
  std::string text;
  for (const migration::Failure& failure : failures) {
    text += failure.file + ": " + failure.text + "\n";
  }
  return text;
}

std::string textOf(const std::vector<NamedText>& texts) {
  std::string all;
  for (const NamedText& text : texts) {
    all += "== " + text.name + "\n" + text.bytes;
  }
  return all;
}

struct Outcome {
  Execution execution;
  std::size_t undecided = 0;
};

Outcome run(const std::vector<NamedText>& base, const std::vector<NamedText>& old,
            const std::vector<NamedText>& latest) {
  const Installation ofBase = installationOf("BASE", base);
  const Installation ofOld = installationOf("OLD", old);
  const Installation ofNew = installationOf("NEW", latest);
  ThreeWayRequest request;
  request.base = &ofBase;
  request.old = &ofOld;
  request.latest = &ofNew;
  const ThreeWay threeWay = compareThreeWay(request);
  Outcome result;
  for (const Verdict& row : threeWay.differences) {
    result.undecided += row.isUndecided() ? 1 : 0;
  }
  const PrivateFolder folder;
  const support::UnfreedDefinitions unfreed;
  result.execution = execute(request, threeWay, folder.path());
  return result;
}

TEST(Execution, NewsLayoutKeepsEveryByteThatIsNotReplaced) {
  const std::vector<NamedText> base = {
      {"V3.system.at",
       "# head\nattributetypes {\n  ( 1.1 NAME 'a' USAGE u )  # one\n  ( 1.2 NAME 'b' USAGE u )\n}\n"},
      {"V3.system.oc", "objectclasses=( 2.1 NAME 'c' ABSTRACT )\n"}};
  std::vector<NamedText> old = base;
  old[0].bytes =
      "attributetypes=( 1.1 NAME 'a' DESC 'site''s' USAGE u )\n"
      "attributetypes=( 1.2 NAME 'b' USAGE site )\n";
  old[0].bytes =
      "attributetypes=( 1.1 NAME 'a' USAGE u )\nattributetypes=( 1.2 NAME 'b' USAGE site )\n";
  old.push_back(
      {"V3.user.oc",
       "# Guards.\nobjectclasses=( 9.2 NAME 'guard' SUP person STRUCTURAL\n"
       "  MAY ( badge ) )\n"
       "# People.\n# All of them.\nobjectclasses=( 9.1 NAME 'person' SUP c STRUCTURAL )\n"});
  old.push_back({"V3.user.at",
                 "attributetypes=( 9.3 NAME 'badge' USAGE u )\n"
                 "ORVAttributetypes=( 9.3 DBNAME ( 'badge' 'badge' ) ACCESS-CLASS normal )\n"});
  const Outcome result = run(base, old, base);
  EXPECT_EQ(textOf(result.execution.failures), "");
  EXPECT_EQ(textOf(result.execution.inNewsLayout),
            "== V3.system.at\n"
            "# head\nattributetypes {\n  ( 1.1 NAME 'a' USAGE u )  # one\n"
            "  ( 1.2 NAME 'b' USAGE site )\n}\n"
            "== V3.system.oc\n"
            "objectclasses=( 2.1 NAME 'c' ABSTRACT )\n"
            "== V3.user.at\n"
            "# Carried over from the installation before the migration:\n"
            "attributetypes=( 9.3 NAME 'badge' USAGE u )\n"
            "ORVAttributetypes=( 9.3 DBNAME ( 'badge' 'badge' ) ACCESS-CLASS normal )\n"
            "== V3.user.oc\n"
            "# Carried over from the installation before the migration:\n"
            "# People.\n# All of them.\n"
            "objectclasses=( 9.1 NAME 'person' SUP c STRUCTURAL )\n"
            "# Guards.\n"
            "objectclasses=( 9.2 NAME 'guard' SUP person STRUCTURAL\n  MAY ( badge ) )\n");
}

TEST(Execution, AReleaseMigratedToItselfChangesNoByte) {
  const std::vector<NamedText> texts = {
      {"V3.system.at", "attributetypes {\n ( 1.1 NAME 'a' DESC 'x' USAGE u )\n} # end"},
      {"V3.config.at", "attributetypes=( 1.9 NAME 'z' USAGE u )\n"}};
  const Outcome result = run(texts, texts, texts);
  EXPECT_EQ(textOf(result.execution.failures), "");
  EXPECT_EQ(textOf(result.execution.inNewsLayout), textOf(texts));
}

// What the library's comparison would leave out: the order of DBNAME, and of repeated members.
TEST(Execution, WhatTheLibraryTakesForEqualIsCarriedAllTheSame) {
  const std::string type = "attributetypes=( 1.1 NAME 'a' USAGE u )\n";
  const Outcome result =
      run({{"V3.orv.at", type + "ORVAttributetypes=( 1.1 DBNAME ( 'x' 'y' ) ACCESS-CLASS n )\n"}},
          {{"V3.orv.at", type + "ORVAttributetypes=( 1.1 DBNAME ( 'y' 'x' ) ACCESS-CLASS n )\n"}},
          {{"V3.orv.at", type + "ORVAttributetypes=( 1.1 DBNAME ( 'x' 'y' ) ACCESS-CLASS n )\n"}});
  EXPECT_EQ(textOf(result.execution.failures), "");
  EXPECT_EQ(
      textOf(result.execution.inNewsLayout),
      "== V3.orv.at\n" + type + "ORVAttributetypes=( 1.1 DBNAME ( 'y' 'x' ) ACCESS-CLASS n )\n");
}

TEST(Execution, WhatTheLibrarysWriterDoesNotCarryIsNamed) {
  const std::vector<NamedText> texts = {
      {"V3.orv.at", "ORVAttributetypes=( 1.1 DBNAME ( 'x' ) ACCESS-CLASS n )\n"}};
  const Outcome result = run(texts, texts, texts);
  EXPECT_EQ(textOf(result.execution.failures), "");
  EXPECT_EQ(textOf(result.execution.notCarriedByLibrary),
            "result: vendor extension 1.1 is not in the result\n");
}

// What NEW has twice is NEW's own: its layout keeps it, and only the library's cannot.
TEST(Execution, NewsOwnRepeatsStay) {
  const std::string type = "attributetypes=( 1.1 NAME 'a' USAGE u )\n";
  const struct {
    const char* rule;
    std::string latest;
    const char* notCarried;
  } cases[] = {
      {"TwoUnderOneOid", type + "attributetypes=( 1.1 NAME 'b' USAGE u )\n",
       "result: attribute type b (1.1) is not in the result\n"},
      {"TwoUnderOneFirstName", type + "attributetypes=( 1.2 NAME 'A' USAGE v )\n", ""},
      {"TwoUnderOneFirstNameThatTheLibraryWouldTurnRound",
       "attributetypes=( 1.2 NAME 'A' USAGE v )\n" + type,
       "result: attribute type A (1.2) is not in the result\n"},
      {"TwoUnderBoth", type + "attributetypes=( 1.1 NAME 'a' USAGE v )\n",
       "result: attribute type a (1.1) of V3.system.at:2 in NEW is not in the result\n"},
      {"TwoAlike", type + type, ""},
      {"AnOidThatIsReadInTwo", type + "objectclasses=( 2.1 NAME 'c' ABSTRACT X-ORIGIN 'of2.1' )\n",
       "result: object class c (of2.1) is not in the result\n"},
      {"TwoSuperiors", type + "attributetypes=( 1.3 NAME 'd' SUP a SUP x USAGE u )\n",
       "result: attribute type d (1.3) is not in the result\n"},
  };
  const std::string sites = "attributetypes=( 9.1 NAME 'mine' USAGE u )\n";
  for (const auto& row : cases) {
    SCOPED_TRACE(row.rule);
    const std::vector<NamedText> latest = {{"V3.system.at", row.latest}};
    const Outcome result =
        run(latest, {{"V3.system.at", row.latest}, {"V3.user.at", sites}}, latest);
    EXPECT_EQ(textOf(result.execution.failures), "");
    EXPECT_EQ(textOf(result.execution.inNewsLayout),
              "== V3.system.at\n" + row.latest +
                  "== V3.user.at\n# Carried over from the installation before the migration:\n" +
                  sites);
    EXPECT_EQ(textOf(result.execution.notCarriedByLibrary), row.notCarried);
  }
}

// A definition of which a repeat lies in another file gets the site's OID or name in one place.
TEST(Execution, ARepeatGoesWithWhatIsRenumbered) {
  const std::string plain = "attributetypes=( 1.1 NAME 'a' USAGE u )\n";
  const std::vector<NamedText> shipped = {{"V3.system.at", plain}, {"V3.user.at", plain}};
  const Outcome result =
      run(shipped, {{"V3.user.at", "attributetypes=( 9.1 NAME 'a' USAGE u )\n"}}, shipped);
  EXPECT_EQ(textOf(result.execution.failures), "");
  EXPECT_EQ(textOf(result.execution.inNewsLayout),
            "== V3.system.at\nattributetypes=( 9.1 NAME 'a' USAGE u )\n== V3.user.at\n");
}

TEST(Execution, WhatIsAddedTakesTheLineEndsOfItsFile) {
  const std::string first = "attributetypes=( 1.1 NAME 'a' USAGE u )";
  const std::string own = "attributetypes=( 9.1 NAME 'b' USAGE u )";
  const Outcome toReturns =
      run({{"V3.user.at", first + "\r\n"}}, {{"V3.user.at", first + "\n# ours\n" + own + "\n"}},
          {{"V3.user.at", first + "\r\n"}});
  EXPECT_EQ(textOf(toReturns.execution.failures), "");
  EXPECT_EQ(textOf(toReturns.execution.inNewsLayout),
            "== V3.user.at\n" + first +
                "\r\n# Carried over from the installation before the migration:\r\n# ours\r\n" +
                own + "\r\n");
  const Outcome fromReturns =
      run({{"V3.user.at", first + "\n"}}, {{"V3.user.at", first + "\r\n# ours\r\n" + own + "\r\n"}},
          {{"V3.user.at", first + "\n"}});
  EXPECT_EQ(textOf(fromReturns.execution.failures), "");
  EXPECT_EQ(textOf(fromReturns.execution.inNewsLayout),
            "== V3.user.at\n" + first +
                "\n# Carried over from the installation before the migration:\n# ours\n" + own +
                "\n");
}

// Only the clauses that differ are written anew.
TEST(Execution, AMergedDefinitionKeepsTheTextOfNews) {
  const std::string plain =
      "attributetypes=( 1.1 NAME 'a' # of the standard\n  DESC 'd'\n  USAGE u )\n";
  const std::string sites = "attributetypes=( 1.1 NAME ( 'a' 'mine' ) DESC 'd' USAGE u )\n";
  const std::string releases =
      "attributetypes=( 1.1   NAME 'a' # X-ORIGIN 'RFC 1'\n  DESC 'new'\n  USAGE u )\n";
  const Outcome result =
      run({{"V3.user.at", plain}}, {{"V3.user.at", sites}}, {{"V3.user.at", releases}});
  EXPECT_EQ(textOf(result.execution.failures), "");
  EXPECT_EQ(textOf(result.execution.inNewsLayout),
            "== V3.user.at\n"
            "attributetypes=( 1.1   NAME ( 'a' 'mine' ) # X-ORIGIN 'RFC 1'\n  DESC 'new'\n"
            "  USAGE u )\n");
}

// ---- Generated triples ----

class Generator {
 public:
  explicit Generator(unsigned seed) : m_random(seed) {}

  std::vector<NamedText> base() {
    m_base = {};
    for (int number = 0; number < 12; ++number) {
      m_base.push_back({number, 0});
    }
    return textsOf(m_base, "");
  }
  // A changed copy: some removed, some changed, some of its own.
  std::vector<NamedText> variant(const std::string& who) {
    std::vector<Item> items;
    for (Item item : m_base) {
      const int chance = pick(10);
      if (chance == 0) {
        continue;
      }
      if (chance < 4) {
        item.change = 1 + pick(5);
      }
      items.push_back(item);
    }
    return textsOf(items, who);
  }

 private:
  struct Item {
    int number;
    int change;
  };

  int pick(int count) { return static_cast<int>(m_random() % static_cast<unsigned>(count)); }

  static std::string typeOf(const Item& item, const std::string& who) {
    const std::string number = std::to_string(item.number);
    return "attributetypes=( 1." + number + " NAME " +
           (item.change == 1 ? "( 'a" + number + "' 'x" + who + number + "' )"
                             : "'a" + number + "'") +
           (item.change == 2 ? " DESC 'by " + who + "'" : "") +
           (item.change == 3 ? " SINGLE-VALUE" : "") + " USAGE " + (item.change == 4 ? who : "u") +
           " )\n" + "ORVAttributetypes=( 1." + number + " DBNAME ( 'a" + number +
           "' ) ACCESS-CLASS " + (item.change == 5 ? who : "normal") + " )\n";
  }
  static std::string classOf(const Item& item, const std::string& who) {
    const std::string number = std::to_string(item.number);
    return "objectclasses=( 2." + number + " NAME 'c" + number + "' STRUCTURAL MUST ( a" + number +
           " ) MAY ( a1" + (item.change == 1 ? " $ " + who + "1" : "") +
           (item.change == 2 ? "" : " $ a2") + " ) )\n";
  }

  static std::vector<NamedText> textsOf(const std::vector<Item>& items, const std::string& who) {
    std::string system;
    std::string user;
    for (const Item& item : items) {
      (item.number % 3 == 0 ? user : system) += typeOf(item, who) + classOf(item, who);
    }
    if (!who.empty()) {
      const std::string own = who == "site" ? "8" : "7";
      user += "attributetypes=( " + own + ".1 NAME '" + who + "1' SUP a3 USAGE u )\n" +
              "objectclasses=( " + own + ".2 NAME '" + who + "2' SUP c4 STRUCTURAL MAY ( " + who +
              "1 $ a5 ) )\n";
    }
    return {{"V3.system.at", system}, {"V3.user.at", user}};
  }

  std::mt19937 m_random;
  std::vector<Item> m_base;
};

class GeneratedTriples : public ::testing::TestWithParam<unsigned> {};

TEST_P(GeneratedTriples, AnExecutedPlanIsThePlan) {
  Generator generator(GetParam());
  const std::vector<NamedText> base = generator.base();
  const std::vector<NamedText> old = generator.variant("site");
  const std::vector<NamedText> latest = generator.variant("release");
  const Outcome result = run(base, old, latest);
  EXPECT_EQ(textOf(result.execution.failures), "");
  EXPECT_EQ(textOf(result.execution.notCarriedByLibrary), "");
}

TEST_P(GeneratedTriples, AMigrationOfTheResultChangesNoDefinition) {
  Generator generator(GetParam());
  const std::vector<NamedText> base = generator.base();
  const std::vector<NamedText> old = generator.variant("site");
  const std::vector<NamedText> latest = generator.variant("release");
  const Outcome first = run(base, old, latest);
  const Outcome second = run(base, first.execution.inNewsLayout, latest);
  EXPECT_EQ(textOf(second.execution.failures), "");
  const auto definitions = [](const Outcome& from) {
    const Installation result = installationOf("result", from.execution.inNewsLayout);
    std::vector<std::string> all;
    for (const migration::Entry& entry : result.entries()) {
      all.push_back(migration::textOf(migration::contentOf(*entry.kept)));
    }
    std::sort(all.begin(), all.end());
    return all;
  };
  EXPECT_EQ(definitions(first), definitions(second));
}

INSTANTIATE_TEST_SUITE_P(Seeds, GeneratedTriples, ::testing::Range(0U, 60U));

}  // namespace
