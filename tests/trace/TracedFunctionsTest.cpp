// Every traced function: its identifier, its kind, the levels of its records, the event bits that
// switch them, and the code in its exit record.

#include <gtest/gtest.h>

#include <cstdint>
#include <cstdio>
#include <fstream>
#include <memory>
#include <ostream>
#include <set>
#include <string>
#include <vector>

#include "Files.h"
#include "SchemaManager.h"
#include "TraceRecorder.h"
#include "TraceTree.h"

namespace {

using support::TraceRecorder;
using tracetree::TracedFunction;
using tracetree::tracedFunctions;

constexpr char kDefinitions[] =
    "attributetypes=( 1.1 NAME 'first' DESC 'd' )\n"
    "ORVAttributetypes=( 1.1 DBNAME ( 'first' ) )\n"
    "objectclasses=( 2.1 NAME 'thing' STRUCTURAL )\n";

// What the calls below are made on.
struct World {
  World()
      : manager(directory.path()),
        empty(directory.path()),
        out(directory.file("out")),
        list(directory.write("list", "1.1 \n")) {
    directory.write("V3.user.at", kDefinitions);
    directory.write("V3.config.at", kDefinitions);
    directory.write("V3.modifiedschema", "attributetypes=( 1.9 NAME 'gone' DESC 'd' )\n");
    manager.readFile("V3.user.at");
    manager.readFile("V3.modifiedschema");
    directory.write("broken", "");
    directory.write("V3.user.oc", "attributetypes 1\n");
    attribute = manager.getAttr("first");
    extension = manager.getORVAttr("1.1");
    objectClass = manager.getObjClass("thing");
  }

  // An analyser that stands on "=" before the text.
  SchemaLexan& lexer(const std::string& text) {
    directory.write("input", "=" + text);
    input = std::make_unique<SchemaLexan>(directory.path(), "input");
    input->lexan();
    return *input;
  }

