// The tables and OID sets of a manager: looking up, and printing.

#include <gtest/gtest.h>

#include <memory>
#include <type_traits>
#include <utility>

#include "Calls.h"
#include "Files.h"
#include "Installation.h"
#include "UnfreedDefinitions.h"

using namespace support;

namespace {

struct Print {
  const char* name;
  void (SchemaManager::*print)();
  const char* ofEmptyManager;
};

const Print kPrints[] = {
    {"dumpAttrTable", &SchemaManager::dumpAttrTable, "AttributeTable contains:\nKey\nValue\n\n"},
    {"dumpORVAttrTable", &SchemaManager::dumpORVAttrTable,
     "ORVAttributeTable contains:\nKey\nValue\n\n"},
    {"dumpOcTable", &SchemaManager::dumpOcTable, "ObjectClassTable contains:\nKey\tValue\n\n"},
    {"dumpUserOc", &SchemaManager::dumpUserOc, "OIDs from the V3.user.oc file\n\n"},
    {"dumpUserAt", &SchemaManager::dumpUserAt, "OIDs from the V3.user.at file\n\n"},
    {"dumpOrvOc", &SchemaManager::dumpOrvOc, "OIDs from the V3.orv.oc file\n\n"},
    {"dumpOrvAt", &SchemaManager::dumpOrvAt, "OIDs from the V3.orv.at file\n\n"},
    {"dumpSysOc", &SchemaManager::dumpSysOc, "OIDs from the V3.system.oc file\n\n"},
    {"dumpSysAt", &SchemaManager::dumpSysAt, "OIDs from the V3.system.at file\n\n"},
    {"dumpEOids", &SchemaManager::dumpEOids, "excluded oids\n\n"},
};

std::string printed(Installation* installation, void (SchemaManager::*print)()) {
  return standardOutputOf([&] { (installation->manager()->*print)(); });
}

}  // namespace

TEST(SchemaManager, IsNoBaseClass) { EXPECT_FALSE(std::is_polymorphic_v<SchemaManager>); }

TEST(SchemaManager, DirectoryIsKeptAsGiven) {
  const TemporaryDirectory directory;
  directory.write("V3.user.at", "");
  const std::string given = directory.path() + "//";
  SchemaManager manager(given);
  int result = -1;
  EXPECT_EQ(messagesOf([&] { result = manager.readFile("V3.user.at"); }),
            "readFile: Parsing file: V3.user.at in directory: " + given +
                " \nreadFile: Successfully parsed the file, V3.user.at.\n");
  EXPECT_EQ(result, 0);
}

TEST(SchemaManager, DirectoryIsNotValidated) {
  SchemaManager manager("/no such directory");
  EXPECT_EQ(stateOf(&manager), "");
  EXPECT_EQ(manager.readFile("V3.user.at"), 1);
}

TEST(SchemaManager, NewOneIsEmpty) {
  Installation installation;
  EXPECT_EQ(stateOf(installation.manager()), "");
  EXPECT_TRUE(installation->isModFileEmpty());
}

// Both indexes hold the same object; it is freed once, which a double free or the leak checker
// shows.
TEST(SchemaManager, DestructionFreesEveryDefinitionOnce) {
  auto installation = std::make_unique<Installation>(std::initializer_list<SchemaText>{
      {"V3.user.at",
       attributeType("1.1", "a") + attributeType("1.2", "b") + vendorExtension("1.1")},
      {"V3.user.oc", objectClass("2.1", "a") + objectClass("2.2", "b")}});
  EXPECT_EQ(tablesOf(installation->manager()),
            "attributes: a=1.1(text) b=1.2(text)\n"
            "classes: a=2.1(text) b=2.2(text)\n"
            "extensions: 1.1(normal)\n");
  EXPECT_EQ(attributeUnder(installation->manager(), "1.2"), "b=1.2(text)");
  installation.reset();
}

// ---- Printing ----

TEST(SchemaManagerPrint, EmptyManager) {
  for (const Print& row : kPrints) {
    Installation installation;
    EXPECT_EQ(printed(&installation, row.print), row.ofEmptyManager) << row.name;
  }
}

TEST(SchemaManagerPrint, EachLeavesOnlyItsOwnRecord) {
  for (const Print& row : kPrints) {
    Installation installation;
    testing::internal::CaptureStdout();
    EXPECT_EQ(callsOf([&] { (installation.manager()->*row.print)(); }), row.name);
    testing::internal::GetCapturedStdout();
  }
}

