// The options that `diff`, `plan` and `migrate` have in common: what a plan is made from.

#ifndef SCHEMA_MIGRATE_PLAN_OPTIONS_H
#define SCHEMA_MIGRATE_PLAN_OPTIONS_H

#include <libschema-migration/MigrationPlan.h>
#include <libschema-migration/SavedPlan.h>

#include <CLI/CLI.hpp>
#include <memory>
#include <optional>
#include <string>
#include <vector>

// Adds --max-input.
void addMaxInput(CLI::App* command, migration::ReadLimits* limits);

class PlanOptions {
 public:
  // Adds them to a command; they refer to this object.
  void declareInputs(CLI::App* command);
  void declareDecisions(CLI::App* command);
  // And --plan in the place of all of them, which are declared before.
  void declarePlan(CLI::App* command);

  // To be called when the command line was read, where --plan is declared. Takes over what the
  // saved plan was made by. Throws a Failure when it cannot be read, or there is neither it nor OLD
  // and NEW.
  void readPlan();

  // So that what outlives the run, a saved plan or a record, can be used from any directory.
  void makePathsAbsolute();

  // The options as a command line gives them again, a word or two words each: "--from /srv/old".
  std::vector<std::string> words() const;

  // Reads the inputs and works the plan out. Throws a Failure when an input cannot be had, and when
  // a saved plan does not hold any more.
  std::unique_ptr<migration::MigrationPlan> makePlan() const;

  migration::PlanRequest request;

 private:
  void refuseUnlessPlanHolds(const migration::MigrationPlan& again) const;

  std::string m_prefer;
  std::string m_plan;
  std::unique_ptr<migration::Source> m_source;  // of the saved plan
  std::optional<migration::SavedPlan> m_saved;
};

// The text as one word of a shell.
std::string shellWord(const std::string& text);

#endif  // SCHEMA_MIGRATE_PLAN_OPTIONS_H
