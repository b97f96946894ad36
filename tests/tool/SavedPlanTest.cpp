// plan --save: what a saved plan holds, and that it is there whole or not at all. migrate --plan:
// that it is carried out as long as it holds, and no longer.

#include <gtest/gtest.h>
#include <sys/resource.h>
#include <unistd.h>

#include <array>
#include <cstdio>
#include <filesystem>
#include <nlohmann/json.hpp>

#include "Files.h"
#include "Json.h"
#include "Machine.h"
#include "PlannedFolder.h"
#include "TracedRun.h"

namespace {

using nlohmann::json;

class SavedPlan : public testing::Test {
 protected:
  std::string saved(const std::string& name = "plan.json") const {
    return support::readWholeFile(m_folder.file(name));
  }
  json save(const std::vector<std::string>& more = {}) const {
    std::vector<std::string> options = {"--save", "@/plan.json"};
    options.insert(options.end(), more.begin(), more.end());
    const ToolResult result = m_folder.runPlanned("plan", options);
    EXPECT_EQ("", result.err);
    EXPECT_EQ(0, result.exitCode);
    return json::parse(saved());
  }

  PlannedFolder m_folder;
};

// What sha256sum says of a file.
std::string sha256sum(const std::string& path) {
  std::FILE* const pipe = ::popen(("sha256sum < '" + path + "'").c_str(), "r");
  std::array<char, 65> digest{};
  EXPECT_EQ(64U, std::fread(digest.data(), 1, 64, pipe));
  ::pclose(pipe);
  return digest.data();
}

TEST_F(SavedPlan, IsTheDocumentOfTheCommand) {
  const ToolResult result =
      m_folder.runPlanned("plan", {"--save", "@/plan.json", "--format", "json"});
  EXPECT_EQ(0, result.exitCode);
  EXPECT_EQ(result.out, m_folder.withoutPath(saved()));
  if (!canValidateJson()) {
    GTEST_SKIP() << "needs python3-jsonschema";
  }
  EXPECT_EQ("", problemsOf(saved(), PLAN_SCHEMA));
}

TEST_F(SavedPlan, IsTheSameEachTime) {
  save();
  const std::string first = saved();
  save();
  EXPECT_EQ(first, saved());
}

TEST_F(SavedPlan, HoldsTheSha256OfEveryInputListAndDecisionsFile) {
  m_folder.write("excluded", "# none\n");
  m_folder.write("withdrawn", "# none\n");
  m_folder.write("decisions.toml", "# none\n");
  const json plan = save({"--exclude-oids", "@/excluded", "--withdraw", "@/withdrawn",
                          "--decisions", "@/decisions.toml"});
  std::string inputs;
  for (const json& input : plan["inputs"]) {
    const std::string path = input["path"];
    inputs += std::string(input["role"]) + " " + m_folder.withoutPath(path) + "\n";
    EXPECT_EQ(sha256sum(path), input["sha256"]) << path;
  }
  EXPECT_EQ(
      "base @/base/V3.system.at\nbase @/base/V3.system.oc\n"
      "old @/old/V3.system.at\nold @/old/V3.system.oc\nold @/old/V3.user.at\n"
      "old @/old/V3.user.oc\n"
      "new @/new/V3.system.at\nnew @/new/V3.system.oc\nnew @/new/V3.config.at\n"
      "exclude @/excluded\nwithdraw @/withdrawn\ndecisions @/decisions.toml\n",
      inputs);
  EXPECT_EQ(SCHEMA_MIGRATE_VERSION, plan["program"]["version"]);
}

TEST_F(SavedPlan, HoldsEveryOptionThatMatters) {
  const json plain = save()["options"];
  EXPECT_EQ(json::parse(m_folder.withPath(R"({"base": "@/base", "from": "@/old", "to": "@/new",
      "excludeOids": [], "withdraw": null, "decisions": [], "prefer": null, "acceptBase": false,
      "allowUnused": false, "repair": false})")),
            plain);
  m_folder.write("e1", "# none\n");
  m_folder.write("e2", "# none\n");
  m_folder.write("w", "# none\n");
  m_folder.write("d.toml",
                 "[[definition]]\nkind = \"object-class\"\nname = \"nowhere\"\n"
                 "take = \"new\"\n");
  const json full =
      save({"--exclude-oids", "@/e1", "--exclude-oids", "@/e2", "--withdraw", "@/w", "--decisions",
            "@/d.toml", "--allow-unused", "--accept-base", "--prefer", "old"})["options"];
  EXPECT_EQ(json::parse(m_folder.withPath(R"({"base": "@/base", "from": "@/old", "to": "@/new",
      "excludeOids": ["@/e1", "@/e2"], "withdraw": "@/w", "decisions": ["@/d.toml"],
      "prefer": "old", "acceptBase": true, "allowUnused": true, "repair": false})")),
            full);
}

TEST_F(SavedPlan, HoldsTheDefinitions) {
  const json plan = save();
  std::string lines;
  for (const json& each : plan["definitions"]) {
    lines += std::string(each["kind"]) + " " + std::string(each["oid"]) + " " +
             std::string(each["class"]) + " " + std::string(each["outcome"]) + "\n";
  }
  EXPECT_EQ(
      "attribute-type 1.1 changed-by-site old\n"
      "attribute-type 1.2 changed-by-release new\n"
      "attribute-type 3.1 added-by-release new\n"
      "attribute-type 9.1 added-by-site added\n"
      "object-class 2.1 changed-by-both-mergeable merged\n"
      "object-class 9.2 added-by-site added\n"
      "vendor-extension 1.2 same same\n",
      lines);
  EXPECT_EQ(json({{"base", {{"file", m_folder.file("base/V3.system.oc")}, {"line", 1}}},
                  {"old", {{"file", m_folder.file("old/V3.system.oc")}, {"line", 1}}},
                  {"new", {{"file", m_folder.file("new/V3.system.oc")}, {"line", 1}}},
                  {"result", {{"file", "V3.system.oc"}, {"line", 1}}}}),
            plan["definitions"][4]["places"]);
  EXPECT_EQ(json({{"clause", "MAY"},
                  {"base", "a"},
                  {"old", "a $ s"},
                  {"new", "b $ a"},
                  {"result", "b $ a $ s"},
                  {"decided", true},
                  {"risk", "structure"}}),
            plan["definitions"][4]["clauses"][0]);
}

// Those that a migration writes.
TEST_F(SavedPlan, HoldsTheSha256OfTheOutput) {
  const json outputs = save()["outputs"];
  ASSERT_EQ(0, m_folder.runPlanned("migrate", {"--out", "@/out"}).exitCode);
  EXPECT_EQ(m_folder.contents("out").size(), outputs.size());
  for (const json& output : outputs) {
    EXPECT_EQ(sha256sum(m_folder.file("out/" + std::string(output["file"]))), output["sha256"]);
  }
}

// It is used from other directories, so the paths in it are absolute.
TEST_F(SavedPlan, HasAbsolutePaths) {
  const ToolResult result =
      m_folder.run({"plan", "--base", "base", "--from", "old", "--to", "./new", "--save", "p"},
                   [&] { static_cast<void>(::chdir(m_folder.path().c_str())); });
  EXPECT_EQ("", result.err);
  const json plan = json::parse(saved("p"));
  EXPECT_EQ(m_folder.file("base"), plan["options"]["base"]);
  EXPECT_EQ(m_folder.file("old"), plan["options"]["from"]);
  EXPECT_EQ(m_folder.file("./new"), plan["options"]["to"]);
  EXPECT_EQ(m_folder.file("old/V3.system.at"), plan["inputs"][2]["path"]);
}

TEST_F(SavedPlan, IsSavedAlsoWhenItIsNotReady) {
  const ToolResult result =
      m_folder.run({"plan", "--from", "@/old", "--to", "@/new", "--save", "@/plan.json"});
  EXPECT_EQ(4, result.exitCode);
  const json plan = json::parse(saved());
  EXPECT_EQ(false, plan["ready"]);
  EXPECT_EQ(json::array(), plan["outputs"]);
}

TEST_F(SavedPlan, ReplacesASavedPlanAndNothingElse) {
  m_folder.write("mine", "my own\n");
  m_folder.write("document.json", "{ \"version\": 1 }\n");
  std::filesystem::create_directory(m_folder.file("folder"));
  std::filesystem::create_symlink(m_folder.file("nowhere"), m_folder.file("link"));
  ASSERT_EQ(0, ::mkfifo(m_folder.file("fifo").c_str(), 0600));
  const std::string before = m_folder.snapshot();
  for (const char* const name : {"mine", "document.json", "folder", "link", "fifo"}) {
    const ToolResult result = m_folder.runPlanned("plan", {"--save", "@/" + std::string(name)});
    EXPECT_EQ(5, result.exitCode) << name;
    EXPECT_EQ("@/" + std::string(name) +
                  ": error: exists and is no saved plan, so it is not replaced; name a new file\n",
              result.err);
    EXPECT_EQ("", result.out);
  }
  EXPECT_EQ(before, m_folder.snapshot());
  save();
  const std::string with = saved();
  ASSERT_EQ(
      4,
      m_folder.run({"plan", "--from", "@/old", "--to", "@/new", "--save", "@/plan.json"}).exitCode);
  EXPECT_NE(with, saved());
}

TEST_F(SavedPlan, TellsWhereItCannotBeWritten) {
  const ToolResult nowhere = m_folder.runPlanned("plan", {"--save", "@/nowhere/plan.json"});
  EXPECT_EQ(5, nowhere.exitCode);
  EXPECT_EQ(
      "@/nowhere/plan.json: error: the directory to write it in cannot be used: No such file or "
      "directory\n",
      nowhere.err);
  const ToolResult directory = m_folder.runPlanned("plan", {"--save", "@/nowhere/"});
  EXPECT_EQ(5, directory.exitCode);
  // A path that is not UTF-8 cannot stand in it, and what it would read instead is another file.
  m_folder.install("\xff", {{"V3.user.at", ""}});
  const ToolResult foreign =
      m_folder.run({"plan", "--from", "@/\xff", "--to", "@/new", "--save", "@/plan.json"});
  EXPECT_EQ(5, foreign.exitCode);
  EXPECT_EQ(
      "@/plan.json: error: cannot be written: the path \"@/\\xFF\" is not UTF-8, and a plan "
      "cannot hold it\n",
      foreign.err);
  EXPECT_EQ("base new old \xff", m_folder.names());
}

TEST_F(SavedPlan, IsNotThereWhenTheDiskIsFull) {
  const std::string before = m_folder.snapshot();
  const ToolResult result = m_folder.runPlanned("plan", {"--save", "@/plan.json"}, [] {
    const rlimit most{4000, 4000};
    ::setrlimit(RLIMIT_FSIZE, &most);
  });
  EXPECT_EQ(5, result.exitCode);
  EXPECT_EQ("@/plan.json: error: cannot be written: File too large\n", result.err);
  EXPECT_EQ(before, m_folder.snapshot());
}

// Once before and once behind every change that the run makes to a file system. What was there
// stays until the new plan is whole.
TEST_F(SavedPlan, IsWholeOrNotThereWheneverTheRunIsKilled) {
  SKIP_UNLESS_MACHINE_CAN(kTraceProcesses);
  const std::vector<std::string> arguments = {"plan", "--base", "@/base", "--from",     "@/old",
                                              "--to", "@/new",  "--save", "@/plan.json"};
  ASSERT_EQ(4, m_folder.run({"plan", "--from", "@/old", "--to", "@/new", "--save", "@/other.json"})
                   .exitCode);
  const std::string other = saved("other.json");
  save();
  const std::string whole = saved();
  int changes = 0;
  int withOther = 0;
  for (bool isKilled = true; isKilled; ++changes) {
    for (const bool isBehind : {false, true}) {
      for (const bool isReplacing : {false, true}) {
        SCOPED_TRACE("change " + std::to_string(changes + 1) + (isBehind ? ", behind" : ""));
        std::filesystem::remove(m_folder.file("plan.json"));
        if (isReplacing) {
          m_folder.write("plan.json", other);
        }
        int exitCode = 0;
        const pid_t process = m_folder.startRun(arguments, "run", waitForTracer);
        isKilled = endAt(process, {changes + 1, isBehind}, SIGKILL, &exitCode);
        const bool isThere = std::filesystem::exists(m_folder.file("plan.json"));
        EXPECT_TRUE(isKilled || isThere);
        EXPECT_TRUE(isThere || !isReplacing);
        if (isThere) {
          const std::string text = saved();
          withOther += text == other ? 1 : 0;
          EXPECT_TRUE(text == whole || (isReplacing && text == other)) << text;
        }
        ASSERT_FALSE(HasFailure());
      }
    }
  }
  EXPECT_GT(changes, 4);
  EXPECT_GT(withOther, 4);
}

// ---- migrate --plan ----

class MigrateByPlan : public SavedPlan {
 protected:
  MigrateByPlan() {
    m_folder.write("excluded", "# none\n");
    m_folder.write("withdrawn", "# none\n");
    m_folder.write("decisions.toml",
                   "[[definition]]\nkind = \"attribute-type\"\nname = \"b\"\ntake = \"old\"\n");
    save({"--exclude-oids", "@/excluded", "--withdraw", "@/withdrawn", "--decisions",
          "@/decisions.toml"});
  }

