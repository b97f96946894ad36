#include "Works.h"

#include <memory>
#include <utility>

#include "Attribute.h"
#include "ORVAttribute.h"
#include "ObjectClass.h"
#include "Peer.h"
#include "SchemaLexan.h"
#include "SchemaManager.h"
#include "floor/Schema.h"

namespace bench {

namespace {

static_assert(sizeof(minimal::AttributeType) == sizeof(Attribute), "the same members");
static_assert(sizeof(minimal::ObjectClass) == sizeof(ObjectClass), "the same members");
static_assert(sizeof(minimal::Extension) == sizeof(ORVAttribute), "the same members");

double sumOf(const std::vector<FileList>& lists, double FileList::*what) {
  double sum = 0;
  for (const FileList& list : lists) {
    sum += list.*what;
  }
  return sum;
}

template <typename Manager>
void readFiles(Manager* manager, const FileList& list) {
  for (const std::string& name : list.names) {
    manager->readFile(name);
  }
}

// Both installations of a pair, each in a manager.
template <typename Manager>
struct Managers {
  explicit Managers(const Input& input) : older(input.older), newer(input.newer) {}

  void read(const Input& input) {
    readFiles(&older, input.olderFiles);
    readFiles(&newer, input.newerFiles);
    if (!input.excluded.empty()) {
      older.readExcludedOids(input.excluded);
    }
    if (!input.withdrawn.empty()) {
      older.modifySchema(input.withdrawn);
    }
  }