  support::TemporaryDirectory directory;
  SchemaManager manager;
  SchemaManager empty;
  std::ofstream out;
  std::string list;
  std::unique_ptr<SchemaLexan> input;
  Attribute attribute;
  ORVAttribute extension;
  ObjectClass objectClass;
};

// Before the recording starts, an analyser stands on "=" before `input`, when there is one, and
// then `prepare` is called.
struct CallRow {
  const char* function;
  const char* rule;
  long code;
  void (*call)(World&);
  const char* input = nullptr;
  void (*prepare)(World&) = nullptr;
};

void PrintTo(const CallRow& row, std::ostream* out) { *out << row.function << " " << row.rule; }

// Excludes the OID of the attribute type.
void exclude(World& world) { world.manager.readExcludedOids(world.list); }

const CallRow kCalls[] = {
    {"Attribute::attrsEqual", "equal", 1, [](World& w) { w.attribute.attrsEqual(w.attribute); }},
    {"Attribute::attrsEqual", "different", 0,
     [](World& w) { w.attribute.attrsEqual(Attribute()); }},
    {"Attribute::parse", "success", 1, [](World& w) { Attribute().parse(w.input.get()); },
     "( 1.2 )\n"},
    {"Attribute::parse", "failure", 0, [](World& w) { Attribute().parse(w.input.get()); },
     "( 1.2 \n"},
    {"Attribute::dump(out)", "", 0, [](World& w) { w.attribute.dump(w.out); }},
    {"Attribute::dump()", "", 0, [](World& w) { w.attribute.dump(); }},
    {"ORVAttribute::parse", "success", 0, [](World& w) { ORVAttribute().parse(w.input.get()); },
     "( 1.2 )\n"},
    {"ORVAttribute::parse", "failure", 0, [](World& w) { ORVAttribute().parse(w.input.get()); },
     "( 1.2 \n"},
    {"ORVAttribute::orvAttrsEqual", "equal", 0,
     [](World& w) { w.extension.orvAttrsEqual(w.extension); }},
    {"ORVAttribute::orvAttrsEqual", "different", 0,
     [](World& w) { w.extension.orvAttrsEqual(ORVAttribute()); }},
    {"ORVAttribute::dump(out)", "", 0, [](World& w) { w.extension.dump(w.out); }},
    {"ORVAttribute::dump()", "", 0, [](World& w) { w.extension.dump(); }},
    {"ObjectClass::objsEqual", "equal", 0,
     [](World& w) { w.objectClass.objsEqual(w.objectClass); }},
    {"ObjectClass::objsEqual", "different", 0,
     [](World& w) { w.objectClass.objsEqual(ObjectClass()); }},
    {"ObjectClass::parse", "success", 0, [](World& w) { ObjectClass().parse(w.input.get()); },
     "( 1.2 )\n"},
    {"ObjectClass::parse", "failure", 0, [](World& w) { ObjectClass().parse(w.input.get()); },
     "( 1.2 \n"},
    {"ObjectClass::dump(out)", "", 0, [](World& w) { w.objectClass.dump(w.out); }},
    {"ObjectClass::dump()", "", 0, [](World& w) { w.objectClass.dump(); }},

    {"lookUp", "found", 18, [](World& w) { w.input->lookUp(1026, 0); }, ""},
    {"lookUp", "absent", -1, [](World& w) { w.input->lookUp(4711, 0); }, ""},
    {"lexan", "keyword", 1003, [](World& w) { w.input->lexan(); }, "NAME\n"},
    {"lexan", "negative", -128, [](World& w) { w.input->lexan(); }, "\x80"},
    {"lexan", "end", 260, [](World& w) { w.input->lexan(); }, ""},
    {"match", "the token", 0, [](World& w) { w.input->match(61); }, "NAME\n"},
    {"match", "another token", 0, [](World& w) { w.input->match(40); }, "NAME\n"},
    {"insertString", "", 25, [](World& w) { w.input->insertString("x", 7); }, ""},
    {"insertCharacter", "", 25, [](World& w) { w.input->insertCharacter('x', 7); }, ""},
    {"dumpTable", "", 0, [](World& w) { w.input->dumpTable(w.directory.file("table")); }, ""},
    {"SchemaLexan::dump", "", 0, [](World& w) { w.input->dump(5, w.out); }, ""},
    {"getLineNumber", "", 3, [](World& w) { w.input->getLineNumber(); }, "\n\n(",
     [](World& w) { w.input->lexan(); }},
    {"getFileName", "", 0, [](World& w) { w.input->getFileName(); }, ""},
    {"getWorkingDir", "", 0, [](World& w) { w.input->getWorkingDir(); }, ""},
    {"fileIsOpen", "open", 0, [](World& w) { w.input->fileIsOpen(); }, "NAME"},
    {"fileIsOpen", "at its end", 0, [](World& w) { w.input->fileIsOpen(); }, "",
     [](World& w) { w.input->lexan(); }},

    {"dumpAttrTable", "", 0, [](World& w) { w.manager.dumpAttrTable(); }},
    {"dumpORVAttrTable", "", 0, [](World& w) { w.manager.dumpORVAttrTable(); }},
    {"dumpOcTable", "", 0, [](World& w) { w.manager.dumpOcTable(); }},
    {"getAttr", "found", 0, [](World& w) { w.manager.getAttr("first"); }},
    {"getAttr", "absent", 0, [](World& w) { w.manager.getAttr("second"); }},
    {"getORVAttr", "", 0, [](World& w) { w.manager.getORVAttr("1.1"); }},
    {"getObjClass", "", 0, [](World& w) { w.manager.getObjClass("thing"); }},
    {"dumpUserOc", "", 0, [](World& w) { w.manager.dumpUserOc(); }},
    {"dumpUserAt", "", 0, [](World& w) { w.manager.dumpUserAt(); }},
    {"dumpOrvOc", "", 0, [](World& w) { w.manager.dumpOrvOc(); }},
    {"dumpOrvAt", "", 0, [](World& w) { w.manager.dumpOrvAt(); }},
    {"dumpSysOc", "", 0, [](World& w) { w.manager.dumpSysOc(); }},
    {"dumpSysAt", "", 0, [](World& w) { w.manager.dumpSysAt(); }},
    {"compObjTables", "", 0, [](World& w) { w.manager.compObjTables(&w.empty); }},
    {"compAttrTables", "", 0, [](World& w) { w.manager.compAttrTables(&w.empty); }},
    {"compORVAttrTables", "", 0, [](World& w) { w.manager.compORVAttrTables(&w.empty); }},
    {"readFile", "success", 0, [](World& w) { w.empty.readFile("V3.user.at"); }},
    {"readFile", "missing file", 1, [](World& w) { w.empty.readFile("V3.system.at"); }},
    {"readFile", "syntax", 1, [](World& w) { w.empty.readFile("V3.user.oc"); }},
    {"readFile", "unknown name", 89, [](World& w) { w.empty.readFile("broken"); }},
    {"writeFile", "success", 0,
     [](World& w) { w.manager.writeFile(w.directory.path(), "V3.user.at"); }},
    {"writeFile", "no folder", 1,
     [](World& w) { w.manager.writeFile(w.directory.file("none"), "V3.user.at"); }},
    {"writeFile", "unknown name", 89,
     [](World& w) { w.manager.writeFile(w.directory.path(), "V3.config.at"); }},
    {"writeSetToFile", "success", 0,
     [](World& w) { w.manager.writeSetToFile({"1.1"}, w.directory.file("set")); }},
    {"writeSetToFile", "empty set", 0,
     [](World& w) { w.manager.writeSetToFile({}, w.directory.file("set")); }},
    {"writeSetToFile", "no folder", 1,
     [](World& w) { w.manager.writeSetToFile({"1.1"}, w.directory.file("none/set")); }},
    {"readExcludedOids", "success", 0, [](World& w) { w.manager.readExcludedOids(w.list); }},
    {"readExcludedOids", "missing file", 1,
     [](World& w) { w.manager.readExcludedOids(w.directory.file("none")); }},
    {"delOidFromFileSet", "removed", 0, [](World& w) { w.manager.delOidFromFileSet("2.1"); }},
    {"delOidFromFileSet", "absent", 32, [](World& w) { w.manager.delOidFromFileSet("1.9"); }},
    {"mergeSchemas", "success", 0, [](World& w) { w.manager.mergeSchemas(&w.empty); }},
    {"mergeAttrs", "success", 1, [](World& w) { w.manager.mergeAttrs(&w.empty); }},
    {"mergeORVAttrs", "success", 0, [](World& w) { w.manager.mergeORVAttrs(&w.empty); }},
    {"mergeObjClasses", "success", 0, [](World& w) { w.manager.mergeObjClasses(&w.empty); }},
    {"findOidInSet", "found", 0, [](World& w) { w.empty.findOidInSet(&w.manager, "1.1"); }},
    {"findOidInSet", "absent", 0, [](World& w) { w.empty.findOidInSet(&w.manager, "1.9"); }},
    {"dumpEOids", "", 0, [](World& w) { w.manager.dumpEOids(); }},
    {"compSchemas", "", 0, [](World& w) { w.empty.compSchemas(&w.manager); }},
    {"checkCollisions", "", 0, [](World& w) { w.empty.checkCollisions(&w.manager); }},
    {"modifySchema", "success", 0, [](World& w) { w.empty.modifySchema(w.list); }},
    {"modifySchema", "missing file", 1,
     [](World& w) { w.empty.modifySchema(w.directory.file("none")); }},
    {"isExcluded", "yes", 0, [](World& w) { w.manager.isExcluded("1.1"); }, nullptr, exclude},
    {"isExcluded", "no", 0, [](World& w) { w.manager.isExcluded("1.1"); }},
    {"delOidFromModSch", "removed", 0, [](World& w) { w.manager.delOidFromModSch("1.9"); }},
    {"delOidFromModSch", "absent", 32, [](World& w) { w.manager.delOidFromModSch("1.1"); }},
    {"checkObjClasses", "", 0, [](World& w) { w.empty.checkObjClasses(&w.manager); }},
    {"checkAttrs", "", 0, [](World& w) { w.empty.checkAttrs(&w.manager); }},
    {"checkORVAttrs", "", 0, [](World& w) { w.empty.checkORVAttrs(&w.manager); }},
    {"getOcTable", "", 0, [](World& w) { w.manager.getOcTable(); }},
    {"getORVAttrTable", "", 0, [](World& w) { w.manager.getORVAttrTable(); }},
    {"getAttrTable", "", 0, [](World& w) { w.manager.getAttrTable(); }},
    {"isModFileEmpty", "yes", 0, [](World& w) { w.empty.isModFileEmpty(); }},
    {"isModFileEmpty", "no", 0, [](World& w) { w.manager.isModFileEmpty(); }},
};

const TracedFunction& functionOf(const CallRow& row) {
  for (const TracedFunction& function : tracedFunctions()) {
    if (function.name == std::string(row.function)) {
      return function;
    }
  }
  ADD_FAILURE() << row.function;
  return tracedFunctions().front();
}

std::string hex(unsigned long value) {
  char text[32];
  std::snprintf(text, sizeof text, "0x%lx", value);
  return text;
}

std::string entryOf(const TracedFunction& function) {
  return "entry " + hex(function.identifier) +
         (function.isFrequent ? " level 0x32a0000" : " level 0x3200000");
}

std::string exitOf(const TracedFunction& function, long code) {
  return "exit " + hex(function.identifier) +
         (function.isFrequent ? " kind 43 bit 65536 code " : " kind 33 bit 4096 code ") +
         std::to_string(code);
}

// The records that the call makes with these event bits.
std::vector<std::string> recordsOf(const CallRow& row, std::uint64_t events) {
  World world;
  if (row.input != nullptr) {
    world.lexer(row.input);
  }
  if (row.prepare != nullptr) {
    row.prepare(world);
  }
  std::vector<std::string> records;
  support::standardOutputOf([&] {
    TraceRecorder recorder(events);
    row.call(world);
    records = recorder.records();
  });
  return records;
}

// Those of them that carry the function's own identifier; a nested call of itself there is none.
std::string ownRecords(const CallRow& row, std::uint64_t events) {
  std::string own;
  for (const std::string& record : recordsOf(row, events)) {
    if (record.find(" " + hex(functionOf(row).identifier) + " ") != std::string::npos &&
        record.rfind("debug", 0) != 0) {
      own += record + "\n";
    }
  }
  return own;
}

class TracedCall : public testing::TestWithParam<CallRow> {};

TEST_P(TracedCall, EventBitsSwitchItsRecords) {
  const CallRow& row = GetParam();
  const TracedFunction& function = functionOf(row);
  const std::string entry = entryOf(function) + "\n";
  const std::string exit = exitOf(function, row.code) + "\n";
  const std::uint64_t own = function.isFrequent ? 0x10000 : 0x1000;
  const std::uint64_t other = function.isFrequent ? 0x1000 : 0x10000;
  EXPECT_EQ(ownRecords(row, 0), "");
  EXPECT_EQ(ownRecords(row, own), entry + exit);
  EXPECT_EQ(ownRecords(row, own << 1), exit);
  EXPECT_EQ(ownRecords(row, own | (own << 1)), entry + exit);
  EXPECT_EQ(ownRecords(row, other), "");
  EXPECT_EQ(ownRecords(row, other << 1), "");
  EXPECT_EQ(ownRecords(row, other | (other << 1)), "");
  EXPECT_EQ(ownRecords(row, support::kDebugEvents), "");
  EXPECT_EQ(ownRecords(row, ~std::uint64_t{0}), entry + exit);
  EXPECT_EQ(ownRecords(row, ~(own | (own << 1))), "");
}

TEST_P(TracedCall, ItsRecordsEncloseAllOthers) {
  const CallRow& row = GetParam();
  const TracedFunction& function = functionOf(row);
  const std::vector<std::string> records = recordsOf(row, support::kAllEvents);
  ASSERT_GE(records.size(), 2U);
  EXPECT_EQ(records.front(), entryOf(function));
  EXPECT_EQ(records.back(), exitOf(function, row.code));
}

TEST_P(TracedCall, NothingReachesTheFacilityWithItsBitsOff) {
  constexpr std::uint64_t kUsed = 0x3000 | 0x30000 | 0x04000000;
  EXPECT_TRUE(recordsOf(GetParam(), 0).empty());
  EXPECT_TRUE(recordsOf(GetParam(), ~kUsed).empty());
}

INSTANTIATE_TEST_SUITE_P(All, TracedCall, testing::ValuesIn(kCalls));

TEST(TracedFunctions, AreAllCalledAbove) {
  std::set<std::string> called;
  for (const CallRow& row : kCalls) {
    called.insert(row.function);
  }
  EXPECT_EQ(tracedFunctions().size(), 61U);
  for (const TracedFunction& function : tracedFunctions()) {
    EXPECT_EQ(called.count(function.name), 1U) << function.name;
  }
  EXPECT_EQ(called.size(), tracedFunctions().size());
}

// Failed merges: both managers hold the definitions then, so that each run is a separate one and
// the target's share is taken back by a merge that succeeds.
struct FailedMergeRow {
  const char* definition;
  bool (SchemaManager::*merge)(SchemaManager*);
  const char* records;
};

TEST(TracedFunctions, FailedMergePassesRecordZero) {
  const FailedMergeRow rows[] = {
      {"attributetypes=( 1.1 NAME 'a' DESC 'd' )\n", &SchemaManager::mergeAttrs,
       "entry 0x53051600 level 0x32a0000\nentry 0x53051900 level 0x32a0000\n"
       "exit 0x53051900 kind 43 bit 65536 code 0\nexit 0x53051600 kind 43 bit 65536 code 0\n"},
      {"ORVAttributetypes=( 1.1 LENGTH 5 )\n", &SchemaManager::mergeORVAttrs,
       "entry 0x53051700 level 0x32a0000\nentry 0x53051900 level 0x32a0000\n"
       "exit 0x53051900 kind 43 bit 65536 code 0\nexit 0x53051700 kind 43 bit 65536 code 0\n"},
      {"objectclasses=( 1.1 NAME 'o' STRUCTURAL )\n", &SchemaManager::mergeObjClasses,
       "entry 0x53051800 level 0x32a0000\nentry 0x53051900 level 0x32a0000\n"
       "exit 0x53051900 kind 43 bit 65536 code 0\nexit 0x53051800 kind 43 bit 65536 code 0\n"},
  };
  for (const FailedMergeRow& row : rows) {
    support::TemporaryDirectory directory;
    directory.write("V3.config.at", row.definition);
    SchemaManager source(directory.path());
    SchemaManager target(directory.path());
    ASSERT_EQ(source.readFile("V3.config.at"), 0);
    TraceRecorder recorder(0x33000);
    // The first definition fails, so that the target has taken none.
    EXPECT_FALSE((target.*row.merge)(&source));
    std::string records;
    for (const std::string& record : recorder.records()) {
      records += record + "\n";
    }
    EXPECT_EQ(records, row.records);
  }
}

// ---- What leaves no records ----

TEST(UntracedFunctions, LeaveNoRecords) {
  World world;
  SchemaLexan& lexer = world.lexer("NAME 'x' )\n");
  std::string text;
  char character = ' ';
  TraceRecorder recorder(support::kAllEvents & ~support::kDebugEvents);

  Attribute attribute(world.attribute);
  ORVAttribute extension(world.extension);
  ObjectClass objectClass(world.objectClass);
  for (ORVSchema* definition :
       {static_cast<ORVSchema*>(&attribute), static_cast<ORVSchema*>(&extension),
        static_cast<ORVSchema*>(&objectClass)}) {
    definition->getOid();
    definition->getDescription();
    definition->getSuperior();
    definition->getFirstName();
    definition->getNames();
    definition->getFirstNameLower();
  }
  attribute.convert("X");
  attribute.getOidAndName();
  extension.convert("X");
  extension.getOidAndName();
  objectClass.convert("X");
  objectClass.getOidAndName();
  objectClass.getReqAttrs();
  objectClass.getOptAttrs();

  lexer.getCurrentToken();
  lexer.getTokenValIndex();
  lexer.getStringValue(1, text);
  lexer.getCharValue(1, character);
  lexer.isString(1);
  lexer.isCharacter(1);
  lexer.clear();
  lexer.skip(1, world.out);

  SchemaSymbolTable table;
  table.insertValue(std::string("x"), 7, false);
  table.insertValue('x', 7, false);
  table.lookUpValue("x");
  table.removeValue(25);
  table.tableDump(world.directory.file("table"));
  table.dump(0, world.out);

  world.manager.convert("X");
  { SchemaManager constructed(world.directory.path()); }
  { SchemaLexan constructed(world.directory.path(), "V3.user.at"); }
  EXPECT_EQ(tracetree::treeOf(recorder.records()), "\n");
}

}  // namespace
