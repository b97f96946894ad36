// Merge: the definitions of a source move into a manager.

#include <gtest/gtest.h>

#include <optional>
#include <string>
#include <vector>

#include "Calls.h"
#include "Files.h"
#include "FixedClock.h"
#include "Installation.h"
#include "UnfreedDefinitions.h"

using namespace support;

namespace {

void merge(Installation* installation, Installation* source) {
  EXPECT_TRUE((*installation)->mergeSchemas(source->manager()));
}

const SchemaText kAttributes = {"V3.user.at", attributeType("1.1", "a") +
                                                  attributeType("1.2", "b") +
                                                  vendorExtension("1.1") + vendorExtension("1.2")};
const SchemaText kClasses = {"V3.user.oc", objectClass("2.1", "c") + objectClass("2.2", "d")};
constexpr char kWholeTables[] =
    "attributes: a=1.1(text) b=1.2(text)\n"
    "classes: c=2.1(text) d=2.2(text)\n"
    "extensions: 1.1(normal) 1.2(normal)\n";
constexpr char kWholeSets[] =
    "V3.user.oc: 2.1 2.2\n"
    "V3.user.at: 1.1 1.2\n";

struct FileOfSet {
  const char* name;
  const char* file;
};

const FileOfSet kFilesOfSets[] = {
    {"UserClasses", "V3.user.oc"},     {"UserAttributes", "V3.user.at"},
    {"VendorClasses", "V3.orv.oc"},    {"VendorAttributes", "V3.orv.at"},
    {"SystemClasses", "V3.system.oc"}, {"SystemAttributes", "V3.system.at"},
};

}  // namespace

// ---- Whole schemas ----

TEST(MergeSchemas, EmptySourceChangesNothing) {
  Installation installation{kAttributes, kClasses};
  Installation source;
  merge(&installation, &source);
  EXPECT_TRUE(installation->mergeAttrs(source.manager()));
  EXPECT_TRUE(installation->mergeORVAttrs(source.manager()));
  EXPECT_TRUE(installation->mergeObjClasses(source.manager()));
  EXPECT_EQ(stateOf(installation.manager()), std::string(kWholeTables) + kWholeSets);
  EXPECT_EQ(stateOf(source.manager()), "");
}

TEST(MergeSchemas, EmptyManagerTakesAllAndTheSourceKeepsItsSets) {
  Installation installation;
  Installation source{kAttributes, kClasses};
  merge(&installation, &source);
  EXPECT_EQ(stateOf(installation.manager()), std::string(kWholeTables) + kWholeSets);
  EXPECT_EQ(stateOf(source.manager()), kWholeSets);
  for (const char* oid : {"1.1", "1.2", "2.1", "2.2"}) {
    EXPECT_EQ(attributeUnder(source.manager(), oid), "nothing") << oid;
    EXPECT_EQ(objectClassUnder(source.manager(), oid), "nothing") << oid;
    EXPECT_EQ(extensionUnder(source.manager(), oid), "nothing") << oid;
  }
  EXPECT_EQ(attributeUnder(installation.manager(), "1.2"), "b=1.2(text)");
  EXPECT_EQ(objectClassUnder(installation.manager(), "2.1"), "c=2.1(text)");
}

// Only one of the two frees what was moved, whichever goes first.
TEST(MergeSchemas, EitherManagerMayGoFirst) {
  for (const bool isSourceFirst : {true, false}) {
    std::optional<Installation> installation(std::in_place, std::vector<SchemaText>{});
    std::optional<Installation> source(std::in_place,
                                       std::vector<SchemaText>{kAttributes, kClasses});
    merge(&*installation, &*source);
    (isSourceFirst ? source : installation).reset();
    Installation& left = isSourceFirst ? *installation : *source;
    EXPECT_EQ(tablesOf(left.manager()), isSourceFirst ? kWholeTables : "");
  }
}

TEST(MergeSchemas, MergingAgainAddsNothing) {
  Installation installation;
  Installation source{kAttributes, kClasses};
  merge(&installation, &source);
  merge(&installation, &source);
  EXPECT_EQ(stateOf(installation.manager()), std::string(kWholeTables) + kWholeSets);
}

