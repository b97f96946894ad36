// The definitions of a KeptFile are those that the schema manager reads from the same bytes:
// tables, file sets, result and failure.

#include "Kept.h"

#include <gtest/gtest.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <csignal>
#include <filesystem>
#include <fstream>
#include <memory>
#include <set>
#include <string>
#include <vector>

#include "Files.h"
#include "GeneratedDirectory.h"
#include "ManagerTables.h"
#include "RandomInput.h"
#include "SchemaManager.h"

namespace {

using migration::KeptDefinition;
using migration::KeptFile;
using migration::Kind;
using migration::ReadingEnd;
using migration::Source;
using properties::State;
using support::TemporaryDirectory;

constexpr char kFile[] = "V3.user.at";

std::string lineOf(const Attribute& definition) {
  std::string line;
  definition.appendLine(&line);
  return line;
}

std::string lineOf(const ObjectClass& definition) {
  std::string line;
  definition.appendLine(&line);
  return line;
}

std::string lineOf(const ORVAttribute& definition) {
  std::string line;
  definition.appendLine(&line);
  return line;
}

template <typename Definition>
void append(const char* heading, const properties::Table<Definition>& table, std::string* text) {
  *text += heading;
  for (const auto& [key, definition] : table) {
    *text += "  " + key + ": " + lineOf(*definition);
  }
}

// All that a manager has after reading one file.
std::string textOf(const State& state, int result) {
  std::string text = "result " + std::to_string(result) + "\n";
  append("attrTable\n", state.attrTable, &text);
  append("attrOidTable\n", state.attrOidTable, &text);
  append("ocTable\n", state.ocTable, &text);
  append("ocOidTable\n", state.ocOidTable, &text);
  append("orvAttrTable\n", state.orvAttrTable, &text);
  text += kFile;
  for (const std::string& oid : state.fileSets[1]) {
    text += " " + oid;
  }
  return text + "\n";
}

std::string managersReading(const std::string& text) {
  const TemporaryDirectory directory;
  directory.write(kFile, text);
  std::vector<std::unique_ptr<SchemaManager>> managers;
  managers.push_back(std::make_unique<SchemaManager>(directory.path()));
  const int result = managers.front()->readFile(kFile);
  std::string reading = textOf(properties::stateOf(*managers.front()), result);
  const std::set<ORVSchema*> read = properties::definitionsOf(*managers.front());
  properties::destroyWithAllDefinitions(read, &managers);
  return reading;
}

// Enters the definitions as the manager does: the first one under a key stays.
std::string keptReading(const KeptFile& file) {
  State state;
  for (const KeptDefinition& kept : file.definitions()) {
    if (!kept.isEntered) {
      continue;
    }
    const std::string oid = kept.object->getOid();
    state.fileSets[1].insert(oid);
    switch (kept.kind) {
      case Kind::kAttributeType: {
        auto* const object = static_cast<Attribute*>(kept.object.get());
        state.attrTable.emplace(object->getFirstNameLower(), object);
        state.attrOidTable.emplace(oid, object);
        break;
      }
      case Kind::kObjectClass: {
        auto* const object = static_cast<ObjectClass*>(kept.object.get());
        state.ocTable.emplace(object->getFirstNameLower(), object);
        state.ocOidTable.emplace(oid, object);
        break;
      }
      case Kind::kVendorExtension:
        state.orvAttrTable.emplace(oid, static_cast<ORVAttribute*>(kept.object.get()));
    }
  }
  return textOf(state, file.ending() == ReadingEnd::kWhole ? 0 : 1);
}

// True when the manager is still reading after a second.
bool managerNeverEnds(const std::string& text) {
  const TemporaryDirectory directory;
  directory.write(kFile, text);
  const pid_t child = ::fork();
  if (child == 0) {
    ::alarm(1);
    SchemaManager(directory.path()).readFile(kFile);
    ::_exit(0);
  }
  int status = 0;
  ::waitpid(child, &status, 0);
  return WIFSIGNALED(status) && WTERMSIG(status) == SIGALRM;
}

int endlessTried = 0;

void expectSameReading(const std::string& text) {
  SCOPED_TRACE(text);
  const Source source(kFile, text);
  const KeptFile file(source);
  if (file.ending() != ReadingEnd::kNeverEnds) {
    EXPECT_EQ(managersReading(text), keptReading(file));
  } else if (endlessTried < 12) {
    ++endlessTried;
    EXPECT_TRUE(managerNeverEnds(text));
  }
}

std::vector<std::string> textsBelow(const std::string& folder) {
  std::set<std::filesystem::path> paths;
  for (const auto& entry :
       std::filesystem::recursive_directory_iterator(PROJECT_SOURCE "/" + folder)) {
    if (entry.is_regular_file()) {
      paths.insert(entry.path());
    }
  }
  std::vector<std::string> texts;
  for (const auto& path : paths) {
    texts.push_back(support::readWholeFile(path));
  }
  return texts;
}

TEST(KeptEqualsTheManager, OnGoldenAndExampleFiles) {
  for (const char* const folder : {"tests/golden", "examples"}) {
    for (const std::string& text : textsBelow(folder)) {
      expectSameReading(text);
    }
  }
}

TEST(KeptEqualsTheManager, OnTheSeedsOfTheFuzzingTargets) {
  for (const std::string& text : textsBelow("fuzz/corpus/reader")) {
    expectSameReading(text);
  }
}

TEST(KeptEqualsTheManager, OnEveryBeginningOfAFileWithAllForms) {
  const std::string text = support::readWholeFile(
      PROJECT_SOURCE "/tests/golden/read-write/forms-and-oddities/input/V3.user.at");
  for (std::size_t size = 0; size <= text.size(); ++size) {
    expectSameReading(text.substr(0, size));
  }
}

TEST(KeptEqualsTheManager, OnGeneratedDefinitions) {
  for (unsigned seed = 0; seed < 300; ++seed) {
    properties::SeededChoices choices(seed);
    for (const auto& [name, text] : filesOf(properties::anyDirectory(&choices))) {
      expectSameReading(text);
    }
  }
}

TEST(KeptEqualsTheManager, OnDamagedDefinitions) {
  for (std::uint32_t seed = 0; seed < 1500; ++seed) {
    RandomInput random(seed);
    expectSameReading(seed % 3 == 0 ? random.pieces() : random.damagedDefinitions());
  }
}

// ---- Endings ----

struct EndingCase {
  const char* name;
  const char* text;
  ReadingEnd ending;
};

const EndingCase kEndingCases[] = {
    {"EmptyFile", "", ReadingEnd::kWhole},
    {"JunkOnly", "a ( b ) '", ReadingEnd::kWhole},
    {"StringCutOffByALineEnd",
     "attributetypes=( 1.1 DESC 'a\nb' OBSOLETE )\nattributetypes=( 1.2 )\n", ReadingEnd::kFails},
    {"StringCutOffByAByteOf128",
     "attributetypes {\n( 1.1 NAME 'gr\xC3\xB6n' OBSOLETE )\n( 1.2 NAME 'b' OBSOLETE )\n}\n",
     ReadingEnd::kWhole},
    {"StringCutOffBetweenDefinitions",
     "it's one attributetypes=( 1.1 )\nit's another\nattributetypes=( 1.2 )\n'\n",
     ReadingEnd::kWhole},
    {"EachKind",
     "attributetypes=( 1.1 NAME 'a' DESC 'd' )\nobjectclasses=( 1.2 NAME 'b' STRUCTURAL )\nORVAttributetypes=( 1.1 DBNAME ( 'a' ) )\n",
     ReadingEnd::kWhole},
    {"BlocksOfEachKind",
     "attributetypes {\n( 1.1 NAME 'a' DESC 'd' )\n\n( 1.2 NAME 'b' OBSOLETE ) }\nobjectclasses { ( 1.3 MAY ( a ) )\n( 1.4 MUST ( a ) ) }\nORVAttributetypes {\n( 1.1 LENGTH 1 ) }\n",
     ReadingEnd::kWhole},
    {"CollectiveInAttributeType", "attributetypes=( 1.1 NAME 'a' COLLECTIVE )\n",
     ReadingEnd::kNeverEnds},
    {"CollectiveInABlock", "attributetypes {\n( 1.1 NAME 'a' DESC 'd'\n  COLLECTIVE ) }\n",
     ReadingEnd::kNeverEnds},
    {"CollectiveAsAValue", "attributetypes=( 1.1 NAME 'a' SUP COLLECTIVE )\n", ReadingEnd::kWhole},
    {"CollectiveInQuotesInClausePosition", "attributetypes=( 1.1 'COLLECTIVE' )\n",
     ReadingEnd::kNeverEnds},
    {"CollectiveBehindTheDefinition", "attributetypes=( 1.1 ) COLLECTIVE\n", ReadingEnd::kWhole},
    {"CollectiveInOtherKinds",
     "objectclasses=( 1.1 COLLECTIVE NAME 'a' MAY ( b ) )\nORVAttributetypes=( 1.1 COLLECTIVE )\n",
     ReadingEnd::kWhole},
    {"CollectiveBehindAFailure", "attributetypes=( 1.1\nattributetypes=( 1.2 COLLECTIVE )\n",
     ReadingEnd::kFails},
    {"NamesOfAttributeTypeToTheEnd", "attributetypes=( 1.1 NAME 'a' )\n", ReadingEnd::kNeverEnds},
    {"FirstTokenOfAttributeNamesIsNotLookedAt", "attributetypes=( 1.1 NAME DESC )\n",
     ReadingEnd::kNeverEnds},
    {"NamesThatSwallowADefinition",
     "attributetypes=( 1.1 NAME 'a' )\nattributetypes=( 1.2 NAME 'b' DESC 'd' )\n",
     ReadingEnd::kWhole},
    {"NamesOfObjectClassToTheEnd", "objectclasses=( 1.1\n NAME 'a' )\n", ReadingEnd::kNeverEnds},
    {"FirstTokenOfClassNamesIsLookedAt", "objectclasses=( 1.1 NAME STRUCTURAL )\n",
     ReadingEnd::kWhole},
    {"SyntaxDoesNotEndTheNamesOfAClass", "objectclasses=( 1.1 NAME 'a' SYNTAX 1.2 )\n",
     ReadingEnd::kNeverEnds},
    {"DatabaseNamesToTheEnd", "ORVAttributetypes=( 1.1 DBNAME ( 'a' 'b'\n", ReadingEnd::kNeverEnds},
    {"DatabaseNamesThenAnotherLine",
     "ORVAttributetypes {\n( 1.1 DBNAME ( 'a' )\n( 1.2 DBNAME ( 'b' ) ) }\n", ReadingEnd::kWhole},
    {"DatabaseNamesThenALineThatDoesNotCount",
     "ORVAttributetypes {\n( 1.1 DBNAME ( a ) 'x\n( 1.2 DBNAME ( 'b' ) ) }\n", ReadingEnd::kWhole},
    {"AttributeTypeNotClosed", "attributetypes=( 1.1 DESC 'd'\n", ReadingEnd::kFails},
    {"ObjectClassNotClosed", "objectclasses=( 1.1 DESC 'd'\n\nobjectclasses=( 1.2 )\n",
     ReadingEnd::kFails},
    {"VendorExtensionNotClosed", "ORVAttributetypes=( 1.1 LENGTH 3\nattributetypes=( 1.2 )\n",
     ReadingEnd::kFails},
    {"VendorExtensionThatSwallowsAnother",
     "ORVAttributetypes=( 1.1 LENGTH 3\nORVAttributetypes=( 1.2 LENGTH 4 )\n", ReadingEnd::kWhole},
    {"BlockNotClosed", "attributetypes {\n( 1.1 DESC 'd' )\n", ReadingEnd::kFails},
    {"LengthOfNumberNotComplete", "objectclasses=( 1.1{x ABSTRACT )\n", ReadingEnd::kFails},
    {"NeitherFormOfDefinition", "attributetypes ( 1.1 )\n", ReadingEnd::kFails},
    {"KeywordAtTheEnd", "\nobjectClasses ", ReadingEnd::kFails},
    {"ClosingParenthesisIsTheLastByte", "attributetypes=( 1.1 )", ReadingEnd::kWhole},
    {"ClosingParenthesisInPlaceOfAValue", "attributetypes=( 1.1 DESC ) )\n", ReadingEnd::kWhole},
    {"UnknownWordReplacesOid", "attributetypes=( 1.1 NAME 'a' DESC 'd' X-ORIGIN 'site' )\n",
     ReadingEnd::kWhole},
    {"NumberInAList", "objectclasses=( 1.1 MUST ( 2.5.4.3 $ cn ) )\n", ReadingEnd::kWhole},
};

TEST(KeptEnding, IsThatOfTheManager) {
  for (const EndingCase& row : kEndingCases) {
    SCOPED_TRACE(row.name);
    const Source source(kFile, row.text);
    EXPECT_EQ(row.ending, KeptFile(source).ending());
    if (row.ending == ReadingEnd::kNeverEnds) {
      EXPECT_TRUE(managerNeverEnds(row.text));
    } else {
      EXPECT_EQ(managersReading(row.text), keptReading(KeptFile(source)));
    }
  }
}

// ---- Places ----

std::string placesIn(const std::string& text) {
  const Source source(kFile, text);
  const KeptFile file(source);
  std::string places;
  for (const KeptDefinition& kept : file.definitions()) {
    places += describe(kept) + (kept.isInBlock ? " {" : " =") + (kept.isEntered ? "" : " out") +
              " [" + text.substr(kept.offset, kept.end - kept.offset) + "]\n";
  }
  static const char* const kEndings[] = {"whole", "fails", "never ends"};
  places += kEndings[static_cast<int>(file.ending())];
  places += " at " + std::to_string(file.endOffset());
  if (file.unfinished() != nullptr) {
    places += " in " + describe(*file.unfinished()) + " from " +
              std::to_string(file.unfinished()->offset);
  }
  return places;
}

struct PlaceCase {
  const char* name;
  std::string text;
  std::string places;
};

const PlaceCase kPlaces[] = {
    {"Single", "# c\nattributetypes = ( 1.1 NAME 'a' DESC 'd' )  \n",
     "attribute type a (1.1) = [( 1.1 NAME 'a' DESC 'd' )]\nwhole at 49"},
    {"Block", "objectclasses { # (\n( 1.1 NAME 'a' MAY ( b ) )\n(1.2 NAME 'c' MAY(d)) }",
     "object class a (1.1) { [( 1.1 NAME 'a' MAY ( b ) )]\n"
     "object class c (1.2) { [(1.2 NAME 'c' MAY(d))]\nwhole at 70"},
    {"CarriageReturns", "attributetypes {\r\n( 1.1 DESC 'd' )\r\n( 1.2 DESC 'd' )\r\n}\r\n",
     "attribute type 1.1 { [( 1.1 DESC 'd' )]\nattribute type 1.2 { [( 1.2 DESC 'd' )]\n"
     "attribute type { out []\nwhole at 57"},
    {"WithoutAnOid", "attributetypes { ( DESC 'd' ) }\nattributetypes = ( DESC 'd' ) ",
     "attribute type { out [( DESC 'd' )]\nattribute type = [( DESC 'd' )]\nwhole at 62"},
    {"ListThatEndsTheLine", "ORVAttributetypes {\n( 1.1 DBNAME ( 'a' )\n( 1.2 DBNAME ( 'b' ) ) }",
     "vendor extension 1.1 { [( 1.1 DBNAME ( 'a' )]\n"
     "vendor extension 1.2 { [( 1.2 DBNAME ( 'b' ) )]\nwhole at 65"},
    {"NotClosed", "attributetypes=( 1.1 NAME 'a' DESC 'd'\nattributetypes=( 1.2 )",
     "fails at 39 in attribute type a (1.1) from 15"},
    {"NeitherOneNorABlock", "attributetypes=( 1.1 )\nobjectclasses ( 1.2 )",
     "attribute type 1.1 = [( 1.1 )]\nfails at 37"},
    {"Collective", "attributetypes=( 1.1 COLLECTIVE )",
     "never ends at 21 in attribute type 1.1 from 15"},
    {"NamesToTheEnd", "attributetypes=( 1.1 NAME 'a' )\n",
     "never ends at 32 in attribute type a (1.1) from 15"},
    {"NamesOfAClassToTheEnd", "objectclasses=( 1.1 NAME 'a' )\n",
     "never ends at 31 in object class a (1.1) from 14"},
    {"DatabaseNamesToTheEnd", "ORVAttributetypes=( 1.1 DBNAME 'a' \n",
     "never ends at 36 in vendor extension 1.1 from 18"},
};

TEST(KeptPlaces, AreThoseOfTheText) {
  for (const PlaceCase& row : kPlaces) {
    SCOPED_TRACE(row.name);
    EXPECT_EQ(row.places, placesIn(row.text));
  }
}

}  // namespace
