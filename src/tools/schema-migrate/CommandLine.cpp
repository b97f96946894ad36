#include "CommandLine.h"

#include <algorithm>
#include <iostream>
#include <sstream>

#include "DisplayText.h"
#include "Messages.h"
#include "Terminal.h"

namespace {

constexpr char kVersion[] = "schema-migrate " SCHEMA_MIGRATE_VERSION;

constexpr char kDescription[] =
    R"(Checks and shows the schema of a directory server, and carries that of an old
installation over to a new release.)";

constexpr char kFooter[] = R"(schema-migrate COMMAND --help tells more about a command.

Example:
  schema-migrate check /srv/ldap-old/schema
  schema-migrate migrate --from /srv/ldap-old/schema --to /srv/ldap-new/schema \
      --out /srv/migrated-schema

Exit codes:
  0  done
  1  check has findings, diff or verify shows differences, or show finds no such
     name
  2  the command line is wrong
  3  an input is missing, unreadable, too large or cannot be parsed
  4  refused: a definition cannot be migrated, or is undecided; nothing was
     written
  5  writing or verification failed

Manual: man schema-migrate)";

int usageError(const std::string& text, const std::string& command) {
  std::cerr << asComplaint(
      errorLine(text + "; schema-migrate " + command + "--help tells how it is used"));
  return kUsage;
}

// An option with "=" and nothing behind it. The parser takes it for one without a value, and then
// the next word for the value.
std::string emptyOption(int argc, char** argv) {
  for (int i = 1; i < argc; ++i) {
    const std::string word = argv[i];
    if (word == "--") {
      break;
    }
    if (word.size() > 3 && word.compare(0, 2, "--") == 0 && word.find('=') == word.size() - 1) {
      return word.substr(0, word.size() - 1);
    }
  }
  return "";
}

std::string joined(const std::vector<std::string>& words) {
  std::string text;
  for (const std::string& word : words) {
    text += (text.empty() ? "" : " ") + word;
  }
  return text;
}

// Help of at most 80 columns.
class HelpFormatter : public CLI::Formatter {
 public:
  std::string make_option(const CLI::Option* option, bool isPositional) const override {
    return row(make_option_name(option, isPositional) + make_option_opts(option),
               make_option_desc(option));
  }

  std::string make_subcommand(const CLI::App* command) const override {
    return row(command->get_name(), command->get_description());
  }

  std::string make_footer(const CLI::App* command) const override {
    std::string text;
    std::string paragraph;
    for (std::istringstream lines(command->get_footer() + "\n"); !lines.eof();) {
      std::string line;
      std::getline(lines, line);
      const bool isRunning = !line.empty() && line.front() != ' ' && line.back() != ':';
      if (isRunning) {
        paragraph += (paragraph.empty() ? "" : " ") + line;
        continue;
      }
      text += paragraph.empty() ? "" : wrapped("", paragraph, kWidth);
      paragraph.clear();
      text += lines.eof() ? "" : fitted(line + "\n", kWidth);
    }
    return text;
  }

 private:
  static constexpr std::size_t kWidth = 80;

  // What stands on the left, and its description beside it, or below where it is long.
  static std::string row(const std::string& name, const std::string& description) {
    constexpr std::size_t kLeft = 28;
    const std::string left = "  " + name;
    const bool isBeside = left.size() + 2 <= kLeft;
    return (isBeside ? "" : left + "\n") +
           wrapped(padded(isBeside ? left : "", kLeft), description, kWidth);
  }
};

// The commands on a command line with the program's own help and version.
class Program {
 public:
  explicit Program(const Commands& commands) : m_program(kDescription, "schema-migrate") {
    m_program.footer(kFooter);
    m_program.formatter(std::make_shared<HelpFormatter>());
    m_program.set_help_flag("-h,--help", "print this help");
    m_program.set_version_flag("--version", kVersion, "print the version");
    m_program.require_subcommand(1);
    for (const auto& command : commands) {
      CLI::App* const declared = command->declare(&m_program);
      declared
          ->add_option_function<std::string>("--color", wishForColour,
                                             "colours: always, never, or auto (on a terminal, "
                                             "unless NO_COLOR is set); auto unless given")
          ->check(oneOf({"auto", "always", "never"}))
          ->type_name("WHEN");
      declared->set_help_flag("-h,--help", "print this help");
      m_declared.emplace_back(declared, command.get());
    }
  }

  Command* parse(int argc, char** argv, int* exitCode) {
    if (const std::string option = emptyOption(argc, argv); !option.empty()) {
      *exitCode = usageError(option + ": the name is empty", commandNamed(argv[1]));
      return nullptr;
    }
    try {
      m_program.parse(argc, argv);
      Command* const command = chosen()->second;
      std::vector<std::string> words = {m_program.get_name()};
      words.insert(words.end(), argv + 1, argv + argc);
      command->takeWords(words);
      command->takeProgram(&m_program);
      return command;
    } catch (const CLI::Success& printed) {
      *exitCode = m_program.exit(printed);
    } catch (const CLI::ParseError& error) {
      const auto command = chosen();
      *exitCode = usageError(error.what(),
                             command == m_declared.end() ? "" : command->first->get_name() + " ");
    }
    return nullptr;
  }

 private:
  using Declared = std::vector<std::pair<CLI::App*, Command*>>;

  Declared::const_iterator chosen() const {
    return std::find_if(m_declared.begin(), m_declared.end(),
                        [&](const auto& each) { return m_program.got_subcommand(each.first); });
  }

  // "check " when that is a command, otherwise nothing.
  std::string commandNamed(const std::string& word) const {
    const bool isCommand = std::any_of(m_declared.begin(), m_declared.end(), [&](const auto& each) {
      return each.first->get_name() == word;
    });
    return isCommand ? word + " " : "";
  }

  CLI::App m_program;
  Declared m_declared;
};

}  // namespace

Commands allCommands() {
  Commands commands;
  commands.push_back(makeCheckCommand());
  commands.push_back(makeCompletionCommand());
  commands.push_back(makeDecideCommand());
  commands.push_back(makeDiffCommand());
  commands.push_back(makeExplainCommand());
  commands.push_back(makeFleetCommand());
  commands.push_back(makeMigrateCommand());
  commands.push_back(makePlanCommand());
  commands.push_back(makeShowCommand());
  commands.push_back(makeVerifyCommand());
  return commands;
}

Command* parseCommandLine(int argc, char** argv, const Commands& commands, int* exitCode) {
  return Program(commands).parse(argc, argv, exitCode);
}

CLI::Option* addList(CLI::App* command, const std::string& name, std::vector<std::string>* values,
                     const std::string& type, const std::string& description) {
  return command->add_option(name, *values, description + "; may be given more than once")
      ->type_name(type)
      ->type_size(1)
      ->allow_extra_args(false);
}

CLI::Validator notEmpty(const std::vector<std::string>& usual) {
  return {[](const std::string& value) {
            return value.empty() ? std::string("the name is empty") : std::string();
          },
          "", joined(usual)};
}

CLI::Validator oneOf(std::initializer_list<const char*> words) {
  const std::vector<std::string> allowed(words.begin(), words.end());
  return {[allowed](const std::string& value) {
            if (std::find(allowed.begin(), allowed.end(), value) != allowed.end()) {
              return std::string();
            }
            std::string text = "must be";
            for (const std::string& word : allowed) {
              text += (&word == &allowed.front()  ? " "
                       : &word == &allowed.back() ? " or "
                                                  : ", ") +
                      word;
            }
            return text;
          },
          "", joined(allowed)};
}