TEST(MergeSchemas, EachPassMovesItsOwnTable) {
  Installation installation;
  Installation source{kAttributes, kClasses};
  EXPECT_TRUE(installation->mergeORVAttrs(source.manager()));
  EXPECT_EQ(stateOf(installation.manager()),
            "extensions: 1.1(normal) 1.2(normal)\nV3.user.at: 1.1 1.2\n");
  EXPECT_TRUE(installation->mergeObjClasses(source.manager()));
  EXPECT_EQ(tablesOf(source.manager()), "attributes: a=1.1(text) b=1.2(text)\n");
  EXPECT_TRUE(installation->mergeAttrs(source.manager()));
  EXPECT_EQ(stateOf(installation.manager()), std::string(kWholeTables) + kWholeSets);
}

// ---- Additions ----

TEST(MergeSchemas, AdditionJoinsTheSetOfTheSameFile) {
  for (const FileOfSet& row : kFilesOfSets) {
    SCOPED_TRACE(row.name);
    Installation installation;
    Installation source{
        {row.file, attributeType("1.1", "a") + objectClass("1.2", "c") + vendorExtension("1.3")}};
    merge(&installation, &source);
    EXPECT_EQ(stateOf(installation.manager()),
              "attributes: a=1.1(text)\nclasses: c=1.2(text)\nextensions: 1.3(normal)\n" +
                  std::string(row.file) + ": 1.1 1.2 1.3\n");
    EXPECT_EQ(setsOf(source.manager()), std::string(row.file) + ": 1.1 1.2 1.3\n");
  }
}

// User files before vendor files before system files, classes before attributes.
TEST(MergeSchemas, AdditionJoinsOneSetOnly) {
  const std::string text = attributeType("1.1", "a");
  for (std::size_t first = 0; first < std::size(kFilesOfSets); ++first) {
    std::vector<SchemaText> files;
    for (std::size_t i = first; i < std::size(kFilesOfSets); ++i) {
      files.push_back({kFilesOfSets[i].file, text});
    }
    Installation installation;
    Installation source(files);
    merge(&installation, &source);
    EXPECT_EQ(setsOf(installation.manager()), std::string(kFilesOfSets[first].file) + ": 1.1\n");
  }
}

TEST(MergeSchemas, AdditionIsWrittenToTheFileItCameFrom) {
  Installation installation{{"V3.user.at", attributeType("1.2.6", "six")}};
  Installation source{{"V3.user.at", attributeType("1.2.10", "ten", "theirs")}};
  merge(&installation, &source);
  EXPECT_EQ(writtenFile(installation.manager(), "V3.user.at"),
            std::string(kHeaderLine) +
                "attributetypes=( 1.2.10 NAME ( 'ten'  )  DESC 'theirs' USAGE userApplications  )\n"
                "attributetypes=( 1.2.6 NAME ( 'six'  )  DESC 'text' USAGE userApplications  )\n");
}

// An attribute type or object class is matched by name alone: the OID is no match, and the index by
// OID keeps the definition that it has.
TEST(MergeSchemas, AdditionUnderAKnownOidLeavesTheIndexByOid) {
  Installation installation{{"V3.user.at", attributeType("1.1", "a", "mine")},
                            {"V3.user.oc", objectClass("2.1", "c", "mine")}};
  Installation source{{"V3.system.at", attributeType("1.1", "b", "theirs")},
                      {"V3.system.oc", objectClass("2.1", "d", "theirs")}};
  merge(&installation, &source);
  EXPECT_EQ(stateOf(installation.manager()),
            "attributes: a=1.1(mine) b=1.1(theirs)\n"
            "classes: c=2.1(mine) d=2.1(theirs)\n"
            "V3.user.oc: 2.1\nV3.user.at: 1.1\n"
            "V3.system.oc: 2.1\nV3.system.at: 1.1\n");
  EXPECT_EQ(attributeUnder(installation.manager(), "1.1"), "a=1.1(mine)");
  EXPECT_EQ(objectClassUnder(installation.manager(), "2.1"), "c=2.1(mine)");
  EXPECT_EQ(attributeUnder(source.manager(), "1.1"), "nothing");
}

// Of two additions with one OID, the index takes the one whose name comes first.
TEST(MergeSchemas, FirstOfTwoAdditionsIsFoundByTheirOid) {
  const UnfreedDefinitions unfreed;
  Installation installation{{"V3.system.at", attributeType("1.0", "z")}};
  Installation source{{"V3.user.at", attributeType("1.1", "b") + attributeType("1.1", "a")},
                      {"V3.user.oc", objectClass("2.1", "b") + objectClass("2.1", "a")}};
  merge(&installation, &source);
  EXPECT_EQ(stateOf(installation.manager()),
            "attributes: a=1.1(text) b=1.1(text) z=1.0(text)\n"
            "classes: a=2.1(text) b=2.1(text)\n"
            "V3.user.oc: 2.1\nV3.user.at: 1.1\nV3.system.at: 1.0\n");
  EXPECT_EQ(attributeUnder(installation.manager(), "1.1"), "a=1.1(text)");
  EXPECT_EQ(objectClassUnder(installation.manager(), "2.1"), "a=2.1(text)");
}

