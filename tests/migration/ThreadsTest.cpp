// Eight threads, each with an installation of its own, and eight that look at the same one, have
// what one alone has. Built with the thread sanitizer where the compiler has it.

#include <gtest/gtest.h>

#include <array>
#include <string>
#include <thread>
#include <vector>

#include "Check.h"
#include "Comparison.h"
#include "Fields.h"
#include "Inheritance.h"

namespace {

using migration::CheckRequest;
using migration::Entry;
using migration::Failures;
using migration::Field;
using migration::Finding;
using migration::Installation;
using migration::Kind;

constexpr std::size_t kThreads = 8;

Installation read(std::size_t variant) {
  const std::string number = std::to_string(variant % 3);
  std::string classes = "objectclasses {\n( 2.5.6.0 NAME 'top' ABSTRACT )\n";
  std::string attributes = "# comment\n";
  for (int i = 0; i < 100; ++i) {
    const std::string name = "x" + std::to_string(i);
    attributes += "attributetypes=( 1." + number + "." + std::to_string(i) + " NAME '" + name +
                  "' SUP x" + std::to_string(i / 2 + 7) + " X-ORIGIN 'here' )\n";
    classes += "( 2." + std::to_string(i) + " NAME 'c" + std::to_string(i) +
               "' SUP top STRUCTURAL MUST ( " + name + " $ Lost" + number + " ) MAY cn )\n";
  }
  Failures failures;
  return Installation::fromTexts(
      "memory",
      {{"V3.user.at", attributes},
       {"V3.user.oc", classes + "}\n"},
       {"V3.orv.at", "ORVAttributetypes=( 1." + number + ".1 DBNAME ( 'x1' ) LENGTH 5 )\n"}},
      {}, &failures);
}

std::string resultsOf(const Installation& installation) {
  std::string text;
  CheckRequest request;
  request.installation = &installation;
  for (const Finding& finding : check(request)) {
    text += finding.file + ":" + std::to_string(finding.line) + " " + finding.rule + " " +
            finding.text + "\n";
  }
  for (const Entry& entry : installation.entries()) {
    text += describe(entry) + std::to_string(fieldsOf(*entry.kept).size()) + " " +
            std::to_string(installation.referrersOf(entry).size()) + " " +
            std::to_string(inheritedBy(installation, entry).size()) + "\n";
  }
  text += std::to_string(superiorTree(installation, Kind::kObjectClass).roots.size());
  for (const std::string& name : nearestNames(installation, "x100")) {
    text += " " + name;
  }
  return text + " " + std::to_string(compare(installation, installation).size());
}

template <typename Run>
void inAllThreads(const Run& run) {
  std::vector<std::thread> threads;
  for (std::size_t i = 0; i < kThreads; ++i) {
    threads.emplace_back([&run, i] { run(i); });
  }
  for (std::thread& thread : threads) {
    thread.join();
  }
}

TEST(Threads, WithInstallationsOfTheirOwn) {
  std::array<std::string, kThreads> results;
  inAllThreads([&](std::size_t i) { results[i] = resultsOf(read(i)); });
  for (std::size_t i = 0; i < kThreads; ++i) {
    EXPECT_EQ(resultsOf(read(i)), results[i]);
  }
}

TEST(Threads, WithOneInstallation) {
  const Installation installation = read(0);
  std::array<std::string, kThreads> results;
  inAllThreads([&](std::size_t i) { results[i] = resultsOf(installation); });
  for (const std::string& result : results) {
    EXPECT_EQ(resultsOf(read(0)), result);
  }
}

}  // namespace
