// Installations are read, written and migrated, and libldap compares what comes out with what went
// in. The examples are always tried; further pairs can be named in the environment variable
// LIBSCHEMA_INSTALLATION_PAIRS as OLD:NEW[:OLD:NEW...].

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>
#include <filesystem>
#include <sstream>

#include "Files.h"
#include "PeerDefinitions.h"
#include "SchemaManager.h"
#include "UnfreedDefinitions.h"

namespace {

constexpr const char* kFilesWithSets[] = {"V3.system.at",     "V3.system.oc", "V3.orv.at",
                                          "V3.orv.oc",        "V3.user.at",   "V3.user.oc",
                                          "V3.modifiedschema"};

struct Pair {
  std::string oldOne;
  std::string newOne;
};

std::vector<Pair> installationPairs() {
  std::vector<Pair> pairs{{EXAMPLES_DIRECTORY "/old", EXAMPLES_DIRECTORY "/new"}};
  const char* const more = std::getenv("LIBSCHEMA_INSTALLATION_PAIRS");
  std::istringstream names(more == nullptr ? "" : more);
  Pair pair;
  while (std::getline(names, pair.oldOne, ':') && std::getline(names, pair.newOne, ':')) {
    pairs.push_back(pair);
  }
  return pairs;
}

void readAll(SchemaManager* manager, const std::string& directory) {
  for (const char* const name : kFilesWithSets) {
    if (support::fileExists(directory + "/" + name)) {
      ASSERT_EQ(0, manager->readFile(name)) << directory << "/" << name;
    }
  }
}

void writeAll(SchemaManager* manager, const std::string& directory) {
  for (const char* const name : kFilesWithSets) {
    ASSERT_EQ(0, manager->writeFile(directory, name)) << name;
  }
}

// Definitions of the config files are in no set and are not written.
void dropConfigFiles(const std::string& directory) {
  std::filesystem::remove(directory + "/V3.config.at");
  std::filesystem::remove(directory + "/V3.config.oc");
}

// Every definition of `expected` is in `actual` with the same fields: one of its texts, where the
// input defines it in more than one way.
void expectKept(const peer::Definitions& expected, const peer::Definitions& actual) {
  for (const auto& [key, texts] : expected) {
    const auto found = actual.find(key);
    if (found == actual.end()) {
      ADD_FAILURE() << key << " is lost:" << texts.front();
      continue;
    }
    ASSERT_EQ(1U, found->second.size()) << key;
    EXPECT_NE(texts.end(), std::find(texts.begin(), texts.end(), found->second.front()))
        << key << found->second.front() << "\nwas" << texts.front();
  }
}

support::TemporaryDirectory& copyWithoutConfig(support::TemporaryDirectory* to,
                                               const std::string& from) {
  std::filesystem::copy(from, to->path());
  dropConfigFiles(to->path());
  return *to;
}

TEST(LdapParser, AcceptsWrittenInstallationsWithTheFieldsOfTheInput) {
  for (const Pair& pair : installationPairs()) {
    for (const std::string& directory : {pair.oldOne, pair.newOne}) {
      SCOPED_TRACE(directory);
      support::TemporaryDirectory input;
      support::TemporaryDirectory output;
      support::TemporaryDirectory again;
      copyWithoutConfig(&input, directory);
      SchemaManager manager(input.path());
      ASSERT_NO_FATAL_FAILURE(readAll(&manager, input.path()));
      ASSERT_NO_FATAL_FAILURE(writeAll(&manager, output.path()));
      const peer::Definitions before = peer::readInstallation(input.path());
      const peer::Definitions after = peer::readInstallation(output.path());
      EXPECT_EQ(before.size(), after.size());
      ASSERT_FALSE(before.empty());
      expectKept(before, after);

      SchemaManager second(output.path());
      ASSERT_NO_FATAL_FAILURE(readAll(&second, output.path()));
      ASSERT_NO_FATAL_FAILURE(writeAll(&second, again.path()));
      for (const char* const name : kFilesWithSets) {
        EXPECT_EQ(support::readWholeFile(output.file(name)),
                  support::readWholeFile(again.file(name)))
            << name;
      }
    }
  }
}

// Each written definition has the fields that one of the two installations gave it, and none that
// the target had is lost.
void expectMigrates(const std::string& from, const std::string& to) {
  SCOPED_TRACE(from + " into " + to);
  support::TemporaryDirectory oldCopy;
  support::TemporaryDirectory newCopy;
  support::TemporaryDirectory output;
  copyWithoutConfig(&oldCopy, from);
  copyWithoutConfig(&newCopy, to);
  const support::UnfreedDefinitions unfreed;
  SchemaManager source(oldCopy.path());
  SchemaManager target(newCopy.path());
  // What only V3.modifiedschema has cannot be merged.
  std::filesystem::remove(oldCopy.file("V3.modifiedschema"));
  ASSERT_NO_FATAL_FAILURE(readAll(&source, oldCopy.path()));
  ASSERT_NO_FATAL_FAILURE(readAll(&target, newCopy.path()));
  ASSERT_TRUE(source.compSchemas(&target));
  ASSERT_TRUE(target.mergeSchemas(&source));
  ASSERT_NO_FATAL_FAILURE(writeAll(&target, output.path()));

  const peer::Definitions oldOnes = peer::readInstallation(oldCopy.path());
  const peer::Definitions newOnes = peer::readInstallation(newCopy.path());
  const peer::Definitions written = peer::readInstallation(output.path());
  ASSERT_FALSE(written.empty());
  for (const auto& [key, texts] : written) {
    peer::Definitions either;
    for (const peer::Definitions* const input : {&oldOnes, &newOnes}) {
      const auto found = input->find(key);
      if (found != input->end()) {
        either[key].insert(either[key].end(), found->second.begin(), found->second.end());
      }
    }
    ASSERT_EQ(1U, either.count(key)) << key << texts.front();
    expectKept(either, written);
  }
}

TEST(LdapParser, AcceptsMigratedInstallationsWithTheFieldsOfEitherInput) {
  for (const Pair& pair : installationPairs()) {
    ASSERT_NO_FATAL_FAILURE(expectMigrates(pair.oldOne, pair.newOne));
    ASSERT_NO_FATAL_FAILURE(expectMigrates(pair.newOne, pair.oldOne));
  }
}

}  // namespace