// A replacement finds by its OID what the same merge has added, and takes it away.
TEST(MergeSchemas, AdditionIsFoundByTheReplacementBehindIt) {
  const UnfreedDefinitions unfreed;
  Installation installation{{"V3.system.at", attributeType("1.2", "b", "mine")},
                            {"V3.system.oc", objectClass("2.2", "b", "mine")}};
  Installation source{{"V3.user.at", attributeType("1.1", "a") + attributeType("1.1", "b")},
                      {"V3.user.oc", objectClass("2.1", "a") + objectClass("2.1", "b")}};
  merge(&installation, &source);
  EXPECT_EQ(stateOf(installation.manager()),
            "attributes: b=1.2(mine)\nclasses: b=2.2(mine)\n"
            "V3.user.oc: 2.1\nV3.user.at: 1.1\nV3.system.oc: 2.2\nV3.system.at: 1.2\n");
  EXPECT_EQ(attributeUnder(installation.manager(), "1.1"), "b=1.1(text)");
  EXPECT_EQ(objectClassUnder(installation.manager(), "2.1"), "b=2.1(text)");
}

TEST(MergeSchemas, ExclusionsAndModifiedSchemaHaveNoPartInIt) {
  Installation installation{{"V3.modifiedschema", attributeType("1.1", "a")}};
  Installation source{{"V3.user.at", attributeType("1.2", "b")},
                      {"V3.modifiedschema", attributeType("1.2", "b")}};
  installation.exclude({"1.2"});
  source.exclude({"1.2"});
  merge(&installation, &source);
  EXPECT_EQ(stateOf(installation.manager()),
            "attributes: a=1.1(text) b=1.2(text)\nV3.user.at: 1.2\n");
  EXPECT_EQ(takeFromModifiedSchema(installation.manager(), {"1.1", "1.2"}), "1.1");
  EXPECT_EQ(takeFromModifiedSchema(source.manager(), {"1.1", "1.2"}), "1.2");
}

// ---- Replacements ----

TEST(MergeSchemas, ReplacementKeepsTheFileItHasHere) {
  const UnfreedDefinitions unfreed;
  Installation installation{
      {"V3.system.at", attributeType("1.1", "Aa", "mine") + vendorExtension("1.1", "mine")},
      {"V3.config.oc", objectClass("2.1", "Cc", "mine")}};
  Installation source{
      {"V3.user.at", attributeType("1.1", "aA", "theirs") + vendorExtension("1.1", "theirs")},
      {"V3.user.oc", objectClass("2.1", "cC", "theirs")}};
  merge(&installation, &source);
  EXPECT_EQ(stateOf(installation.manager()),
            "attributes: aa=1.1(theirs)\nclasses: cc=2.1(theirs)\nextensions: 1.1(theirs)\n"
            "V3.system.at: 1.1\n");
  EXPECT_EQ(attributeUnder(installation.manager(), "1.1"), "aa=1.1(theirs)");
  EXPECT_EQ(objectClassUnder(installation.manager(), "2.1"), "cc=2.1(theirs)");
  EXPECT_EQ(installation->getAttr("aa").getFirstName(), "aA");
  EXPECT_EQ(stateOf(source.manager()), "V3.user.oc: 2.1\nV3.user.at: 1.1\n");
  EXPECT_EQ(attributeUnder(source.manager(), "1.1"), "nothing");
}

// A replacement asks for no set, so a definition of a config file or of V3.modifiedschema may be
// one.
TEST(MergeSchemas, ReplacementNeedsNoSetOfTheSource) {
  const UnfreedDefinitions unfreed;
  Installation installation{{"V3.user.at", attributeType("1.1", "a", "mine") +
                                               objectClass("2.1", "c", "mine") +
                                               vendorExtension("3.1", "mine")}};
  Installation source{{"V3.modifiedschema", attributeType("1.1", "a", "theirs")},
                      {"V3.config.at", vendorExtension("3.1", "theirs")},
                      {"V3.config.oc", objectClass("2.1", "c", "theirs")}};
  EXPECT_EQ(messagesOf([&] { merge(&installation, &source); }), "");
  EXPECT_EQ(stateOf(installation.manager()),
            "attributes: a=1.1(theirs)\nclasses: c=2.1(theirs)\nextensions: 3.1(theirs)\n"
            "V3.user.at: 1.1 2.1 3.1\n");
}

