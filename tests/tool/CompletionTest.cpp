// completion: the model is what was declared, and the scripts hold all of the model. What the
// shells make of them is tried in tests/shells.

#include <gtest/gtest.h>

#include <CLI/CLI.hpp>

#include "CommandLine.h"
#include "CommandModel.h"
#include "Completion.h"
#include "ToolRun.h"

namespace {

std::string kindName(ValueModel::Kind kind) {
  constexpr const char* kNames[] = {"none", "free", "word", "file", "folder", "rule", "severity"};
  return kNames[kind];
}

std::string told(const ValueModel& value) {
  return kindName(value.kind) + (value.name.empty() ? "" : " " + value.name) +
         (value.words.empty() ? "" : " " + value.words);
}

std::string told(const CommandModel& command) {
  std::string text = command.name + ": " + command.description + "\n";
  for (const OptionModel& option : command.options) {
    text += option.longName + (option.shortName.empty() ? "" : "," + option.shortName) + " (" +
            told(option.value) + ")" + (option.isRepeatable ? "*" : "") + ": " +
            option.description + "\n";
  }
  for (const ArgumentModel& argument : command.arguments) {
    text += "(" + told(argument.value) + ")" + (argument.isRepeatable ? "*" : "") +
            (argument.isRequired ? "!" : "") + ": " + argument.description + "\n";
  }
  return text;
}

// A program with one command that no other knows.
class Invented : public testing::Test {
 protected:
  Invented() {
    CLI::App* const command = m_program.add_subcommand("invent", "make it's [new]");
    command->set_help_flag("-h,--help", "print this help");
    command->add_flag("--twice", m_flag, "once more");
    command->add_option("--shape", m_text, "of it")
        ->check(oneOf({"round", "square"}))
        ->type_name("SHAPE");
    command->add_option("--into", m_text, "where to")->check(notEmpty())->type_name("DIR");
    command->add_option("--name", m_text, "free")->check(notEmpty())->type_name("NAME");
    command->add_option("--usual", m_text, "hints")
        ->check(notEmpty({"a.at", "b.at"}))
        ->type_name("FILE");
    addList(command, "--like", &m_texts, "FILE", "what it is like")->check(notEmpty());
    addList(command, "--rule", &m_texts, "ID=SEVERITY", "rules");
    command->add_option("PLAN", m_text, "the plan")->required()->type_name("");
    command->add_option("RULE", m_texts, "rules")->type_name("");
    m_model = modelOf(&m_program);
  }

  CLI::App m_program{"", "schema-migrate"};
  bool m_flag = false;
  std::string m_text;
  std::vector<std::string> m_texts;
  ProgramModel m_model;
};

TEST_F(Invented, ModelIsWhatWasDeclared) {
  ASSERT_EQ(1U, m_model.commands.size());
  EXPECT_EQ(
      "invent: make it's [new]\n"
      "--help,-h (none): print this help\n"
      "--twice (none): once more\n"
      "--shape (word SHAPE round square): of it\n"
      "--into (folder DIR): where to\n"
      "--name (free NAME): free\n"
      "--usual (word FILE a.at b.at): hints\n"
      "--like (file FILE)*: what it is like; may be given more than once\n"
      "--rule (severity ID=SEVERITY)*: rules; may be given more than once\n"
      "(file PLAN)!: the plan\n"
      "(rule RULE)*: rules\n",
      told(m_model.commands.front()));
}

TEST_F(Invented, IsInEveryScript) {
  const std::pair<const char*, std::vector<std::string>> kScripts[] = {
      {"bash",
       {"'') REPLY='invent'", "'invent -') REPLY='--help -h --twice --shape --into ",
        "'invent --shape') REPLY='round square'", "'invent --into') REPLY=':folder'",
        "'invent '1) REPLY=':file'", "'invent '[1-9]*) REPLY=':rule'"}},
      {"zsh",
       {"'invent:make it'\\''s [new]'", "--shape='[of it]:SHAPE:(round square)'",
        "--into='[where to]:DIR:_files -/'",
        "'*'--like='[what it is like; may be given more than once]", "'1:PLAN:_files'",
        "'*:RULE:_schema_migrate_rule'"}},
      {"fish",
       {"-a invent -d 'make it\\'s [new]'", "-l shape -x -a 'round square' -d 'of it'",
        "-l into -x -a '(__fish_complete_directories)'", "-l like -r -F", "'invent --shape'"}}};
  for (const auto& [shell, parts] : kScripts) {
    const std::string script = std::string(shell) == "bash"  ? bashCompletion(m_model)
                               : std::string(shell) == "zsh" ? zshCompletion(m_model)
                                                             : fishCompletion(m_model);
    for (const std::string& part : parts) {
      EXPECT_NE(std::string::npos, script.find(part)) << shell << ": " << part << "\n" << script;
    }
  }
}

TEST(Completion, IsPrintedForTheShell) {
  const ToolFolder folder;
  for (const char* const shell : {"bash", "zsh", "fish"}) {
    const ToolResult run = folder.run({"completion", shell});
    EXPECT_EQ(0, run.exitCode);
    EXPECT_EQ("", run.err);
    EXPECT_NE(std::string::npos,
              run.out.find(std::string("# Completion of schema-migrate for ") + shell +
                           ", made by: schema-migrate completion " + shell + "\n"));
  }
}

TEST(Completion, OfAnotherShellIsAUsageError) {
  const ToolFolder folder;
  const ToolResult run = folder.run({"completion", "csh"});
  EXPECT_EQ(2, run.exitCode);
  EXPECT_EQ("", run.out);
  EXPECT_EQ(
      "schema-migrate: error: SHELL: must be bash, zsh or fish; schema-migrate completion --help "
      "tells how it is used\n",
      run.err);
  EXPECT_EQ(2, folder.run({"completion"}).exitCode);
}

}  // namespace
