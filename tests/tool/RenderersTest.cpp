// One report in every format.

#include "Renderers.h"

#include <gtest/gtest.h>

#include <nlohmann/json.hpp>

#include "Json.h"

namespace {

using migration::Finding;
using migration::Severity;

constexpr char kEscapes[] = "a\x1b[31m\nb";

const migration::RuleInfo kRule = {
    "D201", "word-as-oid", Severity::kError, "What.", "Why.", "Mend.", {}, {}};

// A finding of each sort, on texts that would do harm if they were shown as they are.
CheckReport report() {
  static const migration::Source source("dir/V3.user.at",
                                        "# one\n\tattributetypes=( 1.2 \xc3\xa9 X-ORIGIN 'x' )\n");
  Places places(source, true);
  CheckReport report;
  report.directories = {"dir"};
  report.findings = {
      places.reported({"D201", Severity::kError, source.path(), 2, 26, "takes the OID",
                       "attribute type cn (2.5.4.3)"}),
      places.reported({"I702", Severity::kWarning, "dir/V3,100%:", 0, 0, kEscapes, ""}),
  };
  report.accepted = {
      {places.reported({"L105", Severity::kError, source.path(), 1, 1, "text", ""}), "a remark"}};
  report.failures = {{"dir/V3.user.oc", 0, 0, "", "it is a directory"}};
  report.exitCode = 3;
  return report;
}

// "@" stands for the program's version.
nlohmann::json parsed(std::string text) {
  text.replace(text.find('@'), 1, SCHEMA_MIGRATE_VERSION);
  return nlohmann::json::parse(text);
}

TEST(Renderers, Text) {
  EXPECT_EQ(
      "dir/V3.user.at:2:26: error: takes the OID [D201]\n"
      "dir/V3,100%:: warning: a\\x1B[31m\\x0Ab [I702]\n"
      "1 error, 1 warning; 1 accepted; not everything could be checked\n",
      renderText(report(), {}));
}

TEST(Renderers, TextWithExcerpts) {
  EXPECT_EQ(
      "dir/V3.user.at:2:26: error: takes the OID [D201]\n"
      "   attributetypes=( 1.2 \\xC3\\xA9 X-ORIGIN 'x' )\n"
      "                                 ^\n"
      "dir/V3,100%:: warning: a\\x1B[31m\\x0Ab [I702]\n"
      "1 error, 1 warning; 1 accepted; not everything could be checked\n",
      renderText(report(), {true, false}));
}

TEST(Renderers, TextInColour) {
  CheckReport one = report();
  one.findings.resize(1);
  one.accepted.clear();
  one.failures.clear();
  EXPECT_EQ(
      "\x1b[1mdir/V3.user.at:2:26:\x1b[0m \x1b[1;31merror:\x1b[0m takes the OID [D201]\n"
      "   attributetypes=( 1.2 \\xC3\\xA9 X-ORIGIN 'x' )\n"
      "                                 \x1b[1;32m^\x1b[0m\n"
      "1 error, 0 warnings\n",
      renderText(one, {true, true}));
}

TEST(Renderers, WhatCouldNotBeChecked) {
  EXPECT_EQ("dir/V3.user.oc: error: it is a directory\n", renderFailures(report()));
}

TEST(Renderers, TextOfNothing) { EXPECT_EQ("no findings\n", renderText({}, {})); }

TEST(Renderers, ALongLineIsCutOnBothSides) {
  const migration::Source source("f", std::string(500, 'a') + "X" + std::string(500, 'b'));
  Places places(source, true);
  const ReportedFinding reported =
      places.reported({"D201", Severity::kError, "f", 1, 501, "t", ""});
  EXPECT_EQ("..." + std::string(60, 'a') + "X" + std::string(79, 'b') + "...", reported.excerpt);
  EXPECT_EQ('X', reported.excerpt[reported.caret]);
}

TEST(Renderers, CharactersAreCountedFromPlaceToPlace) {
  const migration::Source source("f", "\xc3\xa9\xc3\xa9 x\n\xe2\x82\xac y\n");
  Places places(source, false);
  std::string text;
  const std::pair<std::uint64_t, std::uint64_t> kPlaces[] = {{1, 1}, {1, 5}, {1, 6}, {1, 3},
                                                             {2, 1}, {2, 5}, {1, 6}, {2, 900}};
  for (const auto& [line, column] : kPlaces) {
    const ReportedFinding reported =
        places.reported({"D201", Severity::kError, "f", line, column, "t", ""});
    text += std::to_string(line) + ":" + std::to_string(reported.character) + " ";
    EXPECT_EQ("", reported.excerpt);
  }
  EXPECT_EQ("1:1 1:3 1:4 1:2 2:1 2:3 1:4 2:4 ", text);
}

TEST(Renderers, Github) {
  EXPECT_EQ(
      "::error file=dir/V3.user.at,line=2,col=25,title=D201::takes the OID\n"
      "::warning file=dir/V3%2C100%25%3A,title=I702::a\\x1B[31m%0Ab\n"
      "::error file=dir/V3.user.oc::it is a directory\n",
      renderGithub(report()));
}

TEST(Renderers, Json) {
  EXPECT_EQ(parsed(R"json({
    "version": 1,
    "program": {"name": "schema-migrate", "version": "@"},
    "command": "check",
    "directories": ["dir"],
    "findings": [
      {"rule": "D201", "severity": "error", "file": "dir/V3.user.at", "line": 2, "column": 26,
       "text": "takes the OID", "definition": "attribute type cn (2.5.4.3)",
       "source": {"before": "\tattributetypes=( 1.2 \u00e9 ", "behind": "X-ORIGIN 'x' )"}},
      {"rule": "I702", "severity": "warning", "file": "dir/V3,100%:", "line": 0, "column": 0,
       "text": "a\u001b[31m\nb", "definition": "", "source": null}],
    "rules": [
      {"id": "D201", "name": "word-becomes-oid",
       "what": "A word that the reader does not know stands where a clause begins: an X- clause, APPROX, a second word."},
      {"id": "I702", "name": "file-is-unknown",
       "what": "The name of a file begins with V3. and is none of the nine."}],
    "accepted": [
      {"rule": "L105", "severity": "error", "file": "dir/V3.user.at", "line": 1, "column": 1,
       "text": "text", "definition": "", "reason": "a remark"}],
    "changes": [],
    "failures": [{"file": "dir/V3.user.oc", "line": 0, "column": 0, "text": "it is a directory"}],
    "counts": {"error": 1, "warning": 1, "accepted": 1},
    "exitCode": 3
})json"),
            nlohmann::json::parse(renderJson(report())));
}

