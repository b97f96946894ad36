// What is a token: one row per rule.

#include <gtest/gtest.h>

#include <ostream>
#include <string>

#include "LexerTesting.h"

namespace {

using lexertesting::linesOf;
using lexertesting::printable;
using lexertesting::tokensOf;
using namespace std::string_literals;

struct TokenRow {
  const char* rule;
  std::string text;
  std::string tokens;
};

void PrintTo(const TokenRow& row, std::ostream* out) { *out << printable(row.text); }

const auto kRuleName = [](const auto& row) { return std::string(row.param.rule); };

class Tokens : public testing::TestWithParam<TokenRow> {};

TEST_P(Tokens, AreRead) { EXPECT_EQ(tokensOf(GetParam().text), GetParam().tokens); }

const TokenRow kWords[] = {
    {"AttributeTypeLine", "attributetypes=( 2.5.4.3 NAME 'cn' )\n",
     "1010 61 40 2024:2.5.4.3 1003 259:cn 41 260"},
    {"LettersDigitsUnderscoreAndHyphen", "aZ09_-b c ", "259:aZ09_-b 259:c 260"},
    {"HyphenStartsAWord", "-a - --1 ", "259:-a 259:- 259:--1 260"},
    {"UnderscoreStartsNoWord", "_a ", "95 259:a 260"},
    {"DigitStartsANumber", "1a ", "2024:1 259:a 260"},
    {"DotEndsAWord", "a.b ", "259:a 46 259:b 260"},
    {"PunctuationEndsAWord", "NAME(a,b;c$d)e{f}g ",
     "1003 40 259:a 44 259:b 59 259:c 36 259:d 41 259:e 123 259:f 125 259:g 260"},
    {"QuoteEndsAWord", "a'b'c ", "259:a 259:b 259:c 260"},
    {"HashEndsAWord", "a#b\nc ", "259:a 259:c 260"},
    {"NewlineEndsAWord", "a\nb ", "259:a 259:b 260"},
    {"CarriageReturnEndsAWord", "a\r\nb ", "259:a 13 259:b 260"},
    {"TabBehindAWordBelongsToIt", "NAME\t'cn'\t DESC ", "259:NAME\t 259:cn 1004 260"},
    {"TabInsideAWord", "a\tb\t\tc ", "259:a\tb\t\tc 260"},
    {"TabBehindABlankIsSkipped", "NAME \t'cn' \t\tDESC ", "1003 259:cn 1004 260"},
    {"TabAtTheStartIsSkipped", "\tNAME ", "1003 260"},
    {"LongWord", std::string(3000, 'w') + " ", "259:" + std::string(3000, 'w') + " 260"},
};

INSTANTIATE_TEST_SUITE_P(Words, Tokens, testing::ValuesIn(kWords), kRuleName);

const TokenRow kKeywords[] = {
    {"AllInOrder",
     "objectclasses NAME DESC SUP AUXILIARY MUST MAY STRUCTURAL attributetypes EQUALITY SYNTAX "
     "SINGLE-VALUE USAGE NO-USER-MODIFICATION ORVAttributetypes ACCESS-CLASS DBNAME SUBSTR REVERSE "
     "ORDERING COLLECTIVE OBSOLETE ABSTRACT LENGTH APPROX ",
     "1002 1003 1004 1005 1006 1007 1008 1009 1010 1011 1012 1013 1014 1015 1016 1017 1018 1019 "
     "1026 1020 1021 1022 1023 1024 1025 260"},
    {"QuotedIsLookedUpToo", "'NAME' 'objectclasses' 'SINGLE-VALUE' ", "1003 1002 1013 260"},
    {"CaseMatters", "name Name DESc ", "259:name 259:Name 259:DESc 260"},
    {"LongerOrShorterIsNone", "NAMES NAM SINGLE SINGLE-VALUES ",
     "259:NAMES 259:NAM 259:SINGLE 259:SINGLE-VALUES 260"},
    {"FoldedSpellings", "objectClasses attributeTypes ORVattributeTypes ", "1002 1010 1016 260"},
    {"FoldedSpellingsInQuotes", "'objectClasses' 'attributeTypes' 'ORVattributeTypes' ",
     "1002 1010 1016 260"},
    {"OtherSpellingsAreNames",
     "OBJECTCLASSES ObjectClasses objectclassES ATTRIBUTETYPES AttributeTypes orvattributetypes "
     "ORVAttributeTypes ORVATTRIBUTETYPES ",
     "259:OBJECTCLASSES 259:ObjectClasses 259:objectclassES 259:ATTRIBUTETYPES 259:AttributeTypes "
     "259:orvattributetypes 259:ORVAttributeTypes 259:ORVATTRIBUTETYPES 260"},
    {"KeywordDoesNotTakeTheScratchEntry", "cn NAME cn ", "259:cn 1003 259:cn 260"},
    {"TrailingTabMakesAName", "objectClasses\t DESC\t x ",
     "259:objectClasses\t 259:DESC\t 259:x 260"},
};

INSTANTIATE_TEST_SUITE_P(Keywords, Tokens, testing::ValuesIn(kKeywords), kRuleName);

const TokenRow kQuoted[] = {
    {"BlanksAndPunctuation", "'a b,c' ", "259:a b,c 260"},
    {"Empty", "'' ", "259: 260"},
    {"EmptyTwice", "'''' ", "259: 259: 260"},
    {"EveryPunctuationButTheQuote", "'!\"#$%&()*+,-./:;<=>?@[\\]^_`{|}~' ",
     "259:!\"#$%&()*+,-./:;<=>?@[\\]^_`{|}~ 260"},
    {"HashStartsNoComment", "'# a' b ", "259:# a 259:b 260"},
    {"DigitsAndDots", "'2.5.4.3' ", "259:2.5.4.3 260"},
    {"TabBelongsToIt", "'a\tb\t' ", "259:a\tb\t 260"},
    {"LeadingAndTrailingBlanksStay", "'  a  ' ", "259:  a   260"},
    {"TextRightBehindTheClosingQuote", "'a'b'c' ", "259:a 259:b 259:c 260"},
    {"TwoWithoutABlank", "'a''b' ", "259:a 259:b 260"},
    {"NewlineEndsItAndIsDropped", "'ab\ncd' e\n", "259:ab 259:cd 260"},
    {"CarriageReturnEndsItAndIsDropped", "'ab\rcd' e'\n", "259:ab 259:cd 259: e 260"},
    {"ByteOf128EndsItAndIsDropped", "'abc\x80xyz' rest' DESC ",
     "259:abc 259:xyz 259: rest 1004 260"},
    {"ByteOf255EndsItAndIsDropped", "'abc\xff) NAME' rest' ", "259:abc 41 1003 259: rest 260"},
    {"TwoHighBytesLeaveTheSecond", "'a\xc3\xa9z' ' ", "259:a -87 259:z 259:  260"},
    {"NulEndsItAndIsDropped", "'a\0b' 'c "s, "259:a 259:b 259:  259:c 260"},
    {"ControlCharacterEndsIt", "'a\vb' ' ", "259:a 259:b 259:  260"},
    {"DeleteCharacterEndsIt", "'a\x7f\x62 \n", "259:a 259:b 260"},
    {"HighByteAtTheStart", "'\x80z ", "259: 259:z 260"},
    {"UnclosedRunsOverTheRestOfTheLine", "'ab cd\nNAME ", "259:ab cd 1003 260"},
};

INSTANTIATE_TEST_SUITE_P(QuotedStrings, Tokens, testing::ValuesIn(kQuoted), kRuleName);

const TokenRow kNumbers[] = {
    {"DottedDigits", "2.5.4.3\n", "2024:2.5.4.3 260"},
    {"SingleDigit", "0\n", "2024:0 260"},
    {"FormIsNotChecked", "1..2. 00..\n", "2024:1..2. 2024:00.. 260"},
    {"DotStartsNoNumber", ".5\n", "46 2024:5 260"},
    {"HyphenStartsNoNumber", "-5 ", "259:-5 260"},
    {"LetterEndsIt", "12ab ", "2024:12 259:ab 260"},
    {"ParenthesisEndsIt", "1.2) ", "2024:1.2 41 260"},
    {"QuoteEndsIt", "1.2'a' ", "2024:1.2 259:a 260"},
    {"HashEndsIt", "1.2#a\n3\n", "2024:1.2 2024:3 260"},
    {"HashBehindBlanks", "1.2  # 4\n3\n", "2024:1.2 2024:3 260"},
    {"HighByteEndsIt", "1\x80 2\xff ", "2024:1 -128 2024:2 -1 260"},
    {"NulEndsIt", "1\0 2\n"s, "2024:1 0 2024:2 260"},
    {"Length", "1.3.6.1.4.1.1466.115.121.1.15{256} ",
     "2025:1.3.6.1.4.1.1466.115.121.1.15{256} 260"},
    {"LengthBehindABlank", "1.2.3 {32} ", "2025:1.2.3{32} 260"},
    {"LengthBehindManyBlanks", "1.2.3      {32}x ", "2025:1.2.3{32} 259:x 260"},
    {"NoLengthBehindATab", "1.2.3\t{32} ", "2024:1.2.3 123 2024:32 125 260"},
    {"NoLengthBehindABlankAndATab", "1.2.3 \t{32} ", "2024:1.2.3 123 2024:32 125 260"},
    {"NoLengthBehindANewline", "1.2.3\n{32} ", "2024:1.2.3 123 2024:32 125 260"},
    {"NoLengthBehindABlankAndANewline", "1.2.3 \n{32} ", "2024:1.2.3 123 2024:32 125 260"},
    {"LetterInTheBraces", "1.2.3{x ", "2026:1.2.3{ 259:x 260"},
    {"LetterBehindABlankAndABrace", "1.2.3 {x ", "2026:1.2.3{ 259:x 260"},
    {"OtherEndOfTheLength", "1.2.3{12) ", "2026:1.2.3{12 41 260"},
    {"EmptyBraces", "1{} ", "2026:1{ 125 260"},
    {"BlankInsideTheBraces", "1{ 2} ", "2026:1{ 2024:2 125 260"},
    {"BlankBeforeTheClosingBrace", "1{2 } ", "2026:1{2 125 260"},
    {"TabBeforeTheClosingBrace", "1{2\t} ", "2026:1{2 125 260"},
    {"NewlineInTheBraces", "1{2\n} ", "2026:1{2 125 260"},
    {"DotInTheLength", "1{2.3} ", "2026:1{2 46 2024:3 125 260"},
    {"TwoOpeningBraces", "1{{2} ", "2026:1{ 123 2024:2 125 260"},
    {"TwoLengths", "1{2}{3} ", "2025:1{2} 123 2024:3 125 260"},
    {"BlankBehindTheLengthStaysForTheNext", "1{2} {3} ", "2025:1{2} 123 2024:3 125 260"},
    {"HighByteInTheBraces", "1{\x80} ", "2026:1{ -128 125 260"},
    {"QuoteInTheBraces", "1{'2'} ", "2026:1{ 259:2 125 260"},
    {"BlankBetweenNumbersIsTaken", "1 2  3 a ", "2024:1 2024:2 2024:3 259:a 260"},
    {"LongNumber", std::string(3000, '7') + " {" + std::string(3000, '8') + "} ",
     "2025:" + std::string(3000, '7') + "{" + std::string(3000, '8') + "} 260"},
};

INSTANTIATE_TEST_SUITE_P(Numbers, Tokens, testing::ValuesIn(kNumbers), kRuleName);

const TokenRow kCharacters[] = {
    {"StructureOfAFile", "()$={} ", "40 41 36 61 123 125 260"},
    {"OtherPunctuation", "!\"%&*+,./:;<>?@[\\]^_`|~ ",
     "33 34 37 38 42 43 44 46 47 58 59 60 62 63 64 91 92 93 94 95 96 124 126 260"},
    {"ControlCharacters", "\x01\x07\b\v\f\r\x1b\x1f\x7f ", "1 7 8 11 12 13 27 31 127 260"},
    {"Nul", "\0\0 a\0"s, "0 0 259:a 0 260"},
    {"HighBytesAreNegative", "\x80\x81\xe9\xff ", "-128 -127 -23 -1 260"},
    {"HighByteEndsAWord", "a\xe9z ", "259:a -23 259:z 260"},
    {"ByteOrderMark", "\xef\xbb\xbfNAME ", "-17 -69 -65 1003 260"},
    {"LastByteIsReturned", "NAME )", "1003 41 260"},
    {"LastHighByteIsReturned", "\xff", "-1 260"},
};

INSTANTIATE_TEST_SUITE_P(Characters, Tokens, testing::ValuesIn(kCharacters), kRuleName);

const TokenRow kScratch[] = {
    {"QuotedNumberFirst", "'2.5.4.3' 2.5.4.3\n", "259:2.5.4.3 259:2.5.4.3 260"},
    {"BareNumberFirst", "2.5.4.3 '2.5.4.3' ", "2024:2.5.4.3 2024:2.5.4.3 260"},
    {"NumberWithLengthFirst", "1 {2} '1{2}' '1{2' 1{2 ", "2025:1{2} 2025:1{2} 259:1{2 259:1{2 260"},
    {"BadLengthFirst", "1{2 '1{2' 1{2 ) ", "2026:1{2 2026:1{2 2026:1{2 41 260"},
    {"OnlyTheLastTextIsKept", "'1' 2 1\n", "259:1 2024:2 2024:1 260"},
    {"SingleCharactersKeepIt", "'1' ( ) 1\n", "259:1 40 41 259:1 260"},
    {"KeywordsKeepIt", "'1' NAME objectClasses 1\n", "259:1 1003 1002 259:1 260"},
    {"CommentsAndLinesKeepIt", "'1' # 2 3\n\n1\n", "259:1 259:1 260"},
    {"FoundTextIsKeptOn", "'1' 1 1 '1' 1\n", "259:1 259:1 259:1 259:1 259:1 260"},
    {"BlankInTheTextMatters", "'1 ' 1\n", "259:1  2024:1 260"},
};

INSTANTIATE_TEST_SUITE_P(ScratchEntry, Tokens, testing::ValuesIn(kScratch), kRuleName);

const TokenRow kComments[] = {
    {"WholeLine", "# NAME DESC\nSUP ", "1005 260"},
    {"BehindAToken", "NAME # DESC\nSUP ", "1003 1005 260"},
    {"RightBehindAParenthesis", "(#)\n)", "40 41 260"},
    {"Empty", "#\nSUP ", "1005 260"},
    {"HashInAComment", "# a # b\nSUP ", "1005 260"},
    {"QuoteInAComment", "# don't\nSUP 'x' ", "1005 259:x 260"},
    {"AnyBytes", "# \0 \x80 \xff \t\r\nSUP "s, "1005 260"},
    {"SeveralLines", "#1\n#2\n  #3\nSUP ", "1005 260"},
    {"CarriageReturnDoesNotEndIt", "# a\rNAME\nSUP ", "1005 260"},
    {"Long", "#" + std::string(20000, 'x') + "\nSUP ", "1005 260"},
};

INSTANTIATE_TEST_SUITE_P(Comments, Tokens, testing::ValuesIn(kComments), kRuleName);

class Lines : public testing::TestWithParam<TokenRow> {};

TEST_P(Lines, AreCounted) { EXPECT_EQ(linesOf(GetParam().text), GetParam().tokens); }

const TokenRow kLines[] = {
    {"FirstIsOne", "( ) ", "40@1 41@1 260@1"},
    {"EveryNewlineAddsOne", "(\n\n\n)\n", "40@1 41@4 260@5"},
    {"NewlineBehindAWordWaitsForTheNextToken", "NAME\nDESC\n", "1003@1 1004@2 260@3"},
    {"NewlineBehindANumberWaitsForTheNextToken", "1.2\n3 \n4\n",
     "2024:1.2@1 2024:3@2 2024:4@3 260@4"},
    {"CommentAddsOne", "# c\n( # d\n)", "40@2 41@3 260@3"},
    {"CommentAtTheEndAddsOneToo", "( # c", "40@1 260@2"},
    {"EmptyCommentAtTheEndAddsOneToo", "( #", "40@1 260@2"},
    {"CommentWithALineEndAtTheEndAddsOneOnly", "( # c\n", "40@1 260@2"},
    {"NewlineDroppedByAQuotedStringIsNotCounted", "'ab\n(\n)", "259:ab@1 40@1 41@2 260@2"},
    {"SecondNewlineBehindAQuotedStringIsCounted", "'ab\n\n(", "259:ab@1 40@2 260@2"},
    {"CarriageReturnIsNoLine", "(\r)\r\n(", "40@1 13@1 41@1 13@1 40@2 260@2"},
    {"FormFeedIsNoLine", "(\f)\v(", "40@1 12@1 41@1 11@1 40@1 260@1"},
    {"OnlyNewlines", "\n\n\n", "260@4"},
    {"BadLengthLeavesTheNewline", "1{\n2{3\n)", "2026:1{@1 2026:2{3@2 41@3 260@3"},
};

INSTANTIATE_TEST_SUITE_P(All, Lines, testing::ValuesIn(kLines), kRuleName);

}  // namespace
