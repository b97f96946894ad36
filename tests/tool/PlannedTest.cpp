// diff, plan and migrate with BASE: what an administrator sees and gets.

#include <gtest/gtest.h>
#include <sys/wait.h>

#include <cstdlib>
#include <filesystem>
#include <string>
#include <vector>

#include "Files.h"
#include "ToolRun.h"

namespace {

std::string at(const std::string& rest) { return "attributetypes=( " + rest + " )\n"; }
std::string oc(const std::string& rest) { return "objectclasses=( " + rest + " )\n"; }
std::string orv(const std::string& rest) { return "ORVAttributetypes=( " + rest + " )\n"; }

const std::string kBaseTypes = at("1.1 NAME 'a' DESC 'd' USAGE userApplications") +
                               at("1.2 NAME 'b' DESC 'd' USAGE userApplications") +
                               orv("1.2 DBNAME ( 'b' 'b' ) ACCESS-CLASS normal LENGTH 8");
const std::string kBaseClasses =
    oc("2.1 NAME 'c' STRUCTURAL MAY ( a )") + oc("2.2 NAME 'e' STRUCTURAL MAY ( a )");

// The site changed `a` and c's list and added a class; the release changed `b`, c's list and `e`.
class Planned : public ::testing::Test {
 protected:
  Planned() {
    m_folder.install("base", {{"V3.system.at", kBaseTypes}, {"V3.system.oc", kBaseClasses}});
    m_folder.install(
        "old", {{"V3.system.at", at("1.1 NAME 'a' DESC 'd' SINGLE-VALUE USAGE "
                                    "userApplications") +
                                     at("1.2 NAME 'b' DESC 'd' USAGE "
                                        "userApplications") +
                                     orv("1.2 DBNAME ( 'b' 'b' ) ACCESS-CLASS normal "
                                         "LENGTH 8")},
                {"V3.system.oc", oc("2.1 NAME 'c' STRUCTURAL MAY ( a $ s )") +
                                     oc("2.2 NAME 'e' STRUCTURAL MAY ( a )")},
                {"V3.user.at", at("9.1 NAME 's' USAGE userApplications")},
                {"V3.user.oc", "# Guards.\n" + oc("9.2 NAME 'guard' SUP c STRUCTURAL MAY ( s )")}});
    m_folder.install(
        "new",
        {{"V3.system.at", "# The release.\n" + at("1.1 NAME 'a' DESC 'd' USAGE userApplications") +
                              at("1.2 NAME 'b' DESC 'better' USAGE userApplications") +
                              orv("1.2 DBNAME ( 'b' 'b' ) ACCESS-CLASS normal LENGTH 8")},
         {"V3.system.oc", oc("2.1 NAME 'c' STRUCTURAL MAY ( b $ a )") +
                              oc("2.2 NAME 'e' STRUCTURAL MAY ( a $ b )")}});
  }

  ToolResult run(const std::string& command, std::vector<std::string> more = {}) const {
    std::vector<std::string> arguments = {command, "--from", "@/old", "--to", "@/new"};
    arguments.insert(arguments.end(), more.begin(), more.end());
    return m_folder.run(arguments);
  }

