#include "CommandModel.h"

#include <algorithm>
#include <iterator>
#include <utility>

namespace {

// What stands for a value in the help tells what it is.
constexpr std::pair<const char*, ValueModel::Kind> kKinds[] = {
    {"FILE", ValueModel::kFile},  {"PLAN", ValueModel::kFile},
    {"DIR", ValueModel::kFolder}, {"BASE", ValueModel::kFolder},
    {"OLD", ValueModel::kFolder}, {"NEW", ValueModel::kFolder},
    {"OUT", ValueModel::kFolder}, {"RDIR", ValueModel::kFolder},
    {"RULE", ValueModel::kRule},  {"ID=SEVERITY", ValueModel::kSeverity},
};

// Those that the validator of the option has for its name.
std::string wordsOf(CLI::Option* option) {
  try {
    return option->get_validator()->get_name();
  } catch (const CLI::OptionNotFound&) {
    return "";  // it has none
  }
}

ValueModel valueOf(CLI::Option* option) {
  ValueModel value;
  if (option->get_items_expected_max() == 0) {
    value.kind = ValueModel::kNone;
    return value;
  }
  value.name = option->get_positional() ? option->get_name(true) : option->get_type_name();
  value.words = wordsOf(option);
  if (!value.words.empty()) {
    value.kind = ValueModel::kWord;
    return value;
  }
  const auto* const known =
      std::find_if(std::begin(kKinds), std::end(kKinds),
                   [&](const auto& kind) { return value.name == kind.first; });
  if (known != std::end(kKinds)) {
    value.kind = known->second;
  }
  return value;
}

bool isRepeatable(const CLI::Option& option) { return option.get_items_expected_max() > 1; }

CommandModel commandOf(CLI::App* app) {
  CommandModel command;
  command.name = app->get_name();
  command.description = app->get_description();
  for (CLI::Option* const option : app->get_options()) {
    if (option->get_positional()) {
      command.arguments.push_back({option->get_description(), valueOf(option),
                                   option->get_required(), isRepeatable(*option)});
      continue;
    }
    OptionModel model;
    model.longName = "--" + option->get_lnames().front();
    if (!option->get_snames().empty()) {
      model.shortName = "-" + option->get_snames().front();
    }
    model.description = option->get_description();
    model.value = valueOf(option);
    model.isRepeatable = isRepeatable(*option);
    command.options.push_back(std::move(model));
  }
  return command;
}

}  // namespace

ProgramModel modelOf(CLI::App* program) {
  ProgramModel model;
  model.program = commandOf(program);
  for (CLI::App* const command : program->get_subcommands([](CLI::App*) { return true; })) {
    model.commands.push_back(commandOf(command));
  }
  return model;
}
