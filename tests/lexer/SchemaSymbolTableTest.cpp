#include "SchemaSymbolTable.h"

#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <type_traits>

namespace {

struct KeywordRow {
  int index;
  const char* text;
  int token;
};

const KeywordRow kKeywords[] = {
    {0, "objectclasses", 1002},
    {1, "NAME", 1003},
    {2, "DESC", 1004},
    {3, "SUP", 1005},
    {4, "AUXILIARY", 1006},
    {5, "MUST", 1007},
    {6, "MAY", 1008},
    {7, "STRUCTURAL", 1009},
    {8, "attributetypes", 1010},
    {9, "EQUALITY", 1011},
    {10, "SYNTAX", 1012},
    {11, "SINGLE-VALUE", 1013},
    {12, "USAGE", 1014},
    {13, "NO-USER-MODIFICATION", 1015},
    {14, "ORVAttributetypes", 1016},
    {15, "ACCESS-CLASS", 1017},
    {16, "DBNAME", 1018},
    {17, "SUBSTR", 1019},
    {18, "REVERSE", 1026},
    {19, "ORDERING", 1020},
    {20, "COLLECTIVE", 1021},
    {21, "OBSOLETE", 1022},
    {22, "ABSTRACT", 1023},
    {23, "LENGTH", 1024},
    {24, "APPROX", 1025},
};

void PrintTo(const KeywordRow& row, std::ostream* out) { *out << row.text; }

class Keyword : public testing::TestWithParam<KeywordRow> {};

TEST_P(Keyword, StandsAtItsIndexWithItsCode) {
  const KeywordRow& row = GetParam();
  SchemaSymbolTable table;
  std::string text;
  char character = '?';
  EXPECT_EQ(table.lookUpValue(row.text), row.index);
  EXPECT_TRUE(table.getValue(row.index, text));
  EXPECT_EQ(text, row.text);
  EXPECT_EQ(table.getTokenValue(row.index), row.token);
  EXPECT_TRUE(table.isString(row.index));
  EXPECT_FALSE(table.isCharacter(row.index));
  EXPECT_FALSE(table.getValue(row.index, character));
  EXPECT_EQ(character, '?');
}

INSTANTIATE_TEST_SUITE_P(All, Keyword, testing::ValuesIn(kKeywords));

TEST(TokenCodes, HaveTheirValues) {
  const int named[] = {KEY_OBJECTCLASSES,
                       KEY_NAME,
                       KEY_DESC,
                       KEY_SUP,
                       KEY_AUXILIARY,
                       KEY_MUST,
                       KEY_MAY,
                       KEY_STRUCTURAL,
                       KEY_ATTRIBUTETYPES,
                       KEY_EQUALITY,
                       KEY_SYNTAX,
                       KEY_SINGLE_VALUE,
                       KEY_USAGE,
                       KEY_NO_USER_MODIFICATION,
                       KEY_ORVATTRIBUTETYPES,
                       KEY_ACCESS_CLASS,
                       KEY_DBNAME,
                       KEY_SUBSTR,
                       KEY_REVERSE,
                       KEY_ORDERING,
                       KEY_COLLECTIVE,
                       KEY_OBSOLETE,
                       KEY_ABSTRACT,
                       KEY_LENGTH,
                       KEY_APPROX};
  ASSERT_EQ(std::size(named), std::size(kKeywords));
  for (std::size_t i = 0; i < std::size(named); ++i) {
    EXPECT_EQ(named[i], kKeywords[i].token) << kKeywords[i].text;
  }
  EXPECT_EQ(TOKEN_NAME, 259);
  EXPECT_EQ(TOKEN_END, 260);
  EXPECT_EQ(TOKEN_NUMBER, 2024);
  EXPECT_EQ(TOKEN_NUMBER_LENGTH, 2025);
  EXPECT_EQ(TOKEN_NUMBER_BAD_LENGTH, 2026);
}

TEST(SchemaSymbolTable, IsASymbolTableWithAVirtualDestructorAndNoFieldsOfItsOwn) {
  EXPECT_TRUE((std::is_base_of<CSymbolTable, SchemaSymbolTable>::value));
  EXPECT_TRUE((std::is_convertible<SchemaSymbolTable*, CSymbolTable*>::value));
  EXPECT_TRUE(std::has_virtual_destructor<CSymbolTable>::value);
  EXPECT_EQ(sizeof(SchemaSymbolTable), sizeof(CSymbolTable));
  const std::unique_ptr<CSymbolTable> owned = std::make_unique<SchemaSymbolTable>();
  EXPECT_EQ(owned->getTableSize(), 25);
}

TEST(SchemaSymbolTable, FreshTableHasTwentyFiveEntries) {
  SchemaSymbolTable table;
  EXPECT_EQ(table.getTableSize(), 25);
  EXPECT_FALSE(table.isString(25));
  EXPECT_FALSE(table.isCharacter(25));
}

struct AbsentRow {
  const char* rule;
  const char* text;
};

const AbsentRow kAbsent[] = {
    {"LowerCase", "name"},
    {"MixedCase", "Name"},
    {"FoldedObjectClasses", "objectClasses"},
    {"FoldedAttributeTypes", "attributeTypes"},
    {"FoldedOrvAttributeTypes", "ORVattributeTypes"},
    {"UpperCaseStart", "OBJECTCLASSES"},
    {"OrvInCamelCase", "ORVAttributeTypes"},
    {"Prefix", "NAM"},
    {"LongerWord", "NAMES"},
    {"TrailingBlank", "NAME "},
    {"Empty", ""},
    {"SameLengthFirstAndLastLetter", "NOME"},
};

void PrintTo(const AbsentRow& row, std::ostream* out) { *out << row.rule; }

class AbsentWord : public testing::TestWithParam<AbsentRow> {};

TEST_P(AbsentWord, IsNotFound) {
  SchemaSymbolTable table;
  EXPECT_EQ(table.lookUpValue(GetParam().text), -1);
}

INSTANTIATE_TEST_SUITE_P(All, AbsentWord, testing::ValuesIn(kAbsent),
                         [](const auto& row) { return std::string(row.param.rule); });

TEST(SchemaSymbolTable, FirstInsertionReceivesTheIndexOfTheSize) {
  SchemaSymbolTable table;
  EXPECT_EQ(table.insertValue(std::string("cn"), 259, false), 25);
  EXPECT_EQ(table.getTableSize(), 26);
  EXPECT_EQ(table.lookUpValue("cn"), 25);
  EXPECT_EQ(table.getTokenValue(25), 259);
}

TEST(SchemaSymbolTable, RemovalOfAnIndexWithoutEntryIsHarmless) {
  SchemaSymbolTable table;
  for (const int index : {25, 26, 1000, -1, -1000, 2147483647, -2147483647 - 1}) {
    table.removeValue(index);
    EXPECT_EQ(table.getTableSize(), 25) << index;
  }
  EXPECT_EQ(table.insertValue(std::string("cn"), 259, false), 25);
}

TEST(SchemaSymbolTable, RemovalTwiceDropsOneEntry) {
  SchemaSymbolTable table;
  const int first = table.insertValue(std::string("first"), 259, false);
  const int second = table.insertValue(std::string("second"), 259, false);
  table.removeValue(first);
  table.removeValue(first);
  EXPECT_EQ(table.getTableSize(), 26);
  EXPECT_EQ(table.lookUpValue("second"), second);
  EXPECT_EQ(table.lookUpValue("first"), -1);
}

TEST(SchemaSymbolTable, ScratchEntryDoesNotMakeTheTableGrow) {
  SchemaSymbolTable table;
  int scratch = table.getTableSize();
  for (int i = 0; i < 10000; ++i) {
    const std::string text = "word" + std::to_string(i);
    table.removeValue(scratch);
    scratch = table.insertValue(text, 259, false);
    ASSERT_EQ(scratch, 25) << text;
    ASSERT_EQ(table.getTableSize(), 26) << text;
    ASSERT_EQ(table.lookUpValue(text), scratch);
  }
  EXPECT_EQ(table.lookUpValue("word0"), -1);
  for (const KeywordRow& row : kKeywords) {
    EXPECT_EQ(table.lookUpValue(row.text), row.index);
  }
}

TEST(SchemaSymbolTable, RemovedEntryLeavesAHoleAndTheOtherIndexesStay) {
  SchemaSymbolTable table;
  std::string text = "untouched";
  char character = '?';
  table.insertValue(std::string("a"), 1, false);
  table.insertValue(std::string("b"), 2, false);
  table.insertValue('c', 3, false);
  table.removeValue(25);
  EXPECT_EQ(table.getTableSize(), 27);
  EXPECT_EQ(table.lookUpValue("a"), -1);
  EXPECT_FALSE(table.isString(25));
  EXPECT_FALSE(table.isCharacter(25));
  EXPECT_FALSE(table.getValue(25, text));
  EXPECT_EQ(text, "untouched");
  EXPECT_FALSE(table.getValue(25, character));
  EXPECT_EQ(table.lookUpValue("b"), 26);
  EXPECT_EQ(table.getTokenValue(26), 2);
  EXPECT_TRUE(table.getValue(27, character));
  EXPECT_EQ(character, 'c');
}

TEST(SchemaSymbolTable, RemovalOfEveryEntryFromTheFrontEmptiesTheTable) {
  SchemaSymbolTable table;
  for (int index = 0; index < 25; ++index) {
    table.removeValue(index);
    EXPECT_EQ(table.getTableSize(), 24 - index);
  }
  for (const KeywordRow& row : kKeywords) {
    EXPECT_EQ(table.lookUpValue(row.text), -1) << row.text;
  }
}

TEST(CSymbolTable, NewTableIsEmpty) {
  CSymbolTable table;
  EXPECT_EQ(table.getTableSize(), 0);
  EXPECT_EQ(table.lookUpValue(""), -1);
  EXPECT_EQ(table.lookUpValue("NAME"), -1);
  EXPECT_EQ(table.insertValue(std::string("x"), 7, true), 0);
}

TEST(CSymbolTable, CharacterEntryIsNoString) {
  CSymbolTable table;
  const int index = table.insertValue('x', 120, false);
  std::string text = "untouched";
  char character = '?';
  EXPECT_EQ(table.lookUpValue("x"), -1);
  EXPECT_TRUE(table.isCharacter(index));
  EXPECT_FALSE(table.isString(index));
  EXPECT_FALSE(table.getValue(index, text));
  EXPECT_EQ(text, "untouched");
  EXPECT_TRUE(table.getValue(index, character));
  EXPECT_EQ(character, 'x');
  EXPECT_EQ(table.getTokenValue(index), 120);
}

TEST(CSymbolTable, EqualTextsAreFoundAtTheLowestIndex) {
  CSymbolTable table;
  table.insertValue(std::string("other"), 1, false);
  const int first = table.insertValue(std::string("twice"), 2, false);
  const int second = table.insertValue(std::string("twice"), 3, false);
  EXPECT_EQ(table.lookUpValue("twice"), first);
  table.removeValue(first);
  EXPECT_EQ(table.lookUpValue("twice"), second);
}

TEST(CSymbolTable, AnyBytesAreAText) {
  CSymbolTable table;
  const std::string texts[] = {"",  std::string(1, '\0'), std::string("a\0b", 3),
                               "a", "\x80\xff",           std::string(100000, 'x')};
  int expected = 0;
  for (const std::string& text : texts) {
    EXPECT_EQ(table.insertValue(text, 300 + expected, false), expected);
    ++expected;
  }
  expected = 0;
  for (const std::string& text : texts) {
    std::string back;
    EXPECT_EQ(table.lookUpValue(text), expected);
    EXPECT_TRUE(table.getValue(expected, back));
    EXPECT_EQ(back, text);
    ++expected;
  }
}

TEST(CSymbolTable, IndexOutsideTheTableHasNoValue) {
  CSymbolTable table;
  table.insertValue(std::string("x"), 7, false);
  std::string text = "untouched";
  char character = '?';
  for (const int index : {-1, 1, 2147483647, -2147483647 - 1}) {
    EXPECT_FALSE(table.isString(index)) << index;
    EXPECT_FALSE(table.isCharacter(index)) << index;
    EXPECT_FALSE(table.getValue(index, text)) << index;
    EXPECT_FALSE(table.getValue(index, character)) << index;
    EXPECT_EQ(table.getTokenValue(index), -1) << index;
  }
  EXPECT_EQ(text, "untouched");
  EXPECT_EQ(character, '?');
}

TEST(CSymbolTable, RemovedIndexHasNoTokenCode) {
  CSymbolTable table;
  const int text = table.insertValue(std::string("x"), 7, true);
  const int character = table.insertValue('x', 8, false);
  const int last = table.insertValue(std::string("y"), 9, false);
  table.removeValue(text);
  table.removeValue(character);
  EXPECT_EQ(table.getTokenValue(text), -1);
  EXPECT_EQ(table.getTokenValue(character), -1);
  EXPECT_EQ(table.getTokenValue(last), 9);
  table.removeValue(last);
  EXPECT_EQ(table.getTokenValue(last), -1);
}

// Behind a removed last entry the removed ones before it go, too.
TEST(CSymbolTable, IndexesBehindTheLastEntryAreGivenOutAgain) {
  CSymbolTable table;
  table.insertValue(std::string("a"), 1, false);
  table.insertValue(std::string("b"), 2, false);
  table.insertValue(std::string("c"), 3, false);
  table.removeValue(1);
  EXPECT_EQ(table.insertValue(std::string("d"), 4, false), 3);
  table.removeValue(3);
  EXPECT_EQ(table.insertValue(std::string("e"), 5, false), 3);
  table.removeValue(3);
  table.removeValue(2);
  EXPECT_EQ(table.insertValue(std::string("f"), 6, false), 1);
  EXPECT_EQ(table.getTableSize(), 2);
  EXPECT_EQ(table.lookUpValue("a"), 0);
  EXPECT_EQ(table.lookUpValue("f"), 1);
}

TEST(CSymbolTable, LookUpByCodeReturnsTheLowestIndexFromTheFirstOn) {
  SchemaSymbolTable table;
  table.insertValue(std::string("again"), 1003, false);
  EXPECT_EQ(table.lookUp(1003, 0), 1);
  EXPECT_EQ(table.lookUp(1003, 1), 1);
  EXPECT_EQ(table.lookUp(1003, 2), 25);
  EXPECT_EQ(table.lookUp(1003, 26), -1);
  EXPECT_EQ(table.lookUp(1003, -5), 1);
  EXPECT_EQ(table.lookUp(4711, 0), -1);
}

TEST(CSymbolTable, ClearForgetsTheCurrentTokenAndKeepsEveryEntry) {
  SchemaSymbolTable table;
  table.insertValue(std::string("cn"), 259, false);
  EXPECT_EQ(table.clear(25), -1);
  EXPECT_EQ(table.clear(-1), -1);
  EXPECT_EQ(table.getTableSize(), 26);
  EXPECT_EQ(table.lookUpValue("cn"), 25);
}

}  // namespace