  ToolFolder m_folder;
};

TEST_F(Planned, DiffTellsWhoChangedWhat) {
  const ToolResult result = run("diff", {"--base", "@/base"});
  EXPECT_EQ(result.err, "");
  EXPECT_EQ(result.out,
            "attribute type a (1.1): changed by site -> old [data]\n"
            "  only the site changed it\n"
            "  BASE V3.system.at:1, OLD V3.system.at:1, NEW V3.system.at:2\n"
            "  SINGLE-VALUE\n"
            "    old     SINGLE-VALUE\n"
            "    result  SINGLE-VALUE\n"
            "\n"
            "attribute type b (1.2): changed by release -> new [cosmetic]\n"
            "  only the release changed it\n"
            "  BASE V3.system.at:2, OLD V3.system.at:2, NEW V3.system.at:3\n"
            "  DESC\n"
            "    base    'd'\n"
            "    old     'd'\n"
            "    new     'better'\n"
            "    result  'better'\n"
            "\n"
            "attribute type s (9.1): added by site -> added [structure]\n"
            "  the site added it\n"
            "  OLD V3.user.at:1\n"
            "\n"
            "object class c (2.1): changed by both, mergeable -> merged [structure]\n"
            "  the site and the release changed different parts of it\n"
            "  BASE V3.system.oc:1, OLD V3.system.oc:1, NEW V3.system.oc:1\n"
            "  MAY\n"
            "    base    a\n"
            "    old     a $ s\n"
            "    new     b $ a\n"
            "    result  b $ a $ s\n"
            "\n"
            "object class e (2.2): changed by release -> new [structure]\n"
            "  only the release changed it\n"
            "  BASE V3.system.oc:2, OLD V3.system.oc:2, NEW V3.system.oc:2\n"
            "  MAY\n"
            "    base    a\n"
            "    old     a\n"
            "    new     a $ b\n"
            "    result  a $ b\n"
            "\n"
            "object class guard (9.2): added by site -> added [structure]\n"
            "  the site added it\n"
            "  OLD V3.user.oc:2\n"
            "\n"
            "6 differences in 7 definitions, by who changed them:\n"
            "  2 added by site\n"
            "  1 changed by both, mergeable\n"
            "  2 changed by release\n"
            "  1 changed by site\n"
            "and by what comes of them:\n"
            "  2 added\n"
            "  1 merged\n"
            "  2 new\n"
            "  1 old\n");
  EXPECT_EQ(result.exitCode, 1);
}

TEST_F(Planned, DiffLeavesOutWhatIsNotAskedFor) {
  const struct {
    std::vector<std::string> options;
    const char* count;
    int exitCode;
  } cases[] = {
      {{"guard"}, "1 difference in 7 definitions", 1},
      {{"GUARD", "1.1"}, "2 differences in 7 definitions", 1},
      {{"nothing"}, "0 differences in 7 definitions", 1},
      {{"b"}, "1 difference in 7 definitions", 1},
      {{"--kind", "object-class"}, "3 differences in 7 definitions", 1},
      {{"--class", "added-by-site"}, "2 differences in 7 definitions", 1},
      {{"--class", "same"}, "1 difference in 7 definitions", 0},
      {{"--risk", "data"}, "1 difference in 7 definitions", 1},
      {{"--ignore", "desc"}, "5 differences in 7 definitions", 1},
      {{"--stat"}, "6 differences in 7 definitions", 1},
  };
  for (const auto& row : cases) {
    std::vector<std::string> options = {"--base", "@/base"};
    options.insert(options.end(), row.options.begin(), row.options.end());
    const ToolResult result = run("diff", options);
    SCOPED_TRACE(row.options.front());
    EXPECT_NE(result.out.find(row.count), std::string::npos) << result.out << result.err;
    EXPECT_EQ(result.exitCode, row.exitCode);
  }
}

TEST_F(Planned, DiffOfAnUnknownNameTellsWhatMayHaveBeenMeant) {
  const ToolResult result = run("diff", {"--base", "@/base", "guerd", "c"});
  EXPECT_EQ(result.err, "schema-migrate: error: nothing here is called guerd; near it: guard\n");
  EXPECT_NE(result.out.find("1 difference in 7 definitions"), std::string::npos) << result.out;
  EXPECT_EQ(result.exitCode, 1);
}

// What is removed differs in more than its DESC.
TEST_F(Planned, DiffThatIgnoresDescTellsWhatWasRemoved) {
  m_folder.install("base", {{"V3.user.at", at("5.1 NAME 'z' DESC 'd' USAGE u")}});
  m_folder.install("old", {{"V3.user.at", at("5.1 NAME 'z' DESC 'e' USAGE u")}});
  m_folder.install("new", {{"V3.user.at", at("5.2 NAME 'y' DESC 'd' USAGE u")}});
  const ToolResult result =
      run("diff", {"--base", "@/base", "--ignore", "desc", "--class", "removed-by-release"});
  EXPECT_NE(result.out.find("attribute type z (5.1): removed by release -> undecided"),
            std::string::npos)
      << result.out;
  EXPECT_EQ(result.exitCode, 1);
}

// Everything in one run: also what stands in OLD a second time, and does not count.
TEST_F(Planned, PlanTellsTheFindingsOnItsInputs) {
  m_folder.install("old", {{"V3.user.at", at("9.1 NAME 's' USAGE userApplications") +
                                              at("9.2 NAME 'S' USAGE userApplications")},
                           {"V3.more", ""}});
  const ToolResult result = run("plan", {"--base", "@/base", "--exclude-oids", "@/oids"});
  EXPECT_EQ(result.exitCode, 3);
  m_folder.write("oids", "9.9\n");
  const ToolResult listed = run("plan", {"--base", "@/base", "--exclude-oids", "@/oids"});
  const std::string findings = listed.out + listed.err;
  for (const char* const finding :
       {"V3.user.at:2:", "[T301]", "V3.more", "[I702]", "oids:1:1", "[O503]"}) {
    EXPECT_NE(findings.find(finding), std::string::npos) << finding << "\n" << findings;
  }
}

// A habit of writing is told once for each side, and counted; the document has each place.
TEST_F(Planned, PlanCountsTheWarningsThatSayTheSame) {
  std::string comments;
  for (int number = 0; number < 4; ++number) {
    comments += "# one\n" + at("3." + std::to_string(number) + " NAME 'x" + std::to_string(number) +
                               "' USAGE userApplications");
  }
  for (const char* const side : {"base", "old", "new"}) {
    m_folder.write(side + std::string("/V3.config.at"), comments);
  }
  const ToolResult result = run("plan", {"--base", "@/base"});
  const auto count = [&](const std::string& text, const std::string& wanted) {
    std::size_t number = 0;
    for (std::size_t at = text.find(wanted); at != std::string::npos;
         at = text.find(wanted, at + 1)) {
      ++number;
    }
    return number;
  };
  EXPECT_EQ(3U, count(result.out, "V3.config.at is read but never written")) << result.out;
  EXPECT_NE(std::string::npos, result.out.find("@/base: warning: 3 more like this [T305]\n"));
  EXPECT_NE(std::string::npos,
            result.out.find("Each of them is told by check, and by --format json and --html.\n"));
  const std::string document = run("plan", {"--base", "@/base", "--format", "json"}).out;
  EXPECT_EQ(12U, count(document, "V3.config.at is read but never written"));
}

// Where one directory is two of the inputs.
TEST_F(Planned, AFindingIsToldOnce) {
  m_folder.write("new/V3.config.at", at("3.1 NAME 'x' USAGE userApplications"));
  const std::string document =
      run("plan", {"--base", "@/new", "--accept-base", "--format", "json"}).out;
  const std::size_t first = document.find("V3.config.at is read but never written");
  EXPECT_NE(std::string::npos, first);
  EXPECT_EQ(std::string::npos, document.find("V3.config.at is read but never written", first + 1));
}

TEST_F(Planned, DiffOfANameTellsItsExtensionToo) {
  m_folder.write("old/V3.system.at",
                 at("1.1 NAME 'a' DESC 'd' USAGE userApplications") +
                     at("1.2 NAME 'b' DESC 'better' USAGE userApplications") +
                     orv("1.2 DBNAME ( 'b' 'b' ) ACCESS-CLASS normal LENGTH 9"));
  const ToolResult result = run("diff", {"--base", "@/base", "b"});
  EXPECT_EQ(0U,
            result.out.find("vendor extension of b (1.2): changed by site -> old [structure]\n"))
      << result.out;
  EXPECT_EQ(std::string::npos, result.out.find("attribute type")) << result.out;
  EXPECT_EQ(1, result.exitCode);
}

TEST_F(Planned, APageInTheOutputIsAnErrorOfUsage) {
  std::filesystem::create_directory(m_folder.file("out"));
  for (const char* const option : {"--out", "--record"}) {
    const bool isRecord = option == std::string("--record");
    const std::string other = isRecord ? "@/record" : "@/out";
    const ToolResult result = run("migrate", {"--base", "@/base", "--out", "@/out", "--record",
                                              "@/record", "--html", other + "/page.html"});
    EXPECT_EQ(2, result.exitCode);
    EXPECT_EQ("schema-migrate: error: --html " + other + "/page.html lies in the directory that " +
                  option + " creates; name a file elsewhere\n",
              result.err);
  }
  EXPECT_TRUE(std::filesystem::is_empty(m_folder.file("out")));
}

TEST_F(Planned, MigrateCarriesTheSitesChangesAndKeepsTheReleases) {
  const ToolResult result = run("migrate", {"--base", "@/base", "--out", "@/out"});
  EXPECT_EQ(result.err, "");
  EXPECT_EQ(result.exitCode, 0);
  EXPECT_NE(result.out.find("\nWritten and verified: @/out\n"), std::string::npos) << result.out;
  EXPECT_EQ(
      m_folder.contents("out"),
      (ToolFolder::Files{
          {"V3.system.at", "# The release.\n" +
                               at("1.1 NAME 'a' DESC 'd' SINGLE-VALUE USAGE userApplications") +
                               at("1.2 NAME 'b' DESC 'better' USAGE userApplications") +
                               orv("1.2 DBNAME ( 'b' 'b' ) ACCESS-CLASS normal LENGTH 8")},
          {"V3.system.oc", "objectclasses=( 2.1 NAME 'c' STRUCTURAL MAY ( b $ a $ s ) )\n" +
                               oc("2.2 NAME 'e' STRUCTURAL MAY ( a $ b )")},
          {"V3.user.at", "# Carried over from the installation before the migration:\n" +
                             at("9.1 NAME 's' USAGE userApplications")},
          {"V3.user.oc", "# Carried over from the installation before the migration:\n# Guards.\n" +
                             oc("9.2 NAME 'guard' SUP c STRUCTURAL MAY ( s )")}}));
}

TEST_F(Planned, TheLibrarysLayoutHoldsTheSameDefinitions) {
  ASSERT_EQ(run("migrate", {"--base", "@/base", "--out", "@/out", "--layout", "library"}).exitCode,
            0);
  const ToolFolder::Files files = m_folder.contents("out");
  EXPECT_EQ(files.at("V3.user.oc"),
            "# File generated by 6.1 migration TIME\n"
            "objectclasses=( 9.2 NAME 'guard' SUP ( c ) STRUCTURAL MAY ( s ) )\n");
  EXPECT_EQ(files.at("V3.system.oc"),
            "# File generated by 6.1 migration TIME\n"
            "objectclasses=( 2.1 NAME 'c' STRUCTURAL MAY ( b $ a $ s ) )\n"
            "objectclasses=( 2.2 NAME 'e' STRUCTURAL MAY ( a $ b ) )\n");
}

TEST_F(Planned, ADryRunDoesEverythingButPublish) {
  const ToolResult result = run("migrate", {"--base", "@/base", "--out", "@/out", "--dry-run"});
  EXPECT_EQ(result.err, "");
  EXPECT_EQ(result.exitCode, 0);
  EXPECT_NE(result.out.find("\nVerified, but not written, as this was a dry run: @/out\n"),
            std::string::npos);
  EXPECT_EQ(m_folder.names(), "base new old");
}

TEST_F(Planned, WhatIsUndecidedIsRefused) {
  const ToolResult plan = run("plan");
  EXPECT_EQ(plan.exitCode, 4);
  EXPECT_EQ(plan.err,
            "schema-migrate: error: undecided: attribute type a (1.1): OLD and NEW differ, and "
            "without BASE nobody can tell who changed: SINGLE-VALUE\n"
            "schema-migrate: error: undecided: object class c (2.1): OLD and NEW differ, and "
            "without BASE nobody can tell who changed: MAY\n"
            "schema-migrate: error: undecided: object class e (2.2): OLD and NEW differ, and "
            "without BASE nobody can tell who changed: MAY\n");
  EXPECT_NE(plan.out.find("Not ready: 3 definitions undecided, 0 other reasons.\n"),
            std::string::npos)
      << plan.out;
  m_folder.write("none.toml", "# nothing\n");
  const ToolResult migrate = run("migrate", {"--out", "@/out", "--decisions", "@/none.toml"});
  EXPECT_EQ(migrate.exitCode, 4);
  EXPECT_EQ(m_folder.names(), "base new none.toml old");
}

TEST_F(Planned, ATemplateIsFilledInAndTaken) {
  ASSERT_EQ(run("plan", {"--template", "@/decisions.toml"}).exitCode, 4);
  std::string text = support::readWholeFile(m_folder.file("decisions.toml"));
  EXPECT_NE(text.find("# OLD   ( 1.1 NAME ( 'a' ) DESC 'd' SINGLE-VALUE USAGE userApplications )  "
                      "(V3.system.at:1)\n"),
            std::string::npos)
      << text;
  EXPECT_NE(text.find("# take: \"old\" or \"new\" or \"drop\"\n"), std::string::npos);
  // Nothing is chosen yet, and none may be forgotten.
  const ToolResult empty = run("plan", {"--decisions", "@/decisions.toml"});
  EXPECT_EQ(empty.exitCode, 3);
  EXPECT_NE(empty.err.find("nothing is decided"), std::string::npos) << empty.err;
  const std::string rest = "reason = \"\"\n";
  std::string decided;
  for (const char* const take : {"old", "merged", "merged"}) {
    const std::size_t end = text.find(rest) + rest.size();
    decided += text.substr(0, end) + "take = \"" + take + "\"\n";
    text.erase(0, end);
  }
  text = decided + text;
  m_folder.write("decisions.toml", text);
  const ToolResult plan = run("plan", {"--decisions", "@/decisions.toml"});
  EXPECT_EQ(plan.err, "");
  EXPECT_EQ(plan.exitCode, 0);
  EXPECT_NE(plan.out.find("Ready: every definition is decided.\n"), std::string::npos);
  EXPECT_NE(plan.out.find("  decided   @/decisions.toml:"), std::string::npos) << plan.out;
}

TEST_F(Planned, APreferenceDecides) {
  const ToolResult result = run("migrate", {"--prefer", "new", "--out", "@/out"});
  EXPECT_EQ(result.err, "");
  EXPECT_EQ(result.exitCode, 0);
  EXPECT_EQ(
      m_folder.contents("out").at("V3.system.oc"),
      oc("2.1 NAME 'c' STRUCTURAL MAY ( b $ a )") + oc("2.2 NAME 'e' STRUCTURAL MAY ( a $ b )"));
}

TEST_F(Planned, ABaseThatEqualsOldIsDoubted) {
  const ToolResult doubted = run("plan", {"--base", "@/old"});
  EXPECT_EQ(doubted.exitCode, 4);
  EXPECT_NE(doubted.err.find("BASE equals OLD definition by definition"), std::string::npos)
      << doubted.err;
  EXPECT_EQ(run("diff", {"--base", "@/old", "--stat"}).exitCode, 4);
  EXPECT_EQ(run("diff", {"--base", "@/old", "--accept-base", "--stat"}).exitCode, 1);
}

// Referrer, clause, missing name, and what caused it.
TEST_F(Planned, WhatTheResultWouldBreakIsRefused) {
  m_folder.write("excluded", "# of the site\n9.1\n");
  for (const char* const command : {"plan", "migrate"}) {
    std::vector<std::string> more = {"--base", "@/base", "--exclude-oids", "@/excluded"};
    if (std::string(command) == "migrate") {
      more.insert(more.end(), {"--out", "@/out"});
    }
    const ToolResult result = run(command, more);
    EXPECT_EQ(result.exitCode, 4);
    EXPECT_NE(
        result.err.find(
            "result/V3.system.oc:1:55: error: MAY of object class c (2.1) names s, which is not in "
            "the result: attribute type s (9.1) is excluded at @/excluded:2; decide otherwise about "
            "one of the two (new in this result) [R401]\n"),
        std::string::npos)
        << result.err;
    EXPECT_NE(
        result.err.find(
            "error: MAY of object class guard (9.2) names s, which is not in the result: attribute "
            "type s (9.1) is excluded at @/excluded:2; decide otherwise about one of the two (new "
            "in this result) [R401]\n"),
        std::string::npos)
        << result.err;
  }
  EXPECT_EQ(m_folder.names(), "base excluded new old");
}

TEST_F(Planned, WhatADecisionWouldBreakNamesTheDecision) {
  m_folder.write("decisions.toml",
                 "[[definition]]\nkind = \"attribute-type\"\nname = \"s\"\ntake = \"drop\"\n");
  const ToolResult result = run("plan", {"--base", "@/base", "--decisions", "@/decisions.toml"});
  EXPECT_EQ(result.exitCode, 4);
  EXPECT_NE(result.err.find("names s, which is not in the result: attribute type s (9.1) is left "
                            "out, as "),
            std::string::npos)
      << result.err;
  EXPECT_NE(result.err.find(", decided at @/decisions.toml:1; decide otherwise"), std::string::npos)
      << result.err;
}

// A name that the site's class refers to is another definition's in the result.
TEST_F(Planned, ANameThatMeansSomethingElseIsRefused) {
  m_folder.write("new/V3.user.at", at("7.1 NAME 's' SINGLE-VALUE USAGE userApplications"));
  m_folder.write("excluded", "9.1\n");
  const ToolResult result = run("plan", {"--base", "@/base", "--exclude-oids", "@/excluded"});
  EXPECT_EQ(result.exitCode, 4);
  EXPECT_NE(result.err.find("error: MAY of object class guard (9.2) names s, which is attribute "
                            "type s (9.1) in OLD and attribute type s (7.1) in the result"),
            std::string::npos)
      << result.err;
  EXPECT_NE(result.err.find("(new in this result) [R404]\n"), std::string::npos) << result.err;
}

// ---- Before: what the library would read otherwise than it is written ----

class LossyInput : public Planned {
 protected:
  LossyInput() {
    m_folder.write("old/V3.user.oc", oc("9.2 NAME 'guard' SUP c STRUCTURAL MAY s") +
                                         oc("9.3 NAME 'other' SUP c STRUCTURAL MAY ( s )"));
  }
  std::vector<std::string> withBase(std::vector<std::string> more) const {
    more.insert(more.end(), {"--base", "@/base"});
    return more;
  }
};

TEST_F(LossyInput, Refuses) {
  for (const char* const command : {"plan", "migrate"}) {
    const ToolResult result = run(command, withBase(std::string(command) == "migrate"
                                                        ? std::vector<std::string>{"--out", "@/out"}
                                                        : std::vector<std::string>()));
    EXPECT_TRUE(result.exitCode == 3 || result.exitCode == 4) << result.exitCode;
    EXPECT_NE(result.err.find("@/old/V3.user.oc:1:"), std::string::npos) << result.err;
    EXPECT_NE(result.err.find("[D208]\n"), std::string::npos) << result.err;
  }
  EXPECT_EQ(m_folder.names(), "base new old");
}

TEST_F(LossyInput, IsMendedInAPrivateCopy) {
  const ToolFolder::Files before = m_folder.contents("old");
  const ToolResult result = run("migrate", withBase({"--repair", "--out", "@/out"}));
  EXPECT_EQ(result.err, "");
  EXPECT_EQ(result.exitCode, 0);
  EXPECT_NE(result.out.find("@/old/V3.user.oc:1:"), std::string::npos) << result.out;
  EXPECT_NE(result.out.find(": mended in a private copy: "), std::string::npos) << result.out;
  EXPECT_NE(m_folder.contents("out").at("V3.user.oc").find(" MAY ( s ) )\n"), std::string::npos);
  EXPECT_EQ(m_folder.contents("old"), before);
  EXPECT_EQ(run("plan", withBase({"--repair"})).exitCode, 0);
}

TEST_F(Planned, WhatTheSettingsAcceptIsNoRefusal) {
  m_folder.write("old/V3.user.at", at("9.1 NAME 's' USAGE userApplications") + "a note\n");
  const ToolResult refused = run("plan", {"--base", "@/base"});
  EXPECT_EQ(refused.exitCode, 4);
  EXPECT_NE(refused.err.find("@/old/V3.user.at:2:1: error: "), std::string::npos) << refused.err;
  m_folder.write("old/.schema-migrate.toml",
                 "[[accepted]]\nrule = \"L105\"\nfile = \"V3.user.at\"\nline = 2\n"
                 "reason = \"a note of ours\"\n");
  const ToolResult result = run("plan", {"--base", "@/base"});
  EXPECT_EQ(result.err, "");
  EXPECT_EQ(result.exitCode, 0);
  // By place: at another line it is another one.
  m_folder.write("old/V3.user.at", "\n" + at("9.1 NAME 's' USAGE userApplications") + "a note\n");
  EXPECT_EQ(run("plan", {"--base", "@/base"}).exitCode, 4);
}

TEST_F(Planned, JsonFollowsItsSchema) {
  if (std::system("python3 -c 'import jsonschema' 2>/dev/null") != 0) {
    GTEST_SKIP() << "needs python3-jsonschema";
  }
  for (const std::vector<std::string>& arguments :
       {std::vector<std::string>{"diff", "--base", "@/base"},
        std::vector<std::string>{"plan", "--base", "@/base"}, std::vector<std::string>{"plan"},
        std::vector<std::string>{"migrate", "--base", "@/base", "--out", "@/out"}}) {
    std::vector<std::string> more(arguments.begin() + 1, arguments.end());
    more.insert(more.end(), {"--format", "json"});
    const ToolResult result = run(arguments.front(), more);
    m_folder.write("document.json", result.out);
    const std::string command =
        "python3 -c \"import json,jsonschema;jsonschema.validate(json.load("
        "open('" +
        m_folder.file("document.json") + "')),json.load(open('" PLAN_SCHEMA "')))\"";
    EXPECT_EQ(std::system(command.c_str()), 0) << result.out;
  }
}

}  // namespace
