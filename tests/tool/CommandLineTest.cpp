// Help, version, and command lines that are wrong.

#include <gtest/gtest.h>

#include "ToolRun.h"

namespace {

struct Row {
  const char* name;
  std::vector<std::string> arguments;
  int exitCode;
  const char* err;
};

void PrintTo(const Row& row, std::ostream* out) { *out << row.name; }

const Row kRows[] = {
    {"NoArgument",
     {},
     2,
     "schema-migrate: error: A subcommand is required; schema-migrate --help tells how it is used\n"},
    {"UnknownSubcommand",
     {"merge"},
     2,
     "schema-migrate: error: A subcommand is required; schema-migrate --help tells how it is used\n"},
    {"NoFrom",
     {"migrate", "--to", "@/new", "--out", "@/out"},
     2,
     "schema-migrate: error: --from is required, or --plan; schema-migrate migrate --help tells how it is used\n"},
    {"NoTo",
     {"migrate", "--from", "@/old", "--out", "@/out"},
     2,
     "schema-migrate: error: --to is required, or --plan; schema-migrate migrate --help tells how it is used\n"},
    {"NoOut",
     {"migrate", "--from", "@/old", "--to", "@/new"},
     2,
     "schema-migrate: error: --out is required; schema-migrate migrate --help tells how it is used\n"},
    {"UnknownOption",
     {"migrate", "--from", "@/old", "--to", "@/new", "--out", "@/out", "--force"},
     2,
     "schema-migrate: error: The following argument was not expected: --force; schema-migrate migrate --help tells how it is used\n"},
    {"ValueTooMuch",
     {"migrate", "--from", "@/old", "--to", "@/new", "--out", "@/out", "@/x"},
     2,
     "schema-migrate: error: The following argument was not expected: @/x; schema-migrate migrate --help tells how it is used\n"},
    {"TwoWithdrawalLists",
     {"migrate", "--from", "@/old", "--to", "@/new", "--out", "@/out", "--withdraw", "a",
      "--withdraw", "b"},
     2,
     "schema-migrate: error: --withdraw: At Most 1 required but received 2; schema-migrate migrate --help tells how it is used\n"},
    {"NameOfAListThatIsEmpty",
     {"migrate", "--from", "@/old", "--to", "@/new", "--out", "@/out", "--exclude-oids", ""},
     2,
     "schema-migrate: error: --exclude-oids: the name is empty; schema-migrate migrate --help tells how it is used\n"},
    {"SecondNameOfAListThatIsEmpty",
     {"migrate", "--from", "@/old", "--to", "@/new", "--out", "@/out", "--exclude-oids", "a",
      "--exclude-oids", ""},
     2,
     "schema-migrate: error: --exclude-oids: the name is empty; schema-migrate migrate --help tells how it is used\n"},
    {"NameOfTheWithdrawalListThatIsEmpty",
     {"migrate", "--from", "@/old", "--to", "@/new", "--out", "@/out", "--withdraw", ""},
     2,
     "schema-migrate: error: --withdraw: the name is empty; schema-migrate migrate --help tells how it is used\n"},
    {"NameThatIsEmptyBehindAnEqualsSign",
     {"migrate", "--from=", "--to", "@/new", "--out", "@/out"},
     2,
     "schema-migrate: error: --from: the name is empty; schema-migrate migrate --help tells how it is used\n"},
    {"ListThatIsEmptyBehindAnEqualsSign",
     {"migrate", "--from", "@/old", "--to", "@/new", "--out", "@/out", "--withdraw="},
     2,
     "schema-migrate: error: --withdraw: the name is empty; schema-migrate migrate --help tells how it is used\n"},
    {"EmptyFrom",
     {"migrate", "--from", "", "--to", "@/new", "--out", "@/out"},
     2,
     "schema-migrate: error: --from: the name is empty; schema-migrate migrate --help tells how it is used\n"},
    {"EmptyOut",
     {"migrate", "--from", "@/old", "--to", "@/new", "--out", ""},
     2,
     "schema-migrate: error: --out: the name is empty; schema-migrate migrate --help tells how it is used\n"},
    {"NoInputAllowed",
     {"migrate", "--from", "@/old", "--to", "@/new", "--out", "@/out", "--max-input", "0"},
     2,
     "schema-migrate: error: --max-input: \"0\" is no size; write a number of bytes, or one with K, M or G behind it, as in 500M; schema-migrate migrate --help tells how it is used\n"},
    {"SizeThatIsNone",
     {"migrate", "--from", "@/old", "--to", "@/new", "--out", "@/out", "--max-input", "much"},
     2,
     "schema-migrate: error: --max-input: \"much\" is no size; write a number of bytes, or one with K, M or G behind it, as in 500M; schema-migrate migrate --help tells how it is used\n"},
    {"SizeThatIsNegative",
     {"migrate", "--from", "@/old", "--to", "@/new", "--out", "@/out", "--max-input", "-1"},
     2,
     "schema-migrate: error: --max-input: \"-1\" is no size; write a number of bytes, or one with K, M or G behind it, as in 500M; schema-migrate migrate --help tells how it is used\n"},
    {"SizeThatIsTooLarge",
     {"migrate", "--from", "@/old", "--to", "@/new", "--out", "@/out", "--max-input",
      "99999999999G"},
     2,
     "schema-migrate: error: --max-input: \"99999999999G\" is no size; write a number of bytes, or one with K, M or G behind it, as in 500M; schema-migrate migrate --help tells how it is used\n"},
    {"OutWithoutAName",
     {"migrate", "--from", "@/old", "--to", "@/new", "--out", "@/.."},
     2,
     "schema-migrate: error: --out must end in the name of the directory to create, not in \"@/..\"\n"},
    {"OutInOld",
     {"migrate", "--from", "@/old", "--to", "@/new", "--out", "@/new/../old/out"},
     2,
     "schema-migrate: error: the output directory @/new/../old/out lies inside @/old, which is only read; name a place outside\n"},
    {"OutInNew",
     {"migrate", "--from", "@/old", "--to", "@/new/", "--out", "@/new/out/"},
     2,
     "schema-migrate: error: the output directory @/new/out lies inside @/new/, which is only read; name a place outside\n"},
};

class CommandLine : public testing::TestWithParam<Row> {};

TEST_P(CommandLine, IsRefused) {
  ToolFolder folder;
  folder.install("old", {{"V3.user.at", ""}});
  folder.install("new", {{"V3.user.at", ""}});
  const ToolResult result = folder.run(GetParam().arguments);
  EXPECT_EQ(GetParam().exitCode, result.exitCode);
  EXPECT_EQ("", result.out);
  EXPECT_EQ(GetParam().err, result.err);
  EXPECT_EQ("new old", folder.names());
}

INSTANTIATE_TEST_SUITE_P(Rows, CommandLine, testing::ValuesIn(kRows),
                         [](const auto& row) { return std::string(row.param.name); });

TEST(CommandLineHelp, TellsOptionsExampleAndExitCodes) {
  const ToolFolder folder;
  for (const std::vector<std::string>& arguments :
       {std::vector<std::string>{"migrate", "--help"}, {"migrate", "-h"}}) {
    const ToolResult result = folder.run(arguments);
    EXPECT_EQ(0, result.exitCode);
    EXPECT_EQ("", result.err);
    for (const char* const part :
         {"--from OLD", "--to NEW", "--out DIR", "--exclude-oids FILE", "--withdraw FILE",
          "--max-input SIZE", "--allow-foreign-parent",
          "\n  schema-migrate migrate --base /srv/shipped --from /srv/ldap-old/schema",
          "\n  0  done; ", "\n  2  ", "\n  3  ", "\n  4  refused, ", "\n  5  ", "\n  replaced ",
          "\n  kept ", "\n  added "}) {
      EXPECT_NE(std::string::npos, result.out.find(part)) << part;
    }
  }
}

TEST(CommandLineHelp, OfTheProgramNamesTheSubcommand) {
  const ToolFolder folder;
  const ToolResult result = folder.run({"--help"});
  EXPECT_EQ(0, result.exitCode);
  for (const char* const part : {"\n  migrate ", "\nExample:\n", "\nExit codes:\n"}) {
    EXPECT_NE(std::string::npos, result.out.find(part)) << part;
  }
}

TEST(CommandLineHelp, PrintsTheVersion) {
  const ToolFolder folder;
  const ToolResult result = folder.run({"--version"});
  EXPECT_EQ(0, result.exitCode);
  EXPECT_EQ("schema-migrate " SCHEMA_MIGRATE_VERSION "\n", result.out);
}

}  // namespace
