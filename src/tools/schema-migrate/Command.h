// A command of the program: what it takes from the command line, and what it does. It calls the
// libraries, lets a report be rendered, and says how the run ends.

#ifndef SCHEMA_MIGRATE_COMMAND_H
#define SCHEMA_MIGRATE_COMMAND_H

#include <memory>
#include <string>
#include <vector>

#include "Console.h"

namespace CLI {
class App;
}

class Command {
 public:
  Command() = default;
  Command(const Command&) = delete;
  Command& operator=(const Command&) = delete;
  virtual ~Command() = default;

  // Adds the subcommand with its options, which refer to this object, and returns it.
  virtual CLI::App* declare(CLI::App* program) = 0;

  // The words of the command line, the program's name first, for a command that tells them.
  virtual void takeWords(const std::vector<std::string>& /*words*/) {}

  // The program with all commands declared, for a command that tells of them; it is gone when the
  // command runs.
  virtual void takeProgram(CLI::App* /*program*/) {}

  // Returns the exit code, or throws a Failure.
  virtual int run(Console* console) = 0;
};

// Each of the commands.
std::unique_ptr<Command> makeCheckCommand();
std::unique_ptr<Command> makeCompletionCommand();
std::unique_ptr<Command> makeDecideCommand();
std::unique_ptr<Command> makeDiffCommand();
std::unique_ptr<Command> makeExplainCommand();
std::unique_ptr<Command> makeFleetCommand();
std::unique_ptr<Command> makeMigrateCommand();
std::unique_ptr<Command> makePlanCommand();
std::unique_ptr<Command> makeShowCommand();
std::unique_ptr<Command> makeVerifyCommand();

#endif  // SCHEMA_MIGRATE_COMMAND_H
