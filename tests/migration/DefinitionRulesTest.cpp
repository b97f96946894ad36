// The D rules: for each what has the finding, and what nearly has it.

#include <gtest/gtest.h>

#include <string>

#include "RulesTesting.h"

namespace {

struct Row {
  const char* name;
  const char* text;
  const char* findings;
};

void PrintTo(const Row& row, std::ostream* out) { *out << row.name; }

const Row kRows[] = {
    // D201
    {"D201Extension", "attributetypes=( 1.2 SUP a X-ORIGIN 'RFC4519' )\n", "1:28 error D201\n"},
    {"D201ExtensionWithAList", "attributetypes=( 1.2 SUP a X-ORIGIN ( 'b' 'c' ) USAGE d )\n",
     "1:28 error D201\n"},
    {"D201ExtensionInABlockOfClasses",
     "objectclasses { ( 1.2 SUP a X-ORIGIN ( 'b' 'c' ) STRUCTURAL )\n( 1.3 STRUCTURAL ) }\n",
     "1:29 error D201\n"},
    {"D201ExtensionBehindABareMember", "objectclasses=( 1.2 MUST a X-ORIGIN 'b' STRUCTURAL )\n",
     "1:28 error D201\n"},
    {"D201Approx", "attributetypes=( 1.2 SUP a APPROX b )\n", "1:28 error D201\n"},
    {"D201SecondWord", "attributetypes=( 1.2 foo SUP a )\n", "1:22 error D201\n"},
    {"D201ValueOfAFlag", "ORVAttributetypes=( 1.2 EQUALITY caseIgnoreMatch )\n",
     "1:34 error D201\n"},
    {"D201NameOfAnExtension", "ORVAttributetypes=( 1.2 NAME 'a' EQUALITY )\n", "1:25 error D201\n"},
    // The OID, which it replaces, is no part of the value before it.
    {"D201ClauseOfAnotherKindBehindAText", "ORVAttributetypes=( 1.2 SYNTAX 1.3{x} )\n",
     "1:25 error D201\n1:32 error L104\n"},
    {"D201ApproxOfAnExtension", "ORVAttributetypes=( 1.2 EQUALITY APPROX )\n", ""},
    // D202
    {"D202Collective", "attributetypes=( 1.2 SUP a COLLECTIVE )\n", "1:28 error D202\n"},
    {"D202RestOfTheFile", "attributetypes=( 1.2 SUP a COLLECTIVE )\nattributetypes=( 1.3 SUP b )\n",
     "1:28 error D202\n"},
    {"D202InADescription", "attributetypes=( 1.2 DESC 'is COLLECTIVE' SUP a )\n", ""},
    // D203
    {"D203RunsOn", "attributetypes=( 1.2 NAME 'a' )\nattributetypes=( 1.3 SUP a )\n",
     "1:22 error D203\n"},
    {"D203NeverEnds", "attributetypes=( 1.2 SUP a NAME 'a' )\n", "1:28 error D203\n"},
    {"D203OfAClass", "objectclasses=( 1.2 NAME ( 'a' 'b' ) )\nobjectclasses=( 1.3 STRUCTURAL )\n",
     "1:21 error D203\n"},
    {"D203Ended", "objectclasses=( 1.2 NAME 'a' STRUCTURAL )\n", ""},
    {"D203ExtensionIsNoEnd", "attributetypes=( 1.2 NAME 'a' X-B 'c' )\n",
     "1:22 error D203\n1:31 error D207\n"},
    {"D203BehindADefinitionWithAnUnclosedQuote",
     "attributetypes=( 1.2 DESC 'a SUP c )\nattributetypes=( 1.3 NAME 'b' )\n"
     "attributetypes=( 1.4 SUP a )\n",
     "1:27 error L103\n2:22 error D203\n"},
    // D204
    {"D204BeforeASection", "attributetypes=( 1.2 SUP a\nattributetypes=( 1.3 SUP b )\n",
     "1:16 error D204\n"},
    {"D204InABlock", "attributetypes {\n( 1.2 SUP a\n( 1.3 SUP b )\n( 1.4 SUP c )\n}\n",
     "2:1 error D204\n"},
    {"D204LastOfABlock", "attributetypes {\n( 1.2 SUP a\n}\n", "2:1 warning D204\n"},
    {"D204EndOfTheFile", "attributetypes=( 1.2 SUP a\n", "1:16 error D204\n"},
    {"D204NothingBehindEquals", "attributetypes=\nattributetypes=\n",
     "1:1 error D204\n2:1 error D204\n"},
    {"D204Closed", "attributetypes=( 1.2 SUP a\n)\n", ""},
    // D205
    {"D205NoOid", "attributetypes=( NAME 'a' SUP b )\n", "1:16 error D205\n"},
    {"D205NoOidInABlock", "attributetypes { ( NAME 'a' SUP b ) ( 1.3 SUP b ) }\n",
     "1:18 error D205\n"},
    {"D205Empty", "attributetypes=( )\n", "1:16 error D205\n"},
    {"D205Word", "attributetypes=( nsRoot-oid SUP b )\n", "1:18 warning D205\n"},
    {"D205WordThatIsNotKept", "attributetypes=( 1.2abc SUP b )\n", "1:18 error D205\n"},
    {"D205WithLength", "attributetypes=( 1.2{5} SUP b )\n", "1:18 error D205\n"},
    {"D205Numeric", "attributetypes=( 2.16.840.0.1 SUP b )\n", ""},
    // D206
    {"D206MayTwice", "objectclasses=( 1.2 MAY ( a ) MAY ( b ) STRUCTURAL )\n",
     "1:31 warning D206\n"},
    {"D206DescriptionTwice", "attributetypes=( 1.2 DESC 'a' DESC 'b' SUP c )\n",
     "1:31 error D206\n"},
    {"D206SameDescriptionTwice", "attributetypes=( 1.2 DESC 'a' DESC 'a' SUP c )\n",
     "1:31 warning D206\n"},
    {"D206TwoKinds", "objectclasses=( 1.2 STRUCTURAL AUXILIARY )\n", "1:32 error D206\n"},
    {"D206FlagTwice", "attributetypes=( 1.2 OBSOLETE OBSOLETE SUP a )\n", "1:31 warning D206\n"},
    {"D206NameTwice", "attributetypes=( 1.2 NAME ( 'a' 'a' ) SUP a )\n", "1:33 error D206\n"},
    {"D206NameInOtherLetterCase", "attributetypes=( 1.2 NAME ( 'a' 'A' ) SUP a )\n",
     "1:33 warning D206\n"},
    {"D206QuotedAndBareName", "attributetypes=( 1.2 NAME ( 'cn' cn ) SUP a )\n",
     "1:34 error D206\n1:34 warning D207\n"},
    {"D206NameThatOnlyBeginsAlike", "attributetypes=( 1.2 NAME ( 'cn' 'cnx' 'c' ) SUP a )\n", ""},
    {"D206MembersAreNotConcerned",
     "objectclasses=( 1.2 MUST ( a $ a ) MAY ( a $ A ) STRUCTURAL )\n", ""},
    {"D206DatabaseNamesAreNotConcerned", "ORVAttributetypes=( 1.2 DBNAME ( 'a' 'a' ) )\n", ""},
    // D207
    {"D207Kept", "attributetypes=( 1.2 NAME siteA SUP b )\n", "1:27 warning D207\n"},
    {"D207InAList", "attributetypes=( 1.2 NAME ( 'a' siteA ) SUP b )\n", "1:33 warning D207\n"},
    {"D207ExtensionBehindTheNames", "attributetypes=( 1.2 NAME 'a' X-ORIGIN 'RFC' SUP b )\n",
     "1:31 error D207\n"},
    {"D207ApproxBehindTheNames", "attributetypes=( 1.2 NAME 'a' APPROX c SUP b )\n",
     "1:31 error D207\n"},
    {"D207NotKept", "attributetypes=( 1.2 NAME a.b SUP c )\n", "1:27 error D207\n"},
    {"D207BehindAnotherClause", "attributetypes=( 1.2 NAME 'a' SUP b X-ORIGIN 'RFC' )\n",
     "1:37 error D201\n"},
    // D208
    {"D208OfAClass", "objectclasses=( 1.2 STRUCTURAL MAY a )\nobjectclasses=( 1.3 STRUCTURAL )\n",
     "1:32 error D208\n"},
    {"D208KeptInABlock",
     "objectclasses {\n( 1.2 STRUCTURAL MAY a )\n( 1.3 STRUCTURAL MUST b )\n}\n",
     "2:18 warning D208\n3:18 warning D208\n"},
    {"D208OfAnExtension",
     "ORVAttributetypes=( 1.2 DBNAME 'a' )\nORVAttributetypes=( 1.3 EQUALITY )\n",
     "1:25 error D208\n"},
    {"D208OfAnExtensionBeforeALaterLine",
     "ORVAttributetypes {\n( 1.2 DBNAME 'a' )\n( 1.3 EQUALITY )\n}\n", "2:7 warning D208\n"},
    {"D208OfAnExtensionInTheSameLine",
     "ORVAttributetypes { ( 1.2 DBNAME 'a' ) ( 1.3 EQUALITY ) }\n", "1:27 error D208\n"},
    {"D208ClauseBehind", "objectclasses=( 1.2 MAY a STRUCTURAL )\n", ""},
    {"D208Parentheses", "objectclasses=( 1.2 STRUCTURAL MAY ( a ) )\n", ""},
    {"D208SuperiorIsNotConcerned", "objectclasses=( 1.2 STRUCTURAL SUP a )\n", ""},
    // D209
    {"D209ParenthesisOutside", "attributetypes=( 1.2 SUP a ) )\n", "1:30 error D209\n"},
    {"D209OpeningOutside", "attributetypes=( 1.2 SUP a ) (\nattributetypes=( 1.3 SUP a )\n",
     "1:30 error D209\n"},
    {"D209RoundAValue", "attributetypes=( 1.2 SUP ( a ) USAGE b )\n", "1:26 error D209\n"},
    {"D209RoundAClause", "attributetypes=( 1.2 ( SUP a ) USAGE b )\n", "1:22 error D209\n"},
    {"D209ListThatIsNotClosed", "attributetypes=( 1.2 NAME ( 'a' SUP b )\n", "1:27 warning D209\n"},
    {"D209ListOfSuperiors", "objectclasses=( 1.2 SUP ( a ) STRUCTURAL )\n", ""},
    // D210
    {"D210InADefinition", "attributetypes=( 1.2 SUP a attributetypes=( 1.3 SUP b ) SUP c )\n",
     "1:28 error D210\n"},
    {"D210InADefinitionOfABlock",
     "attributetypes { ( 1.2 SUP a ( 1.3 SUP b ) SUP c ) ( 1.4 SUP d ) }\n", "1:30 error D210\n"},
    {"D210SectionInABlock", "attributetypes { objectclasses { ( 1.2 STRUCTURAL ) } }\n",
     "1:18 error D210\n"},
    {"D210BehindTheDefinition", "attributetypes=( 1.2 SUP a ) attributetypes=( 1.3 SUP b )\n", ""},
    // D211
    {"D211NoOpening", "attributetypes ( 1.2 SUP a )\nattributetypes=( 1.3 SUP b )\n",
     "1:1 error D211\n"},
    {"D211InText", "attributetypes of this site\nattributetypes=( 1.3 SUP b )\n",
     "1:1 error D211\n"},
    {"D211BehindWhatIsNotRead", "attributetypes of\nattributetypes this\n",
     "1:1 error D211\n2:1 error D211\n"},
    {"D211InAComment", "# attributetypes of this site\nattributetypes=( 1.3 SUP b )\n",
     "1:1 warning L112\n"},
    // D212
    {"D212KeywordInItsPlace", "attributetypes=( 1.2 DESC SUP a )\n", "1:22 error D212\n"},
    {"D212EndInItsPlace", "attributetypes=( 1.2 SUP a USAGE )\n", "1:28 error D212\n"},
    {"D212EmptyList", "objectclasses=( 1.2 MUST ( ) STRUCTURAL )\n", "1:21 warning D212\n"},
    {"D212BehindDollar", "objectclasses=( 1.2 MUST ( a $ ) STRUCTURAL )\n", "1:21 warning D212\n"},
    {"D212EmptyText", "attributetypes=( 1.2 DESC '' SUP a )\n", ""},
    // D213
    {"D213EndOfTheFile", "attributetypes {\n( 1.2 SUP a )\n", "1:1 error D213\n"},
    {"D213BeforeASection",
     "attributetypes {\n( 1.2 SUP a )\nobjectclasses {\n( 1.3 ABSTRACT )\n}\n", "1:1 error D213\n"},
    {"D213Closed", "attributetypes {\n( 1.2 SUP a )\n}\n", ""},
    // D214
    {"D214NumberAsMember", "objectclasses=( 1.2 MUST ( 2.5.4.3 $ sn ) STRUCTURAL )\n",
     "1:28 error D214\n"},
    {"D214NumberAsSuperiorOfAClass", "objectclasses=( 1.2 SUP 2.5.6.0 STRUCTURAL )\n",
     "1:25 error D214\n"},
    {"D214NumberAsDescription", "attributetypes=( 1.2 DESC 12 SUP a )\n", "1:27 error D214\n"},
    {"D214NumberAsName", "attributetypes=( 1.2 NAME 12 SUP a )\n", "1:27 error D214\n"},
    {"D214Comma", "objectclasses=( 1.2 MUST ( a, b ) STRUCTURAL )\n", "1:29 error D214\n"},
    {"D214DollarTooMany", "objectclasses=( 1.2 MUST ( a $ $ b ) STRUCTURAL )\n",
     "1:32 warning D214\n"},
    {"D214DottedWord", "attributetypes=( 1.2 SUP a.b USAGE c )\n", "1:26 error D214\n"},
    {"D214NumberAsSuperiorOfAnAttributeType", "attributetypes=( 1.2 SUP 2.5.4.41 USAGE c )\n", ""},
    {"D214NumberAsMatchingRule", "attributetypes=( 1.2 EQUALITY 2.5.13.2 SUP a )\n", ""},
};

class DefinitionRules : public testing::TestWithParam<Row> {};

TEST_P(DefinitionRules, Find) {
  EXPECT_EQ(printed::findings(rules_testing::findingsOf(GetParam().text)), GetParam().findings);
}

INSTANTIATE_TEST_SUITE_P(, DefinitionRules, testing::ValuesIn(kRows),
                         [](const auto& row) { return std::string(row.param.name); });

}  // namespace
