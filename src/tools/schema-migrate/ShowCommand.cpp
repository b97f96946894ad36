// show: definitions of an installation, for a person to read.

#include <libschema-migration/Installation.h>

#include <CLI/CLI.hpp>

#include "Command.h"
#include "CommandLine.h"
#include "Messages.h"
#include "ShowReport.h"
#include "ShowRun.h"

namespace {

using migration::Kind;
using migration::Reading;

constexpr char kDescription[] = "print definitions, listings and trees";

constexpr char kFooter[] =
    R"(Prints the definitions of DIR that have a name or an OID, in any letter case, a
clause a line, with file and line; an attribute type with its vendor extension.
Without a name, lists all definitions. DIR is only read.

Examples:
  schema-migrate show /srv/ldap/schema person --inherited --refs
  schema-migrate show /srv/ldap/schema --kind attribute-type --match 'cfg*'
  schema-migrate show /srv/ldap/schema --tree --format dot \
      | dot -Tsvg -o classes.svg

Exit codes:
  0  printed
  1  a name or OID is unknown; those that may have been meant are named
  2  the command line is wrong
  3  an input cannot be read
  5  the output cannot be written)";

class ShowCommand : public Command {
 public:
  CLI::App* declare(CLI::App* program) override {
    CLI::App* const show = program->add_subcommand("show", kDescription);
    show->footer(kFooter);
    show->add_option("DIR", m_options.directory, "directory with V3.* files")
        ->required()
        ->check(notEmpty())
        ->type_name("");
    CLI::Option* const names = show->add_option("NAME", m_options.names, "names or OIDs")
                                   ->check(notEmpty())
                                   ->type_name("");
    CLI::Option* const inherited = show->add_flag("--inherited", m_options.isWithInherited,
                                                  "what comes from superiors, and from which");
    CLI::Option* const refs =
        show->add_flag("--refs", m_options.isWithReferrers, "who names it in SUP, MUST or MAY");
    CLI::Option* const tree = show->add_flag(
        "--tree", m_options.isTree, "the tree by superior; from each NAME down, if there is one");
    CLI::Option* const as =
        show->add_option("--as", m_as,
                         "reading: written, as in the file, or kept, as in the server")
            ->check(oneOf({"written", "kept"}))
            ->type_name("READING");
    show->add_option("--kind", m_kind, "attribute-type, object-class or vendor-extension")
        ->check(oneOf({"attribute-type", "object-class", "vendor-extension"}))
        ->type_name("KIND");
    CLI::Option* const file =
        show->add_option("--file", m_options.file, "only definitions of this file, as V3.user.at")
            ->check(notEmpty({migration::kSchemaFiles.begin(), migration::kSchemaFiles.end()}))
            ->type_name("FILE");
    CLI::Option* const match =
        show->add_option("--match", m_options.pattern,
                         "only definitions with a name or OID like this, as in 'cfg*'")
            ->check(notEmpty())
            ->type_name("PATTERN");
    CLI::Option* const format = show->add_option("--format", m_format, "of a tree: text or dot")
                                    ->check(oneOf({"text", "dot"}))
                                    ->type_name("FORMAT");
    inherited->needs(names);
    refs->needs(names);
    match->excludes(names);
    format->needs(tree);
    for (CLI::Option* const other : {inherited, refs, as, file, match}) {
      tree->excludes(other);
    }
    return show;
  }

  int run(Console* console) override {
    m_options.reading = m_as == "written" ? Reading::kWritten : Reading::kKept;
    for (const Kind kind : {Kind::kAttributeType, Kind::kObjectClass, Kind::kVendorExtension}) {
      if (wordOf(kind) == m_kind) {
        m_options.kind = kind;
      }
    }
    const ShowReport report = show(m_options);
    std::string complaints = renderComplaints(report);
    console->complain(&complaints);
    console->print(m_format == "dot" ? renderDot(report) : renderText(report));
    return report.exitCode;
  }

 private:
  ShowOptions m_options;
  std::string m_as = "kept";
  std::string m_kind;
  std::string m_format = "text";
};

}  // namespace

std::unique_ptr<Command> makeShowCommand() { return std::make_unique<ShowCommand>(); }
