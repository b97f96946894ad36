// A schema's text as it is written: definitions, clauses, values and places; what is odd about it.

#include <gtest/gtest.h>
#include <libschema-migration/Written.h>

#include <string>

#include "Printed.h"

namespace {

struct Row {
  const char* name;
  std::string text;
  std::string definitions;
  std::string oddities;
};

void PrintTo(const Row& row, std::ostream* out) { *out << row.name; }

const Row kRows[] = {
    {"Empty", "", "", ""},
    {"AllClausesOfAnAttributeType",
     "attributetypes=( 1.2 NAME ( 'a' 'b' ) DESC 'd e' OBSOLETE SUP c EQUALITY e ORDERING 1.3\n"
     " SUBSTR s SYNTAX 1.4{64} SINGLE-VALUE NO-USER-MODIFICATION USAGE dSAOperation )\n",
     "1:16-2:80 attribute type = OID 1.2 | NAME ( 'a' 'b' ) | DESC 'd e' | OBSOLETE | SUP c | "
     "EQUALITY e | ORDERING 1.3 | SUBSTR s | SYNTAX 1.4{64} | SINGLE-VALUE | "
     "NO-USER-MODIFICATION | USAGE dSAOperation\n",
     ""},
    {"AllClausesOfAnObjectClass",
     "objectclasses=( 1.2 NAME 'a' SUP ( b $ c ) ABSTRACT MUST d MAY ( e $ f ) )\n",
     "1:15-1:75 object class = OID 1.2 | NAME 'a' | SUP ( b c ) | ABSTRACT | MUST d | "
     "MAY ( e f )\n",
     ""},
    {"AllClausesOfAVendorExtension",
     "ORVAttributetypes=( 1.2 DBNAME ( 'a' 'a' ) ACCESS-CLASS normal LENGTH 5 EQUALITY ORDERING "
     "SUBSTR APPROX REVERSE )\n",
     "1:19-1:114 vendor extension = OID 1.2 | DBNAME ( 'a' 'a' ) | ACCESS-CLASS normal | LENGTH 5 "
     "| EQUALITY | ORDERING | SUBSTR | APPROX | REVERSE\n",
     ""},
    {"Block", "attributetypes {\n( 1.2 SUP a )\n( 1.3 SUP b )\n}\n",
     "2:1-2:14 attribute type { OID 1.2 | SUP a\n3:1-3:14 attribute type { OID 1.3 | SUP b\n", ""},
    {"EmptyBlock", "attributetypes { }\n", "", ""},
    {"CommentsAbove", "# one\n\n# two\n  # three\nattributetypes=( 1.2 SUP a ) # four\n",
     "# two\n  # three\n5:16-5:29 attribute type = OID 1.2 | SUP a\n", ""},
    {"CommentsInABlock", "attributetypes {\n# one\n( 1.2 SUP a )\n\n( 1.3 # two\nSUP b ) }\n",
     "# one\n3:1-3:14 attribute type { OID 1.2 | SUP a\n"
     "5:1-6:8 attribute type { OID 1.3 | SUP b\n",
     ""},
    {"EscapesAreResolved", "attributetypes=( 1.2 DESC 'it\\27s \\5C \\28' )\n",
     "1:16-1:45 attribute type = OID 1.2 | DESC 'it's \\ \\28'\n", ""},
    {"BytesOfUtf8", "attributetypes=( 1.2 DESC 'caf\xc3\xa9' )\n",
     "1:16-1:36 attribute type = OID 1.2 | DESC 'caf\xc3\xa9'\n", "1:31 ByteInQuotes [\xc3]\n"},
    {"LineEndInQuotes", "attributetypes=( 1.2 DESC 'one\n two' )\n",
     "1:16-2:8 attribute type = OID 1.2 | DESC 'one\n two'\n", "1:27 LineEndInQuotes ['one\n]\n"},
    {"UnclosedQuoteEndsWithItsLine", "attributetypes=( 1.2 DESC 'one\n SUP a NAME 'b' )\n",
     "1:16-2:18 attribute type = OID 1.2 | DESC 'one' | SUP a | NAME 'b'\n",
     "1:27 UnclosedQuote ['one]\n"},
    {"UnclosedQuoteBeforeADefinition",
     "attributetypes=( 1.2 DESC 'one )\nattributetypes=( 1.3 DESC 'two' )\n",
     "1:16-1:33 attribute type = OID 1.2 | DESC 'one )' …\n"
     "2:16-2:34 attribute type = OID 1.3 | DESC 'two'\n",
     "1:16 NotClosed [(]\n1:27 UnclosedQuote ['one )]\n"},
    {"BlankBeforeTheLength", "attributetypes=( 1.2 SYNTAX 1.3 {64} )\n",
     "1:16-1:39 attribute type = OID 1.2 | SYNTAX 1.3{64}\n", ""},
    {"BadLengths", "attributetypes=( 1.2 SYNTAX 1.3{6x} SUP a{5} )\n",
     "1:16-1:47 attribute type = OID 1.2 | SYNTAX 1.3{6x} | SUP a{5}\n",
     "1:29 BadLength [1.3{6x}]\n1:41 BadLength [a{5}]\n"},
    {"TabsGlueWords", "attributetypes=( 1.2\tSUP\ta\tNAME 'b'\tDESC 'c' )\n",
     "1:16-1:47 attribute type = OID 1.2 | SUP a | NAME 'b' | DESC 'c'\n",
     "1:22 TabBehindWord [SUP]\n"},
    {"AnyLetterCase", "ATTRIBUTETYPES=( 1.2 sup a single_value )\n",
     "1:16-1:42 attribute type = OID 1.2 | SUP<sup> a | SINGLE-VALUE<single_value>\n",
     "1:1 Spelling [ATTRIBUTETYPES]\n1:22 Spelling [sup]\n1:28 Spelling [single_value]\n"},
    {"OneEditAway", "attributetypes=( 1.2 EQUALTY a SYNATX 1.3 NAMEE 'b' SUB c )\n",
     "1:16-1:60 attribute type = OID 1.2 | EQUALITY<EQUALTY> a | SYNTAX<SYNATX> 1.3 | "
     "NAME<NAMEE> 'b' | SUP<SUB> c\n",
     "1:22 Spelling [EQUALTY]\n1:32 Spelling [SYNATX]\n1:43 Spelling [NAMEE]\n"
     "1:53 Spelling [SUB]\n"},
    {"ValuesMayBeCalledLikeKeywords", "objectclasses=( 1.2 SUP name MUST ( desc $ sup ) )\n",
     "1:15-1:51 object class = OID 1.2 | SUP name | MUST ( desc sup )\n", ""},
    {"ExtensionsWithValues",
     "attributetypes=( 1.2 SUP a X-ORIGIN 'RFC 1' x-b ( 'c' 'd' ) FOO bar APPROX e )\n",
     "1:16-1:79 attribute type = OID 1.2 | SUP a | <X-ORIGIN> 'RFC 1' | <x-b> ( 'c' 'd' ) | "
     "<FOO> bar | APPROX e\n",
     ""},
    {"NotClosedBeforeASection", "attributetypes=( 1.2 SUP a\nattributetypes=( 1.3 SUP b )\n",
     "1:16-1:27 attribute type = OID 1.2 | SUP a …\n"
     "2:16-2:29 attribute type = OID 1.3 | SUP b\n",
     "1:16 NotClosed [(]\n"},
    {"NotClosedInABlock", "attributetypes {\n( 1.2 SUP a\n( 1.3 SUP b )\n( 1.4 SUP c\n}\n",
     "2:1-2:12 attribute type { OID 1.2 | SUP a …\n3:1-3:14 attribute type { OID 1.3 | SUP b\n"
     "4:1-4:12 attribute type { OID 1.4 | SUP c …\n",
     "2:1 NotClosed [(]\n4:1 NotClosed [(]\n"},
    {"DefinitionInADefinition", "attributetypes=( 1.2 SUP a attributetypes=( 1.3 SUP b ) SUP c )\n",
     "1:16-1:27 attribute type = OID 1.2 | SUP a …\n1:43-1:56 attribute type = OID 1.3 | SUP b\n",
     "1:28 DefinitionInDefinition [attributetypes]\n"},
    {"DefinitionInADefinitionOfABlock",
     "attributetypes { ( 1.2 SUP a ( 1.3 SUP b ) SUP c ) ( 1.4 SUP d ) }\n",
     "1:18-1:29 attribute type { OID 1.2 | SUP a …\n1:30-1:43 attribute type { OID 1.3 | SUP b\n"
     "1:52-1:65 attribute type { OID 1.4 | SUP d\n",
     "1:30 DefinitionInDefinition [(]\n"},
    {"SectionInABlock", "attributetypes { objectclasses { ( 1.2 SUP a ) } ( 1.3 SUP b ) }\n",
     "1:34-1:47 object class { OID 1.2 | SUP a\n1:50-1:63 attribute type { OID 1.3 | SUP b\n",
     "1:18 DefinitionInDefinition [objectclasses]\n"},
    {"BlockNotClosed", "attributetypes { ( 1.2 SUP a )\nobjectclasses { ( 1.3 SUP b ) }\n",
     "1:18-1:31 attribute type { OID 1.2 | SUP a\n2:17-2:30 object class { OID 1.3 | SUP b\n",
     "1:1 BlockNotClosed [attributetypes { ( 1.2 SUP a )\n]\n"},
    {"NoOpening", "attributetypes ( 1.2 SUP a )\nattributetypes foo\n",
     "1:16-1:29 attribute type = OID 1.2 | SUP a\n",
     "1:1 NoOpening [attributetypes]\n2:1 NoOpening [attributetypes]\n"},
    {"TextOutsideWithItsGroups", "foo ( bar ) baz\nattributetypes=( 1.2 SUP a ) ) qux\n",
     "2:16-2:29 attribute type = OID 1.2 | SUP a\n",
     "1:1 TextOutside [foo ( bar ) baz]\n2:30 LoneParenthesis [)]\n2:32 TextOutside [qux]\n"},
    {"NoValues", "objectclasses=( 1.2 NAME DESC SUP ( ) MAY ( a $ ) MUST )\n",
     "1:15-1:57 object class = OID 1.2 | NAME | DESC | SUP ( ) | MAY ( a ) | MUST\n",
     "1:21 NoValue [NAME]\n1:26 NoValue [DESC]\n1:31 NoValue [SUP]\n1:39 NoValue [MAY]\n"
     "1:51 NoValue [MUST]\n"},
    {"NoNames", "objectclasses=( 1.2 NAME 5 DESC 6 SUP 1.3 MUST ( $ a , b ) )\n",
     "1:15-1:61 object class = OID 1.2 | NAME 5 | DESC 6 | SUP 1.3 | MUST ( a b )\n",
     "1:26 NoName [5]\n1:33 NoName [6]\n1:39 NoName [1.3]\n1:50 NoName [$]\n1:54 NoName [,]\n"},
    {"StrayParentheses", "attributetypes=( 1.2 SUP ( a ) ( DESC 'b' ) NAME ( 'c' USAGE d )\n",
     "1:16-1:65 attribute type = OID 1.2 | SUP ( a ) | DESC 'b' | NAME ( 'c' ) | USAGE d\n",
     "1:26 StrayParenthesis [(]\n1:32 StrayParenthesis [(]\n1:50 StrayParenthesis [(]\n"},
    {"CommentBehindATab", "\t # x\n\t# y\nattributetypes=( 1.2 SUP c )\n",
     "\t # x\n\t# y\n3:16-3:29 attribute type = OID 1.2 | SUP c\n", ""},
    {"DoubleQuoteThatTheLineEnds", "attributetypes=( 1.2 DESC \"b\nSUP c )\n",
     "1:16-2:8 attribute type = OID 1.2 | DESC \"\" | <b> | SUP c\n", "1:27 DoubleQuote [\"]\n"},
    {"DoubleQuotes", "attributetypes=( 1.2 NAME \"a\" DESC \"b c\" )\n",
     "1:16-1:43 attribute type = OID 1.2 | NAME \"a\" | DESC \"b c\"\n",
     "1:27 DoubleQuote [\"a\"]\n1:36 DoubleQuote [\"b c\"]\n"},
    {"LastWord", "attributetypes=( 1.2 SUP a )\nfoo",
     "1:16-1:29 attribute type = OID 1.2 | SUP a\n", "2:1 LastWord [foo]\n2:1 TextOutside [foo]\n"},
    {"CarriageReturns",
     "objectclasses=\r\n( 1.2\r\n NAME\r\n 'a'\r\n DESC\r\n 'b' MUST ( a $\r\n b )\r\n)\r\n",
     "2:1-8:2 object class = OID 1.2 | NAME 'a' | DESC 'b' | MUST ( a b )\n",
     "1:15 CarriageReturn [\r]\n5:6 CarriageReturn [\r]\n6:16 CarriageReturn [\r]\n"},
    {"NulAndMark", std::string("\xef\xbb\xbf\0\0attributetypes=( 1.2 SUP a )\n", 34),
     "1:21-1:34 attribute type = OID 1.2 | SUP a\n",
     std::string("1:1 ByteOrderMark [\xef\xbb\xbf]\n1:4 Nul [\0\0]\n", 37)},
};

class Written : public testing::TestWithParam<Row> {};

TEST_P(Written, IsReadAs) {
  const migration::Source source("V3.user.at", GetParam().text);
  const migration::WrittenFile file(source);
  EXPECT_EQ(printed::definitions(file), GetParam().definitions);
  EXPECT_EQ(printed::oddities(file), GetParam().oddities);
}

INSTANTIATE_TEST_SUITE_P(, Written, testing::ValuesIn(kRows),
                         [](const auto& row) { return std::string(row.param.name); });

}  // namespace
