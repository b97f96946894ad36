// The command line.

#ifndef SCHEMA_MIGRATE_ARGUMENTS_H
#define SCHEMA_MIGRATE_ARGUMENTS_H

#include <optional>
#include <string>
#include <vector>

struct Arguments {
  std::string from;
  std::string to;
  std::string out;
  std::vector<std::string> excludeLists;
  std::string withdrawList;  // empty when there is none
};

// Returns what `migrate` is to do. Returns nothing, with the exit code in *exitCode, when there is
// nothing more to do: help or the version was printed, or what is wrong with the command line.
std::optional<Arguments> parseArguments(int argc, char** argv, int* exitCode);

#endif  // SCHEMA_MIGRATE_ARGUMENTS_H