TEST(MergeSchemas, VendorExtensionIsMatchedByOidAlone) {
  const UnfreedDefinitions unfreed;
  Installation installation{{"V3.orv.at", vendorExtension("1.1", "mine")}};
  Installation source{{"V3.orv.at", vendorExtension("1.1", "theirs") + vendorExtension("1.2")}};
  merge(&installation, &source);
  EXPECT_EQ(stateOf(installation.manager()),
            "extensions: 1.1(theirs) 1.2(normal)\nV3.orv.at: 1.1 1.2\n");
  EXPECT_EQ(tablesOf(source.manager()), "");
}

// The name is found, but it is the definition of the source's OID that is erased: bar goes, and foo
// stays under its name.
TEST(MergeAttrs, NameUnderAnotherOidRemovesTheOtherDefinition) {
  const UnfreedDefinitions unfreed;
  Installation installation{
      {"V3.user.at", attributeType("1.1", "foo", "mine") + attributeType("1.2", "bar", "mine")},
      {"V3.user.oc", objectClass("2.1", "foo", "mine") + objectClass("2.2", "bar", "mine")}};
  Installation source{{"V3.system.at", attributeType("1.2", "foo", "theirs")},
                      {"V3.system.oc", objectClass("2.2", "foo", "theirs")}};
  merge(&installation, &source);
  EXPECT_EQ(stateOf(installation.manager()),
            "attributes: foo=1.1(mine)\nclasses: foo=2.1(mine)\n"
            "V3.user.oc: 2.1 2.2\nV3.user.at: 1.1 1.2\n");
  EXPECT_EQ(attributeUnder(installation.manager(), "1.1"), "foo=1.1(mine)");
  EXPECT_EQ(attributeUnder(installation.manager(), "1.2"), "foo=1.2(theirs)");
  EXPECT_EQ(attributeUnder(installation.manager(), "bar"), "nothing");
  EXPECT_EQ(objectClassUnder(installation.manager(), "2.1"), "foo=2.1(mine)");
  EXPECT_EQ(objectClassUnder(installation.manager(), "2.2"), "foo=2.2(theirs)");
  EXPECT_EQ(objectClassUnder(installation.manager(), "bar"), "nothing");
  EXPECT_EQ(stateOf(source.manager()), "V3.system.oc: 2.2\nV3.system.at: 1.2\n");
  EXPECT_EQ(attributeUnder(source.manager(), "1.2"), "nothing");
}

// Nothing has the source's OID here: nothing is erased, not even what has neither name nor OID.
TEST(MergeSchemas, UnknownOidOfTheSourceErasesNothing) {
  const UnfreedDefinitions unfreed;
  Installation installation{{"V3.user.at", attributeType("1.1", "foo", "mine") +
                                               "attributetypes=( DESC 'neither name nor OID' )\n"},
                            {"V3.user.oc", objectClass("2.1", "foo", "mine") +
                                               "objectclasses=( DESC 'neither name nor OID' )\n"}};
  const std::string before = stateOf(installation.manager());
  EXPECT_EQ(before,
            "attributes: ''=''(neither name nor OID) foo=1.1(mine)\n"
            "classes: ''=''(neither name nor OID) foo=2.1(mine)\n"
            "V3.user.oc: '' 2.1\nV3.user.at: '' 1.1\n");
  Installation source{{"V3.system.at", attributeType("1.2", "foo", "theirs")},
                      {"V3.system.oc", objectClass("2.2", "foo", "theirs")}};
  merge(&installation, &source);
  EXPECT_EQ(stateOf(installation.manager()), before);
  EXPECT_EQ(attributeUnder(installation.manager(), ""), "''=''(neither name nor OID)");
  EXPECT_EQ(attributeUnder(installation.manager(), "1.1"), "foo=1.1(mine)");
  EXPECT_EQ(attributeUnder(installation.manager(), "1.2"), "foo=1.2(theirs)");
  EXPECT_EQ(objectClassUnder(installation.manager(), ""), "''=''(neither name nor OID)");
  EXPECT_EQ(objectClassUnder(installation.manager(), "2.1"), "foo=2.1(mine)");
  EXPECT_EQ(objectClassUnder(installation.manager(), "2.2"), "foo=2.2(theirs)");
  // The indexes by OID still have the entries under the empty key.
  EXPECT_EQ(writtenFor(installation.manager(), {""}),
            std::string(kHeaderLine) +
                "objectclasses=(  NAME  DESC 'neither name nor OID' STRUCTURAL )\n");
  EXPECT_EQ(tablesOf(source.manager()), "");
}

