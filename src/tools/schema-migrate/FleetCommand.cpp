// fleet: what the saved plans of many installations say together.

#include <libschema-migration/FleetTemplate.h>

#include <CLI/CLI.hpp>
#include <memory>
#include <utility>

#include "Command.h"
#include "CommandLine.h"
#include "FleetNames.h"
#include "FleetReport.h"
#include "HtmlOption.h"
#include "HtmlReport.h"
#include "Messages.h"
#include "Outputs.h"
#include "PlanFile.h"
#include "Progress.h"
#include "Terminal.h"

namespace {

constexpr char kDescription[] = "tell what the plans of many installations say together";

constexpr char kFooter[] =
    R"(Reads the plans of many installations, which plan --save wrote, and tells who has
which definition, unchanged or changed in how many ways, what is undecided
anywhere, and which decisions settle most: the same question, with the same texts,
is asked once, and told with the installations where it is asked and how many are
ready once it is answered.

A PLAN is a file, or a directory with plan.json in it, as migrate --record writes
it. An installation is called by the end of that path that no other has, or NAME.

--template writes one decisions file for all of them: fill it in, and give it to
--decisions, with --allow-unused, for each installation.

Example:
  schema-migrate fleet plans/*.json --html fleet.html --template decisions.toml

Exit codes:
  0  every installation is ready
  1  no definition has the name or OID of --definition
  2  the command line is wrong
  3  a PLAN cannot be read, or is none; the others are told
  4  at an installation something is undecided, or refused
  5  the report, or a file of --template or --html, cannot be written)";

class FleetCommand : public Command {
 public:
  CLI::App* declare(CLI::App* program) override {
    CLI::App* const fleet = program->add_subcommand("fleet", kDescription);
    fleet->footer(kFooter);
    fleet->add_option("PLAN", m_plans, "saved plans; NAME=PLAN calls the installation NAME")
        ->required()
        ->check(notEmpty())
        ->type_name("");
    fleet->add_option("--definition", m_query.definition, "only what has this name or OID")
        ->check(notEmpty())
        ->type_name("NAME");
    fleet->add_flag("--all", m_query.isWithUnchanged,
                    "also definitions that no installation changed");
    fleet
        ->add_option("--template", m_template,
                     "write a decisions file for all of them; FILE must not exist")
        ->check(notEmpty())
        ->type_name("FILE");
    fleet->add_option("--format", m_format, "text or json")
        ->check(oneOf({"text", "json"}))
        ->type_name("FORMAT");
    m_html.declare(fleet);
    return fleet;
  }

  int run(Console* console) override {
    const std::vector<NamedPlan> plans = namePlans(m_plans);
    m_html.open();
    const FleetReport report = read(plans);
    if (!m_template.empty()) {
      writeNewFile(m_template, migration::decisionsTemplate(report.fleet));
    }
    const bool isJson = m_format == "json";
    const std::string document = isJson || m_html.isWanted() ? renderJson(report) : "";
    if (m_html.isWanted()) {
      m_html.write(renderFleetHtml(document));
    }
    console->print(isJson ? document : renderText(report, isColourWanted()));
    std::string lines = renderComplaints(report);
    console->complain(&lines);
    return report.exitCode;
  }

 private:
  FleetReport read(const std::vector<NamedPlan>& plans) const {
    progress::step("reading plans");
    FleetReport report;
    report.query = m_query;
    migration::FleetReader reader(m_query);
    for (const NamedPlan& plan : plans) {
      const std::unique_ptr<migration::Source> source = readPlanFile(plan.path, &report.failures);
      if (source != nullptr) {
        reader.add(plan.name, *source, &report.failures);
      }
    }
    report.fleet = reader.take();
    report.exitCode = exitCodeOf(report);
    return report;
  }

  static int exitCodeOf(const FleetReport& report) {
    const bool isUnknown = !report.query.definition.empty() && report.fleet.definitions.empty();
    return !report.failures.empty() ? kBadInput
           : isUnknown              ? kFindings
           : report.isReady()       ? kDone
                                    : kRefused;
  }

  std::vector<std::string> m_plans;
  migration::FleetQuery m_query;
  std::string m_template;
  std::string m_format = "text";
  HtmlOption m_html;
};

}  // namespace

std::unique_ptr<Command> makeFleetCommand() { return std::make_unique<FleetCommand>(); }
