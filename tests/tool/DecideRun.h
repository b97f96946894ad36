// Installations with something of each kind to decide, and runs of `decide` on them.

#ifndef LIBSCHEMA_TESTS_DECIDE_RUN_H
#define LIBSCHEMA_TESTS_DECIDE_RUN_H

#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "Files.h"
#include "TerminalRun.h"
#include "ToolRun.h"

inline std::string attribute(const std::string& rest) {
  return "attributetypes=( " + rest + " )\n";
}
inline std::string shape(const std::string& rest) { return "objectclasses=( " + rest + " )\n"; }
inline std::string extension(const std::string& rest) {
  return "ORVAttributetypes=( " + rest + " )\n";
}

// In this order: `gone` was removed by the release and changed by the site, `badge` has a name that
// is x's in NEW, and the kind of `c` was changed in two ways and its MAY by both; `guard` refers to
// badge.
class Deciding : public testing::Test {
 protected:
  Deciding() {
    m_folder.install("base", {{"V3.system.at", attribute("1.1 NAME 'a' USAGE userApplications") +
                                                   attribute("1.9 NAME 'gone' USAGE "
                                                             "userApplications")},
                              {"V3.system.oc", shape("2.1 NAME 'c' ABSTRACT MAY ( a )")}});
    m_folder.install(
        "old",
        {{"V3.system.at", attribute("1.1 NAME 'a' USAGE userApplications") +
                              attribute("1.9 NAME 'gone' SINGLE-VALUE USAGE userApplications")},
         {"V3.user.at", attribute("9.1 NAME 'badge' USAGE userApplications") +
                            extension("9.1 DBNAME ( 'badge' 'badge' ) LENGTH 8")},
         {"V3.system.oc", shape("2.1 NAME 'c' AUXILIARY MAY ( a $ gone )")},
         {"V3.user.oc", shape("9.2 NAME 'guard' STRUCTURAL MUST ( badge )")}});
    m_folder.install(
        "new", {{"V3.system.at", attribute("1.1 NAME 'a' USAGE userApplications") +
                                     attribute("1.5 NAME ( 'x' 'badge' ) USAGE userApplications")},
                {"V3.system.oc", shape("2.1 NAME 'c' STRUCTURAL MAY ( x $ a )")}});
  }

  static std::vector<std::string> command(const std::vector<std::string>& more = {}) {
    std::vector<std::string> words = {"decide", "--from", "old",         "--to",  "new",
                                      "--base", "base",   "--decisions", "d.toml"};
    words.insert(words.end(), more.begin(), more.end());
    return words;
  }

  // A run that has come to its first question.
  std::unique_ptr<TerminalRun> started(const TerminalSettings& settings = {},
                                       const std::vector<std::string>& more = {}) const {
    auto run = std::make_unique<TerminalRun>(m_folder, command(more), settings);
    run->until("Your choice: ");
    return run;
  }

  // Types an answer and its reason, and waits for the next question, or the end.
  static std::string answer(TerminalRun* run, const std::string& letter,
                            const std::string& reason = "") {
    run->type(letter);
    std::string text = run->until("Reason (Enter for none): ");
    run->type(reason);
    return onScreen(text + run->until("\r\n\r\n"));
  }

  // The file, with each fingerprint as "…".
  std::string file(const std::string& name = "d.toml") const {
    if (!support::fileExists(m_folder.file(name))) {
      return "(no file)";
    }
    std::string text = support::readWholeFile(m_folder.file(name));
    for (std::size_t at = 0; (at = text.find("sha256:", at)) != std::string::npos; at += 3) {
      text.replace(at, 7 + 64, "...");
    }
    return text;
  }

  // What `plan` has to say of the decisions: its exit code and complaints.
  std::string planned() const {
    const ToolResult result = m_folder.run({"plan", "--from", "@/old", "--to", "@/new", "--base",
                                            "@/base", "--decisions", "@/d.toml"});
    return std::to_string(result.exitCode) + "\n" + result.err;
  }

  ToolFolder m_folder;
};

#endif  // LIBSCHEMA_TESTS_DECIDE_RUN_H
