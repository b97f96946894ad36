#include <libschema-migration/Rule.h>

#include <string>

#include "Completion.h"

namespace {

constexpr char kHead[] = R"(#compdef schema-migrate
# Completion of schema-migrate for zsh, made by: schema-migrate completion zsh

)";

constexpr char kValues[] = R"(
_schema_migrate_rule()
{
  _describe -t rules rule _schema_migrate_rules "$@"
}

_schema_migrate_severity()
{
  if compset -P '*='; then
    compadd "$@" error warning off
  else
    _schema_migrate_rule -S =
  fi
}
)";

constexpr char kArguments[] = R"(
_schema_migrate()
{
  local context state state_descr line
  typeset -A opt_args
  _arguments -C \
)";

constexpr char kCommands[] = R"(    '1:command:->command' \
    '*::argument:->argument' && return
  if [[ $state == command ]]; then
    _describe -t commands command _schema_migrate_commands
    return
  fi
  case $line[1] in
)";

constexpr char kTail[] = R"(  esac
}

if [[ $funcstack[1] == _schema-migrate ]]; then
  _schema_migrate "$@"
else
  compdef _schema_migrate schema-migrate
fi
)";

// A text in single quotes, with a backslash before each of the characters that _arguments or
// _describe would take for one of its own.
std::string escaped(const std::string& text, const char* special) {
  std::string result;
  for (const char c : text) {
    if (c == '\'') {
      result += "'\\''";
      continue;
    }
    if (std::string(special).find(c) != std::string::npos) {
      result += '\\';
    }
    result += c;
  }
  return result;
}

// ":NAME:how it is completed".
std::string message(const ValueModel& value) {
  const std::string start = ":" + escaped(value.name, "\\:") + ":";
  switch (value.kind) {
    case ValueModel::kNone:
      return "";
    case ValueModel::kFree:
      return start + " ";
    case ValueModel::kFile:
      return start + "_files";
    case ValueModel::kFolder:
      return start + "_files -/";
    case ValueModel::kRule:
      return start + "_schema_migrate_rule";
    case ValueModel::kSeverity:
      return start + "_schema_migrate_severity";
    case ValueModel::kWord:
      break;
  }
  return start + "(" + value.words + ")";
}

std::string specification(const OptionModel& option) {
  const std::string equals = option.value.kind == ValueModel::kNone ? "" : "=";
  const std::string rest =
      "'[" + escaped(option.description, "\\[]:") + "]" + message(option.value) + "'";
  // Help and version go with nothing else.
  const std::string others = option.longName == "--help" || option.longName == "--version"
                                 ? "'(- *)'"
                                 : (option.isRepeatable ? "'*'" : "");
  return others +
         (option.shortName.empty()
              ? option.longName + equals
              : "{" + option.shortName + "," + option.longName + equals + "}") +
         rest;
}

std::string specification(const ArgumentModel& argument, int place) {
  const std::string which =
      argument.isRepeatable ? "*" : std::to_string(place) + (argument.isRequired ? "" : ":");
  return "'" + which + message(argument.value) + "'";
}

std::string arm(const CommandModel& command) {
  std::string text = "    " + command.name + ")\n      _arguments -s -S";
  for (const OptionModel& option : command.options) {
    text += " \\\n        " + specification(option);
  }
  int place = 1;
  for (const ArgumentModel& argument : command.arguments) {
    text += " \\\n        " + specification(argument, place);
    ++place;
  }
  return text + "\n      ;;\n";
}

// An array of words with descriptions, as _describe takes it.
std::string described(const std::string& word, const std::string& description) {
  return "  '" + escaped(word, "\\:") + ":" + escaped(description, "\\") + "'\n";
}

}  // namespace

std::string zshCompletion(const ProgramModel& model) {
  std::string rules;
  for (const migration::RuleInfo* const rule : migration::allRules()) {
    rules += described(rule->id, rule->name);
  }
  std::string commands;
  std::string arms;
  for (const CommandModel& command : model.commands) {
    commands += described(command.name, command.description);
    arms += arm(command);
  }
  std::string options;
  for (const OptionModel& option : model.program.options) {
    options += "    " + specification(option) + " \\\n";
  }
  return kHead +
         ("typeset -ga _schema_migrate_rules _schema_migrate_commands\n" +
          ("_schema_migrate_rules=(\n" + rules) + ")\n_schema_migrate_commands=(\n" + commands +
          ")\n") +
         kValues + kArguments + options + kCommands + arms + kTail;
}