  Manager older;
  Manager newer;
};

template <typename Manager>
void writeAll(Manager* manager, const std::string& output) {
  for (const std::string& name : kWritable) {
    manager->writeFile(output, name);
  }
}

template <typename Manager>
std::string reports(Manager* manager) {
  return manager->getOcTable() + manager->getAttrTable() + manager->getORVAttrTable();
}

// ---- Runs ----

template <typename Manager>
Run readingRun(const std::vector<FileList>& lists) {
  return [lists] {
    std::vector<std::unique_ptr<Manager>> managers;
    return secondsOf([&] {
      for (const FileList& list : lists) {
        managers.push_back(std::make_unique<Manager>(list.directory));
        readFiles(managers.back().get(), list);
      }
    });
  };
}

Run peerRun(const std::vector<FileList>& lists) {
  return [&lists] {
    std::vector<std::unique_ptr<Peer>> peers;
    return secondsOf([&] {
      for (const FileList& list : lists) {
        peers.push_back(std::make_unique<Peer>());
        for (const std::string& name : list.names) {
          peers.back()->readFile(list.directory + "/" + name);
        }
      }
    });
  };
}

std::size_t countTokens(const std::string& directory, const std::string& fileName) {
  SchemaLexan lexer(directory, fileName);
  std::size_t count = 0;
  while (lexer.lexan() != TOKEN_END) {
    ++count;
  }
  return count;
}

template <typename Count>
Run tokenRun(const Input& input, Count count) {
  return [&input, count] {
    volatile std::size_t tokens = 0;
    return secondsOf([&] {
      for (const FileList& list : input.all) {
        for (const std::string& name : list.names) {
          tokens = tokens + count(list.directory, name);
        }
      }
    });
  };
}

// A work on two managers that have been read, and pruned by a comparison if so wanted.
template <typename Manager, typename Action>
Run pairRun(const Input& input, bool isPruned, Action action) {
  return [&input, isPruned, action] {
    Managers<Manager> managers(input);
    managers.read(input);
    if (isPruned) {
      managers.older.compSchemas(&managers.newer);
    }
    return secondsOf([&] { action(&managers.older, &managers.newer); });
  };
}

template <typename Manager>
Run writingRun(const Input& input, const std::string& output) {
  return [&input, output] {
    Manager manager(input.older);
    readFiles(&manager, input.olderFiles);
    return secondsOf([&] { writeAll(&manager, output); });
  };
}

template <typename Manager>
Run cycleRun(const Input& input, const std::string& output) {
  return [&input, output] {
    Managers<Manager> managers(input);
    return secondsOf([&] {
      managers.read(input);
      managers.older.compSchemas(&managers.newer);
      managers.older.checkCollisions(&managers.newer);
      reports(&managers.older);
      managers.newer.mergeSchemas(&managers.older);
      writeAll(&managers.newer, output);
    });
  };
}

// ---- The list ----

double allDefinitions(const Input& input) { return sumOf(input.all, &FileList::definitions); }
double allBytes(const Input& input) { return sumOf(input.all, &FileList::bytes); }
double plainDefinitions(const Input& input) { return sumOf(input.plain, &FileList::definitions); }
double plainBytes(const Input& input) { return sumOf(input.plain, &FileList::bytes); }

// Small inputs have no goal.
double peerGoalOf(const Input& input) {
  if (input.origin == Origin::kGenerated) {
    const double definitions = plainDefinitions(input);
    return definitions < 5000 ? 0 : definitions < 50000 ? 0.9 : 0.8;
  }
  return input.origin == Origin::kReal ? 1.0 : 0;
}

double floorGoalOf(const Input& input) { return peerGoalOf(input) > 0 ? 1.1 : 0; }

template <typename Manager>
Work::Maker plainReading() {
  return [](const Input& input, const std::string&) { return readingRun<Manager>(input.plain); };
}

template <typename Manager>
Work::Maker fullReading() {
  return [](const Input& input, const std::string&) { return readingRun<Manager>(input.all); };
}

// Files of the same names with nothing in them: what there is to do for a file whatever its size.
template <typename Manager>
Work::Maker emptyReading() {
  return [](const Input& input, const std::string& output) {
    std::vector<FileList> lists = input.all;
    for (FileList& list : lists) {
      list.directory = output;
      for (const std::string& name : list.names) {
        writeText(output + "/" + name, "");
      }
    }
    return readingRun<Manager>(lists);
  };
}

template <typename Manager>
Work::Maker comparison() {
  return [](const Input& input, const std::string&) {
    return pairRun<Manager>(input, false,
                            [](Manager* older, Manager* newer) { older->compSchemas(newer); });
  };
}

template <typename Manager>
Work::Maker check() {
  return [](const Input& input, const std::string&) {
    return pairRun<Manager>(input, false,
                            [](Manager* older, Manager* newer) { older->checkCollisions(newer); });
  };
}

template <typename Manager>
Work::Maker merge() {
  return [](const Input& input, const std::string&) {
    return pairRun<Manager>(input, true,
                            [](Manager* older, Manager* newer) { newer->mergeSchemas(older); });
  };
}

Work readingOfTypesAndClasses() {
  Work work;
  work.name = "read attribute types and object classes";
  work.library = plainReading<SchemaManager>();
  work.floor = plainReading<minimal::Schema>();
  work.peer = [](const Input& input, const std::string&) { return peerRun(input.plain); };
  work.peerGoal = peerGoalOf;
  work.floorGoal = floorGoalOf;
  work.definitions = plainDefinitions;
  work.bytes = plainBytes;
  return work;
}

Work workOf(const char* name, double floorGoal, Work::Maker library, Work::Maker floor) {
  Work work;
  work.name = name;
  work.floorGoal = [floorGoal](const Input&) { return floorGoal; };
  work.library = std::move(library);
  work.floor = std::move(floor);
  work.definitions = allDefinitions;
  work.bytes = allBytes;
  return work;
}

Work readingOfEmptyFiles() {
  const auto nothing = [](const Input&) { return 0.0; };
  Work work;
  work.name = "read as many empty files";
  work.library = emptyReading<SchemaManager>();
  work.floor = emptyReading<minimal::Schema>();
  work.isMeasuredOn = [](const Input& input) { return input.origin == Origin::kExample; };
  work.definitions = nothing;
  work.bytes = nothing;
  return work;
}

std::vector<Work> makeWorks() {
  std::vector<Work> list;
  list.push_back(readingOfTypesAndClasses());
  list.push_back(
      workOf("read all files", 1.25, fullReading<SchemaManager>(), fullReading<minimal::Schema>()));
  list.push_back(readingOfEmptyFiles());
  list.push_back(workOf(
      "`lexan()` over all files", 1.5,
      [](const Input& input, const std::string&) { return tokenRun(input, countTokens); },
      [](const Input& input, const std::string&) {
        return tokenRun(input, minimal::Schema::countTokens);
      }));
  list.push_back(workOf("`writeFile`, all files", 1.3, writingRun<SchemaManager>,
                        writingRun<minimal::Schema>));
  list.push_back(
      workOf("`compSchemas`", 1.5, comparison<SchemaManager>(), comparison<minimal::Schema>()));
  list.push_back(workOf("`checkCollisions`", 3, check<SchemaManager>(), check<minimal::Schema>()));
  list.push_back(workOf("`mergeSchemas`", 2, merge<SchemaManager>(), merge<minimal::Schema>()));
  list.back().isMeasuredOn = mayBeMerged;
  list.push_back(workOf("whole cycle", 1.3, cycleRun<SchemaManager>, cycleRun<minimal::Schema>));
  list.back().isMeasuredOn = mayBeMerged;
  return list;
}

// ---- Verification ----

// What an operation leaves behind, as texts with their names.
using Outcome = std::vector<std::pair<std::string, std::string>>;

template <typename Manager>
void noteState(const std::string& label, Managers<Manager>* managers, const std::string& output,
               Outcome* outcome) {
  outcome->emplace_back(label + ", tables of the older", reports(&managers->older));
  outcome->emplace_back(label + ", tables of the newer", reports(&managers->newer));
  for (Manager* const manager : {&managers->older, &managers->newer}) {
    writeAll(manager, output);
    for (const std::string& name : kWritable) {
      outcome->emplace_back(label + ", " + name, readText(output + "/" + name));
    }
  }
}

template <typename Manager>
Outcome outcomeOf(const Input& input, const std::string& output) {
  Outcome outcome;
  const auto note = [&](const std::string& label, auto action) {
    // Left to the end of the process: after a merge both hold the same definitions, and must not
    // both be destroyed.
    auto* const managers = new Managers<Manager>(input);
    managers->read(input);
    const bool isDone = action(&managers->older, &managers->newer);
    outcome.emplace_back(label, isDone ? "done" : "failed");
    noteState(label, managers, output, &outcome);
  };
  note("reading", [](Manager*, Manager*) { return true; });
  note("comparison", [](Manager* older, Manager* newer) { return older->compSchemas(newer); });
  note("check", [](Manager* older, Manager* newer) { return older->checkCollisions(newer); });
  if (!mayBeMerged(input)) {
    return outcome;
  }
  note("merge", [](Manager* older, Manager* newer) {
    return older->compSchemas(newer) && newer->mergeSchemas(older);
  });
  note("cycle", [](Manager* older, Manager* newer) {
    return older->compSchemas(newer) && older->checkCollisions(newer) && newer->mergeSchemas(older);
  });
  return outcome;
}

std::string verifyTokens(const Input& input) {
  for (const FileList& list : input.all) {
    for (const std::string& name : list.names) {
      if (countTokens(list.directory, name) != minimal::Schema::countTokens(list.directory, name)) {
        return "the number of tokens of " + name;
      }
    }
  }
  return "";
}

std::string verifyPeer(const Input& input) {
  for (const FileList& list : input.plain) {
    Peer peer;
    for (const std::string& name : list.names) {
      peer.readFile(list.directory + "/" + name);
    }
    if (peer.refused() != 0 || static_cast<double>(peer.definitions()) != list.definitions) {
      return "libldap refuses " + std::to_string(peer.refused()) + " of " +
             std::to_string(peer.definitions()) + " definitions in " + list.directory;
    }
  }
  return "";
}

}  // namespace

bool mayBeMerged(const Input& input) { return input.origin != Origin::kExample; }

const std::vector<Work>& works() {
  static const std::vector<Work> kWorks = makeWorks();
  return kWorks;
}

std::string verify(const Input& input, const TemporaryFolder& folder) {
  const Outcome library = outcomeOf<SchemaManager>(input, folder.folder("library"));
  const Outcome floor = outcomeOf<minimal::Schema>(input, folder.folder("floor"));
  for (std::size_t i = 0; i < library.size(); ++i) {
    if (library[i].second != floor[i].second) {
      writeText(folder.path() + "-library", library[i].second);
      writeText(folder.path() + "-floor", floor[i].second);
      return library[i].first + ", see " + folder.path() + "-library and -floor";
    }
    if (library[i].second == "failed") {
      return library[i].first + " fails";
    }
  }
  const std::string tokens = verifyTokens(input);
  return tokens.empty() ? verifyPeer(input) : tokens;
}

}  // namespace bench