  ToolResult migrate(const std::vector<std::string>& more = {}) const {
    std::vector<std::string> arguments = {"migrate", "--plan", "@/plan.json", "--out", "@/out"};
    arguments.insert(arguments.end(), more.begin(), more.end());
    return m_folder.run(arguments);
  }
  void edit(const std::string& file, const std::string& from, const std::string& to) const {
    m_folder.write(file, replaced(support::readWholeFile(m_folder.file(file)), from, to));
  }
  // Refused with this line among those told, and nothing written.
  void expectRefused(const std::string& line) const {
    const std::string before = m_folder.snapshot();
    const ToolResult result = migrate();
    EXPECT_EQ(4, result.exitCode) << result.err;
    EXPECT_NE(std::string::npos, result.err.find(line)) << line << "\n" << result.err;
    EXPECT_NE(
        std::string::npos,
        result.err.find("schema-migrate: error: refused: the plan does not hold any more, and "
                        "nothing was written; make it again with plan --save\n"))
        << result.err;
    EXPECT_EQ("", result.out);
    EXPECT_EQ(before, m_folder.snapshot());
  }
};

TEST_F(MigrateByPlan, DoesWhatItsOptionsDo) {
  for (const char* const layout : {"keep", "library"}) {
    const ToolResult byPlan = migrate({"--layout", layout});
    EXPECT_EQ("", byPlan.err);
    EXPECT_EQ(0, byPlan.exitCode);
    const ToolFolder::Files files = m_folder.contents("out");
    std::filesystem::remove_all(m_folder.file("out"));
    const ToolResult byOptions = m_folder.runPlanned(
        "migrate", {"--exclude-oids", "@/excluded", "--withdraw", "@/withdrawn", "--decisions",
                    "@/decisions.toml", "--out", "@/out", "--layout", layout});
    EXPECT_EQ(byOptions.out, byPlan.out);
    EXPECT_EQ(m_folder.contents("out"), files);
    EXPECT_NE(std::string::npos, files.at("V3.system.at").find("'b' DESC 'd'") +
                                     files.at("V3.system.at").find("'b'  )  DESC 'd'") + 1);
    std::filesystem::remove_all(m_folder.file("out"));
  }
}

TEST_F(MigrateByPlan, IsCarriedOutFromAnotherDirectory) {
  std::filesystem::create_directory(m_folder.file("elsewhere"));
  ASSERT_EQ(0, m_folder
                   .run({"plan", "--base", "base", "--from", "old", "--to", "new", "--save", "p"},
                        [&] { static_cast<void>(::chdir(m_folder.path().c_str())); })
                   .exitCode);
  const ToolResult result = m_folder.run({"migrate", "--plan", "../p", "--out", "out"}, [&] {
    static_cast<void>(::chdir(m_folder.file("elsewhere").c_str()));
  });
  EXPECT_EQ("", result.err);
  EXPECT_EQ(0, result.exitCode);
  EXPECT_EQ(5U, m_folder.contents("elsewhere/out").size());
}

// What --format json prints is a plan, too.
TEST_F(MigrateByPlan, TakesThePrintedDocument) {
  const ToolResult printed = m_folder.runPlanned("plan", {"--format", "json"});
  m_folder.write("plan.json", m_folder.withPath(printed.out));
  EXPECT_EQ(0, migrate().exitCode);
}

TEST_F(MigrateByPlan, IsRefusedWhenAnInputChanged) {
  edit("old/V3.user.at", "'s'", "'s' DESC 'more'");
  expectRefused(
      "@/old/V3.user.at: error: is not what the plan was made from (old): its SHA-256 was ");
}

TEST_F(MigrateByPlan, IsRefusedWhenAListChanged) {
  m_folder.write("excluded", "# more\n");
  expectRefused("@/excluded: error: is not what the plan was made from (exclude): ");
}

TEST_F(MigrateByPlan, IsRefusedWhenTheWithdrawalsChanged) {
  m_folder.write("withdrawn", "");
  expectRefused("@/withdrawn: error: is not what the plan was made from (withdraw): ");
}

TEST_F(MigrateByPlan, IsRefusedWhenADecisionChanged) {
  edit("decisions.toml", "old", "new");
  expectRefused("@/decisions.toml: error: is not what the plan was made from (decisions): ");
}

TEST_F(MigrateByPlan, IsRefusedWhenAnInputIsMalformedNow) {
  m_folder.write("decisions.toml", "[[definition\n");
  expectRefused("@/decisions.toml: error: is not what the plan was made from (decisions): ");
}

TEST_F(MigrateByPlan, IsRefusedWhenAFileIsGone) {
  std::filesystem::remove(m_folder.file("base/V3.system.oc"));
  expectRefused(
      "@/base/V3.system.oc: error: the plan was made from it (base), and it is no longer "
      "there\n");
}

TEST_F(MigrateByPlan, IsRefusedWhenAListIsGone) {
  std::filesystem::remove(m_folder.file("excluded"));
  expectRefused(
      "@/excluded: error: the plan was made from it (exclude), and it cannot be read any more: No "
      "such file or directory\n");
}

TEST_F(MigrateByPlan, IsRefusedWhenADirectoryIsGone) {
  std::filesystem::rename(m_folder.file("base"), m_folder.file("moved"));
  expectRefused(
      "@/base/V3.system.at: error: the plan was made from it (base), and it is no longer "
      "there\n");
}

TEST_F(MigrateByPlan, IsRefusedWhenAFileIsNew) {
  m_folder.write("new/V3.orv.oc", "");
  expectRefused("@/new/V3.orv.oc: error: is new: the plan was made without it (new)\n");
}

TEST_F(MigrateByPlan, IsRefusedByAnotherVersion) {
  edit("plan.json", "\"version\": \"" SCHEMA_MIGRATE_VERSION "\"", "\"version\": \"0.9.9\"");
  expectRefused(
      "@/plan.json: error: was made by version 0.9.9 of the program, and this is " SCHEMA_MIGRATE_VERSION
      "\n");
}

// Whoever changes an outcome in it changes nothing of what its inputs give.
TEST_F(MigrateByPlan, IsRefusedWhenItWasChanged) {
  edit("plan.json", "\"outcome\": \"added\"", "\"outcome\": \"dropped\"");
  expectRefused(
      "@/plan.json: error: attribute-type s (9.1): outcome is dropped in the plan, and its "
      "inputs give added\n");
}

TEST_F(MigrateByPlan, IsRefusedWhenAnOptionWasChanged) {
  edit("plan.json", "\"prefer\": null", "\"prefer\": \"old\"");
  edit("plan.json", "\"ready\": true", "\"ready\": false");
  expectRefused("@/plan.json: error: \"ready\" is not what the inputs of the plan give\n");
}

TEST_F(MigrateByPlan, IsRefusedWhileItIsNotReady) {
  ASSERT_EQ(
      4,
      m_folder.run({"plan", "--from", "@/old", "--to", "@/new", "--save", "@/plan.json"}).exitCode);
  const ToolResult result = migrate();
  EXPECT_EQ(4, result.exitCode);
  EXPECT_NE(std::string::npos, result.err.find("undecided: object class c (2.1)")) << result.err;
  EXPECT_FALSE(std::filesystem::exists(m_folder.file("out")));
}

TEST_F(MigrateByPlan, ContradictionsAreErrorsOfUsage) {
  const std::vector<std::string> options[] = {
      {"--from", "@/old"},    {"--to", "@/new"},         {"--base", "@/base"},
      {"--accept-base"},      {"--exclude-oids", "@/e"}, {"--withdraw", "@/w"},
      {"--decisions", "@/d"}, {"--allow-unused"},        {"--prefer", "old"},
  };
  for (const std::vector<std::string>& option : options) {
    const ToolResult result = migrate(option);
    EXPECT_EQ(2, result.exitCode) << option.front();
    EXPECT_NE(std::string::npos, result.err.find("--plan")) << result.err;
    EXPECT_NE(std::string::npos, result.err.find(option.front())) << result.err;
  }
  const ToolResult nothing = m_folder.run({"migrate", "--out", "@/out"});
  EXPECT_EQ(2, nothing.exitCode);
  EXPECT_EQ(
      "schema-migrate: error: --from is required, or --plan; schema-migrate migrate --help "
      "tells how it is used\n",
      nothing.err);
  const ToolResult half = m_folder.run({"migrate", "--from", "@/old", "--out", "@/out"});
  EXPECT_EQ(2, half.exitCode);
  EXPECT_EQ(
      "schema-migrate: error: --to is required, or --plan; schema-migrate migrate --help "
      "tells how it is used\n",
      half.err);
}

TEST_F(MigrateByPlan, AMalformedPlanIsToldWithItsPlace) {
  edit("plan.json", "\"options\": {", "\"options\": {,");
  const ToolResult cut = migrate();
  EXPECT_EQ(3, cut.exitCode);
  EXPECT_EQ("@/plan.json:9:15: error: is no saved plan: the JSON text is wrong or ends here\n",
            cut.err);
  m_folder.write("plan.json", "{}");
  EXPECT_EQ(3, migrate().exitCode);
  std::filesystem::remove(m_folder.file("plan.json"));
  const ToolResult gone = migrate();
  EXPECT_EQ(3, gone.exitCode);
  EXPECT_EQ("@/plan.json: error: cannot be read: No such file or directory\n", gone.err);
}

// The output must not lie in what the plan reads.
TEST_F(MigrateByPlan, TheOutputLiesOutsideTheInputs) {
  const ToolResult result =
      m_folder.run({"migrate", "--plan", "@/plan.json", "--out", "@/base/out"});
  EXPECT_EQ(2, result.exitCode);
  EXPECT_NE(std::string::npos, result.err.find("lies inside @/base")) << result.err;
}

}  // namespace
