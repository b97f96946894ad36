// A facility that throws: every traced function that the exception leaves still writes its exit
// record, those around it with the code 0, and nothing that a function took hold of is lost.

#include <gtest/gtest.h>

#include <clocale>
#include <cstdarg>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <functional>
#include <stdexcept>
#include <string>
#include <vector>

#include "Files.h"
#include "SchemaLexan.h"
#include "SchemaManager.h"
#include "UnfreedDefinitions.h"
#include "ldtr.h"
#include "timestamp.h"

std::uint64_t trcEvents = 0;
ldtr_function_global ldtr_fun;

namespace {

// What the facility was given, the record that it throws at, and who looks on at each record.
std::vector<std::string> received;
std::string refused;
std::function<void(const std::string&)> onlooker;

std::string hex(unsigned long value) {
  char text[32];
  std::snprintf(text, sizeof text, "0x%lx", value);
  return text;
}

void receive(const std::string& record) {
  received.push_back(record);
  if (onlooker) {
    onlooker(record);
  }
  if (!refused.empty() && record.find(refused) != std::string::npos) {
    throw std::runtime_error(record);
  }
}

std::string formatted(const char* format, std::va_list arguments) {
  char text[512];
  std::vsnprintf(text, sizeof text, format, arguments);
  return text;
}

}  // namespace

void ldtr_write(unsigned long /*level*/, unsigned long identifier, void const* /*pointer*/) {
  receive("entry " + hex(identifier));
}

void ldtr_exit_errcode(unsigned long identifier, unsigned long /*kind*/, unsigned long /*entryBit*/,
                       long errorCode, void const* /*pointer*/) {
  received.push_back("exit " + hex(identifier) + " code " + std::to_string(errorCode));
}

void ldtr_formater_local::debug(unsigned long /*debugLevel*/, char const* format, ...) {
  std::va_list arguments;
  va_start(arguments, format);
  const std::string text = formatted(format, arguments);
  va_end(arguments);
  receive("debug " + text);
}

void ldtr_formater_global::debug(unsigned long /*debugLevel*/, char const* format, ...) {
  std::va_list arguments;
  va_start(arguments, format);
  const std::string text = formatted(format, arguments);
  va_end(arguments);
  receive("debug outside " + text);
}

std::string getCurrentTimeStamp(int /*format*/) {
  receive("time");
  return "now";
}

namespace {

class ThrowingFacility : public testing::Test {
 protected:
  ThrowingFacility() : manager(directory.path()) { received.clear(); }
  ~ThrowingFacility() override { reset(); }

  static void reset() {
    trcEvents = 0;
    refused.clear();
  }

  // The exit records of `action`, which the facility interrupts at the record with `text` in it.
  template <typename Action>
  static std::string exitsOf(const std::string& text, Action action,
                             std::uint64_t events = 0x0403f000) {
    received.clear();
    refused = text;
    trcEvents = events;
    EXPECT_THROW(action(), std::runtime_error) << text;
    reset();
    std::string exits = "\n";
    bool isBehind = false;
    for (const std::string& record : received) {
      isBehind = isBehind || record.find(text) != std::string::npos;
      if (isBehind && record.rfind("exit ", 0) == 0) {
        exits += record + "\n";
      }
    }
    return exits;
  }

  void read(const std::string& name, const std::string& text) {
    directory.write(name, text);
    EXPECT_EQ(manager.readFile(name), 0);
  }