// What is found is erased under the name that it has, the empty one included.
TEST(MergeSchemas, FoundDefinitionWithoutANameIsErased) {
  const UnfreedDefinitions unfreed;
  Installation installation{
      {"V3.user.at", attributeType("1.1", "foo", "mine") + "attributetypes=( 1.2 DESC 'x' )\n"},
      {"V3.user.oc", objectClass("2.1", "foo", "mine") + "objectclasses=( 2.2 DESC 'x' )\n"}};
  Installation source{{"V3.system.at", attributeType("1.2", "foo", "theirs")},
                      {"V3.system.oc", objectClass("2.2", "foo", "theirs")}};
  merge(&installation, &source);
  EXPECT_EQ(tablesOf(installation.manager()),
            "attributes: foo=1.1(mine)\nclasses: foo=2.1(mine)\n");
  EXPECT_EQ(attributeUnder(installation.manager(), "1.2"), "foo=1.2(theirs)");
  EXPECT_EQ(objectClassUnder(installation.manager(), "2.2"), "foo=2.2(theirs)");
}

// The source's OID is looked up as the public operations do: among the names first.
TEST(MergeSchemas, DefinitionNamedLikeTheOidIsErasedInstead) {
  const UnfreedDefinitions unfreed;
  Installation installation{
      {"V3.user.at", attributeType("1.2", "foo", "mine") + attributeType("9.1", "1.2", "mine")},
      {"V3.user.oc", objectClass("2.2", "foo", "mine") + objectClass("9.2", "2.2", "mine")}};
  Installation source{{"V3.system.at", attributeType("1.2", "foo", "theirs")},
                      {"V3.system.oc", objectClass("2.2", "foo", "theirs")}};
  merge(&installation, &source);
  EXPECT_EQ(tablesOf(installation.manager()),
            "attributes: foo=1.2(mine)\nclasses: foo=2.2(mine)\n");
  EXPECT_EQ(attributeUnder(installation.manager(), "1.2"), "foo=1.2(mine)");
  EXPECT_EQ(attributeUnder(installation.manager(), "9.1"), "nothing");
  EXPECT_EQ(objectClassUnder(installation.manager(), "2.2"), "foo=2.2(mine)");
  EXPECT_EQ(objectClassUnder(installation.manager(), "9.2"), "nothing");
}

// getAttr folds the letter case of the OID that it looks for among the names; getObjClass does not.
TEST(MergeSchemas, OidThatIsAWordIsFoldedForAttributeTypesOnly) {
  const UnfreedDefinitions unfreed;
  Installation installation{
      {"V3.user.at", attributeType("WORD", "foo", "mine") + attributeType("9.1", "word", "mine")},
      {"V3.user.oc", objectClass("WORD", "foo", "mine") + objectClass("9.2", "word", "mine")}};
  Installation source{{"V3.system.at", attributeType("WORD", "foo", "theirs")},
                      {"V3.system.oc", objectClass("WORD", "foo", "theirs")}};
  merge(&installation, &source);
  EXPECT_EQ(tablesOf(installation.manager()),
            "attributes: foo=WORD(mine)\n"
            "classes: foo=WORD(theirs) word=9.2(mine)\n");
}

// A collision check takes OIDs out of the reference's index. A merge into that reference then finds
// nothing to erase, and the definition that stands there under the name stays.
TEST(MergeAttrs, CheckedReferenceKeepsItsDefinitions) {
  const UnfreedDefinitions unfreed;
  Installation target{{"V3.system.at", attributeType("1.1", "a", "mine")}};
  Installation source{{"V3.user.at", attributeType("1.1", "a", "theirs")}};
  EXPECT_TRUE(source->checkCollisions(target.manager()));
  merge(&target, &source);
  EXPECT_EQ(stateOf(target.manager()), "attributes: a=1.1(mine)\nV3.system.at: 1.1\n");
  EXPECT_EQ(attributeUnder(target.manager(), "1.1"), "a=1.1(theirs)");
  EXPECT_EQ(tablesOf(source.manager()), "");
}

