#include "Hostile.h"

#include <filesystem>
#include <stdexcept>
#include <utility>

#include "Inputs.h"
#include "SchemaManager.h"

namespace bench {

namespace {

constexpr char kTypes[] = "V3.system.at";
constexpr char kClasses[] = "V3.system.oc";
constexpr char kExtensions[] = "V3.orv.at";

// The numbers below `count` scattered, each once, so that keys do not come in their order.
std::size_t scattered(std::size_t i, std::size_t count) { return i * 7919 % count; }

// Calls `one` with 0 to count - 1 and joins what it returns.
template <typename One>
std::string repeat(std::size_t count, One one) {
  std::string text;
  for (std::size_t i = 0; i < count; ++i) {
    text += one(i);
  }
  return text;
}

std::string word(const std::string& stem, std::size_t i) { return stem + std::to_string(i); }

std::string typeOf(const std::string& oid, const std::string& name, const std::string& rest = "") {
  return "attributetypes=( " + oid + " NAME '" + name + "' DESC 'd' " + rest + ")\n";
}

// `count` attribute types with different names and OIDs.
std::string types(std::size_t count, const std::string& stem = "name",
                  const std::string& arc = "1.3.6.1.4.1.") {
  return repeat(count, [&](std::size_t i) {
    return typeOf(arc + std::to_string(i), word(stem, scattered(i, count)));
  });
}

std::string extensions(std::size_t count) {
  return repeat(count, [](std::size_t i) {
    return "ORVAttributetypes=( 1.3.6.1.4.1." + std::to_string(i) + " DBNAME ( 'a' ) LENGTH 9 )\n";
  });
}

std::string oids(std::size_t count) {
  return repeat(count, [](std::size_t i) { return "1.3.6.1.4.1." + std::to_string(i) + "\n"; });
}

void read(SchemaManager* manager, const char* file) {
  if (manager->readFile(file) != 0) {
    throw std::runtime_error("an input of the benchmark cannot be read");
  }
}

// ---- Runs ----

// Reads the text as the file.
auto reading(const char* file, std::function<std::string(std::size_t)> text) {
  return [=](std::size_t size, const std::string& folder) -> Run {
    writeText(folder + "/" + file, text(size));
    return [=] {
      SchemaManager manager(folder);
      return secondsOf([&] { read(&manager, file); });
    };
  };
}

// Reads the older and the newer text as the file into two managers, and times what `action` does
// with them.
using Action = std::function<void(SchemaManager* older, SchemaManager* newer)>;
using PairTexts = std::function<std::pair<std::string, std::string>(std::size_t)>;

auto withPair(const char* file, PairTexts texts, Action action) {
  return [=](std::size_t size, const std::string& folder) -> Run {
    const auto written = texts(size);
    for (const char* const name : {"/older", "/newer"}) {
      std::filesystem::create_directories(folder + name);
    }
    writeText(folder + "/older/" + file, written.first);
    writeText(folder + "/newer/" + file, written.second);
    writeText(folder + "/oids", oids(size));
    return [=] {
      SchemaManager older(folder + "/older");
      SchemaManager newer(folder + "/newer");
      read(&older, file);
      read(&newer, file);
      return secondsOf([&] { action(&older, &newer); });
    };
  };
}

void compare(SchemaManager* older, SchemaManager* newer) { older->compSchemas(newer); }

// Comparison of one definition with a list of `size` members against one with the same members in
// the opposite order and other letter case.
auto reversedLists(const char* file, const char* before, const char* between, const char* after) {
  return withPair(
      file,
      [=](std::size_t size) {
        const auto list = [&](const char* stem, bool isReversed) {
          return before +
                 repeat(size,
                        [&](std::size_t i) {
                          return (i == 0 ? "" : between) +
                                 word(stem, isReversed ? size - 1 - i : i);
                        }) +
                 after;
        };
        return std::make_pair(list("member", false), list("MEMBER", true));
      },
      compare);
}

// The same with one member, the last one of the other list, over and over.
auto repeatedMember(const char* file, const char* before, const char* between, const char* after) {
  return withPair(
      file,
      [=](std::size_t size) {
        const auto list = [&](bool isRepeated) {
          return before +
                 repeat(size,
                        [&](std::size_t i) {
                          return (i == 0 ? "" : between) +
                                 word("member", isRepeated ? size - 1 : i);
                        }) +
                 after;
        };
        return std::make_pair(list(true), list(false));
      },
      compare);
}

constexpr char kMustBefore[] = "objectclasses=( 1.2 NAME 'c' STRUCTURAL MUST ( ";
constexpr char kMayBefore[] = "objectclasses=( 1.2 NAME 'c' STRUCTURAL MAY ( ";
constexpr char kSupBefore[] = "objectclasses=( 1.2 NAME 'c' SUP ( ";
constexpr char kClassAfter[] = " ) MAY ( x ) )\n";
constexpr char kNamesBefore[] = "attributetypes=( 1.2 NAME ( 'first' '";
constexpr char kNamesAfter[] = "' ) DESC 'd' )\n";
constexpr char kDbBefore[] = "ORVAttributetypes=( 1.2 DBNAME ( '";
constexpr char kDbAfter[] = "' ) LENGTH 9 )\n";

// ---- The list ----

void addNameCases(std::vector<HostileCase>* list) {
  list->push_back({"names of one attribute type", 20000, reading(kTypes, [](std::size_t n) {
                     return kNamesBefore +
                            repeat(n, [](std::size_t i) { return word("name", i) + "' '"; }) +
                            kNamesAfter;
                   })});
  list->push_back(
      {"names of one attribute type, each twice", 20000, reading(kTypes, [](std::size_t n) {
         return kNamesBefore +
                repeat(n, [n](std::size_t i) { return word("name", i % (n / 2)) + "' '"; }) +
                kNamesAfter;
       })});
  list->push_back(
      {"NAME clauses in one attribute type", 20000, reading(kTypes, [](std::size_t n) {
         return "attributetypes=( 1.2 " +
                repeat(n,
                       [](std::size_t i) { return "NAME '" + word("name", i) + "' DESC 'd' "; }) +
                ")\n";
       })});
  list->push_back(
      {"NAME clause that swallows attribute types", 10000, reading(kTypes, [](std::size_t n) {
         return repeat(n,
                       [](std::size_t i) {
                         return "attributetypes=( 1.2." + std::to_string(i) + " NAME '" +
                                word("name", i) + "' )\n";
                       }) +
                typeOf("1.2", "last");
       })});
  list->push_back(
      {"NAME clause that swallows object classes", 10000, reading(kClasses, [](std::size_t n) {
         return repeat(n,
                       [](std::size_t i) {
                         return "objectclasses=( 1.2." + std::to_string(i) + " NAME '" +
                                word("name", i) + "' )\n";
                       }) +
                "objectclasses=( 1.2 NAME 'last' MAY ( a ) )\n";
       })});
}

void addEqualityCases(std::vector<HostileCase>* list) {
  constexpr std::size_t kSize = 10000;
  list->push_back(
      {"equality of NAME lists", kSize, reversedLists(kTypes, kNamesBefore, "' '", kNamesAfter)});
  list->push_back({"equality of SUP lists, attribute type", kSize,
                   reversedLists(kTypes, "attributetypes=( 1.2 NAME 'a' SUP ", " SUP ", " )\n")});
  list->push_back({"equality of SUP lists, object class", kSize,
                   reversedLists(kClasses, kSupBefore, " $ ", kClassAfter)});
  list->push_back(
      {"equality of MUST lists", kSize, reversedLists(kClasses, kMustBefore, " $ ", kClassAfter)});
  list->push_back(
      {"equality of MAY lists", kSize, reversedLists(kClasses, kMayBefore, " $ ", kClassAfter)});
  list->push_back(
      {"equality of DBNAME lists", kSize, reversedLists(kExtensions, kDbBefore, "' '", kDbAfter)});
  list->push_back({"equality of MUST lists, one member repeated", kSize,
                   repeatedMember(kClasses, kMustBefore, " $ ", kClassAfter)});
  list->push_back({"equality of SUP lists, one member repeated", kSize,
                   repeatedMember(kClasses, kSupBefore, " $ ", kClassAfter)});
  list->push_back({"equality of DBNAME lists, one member repeated", kSize,
                   repeatedMember(kExtensions, kDbBefore, "' '", kDbAfter)});
}

void addOidCases(std::vector<HostileCase>* list) {
  // So many that the tables of the smaller case do not fit into the processor's own cache either:
  // the step out of it would count as growth.
  constexpr std::size_t kSize = 20000;
  const PairTexts equal = [](std::size_t n) { return std::make_pair(types(n), types(n)); };
  const PairTexts added = [](std::size_t n) { return std::make_pair(types(n), std::string()); };
  const auto withOids = [](int (SchemaManager::*use)(std::string), Action then) {
    return [=](std::size_t size, const std::string& folder) -> Run {
      writeText(folder + "/" + kTypes, types(size));
      writeText(folder + "/" + kExtensions, extensions(size));
      writeText(folder + "/oids", oids(size));
      return [=] {
        SchemaManager older(folder);
        SchemaManager newer(folder);
        read(&older, kTypes);
        read(&older, kExtensions);
        return secondsOf([&] {
          (older.*use)(folder + "/oids");
          then(&older, &newer);
        });
      };
    };
  };
  list->push_back({"excluded OIDs", kSize, withOids(&SchemaManager::readExcludedOids, compare)});
  list->push_back({"withdrawal list", kSize,
                   withOids(&SchemaManager::modifySchema, [](SchemaManager*, SchemaManager*) {})});
  list->push_back({"removal from the file OID sets", kSize, withPair(kTypes, equal, compare)});
  const Action merge = [](SchemaManager* older, SchemaManager* newer) {
    newer->mergeSchemas(older);
  };
  // What is added to begins with nothing and leaves the cache later.
  list->push_back({"additions in a merge", 2 * kSize, withPair(kTypes, added, merge)});
  list->push_back({"replacements in a merge", kSize, withPair(kTypes, equal, merge)});
  const Action check = [](SchemaManager* older, SchemaManager* newer) {
    older->checkCollisions(newer);
  };
  list->push_back({"check of collisions", kSize, withPair(kTypes, equal, check)});
  list->push_back({"check without collisions", kSize, withPair(kTypes, added, check)});
  list->push_back({"report of collisions", 20000,
                   withPair(kTypes, equal, [](SchemaManager* older, SchemaManager*) {
                     static_cast<void>(older->getAttrTable());
                   })});
  list->push_back({"report of one collision with many names", 50000,
                   withPair(
                       kTypes,
                       [](std::size_t n) {
                         return std::make_pair(
                             kNamesBefore +
                                 repeat(n, [](std::size_t i) { return word("name", i) + "' '"; }) +
                                 kNamesAfter,
                             std::string());
                       },
                       [](SchemaManager* older, SchemaManager*) {
                         static_cast<void>(older->getAttrTable());
                       })});
}

void addByteCases(std::vector<HostileCase>* list) {
  constexpr std::size_t kBytes = 2000000;
  const auto one = [&](const char* name, const std::string& before, char byte,
                       const std::string& after) {
    list->push_back({name, kBytes, reading(kTypes, [=](std::size_t n) {
                       return before + std::string(n, byte) + after;
                     })});
  };
  const std::string start = "attributetypes=( 1.2 NAME 'a' ";
  one("long quoted string", start + "DESC '", 'd', "' )\n");
  one("long word", start + "SYNTAX ", 'w', " )\n");
  one("long number", start + "SYNTAX 1.", '2', " )\n");
  one("run of blanks", start, ' ', "DESC 'd' )\n");
  one("run of TABs in a quoted string", start + "DESC '", '\t', "' )\n");
  one("blanks between a number and its length", start + "SYNTAX 1.2", ' ', "{8} )\n");
  one("run of newlines", start, '\n', "DESC 'd' )\n");
  one("long comment", "", '#', "\n" + typeOf("1.2", "a"));
  one("run of parentheses", "", '(', "\n" + typeOf("1.2", "a"));
  list->push_back({"comment lines", 200000, reading(kTypes, [](std::size_t n) {
                     return repeat(n, [](std::size_t) { return "# note\n"; }) + typeOf("1.2", "a");
                   })});
  list->push_back({"lines of junk between definitions", 20000, reading(kTypes, [](std::size_t n) {
                     return typeOf("1.1", "a") +
                            repeat(n,
                                   [](std::size_t i) {
                                     return word("junk", i) + " ( 1.2." + std::to_string(i) +
                                            " $ 'x y' ) = { }\n";
                                   }) +
                            typeOf("1.2", "b");
                   })});
}

void addTableCases(std::vector<HostileCase>* list) {
  list->push_back({"one definition again and again", 5000, reading(kTypes, [](std::size_t n) {
                     return repeat(n, [](std::size_t) { return typeOf("1.2", "name"); });
                   })});
  list->push_back(
      {"definitions of one name", 5000, reading(kTypes, [](std::size_t n) {
         return repeat(n, [](std::size_t i) { return typeOf("1.2." + std::to_string(i), "name"); });
       })});
  list->push_back({"definitions of one OID", 5000, reading(kTypes, [](std::size_t n) {
                     return repeat(n, [](std::size_t i) { return typeOf("1.2", word("name", i)); });
                   })});
  list->push_back(
      {"many definitions", 5000, reading(kTypes, [](std::size_t n) { return types(n); })});
  const auto longKeys = [](std::size_t n) {
    std::string arc = "1";
    for (int i = 0; i < 250; ++i) {
      arc += ".2";
    }
    return types(n, std::string(500, 'n'), arc + ".");
  };
  list->push_back({"long common key prefixes, reading", 2500, reading(kTypes, longKeys)});
  // More than the processor's own cache holds, as for the cases by OID.
  list->push_back(
      {"long common key prefixes, comparison", 10000,
       withPair(
           kTypes, [=](std::size_t n) { return std::make_pair(longKeys(n), longKeys(n)); },
           compare)});
  list->push_back(
      {"long common key prefixes, merge", 2500,
       withPair(
           kTypes, [=](std::size_t n) { return std::make_pair(longKeys(n), longKeys(n)); },
           [](SchemaManager* older, SchemaManager* newer) { newer->mergeSchemas(older); })});
  list->push_back(
      {"writing of many definitions", 5000, [](std::size_t size, const std::string& folder) -> Run {
         writeText(folder + "/" + kTypes, types(size));
         std::filesystem::create_directories(folder + "/out");
         return [=] {
           SchemaManager manager(folder);
           read(&manager, kTypes);
           return secondsOf([&] { manager.writeFile(folder + "/out", kTypes); });
         };
       }});
}

std::vector<HostileCase> makeCases() {
  std::vector<HostileCase> list;
  addNameCases(&list);
  addEqualityCases(&list);
  addOidCases(&list);
  addByteCases(&list);
  addTableCases(&list);
  return list;
}

}  // namespace

const std::vector<HostileCase>& hostileCases() {
  static const std::vector<HostileCase> kCases = makeCases();
  return kCases;
}

}  // namespace bench
