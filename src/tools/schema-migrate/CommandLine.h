// The command line: which command is meant, and the parts that options of several have in common.

#ifndef SCHEMA_MIGRATE_COMMAND_LINE_H
#define SCHEMA_MIGRATE_COMMAND_LINE_H

#include <CLI/CLI.hpp>
#include <initializer_list>
#include <memory>
#include <string>
#include <vector>

#include "Command.h"

using Commands = std::vector<std::unique_ptr<Command>>;

// Those of the program.
Commands allCommands();

// Returns the command that is meant, with its options. Returns null, with the exit code in
// *exitCode, when there is nothing more to do: help or the version was printed, or what is wrong
// with the command line.
Command* parseCommandLine(int argc, char** argv, const Commands& commands, int* exitCode);

// Adds an option that may be given more than once, each time with one value.
CLI::Option* addList(CLI::App* command, const std::string& name, std::vector<std::string>* values,
                     const std::string& type, const std::string& description);

// Refuses what an unset variable of a shell leaves of an option. The words are those that it mostly
// is; they are its name, with a blank between them, and so are offered by a shell.
CLI::Validator notEmpty(const std::vector<std::string>& usual = {});

// Refuses any other word than these, which are its name, too.
CLI::Validator oneOf(std::initializer_list<const char*> words);

#endif  // SCHEMA_MIGRATE_COMMAND_LINE_H
