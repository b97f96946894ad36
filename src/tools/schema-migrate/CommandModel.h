// What the command line takes, as values: made from the declared commands, so that whatever is
// declared is in it.

#ifndef SCHEMA_MIGRATE_COMMAND_MODEL_H
#define SCHEMA_MIGRATE_COMMAND_MODEL_H

#include <CLI/CLI.hpp>
#include <string>
#include <vector>

// What a value of an option, or an argument, may be.
struct ValueModel {
  enum Kind {
    kNone,      // the option takes no value
    kFree,      // any text
    kWord,      // one of `words`
    kFile,      // a file
    kFolder,    // a directory
    kRule,      // the identifier of a rule
    kSeverity,  // a rule and its severity, as in D205=off
  };

  Kind kind = kFree;
  std::string name;   // "FORMAT"
  std::string words;  // with a blank between them
};

struct OptionModel {
  std::string longName;   // "--help"
  std::string shortName;  // "-h", or empty
  std::string description;
  ValueModel value;
  bool isRepeatable = false;
};

struct ArgumentModel {
  std::string description;
  ValueModel value;
  bool isRequired = false;
  bool isRepeatable = false;  // the last one
};

struct CommandModel {
  std::string name;
  std::string description;
  std::vector<OptionModel> options;
  std::vector<ArgumentModel> arguments;
};

struct ProgramModel {
  CommandModel program;  // what stands before a command
  std::vector<CommandModel> commands;
};

ProgramModel modelOf(CLI::App* program);

#endif  // SCHEMA_MIGRATE_COMMAND_MODEL_H
