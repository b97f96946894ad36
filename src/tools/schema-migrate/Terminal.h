// Where standard output goes.

#ifndef SCHEMA_MIGRATE_TERMINAL_H
#define SCHEMA_MIGRATE_TERMINAL_H

// Whether a person reads it on a terminal.
bool isOnTerminal();

// Whether colours may be used: on a terminal that has them, unless NO_COLOR is set and not empty.
bool isColourWanted();

#endif  // SCHEMA_MIGRATE_TERMINAL_H
