// The records of reading a file, in the order of its steps: which traced functions it goes through,
// and when.

#include "RecordOrder.h"

#include <clocale>
#include <cstdlib>

namespace {

using tracetree::Installation;
using tracetree::treeOf;

std::string readTree(const std::string& text, int result) {
  Installation installation;
  installation.directory.write("V3.user.at", text);
  return treeOf([&] { EXPECT_EQ(installation.manager.readFile("V3.user.at"), result); });
}

TEST(RecordOrder, ReadAnEmptyFile) {
  EXPECT_EQ(readTree("", 0), R"(
readFile
  fileIsOpen -> 0
  lexan -> 260
  lexan -> 260
readFile -> 0
)");
}

TEST(RecordOrder, ReadAMissingFile) {
  Installation installation;
  EXPECT_EQ(treeOf([&] { installation.manager.readFile("V3.user.at"); }), R"(
readFile
  fileIsOpen -> 0
readFile -> 1
)");
}

TEST(RecordOrder, ReadAFileWithAnUnknownName) {
  Installation installation;
  installation.directory.write("V3.other", "NAME ");
  EXPECT_EQ(treeOf([&] { installation.manager.readFile("V3.other"); }), R"(
readFile
  fileIsOpen -> 0
readFile -> 89
)");
}

// The token that the definition ends on stays the current one when lexan() meets the end, so the
// reader asks once more behind the last definition, and once more at the end.
TEST(RecordOrder, ReadAnAttributeType) {
  EXPECT_EQ(readTree("attributetypes=( 1.1 NAME ( 'a' ) DESC 'd' SUP b EQUALITY c OBSOLETE )\n", 0),
            R"(
readFile
  fileIsOpen -> 0
  lexan -> 1010
  lexan -> 61
  Attribute::parse
    match
      lexan -> 40
    match -> 0
    match
      lexan -> 2024
    match -> 0
    lexan -> 1003
    match
      lexan -> 40
    match -> 0
    lexan -> 259
    lexan -> 41
    lexan -> 1004
    lexan -> 259
    lexan -> 1005
    lexan -> 259
    lexan -> 1011
    lexan -> 259
    lexan -> 1022
    lexan -> 41
    lexan -> 260
  Attribute::parse -> 1
  lexan -> 260
  lexan -> 260
readFile -> 0
)");
}

// A list is opened and closed by match(), whether its brackets are there or not.
TEST(RecordOrder, ReadAnObjectClass) {
  EXPECT_EQ(
      readTree(
          "objectclasses=( 2.1 NAME 'o' DESC 'd' SUP ( t ) AUXILIARY MUST ( x $ y ) MAY z OBSOLETE )\n",
          0),
      R"(
readFile
  fileIsOpen -> 0
  lexan -> 1002
  lexan -> 61
  ObjectClass::parse
    match
      lexan -> 40
    match -> 0
    match
      lexan -> 2024
    match -> 0
    lexan -> 1003
    match
      lexan -> 259
    match -> 0
    lexan -> 1004
    lexan -> 259
    lexan -> 1005
    lexan -> 40
    match
      lexan -> 259
    match -> 0
    lexan -> 41
    match
      lexan -> 1006
    match -> 0
    lexan -> 1007
    match
      lexan -> 40
    match -> 0
    match
      lexan -> 259
    match -> 0
    lexan -> 36
    lexan -> 259
    lexan -> 41
    match
      lexan -> 1008
    match -> 0
    match
      lexan -> 259
    match -> 0
    match -> 0
    lexan -> 1022
    match -> 0
    lexan -> 41
    lexan -> 260
  ObjectClass::parse -> 0
  lexan -> 260
  lexan -> 260
readFile -> 0
)");
}

TEST(RecordOrder, ReadAVendorExtension) {
  EXPECT_EQ(
      readTree("ORVAttributetypes=( 3.1 DBNAME ( 'p' )\nLENGTH 5 EQUALITY ACCESS-CLASS normal )\n",
               0),
      R"(
readFile
  fileIsOpen -> 0
  lexan -> 1016
  lexan -> 61
  ORVAttribute::parse
    match
      lexan -> 40
    match -> 0
    match
      lexan -> 2024
    match -> 0
    lexan -> 1018
    match
      lexan -> 40
    match -> 0
    lexan -> 259
    lexan -> 41
    getLineNumber -> 1
    lexan -> 1024
    getLineNumber -> 2
    lexan -> 2024
    lexan -> 1011
    lexan -> 1017
    lexan -> 259
    lexan -> 41
    lexan -> 260
  ORVAttribute::parse -> 0
  lexan -> 260
  lexan -> 260
readFile -> 0
)");
}

// The second definition of a block begins by consuming the token on which the first one stopped.
TEST(RecordOrder, ReadABlock) {
  EXPECT_EQ(readTree("x ORVAttributetypes { ( 1 ) ( 2 ) }\ny\n", 0), R"(
readFile
  fileIsOpen -> 0
  lexan -> 259
  lexan -> 1016
  lexan -> 123
  ORVAttribute::parse
    match
      lexan -> 40
    match -> 0
    match
      lexan -> 2024
    match -> 0
    lexan -> 41
    lexan -> 40
  ORVAttribute::parse -> 0
  ORVAttribute::parse
    match
      lexan -> 2024
    match -> 0
    match -> 0
    lexan -> 41
    lexan -> 125
  ORVAttribute::parse -> 0
  lexan -> 259
  lexan -> 260
  lexan -> 260
readFile -> 0
)");
}

TEST(RecordOrder, ReadADefinitionThatFails) {
  EXPECT_EQ(readTree("attributetypes=( 1 \n", 1), R"(
readFile
  fileIsOpen -> 0
  lexan -> 1010
  lexan -> 61
  Attribute::parse
    match
      lexan -> 40
    match -> 0
    match
      lexan -> 2024
    match -> 0
    lexan -> 260
  Attribute::parse -> 0
  Attribute::dump(out) -> 0
  SchemaLexan::dump -> 0
  dumpTable -> 0
readFile -> 1
)");
  EXPECT_EQ(readTree("objectclasses{ } \n", 0), R"(
readFile
  fileIsOpen -> 0
  lexan -> 1002
  lexan -> 123
  ObjectClass::parse
    match
      lexan -> 125
    match -> 0
    match -> 0
  ObjectClass::parse -> 0
  lexan -> 260
  lexan -> 260
readFile -> 0
)");
  EXPECT_EQ(readTree("ORVAttributetypes ( \n", 1), R"(
readFile
  fileIsOpen -> 0
  lexan -> 1016
  lexan -> 40
  SchemaLexan::dump -> 0
  dumpTable -> 0
readFile -> 1
)");
}

// With every bit on, debug records stand where the steps make them.
TEST(RecordOrder, ReadADefinitionThatFailsWithAllEvents) {
  Installation installation;
  installation.directory.write("V3.user.at", "ORVAttributetypes=( 1 )objectclasses = ( \n");
  ::setenv("LC_ALL", "C", 1);
  std::setlocale(LC_ALL, "C");
  const std::string expected = R"(
readFile
  debug outside: SchemaLexan: current locale settings on the system is: C
  debug outside: SchemaLexan: changing locale settings to "C" 
  debug outside: SchemaLexan: locale settings on the system after changing is: C 
  fileIsOpen -> 0
  debug: readFile: Parsing file: V3.user.at in directory: $ 
  lexan -> 1016
  lexan -> 61
  ORVAttribute::parse
    match
      lexan -> 40
    match -> 0
    match
      lexan -> 2024
    match -> 0
    lexan -> 41
    lexan -> 1002
  ORVAttribute::parse -> 0
  lexan -> 61
  ObjectClass::parse
    match
      lexan -> 40
    match -> 0
    match
      lexan -> 260
    match -> 0
  ObjectClass::parse -> 0
  debug: readFile: There was an error parsing the file, V3.user.at.
  debug: readFile: (1).Error occured while parsing the objectclass: 
  ObjectClass::dump(out) -> 0
  SchemaLexan::dump -> 0
  dumpTable -> 0
  debug outside: ~SchemaLexan: resetting locale before returning to system default settings. 
  debug outside: lexan: locale settings after resetting is: C
readFile -> 1
)";
  std::string actual = treeOf([&] { EXPECT_EQ(installation.manager.readFile("V3.user.at"), 1); },
                              support::kAllEvents);
  const auto place = actual.find(installation.directory.path());
  ASSERT_NE(place, std::string::npos);
  actual.replace(place, installation.directory.path().size(), "$");
  EXPECT_EQ(actual, expected);
  ::unsetenv("LC_ALL");
}

}  // namespace
