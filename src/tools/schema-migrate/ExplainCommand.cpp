// explain: the page of a rule, or the list of all.

#include <libschema-migration/Rule.h>

#include <CLI/CLI.hpp>
#include <algorithm>
#include <cctype>

#include "Command.h"
#include "CommandLine.h"
#include "Messages.h"
#include "RulePage.h"

namespace {

constexpr char kDescription[] = "print the page of a rule";

constexpr char kFooter[] =
    R"(Prints the page of a rule of check: what it says, an example, why it matters and
how to mend it. Without RULE, prints the list of all rules.

Example:
  schema-migrate explain D208

Exit codes:
  0  printed
  2  the command line is wrong, or there is no such rule
  5  the page cannot be written)";

class ExplainCommand : public Command {
 public:
  CLI::App* declare(CLI::App* program) override {
    CLI::App* const explain = program->add_subcommand("explain", kDescription);
    explain->footer(kFooter);
    explain->add_option("RULE", m_rule, "identifier of a rule, such as D208, or its name")
        ->type_name("");
    return explain;
  }

  int run(Console* console) override {
    if (m_rule.empty()) {
      console->print(renderList(migration::allRules()));
      return kDone;
    }
    for (const migration::RuleInfo* const rule : migration::allRules()) {
      if (isCalled(*rule)) {
        console->print(renderPage(*rule));
        return kDone;
      }
    }
    throw Failure(kUsage,
                  errorLine("there is no rule " + m_rule + "; schema-migrate explain lists them"));
  }

 private:
  bool isCalled(const migration::RuleInfo& rule) const {
    std::string identifier = m_rule;
    for (char& c : identifier) {
      c = static_cast<char>(std::toupper(static_cast<unsigned char>(c)));
    }
    return identifier == rule.id || m_rule == rule.name;
  }

  std::string m_rule;
};

}  // namespace

std::unique_ptr<Command> makeExplainCommand() { return std::make_unique<ExplainCommand>(); }
