#include "Arguments.h"

#include <CLI/CLI.hpp>
#include <iostream>

#include "Messages.h"

namespace {

constexpr char kVersion[] = "schema-migrate " SCHEMA_MIGRATE_VERSION;

constexpr char kDescription[] =
    R"(Carries the schema of a directory server's old installation over to a new release:
what OLD adds to NEW's schema, or defines differently, is merged into a copy of NEW's.)";

constexpr char kMigrateDescription[] =
    R"(Reads every V3.* schema file of OLD and of NEW, prints which of OLD's definitions
collide with NEW's, merges what OLD adds or changes into NEW's schema, and writes the
result to DIR: the seven files V3.system.at, V3.system.oc, V3.orv.at, V3.orv.oc,
V3.user.at, V3.user.oc and V3.modifiedschema, and V3.config.at and V3.config.oc
unchanged as they are in NEW. OLD and NEW are only read. DIR appears when it is
complete and verified, or not at all.)";

constexpr char kFooter[] = R"(What is printed:
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
      --out /srv/migrated-schema --exclude-oids exclude.oids --withdraw withdraw.oids

Exit codes:
  0  done; DIR is in place
  2  the command line is wrong
  3  an input is missing, unreadable or cannot be parsed
  4  refused: a definition cannot be migrated; nothing was written
  5  writing or verification failed; DIR is not in place, unless the message says it is

Manual: man schema-migrate)";

int usageError(const std::string& text) {
  std::cerr << errorLine(text + "; schema-migrate migrate --help tells how it is used");
  return kUsage;
}

void addOptions(CLI::App* migrate, Arguments* arguments) {
  migrate->add_option("--from", arguments->from, "directory with the old installation's V3.* files")
      ->required()
      ->type_name("OLD");
  migrate->add_option("--to", arguments->to, "directory with the new release's V3.* files")
      ->required()
      ->type_name("NEW");
  migrate->add_option("--out", arguments->out, "directory to create; an empty one is replaced")
      ->required()
      ->type_name("DIR");
  migrate
      ->add_option("--exclude-oids", arguments->excludeLists,
                   "list of OIDs that are not carried over; may be given more than once")
      ->type_name("FILE")
      ->type_size(1)
      ->allow_extra_args(false);
  migrate->add_option("--withdraw", arguments->withdrawList, "list of OIDs that OLD takes back")
      ->type_name("FILE");
}

}  // namespace

std::optional<Arguments> parseArguments(int argc, char** argv, int* exitCode) {
  Arguments arguments;
  CLI::App program(kDescription, "schema-migrate");
  program.footer(kFooter);
  program.set_help_flag("-h,--help", "print this help");
  program.set_version_flag("--version", kVersion, "print the version");
  program.require_subcommand(1);
  CLI::App* const migrate = program.add_subcommand("migrate", kMigrateDescription);
  migrate->footer(kFooter);
  migrate->set_help_flag("-h,--help", "print this help");
  addOptions(migrate, &arguments);
  try {
    program.parse(argc, argv);
    return arguments;
  } catch (const CLI::Success& printed) {
    *exitCode = program.exit(printed);
  } catch (const CLI::ParseError& error) {
    *exitCode = usageError(error.what());
  }
  return std::nullopt;
}
