// plan: what a migration would do, and what is to be decided before it.

#include <libschema-migration/DecisionsTemplate.h>

#include <CLI/CLI.hpp>

#include "Command.h"
#include "CommandLine.h"
#include "Messages.h"
#include "NewFile.h"
#include "PlanOptions.h"
#include "PlanReport.h"
#include "Terminal.h"

namespace {

constexpr char kDescription[] = "tell what a migration would do, and what is undecided";

constexpr char kFooter[] =
    R"(Works out what a migration of OLD's schema to NEW would do: what comes of every
definition and why, what nobody has decided yet, and what the rules of check say of
the inputs and of the result. Nothing is migrated.

With BASE, the schema as the old release shipped it, what only the site changed is
carried over, and what only the release changed stays. What both changed is merged
clause by clause; a clause that both changed in two ways has to be decided.

--template writes a file with an entry for each definition that is undecided: fill it
in, and give it to --decisions.

Example:
  schema-migrate plan --base /srv/shipped --from /srv/ldap-old/schema \
      --to /srv/ldap-new/schema --template decisions.toml

Exit codes:
  0  ready: everything is decided
  2  the command line is wrong
  3  an input is missing, unreadable, too large or cannot be parsed
  4  something is undecided, or refused
  5  the report, or the file for --template, cannot be written)";

class PlanCommand : public Command {
 public:
  CLI::App* declare(CLI::App* program) override {
    CLI::App* const plan = program->add_subcommand("plan", kDescription);
    plan->footer(kFooter);
    m_options.declareInputs(plan);
    m_options.declareDecisions(plan);
    plan->add_option("--template", m_template,
                     "write a decisions file to fill in; FILE must not exist")
        ->check(notEmpty())
        ->type_name("FILE");
    plan->add_option("--format", m_format, "text or json")
        ->check(oneOf({"text", "json"}))
        ->type_name("FORMAT");
    return plan;
  }

  int run(Console* console) override {
    const std::unique_ptr<migration::MigrationPlan> plan = m_options.makePlan();
    if (!m_template.empty()) {
      writeNewFile(m_template, migration::decisionsTemplate(*plan));
    }
    DifferenceFilter filter;
    filter.isWithSame = m_format == "json";
    const ShownDifferences shown = shownOf(*plan, filter);
    const PlanStyle style{isColourWanted(), false};
    if (m_format == "json") {
      console->print(renderPlanJson(*plan, shown, "plan"));
    } else {
      console->printText(renderDifferences(*plan, shown, style) + "\n" +
                         renderReadiness(*plan, style));
    }
    std::string lines = whyNotReady(*plan);
    console->complain(&lines);
    return plan->isReady() ? kDone : kRefused;
  }

 private:
  PlanOptions m_options;
  std::string m_template;
  std::string m_format = "text";
};

}  // namespace

std::unique_ptr<Command> makePlanCommand() { return std::make_unique<PlanCommand>(); }
