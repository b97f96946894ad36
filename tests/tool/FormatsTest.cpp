// The three formats of one run say the same: from the JSON document is worked out what the text and
// the page have to say of each definition.

#include <gtest/gtest.h>

#include <cstddef>
#include <map>
#include <nlohmann/json.hpp>
#include <string>
#include <vector>

#include "Files.h"
#include "PageText.h"
#include "ToolRun.h"

namespace {

using Json = nlohmann::ordered_json;

std::string spaced(std::string word) {
  for (char& c : word) {
    c = c == '-' ? ' ' : c;
  }
  return word;
}

std::string classWord(const Json& definition) {
  const std::string word = definition["class"];
  std::string told = word == "changed-by-both-mergeable"     ? "changed by both, mergeable"
                     : word == "changed-by-both-in-conflict" ? "changed by both, in conflict"
                                                             : spaced(word);
  told += definition["renamed"] ? ", renamed" : "";
  return told + (definition["renumbered"] ? ", renumbered" : "");
}

bool isSame(const Json& definition) {
  return definition["outcome"] == "same" || definition["outcome"] == "gone";
}

std::string shortPlace(const Json& place) {
  const std::string file = place["file"];
  return file.substr(file.rfind('/') + 1) + ":" + std::to_string(place["line"].get<int>());
}

// ---- Text ----

std::string labelled(std::string label, const std::string& value) {
  label.resize(10, ' ');
  return "  " + label + value + "\n";
}

std::string clauseInText(const Json& clause) {
  std::string text = "  " + clause["clause"].get<std::string>() + "\n";
  for (const char* const side : {"base", "old", "new", "result"}) {
    if (clause[side].is_string()) {
      text += labelled(std::string("  ") + side, clause[side]);
    }
  }
  return text + (clause["decided"] ? "" : labelled("  result", "undecided"));
}

// What the text says of a definition, every line of it.
std::string inText(const Json& definition) {
  const std::string oid = definition["oid"];
  const std::string kind = definition["kind"];
  std::string text = spaced(kind) + (kind == "vendor-extension" ? " of " : " ") +
                     definition["name"].get<std::string>() + " (" + oid + ")";
  text += ": " + classWord(definition) + " -> " + definition["outcome"].get<std::string>();
  const std::string risk = definition["risk"];
  text += (risk == "none" ? "" : " [" + risk + "]") + "\n";
  text += "  " + definition["reason"].get<std::string>() + "\n";
  std::string places;
  const Json& all = definition["places"];
  for (const auto& [name, side] : std::vector<std::pair<std::string, std::string>>{
           {"BASE", "base"}, {"OLD", "old"}, {"NEW", "new"}}) {
    if (!all[side].is_null()) {
      places += (places.empty() ? "" : ", ") + name + " " + shortPlace(all[side]);
    }
  }
  text += "  " + places + "\n";
  for (const Json& clause : definition["clauses"]) {
    text += clauseInText(clause);
  }
  for (const Json& note : definition["notes"]) {
    text += labelled("note", note);
  }
  return text +
         (definition["decision"].is_null() ? "" : labelled("decided", definition["decision"]));
}

// ---- HTML ----

// The element with the identifier "d" and the number, up to the end of one of its sort.
std::string definitionIn(const std::string& page, std::size_t number, const std::string& element) {
  const std::size_t begin = page.find(" id=\"d" + std::to_string(number) + "\"");
  const std::size_t end = page.find("</" + element + ">", begin);
  return begin == std::string::npos ? "" : page.substr(page.find('>', begin) + 1, end - begin);
}

// What the page says of a definition, in this order.
std::vector<std::string> inPage(const Json& definition) {
  std::vector<std::string> told = {spaced(definition["kind"]) + " " +
                                   definition["name"].get<std::string>() + " (" +
                                   definition["oid"].get<std::string>() + ")"};
  told.push_back(classWord(definition) + " \u2192 " + definition["outcome"].get<std::string>());
  if (definition["risk"] != "none") {
    told.push_back("risk: " + definition["risk"].get<std::string>());
  }
  told.push_back(definition["reason"]);
  for (const auto& [name, side] : std::vector<std::pair<std::string, std::string>>{
           {"Old", "old"}, {"New", "new"}, {"Result", "result"}}) {
    const Json& place = definition["places"][side];
    told.push_back(name + " " + (place.is_null() ? "not there" : shortPlace(place)));
  }
  for (const Json& clause : definition["clauses"]) {
    told.push_back("\u2260 " + clause["clause"].get<std::string>());
    for (const char* const side : {"base", "old", "new", "result"}) {
      if (clause[side].is_string()) {
        told.push_back(clause[side]);
      }
    }
    if (!clause["decided"]) {
      told.emplace_back("? undecided");
    }
  }
  for (const Json& other : definition["otherClauses"]) {
    told.push_back(other["clause"]);
    if (other["clause"] != other["value"]) {
      told.push_back(other["value"]);
    }
  }
  for (const Json& note : definition["notes"]) {
    told.push_back(note);
  }
  if (!definition["decision"].is_null()) {
    told.push_back(definition["decision"]);
  }
  return told;
}

// In the text each finding has its line, or is counted among those of its rule and directory; diff
// tells of differences alone.
void expectFindings(const Json& document, const std::string& text) {
  std::map<std::string, std::size_t> counts;  // by what stands before and behind a count
  std::map<std::string, std::size_t> told;
  for (const Json& finding : document["findings"]) {
    const std::string file = finding["file"];
    const std::string group =
        file.substr(0, file.rfind('/')) + ": warning: # [" + finding["rule"].get<std::string>();
    const std::string line = file + ":" + std::to_string(finding["line"].get<std::size_t>()) + ":" +
                             std::to_string(finding["column"].get<std::size_t>()) + ": " +
                             finding["severity"].get<std::string>() + ": " +
                             finding["text"].get<std::string>();
    ++counts[group];
    told[group] += text.find("\n" + line) == std::string::npos ? 0 : 1;
  }
  for (const auto& [group, count] : counts) {
    if (document["command"] == "diff") {
      EXPECT_EQ(0U, told[group]) << group;
      continue;
    }
    std::string more = "\n" + group + "]\n";
    more.replace(more.find('#'), 1, std::to_string(count - told[group]) + " more like this");
    EXPECT_NE(0U, told[group]) << group;
    EXPECT_EQ(told[group] != count, text.find(more) != std::string::npos) << more;
  }
}

// ---- The runs ----

struct Run {
  const char* name;
  std::vector<std::string> arguments;
};

void PrintTo(const Run& run, std::ostream* out) { *out << run.name; }

class Formats : public ::testing::TestWithParam<Run> {};

TEST_P(Formats, SayTheSame) {
  const ToolFolder folder;
  std::vector<std::string> arguments = GetParam().arguments;
  arguments.insert(arguments.end(), {"--from", EXAMPLES "/old", "--to", EXAMPLES "/new"});
  const std::string text = "\n" + folder.run(arguments).out;
  arguments.insert(arguments.end(), {"--format", "json", "--html", "@/page.html"});
  const Json document = Json::parse(folder.run(arguments).out);
  const std::string page = folder.withoutPath(support::readWholeFile(folder.file("page.html")));
  const std::string pageText = textOf(page);
  std::size_t differences = 0;
  for (std::size_t i = 0; i < document["definitions"].size(); ++i) {
    const Json& definition = document["definitions"][i];
    if (isSame(definition)) {
      EXPECT_NE("", definitionIn(page, i, "p"));
      continue;
    }
    ++differences;
    EXPECT_NE(std::string::npos, text.find("\n" + inText(definition) + "\n"))
        << inText(definition) << "is not in\n"
        << text;
    expectInOrder(inPage(definition), textOf(definitionIn(page, i, "article")));
  }
  EXPECT_GT(differences, 20U);
  std::map<std::string, std::map<std::string, std::size_t>> words;
  for (const Json& definition : document["definitions"]) {
    for (const char* const by : {"class", "outcome", "risk"}) {
      ++words[by][definition[by]];
    }
  }
  // Of those that do not differ diff tells the number alone.
  const std::size_t all = document["counts"]["definitions"];
  if (const std::size_t same = all - document["definitions"].size(); same != 0) {
    words["class"]["same"] += same;
    words["outcome"]["same"] += same;
    words["risk"]["none"] += same;
  }
  nlohmann::json counts = words;
  counts["definitions"] = all;
  EXPECT_EQ(counts, nlohmann::json::parse(document["counts"].dump()));
  EXPECT_NE(std::string::npos,
            text.find(std::to_string(differences) + " differences in " +
                      std::to_string(document["counts"]["definitions"].get<std::size_t>()) +
                      " definitions"));
  for (const char* const findings : {"findings", "newInResult"}) {
    for (const Json& finding : document[findings]) {
      EXPECT_NE(std::string::npos, pageText.find(finding["text"].get<std::string>()));
    }
  }
  expectFindings(document, text);
  for (const Json& refusal : document["refusals"]) {
    EXPECT_NE(std::string::npos, pageText.find(refusal["text"].get<std::string>()));
  }
  EXPECT_EQ(document["ready"].get<bool>(),
            page.find("The migration may go ahead") != std::string::npos);
}

INSTANTIATE_TEST_SUITE_P(Runs, Formats,
                         ::testing::Values(Run{"Diff", {"diff", "--base", EXAMPLES "/base"}},
                                           Run{"DiffWithoutBase", {"diff"}},
                                           Run{"Plan", {"plan", "--base", EXAMPLES "/base"}},
                                           Run{"PlanWithDecisions",
                                               {"plan", "--base", EXAMPLES "/base", "--decisions",
                                                EXAMPLES "/decisions.toml"}},
                                           Run{"PlanWithoutBase", {"plan", "--prefer", "old"}},
                                           Run{"Migrate",
                                               {"migrate", "--dry-run", "--out", "@/out", "--base",
                                                EXAMPLES "/base", "--decisions",
                                                EXAMPLES "/decisions.toml"}}),
                         [](const auto& row) { return row.param.name; });

// ---- Questions ----

// The lines of a template's entry that offer something, as the document's question has them.
std::string offered(const Json& definition) {
  const Json& question = definition["question"];
  std::string takes;
  for (const Json& take : question["take"]) {
    takes += (takes.empty() ? "\"" : " or \"") + take.get<std::string>() + "\"";
  }
  std::string clauses;
  for (const Json& clause : question["clauses"]) {
    clauses += (clauses.empty() ? "" : ", ") + clause["clause"].get<std::string>() + " = \"\"";
  }
  const std::string by = question["by"];
  return "kind = \"" + definition["kind"].get<std::string>() + "\"\n" + by + " = \"" +
         definition[by].get<std::string>() + "\"\nfingerprint = \"" +
         definition["fingerprint"].get<std::string>() + "\"\n# take: " + takes + "\n" +
         (clauses.empty()
              ? ""
              : "# or, clause by clause (old, new, base, of lists union):\n# clauses = { " +
                    clauses + " }\n") +
         (question["move"] ? "# or, beside NEW's: rename = \"\", renumber = \"\"\n" : "") +
         "reason = \"\"\n";
}

TEST(Questions, OfTheDocumentAreThoseOfTheTemplate) {
  const ToolFolder folder;
  const Json document =
      Json::parse(folder
                      .run({"plan", "--base", EXAMPLES "/base", "--from", EXAMPLES "/old", "--to",
                            EXAMPLES "/new", "--template", "@/template", "--format", "json"})
                      .out);
  std::string text = support::readWholeFile(folder.file("template"));
  std::size_t count = 0;
  for (const Json& definition : document["definitions"]) {
    if (definition["question"].is_null()) {
      continue;
    }
    EXPECT_EQ("undecided", definition["outcome"]);
    const std::size_t at = text.find(offered(definition));
    EXPECT_NE(std::string::npos, at) << offered(definition) << "is not in\n" << text;
    ++count;
  }
  // All but the extension that one decision about its attribute type covers.
  EXPECT_EQ(10U, count);
  std::size_t entries = 0;
  for (std::size_t at = 0; (at = text.find("[[definition]]", at)) != std::string::npos; ++at) {
    ++entries;
  }
  EXPECT_EQ(count, entries);
}

}  // namespace
