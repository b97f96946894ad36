// Operations over whole folders. <operation>/<case>/ holds the input folders and OID lists, and
// expected/ every file that comes out, compared byte for byte. SCHEMA_UPDATE_GOLDEN=1 rewrites
// expected/.

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "Files.h"
#include "SchemaManager.h"
#include "UnfreedDefinitions.h"

using namespace support;

namespace {

namespace fs = std::filesystem;

constexpr const char* kFiles[] = {"V3.user.oc",        "V3.user.at",   "V3.orv.oc",
                                  "V3.orv.at",         "V3.system.oc", "V3.system.at",
                                  "V3.modifiedschema", "V3.config.at", "V3.config.oc"};

// What comes out of a case: text by file name. "results.txt" has a line for each call that says how
// it went.
class Outcome {
 public:
  void add(const std::string& file, const std::string& text) { m_files[file] += text; }
  void result(const std::string& call, int value) {
    add("results.txt", call + ": " + std::to_string(value) + "\n");
  }
  const std::map<std::string, std::string>& files() const { return m_files; }

 private:
  std::map<std::string, std::string> m_files;
};

// Reads what there is of the nine files.
std::unique_ptr<SchemaManager> readFolder(const fs::path& folder, Outcome* outcome) {
  auto manager = std::make_unique<SchemaManager>(folder.string());
  for (const char* file : kFiles) {
    if (fs::exists(folder / file)) {
      outcome->result("readFile " + (folder.filename() / file).string(), manager->readFile(file));
    }
  }
  return manager;
}

// Writes the files that have a set, each of which is part of the outcome.
void writeFolder(SchemaManager* manager, Outcome* outcome) {
  const TemporaryDirectory directory;
  for (const char* file : kFiles) {
    const int result = manager->writeFile(directory.path(), file);
    outcome->result(std::string("writeFile ") + file, result);
    if (result == 0) {
      outcome->add(file, readWholeFile(directory.file(file)));
    }
  }
}

void printTables(SchemaManager* manager, const std::string& file, Outcome* outcome) {
  outcome->add(file, standardOutputOf([&] {
                 manager->dumpAttrTable();
                 manager->dumpORVAttrTable();
                 manager->dumpOcTable();
               }));
}

void reportCollisions(SchemaManager* manager, Outcome* outcome) {
  outcome->add("report.txt", manager->getOcTable());
  outcome->add("report.txt", manager->getAttrTable());
  outcome->add("report.txt", manager->getORVAttrTable());
}

void readExcludedOids(SchemaManager* manager, const fs::path& input, Outcome* outcome) {
  const fs::path list = input / "excluded-oids.txt";
  if (fs::exists(list)) {
    outcome->result("readExcludedOids", manager->readExcludedOids(list.string()));
  }
}

void withdraw(SchemaManager* manager, const fs::path& input, Outcome* outcome) {
  const fs::path list = input / "withdraw.txt";
  if (fs::exists(list)) {
    outcome->result("modifySchema", manager->modifySchema(list.string()));
    outcome->result("isModFileEmpty", manager->isModFileEmpty() ? 1 : 0);
  }
}

// After a failed merge the two share definitions, so that neither is destroyed.
void keepForGood(std::unique_ptr<SchemaManager> first, std::unique_ptr<SchemaManager> second) {
  static auto* kept = new std::vector<SchemaManager*>;
  kept->push_back(first.release());
  kept->push_back(second.release());
}

// ---- The operations ----

void readAndWrite(const fs::path& input, Outcome* outcome) {
  const auto manager = readFolder(input / "input", outcome);
  writeFolder(manager.get(), outcome);
  printTables(manager.get(), "tables.txt", outcome);
  // What was written reads back as the same, and is written again as the same.
  const TemporaryDirectory written;
  Outcome again;
  for (const auto& [file, text] : outcome->files()) {
    if (file.compare(0, 3, "V3.") == 0) {
      written.write(file, text);
    }
  }
  writeFolder(readFolder(written.path(), &again).get(), &again);
  for (const auto& [file, text] : again.files()) {
    if (file.compare(0, 3, "V3.") == 0) {
      EXPECT_EQ(text, outcome->files().at(file)) << file << " changes when it is read and written";
    }
  }
}

void compare(const fs::path& input, Outcome* outcome) {
  const UnfreedDefinitions unfreed;
  const auto manager = readFolder(input / "this", outcome);
  const auto reference = readFolder(input / "reference", outcome);
  readExcludedOids(manager.get(), input, outcome);
  outcome->result("compSchemas", manager->compSchemas(reference.get()) ? 1 : 0);
  writeFolder(manager.get(), outcome);
  printTables(manager.get(), "tables.txt", outcome);
}

void merge(const fs::path& input, Outcome* outcome) {
  const UnfreedDefinitions unfreed;
  auto manager = readFolder(input / "this", outcome);
  auto source = readFolder(input / "source", outcome);
  const bool isMerged = manager->mergeSchemas(source.get());
  outcome->result("mergeSchemas", isMerged ? 1 : 0);
  writeFolder(manager.get(), outcome);
  printTables(manager.get(), "tables.txt", outcome);
  printTables(source.get(), "tables-of-source.txt", outcome);
  if (!isMerged) {
    keepForGood(std::move(manager), std::move(source));
  }
}

void check(const fs::path& input, Outcome* outcome) {
  const UnfreedDefinitions unfreed;
  const auto manager = readFolder(input / "this", outcome);
  const auto reference = readFolder(input / "reference", outcome);
  outcome->result("checkCollisions", manager->checkCollisions(reference.get()) ? 1 : 0);
  reportCollisions(manager.get(), outcome);
}

void modify(const fs::path& input, Outcome* outcome) {
  const UnfreedDefinitions unfreed;
  const auto manager = readFolder(input / "this", outcome);
  withdraw(manager.get(), input, outcome);
  writeFolder(manager.get(), outcome);
  printTables(manager.get(), "tables.txt", outcome);
}

// A whole run: what the old installation adds to the new one or changes in it.
void migrate(const fs::path& input, Outcome* outcome) {
  const UnfreedDefinitions unfreed;
  auto carried = readFolder(input / "old", outcome);
  auto target = readFolder(input / "new", outcome);
  readExcludedOids(carried.get(), input, outcome);
  withdraw(carried.get(), input, outcome);
  // The check destroys, so it has managers of its own.
  Outcome unused;
  const auto checked = readFolder(input / "old", &unused);
  const auto reference = readFolder(input / "new", &unused);
  outcome->result("checkCollisions", checked->checkCollisions(reference.get()) ? 1 : 0);
  reportCollisions(checked.get(), outcome);
  outcome->result("compSchemas", carried->compSchemas(target.get()) ? 1 : 0);
  printTables(carried.get(), "tables-carried.txt", outcome);
  const bool isMerged = target->mergeSchemas(carried.get());
  outcome->result("mergeSchemas", isMerged ? 1 : 0);
  writeFolder(target.get(), outcome);
  if (!isMerged) {
    keepForGood(std::move(carried), std::move(target));
  }
}

struct Operation {
  const char* folder;
  void (*run)(const fs::path& input, Outcome* outcome);
};

const Operation kOperations[] = {
    {"read-write", readAndWrite}, {"compare", compare}, {"merge", merge}, {"check", check},
    {"modify", modify},           {"migrate", migrate}};

// ---- The cases ----

struct Case {
  const Operation* operation;
  fs::path folder;
};

void PrintTo(const Case& golden, std::ostream* out) {
  *out << golden.operation->folder << "/" << golden.folder.filename().string();
}

std::vector<Case> casesOf(const Operation& operation) {
  std::vector<Case> cases;
  for (const auto& entry : fs::directory_iterator(fs::path(GOLDEN_DIRECTORY) / operation.folder)) {
    cases.push_back({&operation, entry.path()});
  }
  std::sort(cases.begin(), cases.end(),
            [](const Case& one, const Case& other) { return one.folder < other.folder; });
  return cases;
}

std::vector<Case> allCases() {
  std::vector<Case> cases;
  for (const Operation& operation : kOperations) {
    const std::vector<Case> some = casesOf(operation);
    cases.insert(cases.end(), some.begin(), some.end());
  }
  return cases;
}

std::string nameOf(const testing::TestParamInfo<Case>& golden) {
  std::string name =
      golden.param.operation->folder + ("_" + golden.param.folder.filename().string());
  std::replace(name.begin(), name.end(), '-', '_');
  return name;
}

void rewrite(const fs::path& folder, const std::map<std::string, std::string>& files) {
  fs::remove_all(folder);
  fs::create_directory(folder);
  for (const auto& [file, text] : files) {
    std::ofstream(folder / file, std::ios::binary) << text;
  }
}

bool isUpdating() {
  const char* update = std::getenv("SCHEMA_UPDATE_GOLDEN");
  return update != nullptr && std::string(update) == "1";
}

class Golden : public testing::TestWithParam<Case> {};

}  // namespace

TEST_P(Golden, OutcomeIsTheExpectedOne) {
  Outcome outcome;
  GetParam().operation->run(GetParam().folder, &outcome);
  const fs::path expected = GetParam().folder / "expected";
  if (isUpdating()) {
    rewrite(expected, outcome.files());
  }
  std::vector<std::string> names;
  for (const auto& entry : fs::directory_iterator(expected)) {
    names.push_back(entry.path().filename().string());
  }
  std::sort(names.begin(), names.end());
  std::vector<std::string> made;
  for (const auto& [file, text] : outcome.files()) {
    made.push_back(file);
    if (fs::exists(expected / file)) {
      EXPECT_EQ(text, readWholeFile((expected / file).string())) << file;
    }
  }
  EXPECT_EQ(made, names);
}

INSTANTIATE_TEST_SUITE_P(Cases, Golden, testing::ValuesIn(allCases()), nameOf);

TEST(GoldenFolders, EveryOperationHasCases) {
  for (const Operation& operation : kOperations) {
    EXPECT_GE(casesOf(operation).size(), 2U) << operation.folder;
  }
}
