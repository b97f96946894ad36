#include <libschema-migration/Rule.h>

#include <string>

#include "Completion.h"

namespace {

constexpr char kHead[] =
    R"(# Completion of schema-migrate for fish, made by: schema-migrate completion fish

)";

constexpr char kFunctions[] = R"(
# True while what is typed is, without arguments the command, with one an option of that command, with
# more its argument at one of these places; "more" is the last of them and those behind.
function __schema_migrate_at
    set -l words (commandline -opc)
    set -e words[1]
    set -l command
    set -l option
    set -l is_ended
    set -l place 1
    for word in $words
        if test -n "$option"
            set option
        else if test -z "$is_ended" -a "$word" = --
            set is_ended yes
        else if test -z "$is_ended"; and string match -q -- '-*' $word
            contains -- "$command $word" $__schema_migrate_options_with_values
            and set option $word
        else if test -z "$command"
            set command $word
        else
            set place (math $place + 1)
        end
    end
    switch (count $argv)
        case 0
            test -z "$command"
        case 1
            test "$command" = $argv[1]
        case '*'
            test "$command" = $argv[1]; or return
            contains -- $place $argv[2..-1]; and return
            test $argv[-1] = more -a $place -ge $argv[2]
    end
end

function __schema_migrate_severities
    if string match -qr -- '[A-Z][0-9]+=' (commandline -ct)
        for rule in $__schema_migrate_rules
            printf '%s\n' (string split -f 1 \t $rule)={error,warning,off}
        end
    else
        string replace \t =\t $__schema_migrate_rules
    end
end

complete -c schema-migrate -f
)";

std::string inQuotes(const std::string& text) {
  std::string result = "'";
  for (const char c : text) {
    result += c == '\'' || c == '\\' ? std::string("\\") + c : std::string(1, c);
  }
  return result + "'";
}

// What follows "complete" for a value; an option takes nothing else then.
std::string candidates(const ValueModel& value) {
  switch (value.kind) {
    case ValueModel::kNone:
    case ValueModel::kFree:
      return "";
    case ValueModel::kFile:
      return " -F";
    case ValueModel::kFolder:
      return " -a '(__fish_complete_directories)'";
    case ValueModel::kRule:
      return " -a '(printf \"%s\\n\" $__schema_migrate_rules)'";
    case ValueModel::kSeverity:
      return " -a '(__schema_migrate_severities)'";
    case ValueModel::kWord:
      break;
  }
  return " -a " + inQuotes(value.words);
}

std::string line(const std::string& condition, const std::string& rest) {
  return "complete -c schema-migrate -n " + inQuotes(condition) + rest + "\n";
}

std::string options(const std::string& condition, const CommandModel& command) {
  std::string lines;
  for (const OptionModel& option : command.options) {
    const bool takesValue = option.value.kind != ValueModel::kNone;
    const bool isFile = option.value.kind == ValueModel::kFile;
    lines += line(condition, (option.shortName.empty() ? "" : " -s " + option.shortName.substr(1)) +
                                 " -l " + option.longName.substr(2) +
                                 (takesValue ? isFile ? " -r" : " -x" : "") +
                                 candidates(option.value) + " -d " + inQuotes(option.description));
  }
  return lines;
}

std::string arguments(const CommandModel& command) {
  std::string lines;
  int place = 1;
  for (const ArgumentModel& argument : command.arguments) {
    const std::string rest = candidates(argument.value);
    if (!rest.empty()) {
      lines += line("__schema_migrate_at " + command.name + " " + std::to_string(place) +
                        (argument.isRepeatable ? " more" : ""),
                    rest);
    }
    ++place;
  }
  return lines;
}

}  // namespace

std::string fishCompletion(const ProgramModel& model) {
  std::string rules;
  for (const migration::RuleInfo* const rule : migration::allRules()) {
    rules += " \\\n    " + std::string(rule->id) + "\\t" + rule->name;
  }
  std::string lines = options("__schema_migrate_at", model.program);
  std::string valued;
  for (const CommandModel& command : model.commands) {
    lines +=
        line("__schema_migrate_at", " -a " + command.name + " -d " + inQuotes(command.description));
    lines += options("__schema_migrate_at " + command.name, command) + arguments(command);
    for (const OptionModel& option : command.options) {
      if (option.value.kind != ValueModel::kNone) {
        valued += " \\\n    '" + command.name + " " + option.longName + "'";
      }
    }
  }
  return kHead + ("set -g __schema_migrate_rules" + rules) +
         "\nset -g __schema_migrate_options_with_values" + valued + "\n" + kFunctions + lines;
}