TEST(SchemaManagerPrint, AttributeTableInOrderOfLowerCaseNames) {
  Installation installation{
      {"V3.user.at",
       "attributetypes=( 1.2 NAME ( 'Beta' 'second' ) DESC 'd' SUP name SYNTAX 1.5{8} )\n"
       "attributetypes=( 1.1 NAME 'alpha' EQUALITY eq ORDERING or SUBSTR su USAGE "
       "directoryOperation )\n"}};
  EXPECT_EQ(printed(&installation, &SchemaManager::dumpAttrTable),
            "AttributeTable contains:\nKey\nValue\n"
            "\n"
            "alpha\toid --> 1.1\n"
            "names --> alpha \n"
            "description --> \n"
            "equality --> eq\n"
            "syntax --> \n"
            "ordering --> or\n"
            "substr --> su\n"
            "superior --> \n"
            "usage --> directoryOperation\n"
            "\n"
            "\n"
            "beta\toid --> 1.2\n"
            "names --> Beta second \n"
            "description --> d\n"
            "equality --> \n"
            "syntax --> 1.5{8}\n"
            "ordering --> \n"
            "substr --> \n"
            "superior --> name \n"
            "usage --> userApplications\n"
            "\n"
            "\n");
}

TEST(SchemaManagerPrint, VendorTableInOrderOfOids) {
  Installation installation{
      {"V3.orv.at",
       "ORVAttributetypes=( 1.6 DBNAME ( 'x' 'Y' ) ACCESS-CLASS critical LENGTH 5 APPROX REVERSE )\n"
       "ORVAttributetypes=( 1.10 EQUALITY ORDERING SUBSTR )\n"}};
  EXPECT_EQ(printed(&installation, &SchemaManager::dumpORVAttrTable),
            "ORVAttributeTable contains:\nKey\nValue\n"
            "\n"
            "1.10\toid --> 1.10\n"
            "accessClass --> normal\n"
            "length --> 0\n"
            "equality --> YES\n"
            "ordering --> YES\n"
            "substr --> YES\n"
            "approx --> NO\n"
            "reverse --> NO\n"
            "names--> \n"
            "\n"
            "\n"
            "1.6\toid --> 1.6\n"
            "accessClass --> critical\n"
            "length --> 5\n"
            "equality --> NO\n"
            "ordering --> NO\n"
            "substr --> NO\n"
            "approx --> YES\n"
            "reverse --> YES\n"
            "names--> x Y \n"
            "\n"
            "\n");
}

TEST(SchemaManagerPrint, ObjectClassTableInOrderOfLowerCaseNames) {
  Installation installation{
      {"V3.user.oc",
       "objectclasses=( 2.2 NAME 'Person' DESC 'p' SUP top ABSTRACT MUST ( cn $ sn ) MAY ( l ) )\n"
       "objectclasses=( 2.1 NAME ( 'other' 'o' ) OBSOLETE AUXILIARY )\n"}};
  EXPECT_EQ(printed(&installation, &SchemaManager::dumpOcTable),
            "ObjectClassTable contains:\nKey\tValue\n"
            "\n"
            "other\t\n\noid --> 2.1\n"
            "names --> other o \n"
            "description --> \n"
            "superior --> \n"
            "structural type --> AUXILIARY\n"
            "Obsolete --> YES\n"
            "required Attrs --> \n"
            "optional Attrs --> \n"
            "\n\n"
            "\n"
            "\n"
            "person\t\n\noid --> 2.2\n"
            "names --> Person \n"
            "description --> p\n"
            "superior --> top \n"
            "structural type --> ABSTRACT\n"
            "Obsolete --> NO\n"
            "required Attrs --> cn sn \n"
            "optional Attrs --> l \n"
            "\n\n"
            "\n"
            "\n");
}

