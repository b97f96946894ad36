// migrate: carries the schema of an old installation over to a new release.

#include <CLI/CLI.hpp>
#include <cctype>
#include <charconv>
#include <cstddef>
#include <limits>
#include <string_view>
#include <system_error>

#include "Command.h"
#include "CommandLine.h"
#include "Messages.h"
#include "MigrateRun.h"
#include "PlanOptions.h"
#include "PlannedRun.h"

namespace {

constexpr char kDescription[] = "carry the schema of an old installation over to a new release";

constexpr char kFooter[] =
    R"(Reads every V3.* schema file of OLD and of NEW, prints which of OLD's definitions
collide with NEW's, merges what OLD adds or changes into NEW's schema, and writes the
result to DIR: the seven files V3.system.at, V3.system.oc, V3.orv.at, V3.orv.oc,
V3.user.at, V3.user.oc and V3.modifiedschema, and V3.config.at and V3.config.oc
unchanged as they are in NEW. OLD and NEW are only read. DIR appears when it is
complete and verified, or not at all.

What is printed:
  read OLD, read NEW   definitions in OLD's and in NEW's file of this name
  kept                 definitions in the written file that are NEW's
  added                those that are OLD's, and that NEW lacks
  replaced             those that are OLD's, in the place of NEW's
  written              all definitions in the written file
A vendor extension is written behind its attribute type, in every file that holds the
OID, so a file can hold more definitions than were read from it.

  A collision is a definition of OLD that differs from NEW's of the same first name, or
  of the same OID; OLD's comes in the place of NEW's. To keep NEW's, list the OID in a
  file for --exclude-oids.
  A warning names a definition that gets lost, and what to do about it.

Lists of OIDs:
  OIDs separated by white space; a word with # in it begins a comment up to the end of
  the line; the last line must end in a line break.
  --exclude-oids   what OLD defines under these OIDs is left out, and NEW's stays
  --withdraw       the same for definitions that OLD takes back, V3.modifiedschema's
                   among them; the vendor extension of a withdrawn attribute type stays

Example:
  schema-migrate migrate --from /srv/ldap-old/schema --to /srv/ldap-new/schema \
      --out /srv/migrated-schema --exclude-oids exclude.oids \
      --withdraw withdraw.oids

Exit codes:
  0  done; DIR is in place
  2  the command line is wrong
  3  an input is missing, unreadable, too large or cannot be parsed
  4  refused: a definition cannot be migrated; nothing was written
  5  writing or verification failed; DIR is not in place, unless the message says it is

Manual: man schema-migrate)";

// Bytes; K, M and G stand for 1024 of what comes before. Returns 0 for what is no size.
std::uint64_t bytesOf(const std::string& text) {
  constexpr std::string_view kUnits = "KMG";
  const char* const end = text.data() + text.size();
  std::uint64_t bytes = 0;
  const std::from_chars_result read = std::from_chars(text.data(), end, bytes);
  if (read.ec != std::errc() || end - read.ptr > 1) {
    return 0;
  }
  std::size_t unit = 0;
  if (read.ptr != end) {
    unit = kUnits.find(static_cast<char>(std::toupper(static_cast<unsigned char>(*read.ptr)))) + 1;
    if (unit == 0) {
      return 0;
    }
  }
  const std::uint64_t factor = std::uint64_t{1} << (10 * unit);
  return bytes > std::numeric_limits<std::uint64_t>::max() / factor ? 0 : bytes * factor;
}

const CLI::Validator kSize(
    [](std::string& value) {
      const std::uint64_t bytes = bytesOf(value);
      if (bytes == 0) {
        return "\"" + printable(value) +
               "\" is no size; write a number of bytes, or one with K, M or G behind it, as in 500M";
      }
      value = std::to_string(bytes);
      return std::string();
    },
    "", "size");

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
    migrate
        ->add_option("--layout", m_layout,
                     "with a plan: keep (NEW's files with what is carried over) or library (as the "
                     "library writes)")
        ->check(oneOf({"keep", "library"}))
        ->type_name("LAYOUT");
    migrate->add_flag("--dry-run", m_runOptions.isDryRun,
                      "with a plan: do everything but put DIR in place");
    migrate->add_option("--format", m_format, "with a plan: text or json")
        ->check(oneOf({"text", "json"}))
        ->type_name("FORMAT");
    migrate
        ->add_option(
            "--max-input", m_options.maxInput,
            "refuse inputs of more than SIZE bytes in all, as in 500M or 2G; 1G unless given")
        ->transform(kSize)
        ->type_name("SIZE");
    migrate->add_flag("--allow-foreign-parent", m_options.allowForeignParent,
                      "create DIR also where another user may rename it");
    return migrate;
  }

  int run(Console* console) override {
    m_options.from = m_planOptions.request.old;
    m_options.to = m_planOptions.request.latest;
    m_options.excludeLists = m_planOptions.request.excludeLists;
    m_options.withdrawList = m_planOptions.request.withdrawList;
    m_planOptions.request.limits.bytes = m_options.maxInput;
    if (m_planOptions.hasBaseOrDecisions()) {
      m_runOptions.isInLibraryLayout = m_layout == "library";
      m_runOptions.isJson = m_format == "json";
      migrateByPlan(m_options, m_planOptions, m_runOptions, console);
      return kDone;
    }
    if (!m_layout.empty() || !m_format.empty() || m_runOptions.isDryRun) {
      throw Failure(kUsage,
                    errorLine("--layout, --format and --dry-run belong to a migration with --base, "
                              "--decisions or --prefer; schema-migrate migrate --help tells how it "
                              "is used"));
    }
    migrate(m_options, console);
    return kDone;
  }

 private:
  MigrateOptions m_options;
  PlanOptions m_planOptions;
  PlannedRunOptions m_runOptions;
  std::string m_layout;
  std::string m_format;
};

}  // namespace

std::unique_ptr<Command> makeMigrateCommand() { return std::make_unique<MigrateCommand>(); }
