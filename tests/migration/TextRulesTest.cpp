// The L rules: for each what has the finding, and what nearly has it.

#include <gtest/gtest.h>

#include <string>

#include "RulesTesting.h"

namespace {

struct Row {
  const char* name;
  std::string text;
  const char* findings;
};

void PrintTo(const Row& row, std::ostream* out) { *out << row.name; }

const Row kRows[] = {
    // L100: only where no other finding explains the difference.
    {"L100TextOfTheTokenBefore", "attributetypes=( 1.2 DESC '1.2' SUP a )\n", "1:22 error L100\n"},
    {"L100OtherTextBetween", "attributetypes=( 1.2 NAME 'b' DESC '1.2' SUP a )\n", ""},
    {"L100CharacterAtClauseLevel", "attributetypes=( 1.2 SUP a , USAGE b )\n", "1:28 error L100\n"},
    {"L100KeywordOfAnotherKind", "attributetypes=( 1.2 SUP a STRUCTURAL USAGE b )\n",
     "1:28 error L100\n"},
    {"L100BraceInASingleDefinition", "attributetypes=( 1.2 SUP a } USAGE b )\n",
     "1:28 error L100\n"},
    // L101
    {"L101LastWord", "attributetypes=( 1.2 SUP a )\nfoo", "2:1 error L101\n"},
    {"L101LastNumber", "attributetypes=( 1.2 SUP a )\n12", "2:1 error L101\n"},
    {"L101LastQuoted", "attributetypes=( 1.2 SUP a )\n'b'", "2:1 error L101\n"},
    {"L101WordThatBeginsADefinition", "attributetypes=( 1.2 SUP a )\nattributetypes",
     "2:1 error L101\n"},
    {"L101InADefinition", "attributetypes=( 1.2 SUP a", "1:16 error D204\n1:26 error L101\n"},
    {"L101ParenthesisLast", "attributetypes=( 1.2 SUP a )", ""},
    {"L101WordOfAComment", "attributetypes=( 1.2 SUP a ) # foo", "1:30 warning L112\n"},
    // L102
    {"L102Utf8", "attributetypes=( 1.2 DESC 'caf\xc3\xa9' SUP a )\n", "1:31 error L102\n"},
    {"L102Delete", "attributetypes=( 1.2 DESC 'a\x7f' SUP a )\n", "1:29 error L102\n"},
    {"L102InANameOfAClass", "objectclasses=( 1.2 NAME 'caf\xc3\xa9' STRUCTURAL )\n",
     "1:30 error L102\n"},
    {"L102TabIsPrintable", "attributetypes=( 1.2 DESC 'a\tb' SUP a )\n", ""},
    {"L102EveryPunctuation",
     "attributetypes=( 1.2 DESC '!\"#$%&()*+,-./:;<=>?@[\\]^_`{|}~' SUP a )\n", ""},
    // L103
    {"L103TabBehindAKeyword", "attributetypes=( 1.2 NAME\t'a' SUP a )\n", "1:22 error L103\n"},
    {"L103TabBehindAValue", "attributetypes=( 1.2 SUP a\tUSAGE b )\n", "1:26 error L103\n"},
    {"L103TabBehindTheWordOfASection", "attributetypes\t=( 1.2 SUP a )\n", "1:1 error L103\n"},
    {"L103TabBehindABlank", "attributetypes \t=\t( \t1.2\t SUP \ta \t)\t\n", ""},
    {"L103TabBehindQuotes", "attributetypes=( 1.2 NAME 'a'\tSUP a )\n", ""},
    {"L103LineEndInQuotes", "attributetypes=( 1.2 DESC 'a\nb' SUP a )\n", "1:27 error L103\n"},
    {"L103LineEndOfTwoBytesInQuotes", "attributetypes=( 1.2 DESC 'a\r\nb' SUP a )\n",
     "1:27 error L103\n"},
    {"L103UnclosedQuote", "attributetypes=( 1.2 DESC 'a )\nattributetypes=( 1.3 SUP a )\n",
     "1:27 error L103\n"},
    {"L103UnclosedQuoteInTheLine", "attributetypes=( 1.2 NAME 'a DESC 'b' SUP a )\n",
     "1:37 error L103\n"},
    // L104
    {"L104NoDigits", "attributetypes=( 1.2 SYNTAX 1.3{x} )\n", "1:29 error L104\n"},
    {"L104NotClosed", "attributetypes=( 1.2 SYNTAX 1.3{64 )\n", "1:29 error L104\n"},
    {"L104Empty", "attributetypes=( 1.2 SYNTAX 1.3{} )\n", "1:29 error L104\n"},
    {"L104OfAWord", "attributetypes=( 1.2 SYNTAX abc{64} )\n", "1:29 error L104\n"},
    {"L104AtTheOidOfAClass", "objectclasses=( 1.2{ NAME 'a' STRUCTURAL )\n",
     "1:17 error D205\n1:17 error L104\n"},
    {"L104BlankBefore", "attributetypes=( 1.2 SYNTAX 1.3 {64} )\n", ""},
    // L105
    {"L105TextOnceARun", "attributetypes=( 1.2 SUP a )\nfoo ( bar ( baz ) ) qux\n",
     "2:1 error L105\n"},
    {"L105SecondDefinitionBehindEquals", "attributetypes=( 1.2 SUP a )\n( 1.3 SUP b )\n",
     "2:1 error L105\n"},
    {"L105InABlock", "attributetypes { foo bar ( 1.2 SUP a ) , ( 1.3 SUP b ) }\n",
     "1:18 error L105\n1:40 error L105\n"},
    {"L105BraceOutside", "attributetypes=( 1.2 SUP a )\n}\n", "2:1 error L105\n"},
    {"L105Comment", "attributetypes=( 1.2 SUP a )\n# foo ( bar\n", "2:1 warning L112\n"},
    // L106
    {"L106Description", "attributetypes=( 1.2 DESC 'NAME' SUP a )\n", "1:27 error L106\n"},
    {"L106NameOfAClass", "objectclasses=( 1.2 NAME ( 'a' 'objectClasses' ) STRUCTURAL )\n",
     "1:32 error L106\n"},
    {"L106FoldedName", "attributetypes=( 1.2 NAME 'attributeTypes' SUP a )\n",
     "1:27 warning L106\n"},
    {"L106FoldedMember", "objectclasses=( 1.2 MUST ( objectClasses $ b ) STRUCTURAL )\n",
     "1:28 warning L106\n"},
    {"L106FoldedDatabaseName", "ORVAttributetypes=( 1.2 DBNAME ( 'ORVattributeTypes' 'b' ) )\n",
     "1:34 warning L106\n"},
    {"L106MemberThatEndsTheList",
     "objectclasses=( 1.2 MUST ( ORVattributeTypes $ b ) STRUCTURAL )\n", "1:28 error L106\n"},
    {"L106SuperiorOfAnAttributeType", "attributetypes=( 1.2 SUP objectClasses USAGE b )\n",
     "1:26 error L106\n"},
    {"L106SilentLetterForLetter",
     "attributetypes=( 1.2 NAME ( 'attributetypes' 'objectclasses' ) SUP a )\n", ""},
    {"L106AccessClassTakesAnyText", "ORVAttributetypes=( 1.2 ACCESS-CLASS 'NAME' )\n", ""},
    {"L106OtherLetterCase", "attributetypes=( 1.2 DESC 'Name' SUP a )\n", ""},
    // L107
    {"L107Nul", std::string("attributetypes=( 1.2 SUP a\0 )\n", 30), "1:27 warning L107\n"},
    {"L107NulInQuotes", std::string("attributetypes=( 1.2 DESC 'a\0b' SUP a )\n", 40),
     "1:27 error L107\n"},
    {"L107Mark",
     "\xef\xbb\xbf"
     "attributetypes=( 1.2 SUP a )\n",
     "1:1 warning L107\n"},
    {"L107Utf16Alone",
     std::string("\xff\xfe"
                 "a\0t\0t\0r\0\n\0",
                 12),
     "1:1 error L107\n"},
    {"L107Utf16WithoutMark", std::string("a\0t\0t\0r\0i\0b\0", 12), "1:1 error L107\n"},
    // Of ten letters, two that are not Latin.
    {"L107Utf16WithOtherLetters", std::string("a\0t\0t\0r\0\x37\x04i\0b\0\x38\x04u\0t\0", 20),
     "1:1 error L107\n"},
    {"L107MarkBehindTheBeginning", "attributetypes=( 1.2 SUP a )\n\xef\xbb\xbf\n",
     "2:1 error L105\n"},
    // L108
    {"L108Ldif", "dn: cn=schema\nattributeTypes: ( 1.2 NAME 'a' SUP b )\n", "1:1 error L108\n"},
    {"L108LdifBehindComments", "# x\n\nattributeTypes: ( 1.2 NAME 'a' SUP b )\n",
     "1:1 error L108\n"},
    {"L108ServerSchema", "# x\nattributetype ( 1.2\n\tNAME 'caf\xc3\xa9' )\n", "1:1 error L108\n"},
    {"L108Identifiers", "objectidentifier a 1.2\n", "1:1 error L108\n"},
    {"L108Xml", "<?xml version=\"1.0\"?>\n<a/>\n", "1:1 error L108\n"},
    {"L108XmlOfTwoBytes", "<a", "1:1 error L108\n"},
    {"L108OneByteIsNoXml", "<", "1:1 error L109\n"},
    {"L108Json", "{ \"a\": 1 }\n", "1:1 error L108\n"},
    {"L108Compressed", "\x1f\x8b\x08xyz", "1:1 error L108\n"},
    {"L108DefinitionsBehindForeignText", "dn: a\nattributetypes=( 1.2 SUP a )\n",
     "1:1 error L105\n"},
    // L109
    {"L109TextAlone", "foo ( bar )\n)\n", "1:1 error L109\n"},
    {"L109LastWordToo", "foo", "1:1 error L109\n"},
    {"L109CommentIsNoText", "# foo\n", "1:1 warning L112\n"},
    {"L109Empty", "", ""},
    {"L109EmptyBlock", "attributetypes { }\n", ""},
    // L110
    {"L110LetterCase", "attributetypes=( 1.2 desc 'b' SUP a )\n", "1:22 error L110\n"},
    {"L110LowerCaseBehindNames", "attributetypes=( 1.2 NAME 'a' desc 'b' sup a )\n",
     "1:31 error L110\n1:40 error L110\n"},
    {"L110Substitution", "attributetypes=( 1.2 SYNTEX 1.3 SUP a )\n", "1:22 error L110\n"},
    {"L110Deletion", "attributetypes=( 1.2 EQUALTY b SUP a )\n", "1:22 error L110\n"},
    {"L110Insertion", "attributetypes=( 1.2 NAMES 'b' SUP a )\n", "1:22 error L110\n"},
    {"L110Swap", "attributetypes=( 1.2 SYNATX 1.3 SUP a )\n", "1:22 error L110\n"},
    {"L110UnderscoreIsAHyphen", "attributetypes=( 1.2 SINGLE_VALU SUP a )\n", "1:22 error L110\n"},
    {"L110SectionInOtherLetterCase", "AttributeTypes=( 1.2 SUP a )\n", "1:1 error L110\n"},
    {"L110SectionOneEditAway", "attributtypes { ( 1.2 SUP a ) }\n", "1:1 error L110\n"},
    {"L110SpellingThatTheReaderFolds", "attributeTypes=( 1.2 SUP a )\n", ""},
    {"L110NeverAValue", "objectclasses=( 1.2 SUP name MUST ( desc $ sup ) MAY dsc STRUCTURAL )\n",
     ""},
    {"L110TwoEditsAway", "attributetypes=( 1.2 EQALTY b SUP a )\n", "1:22 error D201\n"},
    // L111
    {"L111Description", "attributetypes=( 1.2 DESC \"a b\" SUP a )\n", "1:27 error L111\n"},
    {"L111NameThatIsKept", "attributetypes=( 1.2 NAME \"a\" SUP a )\n", "1:27 warning L111\n"},
    {"L111InsideQuotes", "attributetypes=( 1.2 DESC '\"a\"' SUP a )\n", ""},
    // L112
    {"L112Once", "# a\nattributetypes=( 1.2 SUP a ) # b\n", "1:1 warning L112\n"},
    {"L112LineOfTheLibrary",
     "# File generated by 6.1 migration 2024\nattributetypes=( 1.2 SUP a )\n", ""},
    // L113
    {"L113BeforeAValue", "attributetypes=( 1.2 SUP\r\n a USAGE b )\r\n", "1:25 error L113\n"},
    {"L113InAList", "objectclasses=( 1.2 MUST ( a $\r\n b ) STRUCTURAL )\r\n", "1:31 error L113\n"},
    {"L113BehindTheWordOfASection", "attributetypes\r\n=( 1.2 SUP a )\r\n", "1:15 error L113\n"},
    {"L113BehindItsEquals", "objectclasses=\r\n( 1.2 STRUCTURAL )\r\n", "1:15 error L113\n"},
    {"L113ElsewhereNothingChanges",
     "attributetypes=\r\n( 1.2\r\n NAME\r\n ( 'a'\r\n 'b' )\r\n SUP a\r\n )\r\n"
     "objectclasses {\r\n( 1.2 STRUCTURAL )\r\n( 1.3 ABSTRACT )\r\n}\r\n",
     ""},
};

class TextRules : public testing::TestWithParam<Row> {};

TEST_P(TextRules, Find) {
  EXPECT_EQ(printed::findings(rules_testing::findingsOf(GetParam().text)), GetParam().findings);
}

INSTANTIATE_TEST_SUITE_P(, TextRules, testing::ValuesIn(kRows),
                         [](const auto& row) { return std::string(row.param.name); });

}  // namespace
