#include "ManagerGroup.h"

#include <sys/stat.h>
#include <unistd.h>

#include <array>
#include <cstddef>
#include <fstream>

#include "Rules.h"

namespace properties {

namespace {

// Some file systems write through when a file is emptied and filled again; a new one can wait.
void writeText(const std::string& path, const std::string& text) {
  ::unlink(path.c_str());
  std::ofstream out(path, std::ios::binary);
  out << text;
}

std::size_t sizeOf(const State& state) {
  return state.attrTable.size() + state.ocTable.size() + state.orvAttrTable.size();
}

// A run over three managers, with the rules' own view of what each holds.
class Run {
 public:
  Run(Choices* choices, const std::string& folder, RunCounts* counts)
      : m_choices(*choices), m_counts(*counts), m_group(folder) {
    const GeneratedDirectory first = anyDirectory(choices);
    read(first);
    read(relativeOf(first, choices));
    read(relativeOf(first, choices));
  }

  std::string operate();

 private:
  void read(const GeneratedDirectory& directory) {
    const SchemaManager* const reader = m_group.read(directory);
    m_states[m_group.managers().size() - 1] = stateOf(*reader);
  }

  std::string step();
  void compare(std::size_t self, std::size_t other);
  void merge(std::size_t self, std::size_t other);
  void check(std::size_t self, std::size_t other);
  void list(std::size_t self);
  void findOids(std::size_t self, std::size_t other);
  void dropOids(std::size_t self);
  void expect(bool expected, bool actual);

  SchemaManager* manager(std::size_t number) { return m_group.managers()[number].get(); }

