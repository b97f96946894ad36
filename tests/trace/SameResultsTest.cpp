// Tracing changes nothing: a whole migration gives the same results with every set of event bits.

#include <gtest/gtest.h>

#include <cstdint>
#include <string>

#include "Files.h"
#include "SchemaManager.h"
#include "TraceRecorder.h"
#include "UnfreedDefinitions.h"

namespace {

constexpr char kOldAttributes[] =
    "attributetypes=( 1.1 NAME ( 'a' 'alpha' ) DESC 'kept' SYNTAX 1.3{32} )\n"
    "ORVAttributetypes=( 1.1 DBNAME ( 'a' 'b' ) LENGTH 256 EQUALITY )\n"
    "attributetypes { ( 1.2 NAME 'b' DESC 'same' ) ( 1.3 NAME 'c' DESC 'changed' ) }\n"
    "# a comment\n"
    "attributetypes=( 1.4 NAME 'd' DESC 'excluded' )\n";

constexpr char kNewAttributes[] =
    "attributetypes=( 1.2 NAME 'B' DESC 'same' )\n"
    "attributetypes=( 1.3 NAME 'c' DESC 'as delivered' )\n";

constexpr char kOldClasses[] =
    "objectClasses=( 2.1 NAME 'o' SUP top STRUCTURAL MUST ( a $ b ) MAY ( c ) )\n"
    "objectClasses=( 2.2 NAME 'p' AUXILIARY )\n";

constexpr char kNewClasses[] = "objectClasses=( 2.2 NAME 'p' ABSTRACT )\n";

// Everything that a caller can see of a run: results, reports, prints and files.
class Migration {
 public:
  explicit Migration(std::uint64_t events) {
    oldFiles.write("V3.user.at", kOldAttributes);
    oldFiles.write("V3.user.oc", kOldClasses);
    oldFiles.write("V3.system.at", "attributetypes=( 9.9 NAME 'broken' DESC 'd'\n");
    newFiles.write("V3.user.at", kNewAttributes);
    newFiles.write("V3.user.oc", kNewClasses);
    const support::TraceRecorder recorder(events);
    collide();
    migrate();
  }

  const std::string& transcript() const { return m_transcript; }

 private:
  template <typename Value>
  void note(const std::string& what, const Value& value) {
    m_transcript += what + ": " + text(value) + "\n";
  }
  static std::string text(const std::string& value) { return value; }
  static std::string text(int value) { return std::to_string(value); }

  void readBoth(SchemaManager* older, SchemaManager* newer) {
    for (const char* name : {"V3.user.at", "V3.user.oc", "V3.orv.at", "V3.wrong"}) {
      note("read old", older->readFile(name));
      note("read new", newer->readFile(name));
    }
  }

  void collide() {
    SchemaManager older(oldFiles.path());
    SchemaManager newer(newFiles.path());
    readBoth(&older, &newer);
    note("check", older.checkCollisions(&newer));
    note("classes", older.getOcTable());
    note("types", older.getAttrTable());
    note("extensions", older.getORVAttrTable());
  }

  void migrate() {
    SchemaManager older(oldFiles.path());
    SchemaManager newer(newFiles.path());
    readBoth(&older, &newer);
    note("exclude", older.readExcludedOids(oldFiles.write("list", "1.4 \n")));
    note("withdraw", older.modifySchema(oldFiles.write("list", "2.1 \n")));
    note("compare", older.compSchemas(&newer));
    note("merge", newer.mergeSchemas(&older));
    note("unknown", newer.delOidFromFileSet("8.8"));
    for (const char* name : {"V3.user.at", "V3.user.oc", "V3.config.at"}) {
      note("write", newer.writeFile(written.path(), name));
    }
    note("types written", support::readWholeFile(written.file("V3.user.at")));
    note("classes written", support::readWholeFile(written.file("V3.user.oc")));
    note("printed", support::standardOutputOf([&] {
           newer.dumpAttrTable();
           newer.dumpOcTable();
           newer.dumpORVAttrTable();
           newer.dumpUserAt();
           older.dumpEOids();
         }));
    note("broken", older.readFile("V3.system.at"));
    for (const char* file : {"attr", "orvattr", "objectclass", "lexan", "table"}) {
      note(file, support::readWholeFile(std::string("/tmp/") + file + ".txt"));
    }
  }

  support::UnfreedDefinitions m_erased;
  support::TemporaryDirectory oldFiles;
  support::TemporaryDirectory newFiles;
  support::TemporaryDirectory written;
  std::string m_transcript;
};

TEST(SameResults, WhateverTheEventBits) {
  const std::string expected = Migration(0).transcript();
  EXPECT_NE(expected.find("merge: 1\n"), std::string::npos) << expected;
  EXPECT_NE(expected.find("broken: 1\n"), std::string::npos) << expected;
  EXPECT_NE(expected.find("attributetypes=( 1.1 NAME ( 'a' 'alpha'  )  DESC 'kept'"),
            std::string::npos)
      << expected;
  for (const std::uint64_t events :
       {std::uint64_t{0x1000}, std::uint64_t{0x2000}, std::uint64_t{0x3000}, std::uint64_t{0x10000},
        std::uint64_t{0x20000}, std::uint64_t{0x30000}, support::kDebugEvents, support::kAllEvents,
        ~std::uint64_t{0}}) {
    EXPECT_EQ(Migration(events).transcript(), expected) << std::hex << events;
  }
}

}  // namespace
