// fleet: what the saved plans of several installations say together.

#include <fcntl.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include <algorithm>
#include <filesystem>
#include <nlohmann/json.hpp>
#include <string>
#include <vector>

#include "Files.h"
#include "FleetNames.h"
#include "Json.h"
#include "Messages.h"
#include "PageText.h"
#include "PlannedFolder.h"
#include "TerminalRun.h"

namespace {

using Json = nlohmann::ordered_json;
using Arguments = std::vector<std::string>;

const std::string kText = "SYNTAX 1.3.6.1.4.1.1466.115.121.1.15";

std::string description(const std::string& length) {
  return at("1.1 NAME 'description' " + kText + "{" + length + "}");
}

// Four installations of one release, which changed the length of a text: oslo and bergen in one
// way, narvik in another, bodo in none; bergen has a definition of its own, too.
class Fleet : public testing::Test {
 protected:
  Fleet() {
    const std::string alike = at("1.2 NAME 'cn' SYNTAX 1.2");
    m_folder.install("base", {{"V3.user.at", description("10") + alike}});
    m_folder.install("new", {{"V3.user.at", description("20") + alike}});
    install("oslo", description("40") + alike);
    install("bergen", description("40") + alike + at("9.1 NAME 'own' DESC 'ours' SYNTAX 1.2"));
    install("narvik", description("50") + alike + at("9.1 NAME 'own' DESC 'mine' SYNTAX 1.2"));
    install("bodo", description("10") + alike);
  }

  void install(const std::string& name, const std::string& types) const {
    m_folder.install(name, {{"V3.user.at", types}});
  }

  ToolResult plan(const std::string& name, const Arguments& more = {}) const {
    Arguments arguments = {"plan",   "--base",    "@/base",
                           "--from", "@/" + name, "--to",
                           "@/new",  "--save",    "@/" + name + ".json"};
    arguments.insert(arguments.end(), more.begin(), more.end());
    if (name == "bodo") {
      arguments.emplace_back("--accept-base");
    }
    return m_folder.run(arguments);
  }

  void planAll(const Arguments& more = {}) const {
    for (const char* const name : {"oslo", "bergen", "narvik", "bodo"}) {
      plan(name, more);
    }
  }

  ToolResult run(const Arguments& more = {}) const {
    Arguments arguments = {"fleet", "@/oslo.json", "@/bergen.json", "@/narvik.json", "@/bodo.json"};
    arguments.insert(arguments.end(), more.begin(), more.end());
    return m_folder.run(arguments);
  }

