// Runs of parse() that never come to an end, each in a child process that is stopped after a second
// and has little memory: a list that grows while the run goes on ends it in another way.

#ifndef LIBSCHEMA_TESTS_ENDLESS_RUNS_H
#define LIBSCHEMA_TESTS_ENDLESS_RUNS_H

#include <unistd.h>

#include <functional>
#include <string>
#include <vector>

#include "Tokens.h"

namespace definitions {

// For a child process: allows it only a little more memory and sets alarm(1).
void limitThisProcess();

// For a death test: parses `text` within the limits and exits with status 0 if parse() returns.
// Memory that runs out ends the process by an abort.
template <typename Definition>
[[noreturn]] void parseWithinLimits(const std::string& text) noexcept {
  support::LexedText input(text);
  input.lexer().lexan();
  Definition definition;
  limitThisProcess();
  definition.parse(&input.lexer());
  ::_exit(0);
}

// Runs each action in a child of its own, a few at a time. Returns for each how the child ended:
// "endless" when the alarm stopped it, "returned" for exit status 0, else the signal or the status.
std::vector<std::string> endsOf(const std::vector<std::function<void()>>& actions);

}  // namespace definitions

#endif  // LIBSCHEMA_TESTS_ENDLESS_RUNS_H
