#include <libschema-migration/Rule.h>

#include <string>

#include "Completion.h"

namespace {

// The parts that do not depend on what there is to complete. In COMP_WORDS, "=" and ":" are words
// of their own as long as they are among the breaks of words, and only what follows the last one is
// replaced: that is the second parameter.
constexpr char kHead[] =
    R"(# Completion of schema-migrate for bash, made by: schema-migrate completion bash

)";

constexpr char kTail[] = R"(
_schema_migrate()
{
  local REPLY word words=() last option= command= place=1 is_ended= prefix= candidate i
  COMPREPLY=()

  for ((i = 1; i <= COMP_CWORD; ++i)); do
    word=${COMP_WORDS[i]}
    if ((i > 1)) && [[ $word =~ ^[=:]+$ || ${COMP_WORDS[i - 1]} =~ ^[=:]+$ ]]; then
      words[${#words[@]} - 1]+=$word
    else
      words+=("$word")
    fi
  done
  last=${words[${#words[@]} - 1]}
  unset "words[${#words[@]} - 1]"

  for word in "${words[@]}"; do
    if [[ $option ]]; then
      option=
    elif [[ ! $is_ended && $word == -- ]]; then
      is_ended=1
    elif [[ ! $is_ended && $word == -* ]]; then
      _schema_migrate_value "$command $word"
      [[ ! $REPLY ]] || option=$word
    elif [[ ! $command ]]; then
      command=$word
    else
      ((++place))
    fi
  done

  if [[ $option ]]; then
    _schema_migrate_value "$command $option"
  elif [[ ! $is_ended && $last == --*=* ]]; then
    prefix=${last%%=*}=
    _schema_migrate_value "$command ${last%%=*}"
  elif [[ ! $is_ended && $last == -* ]]; then
    _schema_migrate_words "$command -"
  elif [[ ! $command ]]; then
    _schema_migrate_words ""
  else
    _schema_migrate_value "$command $place"
  fi

  case $REPLY in
    :file)
      compopt -o default
      return
      ;;
    :folder)
      compopt -o filenames -o dirnames
      return
      ;;
    :rule)
      REPLY=$_schema_migrate_rules
      ;;
    :severity)
      word=${last#"$prefix"}
      if [[ $word == *=* ]]; then
        word=${word%%=*}
        REPLY="$word=error $word=warning $word=off"
      else
        REPLY=${_schema_migrate_rules// /= }=
        compopt -o nospace
      fi
      ;;
    :*)
      return
      ;;
  esac
  for candidate in $REPLY; do
    candidate=$prefix$candidate
    [[ $candidate != "$last"* ]] || COMPREPLY+=("${candidate#"${last%"$2"}"}")
  done
}

complete -F _schema_migrate schema-migrate
)";

std::string reply(const ValueModel& value) {
  switch (value.kind) {
    case ValueModel::kNone:
      return "";
    case ValueModel::kFree:
      return ":free";
    case ValueModel::kFile:
      return ":file";
    case ValueModel::kFolder:
      return ":folder";
    case ValueModel::kRule:
      return ":rule";
    case ValueModel::kSeverity:
      return ":severity";
    case ValueModel::kWord:
      break;
  }
  return value.words;
}

std::string arm(const std::string& pattern, const std::string& words) {
  return "    " + pattern + ") REPLY='" + words + "' ;;\n";
}

std::string options(const CommandModel& command) {
  std::string words;
  for (const OptionModel& option : command.options) {
    words += (words.empty() ? "" : " ") + option.longName +
             (option.shortName.empty() ? "" : " " + option.shortName);
  }
  return words;
}

// The values of the options, and the arguments by their places.
std::string values(const CommandModel& command) {
  std::string arms;
  for (const OptionModel& option : command.options) {
    if (option.value.kind != ValueModel::kNone) {
      arms += arm("'" + command.name + " " + option.longName + "'", reply(option.value));
    }
  }
  int place = 1;
  for (const ArgumentModel& argument : command.arguments) {
    arms +=
        arm("'" + command.name + " '" + (argument.isRepeatable ? "[1-9]*" : std::to_string(place)),
            reply(argument.value));
    ++place;
  }
  return arms;
}

}  // namespace

std::string bashCompletion(const ProgramModel& model) {
  std::string rules;
  for (const migration::RuleInfo* const rule : migration::allRules()) {
    rules += (rules.empty() ? "" : " ") + std::string(rule->id);
  }
  std::string names;
  std::string ofOptions = arm("' -'", options(model.program));
  std::string ofValues;
  for (const CommandModel& command : model.commands) {
    names += (names.empty() ? "" : " ") + command.name;
    ofOptions += arm("'" + command.name + " -'", options(command));
    ofValues += values(command);
  }
  const std::string start = "  REPLY=\n  case $1 in\n";
  const std::string end = "  esac\n}\n";
  return kHead + ("_schema_migrate_rules='" + rules + "'\n\n") +
         "# The commands, or the options of one.\n_schema_migrate_words()\n{\n" + start +
         arm("''", names) + ofOptions + end +
         "\n# What the value of an option is, or the argument at a place; nothing for an option without.\n"
         "_schema_migrate_value()\n{\n" +
         start + ofValues + end + kTail;
}