// Byte order, not the order of numbers: 1.2.10 before 1.2.6.
TEST(SchemaManagerPrint, OidSetsInByteOrderEachOfItsOwnFile) {
  const struct {
    const char* file;
    void (SchemaManager::*print)();
    const char* heading;
  } rows[] = {
      {"V3.user.oc", &SchemaManager::dumpUserOc, "OIDs from the V3.user.oc file\n"},
      {"V3.user.at", &SchemaManager::dumpUserAt, "OIDs from the V3.user.at file\n"},
      {"V3.orv.oc", &SchemaManager::dumpOrvOc, "OIDs from the V3.orv.oc file\n"},
      {"V3.orv.at", &SchemaManager::dumpOrvAt, "OIDs from the V3.orv.at file\n"},
      {"V3.system.oc", &SchemaManager::dumpSysOc, "OIDs from the V3.system.oc file\n"},
      {"V3.system.at", &SchemaManager::dumpSysAt, "OIDs from the V3.system.at file\n"},
  };
  for (const auto& filled : rows) {
    SCOPED_TRACE(filled.file);
    Installation installation{
        {filled.file, attributeType("1.2.6", "six") + objectClass("1.2.10", "ten") +
                          vendorExtension("1.10") + objectClass("B", "upper") +
                          objectClass("a", "lower")}};
    for (const auto& row : rows) {
      const bool isFilled = std::string(row.file) == filled.file;
      EXPECT_EQ(printed(&installation, row.print),
                std::string(row.heading) + (isFilled ? "1.10\n1.2.10\n1.2.6\nB\na\n\n" : "\n"));
    }
  }
}

TEST(SchemaManagerPrint, ValuesPrintThemselvesUnderTheirOwnRecords) {
  Installation installation{
      {"V3.user.at", attributeType("1.1", "a") + vendorExtension("1.1") + objectClass("2.1", "c")}};
  testing::internal::CaptureStdout();
  EXPECT_EQ(callsOf([&] {
              installation->dumpAttrTable();
              installation->dumpORVAttrTable();
              installation->dumpOcTable();
            }),
            "dumpAttrTable{Attribute.print} dumpORVAttrTable{ORVAttribute.print} "
            "dumpOcTable{ObjectClass.print}");
  testing::internal::GetCapturedStdout();
}

// ---- Looking up ----

namespace {

const SchemaText kLookUpFile = {
    "V3.user.at",
    "attributetypes=( 2.5.4.3 NAME ( 'CN' 'commonName' ) DESC 'common name' )\n"
    "attributetypes=( Word-Oid NAME 'word' DESC 'an OID that is a word' )\n"
    "objectclasses=( 2.5.6.6 NAME ( 'Person' 'Human' ) DESC 'a person' STRUCTURAL )\n"
    "objectclasses=( Class-Oid NAME 'thing' DESC 'an OID that is a word' STRUCTURAL )\n"
    "ORVAttributetypes=( 2.5.4.3 DBNAME ( 'cn' 'cn' ) ACCESS-CLASS sensitive )\n"
    "ORVAttributetypes=( Vendor-Oid DBNAME ( 'v' 'v' ) ACCESS-CLASS critical )\n"};

struct LookUp {
  const char* name;
  const char* key;
  const char* found;
};

}  // namespace

TEST(Lookups, AttributeByNameInAnyCaseOrExactOid) {
  const LookUp rows[] = {
      {"LowerCaseName", "cn", "cn=2.5.4.3(common name)"},
      {"UpperCaseName", "CN", "cn=2.5.4.3(common name)"},
      {"MixedCaseName", "Cn", "cn=2.5.4.3(common name)"},
      {"OnlyTheFirstName", "commonname", "nothing"},
      {"Oid", "2.5.4.3", "cn=2.5.4.3(common name)"},
      {"OidThatIsALongerOne", "2.5.4.30", "nothing"},
      {"OidThatIsAShorterOne", "2.5.4", "nothing"},
      {"OidInItsOwnCase", "Word-Oid", "word=Word-Oid(an OID that is a word)"},
      {"OidInAnotherCase", "word-oid", "nothing"},
      {"ObjectClass", "thing", "nothing"},
      {"Empty", "", "nothing"},
  };
  Installation installation{kLookUpFile};
  for (const LookUp& row : rows) {
    EXPECT_EQ(attributeUnder(installation.manager(), row.key), row.found) << row.name;
  }
}

// The key is not folded: a name is found in lower case only.
TEST(Lookups, ObjectClassByLowerCaseNameOrExactOid) {
  const LookUp rows[] = {
      {"LowerCaseName", "person", "person=2.5.6.6(a person)"},
      {"NameAsRead", "Person", "nothing"},
      {"UpperCaseName", "PERSON", "nothing"},
      {"OnlyTheFirstName", "human", "nothing"},
      {"Oid", "2.5.6.6", "person=2.5.6.6(a person)"},
      {"OidInItsOwnCase", "Class-Oid", "thing=Class-Oid(an OID that is a word)"},
      {"OidInAnotherCase", "class-oid", "nothing"},
      {"AttributeType", "cn", "nothing"},
      {"Empty", "", "nothing"},
  };
  Installation installation{kLookUpFile};
  for (const LookUp& row : rows) {
    EXPECT_EQ(objectClassUnder(installation.manager(), row.key), row.found) << row.name;
  }
}

