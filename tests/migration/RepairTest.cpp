// What is mended in a text, what is left alone, and that it is kept as it was written then.

#include <gtest/gtest.h>
#include <libschema-migration/Repair.h>

#include <algorithm>
#include <cstdint>
#include <random>
#include <string>

#include "Agreement.h"
#include "GeneratedText.h"
#include "RulesTesting.h"

namespace {

struct Row {
  const char* name;
  std::string text;
  std::string repaired;
  const char* changes;
};

void PrintTo(const Row& row, std::ostream* out) { *out << row.name; }

const Row kRows[] = {
    {"Nothing", "attributetypes=( 1.2 NAME 'a' SUP b )\n",
     "attributetypes=( 1.2 NAME 'a' SUP b )\n", ""},
    {"Parentheses", "objectclasses=( 1.2 ABSTRACT MAY a )\n",
     "objectclasses=( 1.2 ABSTRACT MAY ( a ) )\n",
     "1:30 D208 parentheses round the value of MAY\n"},
    {"ParenthesesOfADatabaseName", "ORVAttributetypes=( 1.2 DBNAME 'a')\n",
     "ORVAttributetypes=( 1.2 DBNAME ( 'a' ))\n",
     "1:25 D208 parentheses round the value of DBNAME\n"},
    {"LastLineEnd", "attributetypes=( 1.2 SUP b )\nend", "attributetypes=( 1.2 SUP b )\nend\n",
     "2:1 L101 a line end behind the last word\n"},
    {"LetterCase", "ATTRIBUTETYPES=( 1.2 sup b Single-Value )\n",
     "attributetypes=( 1.2 SUP b SINGLE-VALUE )\n",
     "1:1 L110 attributetypes in its letter case\n1:22 L110 SUP in its letter case\n"
     "1:28 L110 SINGLE-VALUE in its letter case\n"},
    {"MisspeltKeywordStays", "attributetypes=( 1.2 EQUALTY b )\n",
     "attributetypes=( 1.2 EQUALTY b )\n", ""},
    {"ExtensionBecomesAComment", "attributetypes=( 1.2 SUP b X-ORIGIN ( 'c'\n 'd' ) USAGE e )\n",
     "attributetypes=( 1.2 SUP b # X-ORIGIN ( 'c'  'd' )\n USAGE e )\n",
     "1:28 D201 a comment of X-ORIGIN\n"},
    {"ExtensionBehindTheNames", "attributetypes=( 1.2 NAME 'a' X-B 'c' SUP d )\n",
     "attributetypes=( 1.2 NAME 'a' # X-B 'c'\n SUP d )\n", "1:31 D207 a comment of X-B\n"},
    {"ParenthesesBeforeAnExtension", "objectclasses=( 1.2 ABSTRACT MAY a X-B 'c' )\n",
     "objectclasses=( 1.2 ABSTRACT MAY ( a ) # X-B 'c'\n )\n",
     "1:30 D208 parentheses round the value of MAY\n1:36 D201 a comment of X-B\n"},
    {"CarriageReturns", "attributetypes=( 1.2 SUP\r\n b )\r\n# c\r\n",
     "attributetypes=( 1.2 SUP\n b )\n# c\n",
     "1:25 L113 3 carriage returns before line ends away\n"},
    {"CarriageReturnsThatChangeNothing", "attributetypes=( 1.2\r\n SUP b )\r\n",
     "attributetypes=( 1.2\r\n SUP b )\r\n", ""},
    {"CarriageReturnInTheLine", "attributetypes=( 1.2 SUP\rb )\n", "attributetypes=( 1.2 SUP b )\n",
     "1:25 L113 a blank in place of a carriage return\n"},
    {"UncertainDefinitionStays", "attributetypes=( 1.2 DESC 'a SUP b X-C 'd' )\n",
     "attributetypes=( 1.2 DESC 'a SUP b X-C 'd' )\n", ""},
};

std::string listed(const migration::Repair& repair) {
  std::string text;
  for (const migration::RepairedPlace& change : repair.changes) {
    text += std::to_string(change.place.line) + ":" + std::to_string(change.place.column) + " " +
            change.rule + " " + change.text + "\n";
  }
  return text;
}

class Repair : public testing::TestWithParam<Row> {};

TEST_P(Repair, Mends) {
  const migration::Source source("V3.user.at", GetParam().text);
  const migration::Repair repaired = repair(migration::WrittenFile(source));
  EXPECT_EQ(repaired.bytes, GetParam().repaired);
  EXPECT_EQ(listed(repaired), GetParam().changes);
}

INSTANTIATE_TEST_SUITE_P(, Repair, testing::ValuesIn(kRows),
                         [](const auto& row) { return std::string(row.param.name); });

// Damages that can be mended, any number of them in a valid text.
std::string mendable(std::uint64_t seed) {
  std::mt19937_64 random(seed);
  std::string text = generated::TextMaker(seed).validText();
  const auto replaceSome = [&](const std::string& from, const std::string& to) {
    for (std::size_t at = text.find(from); at != std::string::npos;
         at = text.find(from, at + to.size())) {
      if (random() % 2 == 0) {
        text.replace(at, from.size(), to);
      }
    }
  };
  replaceSome(" SYNTAX ", " syntax ");
  replaceSome(" STRUCTURAL", " Structural");
  replaceSome("objectclasses ", "OBJECTCLASSES ");
  replaceSome(" NO-USER-MODIFICATION", " X-ORIGIN ( 'a b' 'c' ) NO-USER-MODIFICATION");
  replaceSome(" USAGE", " X-NOTE 'it is' USAGE");
  replaceSome(" MUST (", " X-HERE 'x' MUST (");
  if (random() % 3 == 0) {
    replaceSome(" ABSTRACT )", " ABSTRACT MAY cn )");
  }
  if (random() % 3 == 0) {
    for (std::size_t at = 0; (at = text.find('\n', at)) != std::string::npos; at += 2) {
      text.insert(at, "\r");
    }
  }
  return text;
}

// Without the part of a line that holds what the reader has no field for.
std::string withoutOthers(std::string lines) {
  for (std::size_t at = lines.find(" others|"); at != std::string::npos;
       at = lines.find(" others|")) {
    lines.erase(at, lines.find('\n', at) - at);
  }
  return lines;
}

TEST(RepairedText, HasNoFindingLeftAndIsKeptAsItWasWritten) {
  std::size_t mended = 0;
  for (std::uint64_t seed = 0; seed < 1000; ++seed) {
    const std::string text = mendable(seed);
    const migration::SchemaFile before = rules_testing::fileOf("V3.user.at", text);
    const migration::Repair repaired = repair(*before.written);
    const migration::SchemaFile after = rules_testing::fileOf("V3.user.at", repaired.bytes);
    mended += repaired.changes.empty() ? 0 : 1;
    migration::Findings findings;
    migration::checkText(after, &findings);
    for (const migration::Finding& finding : findings) {
      ASSERT_EQ(finding.rule, "L112") << "seed " << seed << "\n" << text << "\n" << repaired.bytes;
    }
    ASSERT_EQ(agreement::linesOf(*after.kept, true),
              withoutOthers(agreement::linesOf(*before.written, true)))
        << "seed " << seed << "\n"
        << text;
  }
  EXPECT_GT(mended, 500U);
}

TEST(RepairedText, OfDamagedTextsIsMendedOnceAndEveryChangeIsTold) {
  for (std::uint64_t seed = 0; seed < 3000; ++seed) {
    const std::string text = generated::TextMaker(seed).damagedText();
    const migration::Source source("V3.user.at", text);
    const migration::WrittenFile written(source);
    const migration::Repair repaired = repair(written);
    ASSERT_EQ(repaired.bytes == text, repaired.changes.empty()) << "seed " << seed << "\n" << text;
    const migration::Source mended("V3.user.at", repaired.bytes);
    const migration::WrittenFile readAgain(mended);
    ASSERT_EQ(listed(repair(readAgain)), "") << "seed " << seed << "\n" << text;
    ASSERT_EQ(withoutOthers(agreement::linesOf(readAgain, true)),
              withoutOthers(agreement::linesOf(written, true)))
        << "seed " << seed << "\n"
        << text << "\n"
        << repaired.bytes;
  }
}

}  // namespace