// A source without an OID asks for the empty key, and what has no name is found there.
TEST(MergeAttrs, EmptyOidOfTheSourceErasesWhatHasNoName) {
  const UnfreedDefinitions unfreed;
  Installation target{{"V3.system.at", attributeType("1.1", "foo", "mine") +
                                           "attributetypes=( 1.2 DESC 'no name' )\n"}};
  Installation source{{"V3.user.at", "attributetypes=( NAME 'foo' DESC 'theirs' )\n"}};
  merge(&target, &source);
  EXPECT_EQ(tablesOf(target.manager()), "attributes: foo=1.1(mine)\n");
  EXPECT_EQ(attributeUnder(target.manager(), "1.2"), "nothing");
  EXPECT_EQ(attributeUnder(target.manager(), ""), "foo=''(theirs)");
}

// A definition whose OID is spelled like its name replaces the one that has the name.
TEST(MergeAttrs, OidSpelledLikeTheNameReplacesUnderAnotherOid) {
  const UnfreedDefinitions unfreed;
  Installation target{{"V3.system.at", attributeType("1.1", "foo", "mine")},
                      {"V3.system.oc", objectClass("2.1", "foo", "mine")}};
  Installation source{{"V3.user.at", attributeType("foo", "foo", "theirs")},
                      {"V3.user.oc", objectClass("foo", "foo", "theirs")}};
  merge(&target, &source);
  EXPECT_EQ(stateOf(target.manager()),
            "attributes: foo=foo(theirs)\nclasses: foo=foo(theirs)\n"
            "V3.system.oc: 2.1\nV3.system.at: 1.1\n");
  EXPECT_EQ(attributeUnder(target.manager(), "1.1"), "nothing");
  EXPECT_EQ(objectClassUnder(target.manager(), "2.1"), "nothing");
}

// A definition that only the source's index by OID holds is not moved.
TEST(MergeSchemas, OnlyTheTablesOfTheSourceAreWalked) {
  const UnfreedDefinitions unfreed;
  Installation installation;
  Installation source{
      {"V3.user.at", attributeType("1.1", "a", "first") + attributeType("1.2", "a", "second")}};
  merge(&installation, &source);
  EXPECT_EQ(stateOf(installation.manager()), "attributes: a=1.1(first)\nV3.user.at: 1.1\n");
  EXPECT_EQ(attributeUnder(installation.manager(), "1.2"), "nothing");
  EXPECT_EQ(attributeUnder(source.manager(), "1.1"), "nothing");
  EXPECT_EQ(attributeUnder(source.manager(), "1.2"), "a=1.2(second)");
}

// A definition that a comparison or a withdrawal took from the source's tables stays there.
TEST(MergeSchemas, PrunedSourceMovesWhatIsLeft) {
  const UnfreedDefinitions unfreed;
  Installation source{{"V3.user.at", attributeType("1.1", "a") + attributeType("1.2", "b", "mine") +
                                         attributeType("1.3", "added")}};
  Installation target{{"V3.system.at", attributeType("1.1", "a") + attributeType("1.2", "b")}};
  EXPECT_TRUE(source->compSchemas(target.manager()));
  merge(&target, &source);
  EXPECT_EQ(stateOf(target.manager()),
            "attributes: a=1.1(text) added=1.3(text) b=1.2(mine)\n"
            "V3.user.at: 1.3\nV3.system.at: 1.1 1.2\n");
  EXPECT_EQ(attributeUnder(source.manager(), "1.1"), "a=1.1(text)");
}

// ---- Trace ----

// Attribute types, vendor extensions, object classes: only the first pass records its success.
TEST(MergeTrace, OnlyMergeAttrsRecordsSuccess) {
  Installation installation;
  Installation source;
  EXPECT_EQ(callsOf([&] { merge(&installation, &source); }),
            "mergeSchemas{mergeAttrs=1 mergeORVAttrs mergeObjClasses}");
}

TEST(MergeTrace, CallsForReplacementsAndAdditions) {
  const UnfreedDefinitions unfreed;
  Installation installation{{"V3.user.at", attributeType("1.1", "a") + vendorExtension("1.1")},
                            {"V3.user.oc", objectClass("2.1", "c")}};
  Installation source{kAttributes, kClasses};
  EXPECT_EQ(callsOf([&] { merge(&installation, &source); }),
            "mergeSchemas{mergeAttrs{getAttr findOidInSet}=1 mergeORVAttrs{findOidInSet} "
            "mergeObjClasses{getObjClass findOidInSet}}");
}