TEST(Lookups, VendorExtensionByExactOidOnly) {
  const LookUp rows[] = {
      {"Oid", "2.5.4.3", "2.5.4.3(sensitive)"},
      {"OidInItsOwnCase", "Vendor-Oid", "Vendor-Oid(critical)"},
      {"OidInAnotherCase", "vendor-oid", "nothing"},
      {"DatabaseName", "cn", "nothing"},
      {"Empty", "", "nothing"},
  };
  Installation installation{kLookUpFile};
  for (const LookUp& row : rows) {
    EXPECT_EQ(extensionUnder(installation.manager(), row.key), row.found) << row.name;
  }
}

// The table of names is searched first, so an OID that is spelled like a name finds the name.
TEST(Lookups, NameGoesBeforeOid) {
  Installation installation{
      {"V3.user.at", attributeType("9.9", "1.1", "named like an OID") + attributeType("1.1", "a") +
                         attributeType("WORD", "b") + attributeType("9.8", "word", "a word")},
      {"V3.user.oc", objectClass("9.9", "2.1", "named like an OID") + objectClass("2.1", "a") +
                         objectClass("WORD", "b") + objectClass("9.8", "word", "a word")}};
  EXPECT_EQ(attributeUnder(installation.manager(), "1.1"), "1.1=9.9(named like an OID)");
  EXPECT_EQ(objectClassUnder(installation.manager(), "2.1"), "2.1=9.9(named like an OID)");
  // Folding the key decides between the two kinds.
  EXPECT_EQ(attributeUnder(installation.manager(), "WORD"), "word=9.8(a word)");
  EXPECT_EQ(objectClassUnder(installation.manager(), "WORD"), "b=WORD(text)");
}

TEST(Lookups, OnlyGetAttrFoldsItsKey) {
  Installation installation{
      {"V3.user.at",
       attributeType("1.1", "Same") + objectClass("2.1", "Same") + vendorExtension("same")}};
  EXPECT_EQ(attributeUnder(installation.manager(), "SAME"), "same=1.1(text)");
  EXPECT_EQ(objectClassUnder(installation.manager(), "SAME"), "nothing");
  EXPECT_EQ(objectClassUnder(installation.manager(), "Same"), "nothing");
  EXPECT_EQ(extensionUnder(installation.manager(), "SAME"), "nothing");
  EXPECT_EQ(objectClassUnder(installation.manager(), "same"), "same=2.1(text)");
  EXPECT_EQ(extensionUnder(installation.manager(), "same"), "same(normal)");
}

TEST(Lookups, AbsentKeyGivesNewDefinition) {
  Installation installation{kLookUpFile};
  Attribute attribute = installation->getAttr("absent");
  ObjectClass objectClass = installation->getObjClass("absent");
  ORVAttribute extension = installation->getORVAttr("absent");
  EXPECT_EQ(attribute.attrsEqual(Attribute()), 1);
  EXPECT_TRUE(objectClass.objsEqual(ObjectClass()));
  EXPECT_TRUE(extension.orvAttrsEqual(ORVAttribute()));
  EXPECT_EQ(Attribute().attrsEqual(attribute), 1);
  EXPECT_TRUE(ObjectClass().objsEqual(objectClass));
  EXPECT_TRUE(ORVAttribute().orvAttrsEqual(extension));
}

TEST(Lookups, ResultIsACopyThatOutlivesTheManager) {
  auto installation =
      std::make_unique<Installation>(std::initializer_list<SchemaText>{kLookUpFile});
  static_assert(std::is_same_v<decltype((*installation)->getAttr("")), Attribute>);
  static_assert(std::is_same_v<decltype((*installation)->getObjClass("")), ObjectClass>);
  static_assert(std::is_same_v<decltype((*installation)->getORVAttr("")), ORVAttribute>);
  Attribute attribute = (*installation)->getAttr("cn");
  ObjectClass objectClass = (*installation)->getObjClass("person");
  ORVAttribute extension = (*installation)->getORVAttr("2.5.4.3");
  installation.reset();
  EXPECT_EQ(attribute.getOidAndName(), "OID --> 2.5.4.3\nName --> CN, commonName\n\n");
  EXPECT_EQ(objectClass.getOidAndName(), "OID --> 2.5.6.6\nName --> Person, Human\n\n");
  EXPECT_EQ(extension.getOidAndName(), "OID --> 2.5.4.3\nName --> cn, cn\n\n");
}

