#include "Attribute.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <string>
#include <vector>

#include "Outcomes.h"

namespace {

using definitions::expectClauses;
using definitions::expectOutcomes;
using definitions::expectStanding;
using definitions::outcomeOf;
using definitions::parsed;

const std::string kFull =
    "=( 2.5.4.3 NAME ( 'cn' 'commonName' ) DESC 'a Name' OBSOLETE SUP name "
    "EQUALITY caseIgnoreMatch ORDERING caseIgnoreOrderingMatch SUBSTR caseIgnoreSubstringsMatch "
    "SYNTAX 1.3.6.1{64} SINGLE-VALUE NO-USER-MODIFICATION USAGE directoryOperation )\n";

const char kFullLine[] =
    "attributetypes=( 2.5.4.3 NAME ( 'cn' 'commonName'  )  DESC 'a Name' OBSOLETE SUP name "
    "EQUALITY caseIgnoreMatch ORDERING caseIgnoreOrderingMatch SUBSTR caseIgnoreSubstringsMatch "
    "SYNTAX 1.3.6.1{64} SINGLE-VALUE NO-USER-MODIFICATION USAGE directoryOperation  )";

TEST(AttributeParse, ReadsEveryClauseInAnyOrder) {
  expectOutcomes<Attribute>({
      {"Full", kFull, "1 " + std::string(kFullLine)},
      {"ExampleLine", "=( 2.5.4.3 NAME 'cn' SUP name )",
       "1 attributetypes=( 2.5.4.3 NAME ( 'cn'  ) SUP name USAGE userApplications  )"},
      {"ExampleWithEverythingUsual",
       "=( 1.2.3 NAME ( 'a' 'b' 'a' ) DESC 'x y' SYNTAX 1.3.6.1.4.1.1466.115.121.1.15{32} "
       "SINGLE-VALUE )\n",
       "1 attributetypes=( 1.2.3 NAME ( 'a' 'b'  )  DESC 'x y' SYNTAX "
       "1.3.6.1.4.1.1466.115.121.1.15{32} SINGLE-VALUE USAGE userApplications  )"},
      {"Backwards",
       "=( USAGE directoryOperation NO-USER-MODIFICATION SINGLE-VALUE SYNTAX 1.3.6.1 {64} "
       "SUBSTR caseIgnoreSubstringsMatch ORDERING caseIgnoreOrderingMatch "
       "EQUALITY caseIgnoreMatch SUP name OBSOLETE NAME ( 'cn' 'commonName' ) DESC 'a Name' "
       "2.5.4.3 )",
       "1 " + std::string(kFullLine)},
      {"OverSeveralLinesWithComments",
       "=( 1.1 # the OID )\n NAME \t( 'a' )\n\n# NAME 'x'\nDESC 'd'\nSUP b\n)\n",
       "1 attributetypes=( 1.1 NAME ( 'a'  )  DESC 'd' SUP b USAGE userApplications  )"},
      {"Nothing", "=( )", "1 attributetypes=(  NAME (  ) USAGE userApplications  )"},
      {"BlockOfNothing", "{ }", "1 attributetypes=(  NAME (  ) USAGE userApplications  )"},
      {"WithoutOpeningParenthesis", "= 1.1 OBSOLETE )",
       "1 attributetypes=( 1.1 NAME (  ) OBSOLETE USAGE userApplications  )"},
      {"OpeningParenthesesInside", "=( ( 1.1 ( OBSOLETE ( )",
       "1 attributetypes=( 1.1 NAME (  ) OBSOLETE USAGE userApplications  )"},
  });
}

TEST(AttributeParse, FirstTokenIsConsumedWhateverItIs) {
  for (const char* first :
       {"=", "{", "(", ")", "}", "1.9", "word", "attributetypes", "NAME", "$"}) {
    SCOPED_TRACE(first);
    EXPECT_EQ(outcomeOf<Attribute>(std::string(first) + " ( 1.1 OBSOLETE )"),
              "1 attributetypes=( 1.1 NAME (  ) OBSOLETE USAGE userApplications  )");
  }
}

TEST(AttributeParse, EachClauseTakesItsKindsOfValueAndDropsTheOthers) {
  const std::string none =
      "1 attributetypes=( 1.1 NAME (  ) SINGLE-VALUE USAGE userApplications  )";
  const std::string head = "1 attributetypes=( 1.1 NAME (  ) ";
  const std::string tail = "SINGLE-VALUE USAGE userApplications  )";
  expectClauses<Attribute>(
      "=( 1.1 # SINGLE-VALUE )\n", "MAY",
      {{"NAME", "word quoted objectclasses attributetypes",
        "1 attributetypes=( 1.1 NAME ( '@'  ) " + tail, none},
       {"DESC", "word quoted", head + " DESC '@' " + tail, none},
       {"SUP", "word quoted number", head + "SUP @ " + tail, none},
       {"EQUALITY", "word quoted number", head + "EQUALITY @ " + tail, none},
       {"ORDERING", "word quoted number", head + "ORDERING @ " + tail, none},
       {"SUBSTR", "word quoted number", head + "SUBSTR @ " + tail, none},
       {"SYNTAX", "word quoted number length", head + "SYNTAX @ " + tail, none},
       {"USAGE", "word quoted", head + "SINGLE-VALUE USAGE @  )", none}});
}

TEST(AttributeParse, ValueOfTheWrongKindKeepsAnEarlierOne) {
  expectOutcomes<Attribute>({
      {"Desc", "=( 1.1 DESC 'd' DESC 12 )",
       "1 attributetypes=( 1.1 NAME (  )  DESC 'd' USAGE userApplications  )"},
      {"Usage", "=( 1.1 USAGE dSAOperation USAGE 12 )",
       "1 attributetypes=( 1.1 NAME (  ) USAGE dSAOperation  )"},
      {"Syntax", "=( 1.1 SYNTAX 1.5{6} SYNTAX 1.6{6 )",
       "1 attributetypes=( 1.1 NAME (  ) SYNTAX 1.5{6} USAGE userApplications  )"},
      {"NumberAfterDescIsConsumed", "=( 1.1 NAME 'a' DESC 12 OBSOLETE )",
       "1 attributetypes=( 1.1 NAME ( 'a'  ) OBSOLETE USAGE userApplications  )"},
  });
}

TEST(AttributeParse, LastValueOfARepeatedClauseWins) {
  expectOutcomes<Attribute>({
      {"SingleValued",
       "=( 1.1 1.2 DESC 'd' DESC 'e' EQUALITY a EQUALITY b ORDERING a ORDERING c SUBSTR a SUBSTR d "
       "SYNTAX a SYNTAX e USAGE a USAGE f )",
       "1 attributetypes=( 1.2 NAME (  )  DESC 'e' EQUALITY b ORDERING c SUBSTR d SYNTAX e "
       "USAGE f  )"},
      {"SuperiorsAreAppendedWithoutADuplicateCheck", "=( 1.1 SUP a SUP b SUP a SUP 1.2 )",
       "1 attributetypes=( 1.1 NAME (  ) SUP a b a 1.2 USAGE userApplications  )"},
      {"EmptyTextsReplace", "=( 1.1 DESC 'd' DESC '' USAGE '' )",
       "1 attributetypes=( 1.1 NAME (  )  )"},
      {"EmptySuperiorCounts", "=( 1.1 SUP '' )",
       "1 attributetypes=( 1.1 NAME (  ) SUP  USAGE userApplications  )"},
  });
}

TEST(AttributeParse, UnknownWordReplacesOid) {
  expectOutcomes<Attribute>({
      {"UnknownKeywordAndValue", "( 1.2 NAME 'a' DESC 'd' X-ORIGIN 'here' )",
       "1 attributetypes=( here NAME ( 'a'  )  DESC 'd' USAGE userApplications  )"},
      {"UnknownKeywordAndValueAfterEquals", "=( 1.2 NAME 'a' DESC 'd' X-ORIGIN 'here' )",
       "1 attributetypes=( here NAME ( 'a'  )  DESC 'd' USAGE userApplications  )"},
      {"LastOneWins", "=( 1.1 1.2 word 'quoted' 1.3 )",
       "1 attributetypes=( 1.3 NAME (  ) USAGE userApplications  )"},
      {"EmptyStringToo", "=( 1.1 '' )", "1 attributetypes=(  NAME (  ) USAGE userApplications  )"},
      {"NumbersWithALengthDoNot", "=( 1.1 1.2{3} 1.4{ 1.5{6 )",
       "1 attributetypes=( 1.1 NAME (  ) USAGE userApplications  )"},
      {"WordAfterAFlag", "=( 1.1 OBSOLETE a )",
       "1 attributetypes=( a NAME (  ) OBSOLETE USAGE userApplications  )"},
      {"ValuesOfOtherKindsClauses", "=( 1.1 MAY a MUST b LENGTH 5 )",
       "1 attributetypes=( 5 NAME (  ) USAGE userApplications  )"},
  });
}

TEST(AttributeParse, OtherTokensAreSkipped) {
  for (const char* skipped :
       {"MUST", "MAY", "AUXILIARY", "STRUCTURAL", "ABSTRACT", "ACCESS-CLASS", "DBNAME", "REVERSE",
        "LENGTH", "APPROX", "$", "(", "=", "\"", ",", "1.5{6}", "1.5{ ", "\xC3\xA4"}) {
    SCOPED_TRACE(skipped);
    EXPECT_EQ(outcomeOf<Attribute>("=( 1.1 " + std::string(skipped) + " OBSOLETE )"),
              "1 attributetypes=( 1.1 NAME (  ) OBSOLETE USAGE userApplications  )");
  }
}

TEST(AttributeParse, NameClause) {
  expectOutcomes<Attribute>({
      {"RepeatedNameIsDropped", "=( 1.2 NAME ( 'a' 'b' 'a' ) DESC 'd' )",
       "1 attributetypes=( 1.2 NAME ( 'a' 'b'  )  DESC 'd' USAGE userApplications  )"},
      {"OnlyAnEqualStringIsARepeat", "=( 1.2 NAME ( 'a' 'A' ) DESC 'd' )",
       "1 attributetypes=( 1.2 NAME ( 'a' 'A'  )  DESC 'd' USAGE userApplications  )"},
      {"DollarsArePassedOver", "=( 1.2 NAME ( 'a' $ 'b' $ 'c' ) OBSOLETE )",
       "1 attributetypes=( 1.2 NAME ( 'a' 'b' 'c'  ) OBSOLETE USAGE userApplications  )"},
      {"NoParenthesesNeeded", "=( 1.2 NAME a b 'c d' OBSOLETE )",
       "1 attributetypes=( 1.2 NAME ( 'a' 'b' 'c d'  ) OBSOLETE USAGE userApplications  )"},
      {"NumbersArePassedOver", "=( 1.2 NAME ( 'a' 3.4 3.4{5} 3.4{ 'b' ) OBSOLETE )",
       "1 attributetypes=( 1.2 NAME ( 'a' 'b'  ) OBSOLETE USAGE userApplications  )"},
      {"KeywordsOfOtherKindsArePassedOver",
       "=( 1.2 NAME ( 'a' MUST MAY STRUCTURAL AUXILIARY ABSTRACT DBNAME ACCESS-CLASS LENGTH APPROX "
       "REVERSE NAME ORVAttributetypes 'b' ) OBSOLETE )",
       "1 attributetypes=( 1.2 NAME ( 'a' 'b'  ) OBSOLETE USAGE userApplications  )"},
      {"TwoStartKeywordsAreNames",
       "=( 1.2 NAME ( 'objectClasses' 'attributeTypes' 'ORVattributeTypes' ) OBSOLETE )",
       "1 attributetypes=( 1.2 NAME ( 'objectclasses' 'attributetypes'  ) OBSOLETE "
       "USAGE userApplications  )"},
      {"EmptyName", "=( 1.2 NAME '' OBSOLETE )",
       "1 attributetypes=( 1.2 NAME ( ''  ) OBSOLETE USAGE userApplications  )"},
      {"ASecondClauseAdds", "=( 1.2 NAME 'a' DESC 'd' NAME ( 'b' 'a' ) OBSOLETE )",
       "1 attributetypes=( 1.2 NAME ( 'a' 'b'  )  DESC 'd' OBSOLETE USAGE userApplications  )"},
      {"NeitherParenthesisNorBraceEnds", "=( 1.2 NAME 'a' ) } { ( 'b' OBSOLETE )",
       "1 attributetypes=( 1.2 NAME ( 'a' 'b'  ) OBSOLETE USAGE userApplications  )"},
  });
}

// Names in the order first met, whatever their number and however they repeat, over two clauses.
TEST(AttributeParse, ManyNames) {
  for (const int count : {1, 11, 12, 13, 14, 25, 300}) {
    SCOPED_TRACE(count);
    std::string clause = "NAME ( ";
    std::vector<std::string> expected;
    const auto add = [&clause, &expected](const std::string& name) {
      clause += "'" + name + "' $ ";
      if (std::find(expected.begin(), expected.end(), name) == expected.end()) {
        expected.push_back(name);
      }
    };
    for (int i = 0; i < count; ++i) {
      add((i % 2 == 0 ? "n" : "N") + std::to_string((i * 7) % count));
      add((i % 4 < 2 ? "n" : "N") + std::to_string(((i / 2) * 7) % count));
    }
    clause += ") OBSOLETE ";
    expected.emplace_back("last");
    EXPECT_EQ(
        parsed<Attribute>("=( 1.1 " + clause + clause + "NAME 'last' SINGLE-VALUE )").getNames(),
        expected);
  }
}

TEST(AttributeParse, FirstTokenOfTheNameClauseIsNotTested) {
  expectOutcomes<Attribute>({
      {"KeywordIsPassedOverAndItsValueIsAName", "=( 1.2 NAME DESC 'd' OBSOLETE )",
       "1 attributetypes=( 1.2 NAME ( 'd'  ) OBSOLETE USAGE userApplications  )"},
      {"FlagIsPassedOver", "=( 1.2 NAME SINGLE-VALUE OBSOLETE )",
       "1 attributetypes=( 1.2 NAME (  ) OBSOLETE USAGE userApplications  )"},
      {"ParenthesisIsPassedOver", "=( 1.2 NAME ) OBSOLETE )",
       "1 attributetypes=( 1.2 NAME (  ) OBSOLETE USAGE userApplications  )"},
  });
}

TEST(AttributeParse, NameClauseStopsAtElevenKeywords) {
  const std::string named = "1 attributetypes=( 1.2 NAME ( 'a'  )";
  expectOutcomes<Attribute>({
      {"Desc", "=( 1.2 NAME 'a' DESC 'b' )", named + "  DESC 'b' USAGE userApplications  )"},
      {"Syntax", "=( 1.2 NAME 'a' SYNTAX 'b' )", named + " SYNTAX b USAGE userApplications  )"},
      {"Obsolete", "=( 1.2 NAME 'a' OBSOLETE 1.3 )",
       "1 attributetypes=( 1.3 NAME ( 'a'  ) OBSOLETE USAGE userApplications  )"},
      {"Sup", "=( 1.2 NAME 'a' SUP 'b' )", named + " SUP b USAGE userApplications  )"},
      {"Usage", "=( 1.2 NAME 'a' USAGE 'b' )", named + " USAGE b  )"},
      {"NoUserModification", "=( 1.2 NAME 'a' NO-USER-MODIFICATION 1.3 )",
       "1 attributetypes=( 1.3 NAME ( 'a'  ) NO-USER-MODIFICATION USAGE userApplications  )"},
      {"SingleValue", "=( 1.2 NAME 'a' SINGLE-VALUE 1.3 )",
       "1 attributetypes=( 1.3 NAME ( 'a'  ) SINGLE-VALUE USAGE userApplications  )"},
      {"Substr", "=( 1.2 NAME 'a' SUBSTR 'b' )", named + " SUBSTR b USAGE userApplications  )"},
      {"Ordering", "=( 1.2 NAME 'a' ORDERING 'b' )",
       named + " ORDERING b USAGE userApplications  )"},
      {"Equality", "=( 1.2 NAME 'a' EQUALITY 'b' )",
       named + " EQUALITY b USAGE userApplications  )"},
      // The eleventh, COLLECTIVE, never completes: AttributeParse.CollectiveNeverCompletes.
  });
}

TEST(AttributeParse, NameReadsOnIntoTheNextDefinition) {
  expectOutcomes<Attribute>({
      {"NamesOfTheNextAreTaken", "=( 1.1 NAME 'a' )\nattributetypes=( 2.2 NAME 'b' DESC 'c' )\n",
       "1 attributetypes=( 1.1 NAME ( 'a' 'attributetypes' 'b'  )  DESC 'c' "
       "USAGE userApplications  )"},
      {"AcrossAVendorEntry",
       "=( 1.1 NAME ( 'a' 'b' ) )\nORVAttributetypes=( 2.2 DBNAME ( 'c' 'a' ) EQUALITY )\n",
       "0 attributetypes=( 1.1 NAME ( 'a' 'b' 'c'  ) USAGE userApplications  )"},
  });
  expectStanding<Attribute>({
      {"PastTheNext",
       "=( 1.1 NAME 'a' )\nattributetypes=( 2.2 NAME 'b' DESC 'c' )\nattributetypes=( 3.3 )\n",
       "1 on 1010 line 3 then 61 40 2024:3.3 41 260"},
  });
}

TEST(AttributeParse, OneValueIsTakenPerSup) {
  expectStanding<Attribute>({
      {"ListEndsTheDefinition", "=( 1.1 SUP ( a $ b ) OBSOLETE )\n",
       "1 on 1022 line 1 then 41 260"},
  });
  expectOutcomes<Attribute>({
      {"MembersOfAListBecomeTheOid", "=( 1.1 SUP ( a $ b ) OBSOLETE )\n",
       "1 attributetypes=( b NAME (  ) USAGE userApplications  )"},
      {"SecondWordBecomesTheOid", "=( 1.1 SUP a b )\n",
       "1 attributetypes=( b NAME (  ) SUP a USAGE userApplications  )"},
  });
}

TEST(AttributeParse, TokenAfterAKeywordIsNeverExaminedAgain) {
  expectOutcomes<Attribute>({
      {"ClosingParenthesis", "=( 1.1 DESC ) OBSOLETE )",
       "1 attributetypes=( 1.1 NAME (  ) OBSOLETE USAGE userApplications  )"},
      {"ClosingParenthesisAndNoOther", "=( 1.1 SYNTAX )",
       "0 attributetypes=( 1.1 NAME (  ) USAGE userApplications  )"},
      {"ClosingBrace", "=( 1.1 SUP } OBSOLETE )",
       "1 attributetypes=( 1.1 NAME (  ) OBSOLETE USAGE userApplications  )"},
      {"StartOfADefinition", "=( 1.1 EQUALITY attributetypes OBSOLETE )",
       "1 attributetypes=( 1.1 NAME (  ) OBSOLETE USAGE userApplications  )"},
      {"Collective", "=( 1.1 USAGE COLLECTIVE OBSOLETE )",
       "1 attributetypes=( 1.1 NAME (  ) OBSOLETE USAGE userApplications  )"},
      {"TheSameKeyword", "=( 1.1 DESC DESC 'd' )",
       "1 attributetypes=( d NAME (  ) USAGE userApplications  )"},
  });
}

TEST(AttributeParse, EndOfInputInsideEveryClauseFails) {
  for (const char* clause : {"DESC", "SUP", "EQUALITY", "ORDERING", "SUBSTR", "SYNTAX", "USAGE"}) {
    for (const char* rest :
         {"\n", " ", "", " word", " 'quoted'", " 'open", " 3.4", " 3.4{5", "# c"}) {
      SCOPED_TRACE(std::string(clause) + rest);
      EXPECT_EQ(outcomeOf<Attribute>("=( 1.1 " + std::string(clause) + rest),
                "0 attributetypes=( 1.1 NAME (  ) USAGE userApplications  )");
    }
  }
}

TEST(AttributeParse, WhatWasReadBeforeAFailureStays) {
  const std::string read =
      "0 attributetypes=( 1.1 NAME ( 'a'  )  DESC 'd' OBSOLETE SUP s USAGE userApplications  )";
  const std::string text = "=( 1.1 NAME 'a' DESC 'd' OBSOLETE SUP s";
  expectOutcomes<Attribute>({
      {"AtTheEnd", text + "\n", read},
      {"AtAnAttributeType", text + " attributetypes=( 2.2 DESC 'e' )", read},
      {"AtAnObjectClass", text + " objectClasses=( 2.2 DESC 'e' )", read},
      {"AtAVendorEntry", text + " ORVAttributetypes=( 2.2 DESC 'e' )", read},
      {"QuotedKeywordIsOneToo", text + " 'attributeTypes' )", read},
      {"AtTheEndBeforeAnyClause", "=(", "0 attributetypes=(  NAME (  ) USAGE userApplications  )"},
      {"AtTheEndBeforeAnything", "", "0 attributetypes=(  NAME (  ) USAGE userApplications  )"},
      {"AtAnAttributeTypeBeforeAnyClause", "=( attributetypes=( 2.2 )",
       "0 attributetypes=(  NAME (  ) USAGE userApplications  )"},
      {"NumberAtTheEndOfTheFileIsLost", "=( 1.1",
       "0 attributetypes=(  NAME (  ) USAGE userApplications  )"},
  });
}

TEST(AttributeParse, StandsOnTheTokenAfterTheDefinition) {
  expectStanding<Attribute>({
      {"NextDefinition", "=( 1.1 )\n\nattributetypes=( 2.2 )\n",
       "1 on 1010 line 3 then 61 40 2024:2.2 41 260"},
      {"NextOfABlock", "{ ( 1.1 )\n( 2.2 ) }\n", "1 on 40 line 2 then 2024:2.2 41 125 260"},
      {"EndOfABlock", "{ ( 1.1 )\n}\n", "1 on 125 line 2 then 260"},
      {"EndAfterTheParenthesisKeepsTheToken", "=( 1.1 )\n", "1 on 41 line 2 then 260"},
      {"BraceIsNotPassed", "=( 1.1 } word )\n", "1 on 125 line 1 then 259:word 41 260"},
      {"BraceAtOnce", "{ } word )\n", "1 on 125 line 1 then 259:word 41 260"},
      {"ParenthesisAtOnce", "= ) word )\n", "1 on 259 line 1 then 41 260"},
      {"EndKeepsTheToken", "=( 1.1 OBSOLETE\n", "0 on 1022 line 2 then 260"},
      {"EndAtOnceIsTheToken", "=(\n", "0 on 260 line 2 then 260"},
      {"AttributeType", "=( 1.1\nattributetypes=( 2.2 )\n",
       "0 on 1010 line 2 then 61 40 2024:2.2 41 260"},
      {"ObjectClass", "=( 1.1\nobjectclasses=( 2.2 )\n",
       "0 on 1002 line 2 then 61 40 2024:2.2 41 260"},
      {"VendorEntry", "=( 1.1\nORVAttributetypes=( 2.2 )\n",
       "0 on 1016 line 2 then 61 40 2024:2.2 41 260"},
      {"AttributeTypeAtOnce", "=( attributetypes=( 2.2 )\n",
       "0 on 1010 line 1 then 61 40 2024:2.2 41 260"},
      {"AfterATrailingValue", "=( 1.1 DESC 'd' )\nword\n", "1 on 259 line 2 then 260"},
      {"AfterANameClause", "=( 1.1 NAME 'a' OBSOLETE )\nword\n", "1 on 259 line 2 then 260"},
  });
}

}  // namespace
