// verify: whether an output is what a saved plan says.

#include <CLI/CLI.hpp>

#include "Command.h"
#include "CommandLine.h"
#include "Messages.h"
#include "PlanOptions.h"
#include "VerifyRun.h"

namespace {

constexpr char kDescription[] = "tell whether an output is what a saved plan says";

constexpr char kFooter[] =
    R"(Reads PLAN, which plan --save wrote, makes it again from its inputs, and compares
DIR with it: every definition, clause by clause, and the file in which it stands;
every file, byte for byte, the two config files with NEW's; and what the rules of
check find in DIR that neither OLD nor NEW has. It does not matter in which of the
two layouts the migration wrote DIR. Nothing is changed.

What differs is told, a line each: a definition that is missing, was not planned,
is not what was planned, or stands in another file; a file that is missing, was not
planned, or differs from a line on. When PLAN does not hold any more, because an
input has changed or another version of this program made it, that is told, and of
DIR only the SHA-256 of its files can be compared.

Example:
  schema-migrate verify --plan plan.json /srv/migrated-schema

Exit codes:
  0  DIR is what PLAN says
  1  it is not, or PLAN does not hold any more
  2  the command line is wrong
  3  DIR cannot be read, or PLAN cannot be read or is no saved plan
  5  the report cannot be written)";

class VerifyCommand : public Command {
 public:
  CLI::App* declare(CLI::App* program) override {
    CLI::App* const verify = program->add_subcommand("verify", kDescription);
    verify->footer(kFooter);
    verify->add_option("--plan", m_options.plan, "the plan, as plan --save wrote it")
        ->required()
        ->check(notEmpty())
        ->type_name("PLAN");
    verify->add_option("DIR", m_options.directory, "the directory that was migrated to")
        ->required()
        ->check(notEmpty())
        ->type_name("");
    verify->add_option("--format", m_format, "text or json")
        ->check(oneOf({"text", "json"}))
        ->type_name("FORMAT");
    addMaxInput(verify, &m_options.limits);
    return verify;
  }

  int run(Console* console) override {
    const VerifyReport report = verify(m_options, console);
    console->print(m_format == "json" ? renderVerificationJson(report, m_options)
                                      : renderVerification(report, m_options));
    return report.isVerified() ? kDone : kFindings;
  }

 private:
  VerifyOptions m_options;
  std::string m_format = "text";
};

}  // namespace

std::unique_ptr<Command> makeVerifyCommand() { return std::make_unique<VerifyCommand>(); }
