// check: what the rules have to say about installations.

#include <libschema-migration/Rule.h>
#include <libschema-migration/Settings.h>

#include <CLI/CLI.hpp>

#include "CheckRun.h"
#include "Command.h"
#include "CommandLine.h"
#include "HtmlOption.h"
#include "HtmlReport.h"
#include "Messages.h"
#include "Progress.h"
#include "Renderers.h"
#include "RepairRun.h"
#include "Terminal.h"

namespace {

constexpr char kDescription[] = "tell what is wrong with the schema of an installation";

constexpr char kFooter[] =
    R"(Reads every V3.* schema file of each DIR twice, as it is written and as the
server's library keeps it, and reports every difference, and whatever else the
rules find: names that nothing defines, definitions that hide each other, lists
of OIDs that are not read as they look. Nothing is changed.

A finding is an error or a warning; schema-migrate explain RULE tells more.
A file .schema-migrate.toml in a DIR sets severities and accepts findings there.

--repair mends what can be mended without changing what is said: parentheses round
a last value, the last line end, the letter case of keywords, X- clauses (which
become comments), carriage returns. DIR itself is not changed; OUT appears whole.

Example:
  schema-migrate check --exclude-oids exclude.oids /srv/ldap-old/schema

Exit codes:
  0  nothing is as severe as --fail-on says
  1  there are findings
  2  the command line is wrong
  3  an input cannot be read, or the library would never come to its end; the
     findings in the others are told all the same
  5  the report, OUT, or the file for --html cannot be written)";

std::string ruleProblem(const std::string& word) {
  const std::size_t at = word.find('=');
  migration::Severity severity = migration::Severity::kOff;
  if (at == std::string::npos || !migration::severityOf(word.substr(at + 1), &severity)) {
    return "must be as in D205=off, with error, warning or off";
  }
  return migration::findRule(word.substr(0, at)) != nullptr
             ? ""
             : "there is no rule " + word.substr(0, at) + "; schema-migrate explain lists them";
}

class CheckCommand : public Command {
 public:
  CLI::App* declare(CLI::App* program) override {
    CLI::App* const check = program->add_subcommand("check", kDescription);
    check->footer(kFooter);
    check->add_option("DIR", m_options.directories, "directories with V3.* files")
        ->required()
        ->check(notEmpty())
        ->type_name("");
    addList(check, "--exclude-oids", &m_options.excludeLists, "FILE",
            "check this list of OIDs that are not carried over, too")
        ->check(notEmpty());
    check
        ->add_option("--withdraw", m_options.withdrawList,
                     "and this list of OIDs that DIR takes back")
        ->check(notEmpty())
        ->type_name("FILE");
    check
        ->add_option("--against", m_options.against,
                     "compare names and files with the installation NEW")
        ->check(notEmpty())
        ->type_name("NEW");
    addList(check, "--rule", &m_rules, "ID=SEVERITY", "let a rule be an error, a warning or off")
        ->check(CLI::Validator(ruleProblem, ""));
    check
        ->add_option("--fail-on", m_failOn,
                     "least severity that makes the run fail: error or warning")
        ->check(oneOf({"error", "warning"}))
        ->type_name("SEVERITY");
    check->add_option("--format", m_format, "text, json, sarif or github")
        ->check(oneOf({"text", "json", "sarif", "github"}))
        ->type_name("FORMAT");
    m_html.declare(check);
    check->add_flag("--context", m_isWithContext,
                    "show the line of each finding, as on a terminal");
    check
        ->add_option("--repair", m_repair.out,
                     "write a copy of the one DIR to the new directory OUT in which is mended what "
                     "can be, and tell what is left in it")
        ->check(notEmpty())
        ->type_name("OUT");
    check->add_flag("--allow-foreign-parent", m_repair.allowForeignParent,
                    "create OUT also where another user may rename it");
    return check;
  }

  int run(Console* console) override {
    m_options.doWarningsFail = m_failOn == "warning";
    const bool isJson = m_format == "json";
    const bool isWithContext = m_format == "text" && (m_isWithContext || isOnTerminal());
    m_options.isWithExcerpts = isWithContext || isJson || m_html.isWanted();
    for (const std::string& word : m_rules) {
      const std::size_t at = word.find('=');
      migration::severityOf(word.substr(at + 1), &m_options.severities[word.substr(0, at)]);
    }
    if (!m_repair.out.empty() && m_options.directories.size() != 1) {
      throw Failure(kUsage,
                    errorLine("--repair takes one DIR; schema-migrate check --help tells how "
                              "it is used"));
    }
    m_html.refuseIn("--repair", m_repair.out);
    m_html.open();
    progress::step("reading and checking");
    const CheckReport report = m_repair.out.empty() ? checkDirectories(m_options)
                                                    : repairDirectory(m_options, m_repair, console);
    if (m_html.isWanted()) {
      m_html.write(renderCheckHtml(renderJson(report)));
    }
    std::string failures = renderFailures(report);
    console->complain(&failures);
    const bool isCopyTold = !m_repair.out.empty() && report.failures.empty() && m_format == "text";
    const std::string told =
        render(report, isWithContext) +
        (isCopyTold ? "Written and verified: " + wholePrintable(m_repair.out) + "\n" : "");
    m_format == "text" ? console->printText(told) : console->print(told);
    return report.exitCode;
  }

 private:
  std::string render(const CheckReport& report, bool isWithContext) const {
    if (m_format == "json") {
      return renderJson(report);
    }
    if (m_format == "sarif") {
      return renderSarif(report, migration::allRules());
    }
    if (m_format == "github") {
      return renderGithub(report);
    }
    return renderText(report, {isWithContext, isColourWanted(), longestLine()});
  }

  CheckOptions m_options;
  RepairOptions m_repair;
  std::vector<std::string> m_rules;  // "D205=off"
  std::string m_failOn = "error";
  std::string m_format = "text";
  HtmlOption m_html;
  bool m_isWithContext = false;
};

}  // namespace

std::unique_ptr<Command> makeCheckCommand() { return std::make_unique<CheckCommand>(); }
