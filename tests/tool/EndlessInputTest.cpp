// What schema-migrate foresees of reading a file is what the library's reading comes to.

#include "EndlessInput.h"

#include <gtest/gtest.h>
#include <sys/time.h>
#include <sys/wait.h>
#include <unistd.h>

#include <csignal>
#include <string>
#include <vector>

#include "DefinitionReader.h"
#include "Files.h"
#include "RandomInput.h"
#include "SchemaManager.h"

namespace {

constexpr char kFile[] = "V3.user.at";

// Everything that a forecast tells, as text.
class Teller : public ForecastObserver {
 public:
  void definition(DefinitionKind kind, const Position& begin) override {
    kinds.push_back(kind);
    text += std::string(nameOf(kind)) + " in " + std::to_string(begin.line) + "\n";
  }
  void oddity(const Position& position, const std::string& problem) override {
    text += "odd " + placeOf("", position).substr(1) + " " + problem + "\n";
  }

  std::string text;
  std::vector<DefinitionKind> kinds;
};

std::string outcomeOf(const Forecast& forecast, const Teller& teller) {
  if (forecast.reading == Reading::kSucceeds) {
    return teller.text + "read";
  }
  const char* const outcome = forecast.reading == Reading::kFails ? "fails " : "never ends ";
  return teller.text + outcome + placeOf("", forecast.position).substr(1) + " " + forecast.problem;
}

constexpr long kASecond = 1000;
constexpr long kLongEnough = 20000;

// What the library's reading comes to within this time. It is made in a child process, which can be
// stopped, and may leave definitions behind that nobody frees.
Reading readingOf(const std::string& directory, long milliseconds) {
  const pid_t child = ::fork();
  if (child == 0) {
    std::signal(SIGALRM, SIG_DFL);
    itimerval timer{};
    timer.it_value.tv_sec = milliseconds / 1000;
    timer.it_value.tv_usec = milliseconds % 1000 * 1000;
    ::setitimer(ITIMER_REAL, &timer, nullptr);
    SchemaManager manager(directory);
    ::_exit(manager.readFile(kFile));
  }
  int status = 0;
  EXPECT_EQ(child, ::waitpid(child, &status, 0));
  if (WIFSIGNALED(status)) {
    EXPECT_EQ(SIGALRM, WTERMSIG(status));
    return Reading::kNeverEnds;
  }
  EXPECT_LE(WEXITSTATUS(status), 1);
  return WEXITSTATUS(status) == 0 ? Reading::kSucceeds : Reading::kFails;
}

struct Row {
  const char* name;
  const char* text;
  const char* outcome;
};

void PrintTo(const Row& row, std::ostream* out) { *out << row.name; }

const Row
    kRows
        [] =
            {
                {"EmptyFile", "", "read"},
                {"JunkOnly", "a ( b ) '",
                 "odd 1:9 the text in quotes that begins here is cut off by the end of the file, since only printable ASCII characters and TABs belong to it; what stands behind is read as if it were outside, and definitions may get lost; write the text and its closing quote on one line, without other bytes\nread"},
                {"StringCutOffByALineEnd",
                 "attributetypes=( 1.1 DESC 'a\nb' OBSOLETE )\nattributetypes=( 1.2 )\n",
                 "odd 1:27 the text in quotes that begins here is cut off by the end of the line, since only printable ASCII characters and TABs belong to it; what stands behind is read as if it were outside, and definitions may get lost; write the text and its closing quote on one line, without other bytes\nfails 3:1 the attribute type that begins in line 1 is not closed: another definition comes before its \")\"; write \")\" at its end"},
                {"StringCutOffByAByteOf128",
                 "attributetypes {\n( 1.1 NAME 'gr\xC3\xB6n' OBSOLETE )\n( 1.2 NAME 'b' OBSOLETE )\n}\n",
                 "odd 2:12 the text in quotes that begins here is cut off by the byte \\xC3, since only printable ASCII characters and TABs belong to it; what stands behind is read as if it were outside, and definitions may get lost; write the text and its closing quote on one line, without other bytes\nattribute type in 2\nread"},
                {"StringCutOffBetweenDefinitions", "it's one attributetypes=( 1.1 )\nit's another\nattributetypes=( 1.2 )\n'\n", "odd 1:3 the text in quotes that begins here is cut off by the end of the line, since only printable ASCII characters and TABs belong to it; what stands behind is read as if it were outside, and definitions may get lost; write the text and its closing quote on one line, without other bytes\nodd 4:1 the text in quotes that begins here is cut off by the end of the line, since only printable ASCII characters and TABs belong to it; what stands behind is read as if it were outside, and definitions may get lost; write the text and its closing quote on one line, without other bytes\nattribute type in 3\nread"},
                {"EachKind",
                 "attributetypes=( 1.1 NAME 'a' DESC 'd' )\nobjectclasses=( 1.2 NAME 'b' STRUCTURAL )\nORVAttributetypes=( 1.1 DBNAME ( 'a' ) )\n",
                 "attribute type in 1\nobject class in 2\nvendor extension in 3\nread"},
                {"BlocksOfEachKind",
                 "attributetypes {\n( 1.1 NAME 'a' DESC 'd' )\n\n( 1.2 NAME 'b' OBSOLETE ) }\nobjectclasses { ( 1.3 MAY ( a ) )\n( 1.4 MUST ( a ) ) }\nORVAttributetypes {\n( 1.1 LENGTH 1 ) }\n",
                 "attribute type in 2\nattribute type in 4\nobject class in 5\nobject class in 6\nvendor extension in 8\nread"},
                {"CollectiveInAttributeType", "attributetypes=( 1.1 NAME 'a' COLLECTIVE )\n",
                 "never ends 1:31 COLLECTIVE stands in the attribute type that begins in line 1; the reader does not get past this word, so reading would never end; remove the word"},
                {"CollectiveInABlock",
                 "attributetypes {\n( 1.1 NAME 'a' DESC 'd'\n  COLLECTIVE ) }\n",
                 "never ends 3:3 COLLECTIVE stands in the attribute type that begins in line 2; the reader does not get past this word, so reading would never end; remove the word"},
                {"CollectiveAsAValue", "attributetypes=( 1.1 NAME 'a' SUP COLLECTIVE )\n",
                 "attribute type in 1\nread"},
                {"CollectiveInQuotesInClausePosition", "attributetypes=( 1.1 'COLLECTIVE' )\n",
                 "never ends 1:22 COLLECTIVE stands in the attribute type that begins in line 1; the reader does not get past this word, so reading would never end; remove the word"},
                {"CollectiveBehindTheDefinition", "attributetypes=( 1.1 ) COLLECTIVE\n",
                 "attribute type in 1\nread"},
                {"CollectiveInOtherKinds",
                 "objectclasses=( 1.1 COLLECTIVE NAME 'a' MAY ( b ) )\nORVAttributetypes=( 1.1 COLLECTIVE )\n",
                 "object class in 1\nvendor extension in 2\nread"},
                {"CollectiveBehindAFailure",
                 "attributetypes=( 1.1\nattributetypes=( 1.2 COLLECTIVE )\n",
                 "fails 2:1 the attribute type that begins in line 1 is not closed: another definition comes before its \")\"; write \")\" at its end"},
                {"NamesOfAttributeTypeToTheEnd", "attributetypes=( 1.1 NAME 'a' )\n",
                 "never ends 1:22 nothing ends the NAME clause of the attribute type that begins in line 1: only another clause does, \")\" does not, and none follows to the end of the file, so reading would never end; put a clause behind the names, as in NAME 'a' USAGE userApplications )"},
                {"FirstTokenOfAttributeNamesIsNotLookedAt", "attributetypes=( 1.1 NAME DESC )\n",
                 "never ends 1:22 nothing ends the NAME clause of the attribute type that begins in line 1: only another clause does, \")\" does not, and none follows to the end of the file, so reading would never end; put a clause behind the names, as in NAME 'a' USAGE userApplications )"},
                {"NamesThatSwallowADefinition",
                 "attributetypes=( 1.1 NAME 'a' )\nattributetypes=( 1.2 NAME 'b' DESC 'd' )\n",
                 "odd 2:1 the attribute type that begins here is taken for a part of the attribute type that begins in line 1, which nothing ends before, and is lost; close that one, and see that another clause follows its NAME clause\nattribute type in 1\nread"},
                {"NamesOfObjectClassToTheEnd", "objectclasses=( 1.1\n NAME 'a' )\n",
                 "never ends 2:2 nothing ends the NAME clause of the object class that begins in line 1: only DESC, OBSOLETE, SUP, the kind of the class, MUST or MAY does, \")\" does not, and none follows to the end of the file, so reading would never end; put the kind behind the names, as in NAME 'a' STRUCTURAL )"},
                {"FirstTokenOfClassNamesIsLookedAt", "objectclasses=( 1.1 NAME STRUCTURAL )\n",
                 "object class in 1\nread"},
                {"SyntaxDoesNotEndTheNamesOfAClass",
                 "objectclasses=( 1.1 NAME 'a' SYNTAX 1.2 )\n", "never ends 1:21 nothing ends the NAME clause of the object class that begins in line 1: only DESC, OBSOLETE, SUP, the kind of the class, MUST or MAY does, \")\" does not, and none follows to the end of the file, so reading would never end; put the kind behind the names, as in NAME 'a' STRUCTURAL )"},
                {"DatabaseNamesToTheEnd", "ORVAttributetypes=( 1.1 DBNAME ( 'a' 'b'\n",
                 "never ends 1:25 nothing ends the DBNAME list of the vendor extension that begins in line 1: neither \")\" nor another clause follows to the end of the file, so reading would never end; put \")\" behind the names"},
                {"DatabaseNamesThenAnotherLine",
                 "ORVAttributetypes {\n( 1.1 DBNAME ( 'a' )\n( 1.2 DBNAME ( 'b' ) ) }\n",
                 "vendor extension in 2\nvendor extension in 3\nread"},
                // The newline that ends a string is not counted, so "(" seems to stand on the same
                // line.
                {"DatabaseNamesThenALineThatDoesNotCount",
                 "ORVAttributetypes {\n( 1.1 DBNAME ( a ) 'x\n( 1.2 DBNAME ( 'b' ) ) }\n",
                 "odd 2:20 the text in quotes that begins here is cut off by the end of the line, since only printable ASCII characters and TABs belong to it; what stands behind is read as if it were outside, and definitions may get lost; write the text and its closing quote on one line, without other bytes\nvendor extension in 2\nread"},
                {"AttributeTypeNotClosed", "attributetypes=( 1.1 DESC 'd'\n",
                 "fails 2:1 the attribute type that begins in line 1 is not closed: the end of the file comes before its \")\"; write \")\" at its end"},
                {"ObjectClassNotClosed", "objectclasses=( 1.1 DESC 'd'\n\nobjectclasses=( 1.2 )\n",
                 "fails 3:1 the object class that begins in line 1 is not closed: another object class comes before its \")\"; write \")\" at its end"},
                {"VendorExtensionNotClosed",
                 "ORVAttributetypes=( 1.1 LENGTH 3\nattributetypes=( 1.2 )\n",
                 "fails 2:1 the vendor extension that begins in line 1 is not closed: an attribute type comes before its \")\"; write \")\" at its end"},
                {"VendorExtensionThatSwallowsAnother",
                 "ORVAttributetypes=( 1.1 LENGTH 3\nORVAttributetypes=( 1.2 LENGTH 4 )\n",
                 "odd 2:1 the vendor extension that begins here is taken for a part of the vendor extension that begins in line 1, which nothing ends before, and is lost; close that one, and see that another clause follows its NAME clause\nvendor extension in 1\nread"},
                {"BlockNotClosed", "attributetypes {\n( 1.1 DESC 'd' )\n",
                 "attribute type in 2\nfails 3:1 the attribute type that begins in line 3 is not closed: the end of the file comes before its \")\"; write \")\" at its end"},
                {"LengthOfNumberNotComplete", "objectclasses=( 1.1{x ABSTRACT )\n",
                 "fails 1:17 the length of the number \"1.1{\" in the object class that begins in line 1 is not complete; write digits and \"}\" behind the \"{\", or take the \"{\" away"},
                {"NeitherFormOfDefinition", "attributetypes ( 1.1 )\n",
                 "fails 1:16 neither \"=\" nor \"{\" stands behind the word that begins an attribute type; write \"=\" before a single definition, \"{\" before a block of them, or take the word away"},
                {"KeywordAtTheEnd", "\nobjectClasses ",
                 "fails 2:15 neither \"=\" nor \"{\" stands behind the word that begins an object class; write \"=\" before a single definition, \"{\" before a block of them, or take the word away"},
                {"ClosingParenthesisIsTheLastByte", "attributetypes=( 1.1 )",
                 "attribute type in 1\nread"},
                {"ClosingParenthesisInPlaceOfAValue", "attributetypes=( 1.1 DESC ) )\n",
                 "attribute type in 1\nread"},
                {"UnknownWordReplacesOid",
                 "attributetypes=( 1.1 NAME 'a' DESC 'd' X-ORIGIN 'site' )\n",
                 "odd 1:40 \"X-ORIGIN\" takes the place of the OID of the attribute type that begins in line 1: it stands where a clause begins and is no keyword that is known there; remove it\nattribute type in 1\nread"},
                {"NumberInAList", "objectclasses=( 1.1 MUST ( 2.5.4.3 $ cn ) )\n",
                 "odd 1:28 \"2.5.4.3\" takes the place of the OID of the object class that begins in line 1: it stands where a clause begins and is no keyword that is known there; remove it\nobject class in 1\nread"},
};

class EndlessInput : public testing::TestWithParam<Row> {};

TEST_P(EndlessInput, IsForeseen) {
  Teller teller;
  const Forecast forecast = foreseeReading(GetParam().text, &teller);
  EXPECT_EQ(GetParam().outcome, outcomeOf(forecast, teller));
}

TEST_P(EndlessInput, IsForeseenAsTheLibraryReads) {
  const support::TemporaryDirectory directory;
  directory.write(kFile, GetParam().text);
  const Reading foreseen = foreseeReading(GetParam().text, nullptr).reading;
  EXPECT_EQ(foreseen,
            readingOf(directory.path(), foreseen == Reading::kNeverEnds ? kASecond : kLongEnough));
}

INSTANTIATE_TEST_SUITE_P(Rows, EndlessInput, testing::ValuesIn(kRows),
                         [](const auto& row) { return std::string(row.param.name); });

// Of what is foreseen not to end, one in so many is tried; the others take their second each.
class Sample {
 public:
  explicit Sample(int oneIn) : m_oneIn(oneIn) {}
  bool takes() { return m_count++ % m_oneIn == 0; }

