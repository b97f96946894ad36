// diff: what is not the same in the old release, the installation and the new release.

#include <CLI/CLI.hpp>
#include <algorithm>

#include "Command.h"
#include "CommandLine.h"
#include "HtmlOption.h"
#include "HtmlReport.h"
#include "Messages.h"
#include "PlanOptions.h"
#include "PlanReport.h"
#include "Terminal.h"

namespace {

constexpr char kDescription[] = "tell who changed what between two releases";

constexpr char kFooter[] =
    R"(Compares the schema of an old installation with that of a new release, definition by
definition, and with --base tells who changed what: the site or the release. It shows
what plan would do. Nothing is changed.

BASE is the schema as the old release shipped it, before the site touched it. Without
it nobody can tell who changed what, and whatever differs is unknown.

Classes (--class): same, added-by-site, removed-by-site, changed-by-site,
  added-by-release, removed-by-release, changed-by-release,
  changed-by-both-mergeable, changed-by-both-in-conflict, taken, unknown
Risks (--risk): data (what entries hold already may not fit), structure,
  cosmetic

Example:
  schema-migrate diff --base /srv/shipped --from /srv/ldap-old/schema \
      --to /srv/ldap-new/schema --risk data

Exit codes:
  0  no difference
  1  differences, or a name that nothing has
  2  the command line is wrong
  3  an input is missing, unreadable, too large or cannot be parsed
  4  BASE equals OLD or NEW, and --accept-base is not given
  5  the report, or the file for --html, cannot be written)";

class DiffCommand : public Command {
 public:
  CLI::App* declare(CLI::App* program) override {
    CLI::App* const diff = program->add_subcommand("diff", kDescription);
    diff->footer(kFooter);
    m_options.declareInputs(diff);
    diff->add_option("NAME", m_filter.names, "only these definitions, by name or OID")
        ->check(notEmpty())
        ->type_name("");
    addList(diff, "--kind", &m_filter.kinds, "KIND",
            "only attribute-type, object-class or vendor-extension")
        ->check(oneOf({"attribute-type", "object-class", "vendor-extension"}));
    addList(diff, "--class", &m_filter.changes, "CLASS", "only what was changed so")
        ->check(oneOf({"same", "added-by-site", "removed-by-site", "changed-by-site",
                       "added-by-release", "removed-by-release", "changed-by-release",
                       "changed-by-both-mergeable", "changed-by-both-in-conflict", "taken",
                       "unknown"}));
    addList(diff, "--risk", &m_filter.risks, "RISK", "only changes of this risk")
        ->check(oneOf({"none", "cosmetic", "structure", "data"}));
    diff->add_option("--ignore", m_filter.ignored,
                     "leave out what differs only in desc, order or case (letter case)")
        ->delimiter(',')
        ->check(oneOf({"desc", "order", "case"}))
        ->type_name("WHAT");
    diff->add_flag("--stat", m_isSummaryOnly, "only count the differences");
    diff->add_option("--format", m_format, "text or json")
        ->check(oneOf({"text", "json"}))
        ->type_name("FORMAT");
    m_html.declare(diff);
    return diff;
  }

  int run(Console* console) override {
    m_filter.isWithSame = std::find(m_filter.changes.begin(), m_filter.changes.end(), "same") !=
                          m_filter.changes.end();
    m_html.open();
    const bool isJson = m_format == "json";
    // The text tells nothing of what the rules find.
    m_options.request.isChecked = isJson || m_html.isWanted();
    const std::unique_ptr<migration::MigrationPlan> plan = m_options.makePlan();
    const ShownDifferences shown = shownOf(*plan, m_filter);
    const std::string document =
        isJson || m_html.isWanted() ? renderPlanJson(*plan, shown, "diff") : "";
    if (m_html.isWanted()) {
      m_html.write(renderPlanHtml(document));
    }
    if (isJson) {
      console->print(document);
    } else {
      console->printText(renderDifferences(*plan, shown, {isColourWanted(), m_isSummaryOnly}));
    }
    std::string unknown = renderUnknownNames(*plan, m_filter.names);
    const bool isAllKnown = unknown.empty();
    console->complain(&unknown);
    const bool isAllSame =
        std::all_of(shown.begin(), shown.end(), [](const migration::Verdict* verdict) {
          return verdict->outcome == migration::Outcome::kSame;
        });
    return isAllSame && isAllKnown ? kDone : kFindings;
  }

 private:
  PlanOptions m_options;
  DifferenceFilter m_filter;
  std::string m_format = "text";
  HtmlOption m_html;
  bool m_isSummaryOnly = false;
};

}  // namespace

std::unique_ptr<Command> makeDiffCommand() { return std::make_unique<DiffCommand>(); }