TEST(Renderers, JsonIsPrintableWhateverAFileHolds) {
  CheckReport hostile;
  hostile.findings.resize(1);
  hostile.findings[0].finding = {"L102", Severity::kError,   "\xff\x9b", 1,
                                 1,      "\x7f\xc2\x9b\xff", ""};
  for (const char c : renderJson(hostile) + renderSarif(hostile, {&kRule})) {
    EXPECT_TRUE(c == '\n' || (c >= ' ' && c < '\x7f')) << static_cast<int>(c);
  }
}

TEST(Renderers, Sarif) {
  EXPECT_EQ(parsed(R"json({
    "$schema": "https://json.schemastore.org/sarif-2.1.0.json",
    "version": "2.1.0",
    "runs": [{
      "tool": {"driver": {
        "name": "schema-migrate", "version": "@",
        "rules": [{"id": "D201", "name": "word-as-oid", "shortDescription": {"text": "What."},
                   "fullDescription": {"text": "What. Why."}, "help": {"text": "Mend."},
                   "defaultConfiguration": {"level": "error"}}]}},
      "invocations": [{"executionSuccessful": false, "exitCode": 3, "toolExecutionNotifications": [
        {"level": "error", "message": {"text": "it is a directory"}, "locations": [
          {"physicalLocation": {"artifactLocation": {"uri": "dir/V3.user.oc"}}}]}]}],
      "columnKind": "unicodeCodePoints",
      "results": [
        {"ruleId": "D201", "level": "error", "message": {"text": "takes the OID"}, "ruleIndex": 0,
         "locations": [{"physicalLocation": {"artifactLocation": {"uri": "dir/V3.user.at"},
                                             "region": {"startLine": 2, "startColumn": 25}},
                        "logicalLocations": [{"name": "attribute type cn (2.5.4.3)"
}]
}]
},
        {"ruleId": "I702", "level": "warning", "message": {"text": "a\u001b[31m\nb"},
         "locations": [
           {"physicalLocation": {"artifactLocation": {"uri": "dir/V3%2C100%25%3A"}}}]},
        {"ruleId": "L105", "level": "error", "message": {"text": "text"},
         "locations": [{"physicalLocation": {"artifactLocation": {"uri": "dir/V3.user.at"},
                                             "region": {"startLine": 1, "startColumn": 1}}}],
         "suppressions": [{"kind": "external", "justification": "a remark"}]}]
}]
})json"),
            nlohmann::json::parse(renderSarif(report(), {&kRule})));
}

TEST(Renderers, DocumentsKeepToTheirSchemas) {
  if (!canValidateJson()) {
    GTEST_SKIP() << "python3-jsonschema is not here";
  }
  CheckReport mended = report();
  mended.changes.push_back({"D208", Severity::kError, "f", 3, 4, "parentheses", ""});
  for (const CheckReport& each : {CheckReport(), report(), mended}) {
    EXPECT_EQ("", problemsOf(renderJson(each), CHECK_SCHEMA));
    EXPECT_EQ("", problemsOf(renderSarif(each, {&kRule}), SARIF_SCHEMA));
  }
}

// The schemas refuse something: each member is required, and no other is allowed.
TEST(Renderers, SchemasRefuseOtherDocuments) {
  if (!canValidateJson()) {
    GTEST_SKIP() << "python3-jsonschema is not here";
  }
  EXPECT_EQ("findings/0 'rule' is a required property\n", [] {
    auto document = nlohmann::json::parse(renderJson(report()));
    document["findings"][0].erase("rule");
    return problemsOf(document.dump(), CHECK_SCHEMA);
  }());
  EXPECT_EQ(
      "runs/0/results/0/locations/0/physicalLocation/region/startLine 0 is less than the minimum of 1\n",
      [] {
        auto document = nlohmann::json::parse(renderSarif(report(), {&kRule}));
        document["runs"][0]["results"][0]["locations"][0]["physicalLocation"]["region"]
                ["startLine"] = 0;
        return problemsOf(document.dump(), SARIF_SCHEMA);
      }());
}

}  // namespace
