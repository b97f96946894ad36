// completion: the command line, for a shell that completes it.

#include <CLI/CLI.hpp>

#include "Command.h"
#include "CommandLine.h"
#include "CommandModel.h"
#include "Completion.h"
#include "Messages.h"

namespace {

constexpr char kDescription[] = "print what a shell needs to complete command lines";

constexpr char kFooter[] =
    R"(Prints a script by which SHELL completes command lines of schema-migrate: commands,
options and what they take, rules, directories and files. What is installed is
found by the shells; this is for a program that was not installed, or elsewhere.

Example:
  source <(schema-migrate completion bash)

Exit codes:
  0  printed
  2  the command line is wrong
  5  the script cannot be written)";

class CompletionCommand : public Command {
 public:
  CLI::App* declare(CLI::App* program) override {
    CLI::App* const completion = program->add_subcommand("completion", kDescription);
    completion->footer(kFooter);
    completion->add_option("SHELL", m_shell, "bash, zsh or fish")
        ->required()
        ->check(oneOf({"bash", "zsh", "fish"}))
        ->type_name("");
    return completion;
  }

  void takeProgram(CLI::App* program) override { m_model = modelOf(program); }

  int run(Console* console) override {
    console->print(m_shell == "bash"  ? bashCompletion(m_model)
                   : m_shell == "zsh" ? zshCompletion(m_model)
                                      : fishCompletion(m_model));
    return kDone;
  }

 private:
  std::string m_shell;
  ProgramModel m_model;
};

}  // namespace

std::unique_ptr<Command> makeCompletionCommand() { return std::make_unique<CompletionCommand>(); }