  Choices& m_choices;
  RunCounts& m_counts;
  ManagerGroup m_group;
  std::array<State, 3> m_states;
  std::string m_problem;
  bool m_isOver = false;
};

std::string Run::operate() {
  std::string story;
  for (unsigned count = m_choices.below(9); count > 0 && !m_isOver; --count) {
    story += step() + "\n";
    for (std::size_t i = 0; i < m_states.size(); ++i) {
      m_problem += differenceOf(m_states[i], stateOf(*manager(i)));
    }
    if (!m_problem.empty()) {
      return story + m_problem;
    }
    ++m_counts.operations;
  }
  return "";
}

// Returns what was done.
std::string Run::step() {
  const auto done = [](const char* what, std::size_t self, std::size_t other) {
    return std::string(what) + " " + std::to_string(self) + " " + std::to_string(other);
  };
  const std::size_t self = m_choices.below(3);
  const std::size_t other = (self + 1 + m_choices.below(2)) % 3;
  switch (m_choices.below(8)) {
    case 0:
    case 1:
      compare(self, other);
      return done("compare", self, other);
    case 2:
    case 3:
      merge(self, other);
      return done("merge", self, other);
    case 4:
    case 5:
      check(self, other);
      return done("check", self, other);
    case 6:
      list(self);
      return done("list", self, self);
    default:
      findOids(self, other);
      dropOids(self);
      return done("find and drop OIDs", self, other);
  }
}

void Run::expect(bool expected, bool actual) {
  if (expected != actual) {
    m_problem += actual ? "its result is true\n" : "its result is false\n";
  }
}

void Run::compare(std::size_t self, std::size_t other) {
  const State reference = m_states[other];
  const std::size_t before = sizeOf(m_states[self]);
  bool result = false;
  switch (m_choices.below(5)) {
    case 0:
      compareAttributes(&m_states[self], reference);
      result = manager(self)->compAttrTables(manager(other));
      break;
    case 1:
      compareExtensions(&m_states[self], reference);
      result = manager(self)->compORVAttrTables(manager(other));
      break;
    case 2:
      compareClasses(&m_states[self], reference);
      result = manager(self)->compObjTables(manager(other));
      break;
    default:
      compareAll(&m_states[self], reference);
      result = manager(self)->compSchemas(manager(other));
  }
  m_counts.dropped += static_cast<unsigned>(before - sizeOf(m_states[self]));
  expect(true, result);
}

// After a failure the two managers share definitions, so that the run is over.
void Run::merge(std::size_t self, std::size_t other) {
  bool expected = false;
  bool result = false;
  switch (m_choices.below(5)) {
    case 0:
      expected = mergeAttributes(&m_states[self], &m_states[other]);
      result = manager(self)->mergeAttrs(manager(other));
      break;
    case 1:
      expected = mergeExtensions(&m_states[self], &m_states[other]);
      result = manager(self)->mergeORVAttrs(manager(other));
      break;
    case 2:
      expected = mergeClasses(&m_states[self], &m_states[other]);
      result = manager(self)->mergeObjClasses(manager(other));
      break;
    default:
      expected = mergeAll(&m_states[self], &m_states[other]);
      result = manager(self)->mergeSchemas(manager(other));
  }
  m_isOver = !expected;
  ++(expected ? m_counts.merges : m_counts.failedMerges);
  expect(expected, result);
}

void Run::check(std::size_t self, std::size_t other) {
  const std::size_t before = sizeOf(m_states[self]);
  bool result = false;
  switch (m_choices.below(5)) {
    case 0:
      checkClasses(&m_states[self], m_states[other]);
      result = manager(self)->checkObjClasses(manager(other));
      break;
    case 1:
      checkAttributes(&m_states[self], &m_states[other]);
      result = manager(self)->checkAttrs(manager(other));
      break;
    case 2:
      checkExtensions(&m_states[self], m_states[other]);
      result = manager(self)->checkORVAttrs(manager(other));
      break;
    default:
      checkAll(&m_states[self], &m_states[other]);
      result = manager(self)->checkCollisions(manager(other));
  }
  m_counts.dropped += static_cast<unsigned>(before - sizeOf(m_states[self]));
  const std::string reports = manager(self)->getOcTable() + manager(self)->getORVAttrTable() +
                              manager(self)->getAttrTable();
  expect(true, reports == reportsOf(m_states[self]));
  expect(true, result);
}

void Run::list(std::size_t self) {
  const bool isExclusion = m_choices.below(2) == 0;
  const std::string list = anyOidList(&m_choices);
  const std::string path = m_group.writeList(list);
  const std::size_t before = sizeOf(m_states[self]);
  if (isExclusion) {
    m_states[self].excludedOids.merge(oidsIn(list));
    expect(true, manager(self)->readExcludedOids(path) == 0);
    return;
  }
  withdraw(&m_states[self], oidsIn(list));
  m_counts.withdrawn += static_cast<unsigned>(before - sizeOf(m_states[self]));
  expect(true, manager(self)->modifySchema(path) == 0);
}

void Run::findOids(std::size_t self, std::size_t other) {
  for (const std::string& oid : oidsIn(anyOidList(&m_choices))) {
    const std::size_t file = fileOf(m_states[other], oid);
    const OidSet* const found = manager(self)->findOidInSet(manager(other), oid);
    expect(file == kFileNames.size(), found == nullptr);
    expect(true, found == nullptr || *found == m_states[self].fileSets[file]);
  }
}

void Run::dropOids(std::size_t self) {
  const OidSet oids = oidsIn(anyOidList(&m_choices));
  for (const std::string& oid : oids) {
    const bool isFound = dropFromFileSets(&m_states[self], oid) == 0;
    const int result = manager(self)->delOidFromFileSet(oid);
    expect(true, result == (isFound ? 0 : 32));
  }
}

}  // namespace

SchemaManager* ManagerGroup::read(const std::map<std::string, std::string>& files) {
  const std::string path = m_folder + "/" + std::to_string(m_managers.size());
  ::mkdir(path.c_str(), 0777);
  m_managers.push_back(std::make_unique<SchemaManager>(path));
  for (const auto& [name, text] : files) {
    writeText(path + "/" + name, text);
    m_managers.back()->readFile(name);
  }
  m_read.merge(definitionsOf(*m_managers.back()));
  return m_managers.back().get();
}

ReadResult ManagerGroup::readIn(const std::string& folder, const std::string& file) {
  m_managers.push_back(std::make_unique<SchemaManager>(folder));
  const int status = m_managers.back()->readFile(file);
  m_read.merge(definitionsOf(*m_managers.back()));
  return {m_managers.back().get(), status};
}

std::string ManagerGroup::writeList(const std::string& text) const {
  std::string path = m_folder + "/oids";
  writeText(path, text);
  return path;
}

std::string runOperations(Choices* choices, const std::string& folder, RunCounts* counts) {
  return Run(choices, folder, counts).operate();
}

}  // namespace properties