 private:
  int m_oneIn;
  int m_count = 0;
};

// Compares the forecast with the library on one text; returns it.
Reading check(const support::TemporaryDirectory& directory, const std::string& text,
              Sample* endless) {
  directory.write(kFile, text);
  Teller teller;
  const Reading foreseen = foreseeReading(text, &teller).reading;
  if (foreseen == Reading::kNeverEnds) {
    if (endless->takes()) {
      EXPECT_EQ(foreseen, readingOf(directory.path(), kASecond)) << text;
    }
    return foreseen;
  }
  EXPECT_EQ(foreseen, readingOf(directory.path(), kLongEnough)) << text;
  std::vector<DefinitionKind> kinds;
  readDefinitions(directory.path(), kFile,
                  [&](DefinitionKind kind, bool, auto) { kinds.push_back(kind); });
  EXPECT_EQ(kinds, teller.kinds) << text;
  return foreseen;
}

TEST(EndlessInputAtRandom, IsForeseenAsTheLibraryReads) {
  RandomInput random(2);
  const support::TemporaryDirectory directory;
  Sample endless(50);
  int counts[3] = {};
  for (int round = 0; round < 2000 && !testing::Test::HasFailure(); ++round) {
    const std::string text = round % 4 == 0 ? random.pieces() : random.damagedDefinitions();
    SCOPED_TRACE("round " + std::to_string(round));
    ++counts[static_cast<int>(check(directory, text, &endless))];
  }
  // All three outcomes must have been tried, or the inputs are no test.
  EXPECT_GT(counts[0], 100);
  EXPECT_GT(counts[1], 100);
  EXPECT_GT(counts[2], 100);
}

TEST(EndlessInputCutShort, IsForeseenAsTheLibraryReads) {
  const std::string text =
      "attributetypes=( 1.1 NAME ( 'a' 'b' ) DESC 'd' SUP c EQUALITY e SYNTAX 1.2{3} USAGE x )\n"
      "attributetypes { ( 1.2 NAME 'f' OBSOLETE ) ( 1.3 DESC 'g' ) }\n"
      "objectclasses=( 1.4 NAME 'h' SUP ( i $ j ) ABSTRACT MUST ( k $ l ) MAY ( m ) )\n"
      "ORVAttributetypes=( 1.1 DBNAME ( 'a' 'a' ) ACCESS-CLASS normal LENGTH 3 EQUALITY )\n"
      "ORVAttributetypes { ( 1.2 DBNAME ( 'f' )\n( 1.3 REVERSE ) }\n# end";
  const support::TemporaryDirectory directory;
  Sample endless(25);
  for (std::size_t length = 0; length <= text.size(); ++length) {
    SCOPED_TRACE("first " + std::to_string(length) + " bytes");
    check(directory, text.substr(0, length), &endless);
  }
}

}  // namespace
