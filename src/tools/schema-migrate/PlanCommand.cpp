// plan: what a migration would do, and what is to be decided before it.

#include <libschema-migration/DecisionsTemplate.h>

#include <CLI/CLI.hpp>

#include "Command.h"
#include "CommandLine.h"
#include "HtmlOption.h"
#include "HtmlReport.h"
#include "Messages.h"
#include "Outputs.h"
#include "PlanFile.h"
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

--save writes the plan as one JSON document: every definition with what comes of
it and why, the SHA-256 of every file that it was made from, the options, and the
version of this program. migrate --plan carries it out as long as all of that
holds, from any directory, as the paths in it are absolute; verify compares an
output with it. The file appears whole or not at all. A saved plan that has the
name already is replaced, any other file is not. A plan that is not ready is
saved, too, and migrate refuses it.

Example:
  schema-migrate plan --base /srv/shipped --from /srv/ldap-old/schema \
      --to /srv/ldap-new/schema --decisions decisions.toml --save plan.json

Exit codes:
  0  ready: everything is decided
  2  the command line is wrong
  3  an input is missing, unreadable, too large or cannot be parsed
  4  something is undecided, or refused
  5  the report, or a file of --template, --save or --html, cannot be written)";

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
    plan->add_option("--save", m_save, "write the plan, for migrate --plan and for verify")
        ->check(notEmpty())
        ->type_name("PLAN");
    plan->add_option("--format", m_format, "text or json")
        ->check(oneOf({"text", "json"}))
        ->type_name("FORMAT");
    m_html.declare(plan);
    return plan;
  }

  int run(Console* console) override {
    m_html.open();
    if (!m_save.empty()) {
      refuseUnlessPlanCanBeSaved(m_save);
      m_options.makePathsAbsolute();
    }
    const std::unique_ptr<migration::MigrationPlan> plan = m_options.makePlan();
    if (!m_template.empty()) {
      writeNewFile(m_template, migration::decisionsTemplate(*plan));
    }
    if (!m_save.empty()) {
      savePlan(*plan, m_save);
    }
    const bool isJson = m_format == "json";
    DifferenceFilter all;
    all.isWithSame = true;
    const std::string document =
        isJson || m_html.isWanted() ? renderPlanJson(*plan, shownOf(*plan, all), "plan") : "";
    if (m_html.isWanted()) {
      m_html.write(renderPlanHtml(document));
    }
    const PlanStyle style{isColourWanted(), false};
    if (isJson) {
      console->print(document);
    } else {
      console->printText(renderFindings(*plan, Told::kFirst) +
                         renderDifferences(*plan, shownOf(*plan, {}), style) + "\n" +
                         renderReadiness(*plan, style));
    }
    std::string lines = warningsOf(*plan) + whyNotReady(*plan);
    console->complain(&lines);
    return plan->isReady() ? kDone : kRefused;
  }

 private:
  PlanOptions m_options;
  std::string m_template;
  std::string m_save;
  std::string m_format = "text";
  HtmlOption m_html;
};

}  // namespace

std::unique_ptr<Command> makePlanCommand() { return std::make_unique<PlanCommand>(); }
