// migrate: carries the schema of an old installation over to a new release.

#include <CLI/CLI.hpp>

#include "Command.h"
#include "CommandLine.h"
#include "Messages.h"
#include "MigrateRun.h"
#include "PlanOptions.h"

namespace {

constexpr char kDescription[] = "carry the schema of an old installation over to a new release";

constexpr char kFooter[] =
    R"(Makes a plan of OLD's schema, of NEW's, and of the schema as the old release shipped
it (BASE), prints what comes of every definition that differs, and when everything is
decided, writes the result to DIR. Without BASE nobody can tell whether the site or the
release changed what differs: it is undecided until --prefer or a decision decides it.
OLD, NEW and BASE are only read. DIR appears when it is complete and verified, or not
at all.

What is printed at the end, for each file:
  read OLD, read NEW   definitions in OLD's and in NEW's file of this name
  kept                 definitions in the written file that are NEW's
  added                those that are OLD's, and that NEW lacks
  replaced             those that are OLD's, in the place of NEW's
  merged               those with clauses of both
  written              all definitions in the written file

With --layout keep, DIR has NEW's files with their comments and order; what is
carried over stands where NEW's stood, or at the end of the file. With --layout
library, DIR has the seven files that the library writes, and NEW's V3.config.at
and V3.config.oc; a vendor extension is written behind its attribute type, in
every file that holds the OID, so a file can hold more definitions than were read
from it.

A warning names a definition that does not count where it stands, or a file that
is not read.

--plan carries out what plan --save wrote, in the place of --from, --to and whatever
else a plan is made of. The plan is made again from the files that it was made from,
and refused (4) when one of them has changed, went or came, when another version of
this program made it, or when it says something else.

--record creates, beside DIR, what a change ticket needs, as one new directory:
  plan.json            the plan, as plan --save writes it
  report.txt           what is printed here, with every finding
  report.html          the same as a page for a browser
  origins.tsv          where each written definition came from: file and line,
                       and those of the decision about it
  command.txt          the command, version and time; what is a copy of what
  base/ old/ new/      copies of the inputs
  lists/               copies of the lists and decisions
  output/              copies of what is in DIR
  SHA256SUMS           of all these, for sha256sum -c
RDIR appears whole or not at all, after DIR and never without it. With the
environment's SOURCE_DATE_EPOCH for the time, two runs write the same bytes.

Lists of OIDs:
  OIDs separated by white space; a word with # in it begins a comment up to the
  end of the line; the last line must end in a line break.
  --exclude-oids   what OLD defines under these OIDs is left out; NEW's stays
  --withdraw       the same for definitions that OLD takes back, those of
                   V3.modifiedschema among them

Examples:
  schema-migrate migrate --base /srv/shipped --from /srv/ldap-old/schema \
      --to /srv/ldap-new/schema --decisions decisions.toml \
      --out /srv/migrated-schema
  schema-migrate migrate --plan plan.json --out /srv/migrated-schema \
      --record /srv/tickets/upgrade

Exit codes:
  0  done; DIR is in place, or with --dry-run could be
  2  the command line is wrong
  3  an input is missing, unreadable, too large or cannot be parsed
  4  refused, or something is undecided; nothing was written
  5  writing or verification failed; neither DIR nor RDIR is in place, unless
     the message says that it is; or the file for --html cannot be written, and
     then nothing else is

Manual: man schema-migrate)";

class MigrateCommand : public Command {
 public:
  CLI::App* declare(CLI::App* program) override {
    CLI::App* const migrate = program->add_subcommand("migrate", kDescription);
    migrate->footer(kFooter);
    m_planOptions.declareInputs(migrate);
    migrate->add_option("--out", m_options.out, "directory to create; an empty one is replaced")
        ->required()
        ->check(notEmpty())
        ->type_name("DIR");
    m_planOptions.declareDecisions(migrate);
    m_planOptions.declarePlan(migrate);
    migrate
        ->add_option("--record", m_options.record.path,
                     "directory to create for a change ticket; an empty one is replaced")
        ->check(notEmpty())
        ->type_name("RDIR");
    migrate
        ->add_option("--layout", m_layout,
                     "keep (NEW's files with what is carried over) or library (as the library "
                     "writes); keep unless given")
        ->check(oneOf({"keep", "library"}))
        ->type_name("LAYOUT");
    migrate->add_flag("--dry-run", m_options.isDryRun, "do everything but put DIR in place");
    migrate->add_option("--format", m_format, "text or json; text unless given")
        ->check(oneOf({"text", "json"}))
        ->type_name("FORMAT");
    m_html.declare(migrate);
    migrate->add_flag("--allow-foreign-parent", m_options.allowForeignParent,
                      "create DIR also where another user may rename it");
    return migrate;
  }

  void takeWords(const std::vector<std::string>& words) override { m_options.record.words = words; }

  int run(Console* console) override {
    m_planOptions.readPlan();
    if (!m_options.record.path.empty()) {
      m_planOptions.makePathsAbsolute();
    }
    m_options.isInLibraryLayout = m_layout == "library";
    m_options.isJson = m_format == "json";
    migrate(m_planOptions, m_options, &m_html, console);
    return kDone;
  }

 private:
  PlanOptions m_planOptions;
  MigrateOptions m_options;
  std::string m_layout;
  std::string m_format;
  HtmlOption m_html;
};

}  // namespace

std::unique_ptr<Command> makeMigrateCommand() { return std::make_unique<MigrateCommand>(); }
