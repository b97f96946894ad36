// Work in a process of its own, for what leaves memory behind that nothing can free any more.

#ifndef SCHEMA_MIGRATE_SEPARATE_PROCESS_H
#define SCHEMA_MIGRATE_SEPARATE_PROCESS_H

#include <functional>
#include <string>

// Returns the text that `make` returns. A Failure that it throws is thrown here; another exception,
// a signal that ends the process, and an exit of its own are a Failure, too. The process does not
// outlive this one. SIGCHLD must not be ignored.
std::string textFromSeparateProcess(const std::function<std::string()>& make);

#endif  // SCHEMA_MIGRATE_SEPARATE_PROCESS_H
