// The system calls of an action, as a tracer of the process sees them.

#ifndef LIBSCHEMA_TESTS_SYSTEM_CALLS_H
#define LIBSCHEMA_TESTS_SYSTEM_CALLS_H

#include <functional>
#include <map>
#include <string>

namespace platform {

// How often `action` makes each of these system calls: open, stat, truncate, control, write and
// close, whatever form of the call it is; others are not counted. The action runs in a child
// process. Wants Ability::kTraceProcesses; the running test fails when the action does not end.
std::map<std::string, int> systemCallsOf(const std::function<void()>& action);

}  // namespace platform

#endif  // LIBSCHEMA_TESTS_SYSTEM_CALLS_H
