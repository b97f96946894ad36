#include "ORVAttribute.h"

#include <gtest/gtest.h>

#include <string>

#include "Outcomes.h"

namespace {

using definitions::expectClauses;
using definitions::expectOutcomes;
using definitions::expectStanding;
using definitions::outcomeOf;

const std::string kFull =
    "=( 2.5.4.3 DBNAME ( 'cn' 'commonName' ) ACCESS-CLASS critical LENGTH 256 EQUALITY ORDERING "
    "SUBSTR APPROX REVERSE )\n";

const char kFullLine[] =
    "ORVAttributetypes=( 2.5.4.3 DBNAME ( 'cn' 'commonName'  ) ACCESS-CLASS critical LENGTH 256 "
    "EQUALITY ORDERING SUBSTR APPROX REVERSE )";

TEST(ORVAttributeParse, ReadsEveryClauseInAnyOrder) {
  expectOutcomes<ORVAttribute>({
      {"Full", kFull, "1 " + std::string(kFullLine)},
      {"ExampleLine",
       "=( 2.5.4.3 DBNAME ( 'cn' 'cn'  ) ACCESS-CLASS normal LENGTH 256 EQUALITY SUBSTR )",
       "1 ORVAttributetypes=( 2.5.4.3 DBNAME ( 'cn' 'cn'  ) ACCESS-CLASS normal LENGTH 256 "
       "EQUALITY SUBSTR )"},
      {"Backwards",
       "=( REVERSE APPROX SUBSTR ORDERING EQUALITY LENGTH 256 ACCESS-CLASS critical "
       "DBNAME ( 'cn' 'commonName' ) 2.5.4.3 )",
       "1 " + std::string(kFullLine)},
      {"OverSeveralLinesWithComments",
       "=( 1.1 # the OID )\n DBNAME \t(\n'a' 'b' )\n\n# LENGTH 1\nLENGTH 5\nREVERSE\n)\n",
       "1 ORVAttributetypes=( 1.1 DBNAME ( 'a' 'b'  ) ACCESS-CLASS normal LENGTH 5 REVERSE )"},
      {"Nothing", "=( )", "1 ORVAttributetypes=(  ACCESS-CLASS normal )"},
      {"BlockOfNothing", "{ }", "1 ORVAttributetypes=(  ACCESS-CLASS normal )"},
      {"WithoutOpeningParenthesis", "= 1.1 APPROX )",
       "1 ORVAttributetypes=( 1.1 ACCESS-CLASS normal APPROX )"},
      {"OpeningParenthesesInside", "=( ( 1.1\n( APPROX ( )",
       "1 ORVAttributetypes=( 1.1 ACCESS-CLASS normal APPROX )"},
  });
}

TEST(ORVAttributeParse, FirstTokenIsConsumedWhateverItIs) {
  for (const char* first :
       {"=", "{", "(", ")", "}", "1.9", "word", "ORVAttributetypes", "attributetypes", "DBNAME"}) {
    SCOPED_TRACE(first);
    EXPECT_EQ(outcomeOf<ORVAttribute>(std::string(first) + " ( 1.1 APPROX )"),
              "1 ORVAttributetypes=( 1.1 ACCESS-CLASS normal APPROX )");
  }
}

TEST(ORVAttributeParse, EachFlag) {
  const std::string head = "1 ORVAttributetypes=( 1.1 ACCESS-CLASS normal ";
  expectOutcomes<ORVAttribute>({
      {"None", "=( 1.1 )", head + ")"},
      {"Equality", "=( 1.1 EQUALITY )", head + "EQUALITY )"},
      {"Ordering", "=( 1.1 ORDERING )", head + "ORDERING )"},
      {"Substr", "=( 1.1 SUBSTR )", head + "SUBSTR )"},
      {"Approx", "=( 1.1 APPROX )", head + "APPROX )"},
      {"Reverse", "=( 1.1 REVERSE )", head + "REVERSE )"},
      {"Twice", "=( 1.1 REVERSE REVERSE )", head + "REVERSE )"},
      {"TakesNoValue", "=( 1.1 EQUALITY caseIgnoreMatch SUBSTR 2.2 )",
       "1 ORVAttributetypes=( 2.2 ACCESS-CLASS normal EQUALITY SUBSTR )"},
  });
}

TEST(ORVAttributeParse, EachClauseTakesItsKindsOfValueAndDropsTheOthers) {
  const std::string normal = "1 ORVAttributetypes=( 1.1 ACCESS-CLASS normal REVERSE )";
  const std::string everyText =
      "word quoted number length bad-length objectclasses attributetypes orvattributetypes filler";
  expectClauses<ORVAttribute>(
      "=( 1.1 # REVERSE )\n", "MAY",
      {{"ACCESS-CLASS", everyText, "1 ORVAttributetypes=( 1.1 ACCESS-CLASS @ REVERSE )",
        "1 ORVAttributetypes=( 1.1 REVERSE )"},
       {"LENGTH", everyText, "1 ORVAttributetypes=( 1.1 ACCESS-CLASS normal LENGTH @ REVERSE )",
        "1 ORVAttributetypes=( 1.1 ACCESS-CLASS normal LENGTH  REVERSE )"},
       {"DBNAME", "word quoted objectclasses attributetypes orvattributetypes",
        "1 ORVAttributetypes=( 1.1 DBNAME ( '@'  ) ACCESS-CLASS normal REVERSE )", normal}});
}

TEST(ORVAttributeParse, AccessClassAndLength) {
  expectOutcomes<ORVAttribute>({
      {"NoAccessClassIsNormal", "=( 1.1 LENGTH 5 )",
       "1 ORVAttributetypes=( 1.1 ACCESS-CLASS normal LENGTH 5 )"},
      {"LengthZeroIsNoLength", "=( 1.1 LENGTH 0 )",
       "1 ORVAttributetypes=( 1.1 ACCESS-CLASS normal )"},
      {"LengthIsText", "=( 1.1 LENGTH 00 )",
       "1 ORVAttributetypes=( 1.1 ACCESS-CLASS normal LENGTH 00 )"},
      {"LastOneWins", "=( 1.1 LENGTH 5 ACCESS-CLASS a LENGTH 0 ACCESS-CLASS b )",
       "1 ORVAttributetypes=( 1.1 ACCESS-CLASS b )"},
      {"EmptyText", "=( 1.1 ACCESS-CLASS '' LENGTH '' )", "1 ORVAttributetypes=( 1.1 LENGTH  )"},
      {"KeywordIsTheValue", "=( 1.1 ACCESS-CLASS LENGTH 5 LENGTH EQUALITY )",
       "1 ORVAttributetypes=( 5 ACCESS-CLASS LENGTH LENGTH EQUALITY )"},
      {"NumberWithALengthIsKeptWhole", "=( 1.1 LENGTH 5 {6} )",
       "1 ORVAttributetypes=( 1.1 ACCESS-CLASS normal LENGTH 5{6} )"},
  });
}

TEST(ORVAttributeParse, ValueBeforeTheClosingParenthesisBecomesEmpty) {
  expectOutcomes<ORVAttribute>({
      {"AccessClassBeforeTheParenthesis", "=( 1.1 ACCESS-CLASS ) REVERSE )",
       "1 ORVAttributetypes=( 1.1 REVERSE )"},
      {"AccessClassBeforeTheOnlyParenthesis", "=( 1.1 ACCESS-CLASS )\n",
       "0 ORVAttributetypes=( 1.1 )"},
      {"LengthBeforeTheParenthesis", "=( 1.1 LENGTH ) REVERSE )",
       "1 ORVAttributetypes=( 1.1 ACCESS-CLASS normal LENGTH  REVERSE )"},
      {"LengthBeforeTheOnlyParenthesis", "=( 1.1 LENGTH 5 LENGTH )\n",
       "0 ORVAttributetypes=( 1.1 ACCESS-CLASS normal LENGTH  )"},
      {"Brace", "=( 1.1 ACCESS-CLASS critical ACCESS-CLASS } REVERSE )",
       "1 ORVAttributetypes=( 1.1 REVERSE )"},
      {"HighByte", "=( 1.1 ACCESS-CLASS \xFF REVERSE )", "1 ORVAttributetypes=( 1.1 REVERSE )"},
  });
}

// At the end of the input the index of the text is -1 when only blanks and comments came before it;
// when a word or number was lost it is still that of the keyword.
TEST(ORVAttributeParse, ValueLostAtTheEndOfTheFile) {
  expectOutcomes<ORVAttribute>({
      {"LengthNumber", "=( 1.1 LENGTH 25",
       "0 ORVAttributetypes=( 1.1 ACCESS-CLASS normal LENGTH LENGTH )"},
      {"LengthOpenBrace", "=( 1.1 LENGTH 25{6",
       "0 ORVAttributetypes=( 1.1 ACCESS-CLASS normal LENGTH LENGTH )"},
      {"LengthWord", "=( 1.1 LENGTH x",
       "0 ORVAttributetypes=( 1.1 ACCESS-CLASS normal LENGTH LENGTH )"},
      {"AccessClassWord", "=( 1.1 ACCESS-CLASS critical",
       "0 ORVAttributetypes=( 1.1 ACCESS-CLASS ACCESS-CLASS )"},
      {"AccessClassQuoted", "=( 1.1 ACCESS-CLASS 'critical'",
       "0 ORVAttributetypes=( 1.1 ACCESS-CLASS ACCESS-CLASS )"},
      {"AccessClassOpenQuote", "=( 1.1 ACCESS-CLASS 'crit",
       "0 ORVAttributetypes=( 1.1 ACCESS-CLASS ACCESS-CLASS )"},
      {"LengthWithFinalNewline", "=( 1.1 LENGTH 25\n",
       "0 ORVAttributetypes=( 1.1 ACCESS-CLASS normal LENGTH 25 )"},
      {"LengthAndABlank", "=( 1.1 LENGTH ",
       "0 ORVAttributetypes=( 1.1 ACCESS-CLASS normal LENGTH  )"},
      {"LengthAndANewline", "=( 1.1 LENGTH\n",
       "0 ORVAttributetypes=( 1.1 ACCESS-CLASS normal LENGTH  )"},
      {"AccessClassAndAComment", "=( 1.1 ACCESS-CLASS # critical", "0 ORVAttributetypes=( 1.1 )"},
      {"TheKeywordItselfIsLost", "=( 1.1 LENGTH",
       "0 ORVAttributetypes=( 1.1 ACCESS-CLASS normal )"},
  });
}

TEST(ORVAttributeParse, UnknownWordReplacesOid) {
  expectOutcomes<ORVAttribute>({
      {"UnknownKeywordAndValue", "=( 1.2 APPROX X-ORIGIN 'here' )",
       "1 ORVAttributetypes=( here ACCESS-CLASS normal APPROX )"},
      {"LastOneWins", "=( 1.1 1.2 word 'quoted' 1.3 )",
       "1 ORVAttributetypes=( 1.3 ACCESS-CLASS normal )"},
      {"EmptyStringToo", "=( 1.1 '' )", "1 ORVAttributetypes=(  ACCESS-CLASS normal )"},
      {"NumbersWithALengthDoNot", "=( 1.1 1.2{3} 1.4{ 1.5{6 )",
       "1 ORVAttributetypes=( 1.1 ACCESS-CLASS normal )"},
      {"ValuesOfOtherKindsClauses", "=( 1.1 NAME a DESC 'd' SYNTAX 3.3 )",
       "1 ORVAttributetypes=( 3.3 ACCESS-CLASS normal )"},
  });
}

TEST(ORVAttributeParse, OtherTokensAreSkipped) {
  for (const char* skipped : {"objectclasses",
                              "ORVAttributetypes",
                              "NAME",
                              "DESC",
                              "SUP",
                              "AUXILIARY",
                              "MUST",
                              "MAY",
                              "STRUCTURAL",
                              "SYNTAX",
                              "SINGLE-VALUE",
                              "USAGE",
                              "NO-USER-MODIFICATION",
                              "COLLECTIVE",
                              "OBSOLETE",
                              "ABSTRACT",
                              "$",
                              "(",
                              "\n(",
                              "=",
                              ",",
                              "1.5{6}",
                              "1.5{ ",
                              "\xC3\xA4"}) {
    SCOPED_TRACE(skipped);
    EXPECT_EQ(outcomeOf<ORVAttribute>("=( 1.1 " + std::string(skipped) + " APPROX )"),
              "1 ORVAttributetypes=( 1.1 ACCESS-CLASS normal APPROX )");
  }
}

TEST(ORVAttributeParse, DatabaseNames) {
  const std::string two =
      "1 ORVAttributetypes=( 1.1 DBNAME ( 'a' 'b'  ) ACCESS-CLASS normal APPROX )";
  expectOutcomes<ORVAttribute>({
      {"List", "=( 1.1 DBNAME ( 'a' 'b' ) APPROX )", two},
      {"WithoutParentheses", "=( 1.1 DBNAME a b APPROX )", two},
      {"ClosedByAKeyword", "=( 1.1 DBNAME ( 'a' 'b' APPROX )", two},
      {"RepeatsAreKept", "=( 1.1 DBNAME ( 'a' 'A' 'a' ) )",
       "1 ORVAttributetypes=( 1.1 DBNAME ( 'a' 'A' 'a'  ) ACCESS-CLASS normal )"},
      {"StartKeywordsAreValues",
       "=( 1.1 DBNAME ( 'objectClasses' attributeTypes 'ORVattributeTypes' ) )",
       "1 ORVAttributetypes=( 1.1 DBNAME ( 'objectclasses' 'attributetypes' 'ORVAttributetypes'  ) "
       "ACCESS-CLASS normal )"},
      {"AnythingElseIsSkipped",
       "=( 1.1 DBNAME ( ( 'a' $ 3.4 3.4{5} 3.4{ } { NAME DESC SUP AUXILIARY MUST MAY STRUCTURAL SYNTAX "
       "SINGLE-VALUE USAGE NO-USER-MODIFICATION DBNAME COLLECTIVE OBSOLETE ABSTRACT 'b' ) APPROX )",
       two},
      {"EmptyList", "=( 1.1 DBNAME ( ) APPROX )",
       "1 ORVAttributetypes=( 1.1 ACCESS-CLASS normal APPROX )"},
      {"EmptyText", "=( 1.1 DBNAME ( '' ) )",
       "1 ORVAttributetypes=( 1.1 DBNAME ( ''  ) ACCESS-CLASS normal )"},
      {"ASecondClauseAdds", "=( 1.1 DBNAME 'a' APPROX DBNAME ( 'b' ) )", two},
  });
}

TEST(ORVAttributeParse, DatabaseNamesStopAtSevenKeywords) {
  const std::string named = "1 ORVAttributetypes=( 1.2 DBNAME ( 'a'  ) ACCESS-CLASS ";
  expectOutcomes<ORVAttribute>({
      {"Length", "=( 1.2 DBNAME 'a' LENGTH 'b' )", named + "normal LENGTH b )"},
      {"AccessClass", "=( 1.2 DBNAME 'a' ACCESS-CLASS 'b' )", named + "b )"},
      {"Equality", "=( 1.2 DBNAME 'a' EQUALITY )", named + "normal EQUALITY )"},
      {"Approx", "=( 1.2 DBNAME 'a' APPROX )", named + "normal APPROX )"},
      {"Substr", "=( 1.2 DBNAME 'a' SUBSTR )", named + "normal SUBSTR )"},
      {"Ordering", "=( 1.2 DBNAME 'a' ORDERING )", named + "normal ORDERING )"},
      {"Reverse", "=( 1.2 DBNAME 'a' REVERSE )", named + "normal REVERSE )"},
  });
}

TEST(ORVAttributeParse, FirstTokenOfTheDatabaseNamesIsTested) {
  expectOutcomes<ORVAttribute>({
      {"Keyword", "=( 1.2 DBNAME LENGTH 5 )",
       "1 ORVAttributetypes=( 1.2 ACCESS-CLASS normal LENGTH 5 )"},
      {"Flag", "=( 1.2 DBNAME REVERSE 1.3 )",
       "1 ORVAttributetypes=( 1.3 ACCESS-CLASS normal REVERSE )"},
      {"Parenthesis", "=( 1.2 DBNAME ) REVERSE )",
       "1 ORVAttributetypes=( 1.2 ACCESS-CLASS normal REVERSE )"},
  });
}

TEST(ORVAttributeParse, ListThatEndsTheLineEndsTheEntry) {
  expectStanding<ORVAttribute>({
      {"NextEntryOnTheNextLine", "{ ( 1.1 DBNAME ( 'a' )\n( 2.2 ) }\n",
       "1 on 40 line 2 then 2024:2.2 41 125 260"},
      {"EntrysOwnParenthesis", "{ ( 1.1 DBNAME 'a' )\n\n# c\n ( 2.2 ) }\n",
       "1 on 40 line 4 then 2024:2.2 41 125 260"},
      {"EmptyList", "{ ( 1.1 DBNAME )\n( 2.2 ) }\n", "1 on 40 line 2 then 2024:2.2 41 125 260"},
      {"SameLineGoesOn", "{ ( 1.1 DBNAME ( 'a' ) ( 2.2 ) }\n", "1 on 125 line 1 then 260"},
      {"AnotherTokenOnTheNextLineGoesOn", "{ ( 1.1 DBNAME ( 'a' )\nLENGTH\n( 2.2 ) }\n",
       "1 on 125 line 3 then 260"},
      {"ParenthesisAfterACompleteEntry", "{ ( 1.1 DBNAME ( 'a' ) )\n( 2.2 ) }\n",
       "1 on 40 line 2 then 2024:2.2 41 125 260"},
      {"ParenthesisOfTheListOnALineOfItsOwn", "{ ( 1.1 DBNAME ( 'a'\n) ( 2.2 ) }\n",
       "1 on 125 line 2 then 260"},
  });
  expectOutcomes<ORVAttribute>({
      {"NextEntryOnTheNextLine", "{ ( 1.1 DBNAME ( 'a' )\n( 2.2 ) }\n",
       "1 ORVAttributetypes=( 1.1 DBNAME ( 'a'  ) ACCESS-CLASS normal )"},
      {"AfterEarlierClauses", "{ ( 1.1 LENGTH 5 REVERSE DBNAME ( 'a' )\n( 2.2 ) }\n",
       "1 ORVAttributetypes=( 1.1 DBNAME ( 'a'  ) ACCESS-CLASS normal LENGTH 5 REVERSE )"},
      {"SameLineGoesOn", "{ ( 1.1 DBNAME ( 'a' ) ( 2.2 ) }\n",
       "1 ORVAttributetypes=( 2.2 DBNAME ( 'a'  ) ACCESS-CLASS normal )"},
      {"LengthTakesTheParenthesis", "{ ( 1.1 DBNAME ( 'a' )\nLENGTH\n( 2.2 ) }\n",
       "1 ORVAttributetypes=( 2.2 DBNAME ( 'a'  ) ACCESS-CLASS normal LENGTH  )"},
      {"ParenthesisAfterAnotherTokenIsSkipped", "{ ( 1.1 DBNAME ( 'a' ) REVERSE\n( 2.2 ) }\n",
       "1 ORVAttributetypes=( 2.2 DBNAME ( 'a'  ) ACCESS-CLASS normal REVERSE )"},
  });
}

TEST(ORVAttributeParse, RunsOnIntoTheNextEntry) {
  expectOutcomes<ORVAttribute>({
      {"OidOfTheNext",
       "=( 1.1 DBNAME ( 'a' ) LENGTH 5\nORVAttributetypes=( 2.2 DBNAME ( 'b' ) REVERSE )\n",
       "1 ORVAttributetypes=( 2.2 DBNAME ( 'a' 'b'  ) ACCESS-CLASS normal LENGTH 5 REVERSE )"},
      {"ListTookTheParenthesis", "=( 1.1 DBNAME 'a' )\nORVAttributetypes=( 2.2 )\n",
       "1 ORVAttributetypes=( 2.2 DBNAME ( 'a'  ) ACCESS-CLASS normal )"},
      {"OpenList", "=( 1.1 DBNAME ( 'a'\nORVAttributetypes=( 2.2 DBNAME ( 'b' ) )\n",
       "1 ORVAttributetypes=( 1.1 DBNAME ( 'a' 'ORVAttributetypes' 'b'  ) ACCESS-CLASS normal )"},
      {"ObjectClassIsSkippedToo", "=( 1.1\nobjectclasses=( 2.2 )\n",
       "1 ORVAttributetypes=( 2.2 ACCESS-CLASS normal )"},
      {"NotIntoAnAttributeType", "=( 1.1 REVERSE\nattributetypes=( 2.2 )\n",
       "0 ORVAttributetypes=( 1.1 ACCESS-CLASS normal REVERSE )"},
  });
}

TEST(ORVAttributeParse, WhatWasReadBeforeAFailureStays) {
  const std::string read =
      "0 ORVAttributetypes=( 1.1 DBNAME ( 'a'  ) ACCESS-CLASS c LENGTH 5 SUBSTR )";
  const std::string text = "=( 1.1 DBNAME ( 'a' ) ACCESS-CLASS c LENGTH 5 SUBSTR";
  expectOutcomes<ORVAttribute>({
      {"AtTheEnd", text + "\n", read},
      {"AtAnAttributeType", text + " attributeTypes=( 2.2 )", read},
      {"AtTheEndAfterTheList", "=( 1.1 DBNAME ( 'a' )",
       "0 ORVAttributetypes=( 1.1 DBNAME ( 'a'  ) ACCESS-CLASS normal )"},
      {"AtTheEndBeforeAnyClause", "=(", "0 ORVAttributetypes=(  ACCESS-CLASS normal )"},
      {"AtTheEndBeforeAnything", "", "0 ORVAttributetypes=(  ACCESS-CLASS normal )"},
      {"AtAnAttributeTypeBeforeAnyClause", "=( attributetypes=( 2.2 )",
       "0 ORVAttributetypes=(  ACCESS-CLASS normal )"},
      {"NumberAtTheEndOfTheFileIsLost", "=( 1.1", "0 ORVAttributetypes=(  ACCESS-CLASS normal )"},
  });
}

TEST(ORVAttributeParse, StandsOnTheTokenAfterTheEntry) {
  expectStanding<ORVAttribute>({
      {"NextEntry", "=( 1.1 )\n\nORVAttributetypes=( 2.2 )\n",
       "1 on 1016 line 3 then 61 40 2024:2.2 41 260"},
      {"NextOfABlock", "{ ( 1.1 )\n( 2.2 ) }\n", "1 on 40 line 2 then 2024:2.2 41 125 260"},
      {"EndOfABlock", "{ ( 1.1 )\n}\n", "1 on 125 line 2 then 260"},
      {"EndAfterTheParenthesisKeepsTheToken", "=( 1.1 )\n", "1 on 41 line 2 then 260"},
      {"BraceIsNotPassed", "=( 1.1 } word )\n", "1 on 125 line 1 then 259:word 41 260"},
      {"BraceAfterTheList", "=( 1.1 DBNAME ( 'a' ) } word )\n",
       "1 on 125 line 1 then 259:word 41 260"},
      {"ParenthesisAtOnce", "= ) word )\n", "1 on 259 line 1 then 41 260"},
      {"EndKeepsTheToken", "=( 1.1 REVERSE\n", "0 on 1026 line 2 then 260"},
      {"EndAfterTheListKeepsTheToken", "=( 1.1 DBNAME ( 'a' )\n", "0 on 41 line 2 then 260"},
      {"EndAtOnceIsTheToken", "=(\n", "0 on 260 line 2 then 260"},
      {"AttributeType", "=( 1.1\nattributetypes=( 2.2 )\n",
       "0 on 1010 line 2 then 61 40 2024:2.2 41 260"},
      {"AttributeTypeAfterTheList", "=( 1.1 DBNAME ( 'a' )\nattributetypes=( 2.2 )\n",
       "0 on 1010 line 2 then 61 40 2024:2.2 41 260"},
      {"PastTheNextEntry", "=( 1.1\nORVAttributetypes=( 2.2 )\nword\n", "1 on 259 line 3 then 260"},
      {"AfterAValue", "=( 1.1 LENGTH 5 )\nword\n", "1 on 259 line 2 then 260"},
  });
}

}  // namespace