  ToolFolder m_folder;
};

TEST_F(Fleet, TellsWhoHasWhatAndWhatToDecide) {
  planAll();
  const ToolResult result = run();
  EXPECT_EQ(4, result.exitCode);
  EXPECT_EQ(
      "Installations\n"
      "    1 ready: bodo\n"
      "    3 with 1 question: oslo, bergen, narvik\n"
      "\n"
      "Definitions\n"
      "  BASE @/base\n"
      "  NEW @/new\n"
      "  1 of 3 definitions unchanged at every installation\n"
      "\n"
      "  has  unchanged  ways  undecided  definition\n"
      "    4          1     2          3  attribute type description (1.1)\n"
      "        2 changed -> undecided: oslo, bergen\n"
      "            SYNTAX 1.3.6.1.4.1.1466.115.121.1.15{40}\n"
      "        1 changed -> undecided: narvik\n"
      "            SYNTAX 1.3.6.1.4.1.1466.115.121.1.15{50}\n"
      "    2          0     2          0  attribute type own (9.1)\n"
      "        1 added -> added: bergen\n"
      "            DESC 'ours'\n"
      "        1 added -> added: narvik\n"
      "            DESC 'mine'\n"
      "\n"
      "What to decide; what settles most comes first\n"
      "\n"
      "  settles at  then ready  question\n"
      "           2           3  attribute type description (1.1): the site and the release "
      "changed it in two ways: SYNTAX\n"
      "      at oslo, bergen\n"
      "      SYNTAX\n"
      "        base  1.3.6.1.4.1.1466.115.121.1.15{10}\n"
      "        old   1.3.6.1.4.1.1466.115.121.1.15{40}\n"
      "        new   1.3.6.1.4.1.1466.115.121.1.15{20}\n"
      "      take old, new, base, drop; or decide SYNTAX\n"
      "           1           4  attribute type description (1.1): the site and the release "
      "changed it in two ways: SYNTAX\n"
      "      at narvik\n"
      "      SYNTAX\n"
      "        base  1.3.6.1.4.1.1466.115.121.1.15{10}\n"
      "        old   1.3.6.1.4.1.1466.115.121.1.15{50}\n"
      "        new   1.3.6.1.4.1.1466.115.121.1.15{20}\n"
      "      take old, new, base, drop; or decide SYNTAX\n"
      "\n"
      "Not ready: 3 of 4 installations; 3 questions in all.\n",
      result.out);
  EXPECT_EQ("schema-migrate: error: undecided: 3 questions at 3 installations\n", result.err);
}

TEST_F(Fleet, WhatTheSameInstallationsHaveAlikeTakesOneRow) {
  for (const char* const name : {"oslo", "bergen"}) {
    install(name, description("10") + at("9.1 NAME 'one' SYNTAX 1.2") +
                      at("9.2 NAME 'two' SYNTAX 1.2") + at("9.3 NAME 'three' SYNTAX 1.2"));
  }
  planAll();
  const ToolResult result = m_folder.run({"fleet", "@/oslo.json", "@/bergen.json"});
  EXPECT_NE(
      std::string::npos,
      result.out.find("    2          0     1          0  3 attribute types: one, three, two\n"
                      "        2 added -> added: oslo, bergen\n"))
      << result.out;
  EXPECT_EQ(0, result.exitCode) << result.err;
  EXPECT_EQ("", result.err);
}

// One file of decisions, filled in once, settles every installation.
TEST_F(Fleet, OneTemplateSettlesAll) {
  planAll();
  EXPECT_EQ(4, run({"--template", "@/decisions.toml"}).exitCode);
  std::string text = support::readWholeFile(m_folder.file("decisions.toml"));
  std::size_t count = 0;
  for (std::size_t at = 0; (at = text.find("# take", at)) != std::string::npos; at += 30) {
    text.insert(at, ++count == 1 ? "take = \"old\"\n" : "take = \"new\"\n");
  }
  EXPECT_EQ(2U, count);
  m_folder.write("decisions.toml", text);
  for (const char* const name : {"oslo", "bergen", "narvik", "bodo"}) {
    const ToolResult result = plan(name, {"--decisions", "@/decisions.toml", "--allow-unused"});
    EXPECT_EQ(0, result.exitCode) << name << result.err;
  }
  const ToolResult result = run();
  EXPECT_EQ(0, result.exitCode);
  EXPECT_EQ("", result.err);
  EXPECT_NE(std::string::npos, result.out.find("\nReady: 4 installations.\n")) << result.out;
  EXPECT_NE(std::string::npos, result.out.find("        2 changed -> old: oslo, bergen\n"));
  EXPECT_NE(std::string::npos, result.out.find("        1 changed -> new: narvik\n"));
}

TEST_F(Fleet, ATemplateThatIsThereIsLeftAlone) {
  planAll();
  m_folder.write("mine", "mine");
  EXPECT_EQ(5, run({"--template", "@/mine"}).exitCode);
  EXPECT_EQ("mine", support::readWholeFile(m_folder.file("mine")));
}

// ---- Formats ----

std::string articleOf(const std::string& page, const std::string& id) {
  const std::size_t begin = page.find(" id=\"" + id + "\"");
  return begin == std::string::npos
             ? ""
             : textOf(page.substr(begin, page.find("</article>", begin) - begin));
}

std::string joined(const Json& words) {
  std::string text;
  for (const Json& word : words) {
    text += (text.empty() ? "" : ", ") + word.get<std::string>();
  }
  return text;
}

std::string number(const Json& value) { return std::to_string(value.get<std::size_t>()); }

// What the three formats have in common of a definition: the row of the text, and the article.
void compareDefinition(const Json& one, const std::string& text, const std::string& article) {
  const std::string name = one["name"].get<std::string>() + " (" + one["oid"].get<std::string>();
  const std::size_t row = text.find("type " + name);
  ASSERT_NE(std::string::npos, row) << name;
  const std::string line = text.substr(text.rfind('\n', row), row - text.rfind('\n', row));
  expectInOrder(
      {number(one["has"]), number(one["unchanged"]), number(one["ways"]), number(one["undecided"])},
      line);
  Arguments told = {name, number(one["has"]) + " have it, " + number(one["unchanged"]),
                    "other ways: " + number(one["ways"]), "undecided: " + number(one["undecided"])};
  Arguments inText;
  for (const Json& group : one["groups"]) {
    const std::string standing =
        number(Json(group["installations"].size())) + " " + group["standing"].get<std::string>();
    const std::string outcome = group["outcome"];
    told.push_back(standing + " \u2192 " + outcome);
    inText.push_back(standing + " -> " + outcome + ": " + joined(group["installations"]) + "\n");
    for (const Json& clause : group["clauses"]) {
      told.push_back(clause["old"]);
      inText.push_back(clause["clause"].get<std::string>() + " " +
                       clause["old"].get<std::string>() + "\n");
    }
    told.push_back(joined(group["installations"]));
  }
  expectInOrder(told, article);
  expectInOrder(inText, text.substr(row));
}

void compareQuestion(const Json& one, const std::string& text, const std::string& article) {
  const std::string name = one["name"].get<std::string>() + " (" + one["oid"].get<std::string>();
  Arguments told = {"settles at " + number(Json(one["installations"].size())),
                    number(one["readyThen"]) + " ready then", one["reason"]};
  Arguments inText = {number(Json(one["installations"].size())), number(one["readyThen"]), name,
                      one["reason"], "at " + joined(one["installations"]) + "\n"};
  for (const Json& clause : one["clauses"]) {
    for (const char* const side : {"base", "old", "new"}) {
      told.push_back(clause[side]);
      inText.push_back(side + std::string(side[0] == 'b' ? "  " : "   ") +
                       clause[side].get<std::string>());
    }
  }
  inText.push_back("take " + joined(one["take"]) + "; or decide " + joined(one["openClauses"]));
  told.push_back(inText.back().substr(0, inText.back().find(';')));
  told.push_back("at " + joined(one["installations"]));
  expectInOrder(told, article);
  expectInOrder(inText, text.substr(text.find("settles at")));
}

TEST_F(Fleet, TheThreeFormatsSayTheSame) {
  planAll();
  const std::string text = run().out;
  const ToolResult result = run({"--format", "json", "--html", "@/page.html"});
  const Json document = Json::parse(result.out);
  const std::string page = m_folder.withoutPath(support::readWholeFile(m_folder.file("page.html")));
  EXPECT_EQ(4, document["exitCode"]);
  EXPECT_EQ(false, document["ready"]);
  EXPECT_EQ(2U, document["definitions"].size());
  for (std::size_t i = 0; i < document["definitions"].size(); ++i) {
    compareDefinition(document["definitions"][i], text, articleOf(page, "d" + std::to_string(i)));
  }
  EXPECT_EQ(2U, document["questions"].size());
  for (std::size_t i = 0; i < document["questions"].size(); ++i) {
    compareQuestion(document["questions"][i], text, articleOf(page, "q" + std::to_string(i)));
  }
  for (const Json& one : document["installations"]) {
    EXPECT_NE(std::string::npos, text.find(one["name"].get<std::string>()));
    EXPECT_NE(std::string::npos, textOf(page).find(one["plan"].get<std::string>()));
  }
  expectInOrder({"1 of 4 installations ready", "3 questions in all"}, textOf(page));
  expectInOrder({"Not ready: 3 of 4 installations", "3 questions in all"}, text);
}

TEST_F(Fleet, TheDocumentIsAsItsSchemaSays) {
  planAll();
  install("new", description("30"));
  plan("oslo");
  m_folder.write("broken.json", "{\n");
  if (!canValidateJson()) {
    GTEST_SKIP() << "needs python3-jsonschema";
  }
  for (const Arguments& more : {Arguments{}, Arguments{"--all"}, Arguments{"--definition", "OWN"},
                                Arguments{"--definition", "nothing"}, Arguments{"@/broken.json"}}) {
    Arguments arguments = {"--format", "json"};
    arguments.insert(arguments.end(), more.begin(), more.end());
    EXPECT_EQ("", problemsOf(run(arguments).out, FLEET_SCHEMA));
  }
}

TEST_F(Fleet, ThePageIsWrittenWholeOrNotAtAll) {
  planAll();
  m_folder.write("mine", "mine");
  EXPECT_EQ(5, run({"--html", "@/mine"}).exitCode);
  EXPECT_EQ("mine", support::readWholeFile(m_folder.file("mine")));
  EXPECT_EQ(4, run({"--html", "@/page"}).exitCode);
  const std::string first = support::readWholeFile(m_folder.file("page"));
  EXPECT_EQ(4, run({"--html", "@/page"}).exitCode);
  EXPECT_EQ(first, support::readWholeFile(m_folder.file("page")));
}

TEST_F(Fleet, FitsTheTerminal) {
  planAll();
  for (const unsigned short columns : std::initializer_list<unsigned short>{80, 50}) {
    TerminalSettings settings;
    settings.columns = columns;
    TerminalRun run(m_folder,
                    {"fleet", "@/oslo.json", "@/bergen.json", "@/narvik.json", "@/bodo.json"},
                    settings);
    const std::string screen = onScreen(run.rest());
    EXPECT_EQ(4, run.exitCode());
    EXPECT_LE(widestLine(screen), columns) << screen;
    EXPECT_NE(std::string::npos, screen.find("narvik"));
  }
}

// ---- What is told otherwise ----

TEST_F(Fleet, ADefinitionThatIsAskedForIsToldAlone) {
  planAll();
  const ToolResult result = run({"--definition", "CN"});
  EXPECT_NE(std::string::npos,
            result.out.find("    4          4     0          0  attribute type cn (1.2)\n"));
  EXPECT_EQ(std::string::npos, result.out.find("description"));
  EXPECT_EQ(4, result.exitCode);
  const ToolResult unknown = run({"--definition", "nothing"});
  EXPECT_EQ(1, unknown.exitCode);
  EXPECT_NE(std::string::npos, unknown.err.find("nothing here is called nothing\n"));
}

TEST_F(Fleet, AllTellsWhatNobodyChanged) {
  planAll();
  EXPECT_EQ(std::string::npos, run().out.find("cn (1.2)"));
  EXPECT_NE(std::string::npos, run({"--all"}).out.find(
                                   "    4          4     0          0  attribute type cn (1.2)\n"));
}

TEST_F(Fleet, PlansOfSeveralReleasesAreToldApart) {
  planAll();
  m_folder.install("new", {{"V3.user.at", description("30")}});
  plan("narvik");
  const ToolResult result = run();
  expectInOrder(
      {"Definitions of release 1 of 2, at 3 installations\n", "NEW @/new\n", "description (1.1)",
       "oslo, bergen", "Definitions of release 2 of 2, at 1 installation\n",
       "  differs from release 1 in NEW V3.user.at\n", "description (1.1)", "narvik"},
      result.out);
}

TEST_F(Fleet, AnInstallationThatIsRefusedIsTold) {
  planAll();
  const std::string plan = support::readWholeFile(m_folder.file("bodo.json"));
  m_folder.write("bodo.json",
                 replaced(replaced(plan, "\"ready\": true", "\"ready\": false"), "\"refusals\": []",
                          "\"refusals\": [{\"file\": \"f\", \"line\": 1, \"column\": 1, "
                          "\"rule\": \"T302\", \"text\": \"it is lost\"}]"));
  const ToolResult result = run();
  EXPECT_EQ(4, result.exitCode);
  EXPECT_NE(std::string::npos, result.out.find("    1 refused for 1 reason: bodo\n")) << result.out;
  EXPECT_NE(std::string::npos, result.out.find("; 1 refused, whatever is decided.\n"));
  EXPECT_NE(std::string::npos, result.err.find("@/bodo.json: error: refused for 1 reason"));
}

// Without BASE, nobody can tell who changed what.
TEST_F(Fleet, WithoutBaseWhatDiffersIsUnknown) {
  for (const char* const name : {"oslo", "bergen", "narvik", "bodo"}) {
    m_folder.run({"plan", "--from", std::string("@/") + name, "--to", "@/new", "--save",
                  std::string("@/") + name + ".json"});
  }
  expectInOrder(
      {"  without BASE\n", "    4          0     3          4  attribute type description",
       "        2 have it otherwise than NEW -> undecided: oslo, bergen\n",
       "    2          0     2          0  attribute type own (9.1)\n",
       "        1 have it, and NEW does not -> added: bergen\n"},
      run().out);
}

// ---- Plans that cannot be read ----

TEST_F(Fleet, APlanThatCannotBeReadIsToldAndTheOthersAre) {
  planAll();
  const std::string whole = support::readWholeFile(m_folder.file("oslo.json"));
  m_folder.write("cut.json", whole.substr(0, whole.size() / 2));
  m_folder.write("newer.json", replaced(whole, "\"version\": 1,", "\"version\": 7,"));
  m_folder.write("foreign.json", "{\n  \"name\": \"a\"\n}\n");
  m_folder.write("empty.json", "");
  const ToolResult result =
      run({"@/cut.json", "@/newer.json", "@/foreign.json", "@/empty.json", "@/missing.json"});
  EXPECT_EQ(3, result.exitCode);
  const auto lines = static_cast<std::size_t>(
      std::count(whole.begin(), whole.begin() + static_cast<long>(whole.size() / 2), '\n'));
  EXPECT_NE(std::string::npos, result.err.find("@/cut.json:" + std::to_string(lines + 1) + ":"))
      << result.err;
  expectInOrder({"@/newer.json:2:15: error: is no saved plan: /version is 7, and this program "
                 "reads version 1; it was written by another version of the program\n",
                 "@/foreign.json:3:1: error: is no saved plan: it has no member version\n",
                 "@/empty.json:1:1: error: is no saved plan: the JSON text is wrong or ends here\n",
                 "@/missing.json: error: cannot be read: No such file or directory\n",
                 "undecided: 3 questions at 3 installations\n"},
                result.err);
  EXPECT_NE(std::string::npos, result.out.find("oslo, bergen"));
  EXPECT_NE(std::string::npos, result.out.find("; 5 plans not read.\n")) << result.out;
  EXPECT_EQ(3, m_folder.run({"fleet", "@/cut.json"}).exitCode);
}

TEST_F(Fleet, NothingIsReadThatIsNoFile) {
  EXPECT_EQ(3, m_folder.run({"fleet", "/dev/zero"}).exitCode);
  EXPECT_EQ(2, m_folder.run({"fleet"}).exitCode);
}

TEST_F(Fleet, TheReportHasToBeWritten) {
  planAll();
  EXPECT_EQ(5, m_folder
                   .run({"fleet", "@/oslo.json"},
                        [] {
                          ::close(STDOUT_FILENO);
                          ::open("/dev/full", O_WRONLY);
                        })
                   .exitCode);
}

// ---- Names ----

struct Names {
  const char* rule;
  Arguments words;
  std::string names;
};

TEST(FleetNames, AreTheShortestThatTellThemApart) {
  const support::TemporaryDirectory folder;
  const std::string record = folder.file("oslo");
  ASSERT_TRUE(std::filesystem::create_directory(record));
  const std::vector<Names> rows = {
      {"OneFile", {"plans/oslo.json"}, "oslo=plans/oslo.json"},
      {"Files", {"p/oslo.json", "p/bergen.json"}, "oslo=p/oslo.json bergen=p/bergen.json"},
      {"NoJsonEnding", {"oslo.plan", "./bergen"}, "oslo.plan=oslo.plan bergen=./bergen"},
      {"Directories",
       {"/p/oslo/plan.json", "/p/bergen/plan.json"},
       "oslo=/p/oslo/plan.json bergen=/p/bergen/plan.json"},
      {"AsMuchAsIsNeeded",
       {"a/x/plan.json", "b/x/plan.json", "y/plan.json"},
       "a/x=a/x/plan.json b/x=b/x/plan.json y=y/plan.json"},
      {"SomeAlike",
       {"a/plan.json", "b/plan.json", "oslo.json"},
       "a/plan=a/plan.json b/plan=b/plan.json oslo=oslo.json"},
      {"Given", {"north=p/oslo.json", "p/bergen.json"}, "north=p/oslo.json bergen=p/bergen.json"},
      {"AGivenNameIsTaken", {"oslo=a.json", "p/oslo.json"}, "oslo=a.json p/oslo=p/oslo.json"},
      {"AnEqualsSignBehindASlash", {"./a=b.json"}, "a=b=./a=b.json"},
      {"ByTheirFoldersWhereTheFilesAreAlike", {"p/a", "q/a.json"}, "p=p/a q=q/a.json"},
      {"ARecord", {record}, "oslo=" + record + "/plan.json"},
  };
  for (const Names& row : rows) {
    SCOPED_TRACE(row.rule);
    std::string names;
    for (const NamedPlan& plan : namePlans(row.words)) {
      names += (names.empty() ? "" : " ") + plan.name + "=" + plan.path;
    }
    EXPECT_EQ(row.names, names);
  }
}

TEST(FleetNames, NoTwoAreAlike) {
  for (const Arguments& words :
       {Arguments{"a.json", "./a.json"}, Arguments{"a.json", "a.json"}, Arguments{"x=a", "x=b"}}) {
    try {
      namePlans(words);
      ADD_FAILURE() << words[0];
    } catch (const Failure& failure) {
      EXPECT_EQ(kUsage, failure.exitCode());
    }
  }
}

}  // namespace