  support::TemporaryDirectory directory;
  SchemaManager manager;
};

constexpr char kDefinitions[] =
    "attributetypes=( 1.1 NAME 'a' DESC 'd' )\n"
    "ORVAttributetypes=( 1.1 LENGTH 1 )\n"
    "objectclasses=( 2.1 NAME 'o' AUXILIARY )\n";

// The guard stands before the entry record is written.
TEST_F(ThrowingFacility, AtTheEntryRecord) {
  EXPECT_EQ(exitsOf("entry 0x53051e00", [&] { manager.isExcluded("1"); }),
            "\nexit 0x53051e00 code 0\n");
  EXPECT_EQ(exitsOf("entry 0x53050400", [&] { manager.getAttr("a"); }),
            "\nexit 0x53050400 code 0\n");
}

TEST_F(ThrowingFacility, AtADebugRecord) {
  EXPECT_EQ(exitsOf("debug delOidFromFileSet", [&] { manager.delOidFromFileSet("1"); }),
            "\nexit 0x53051400 code 0\n");
  EXPECT_EQ(
      exitsOf("debug readExcludedOids", [&] { manager.readExcludedOids(directory.file("none")); }),
      "\nexit 0x53051300 code 0\n");
  EXPECT_EQ(exitsOf("debug writeSetToFile",
                    [&] { manager.writeFile(directory.file("none"), "V3.user.at"); }),
            "\nexit 0x53051200 code 0\nexit 0x53051100 code 0\n");
}

TEST_F(ThrowingFacility, InANestedFunction) {
  read("V3.user.at", kDefinitions);
  SchemaManager reference(directory.path());
  EXPECT_EQ(exitsOf("entry 0x53050400", [&] { manager.compSchemas(&reference); }),
            "\nexit 0x53050400 code 0\nexit 0x53050e00 code 0\nexit 0x53051b00 code 0\n");
  EXPECT_EQ(exitsOf("entry 0x53051e00", [&] { manager.compSchemas(&reference); }),
            "\nexit 0x53051e00 code 0\nexit 0x53050e00 code 0\nexit 0x53051b00 code 0\n");
  EXPECT_EQ(exitsOf("entry 0x53050500", [&] { manager.checkCollisions(&manager); }),
            "\nexit 0x53050500 code 0\nexit 0x53052200 code 0\nexit 0x53051c00 code 0\n");
  EXPECT_EQ(exitsOf("entry 0x53051900", [&] { reference.mergeSchemas(&manager); }),
            "\nexit 0x53051900 code 0\nexit 0x53051600 code 0\nexit 0x53051500 code 0\n");
}

TEST_F(ThrowingFacility, OnlyWithTheExitBits) {
  read("V3.user.at", kDefinitions);
  SchemaManager reference(directory.path());
  // The entry record of the frequent kind throws; the ordinary functions' exit bits are off.
  EXPECT_EQ(exitsOf(
                "entry 0x53050e00", [&] { manager.compSchemas(&reference); }, 0x10000),
            "\nexit 0x53050e00 code 0\n");
  EXPECT_EQ(exitsOf(
                "entry 0x53050400", [&] { manager.compSchemas(&reference); }, 0x1000),
            "\nexit 0x53050400 code 0\nexit 0x53051b00 code 0\n");
}

// The analyser goes and the locale comes back, and the definition being read is freed.
TEST_F(ThrowingFacility, WhileAFileIsRead) {
  ASSERT_NE(std::setlocale(LC_ALL, "C.UTF-8"), nullptr);
  ::setenv("LC_ALL", "C.UTF-8", 1);
  directory.write("V3.user.at", kDefinitions);
  const char* const places[] = {"entry 0x53040b00", "debug readFile: Parsing", "entry 0x53010200",
                                "entry 0x53040300", "entry 0x53020100",        "entry 0x53030200"};
  for (const char* const place : places) {
    SchemaManager fresh(directory.path());
    const std::string exits = exitsOf(place, [&] { fresh.readFile("V3.user.at"); });
    const std::string last = "exit 0x53051000 code 0\n";
    ASSERT_GE(exits.size(), last.size());
    EXPECT_EQ(exits.substr(exits.size() - last.size()), last) << place;
    EXPECT_STREQ(std::setlocale(LC_ALL, nullptr), "C.UTF-8") << place;
    EXPECT_EQ(fresh.readFile("V3.user.at"), 0) << place;
    EXPECT_EQ(fresh.getAttr("a").getOid(), "1.1") << place;
    EXPECT_EQ(fresh.getObjClass("o").getOid(), "2.1") << place;
  }
  ::unsetenv("LC_ALL");
  std::setlocale(LC_ALL, "C");
}

// Before the switch the locale stays what it is; behind it, it becomes the environment's.
TEST_F(ThrowingFacility, WhileAnAnalyserIsConstructed) {
  directory.write("V3.user.at", "");
  ::setenv("LC_ALL", "C.UTF-8", 1);
  const struct {
    const char* place;
    const char* locale;
  } rows[] = {{"SchemaLexan: current locale", "C"},
              {"SchemaLexan: changing locale", "C"},
              {"SchemaLexan: locale settings on the system after", "C.UTF-8"}};
  for (const auto& row : rows) {
    std::setlocale(LC_ALL, "C");
    exitsOf(row.place, [&] { SchemaLexan(directory.path(), "V3.user.at"); });
    EXPECT_STREQ(std::setlocale(LC_ALL, nullptr), row.locale) << row.place;
  }
  ::unsetenv("LC_ALL");
  std::setlocale(LC_ALL, "C");
}

// A destructor lets no exception out.
TEST_F(ThrowingFacility, WhileAnAnalyserIsDestroyed) {
  directory.write("V3.user.at", "");
  ::setenv("LC_ALL", "C.UTF-8", 1);
  for (const char* const place : {"~SchemaLexan", "lexan: locale settings after"}) {
    {
      const SchemaLexan lexer(directory.path(), "V3.user.at");
      refused = place;
      trcEvents = 0x04000000;
    }
    reset();
    EXPECT_STREQ(std::setlocale(LC_ALL, nullptr), "C.UTF-8") << place;
  }
  ::unsetenv("LC_ALL");
  std::setlocale(LC_ALL, "C");
}

TEST_F(ThrowingFacility, AtTheRecordsOfAFailedRead) {
  directory.write("V3.user.at", "attributetypes=( 1.1 DESC 'd'\n");
  for (const char* const place : {"debug readFile: There was", "debug readFile: (1)",
                                  "entry 0x53040700", "entry 0x53040600"}) {
    SchemaManager fresh(directory.path());
    const std::string exits = exitsOf(place, [&] { fresh.readFile("V3.user.at"); });
    EXPECT_NE(exits.find("exit 0x53051000 code 0\n"), std::string::npos) << place;
  }
}

// What was read before an exception passed is there, and is written, as after any other failure.
TEST_F(ThrowingFacility, WhatWasReadBeforeStays) {
  const std::string text = std::string(kDefinitions) +
                           "attributetypes=( 1.2 NAME 'a' DESC 'd' )\n" +
                           "attributetypes=( 1.3 NAME 'b' DESC 'd' )\nobjectclasses=( 2.2\n";
  directory.write("V3.user.at", text);
  // Of 1.1 and 1.2, which share a name, the second is held by its OID alone.
  const support::UnfreedDefinitions unfreed;
  for (const char* const place : {"debug readFile: There was", "debug readFile: (1)"}) {
    SchemaManager fresh(directory.path());
    exitsOf(place, [&] { fresh.readFile("V3.user.at"); });
    EXPECT_EQ(fresh.getAttr("a").getOid(), "1.1") << place;
    EXPECT_EQ(fresh.getAttr("1.2").getFirstName(), "a") << place;
    EXPECT_EQ(fresh.getAttr("b").getOid(), "1.3") << place;
    EXPECT_EQ(fresh.getORVAttr("1.1").getOid(), "1.1") << place;
    EXPECT_EQ(fresh.getObjClass("o").getOid(), "2.1") << place;
    EXPECT_EQ(fresh.delOidFromFileSet("1.3"), 0) << place;
  }
}

// Who looks on at the records of a failure finds what was read before it.
TEST_F(ThrowingFacility, WhatWasReadBeforeAFailureIsThereAtItsFirstRecord) {
  directory.write("V3.user.at", std::string(kDefinitions) + "attributetypes=( 1.2\n");
  std::string found;
  onlooker = [&](const std::string& record) {
    if (record.find("debug readFile: There was") != std::string::npos) {
      onlooker = nullptr;
      found = manager.getAttr("a").getOid() + " " + manager.getORVAttr("1.1").getOid() + " " +
              manager.getObjClass("2.1").getFirstName() + " " +
              std::to_string(manager.delOidFromFileSet("2.1"));
    }
  };
  trcEvents = 0x04000000;
  EXPECT_EQ(manager.readFile("V3.user.at"), 1);
  reset();
  EXPECT_EQ(found, "1.1 1.1 o 0");
}

TEST_F(ThrowingFacility, WhileAFileIsWritten) {
  read("V3.user.at", kDefinitions);
  const auto write = [&] { manager.writeFile(directory.path(), "V3.user.at"); };
  const std::string both = "exit 0x53051200 code 0\nexit 0x53051100 code 0\n";
  EXPECT_EQ(exitsOf("entry 0x53010300", write), "\nexit 0x53010300 code 0\n" + both);
  EXPECT_EQ(exitsOf("entry 0x53050500", write), "\nexit 0x53050500 code 0\n" + both);
  EXPECT_EQ(exitsOf("entry 0x53020300", write), "\nexit 0x53020300 code 0\n" + both);
  EXPECT_EQ(exitsOf("entry 0x53030300", write), "\nexit 0x53030300 code 0\n" + both);
}

// A host's clock that throws is no different.
TEST_F(ThrowingFacility, InTheTimeStamp) {
  read("V3.user.at", kDefinitions);
  EXPECT_EQ(exitsOf("time", [&] { manager.writeFile(directory.path(), "V3.user.at"); }),
            "\nexit 0x53051200 code 0\nexit 0x53051100 code 0\n");
}

}  // namespace
