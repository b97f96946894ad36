// The options that `diff`, `plan` and `migrate` have in common: what a plan is made from.

#ifndef SCHEMA_MIGRATE_PLAN_OPTIONS_H
#define SCHEMA_MIGRATE_PLAN_OPTIONS_H

#include <libschema-migration/MigrationPlan.h>

#include <CLI/CLI.hpp>
#include <memory>
#include <string>
#include <vector>

class PlanOptions {
 public:
  // Adds them to a command; they refer to this object.
  void declareInputs(CLI::App* command);
  void declareDecisions(CLI::App* command);

  // So that what outlives the run, a saved plan or a record, can be used from any directory.
  void makePathsAbsolute();

  // The options as a command line gives them again, a word or two words each: "--from /srv/old".
  std::vector<std::string> words() const;

  // Reads the inputs and works the plan out. Throws a Failure when an input cannot be had.
  std::unique_ptr<migration::MigrationPlan> makePlan() const;

  migration::PlanRequest request;

 private:
  std::string m_prefer;
};

// The text as one word of a shell.
std::string shellWord(const std::string& text);

#endif  // SCHEMA_MIGRATE_PLAN_OPTIONS_H
