// Saved plans, read back: what a document must have, and where it is told what it lacks.

#include <gtest/gtest.h>

#include <string>

#include "SavedPlan.h"

namespace migration {
namespace {

const std::string kDigest(64, 'a');

// A document with a line for each thing that can be wrong.
std::string document() {
  return "{\n"                                                                    // 1
         "\"version\": 1,\n"                                                      // 2
         "\"program\": {\"name\": \"schema-migrate\",\n"                          // 3
         "  \"version\": \"7.8.9\"},\n"                                           // 4
         "\"command\": \"plan\",\n"                                               // 5
         "\"options\": {\"base\": null, \"from\": \"/old\", \"to\": \"/new\",\n"  // 6
         "  \"excludeOids\": [\"/e1\",\n"                                         // 7
         "    \"/e2\"],\n"                                                        // 8
         "  \"withdraw\": \"/w\", \"decisions\": [\"/d\"],\n"                     // 9
         "  \"prefer\": \"new\",\n"                                               // 10
         "  \"acceptBase\": true, \"allowUnused\": false, \"repair\": false},\n"  // 11
         "\"inputs\": [{\"role\": \"old\", \"path\": \"/old/V3.user.at\",\n"      // 12
         "  \"sha256\": \"" +
         kDigest +
         "\"},\n"                                                  // 13
         "  {\"role\": \"new\", \"path\": \"/new/V3.user.at\",\n"  // 14
         "  \"sha256\": \"" +
         kDigest +
         "\"}],\n"  // 15
         "\"outputs\": [{\"file\": \"V3.user.at\", \"sha256\": \"" +
         kDigest +
         "\"}],\n"                                            // 16
         "\"definitions\": [{\"kind\": \"object-class\"}]\n"  // 17
         "}\n";
}

TEST(SavedPlan, IsReadBack) {
  const Source source("plan.json", document());
  Failures failures;
  const std::optional<SavedPlan> plan = readSavedPlan(source, &failures);
  ASSERT_TRUE(plan.has_value());
  EXPECT_TRUE(failures.empty());
  EXPECT_EQ("plan", plan->command);
  EXPECT_EQ("7.8.9", plan->programVersion);
  EXPECT_EQ("", plan->request.base);
  EXPECT_EQ("/old", plan->request.old);
  EXPECT_EQ("/new", plan->request.latest);
  EXPECT_EQ((std::vector<std::string>{"/e1", "/e2"}), plan->request.excludeLists);
  EXPECT_EQ("/w", plan->request.withdrawList);
  EXPECT_EQ(std::vector<std::string>{"/d"}, plan->request.decisions);
  EXPECT_EQ(Prefer::kNew, plan->request.prefer);
  EXPECT_TRUE(plan->request.acceptBase);
  EXPECT_FALSE(plan->request.allowUnused);
  ASSERT_EQ(2U, plan->inputs.size());
  EXPECT_EQ("new", plan->inputs[1].role);
  EXPECT_EQ("/new/V3.user.at", plan->inputs[1].path);
  EXPECT_EQ(kDigest, plan->inputs[1].sha256);
  ASSERT_EQ(1U, plan->outputs.size());
  EXPECT_EQ("V3.user.at", plan->outputs[0].file);
}

struct Row {
  const char* name;
  const char* from;
  const char* to;
  std::uint64_t line;
  const char* text;
};

void PrintTo(const Row& row, std::ostream* out) { *out << row.name; }

const Row kRows[] = {
    {"NoJson", "{\n", "plan\n", 1, "the JSON text is wrong or ends here"},
    {"AWrongWord", "\"new\",\n  \"acc", "new,\n  \"acc", 10, "the JSON text is wrong or ends here"},
    {"AnotherVersion", "\"version\": 1,", "\"version\": 2,", 2,
     "/version is no version of the document that can be read here"},
    {"NoVersion", "\"version\": 1,\n", "", 1, "it has no member version"},
    {"AnotherProgram", "schema-migrate", "another", 3, "/program/name is another program"},
    {"ADocumentOfDiff", "\"plan\"", "\"diff\"", 5,
     "/command is diff, whose document need not be the whole plan"},
    {"NoCommand", "\"plan\"", "\"check\"", 5, "/command is no command that makes a plan"},
    {"NoOptions", "\"options\"", "\"choices\"", 1, "it has no member options"},
    {"NoPath", "\"/old\"", "\"\"", 6, "/options/from is no path"},
    {"APathWithAZero", "\"/old\"", "\"/o\\u0000ld\"", 6, "/options/from is no path"},
    {"ANumber", "\"/new\"", "5", 6, "/options/to is no text"},
    {"ListsThatAreNone", "[\"/e1\",\n    \"/e2\"]", "{}", 7, "/options/excludeOids is no array"},
    {"AListInAnArray", "\"/e2\"", "null", 8, "/options/excludeOids/1 is no text"},
    {"NoSide", "\"new\",\n  \"acc", "\"base\",\n  \"acc", 10,
     "/options/prefer is neither old nor new"},
    {"NoSwitch", "\"acceptBase\": true", "\"acceptBase\": 1", 11,
     "/options/acceptBase is neither true nor false"},
    {"NoDigest", "\"},\n  {\"role\"", "b\"},\n  {\"role\"", 13, "/inputs/0/sha256 is no SHA-256"},
    {"NoDigestInTheSecond", "\"}],\n\"outputs", "b\"}],\n\"outputs", 15,
     "/inputs/1/sha256 is no SHA-256"},
    {"ADefinitionThatIsNone", "{\"kind\": \"object-class\"}", "7", 17,
     "/definitions/0 has no member kind"},
};

class MalformedPlan : public testing::TestWithParam<Row> {};
INSTANTIATE_TEST_SUITE_P(SavedPlan, MalformedPlan, testing::ValuesIn(kRows),
                         [](const auto& row) { return row.param.name; });

TEST_P(MalformedPlan, IsTold) {
  std::string text = document();
  const std::size_t at = text.find(GetParam().from);
  ASSERT_NE(std::string::npos, at);
  text.replace(at, std::string(GetParam().from).size(), GetParam().to);
  const Source source("plan.json", text);
  Failures failures;
  EXPECT_FALSE(readSavedPlan(source, &failures).has_value());
  ASSERT_EQ(1U, failures.size());
  EXPECT_EQ("plan.json", failures[0].file);
  EXPECT_EQ(std::string("is no saved plan: ") + GetParam().text, failures[0].text);
  EXPECT_EQ(GetParam().line, failures[0].line);
}

// Every beginning of a document ends in a failure, not in anything else.
TEST(SavedPlan, ThatWasCutOffIsTold) {
  const std::string text = document();
  for (std::size_t size = 0; size + 2 < text.size(); ++size) {
    const Source source("plan.json", text.substr(0, size));
    Failures failures;
    EXPECT_FALSE(readSavedPlan(source, &failures).has_value()) << size;
    EXPECT_EQ(1U, failures.size());
  }
}

}  // namespace
}  // namespace migration
