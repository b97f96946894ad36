// verify: an output against its plan and the plan's inputs.

#include <gtest/gtest.h>
#include <sys/stat.h>

#include <filesystem>
#include <nlohmann/json.hpp>
#include <utility>

#include "Files.h"
#include "Json.h"
#include "PlannedFolder.h"

namespace {

class Verify : public testing::Test {
 protected:
  Verify() {
    EXPECT_EQ(0, m_folder.runPlanned("plan", {"--save", "@/plan.json"}).exitCode);
    EXPECT_EQ(0, m_folder.runPlanned("migrate", {"--out", "@/out"}).exitCode);
  }

  void migrateInLibraryLayout() {
    std::filesystem::remove_all(m_folder.file("out"));
    EXPECT_EQ(0,
              m_folder.runPlanned("migrate", {"--out", "@/out", "--layout", "library"}).exitCode);
  }

  ToolResult verify() const { return m_folder.run({"verify", "--plan", "@/plan.json", "@/out"}); }

  void edit(const std::string& file, const std::string& from, const std::string& to) const {
    m_folder.write(file, replaced(support::readWholeFile(m_folder.file(file)), from, to));
  }

  PlannedFolder m_folder;
};

TEST_F(Verify, WhatWasMigratedIsVerified) {
  const std::string before = m_folder.snapshot();
  const ToolResult result = verify();
  EXPECT_EQ("", result.err);
  EXPECT_EQ(
      "Verified: @/out is what @/plan.json says: 7 definitions in 5 files, laid out as "
      "NEW's.\n",
      result.out);
  EXPECT_EQ(0, result.exitCode);
  EXPECT_EQ(before, m_folder.snapshot());
  EXPECT_EQ("", m_folder.privateCopies());
}

TEST_F(Verify, TheLibrarysLayoutIsVerified) {
  migrateInLibraryLayout();
  const ToolResult result = verify();
  EXPECT_EQ("", result.err);
  EXPECT_EQ(
      "Verified: @/out is what @/plan.json says: 7 definitions in 8 files, as the library "
      "writes them.\n",
      result.out);
  EXPECT_EQ(0, result.exitCode);
  EXPECT_EQ("", m_folder.privateCopies());
}

TEST_F(Verify, TheDocumentTellsWhatTheTextTells) {
  const auto document = [&] {
    const ToolResult result =
        m_folder.run({"verify", "--plan", "@/plan.json", "@/out", "--format", "json"});
    EXPECT_EQ("", result.err);
    if (canValidateJson()) {
      EXPECT_EQ("", problemsOf(result.out, VERIFY_SCHEMA));
    }
    return std::pair(nlohmann::json::parse(result.out), result.exitCode);
  };
  const auto [good, done] = document();
  EXPECT_EQ(0, done);
  EXPECT_EQ(true, good.at("verified"));
  EXPECT_EQ("keep", good.at("layout"));
  EXPECT_EQ(nlohmann::json::array(), good.at("differences"));
  EXPECT_EQ(7, good.at("counts").at("definitions"));

  edit("out/V3.system.at", "SINGLE-VALUE", "SYNTAX 1.2{3}");
  const auto [bad, found] = document();
  EXPECT_EQ(1, found);
  EXPECT_EQ(false, bad.at("verified"));
  ASSERT_EQ(2U, bad.at("differences").size());
  const nlohmann::json& difference = bad.at("differences").front();
  EXPECT_EQ("@/out/V3.system.at", difference.at("file"));
  EXPECT_EQ(nlohmann::json(
                {{{"clause", "SYNTAX"}, {"planned", nullptr}, {"found", "1.2{3}"}},
                 {{"clause", "SINGLE-VALUE"}, {"planned", "SINGLE-VALUE"}, {"found", nullptr}}}),
            difference.at("clauses"));
  const std::string text = verify().out;
  for (const nlohmann::json& each : bad.at("differences")) {
    EXPECT_NE(std::string::npos, text.find(each.at("text").get<std::string>())) << text;
  }
}

// A release that the library wrote: its files begin as the library's do, in either layout.
TEST_F(Verify, ALayoutIsKnownAlsoWhereNewIsTheLibrarys) {
  ASSERT_EQ(0, m_folder
                   .run({"migrate", "--base", "@/base", "--accept-base", "--from", "@/base", "--to",
                         "@/new", "--layout", "library", "--out", "@/release"})
                   .exitCode);
  for (const char* const layout : {"keep", "library"}) {
    std::filesystem::remove_all(m_folder.file("out"));
    ASSERT_EQ(0, m_folder
                     .run({"plan", "--base", "@/base", "--from", "@/old", "--to", "@/release",
                           "--save", "@/plan.json"})
                     .exitCode);
    ASSERT_EQ(0, m_folder
                     .run({"migrate", "--base", "@/base", "--from", "@/old", "--to", "@/release",
                           "--layout", layout, "--out", "@/out"})
                     .exitCode);
    const ToolResult result = verify();
    EXPECT_EQ(0, result.exitCode) << layout << "\n" << result.out;
  }
}

struct Row {
  const char* name;
  const char* file;
  const char* from;
  const char* to;
  const char* told;  // but for the last line
};

void PrintTo(const Row& row, std::ostream* out) { *out << row.name; }

const std::string kTypeS = at("9.1 NAME 's' USAGE userApplications");

const Row kRows[] = {
    {"AChangedClause", "out/V3.system.at", "'better'", "'worse'",
     "@/out/V3.system.at:3: attribute type b (1.2) is not what was planned (new: only the release "
     "changed it)\n"
     "  DESC\n"
     "    planned 'better'\n"
     "    found   'worse'\n"
     "@/out/V3.system.at:3: from here on the file is not, byte for byte, what was planned\n"},
    {"AClauseThatIsGone", "out/V3.system.at", " SINGLE-VALUE", "",
     "@/out/V3.system.at:2: attribute type a (1.1) is not what was planned (old: only the site "
     "changed it)\n"
     "  SINGLE-VALUE\n"
     "    planned SINGLE-VALUE\n"
     "    found   (none)\n"
     "@/out/V3.system.at:2: from here on the file is not, byte for byte, what was planned\n"},
    {"EveryClauseOfOne", "out/V3.system.oc", "STRUCTURAL MAY ( b $ a $ s )",
     "SUP guard ABSTRACT MAY ( s $ a )",
     "@/out/V3.system.oc:1: object class c (2.1) is not what was planned (merged: the site and the "
     "release changed different parts of it)\n"
     "  SUP\n"
     "    planned (none)\n"
     "    found   guard\n"
     "  KIND\n"
     "    planned STRUCTURAL\n"
     "    found   ABSTRACT\n"
     "  MAY\n"
     "    planned b $ a $ s\n"
     "    found   s $ a\n"
     "@/out/V3.system.oc:1: from here on the file is not, byte for byte, what was planned\n"
     "FINDINGS"},
    {"AVendorExtension", "out/V3.system.at", "LENGTH 8", "LENGTH 9",
     "@/out/V3.system.at:4: vendor extension 1.2 is not what was planned (same: nobody changed it)\n"
     "  LENGTH\n"
     "    planned 8\n"
     "    found   9\n"
     "@/out/V3.system.at:4: from here on the file is not, byte for byte, what was planned\n"},
    {"AMissingDefinition", "out/V3.user.oc",
     "objectclasses=( 9.2 NAME 'guard' SUP c STRUCTURAL MAY ( s ) )\n", "",
     "@/out/V3.user.oc: object class guard (9.2) is missing (added: the site added it)\n"
     "@/out/V3.user.oc:3: from here on the file is not, byte for byte, what was planned\n"},
    {"AnAdditionalDefinition", "out/V3.user.oc", "objectclasses=( 9.2",
     "objectclasses=( 9.3 NAME 'more' ABSTRACT )\nobjectclasses=( 9.2",
     "@/out/V3.user.oc:3: object class more (9.3) was not planned\n"
     "@/out/V3.user.oc:3: from here on the file is not, byte for byte, what was planned\n"},
    {"ADefinitionTwice", "out/V3.user.at", "attributetypes=( 9.1",
     "attributetypes=( 9.1 NAME 's' USAGE userApplications )\nattributetypes=( 9.1",
     "@/out/V3.user.at:3: attribute type s (9.1) is there more often than planned\n"
     "@/out/V3.user.at:3: from here on the file is not, byte for byte, what was planned\n"},
    {"ACommentThatIsGone", "out/V3.system.at", "# The release.\n", "",
     "@/out/V3.system.at:1: from here on the file is not, byte for byte, what was planned\n"},
    {"AConfigFile", "out/V3.config.at", "'limit' USAGE", "'limit'  USAGE",
     "@/out/V3.config.at:1: from here on the file is not NEW's, byte for byte\n"},
};

class VerifyEach : public Verify, public testing::WithParamInterface<Row> {};
INSTANTIATE_TEST_SUITE_P(Verify, VerifyEach, testing::ValuesIn(kRows),
                         [](const auto& row) { return row.param.name; });

TEST_P(VerifyEach, DifferenceIsTold) {
  const Row& row = GetParam();
  edit(row.file, row.from, row.to);
  const ToolResult result = verify();
  EXPECT_EQ("", result.err);
  EXPECT_EQ(1, result.exitCode);
  std::string told = row.told;
  const std::size_t findings = told.find("FINDINGS");
  if (findings == std::string::npos) {
    told += "Not verified: @/out: ";
    EXPECT_NE(std::string::npos, result.out.find(", 0 new findings.\n")) << result.out;
  } else {
    told.erase(findings);
    EXPECT_NE(std::string::npos, result.out.find(" (new in this result) [")) << result.out;
  }
  EXPECT_EQ(told, result.out.substr(0, told.size()));
}

TEST_F(Verify, ADefinitionInAnotherFileIsTold) {
  m_folder.write("out/V3.user.at", "");
  edit("out/V3.user.oc", "# Guards.\n", kTypeS + "# Guards.\n");
  EXPECT_EQ(0U,
            verify().out.find("@/out/V3.user.oc:2: attribute type s (9.1) stands in V3.user.oc, "
                              "and V3.user.at was planned\n"))
      << verify().out;
  EXPECT_EQ(1, verify().exitCode);
}

TEST_F(Verify, FilesThatAreMissingOrNotPlannedAreTold) {
  std::filesystem::remove(m_folder.file("out/V3.config.at"));
  m_folder.write("out/V3.orv.at", "");
  m_folder.write("out/V3.SYSTEM.at", "");
  m_folder.write("out/notes.txt", "no schema file\n");
  const ToolResult result = verify();
  EXPECT_EQ(0U,
            result.out.find("@/out/V3.config.at: attribute type limit (3.1) is missing (new: the "
                            "release added it)\n"
                            "@/out/V3.config.at: the file is missing\n"
                            "@/out/V3.SYSTEM.at: the file was not planned\n"
                            "@/out/V3.orv.at: the file was not planned\n"))
      << result.out;
  EXPECT_EQ(std::string::npos, result.out.find("notes.txt"));
  EXPECT_EQ(1, result.exitCode);
}

TEST_F(Verify, WhatDiffersInTheLibrarysLayoutIsTold) {
  migrateInLibraryLayout();
  edit("out/V3.system.at", "'better'", "'worse'");
  edit("out/V3.user.at", "# File generated", "# File made");
  EXPECT_EQ(
      "@/out/V3.system.at:3: attribute type b (1.2) is not what was planned (new: only the "
      "release changed it)\n"
      "  DESC\n"
      "    planned 'better'\n"
      "    found   'worse'\n"
      "@/out/V3.system.at:3: from here on the file is not, byte for byte, what was planned\n"
      "Not verified: @/out: 0 reasons against the plan, 2 differences, 0 new findings.\n",
      verify().out);
}

TEST_F(Verify, FindingsThatAreNewAreTold) {
  edit("out/V3.user.at", "USAGE", "SUP nothing USAGE");
  const ToolResult result = verify();
  EXPECT_NE(std::string::npos, result.out.find("\n@/out/V3.user.at:2:")) << result.out;
  EXPECT_NE(std::string::npos, result.out.find(" (new in this result) [R401]\n")) << result.out;
  EXPECT_EQ(1, result.exitCode);
}

TEST_F(Verify, APlanThatHoldsNoLongerIsTold) {
  edit("old/V3.user.at", "'s'", "'s' DESC 'more'");
  m_folder.write("new/V3.orv.oc", "");
  std::filesystem::remove(m_folder.file("base/V3.system.oc"));
  edit("out/V3.user.oc", "'guard'", "'guards'");
  const ToolResult result = verify();
  EXPECT_EQ("", result.err);
  EXPECT_EQ(1, result.exitCode);
  EXPECT_EQ(0U, result.out.find("@/base/V3.system.oc: the plan was made from it (base), and it is "
                                "no longer there\n"
                                "@/old/V3.user.at: is not what the plan was made from (old): its "
                                "SHA-256 was "))
      << result.out;
  EXPECT_NE(std::string::npos,
            result.out.find("\n@/new/V3.orv.oc: is new: the plan was made without it (new)\n"
                            "@/out/V3.user.oc: its SHA-256 is "))
      << result.out;
  EXPECT_NE(std::string::npos, result.out.find("\nNot verified: @/out: 3 reasons against the plan, "
                                               "1 difference, 0 new findings.\n"))
      << result.out;
}

TEST_F(Verify, APlanThatWasNotReadyVerifiesNothing) {
  ASSERT_EQ(
      4,
      m_folder.run({"plan", "--from", "@/old", "--to", "@/new", "--save", "@/plan.json"}).exitCode);
  const ToolResult result = verify();
  EXPECT_EQ(1, result.exitCode);
  EXPECT_EQ(0U, result.out.find("@/plan.json: is not ready (2 definitions undecided, 0 other "
                                "reasons), so that no migration was made by it\n"))
      << result.out;
}

TEST_F(Verify, WhatIsNoInputIsTold) {
  m_folder.write("text", "no plan\n");
  const struct {
    std::vector<std::string> arguments;
    const char* told;
    int exitCode;
  } cases[] = {
      {{"--plan", "@/text", "@/out"}, "@/text:1:2: error: is no saved plan: ", 3},
      {{"--plan", "@/nothing", "@/out"},
       "@/nothing: error: cannot be read: No such file or directory\n",
       3},
      {{"--plan", "@/out", "@/out"}, "@/out: error: cannot be read: it is a directory\n", 3},
      {{"--plan", "@/plan.json", "@/nothing"}, "@/nothing: error: ", 3},
      {{"@/out"}, "schema-migrate: error: --plan is required; schema-migrate verify --help ", 2},
      {{"--plan", "@/plan.json"}, "schema-migrate: error: DIR is required; ", 2},
      {{"--plan=", "@/out"}, "schema-migrate: error: --plan: the name is empty; ", 2},
  };
  for (const auto& row : cases) {
    std::vector<std::string> arguments = {"verify"};
    arguments.insert(arguments.end(), row.arguments.begin(), row.arguments.end());
    const ToolResult result = m_folder.run(arguments);
    EXPECT_EQ(row.exitCode, result.exitCode) << row.told;
    EXPECT_EQ(row.told, result.err.substr(0, std::string(row.told).size()));
    EXPECT_EQ("", result.out);
  }
}

}  // namespace
