#include "ObjectClass.h"

#include <gtest/gtest.h>

#include <string>

#include "Outcomes.h"

namespace {

using definitions::expectClauses;
using definitions::expectOutcomes;
using definitions::expectStanding;
using definitions::outcomeOf;

const std::string kFull =
    "=( 2.5.6.6 NAME ( 'person' 'Human' ) DESC 'a Person' OBSOLETE SUP ( top $ other ) AUXILIARY "
    "MUST ( cn $ sn ) MAY ( seeAlso $ telephoneNumber $ userPassword ) )\n";

const char kFullLine[] =
    "objectclasses=( 2.5.6.6 NAME ( 'person' 'Human'  )  DESC 'a Person' OBSOLETE "
    "SUP ( top $ other ) AUXILIARY MUST ( cn $ sn ) MAY ( seeAlso $ telephoneNumber $ userPassword ) "
    ")";

TEST(ObjectClassParse, ReadsEveryClauseInAnyOrder) {
  expectOutcomes<ObjectClass>({
      {"Full", kFull, "1 " + std::string(kFullLine)},
      {"ExampleLine",
       "=( 2.5.6.6 NAME 'person'  DESC 'a person' SUP ( top ) STRUCTURAL MUST ( cn $ sn ) )",
       "1 objectclasses=( 2.5.6.6 NAME 'person'  DESC 'a person' SUP ( top ) STRUCTURAL "
       "MUST ( cn $ sn ) )"},
      {"Backwards",
       "=( MAY ( seeAlso telephoneNumber userPassword ) MUST ( cn sn ) AUXILIARY SUP ( top other ) "
       "OBSOLETE NAME ( 'person' $ 'Human' ) DESC 'a Person' 2.5.6.6 )",
       "1 " + std::string(kFullLine)},
      {"OverSeveralLinesWithComments",
       "=( 1.1 # the OID )\n NAME \t'a'\n\n# NAME 'x'\nDESC 'd'\nSUP b\nMUST\n(c\n$ d)\n)\n",
       "1 objectclasses=( 1.1 NAME 'a'  DESC 'd' SUP ( b ) STRUCTURAL MUST ( c $ d ) )"},
      {"Nothing", "=( )", "1 objectclasses=(  NAME STRUCTURAL )"},
      {"BlockOfNothing", "{ }", "1 objectclasses=(  NAME STRUCTURAL )"},
      {"WithoutOpeningParenthesis", "= 1.1 OBSOLETE )",
       "1 objectclasses=( 1.1 NAME OBSOLETE STRUCTURAL )"},
      {"WithoutKindIsStructural", "=( 1.1 NAME 'a' DESC 'd' )",
       "1 objectclasses=( 1.1 NAME 'a'  DESC 'd' STRUCTURAL )"},
      {"LastKindWins", "=( 1.1 STRUCTURAL ABSTRACT AUXILIARY )",
       "1 objectclasses=( 1.1 NAME AUXILIARY )"},
      {"LastKindWinsStructural", "=( 1.1 AUXILIARY STRUCTURAL )",
       "1 objectclasses=( 1.1 NAME STRUCTURAL )"},
      {"Abstract", "=( 1.1 ABSTRACT )", "1 objectclasses=( 1.1 NAME ABSTRACT )"},
  });
}

TEST(ObjectClassParse, FirstTokenIsConsumedWhateverItIs) {
  for (const char* first : {"=", "{", "(", ")", "}", "1.9", "word", "objectclasses", "NAME", "$"}) {
    SCOPED_TRACE(first);
    EXPECT_EQ(outcomeOf<ObjectClass>(std::string(first) + " ( 1.1 OBSOLETE )"),
              "1 objectclasses=( 1.1 NAME OBSOLETE STRUCTURAL )");
  }
}

TEST(ObjectClassParse, EachClauseTakesItsKindsOfValueAndDropsTheOthers) {
  const std::string none = "1 objectclasses=( 1.1 NAME OBSOLETE STRUCTURAL )";
  expectClauses<ObjectClass>(
      "=( 1.1 # OBSOLETE )\n", "SYNTAX",
      {{"NAME", "word quoted", "1 objectclasses=( 1.1 NAME '@' OBSOLETE STRUCTURAL )", none},
       {"DESC", "word quoted", "1 objectclasses=( 1.1 NAME  DESC '@' OBSOLETE STRUCTURAL )", none},
       {"SUP", "word quoted", "1 objectclasses=( 1.1 NAME OBSOLETE SUP ( @ ) STRUCTURAL )", none}});
}

TEST(ObjectClassParse, ValueOfTheWrongKindKeepsAnEarlierOne) {
  expectOutcomes<ObjectClass>({
      {"Desc", "=( 1.1 DESC 'd' DESC 12 )", "1 objectclasses=( 1.1 NAME  DESC 'd' STRUCTURAL )"},
      {"DescReplaced", "=( 1.1 DESC 'd' DESC 'e' )",
       "1 objectclasses=( 1.1 NAME  DESC 'e' STRUCTURAL )"},
      {"DescEmptied", "=( 1.1 DESC 'd' DESC '' )", "1 objectclasses=( 1.1 NAME STRUCTURAL )"},
      {"NumberAfterSupIsSkipped", "=( 1.1 SUP 2.2 OBSOLETE )",
       "1 objectclasses=( 1.1 NAME OBSOLETE STRUCTURAL )"},
  });
}

TEST(ObjectClassParse, UnknownWordReplacesOid) {
  expectOutcomes<ObjectClass>({
      {"UnknownKeywordAndValue", "=( 1.2 NAME 'a' DESC 'd' X-ORIGIN 'here' )",
       "1 objectclasses=( here NAME 'a'  DESC 'd' STRUCTURAL )"},
      {"LastOneWins", "=( 1.1 1.2 word 'quoted' 1.3 )", "1 objectclasses=( 1.3 NAME STRUCTURAL )"},
      {"EmptyStringToo", "=( 1.1 '' )", "1 objectclasses=(  NAME STRUCTURAL )"},
      {"NumberWithALengthDoesNot", "=( 1.1 1.2{3} )", "1 objectclasses=( 1.1 NAME STRUCTURAL )"},
      {"WordAfterTheKind", "=( 1.1 ABSTRACT a )", "1 objectclasses=( a NAME ABSTRACT )"},
      {"ValuesOfOtherKindsClauses", "=( 1.1 SYNTAX a EQUALITY b LENGTH 5 )",
       "1 objectclasses=( 5 NAME STRUCTURAL )"},
  });
}

TEST(ObjectClassParse, OtherTokensAreSkipped) {
  for (const char* skipped : {"attributetypes",
                              "EQUALITY",
                              "SYNTAX",
                              "SINGLE-VALUE",
                              "USAGE",
                              "NO-USER-MODIFICATION",
                              "ORVAttributetypes",
                              "ACCESS-CLASS",
                              "DBNAME",
                              "SUBSTR",
                              "REVERSE",
                              "ORDERING",
                              "COLLECTIVE",
                              "LENGTH",
                              "APPROX",
                              "$",
                              "=",
                              "\"",
                              ",",
                              "1.5{6}",
                              "\xC3\xA4"}) {
    SCOPED_TRACE(skipped);
    EXPECT_EQ(outcomeOf<ObjectClass>("=( 1.1 " + std::string(skipped) + " OBSOLETE )"),
              "1 objectclasses=( 1.1 NAME OBSOLETE STRUCTURAL )");
  }
}

TEST(ObjectClassParse, BadLengthFailsAtOnce) {
  expectOutcomes<ObjectClass>({
      {"AsOid", "=( 1.1{x NAME 'a' MAY b )", "0 objectclasses=(  NAME STRUCTURAL )"},
      {"Later", "=( 1.1 NAME 'a' MAY b 1.5{6 OBSOLETE )",
       "0 objectclasses=( 1.1 NAME 'a' STRUCTURAL MAY ( b ) )"},
      {"AfterAListWithoutParentheses", "=( 1.1 MAY 1.5{ OBSOLETE )",
       "0 objectclasses=( 1.1 NAME STRUCTURAL )"},
      {"InAList", "=( 1.1 MAY ( a 1.5{ OBSOLETE )",
       "0 objectclasses=( 1.1 NAME STRUCTURAL MAY ( a ) )"},
      {"NotInsideNames", "=( 1.1 NAME ( 'a' 1.5{ 'b' ) OBSOLETE )",
       "1 objectclasses=( 1.1 NAME ( 'a' 'b'  ) OBSOLETE STRUCTURAL )"},
      {"NotAsAValue", "=( 1.1 DESC 1.5{ SUP 1.5{ OBSOLETE )",
       "1 objectclasses=( 1.1 NAME OBSOLETE STRUCTURAL )"},
  });
}

TEST(ObjectClassParse, NameClause) {
  expectOutcomes<ObjectClass>({
      {"RepeatsAreKept", "=( 1.2 NAME ( 'a' 'b' 'a' ) OBSOLETE )",
       "1 objectclasses=( 1.2 NAME ( 'a' 'b' 'a'  ) OBSOLETE STRUCTURAL )"},
      {"OneNameInParentheses", "=( 1.2 NAME ( 'a' ) OBSOLETE )",
       "1 objectclasses=( 1.2 NAME 'a' OBSOLETE STRUCTURAL )"},
      {"NoParenthesesNeeded", "=( 1.2 NAME a b 'c d' OBSOLETE )",
       "1 objectclasses=( 1.2 NAME ( 'a' 'b' 'c d'  ) OBSOLETE STRUCTURAL )"},
      {"AnythingElseIsSkipped",
       "=( 1.2 NAME ( 'a' $ 3.4 3.4{5} 3.4{ } { ) objectclasses attributetypes ORVAttributetypes NAME "
       "EQUALITY SYNTAX SINGLE-VALUE USAGE NO-USER-MODIFICATION ACCESS-CLASS DBNAME SUBSTR REVERSE "
       "ORDERING COLLECTIVE LENGTH APPROX 'b' ) OBSOLETE )",
       "1 objectclasses=( 1.2 NAME ( 'a' 'b'  ) OBSOLETE STRUCTURAL )"},
      {"EmptyName", "=( 1.2 NAME '' OBSOLETE )",
       "1 objectclasses=( 1.2 NAME '' OBSOLETE STRUCTURAL )"},
      {"ASecondClauseAdds", "=( 1.2 NAME 'a' DESC 'd' NAME 'a' OBSOLETE )",
       "1 objectclasses=( 1.2 NAME ( 'a' 'a'  )  DESC 'd' OBSOLETE STRUCTURAL )"},
  });
}

TEST(ObjectClassParse, NameFollowedByItsKindHasNoNames) {
  expectOutcomes<ObjectClass>({
      {"Kind", "=( 1.2 NAME STRUCTURAL )", "1 objectclasses=( 1.2 NAME STRUCTURAL )"},
      {"Desc", "=( 1.2 NAME DESC 'd' )", "1 objectclasses=( 1.2 NAME  DESC 'd' STRUCTURAL )"},
      {"EmptyList", "=( 1.2 NAME ( ) MAY ( a ) )",
       "1 objectclasses=( 1.2 NAME STRUCTURAL MAY ( a ) )"},
  });
}

TEST(ObjectClassParse, NameClauseStopsAtEightKeywords) {
  const std::string named = "1 objectclasses=( 1.2 NAME 'a' ";
  expectOutcomes<ObjectClass>({
      {"Desc", "=( 1.2 NAME 'a' DESC 'b' )", named + " DESC 'b' STRUCTURAL )"},
      {"Structural", "=( 1.2 NAME 'a' STRUCTURAL 1.3 )",
       "1 objectclasses=( 1.3 NAME 'a' STRUCTURAL )"},
      {"Auxiliary", "=( 1.2 NAME 'a' AUXILIARY )", named + "AUXILIARY )"},
      {"Abstract", "=( 1.2 NAME 'a' ABSTRACT )", named + "ABSTRACT )"},
      {"Obsolete", "=( 1.2 NAME 'a' OBSOLETE )", named + "OBSOLETE STRUCTURAL )"},
      {"Sup", "=( 1.2 NAME 'a' SUP 'b' )", named + "SUP ( b ) STRUCTURAL )"},
      {"Must", "=( 1.2 NAME 'a' MUST ( 'b' ) )", named + "STRUCTURAL MUST ( b ) )"},
      {"May", "=( 1.2 NAME 'a' MAY ( 'b' ) )", named + "STRUCTURAL MAY ( b ) )"},
  });
}

TEST(ObjectClassParse, NameReadsOnIntoTheNextDefinition) {
  const std::string text =
      "=( 1.1 NAME 'a' )\nobjectclasses=( 2.2 NAME 'b' MUST ( cn ) )\nobjectclasses=( 3.3 )\n";
  expectOutcomes<ObjectClass>(
      {{"NamesOfTheNextAreTaken", text,
        "1 objectclasses=( 1.1 NAME ( 'a' 'b'  ) STRUCTURAL MUST ( cn ) )"}});
  expectStanding<ObjectClass>(
      {{"PastTheNext", text, "1 on 1002 line 3 then 61 40 2024:3.3 41 260"}});
}

TEST(ObjectClassParse, Lists) {
  expectOutcomes<ObjectClass>({
      {"SupAloneAndInParentheses", "=( 1.1 SUP top )",
       "1 objectclasses=( 1.1 NAME SUP ( top ) STRUCTURAL )"},
      {"SupInParentheses", "=( 1.1 SUP ( top ) )",
       "1 objectclasses=( 1.1 NAME SUP ( top ) STRUCTURAL )"},
      {"SupWithoutSeparator", "=( 1.1 SUP ( a b ) )",
       "1 objectclasses=( 1.1 NAME SUP ( a $ b ) STRUCTURAL )"},
      {"SupWithSeparator", "=( 1.1 SUP ( a $ b ) )",
       "1 objectclasses=( 1.1 NAME SUP ( a $ b ) STRUCTURAL )"},
      {"SupTakesOneWordWithoutParentheses", "=( 1.1 SUP a b )",
       "1 objectclasses=( b NAME SUP ( a ) STRUCTURAL )"},
      {"RepeatedClausesAdd", "=( 1.1 SUP a SUP ( b a ) MUST ( c ) MUST ( c ) MAY d MAY ( e ) )",
       "1 objectclasses=( 1.1 NAME SUP ( a $ b $ a ) STRUCTURAL MUST ( c $ c ) MAY ( d $ e ) )"},
      {"SeparatorsAnywhere", "=( 1.1 MUST ( $ a $ $ b c $ ) )",
       "1 objectclasses=( 1.1 NAME STRUCTURAL MUST ( a $ b $ c ) )"},
      {"MustWithoutParentheses", "=( 1.1 MUST cn ABSTRACT )",
       "1 objectclasses=( 1.1 NAME ABSTRACT MUST ( cn ) )"},
      {"MayWithoutParentheses", "=( 1.1 MAY cn $ sn OBSOLETE )",
       "1 objectclasses=( 1.1 NAME OBSOLETE STRUCTURAL MAY ( cn $ sn ) )"},
      {"Empty", "=( 1.1 SUP ( ) MUST ( ) MAY ( $ ) )", "1 objectclasses=( 1.1 NAME STRUCTURAL )"},
      {"EmptyMember", "=( 1.1 MAY ( '' a ) )",
       "1 objectclasses=( 1.1 NAME STRUCTURAL MAY (  $ a ) )"},
      {"StartKeywordsAreMembers",
       "=( 1.1 SUP ( objectClasses a ) MUST ( objectClasses $ attributeTypes ) MAY ( 'attributeTypes' ) )",
       "1 objectclasses=( 1.1 NAME SUP ( objectclasses $ a ) STRUCTURAL "
       "MUST ( objectclasses $ attributetypes ) MAY ( attributetypes ) )"},
      {"ButNotAloneAfterSup", "=( 1.1 SUP objectClasses SUP attributeTypes OBSOLETE )",
       "1 objectclasses=( 1.1 NAME OBSOLETE STRUCTURAL )"},
      {"StartKeywordsWithoutParentheses", "=( 1.1 MUST objectClasses OBSOLETE )",
       "1 objectclasses=( 1.1 NAME OBSOLETE STRUCTURAL MUST ( objectclasses ) )"},
      {"MissingParenthesisAtTheEnd", "=( 1.1 MUST ( a MAY ( b OBSOLETE )",
       "1 objectclasses=( 1.1 NAME OBSOLETE STRUCTURAL MUST ( a ) MAY ( b ) )"},
  });
}

TEST(ObjectClassParse, AListEndsAtTheFirstOtherToken) {
  expectOutcomes<ObjectClass>({
      {"NumberBecomesTheOidAndTheParenthesisEnds", "=( 1.1 MUST ( a 3.4 b ) OBSOLETE )",
       "1 objectclasses=( b NAME STRUCTURAL MUST ( a ) )"},
      {"NumberWithALengthIsSkipped", "=( 1.1 MAY ( 3.4{5} b ) OBSOLETE )",
       "1 objectclasses=( b NAME STRUCTURAL )"},
      {"VendorKeywordIsSkipped", "=( 1.1 SUP ( a ORVattributeTypes ) OBSOLETE )",
       "1 objectclasses=( 1.1 NAME SUP ( a ) STRUCTURAL )"},
      {"OtherKeywordIsAClause", "=( 1.1 SUP ( a OBSOLETE ) MAY ( b ) )",
       "1 objectclasses=( 1.1 NAME OBSOLETE SUP ( a ) STRUCTURAL )"},
      {"BraceEndsTheDefinition", "=( 1.1 MAY ( a } OBSOLETE )",
       "1 objectclasses=( 1.1 NAME STRUCTURAL MAY ( a ) )"},
      {"ParenthesisEndsTheDefinition", "=( 1.1 MAY ( a ( b ) OBSOLETE )",
       "1 objectclasses=( 1.1 NAME STRUCTURAL MAY ( a ) )"},
      {"NumberAfterMust", "=( 1.1 MUST 3.4 OBSOLETE )",
       "1 objectclasses=( 3.4 NAME OBSOLETE STRUCTURAL )"},
      {"ParenthesisAfterMustIsTakenForTheListsOwn", "=( 1.1 MUST ) OBSOLETE )",
       "1 objectclasses=( 1.1 NAME OBSOLETE STRUCTURAL )"},
      {"ListWithoutParenthesesTakesTheDefinitionsOwn", "=( 1.1 MAY a )\n",
       "0 objectclasses=( 1.1 NAME STRUCTURAL MAY ( a ) )"},
      {"RunsIntoTheNextDefinition", "=( 1.1 MAY a )\nobjectclasses=( 2.2 NAME 'b' ABSTRACT )\n",
       "0 objectclasses=( 1.1 NAME STRUCTURAL MAY ( a ) )"},
      {"UnclosedListTakesTheNextStartKeyword", "=( 1.1 MAY ( a\nobjectclasses=( 2.2 ABSTRACT )\n",
       "1 objectclasses=( 1.1 NAME STRUCTURAL MAY ( a $ objectclasses ) )"},
  });
}

TEST(ObjectClassParse, TokenAfterDescOrSupIsNeverExaminedAgain) {
  expectOutcomes<ObjectClass>({
      {"ClosingParenthesis", "=( 1.1 DESC ) OBSOLETE )",
       "1 objectclasses=( 1.1 NAME OBSOLETE STRUCTURAL )"},
      {"ClosingParenthesisAndNoOther", "=( 1.1 SUP )", "0 objectclasses=( 1.1 NAME STRUCTURAL )"},
      {"Brace", "=( 1.1 SUP } OBSOLETE )", "1 objectclasses=( 1.1 NAME OBSOLETE STRUCTURAL )"},
      {"StartOfADefinition", "=( 1.1 DESC objectclasses OBSOLETE )",
       "1 objectclasses=( 1.1 NAME OBSOLETE STRUCTURAL )"},
      {"OpeningParenthesisAfterDesc", "=( 1.1 DESC ( 'd' ) OBSOLETE )",
       "1 objectclasses=( d NAME STRUCTURAL )"},
  });
}

TEST(ObjectClassParse, EndOfInputInsideEveryClauseFails) {
  for (const char* clause : {"DESC", "SUP", "SUP (", "MUST", "MUST (", "MAY", "MAY (", "MAY ( $"}) {
    for (const char* rest :
         {"\n", " ", "", " word", " 'quoted'", " 'open", " 3.4", " 3.4{5", "# c"}) {
      SCOPED_TRACE(std::string(clause) + rest);
      EXPECT_EQ(outcomeOf<ObjectClass>("=( 1.1 " + std::string(clause) + rest),
                "0 objectclasses=( 1.1 NAME STRUCTURAL )");
    }
  }
}

TEST(ObjectClassParse, WhatWasReadBeforeAFailureStays) {
  const std::string read =
      "0 objectclasses=( 1.1 NAME 'a'  DESC 'd' OBSOLETE SUP ( s ) ABSTRACT MUST ( m ) )";
  const std::string text = "=( 1.1 NAME 'a' DESC 'd' OBSOLETE SUP s ABSTRACT MUST ( m )";
  expectOutcomes<ObjectClass>({
      {"AtTheEnd", text + "\n", read},
      {"AtTheEndInsideAList", "=( 1.1 NAME 'a' DESC 'd' OBSOLETE SUP s ABSTRACT MUST ( m \n", read},
      {"AtAnObjectClass", text + "\nobjectClasses=( 2.2 DESC 'e' )", read},
      {"AtABadLength", text + " 2.2{ DESC 'e' )", read},
      {"AtTheEndBeforeAnyClause", "=(", "0 objectclasses=(  NAME STRUCTURAL )"},
      {"AtTheEndBeforeAnything", "", "0 objectclasses=(  NAME STRUCTURAL )"},
      {"AtAnObjectClassBeforeAnyClause", "=( objectclasses=( 2.2 )",
       "0 objectclasses=(  NAME STRUCTURAL )"},
      {"NumberAtTheEndOfTheFileIsLost", "=( 1.1", "0 objectclasses=(  NAME STRUCTURAL )"},
  });
}

TEST(ObjectClassParse, StandsOnTheTokenAfterTheDefinition) {
  expectStanding<ObjectClass>({
      {"NextDefinition", "=( 1.1 )\n\nobjectclasses=( 2.2 )\n",
       "1 on 1002 line 3 then 61 40 2024:2.2 41 260"},
      {"NextOfABlock", "{ ( 1.1 )\n( 2.2 ) }\n", "1 on 40 line 2 then 2024:2.2 41 125 260"},
      {"EndOfABlock", "{ ( 1.1 )\n}\n", "1 on 125 line 2 then 260"},
      {"EndAfterTheParenthesisKeepsTheToken", "=( 1.1 )\n", "1 on 41 line 2 then 260"},
      {"BraceIsNotPassed", "=( 1.1 } word )\n", "1 on 125 line 1 then 259:word 41 260"},
      {"OpeningParenthesisIsNotPassed", "=( 1.1\n( word )\n",
       "1 on 40 line 2 then 259:word 41 260"},
      {"OpeningParenthesisAtOnce", "=( ( 1.1 )\n", "1 on 40 line 1 then 2024:1.1 41 260"},
      {"ParenthesisAtOnce", "= ) word )\n", "1 on 259 line 1 then 41 260"},
      {"EndKeepsTheToken", "=( 1.1 OBSOLETE\n", "0 on 1022 line 2 then 260"},
      {"EndAtOnceIsTheToken", "=(\n", "0 on 260 line 2 then 260"},
      {"ObjectClass", "=( 1.1\nobjectclasses=( 2.2 )\n",
       "0 on 1002 line 2 then 61 40 2024:2.2 41 260"},
      {"AttributeTypeIsSkipped", "=( 1.1\nattributetypes=( 2.2 )\n",
       "1 on 40 line 2 then 2024:2.2 41 260"},
      {"VendorEntryIsSkipped", "=( 1.1\nORVAttributetypes=( 2.2 )\n",
       "1 on 40 line 2 then 2024:2.2 41 260"},
      {"BadLength", "=( 1.1 2.2{x word )\n", "0 on 2026 line 1 then 259:x 259:word 41 260"},
      {"AfterAList", "=( 1.1 MAY ( a ) )\nword\n", "1 on 259 line 2 then 260"},
      {"AfterAListWithoutParentheses", "=( 1.1 MAY a ABSTRACT )\nword\n",
       "1 on 259 line 2 then 260"},
      {"AfterANameClause", "=( 1.1 NAME 'a' OBSOLETE )\nword\n", "1 on 259 line 2 then 260"},
  });
}

}  // namespace
