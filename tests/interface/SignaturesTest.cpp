// Every public operation has exactly one signature, which a caller can take a pointer to, and every
// constructor converts implicitly. The pointers are checked when this file is compiled: an added
// `const`, another result or another argument is an error there.

#include <gtest/gtest.h>

#include <fstream>
#include <set>
#include <string>
#include <type_traits>
#include <vector>

#include "Attribute.h"
#include "CSymbolTable.h"
#include "Clex_analyzer.h"
#include "ORVAttribute.h"
#include "ORVSchema.h"
#include "ObjectClass.h"
#include "SchemaLexan.h"
#include "SchemaManager.h"
#include "SchemaSymbolTable.h"
#include "ldtr.h"

namespace {

using Strings = std::vector<std::string>;
using Oids = std::set<std::string>;

// Each line of a list compiles only when the operation has just this signature.
template <typename Signature, typename Owner>
constexpr bool has(Signature Owner::* /*operation*/) {
  return true;
}

// The operations of every definition, as the class itself declares or inherits them.
template <typename Definition>
constexpr bool hasTheOperationsOfADefinition() {
  return has<std::string(), Definition>(&Definition::getOid) &&
         has<std::string(), Definition>(&Definition::getDescription) &&
         has<Strings(), Definition>(&Definition::getSuperior) &&
         has<std::string(), Definition>(&Definition::getFirstName) &&
         has<Strings(), Definition>(&Definition::getNames) &&
         has<std::string(), Definition>(&Definition::getFirstNameLower) &&
         has<void(), Definition>(&Definition::dump) &&
         has<void(std::ofstream&), Definition>(&Definition::dump);
}
static_assert(hasTheOperationsOfADefinition<ORVSchema>());
static_assert(hasTheOperationsOfADefinition<Attribute>());
static_assert(hasTheOperationsOfADefinition<ObjectClass>());
static_assert(hasTheOperationsOfADefinition<ORVAttribute>());

static_assert(has<int(SchemaLexan*), Attribute>(&Attribute::parse));
static_assert(has<int(const Attribute&), Attribute>(&Attribute::attrsEqual));
static_assert(has<std::string(std::string), Attribute>(&Attribute::convert));
static_assert(has<std::string(), Attribute>(&Attribute::getOidAndName));

static_assert(has<bool(SchemaLexan*), ObjectClass>(&ObjectClass::parse));
static_assert(has<bool(const ObjectClass&), ObjectClass>(&ObjectClass::objsEqual));
static_assert(has<Strings(), ObjectClass>(&ObjectClass::getReqAttrs));
static_assert(has<Strings(), ObjectClass>(&ObjectClass::getOptAttrs));
static_assert(has<std::string(std::string), ObjectClass>(&ObjectClass::convert));
static_assert(has<std::string(), ObjectClass>(&ObjectClass::getOidAndName));

static_assert(has<bool(SchemaLexan*), ORVAttribute>(&ORVAttribute::parse));
static_assert(has<bool(const ORVAttribute&), ORVAttribute>(&ORVAttribute::orvAttrsEqual));
static_assert(has<std::string(std::string), ORVAttribute>(&ORVAttribute::convert));
static_assert(has<std::string(), ORVAttribute>(&ORVAttribute::getOidAndName));

template <typename Lexer>
constexpr bool hasTheOperationsOfAnAnalyser() {
  return has<int(), Lexer>(&Lexer::getLineNumber) &&
         has<std::string(), Lexer>(&Lexer::getFileName) &&
         has<std::string(), Lexer>(&Lexer::getWorkingDir) &&
         has<bool(int), Lexer>(&Lexer::isString) && has<bool(int), Lexer>(&Lexer::isCharacter) &&
         has<int(), Lexer>(&Lexer::getCurrentToken) &&
         has<int(), Lexer>(&Lexer::getTokenValIndex) &&
         has<bool(int, std::string&), Lexer>(&Lexer::getStringValue) &&
         has<bool(int, char&), Lexer>(&Lexer::getCharValue) &&
         has<int(int, int), Lexer>(&Lexer::lookUp) && has<int(), Lexer>(&Lexer::lexan) &&
         has<void(int), Lexer>(&Lexer::match) &&
         has<int(std::string, int), Lexer>(&Lexer::insertString) &&
         has<int(char, int), Lexer>(&Lexer::insertCharacter) && has<int(), Lexer>(&Lexer::clear) &&
         has<void(std::string), Lexer>(&Lexer::dumpTable) &&
         has<void(int, std::ofstream&), Lexer>(&Lexer::dump) &&
         has<void(int, std::ofstream&), Lexer>(&Lexer::skip);
}
static_assert(hasTheOperationsOfAnAnalyser<Clex_analyzer>());
static_assert(hasTheOperationsOfAnAnalyser<SchemaLexan>());
static_assert(has<bool(), SchemaLexan>(&SchemaLexan::fileIsOpen));

static_assert(has<int(std::string, int, bool), CSymbolTable>(&CSymbolTable::insertValue));
static_assert(has<int(char, int, bool), CSymbolTable>(&CSymbolTable::insertValue));
static_assert(has<int(std::string), CSymbolTable>(&CSymbolTable::lookUpValue));
static_assert(has<int(int), CSymbolTable>(&CSymbolTable::getTokenValue));
static_assert(has<bool(int, std::string&), CSymbolTable>(&CSymbolTable::getValue));
static_assert(has<bool(int, char&), CSymbolTable>(&CSymbolTable::getValue));
static_assert(has<bool(int), CSymbolTable>(&CSymbolTable::isString));
static_assert(has<bool(int), CSymbolTable>(&CSymbolTable::isCharacter));
static_assert(has<void(int), CSymbolTable>(&CSymbolTable::removeValue));
static_assert(has<int(int, int), CSymbolTable>(&CSymbolTable::lookUp));
static_assert(has<int(int), CSymbolTable>(&CSymbolTable::clear));
static_assert(has<int(), CSymbolTable>(&CSymbolTable::getTableSize));
static_assert(has<void(std::string), CSymbolTable>(&CSymbolTable::tableDump));
static_assert(has<void(int, std::ofstream&), CSymbolTable>(&CSymbolTable::dump));

using Manager = SchemaManager;
static_assert(has<Attribute(std::string), Manager>(&Manager::getAttr));
static_assert(has<ObjectClass(std::string), Manager>(&Manager::getObjClass));
static_assert(has<ORVAttribute(std::string), Manager>(&Manager::getORVAttr));
static_assert(has<std::string(std::string), Manager>(&Manager::convert));
static_assert(has<void(), Manager>(&Manager::dumpAttrTable));
static_assert(has<void(), Manager>(&Manager::dumpORVAttrTable));
static_assert(has<void(), Manager>(&Manager::dumpOcTable));
static_assert(has<void(), Manager>(&Manager::dumpUserOc));
static_assert(has<void(), Manager>(&Manager::dumpUserAt));
static_assert(has<void(), Manager>(&Manager::dumpOrvOc));
static_assert(has<void(), Manager>(&Manager::dumpOrvAt));
static_assert(has<void(), Manager>(&Manager::dumpSysOc));
static_assert(has<void(), Manager>(&Manager::dumpSysAt));
static_assert(has<void(), Manager>(&Manager::dumpEOids));
static_assert(has<int(std::string), Manager>(&Manager::readFile));
static_assert(has<int(std::string, std::string), Manager>(&Manager::writeFile));
static_assert(has<int(Oids, std::string), Manager>(&Manager::writeSetToFile));
static_assert(has<int(std::string), Manager>(&Manager::readExcludedOids));
static_assert(has<bool(std::string), Manager>(&Manager::isExcluded));
static_assert(has<int(std::string), Manager>(&Manager::delOidFromFileSet));
static_assert(has<int(std::string), Manager>(&Manager::modifySchema));
static_assert(has<int(std::string), Manager>(&Manager::delOidFromModSch));
static_assert(has<bool(), Manager>(&Manager::isModFileEmpty));
static_assert(has<bool(Manager*), Manager>(&Manager::compSchemas));
static_assert(has<bool(Manager*), Manager>(&Manager::compObjTables));
static_assert(has<bool(Manager*), Manager>(&Manager::compAttrTables));
static_assert(has<bool(Manager*), Manager>(&Manager::compORVAttrTables));
static_assert(has<bool(Manager*), Manager>(&Manager::mergeSchemas));
static_assert(has<bool(Manager*), Manager>(&Manager::mergeAttrs));
static_assert(has<bool(Manager*), Manager>(&Manager::mergeORVAttrs));
static_assert(has<bool(Manager*), Manager>(&Manager::mergeObjClasses));
static_assert(has<Oids*(Manager*, std::string), Manager>(&Manager::findOidInSet));
static_assert(has<bool(Manager*), Manager>(&Manager::checkCollisions));
static_assert(has<bool(Manager*), Manager>(&Manager::checkObjClasses));
static_assert(has<bool(Manager*), Manager>(&Manager::checkAttrs));
static_assert(has<bool(Manager*), Manager>(&Manager::checkORVAttrs));
static_assert(has<std::string(), Manager>(&Manager::getOcTable));
static_assert(has<std::string(), Manager>(&Manager::getAttrTable));
static_assert(has<std::string(), Manager>(&Manager::getORVAttrTable));

using Guard = ldtr_function_local<0x53010100, 33, 4096>;
static_assert(has<ldtr_formater_local(unsigned long), Guard>(&Guard::operator()));
static_assert(has<long(long), Guard>(&Guard::SetErrorCode));
static_assert(has<void(), ldtr_formater_local>(&ldtr_formater_local::operator()));
static_assert(
    has<void(unsigned long, char const*, ...), ldtr_formater_local>(&ldtr_formater_local::debug));
static_assert(has<ldtr_formater_global(unsigned long), ldtr_function_global>(
    &ldtr_function_global::operator()));
static_assert(
    has<void(unsigned long, char const*, ...), ldtr_formater_global>(&ldtr_formater_global::debug));

static_assert(std::is_convertible_v<void const*, Guard>);
static_assert(std::is_convertible_v<unsigned long, ldtr_formater_global>);
static_assert(std::is_convertible_v<std::string, SchemaManager>);

TEST(Signatures, ConstructorsConvertImplicitly) {
  SchemaManager manager = std::string("directory");
  SchemaLexan lexer = {"directory", "file"};
  SchemaSymbolTable table = {};
  Attribute attribute = {};
  ObjectClass objectClass = {};
  ORVAttribute extension = {};
  EXPECT_TRUE(manager.isModFileEmpty());
  EXPECT_EQ(lexer.getFileName(), "file");
  EXPECT_EQ(table.getTableSize(), 25);
  EXPECT_EQ(attribute.getOid() + objectClass.getOid() + extension.getOid(), "");
}

// A pointer whose type is not written out is as good, since no operation has a second form but
// dump.
TEST(Signatures, OperationsAreCalledThroughPointersToThem) {
  auto getOid = &ORVSchema::getOid;
  auto convert = &Attribute::convert;
  auto isExcluded = &SchemaManager::isExcluded;
  auto lexan = &Clex_analyzer::lexan;
  Attribute attribute;
  SchemaManager manager("");
  SchemaLexan lexer("", "");
  EXPECT_EQ((attribute.*getOid)(), "");
  EXPECT_EQ((attribute.*convert)("A"), "a");
  EXPECT_FALSE((manager.*isExcluded)("1.2"));
  EXPECT_EQ((lexer.*lexan)(), 260);
}

}  // namespace