TEST(Lookups, LeavesOneRecordEachWhetherFoundOrNot) {
  Installation installation{kLookUpFile};
  EXPECT_EQ(callsOf([&] {
              installation->getAttr("cn");
              installation->getAttr("absent");
              installation->getObjClass("person");
              installation->getObjClass("absent");
              installation->getORVAttr("2.5.4.3");
              installation->getORVAttr("absent");
            }),
            "getAttr getAttr getObjClass getObjClass getORVAttr getORVAttr");
}

TEST(SchemaManagerConvert, LowersLettersOfTheCLocaleOnly) {
  const std::pair<const char*, const char*> rows[] = {
      {"", ""}, {"ABC xyz-1_2.3", "abc xyz-1_2.3"}, {"\xC4\xD6", "\xC4\xD6"}, {"lower", "lower"}};
  SchemaManager manager("");
  for (const auto& [given, converted] : rows) {
    EXPECT_EQ(manager.convert(given), converted);
  }
}

TEST(SchemaManagerConvert, LeavesNoRecord) {
  SchemaManager manager("");
  EXPECT_EQ(callsOf([&] { manager.convert("A"); }), "");
}

// ---- Duplicates ----

TEST(SchemaManagerTables, SecondDefinitionOfANameIsFoundByItsOidOnly) {
  const UnfreedDefinitions unfreed;  // only the OID index holds the second ones
  Installation installation{
      {"V3.user.at", attributeType("1.1", "Foo", "first") + attributeType("1.2", "fOO", "second")},
      {"V3.user.oc", objectClass("2.1", "Bar", "first") + objectClass("2.2", "bAR", "second")}};
  EXPECT_EQ(stateOf(installation.manager()),
            "attributes: foo=1.1(first)\n"
            "classes: bar=2.1(first)\n"
            "V3.user.oc: 2.1 2.2\n"
            "V3.user.at: 1.1 1.2\n");
  EXPECT_EQ(attributeUnder(installation.manager(), "1.1"), "foo=1.1(first)");
  EXPECT_EQ(attributeUnder(installation.manager(), "1.2"), "foo=1.2(second)");
  EXPECT_EQ(objectClassUnder(installation.manager(), "2.1"), "bar=2.1(first)");
  EXPECT_EQ(objectClassUnder(installation.manager(), "2.2"), "bar=2.2(second)");
}

TEST(SchemaManagerTables, SecondDefinitionOfAnOidIsFoundByItsNameOnly) {
  Installation installation{
      {"V3.user.at", attributeType("1.1", "a", "first") + attributeType("1.1", "b", "second")},
      {"V3.user.oc", objectClass("2.1", "c", "first") + objectClass("2.1", "d", "second")}};
  EXPECT_EQ(stateOf(installation.manager()),
            "attributes: a=1.1(first) b=1.1(second)\n"
            "classes: c=2.1(first) d=2.1(second)\n"
            "V3.user.oc: 2.1\n"
            "V3.user.at: 1.1\n");
  EXPECT_EQ(attributeUnder(installation.manager(), "1.1"), "a=1.1(first)");
  EXPECT_EQ(objectClassUnder(installation.manager(), "2.1"), "c=2.1(first)");
}

// Neither index takes the second one; it is freed, which the leak checker shows.
TEST(SchemaManagerTables, SecondDefinitionOfNameAndOidIsDropped) {
  Installation installation{
      {"V3.user.at", attributeType("1.1", "a", "first") + attributeType("1.1", "a", "second") +
                         vendorExtension("1.1", "first") + vendorExtension("1.1", "second")},
      {"V3.user.oc", objectClass("2.1", "c", "first") + objectClass("2.1", "c", "second")}};
  EXPECT_EQ(stateOf(installation.manager()),
            "attributes: a=1.1(first)\n"
            "classes: c=2.1(first)\n"
            "extensions: 1.1(first)\n"
            "V3.user.oc: 2.1\n"
            "V3.user.at: 1.1\n");
}
